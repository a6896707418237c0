// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "ModuleDriver.h"

#include "AudioSender.h"

#include <QtEndian>

#include <algorithm>

ModuleDriver::~ModuleDriver()
{
    if (m_process.state() != QProcess::NotRunning) {
        m_process.closeWriteChannel();
        if (!m_process.waitForFinished(5000)) {
            m_process.kill();
            m_process.waitForFinished(5000);
        }
    }
}

bool ModuleDriver::start(const QString &program, const QStringList &arguments)
{
    m_process.setProcessChannelMode(QProcess::ForwardedErrorChannel);
    m_clock.start();
    m_process.start(program, arguments);
    return m_process.waitForStarted(10000);
}

void ModuleDriver::send(const QByteArray &bytes)
{
    m_process.write(bytes);
    m_process.waitForBytesWritten(10000);
}

void ModuleDriver::parse()
{
    m_buffer += m_process.readAllStandardOutput();
    for (;;) {
        // Audio data is escaped so that it holds no line feed: lines can be split on LF throughout.
        const qsizetype end = m_buffer.indexOf('\n');
        if (end < 0) {
            return;
        }
        const QByteArray line = m_buffer.left(end);
        m_buffer.remove(0, end + 1);
        if (line.startsWith("705-")) {
            m_inAudio = true;
            const QByteArray field = line.mid(4);
            if (field.startsWith("sample_rate=")) {
                m_audio.sampleRate = field.mid(12).toInt();
            } else if (field.startsWith("AUDIO")) {
                const QByteArray raw = SdCadenza::AudioSender::unescape(field.mid(6));
                for (qsizetype i = 0; i + 1 < raw.size(); i += 2) {
                    m_audio.samples.push_back(qFromLittleEndian<qint16>(raw.constData() + i));
                }
            }
            continue;
        }
        if (line == "705 AUDIO" && m_inAudio) {
            m_audio.line = line;
            m_audio.atMs = m_clock.elapsed();
            m_items.append(std::move(m_audio));
            m_audio = Item();
            m_inAudio = false;
            continue;
        }
        m_items.append({line, {}, 0, m_clock.elapsed()});
    }
}

QByteArray ModuleDriver::waitForAny(const QByteArrayList &lines, int timeoutMs)
{
    QElapsedTimer timer;
    timer.start();
    qsizetype checked = m_waited;
    for (;;) {
        parse();
        for (; checked < m_items.size(); ++checked) {
            if (lines.contains(m_items.at(checked).line)) {
                m_waited = checked + 1;
                return m_items.at(checked).line;
            }
        }
        const qint64 left = timeoutMs - timer.elapsed();
        if (left <= 0 || m_process.state() == QProcess::NotRunning) {
            parse();
            return {};
        }
        m_process.waitForReadyRead(int(qMin<qint64>(left, 200)));
    }
}

bool ModuleDriver::waitForLine(const QByteArray &line, int timeoutMs)
{
    return !waitForAny({line}, timeoutMs).isEmpty();
}

QList<ModuleDriver::Item> ModuleDriver::takeItems()
{
    parse();
    QList<Item> taken = m_items.mid(m_seen);
    m_seen = m_items.size();
    return taken;
}

std::vector<qint16> ModuleDriver::samplesOf(const QList<Item> &items)
{
    std::vector<qint16> all;
    for (const Item &item : items) {
        all.insert(all.end(), item.samples.begin(), item.samples.end());
    }
    return all;
}

QByteArrayList ModuleDriver::linesOf(const QList<Item> &items)
{
    QByteArrayList lines;
    for (const Item &item : items) {
        lines.append(item.line);
    }
    return lines;
}

double ModuleDriver::medianPitchHz(const std::vector<qint16> &samples, int sampleRate)
{
    constexpr size_t Frame = 1024;
    const int minLag = sampleRate / 500;
    const int maxLag = sampleRate / 50;
    std::vector<double> pitches;
    for (size_t at = 0; at + Frame + size_t(maxLag) < samples.size(); at += Frame / 2) {
        double energy = 0;
        for (size_t i = 0; i < Frame; ++i) {
            energy += double(samples[at + i]) * samples[at + i];
        }
        if (energy / Frame < 1000.0 * 1000.0) {
            continue; // silence or a whisper: no pitch to find
        }
        int bestLag = 0;
        double best = 0;
        for (int lag = minLag; lag <= maxLag; ++lag) {
            double sum = 0;
            for (size_t i = 0; i < Frame; ++i) {
                sum += double(samples[at + i]) * samples[at + i + size_t(lag)];
            }
            if (sum > best) {
                best = sum;
                bestLag = lag;
            }
        }
        if (bestLag > 0 && best > 0.5 * energy) {
            pitches.push_back(double(sampleRate) / bestLag);
        }
    }
    if (pitches.empty()) {
        return 0;
    }
    std::nth_element(pitches.begin(), pitches.begin() + long(pitches.size() / 2), pitches.end());
    return pitches[pitches.size() / 2];
}

std::vector<qint16> ModuleDriver::samplesOfStream(const QByteArray &stream)
{
    std::vector<qint16> samples;
    for (const QByteArray &line : stream.split('\n')) {
        if (line.startsWith("705-AUDIO")) {
            const QByteArray raw = SdCadenza::AudioSender::unescape(line.mid(10));
            for (qsizetype i = 0; i + 1 < raw.size(); i += 2) {
                samples.push_back(qFromLittleEndian<qint16>(raw.constData() + i));
            }
        }
    }
    return samples;
}
