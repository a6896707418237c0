// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "VoiceDescription.h"

#include "core/formats/Locale.h"

#include <algorithm>

namespace Cadenza::Platform {

namespace {

QString stringValue(const QVariantMap &map, const QString &key)
{
    const QVariant v = map.value(key);
    return v.typeId() == QMetaType::QString ? v.toString() : QString();
}

std::optional<qint64> integerValue(const QVariantMap &map, const QString &key)
{
    const QVariant v = map.value(key);
    switch (v.typeId()) {
    case QMetaType::LongLong:
    case QMetaType::Int:
    case QMetaType::ULongLong:
        return v.toLongLong();
    case QMetaType::Double:
        return qint64(v.toDouble());
    default:
        return std::nullopt;
    }
}

} // namespace

VoiceQuality VoiceDescription::qualityOf(const QString &identifier)
{
    if (identifier.endsWith(QLatin1String(".premium"))) {
        return VoiceQuality::Premium;
    }
    if (identifier.endsWith(QLatin1String(".compact"))) {
        return VoiceQuality::Compact;
    }
    return VoiceQuality::Default;
}

QString VoiceDescription::baseIdentifierOf(const QString &identifier)
{
    // ".premium" and ".compact" are both eight characters long.
    return qualityOf(identifier) == VoiceQuality::Default ? identifier : identifier.chopped(8);
}

QStringList VoiceDescription::baseVoiceIdentifiersOf(const QString &identifier)
{
    if (qualityOf(identifier) != VoiceQuality::Premium) {
        return {identifier};
    }
    // Our own compact voices end in ".compact"; voices of other makers may have no ending at all.
    const QString base = identifier.chopped(8);
    return {base, base + QStringLiteral(".compact")};
}

bool VoiceDescription::isBaseVoicePresent(
    const QString &identifier, const std::function<bool(const QString &)> &isPresent)
{
    const QStringList forms = baseVoiceIdentifiersOf(identifier);
    return std::any_of(forms.cbegin(), forms.cend(), isPresent);
}

QStringList VoiceDescription::defaultGroupsOf(const QString &identifier)
{
    if (qualityOf(identifier) == VoiceQuality::Compact) {
        return {VoiceGroup::Compact};
    }
    return {VoiceGroup::Default};
}

std::optional<VoiceDescription> VoiceDescription::fromInfo(const QVariantMap &info, QString *error)
{
    const QVariant attributesValue = info.value(QStringLiteral("VoiceAttributes"));
    if (attributesValue.typeId() != QMetaType::QVariantMap) {
        *error = QStringLiteral("no VoiceAttributes dictionary");
        return std::nullopt;
    }
    VoiceDescription voice;
    voice.attributes = attributesValue.toMap();
    voice.identifier = stringValue(voice.attributes, VoiceAttribute::Identifier);
    if (voice.identifier.isEmpty()) {
        voice.identifier = stringValue(info, QStringLiteral("BundleIdentifier"));
    }
    if (voice.identifier.isEmpty()) {
        *error = QStringLiteral("no voice identifier");
        return std::nullopt;
    }
    if (stringValue(voice.attributes, VoiceAttribute::Name).isEmpty()) {
        *error = QStringLiteral("no voice name");
        return std::nullopt;
    }
    // Every voice list is grouped and titled by the voice's language: its locale, else its language,
    // else en_US (values of the wrong type count as absent). A bundle whose locale or language names
    // no language is left out here rather than stopping a list later.
    for (const QString &key : {VoiceAttribute::LocaleIdentifier, VoiceAttribute::Language}) {
        const QString locale = stringValue(voice.attributes, key);
        if (locale.isEmpty()) {
            continue;
        }
        if (!Locale::namesALanguage(locale)) {
            *error = QStringLiteral("%1 '%2' names no language").arg(key, locale.left(40));
            return std::nullopt;
        }
        break;
    }
    voice.attributes.insert(VoiceAttribute::Identifier, voice.identifier);
    voice.version = stringValue(info, QStringLiteral("BundleVersion"));

    const QVariant groups = voice.attributes.value(VoiceAttribute::Groups);
    if (groups.typeId() == QMetaType::QVariantList) {
        for (const QVariant &g : groups.toList()) {
            if (g.typeId() == QMetaType::QString) {
                voice.groups.append(g.toString());
            }
        }
    }
    if (voice.groups.isEmpty()) {
        voice.groups = defaultGroupsOf(voice.identifier);
    }

    const auto creator = integerValue(voice.attributes, VoiceAttribute::Creator);
    const auto id = integerValue(voice.attributes, VoiceAttribute::VoiceID);
    if (creator) {
        voice.spec = std::pair<qint32, qint32>(qint32(*creator), qint32(id.value_or(0)));
    }

    const QVariant engine = info.value(QStringLiteral("Engine"));
    const QVariantMap engineMap = engine.typeId() == QMetaType::QVariantMap ? engine.toMap() : QVariantMap();
    voice.engineSettings = engineMap;
    voice.engineName = stringValue(engineMap, QStringLiteral("Name"));
    if (voice.engineName.isEmpty()) {
        voice.engineName = QStringLiteral("espeak-ng");
    }
    voice.engineVoice = stringValue(engineMap, QStringLiteral("Voice"));
    voice.engineVariant = stringValue(engineMap, QStringLiteral("Variant"));
    voice.enginePitch
        = int(std::clamp<qint64>(integerValue(engineMap, QStringLiteral("Pitch")).value_or(50), 0, 100));
    voice.engineRate
        = int(std::clamp<qint64>(integerValue(engineMap, QStringLiteral("Rate")).value_or(175), 80, 450));
    if (voice.engineVoice.isEmpty() && voice.engineName == QLatin1String("espeak-ng")) {
        voice.engineVoice = QStringLiteral("en");
    }
    return voice;
}

} // namespace Cadenza::Platform
