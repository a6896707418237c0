// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_PROPERTYLIST_H
#define CADENZA_PLATFORM_PROPERTYLIST_H

#include "cadenzacore_export.h"

#include <QByteArray>
#include <QString>
#include <QVariant>

#include <optional>

namespace Cadenza::Platform {

/**
 * Reads and writes XML property lists, the open format of bundle descriptions, the catalogue and the
 * preference files.
 *
 * Values map onto QVariant so that the types stay apart: integer → qint64, real → double,
 * true/false → bool, date → QDateTime (UTC), data → QByteArray, string → QString,
 * array → QVariantList, dict → QVariantMap.
 */
class CADENZACORE_EXPORT PropertyList
{
public:
    /// Nesting deeper than this is refused: hostile files must not exhaust the stack.
    static constexpr int MaximumDepth = 64;

    /// Parses a whole document. Returns nothing and fills @p error when the bytes are not a property list.
    [[nodiscard]] static std::optional<QVariant> parse(const QByteArray &bytes, QString *error = nullptr);

    /// Serialises @p value; values of types a property list cannot hold are written as empty strings.
    [[nodiscard]] static QByteArray serialize(const QVariant &value);

    /// Reads and parses a file. A missing or unreadable file gives nothing, with @p error set.
    [[nodiscard]] static std::optional<QVariant> readFile(const QString &path, QString *error = nullptr);
};

} // namespace Cadenza::Platform

#endif
