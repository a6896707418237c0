// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_KEYEDARCHIVE_H
#define CADENZA_PLATFORM_KEYEDARCHIVE_H

#include "cadenzaprotocol_export.h"

#include <QByteArray>
#include <QString>
#include <QVariant>

#include <optional>

namespace Cadenza::Platform {

/// The kinds of value a decoder may be allowed to produce.
enum class ArchiveClass : quint32 {
    Array = 1 << 0,
    Dictionary = 1 << 1,
    String = 1 << 2,
    Number = 1 << 3, ///< integers, reals and booleans
    Data = 1 << 4,
    Date = 1 << 5,
};
Q_DECLARE_FLAGS(ArchiveClasses, ArchiveClass)
Q_DECLARE_OPERATORS_FOR_FLAGS(ArchiveClasses)

/// The leaf kinds of a property list; containers must be allowed one by one.
constexpr ArchiveClasses PropertyListLeaves
    = ArchiveClasses(ArchiveClass::String) | ArchiveClass::Number | ArchiveClass::Data | ArchiveClass::Date;

/// What a decoder accepts at most.
struct CADENZAPROTOCOL_EXPORT ArchiveLimits
{
    int maximumDepth = 32;
    qsizetype maximumItems = 100000; ///< values in the whole archive
    qsizetype maximumStringBytes = 1 << 20; ///< per string or data value
};

/**
 * Keyed archives: a value kept under the key "root" of a CBOR map.
 *
 * Encoding takes property-list values (see PropertyList). Decoding is for bytes from other
 * processes: every value is checked against the allowed classes, and depth, counts and lengths are
 * checked before anything is allocated, so no input crashes the decoder or makes it allocate more
 * than the limits allow.
 */
class CADENZAPROTOCOL_EXPORT KeyedArchive
{
public:
    static const QString RootKey; ///< "root"

    using Limits = ArchiveLimits;

    /// The archive of @p root; nothing, with @p error set, when a value cannot be archived.
    [[nodiscard]] static std::optional<QByteArray> encode(const QVariant &root, QString *error = nullptr);
    /**
     * @p value archived on its own, for encodeArray(): a server that answers the same records again
     * and again keeps each record's bytes and archives only what changed.
     */
    [[nodiscard]] static std::optional<QByteArray> encodeItem(
        const QVariant &value, QString *error = nullptr);
    /// The archive of an array whose items were each archived by encodeItem(), joined as they are.
    [[nodiscard]] static QByteArray encodeArray(const QList<QByteArray> &archivedItems);
    /// The value under "root"; nothing, with @p error set, on any damage, excess or class not allowed.
    [[nodiscard]] static std::optional<QVariant> decode(const QByteArray &bytes, ArchiveClasses allowed,
        QString *error = nullptr, const Limits &limits = Limits());
};

} // namespace Cadenza::Platform

#endif
