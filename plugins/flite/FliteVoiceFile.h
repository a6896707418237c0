// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLUGINS_FLITEVOICEFILE_H
#define CADENZA_PLUGINS_FLITEVOICEFILE_H

#include <QByteArray>
#include <QByteArrayView>
#include <QHash>
#include <QString>

#include <optional>

namespace Cadenza::Engines {

/**
 * Checks a ".flitevox" voice file before flite reads it.
 *
 * flite's loader trusts its input: a damaged file makes it read out of bounds or end the process.
 * So a file is handed to flite only when its header is sound (the format's magic, this machine's
 * byte order, a well-formed feature list naming a language the plugin speaks) and when it is exactly
 * the file its bundle describes (size and SHA-256 from the bundle's Info.plist), which covers the
 * model data the header check cannot follow.
 */
class FliteVoiceFile
{
public:
    struct Header
    {
        QHash<QByteArray, QByteArray> features; ///< the voice's feature list
        QByteArray voiceName; ///< such as "cmu_us_slt"
    };

    /// Parses the header of @p data; nothing, with a readable @p error, when it is not sound.
    [[nodiscard]] static std::optional<Header> readHeader(QByteArrayView data, QString *error);
    /**
     * Checks the whole file at @p path: its size and SHA-256 (hex) as the bundle states them, then its
     * header. Returns the header, or nothing with a readable @p error.
     */
    [[nodiscard]] static std::optional<Header> check(
        const QString &path, qint64 expectedSize, const QByteArray &expectedSha256, QString *error);
};

} // namespace Cadenza::Engines

#endif
