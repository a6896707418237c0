// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Info.plist of a recognizer bundle, as the list of installed dictation languages reads it: any bytes
// may sit in a bundle somebody copied into the recognizer folder.
#include "core/formats/Locale.h"
#include "core/formats/PropertyList.h"
#include "core/formats/RecognizerBundleInfo.h"

using namespace Cadenza::Platform;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const auto value = PropertyList::parse(QByteArray(reinterpret_cast<const char *>(data), qsizetype(size)));
    if (!value) {
        return 0;
    }
    QString error;
    const auto bundle = RecognizerBundleInfo::fromInfo(value->toMap(), &error);
    if (!bundle) {
        // A bundle left out is logged by its reason, so there must be one.
        if (error.isEmpty()) {
            __builtin_trap();
        }
        return 0;
    }
    // What the language lists rely on for every accepted bundle: a language with a name, which they
    // would otherwise stop the process for.
    const LocaleComponents components = Locale::componentsFromLocaleIdentifier(bundle->localeIdentifier);
    if (components.languageCode.isEmpty()
        || Locale(QStringLiteral("en"))
               .displayNameForKey(Locale::LanguageCodeKey, components.languageCode)
               .isEmpty()) {
        __builtin_trap();
    }
    return 0;
}
