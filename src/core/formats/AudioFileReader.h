// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_AUDIOFILEREADER_H
#define CADENZA_PLATFORM_AUDIOFILEREADER_H

#include "cadenzacore_export.h"

#include <QString>

#include <memory>
#include <optional>
#include <vector>

namespace Cadenza::Platform {

/**
 * Reads a sound file (WAV and the other formats libsndfile knows) block by block as 16-bit mono at
 * one sample rate: channels are mixed, the rate converted with libsoxr. Memory stays bounded
 * however long the file is.
 */
class CADENZACORE_EXPORT AudioFileReader
{
public:
    explicit AudioFileReader(int sampleRate);
    ~AudioFileReader();
    AudioFileReader(const AudioFileReader &) = delete;
    AudioFileReader &operator=(const AudioFileReader &) = delete;

    /// Opens @p path; false with a readable @p error when it is not a sound file.
    [[nodiscard]] bool open(const QString &path, QString *error);
    /// The length the file's header announces, in seconds.
    [[nodiscard]] double durationSeconds() const;
    /**
     * The next samples, at most about @p frames of them; empty at the end of the file; nothing, with
     * a readable @p error, when reading fails.
     */
    [[nodiscard]] std::optional<std::vector<qint16>> read(qsizetype frames, QString *error);

private:
    struct Private;
    std::unique_ptr<Private> d;
};

} // namespace Cadenza::Platform

#endif
