// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "WaveFile.h"

#include "core/files/OutputFile.h"

#include <QFile>

#include <sndfile.h>

#include <cmath>
#include <cstring>

namespace Cadenza::Platform {

double PcmAudio::rootMeanSquare() const
{
    if (samples.empty()) {
        return 0.0;
    }
    double sum = 0.0;
    for (const qint16 s : samples) {
        sum += double(s) * double(s);
    }
    return std::sqrt(sum / double(samples.size()));
}

namespace {

// libsndfile writing into memory: the header's sizes are patched by seeking, which a device or a
// FIFO could not do, so the whole file is made first and then handed to OutputFile.
struct MemoryFile
{
    QByteArray bytes;
    sf_count_t position = 0;
};

sf_count_t memoryLength(void *user)
{
    return sf_count_t(static_cast<MemoryFile *>(user)->bytes.size());
}

sf_count_t memorySeek(sf_count_t offset, int whence, void *user)
{
    auto *file = static_cast<MemoryFile *>(user);
    const sf_count_t base = whence == SEEK_CUR ? file->position
        : whence == SEEK_END                   ? sf_count_t(file->bytes.size())
                                               : 0;
    file->position = qMax<sf_count_t>(0, base + offset);
    return file->position;
}

sf_count_t memoryRead(void *to, sf_count_t count, void *user)
{
    auto *file = static_cast<MemoryFile *>(user);
    const sf_count_t available = qMax<sf_count_t>(0, sf_count_t(file->bytes.size()) - file->position);
    const sf_count_t n = qMin(count, available);
    std::memcpy(to, file->bytes.constData() + file->position, size_t(n));
    file->position += n;
    return n;
}

sf_count_t memoryWrite(const void *from, sf_count_t count, void *user)
{
    auto *file = static_cast<MemoryFile *>(user);
    const sf_count_t end = file->position + count;
    if (end > sf_count_t(file->bytes.size())) {
        file->bytes.resize(qsizetype(end));
    }
    std::memcpy(file->bytes.data() + file->position, from, size_t(count));
    file->position = end;
    return count;
}

sf_count_t memoryTell(void *user)
{
    return static_cast<MemoryFile *>(user)->position;
}

} // namespace

std::optional<QByteArray> WaveFile::encode(const PcmAudio &audio, QString *error)
{
    SF_INFO info {};
    info.samplerate = audio.sampleRate;
    info.channels = 1;
    info.format = SF_FORMAT_WAV | SF_FORMAT_PCM_16;
    SF_VIRTUAL_IO io {memoryLength, memorySeek, memoryRead, memoryWrite, memoryTell};
    MemoryFile memory;
    SNDFILE *file = sf_open_virtual(&io, SFM_WRITE, &info, &memory);
    if (!file) {
        if (error) {
            *error
                = QStringLiteral("cannot encode the sound: %1").arg(QString::fromUtf8(sf_strerror(nullptr)));
        }
        return std::nullopt;
    }
    const sf_count_t written = sf_write_short(file, audio.samples.data(), sf_count_t(audio.samples.size()));
    const int closed = sf_close(file);
    if (written != sf_count_t(audio.samples.size()) || closed != 0) {
        if (error) {
            *error = QStringLiteral("cannot encode the sound");
        }
        return std::nullopt;
    }
    return memory.bytes;
}

bool WaveFile::write(const QString &path, const PcmAudio &audio, QString *error)
{
    // Refuse a folder or the like before the work of encoding.
    if (OutputFile::kindOf(path, error) == OutputFile::Kind::Refused) {
        return false;
    }
    const auto bytes = encode(audio, error);
    return bytes && OutputFile::write(path, *bytes, error);
}

std::optional<PcmAudio> WaveFile::read(const QString &path, QString *error)
{
    SF_INFO info {};
    SNDFILE *file = sf_open(QFile::encodeName(path).constData(), SFM_READ, &info);
    if (!file) {
        if (error) {
            *error = QString::fromUtf8(sf_strerror(nullptr));
        }
        return std::nullopt;
    }
    if (info.channels <= 0 || info.frames < 0 || info.frames > 60LL * 60 * 192000) {
        sf_close(file);
        if (error) {
            *error = QStringLiteral("unsupported layout");
        }
        return std::nullopt;
    }
    std::vector<qint16> interleaved(size_t(info.frames) * size_t(info.channels));
    const sf_count_t frames = sf_readf_short(file, interleaved.data(), info.frames);
    sf_close(file);
    PcmAudio audio;
    audio.sampleRate = info.samplerate;
    audio.samples.resize(size_t(frames));
    for (sf_count_t f = 0; f < frames; ++f) {
        int sum = 0;
        for (int c = 0; c < info.channels; ++c) {
            sum += interleaved[size_t(f) * size_t(info.channels) + size_t(c)];
        }
        audio.samples[size_t(f)] = qint16(sum / info.channels);
    }
    return audio;
}

} // namespace Cadenza::Platform
