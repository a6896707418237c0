// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RecognizerBundleInfo.h"

#include "PropertyList.h"
#include "core/formats/Locale.h"

namespace Cadenza::Platform {

namespace {
QString stringValue(const QVariantMap &map, const QString &key)
{
    const QVariant v = map.value(key);
    return v.typeId() == QMetaType::QString ? v.toString() : QString();
}
} // namespace

std::optional<RecognizerBundleInfo> RecognizerBundleInfo::fromInfo(const QVariantMap &info, QString *error)
{
    const QVariant locale = info.value(QStringLiteral("LocaleIdentifier"));
    if (locale.typeId() != QMetaType::QString || locale.toString().isEmpty()) {
        *error = QStringLiteral("no LocaleIdentifier string");
        return std::nullopt;
    }
    if (!Locale::namesALanguage(locale.toString())) {
        *error = QStringLiteral("LocaleIdentifier '%1' names no language").arg(locale.toString().left(40));
        return std::nullopt;
    }
    RecognizerBundleInfo bundle;
    bundle.localeIdentifier = locale.toString();
    bundle.bundleIdentifier = stringValue(info, QStringLiteral("BundleIdentifier"));
    bundle.version = stringValue(info, QStringLiteral("BundleVersion"));
    return bundle;
}

std::optional<RecognizerBundleInfo> RecognizerBundleInfo::fromBundle(
    const QString &bundlePath, QString *error)
{
    const auto info = PropertyList::readFile(bundlePath + QStringLiteral("/Info.plist"), error);
    if (!info) {
        return std::nullopt;
    }
    if (info->typeId() != QMetaType::QVariantMap) {
        *error = QStringLiteral("Info.plist holds no dictionary");
        return std::nullopt;
    }
    return fromInfo(info->toMap(), error);
}

} // namespace Cadenza::Platform
