// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The catalogue the daemon trusts for paths, names and checksums.
#include "PackageCatalogue.h"

#include "core/formats/PropertyList.h"

#include <QLoggingCategory>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static const bool quiet = [] {
        QLoggingCategory::setFilterRules(QStringLiteral("*=false"));
        return true;
    }();
    (void)quiet;
    const auto value = Cadenza::Platform::PropertyList::parse(
        QByteArray(reinterpret_cast<const char *>(data), qsizetype(size)));
    if (!value) {
        return 0;
    }
    const auto catalogue = Quillond::PackageCatalogue::fromDictionary(value->toMap());
    const QVariantMap packages = value->toMap().value(QStringLiteral("Packages")).toMap();
    for (auto it = packages.cbegin(); it != packages.cend(); ++it) {
        if (const auto package = catalogue.package(it.key())) {
            // Nothing accepted may point outside the repository or the bundle folders.
            if (!Quillond::PackageCatalogue::isSafeRelativePath(package->path)
                || !Quillond::PackageCatalogue::isSafeBundleName(package->bundleName, package->kind)
                || package->sha256.size() != 32) {
                __builtin_trap();
            }
        }
    }
    return 0;
}
