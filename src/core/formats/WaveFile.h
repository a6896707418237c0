// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_WAVEFILE_H
#define CADENZA_PLATFORM_WAVEFILE_H

#include "cadenzacore_export.h"

#include <QByteArray>
#include <QString>

#include <optional>
#include <vector>

namespace Cadenza::Platform {

/// Mono 16-bit PCM audio.
struct CADENZACORE_EXPORT PcmAudio
{
    std::vector<qint16> samples;
    int sampleRate = 22050;

    [[nodiscard]] double durationSeconds() const
    {
        return sampleRate > 0 ? double(samples.size()) / sampleRate : 0.0;
    }
    /// Root mean square of the samples, 0 for silence, up to 32767.
    [[nodiscard]] double rootMeanSquare() const;
};

/// WAV files through libsndfile.
class CADENZACORE_EXPORT WaveFile
{
public:
    /// @p audio as the bytes of a 16-bit PCM WAV file.
    [[nodiscard]] static std::optional<QByteArray> encode(const PcmAudio &audio, QString *error);
    /// Writes @p audio as a 16-bit PCM WAV file through OutputFile: a regular file is replaced only when
    /// the whole file was written, a device or FIFO is written in place, a folder is refused.
    [[nodiscard]] static bool write(const QString &path, const PcmAudio &audio, QString *error);
    /// Reads a WAV file, mixing channels down to mono.
    [[nodiscard]] static std::optional<PcmAudio> read(const QString &path, QString *error);
};

} // namespace Cadenza::Platform

#endif
