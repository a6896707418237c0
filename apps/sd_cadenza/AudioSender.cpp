// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "AudioSender.h"

#include <QtEndian>

#include <cerrno>
#include <unistd.h>

namespace SdCadenza {

namespace {
constexpr char Escape = 0x7d;
constexpr char Flip = 0x20;
} // namespace

AudioSender::AudioSender(int fd)
    : m_fd(fd)
{ }

bool AudioSender::send(const QByteArray &text)
{
    QMutexLocker locker(&m_mutex);
    return writeAll(text);
}

bool AudioSender::sendAudio(const qint16 *samples, qsizetype count, int sampleRate)
{
    const QByteArray event = audioEvent(samples, count, sampleRate);
    QMutexLocker locker(&m_mutex);
    return writeAll(event);
}

QByteArray AudioSender::audioEvent(const qint16 *samples, qsizetype count, int sampleRate)
{
    QByteArray raw(count * qsizetype(sizeof(qint16)), Qt::Uninitialized);
    for (qsizetype i = 0; i < count; ++i) {
        qToLittleEndian<qint16>(samples[i], raw.data() + 2 * i);
    }
    QByteArray event;
    event.reserve(raw.size() * 2 + 128);
    event += "705-bits=16\n705-num_channels=1\n705-sample_rate=" + QByteArray::number(sampleRate)
        + "\n705-num_samples=" + QByteArray::number(count) + "\n705-big_endian=0\n705-AUDIO";
    event += '\0';
    event += escape(raw);
    event += "\n705 AUDIO\n";
    return event;
}

QByteArray AudioSender::escape(const QByteArray &data)
{
    QByteArray out;
    out.reserve(data.size() + data.size() / 64 + 16);
    for (const char c : data) {
        if (c == '\n' || c == Escape) {
            out += Escape;
            out += char(c ^ Flip);
        } else {
            out += c;
        }
    }
    return out;
}

QByteArray AudioSender::unescape(const QByteArray &data)
{
    QByteArray out;
    out.reserve(data.size());
    for (qsizetype i = 0; i < data.size(); ++i) {
        if (data.at(i) == Escape && i + 1 < data.size()) {
            out += char(data.at(++i) ^ Flip);
        } else {
            out += data.at(i);
        }
    }
    return out;
}

bool AudioSender::writeAll(const QByteArray &bytes)
{
    if (m_broken) {
        return false;
    }
    const char *at = bytes.constData();
    qsizetype left = bytes.size();
    while (left > 0) {
        const ssize_t written = ::write(m_fd, at, size_t(left));
        if (written < 0) {
            if (errno == EINTR) {
                continue;
            }
            m_broken = true; // the server went away; nobody is left to tell
            return false;
        }
        at += written;
        left -= written;
    }
    return true;
}

} // namespace SdCadenza
