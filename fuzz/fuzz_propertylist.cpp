// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Property lists: Info.plist of every bundle, the catalogue, the preference files.
#include "core/formats/PropertyList.h"

using namespace Cadenza::Platform;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const QByteArray bytes(reinterpret_cast<const char *>(data), qsizetype(size));
    if (const auto value = PropertyList::parse(bytes)) {
        // What parses must serialise and parse to a value that serialises the same way.
        const QByteArray once = PropertyList::serialize(*value);
        const auto again = PropertyList::parse(once);
        if (!again || PropertyList::serialize(*again) != once) {
            __builtin_trap();
        }
    }
    return 0;
}
