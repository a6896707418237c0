#include "WaveFile.h"

#include <QFile>

#include <sndfile.h>

#include <cmath>

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

bool WaveFile::write(const QString &path, const PcmAudio &audio, QString *error)
{
    const QString temporary = path + QStringLiteral(".part");
    SF_INFO info {};
    info.samplerate = audio.sampleRate;
    info.channels = 1;
    info.format = SF_FORMAT_WAV | SF_FORMAT_PCM_16;
    SNDFILE *file = sf_open(QFile::encodeName(temporary).constData(), SFM_WRITE, &info);
    if (!file) {
        if (error) {
            *error
                = QStringLiteral("cannot create %1: %2").arg(path, QString::fromUtf8(sf_strerror(nullptr)));
        }
        return false;
    }
    const sf_count_t written = sf_write_short(file, audio.samples.data(), sf_count_t(audio.samples.size()));
    const int closed = sf_close(file);
    if (written != sf_count_t(audio.samples.size()) || closed != 0) {
        QFile::remove(temporary);
        if (error) {
            *error = QStringLiteral("cannot write %1").arg(path);
        }
        return false;
    }
    QFile::remove(path);
    if (!QFile::rename(temporary, path)) {
        QFile::remove(temporary);
        if (error) {
            *error = QStringLiteral("cannot move the sound into %1").arg(path);
        }
        return false;
    }
    return true;
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
