// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Info.plist of an installed voice bundle, as the voice list reads it: any bytes may sit in a bundle
// somebody copied into a voice folder.
#include "core/formats/Locale.h"
#include "core/formats/PropertyList.h"
#include "core/formats/VoiceDescription.h"

using namespace Cadenza::Platform;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const auto value = PropertyList::parse(QByteArray(reinterpret_cast<const char *>(data), qsizetype(size)));
    if (!value) {
        return 0;
    }
    QString error;
    const auto voice = VoiceDescription::fromInfo(value->toMap(), &error);
    if (!voice) {
        // A refused bundle is logged by its reason, so there must be one.
        if (error.isEmpty()) {
            __builtin_trap();
        }
        return 0;
    }
    // What the voice list and the speech engine rely on for every accepted voice.
    if (voice->identifier.isEmpty() || voice->groups.isEmpty() || voice->engineName.isEmpty()
        || (voice->engineName == u"espeak-ng" && voice->engineVoice.isEmpty()) || voice->enginePitch < 0
        || voice->enginePitch > 100 || voice->engineRate < 80 || voice->engineRate > 450
        || voice->attributes.value(VoiceAttribute::Identifier).toString() != voice->identifier) {
        __builtin_trap();
    }
    // Every voice list is titled by the voice's language (its locale, else its language, else
    // en_US): it must have one, with a name.
    QString locale = voice->attributes.value(VoiceAttribute::LocaleIdentifier).toString();
    if (voice->attributes.value(VoiceAttribute::LocaleIdentifier).typeId() != QMetaType::QString
        || locale.isEmpty()) {
        locale = voice->attributes.value(VoiceAttribute::Language).typeId() == QMetaType::QString
            ? voice->attributes.value(VoiceAttribute::Language).toString()
            : QString();
    }
    if (locale.isEmpty()) {
        locale = QStringLiteral("en_US");
    }
    const QString language = Locale::componentsFromLocaleIdentifier(locale).languageCode;
    if (language.isEmpty()
        || Locale(QStringLiteral("en")).displayNameForKey(Locale::LanguageCodeKey, language).isEmpty()) {
        __builtin_trap();
    }
    (void)VoiceDescription::qualityOf(voice->identifier);
    (void)VoiceDescription::baseIdentifierOf(voice->identifier);
    return 0;
}
