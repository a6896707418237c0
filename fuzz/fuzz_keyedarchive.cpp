// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Keyed archives arrive from other processes: installation requests, status records, notifications.
#include "protocol/KeyedArchive.h"
#include "protocol/SecureArchiving.h"

#include <QLoggingCategory>

using namespace Cadenza::Platform;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static const bool quiet = [] {
        QLoggingCategory::setFilterRules(QStringLiteral("*=false"));
        return true;
    }();
    (void)quiet;
    const QByteArray bytes = QByteArray::fromRawData(reinterpret_cast<const char *>(data), qsizetype(size));
    const ArchiveClasses all
        = ArchiveClasses(ArchiveClass::Array) | ArchiveClass::Dictionary | PropertyListLeaves;
    if (const auto value = KeyedArchive::decode(bytes, all)) {
        // Whatever decodes must archive again, and that archive must decode and archive to the same
        // bytes (compared as bytes: a NaN is never equal to itself as a value).
        const auto once = KeyedArchive::encode(*value);
        const auto back = once ? KeyedArchive::decode(*once, all) : std::nullopt;
        const auto twice = back ? KeyedArchive::encode(*back) : std::nullopt;
        if (!once || !twice || *once != *twice) {
            __builtin_trap();
        }
    }
    (void)Cadenza::CZDecodeSecureArray(bytes);
    (void)Cadenza::CZDecodeSecureDictionary(bytes);
    return 0;
}
