// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "AudioFileReader.h"

#include <QFile>

#include <sndfile.h>
#include <soxr.h>

#include <algorithm>
#include <cmath>

namespace Cadenza::Platform {

struct AudioFileReader::Private
{
    int sampleRate;
    SNDFILE *file = nullptr;
    SF_INFO info {};
    soxr_t resampler = nullptr;
    bool inputDone = false;
    bool flushed = false;
    std::vector<float> interleaved;
    std::vector<float> mono;

    ~Private()
    {
        if (resampler) {
            soxr_delete(resampler);
        }
        if (file) {
            sf_close(file);
        }
    }
};

AudioFileReader::AudioFileReader(int sampleRate)
    : d(std::make_unique<Private>())
{
    d->sampleRate = sampleRate;
}

AudioFileReader::~AudioFileReader() = default;

bool AudioFileReader::open(const QString &path, QString *error)
{
    const int rate = d->sampleRate;
    d = std::make_unique<Private>();
    d->sampleRate = rate;
    d->file = sf_open(QFile::encodeName(path).constData(), SFM_READ, &d->info);
    if (!d->file) {
        *error = QStringLiteral("%1 is not a sound file that can be read: %2")
                     .arg(path, QString::fromUtf8(sf_strerror(nullptr)));
        return false;
    }
    if (d->info.channels < 1 || d->info.samplerate < 1000 || d->info.samplerate > 768000) {
        *error = QStringLiteral("%1 has %2 channels at %3 Hz, which is not sound")
                     .arg(path)
                     .arg(d->info.channels)
                     .arg(d->info.samplerate);
        return false;
    }
    // Sample values beyond full scale (floating-point files) are clipped, not wrapped.
    sf_command(d->file, SFC_SET_CLIPPING, nullptr, SF_TRUE);
    if (d->info.samplerate != d->sampleRate) {
        soxr_error_t failure = nullptr;
        const soxr_io_spec_t io = soxr_io_spec(SOXR_FLOAT32_I, SOXR_FLOAT32_I);
        const soxr_quality_spec_t quality = soxr_quality_spec(SOXR_MQ, 0);
        d->resampler = soxr_create(d->info.samplerate, d->sampleRate, 1, &failure, &io, &quality, nullptr);
        if (!d->resampler) {
            *error = QStringLiteral("cannot convert %1 Hz to %2 Hz: %3")
                         .arg(d->info.samplerate)
                         .arg(d->sampleRate)
                         .arg(QString::fromUtf8(failure ? failure : "unknown error"));
            return false;
        }
    }
    return true;
}

double AudioFileReader::durationSeconds() const
{
    return d->info.samplerate > 0 ? double(d->info.frames) / d->info.samplerate : 0.0;
}

std::optional<std::vector<qint16>> AudioFileReader::read(qsizetype frames, QString *error)
{
    if (!d->file) {
        *error = QStringLiteral("no sound file is open");
        return std::nullopt;
    }
    frames = std::max<qsizetype>(frames, 64);
    std::vector<qint16> result;
    const auto toSamples = [&result](const float *data, size_t count) {
        result.reserve(result.size() + count);
        for (size_t i = 0; i < count; ++i) {
            result.push_back(qint16(std::lround(std::clamp(data[i], -1.0f, 1.0f) * 32767.0f)));
        }
    };
    // Read until some output exists, the file ends, or the rate converter has nothing more to give.
    while (result.empty() && !d->flushed) {
        sf_count_t got = 0;
        if (!d->inputDone) {
            d->interleaved.resize(size_t(frames) * size_t(d->info.channels));
            got = sf_readf_float(d->file, d->interleaved.data(), frames);
            if (got < 0 || sf_error(d->file) != SF_ERR_NO_ERROR) {
                *error = QStringLiteral("the sound file cannot be read: %1")
                             .arg(QString::fromUtf8(sf_strerror(d->file)));
                return std::nullopt;
            }
            if (got == 0) {
                d->inputDone = true;
            }
        }
        d->mono.resize(size_t(got));
        for (sf_count_t frame = 0; frame < got; ++frame) {
            float sum = 0;
            for (int channel = 0; channel < d->info.channels; ++channel) {
                sum += d->interleaved[size_t(frame) * size_t(d->info.channels) + size_t(channel)];
            }
            d->mono[size_t(frame)] = sum / float(d->info.channels);
        }
        if (!d->resampler) {
            toSamples(d->mono.data(), d->mono.size());
            d->flushed = d->inputDone;
            continue;
        }
        const double ratio = double(d->sampleRate) / d->info.samplerate;
        std::vector<float> converted(size_t(std::ceil(double(frames) * ratio)) + 256);
        size_t offset = 0;
        size_t made = 0;
        // Feed the block until the converter took all of it; a null input tells it the stream
        // ended, so it hands out what it holds.
        do {
            size_t used = 0;
            made = 0;
            const soxr_error_t failure
                = soxr_process(d->resampler, d->inputDone ? nullptr : d->mono.data() + offset,
                    d->mono.size() - offset, &used, converted.data(), converted.size(), &made);
            if (failure) {
                *error = QStringLiteral("the rate conversion failed: %1").arg(QString::fromUtf8(failure));
                return std::nullopt;
            }
            offset += used;
            toSamples(converted.data(), made);
        } while (!d->inputDone && offset < d->mono.size());
        if (d->inputDone && made == 0) {
            d->flushed = true;
        }
    }
    return result;
}

} // namespace Cadenza::Platform
