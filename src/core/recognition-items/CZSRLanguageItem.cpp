// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZSRLanguageItem.h"

#include "core/SpeechNames.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/PreferencesStore.h"
#include "core/services/RecognitionService.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem_p.h"

namespace Cadenza {

using Platform::Services;

const QString CZSRLanguageItem::VisibleLocalesKey = QStringLiteral("VisibleSRLocaleIdentifiers");

namespace {
// Looking up a tag builds the downloadable items, which look up their own tags when the catalogue
// gives none: while one lookup runs, items do not start another, so that cannot go on without end.
thread_local bool lookingUpTags = false;
} // namespace

CZSRLanguageItemPtr CZSRLanguageItem::initWithLocaleIdentifier(const QString &localeIdentifier)
{
    auto item = std::shared_ptr<CZSRLanguageItem>(new CZSRLanguageItem);
    const QString normalized = normalizedLocaleIdentifier(localeIdentifier);
    item->setLocaleIdentifier(normalized);
    item->setVisibility(visibiltyValueForLocaleIdentifier(localeIdentifier, nullptr));
    if (!lookingUpTags) {
        item->setTagName(tagNameFromLocaleIdentifier(normalized));
    }
    return item;
}

CZSRLanguageItemPtr CZSRLanguageItem::initWithDownloadableBundleIdentifier(
    const QString &bundleIdentifier, const QVariant &properties)
{
    auto item = std::shared_ptr<CZSRLanguageItem>(new CZSRLanguageItem);
    if (!item->initializeFromCatalogue(bundleIdentifier, properties)) {
        return nullptr;
    }
    item->setVisibility(visibiltyValueForLocaleIdentifier(item->localeIdentifier(), nullptr));
    if (item->tagName().isEmpty() && !lookingUpTags) {
        item->setTagName(tagNameFromLocaleIdentifier(item->localeIdentifier()));
    }
    return item;
}

QList<CZSRLanguageItemPtr> CZSRLanguageItem::downloadableLocalSRLanguageItems()
{
    QList<CZSRLanguageItemPtr> items;
    const QVariant languages = installationDictionaryCache().value(QStringLiteral("DownloadableSRLanguages"));
    const QVariantMap map = languages.typeId() == QMetaType::QVariantMap ? languages.toMap() : QVariantMap();
    for (auto it = map.cbegin(); it != map.cend(); ++it) {
        if (auto item = initWithDownloadableBundleIdentifier(it.key(), it.value())) {
            items.append(item);
        }
    }
    return items;
}

QList<CZSRLanguageItemPtr> CZSRLanguageItem::availableLocalRecognizerLanguageItems()
{
    const auto installed = Services::recognition().installedLanguages();
    if (!installed) {
        return {};
    }
    const QList<CZSRLanguageItemPtr> downloadable = downloadableLocalSRLanguageItems();
    QList<CZSRLanguageItemPtr> items;
    for (const QString &locale : *installed) {
        // Bare language codes name no recognizer of their own, Arabic excepted.
        if (!locale.contains(QLatin1Char('_')) && !locale.contains(QLatin1Char('-')) && locale != u"ar") {
            continue;
        }
        items.append(initWithLocaleIdentifier(normalizedLocaleIdentifier(locale)));
        for (const auto &extension : downloadable) {
            if (isSameLocaleIdentifier(locale, extension->fallbackLocaleIdentifier())) {
                auto item = initWithLocaleIdentifier(extension->localeIdentifier());
                item->setFallbackLocaleIdentifier(extension->fallbackLocaleIdentifier());
                items.append(item);
            }
        }
    }
    return items;
}

QList<CZSRLanguageItemPtr> CZSRLanguageItem::languageItemsFromLocaleIdentifiers(
    const QStringList &identifiers)
{
    const QList<CZSRLanguageItemPtr> downloadable = downloadableLocalSRLanguageItems();
    QList<CZSRLanguageItemPtr> items;
    items.reserve(identifiers.size());
    for (const QString &identifier : identifiers) {
        CZSRLanguageItemPtr found;
        for (const auto &candidate : downloadable) {
            if (isSameLocaleIdentifier(candidate->localeIdentifier(), identifier)) {
                found = candidate;
                break;
            }
        }
        items.append(found ? found : initWithLocaleIdentifier(identifier));
    }
    return items;
}

qsizetype CZSRLanguageItem::bestIndexFromLanguageItems(
    const QList<CZSRLanguageItemPtr> &items, const QString &wanted)
{
    qsizetype exact = -1;
    qsizetype sameLanguage = -1;
    qsizetype english = -1;
    for (qsizetype i = 0; i < items.size(); ++i) {
        const QString locale = items.at(i)->localeIdentifier();
        if (isSameLocaleIdentifier(wanted, locale)) {
            exact = i;
            break;
        }
        if (sameLanguage == -1 && isSameLangaugeFromLocaleIdentifier(wanted, locale)) {
            sameLanguage = i;
            continue;
        }
        if (english == -1 && isSameLocaleIdentifier(locale, QStringLiteral("en_US"))) {
            english = i;
        }
    }
    if (exact != -1) {
        return exact;
    }
    if (sameLanguage == -1) {
        return english;
    }
    if (english == -1) {
        return sameLanguage;
    }
    // An English request without an exact match prefers en_US to the first other English.
    return isSameLangaugeFromLocaleIdentifier(wanted, QStringLiteral("en_US")) ? english : sameLanguage;
}

QString CZSRLanguageItem::preferredDictationLocaleIdentifierFromAvaiableLocaleIdentifiers(
    const QStringList &available, const QString &defaultLocaleIdentifier)
{
    const QString fallback
        = defaultLocaleIdentifier.isNull() ? systemLocaleIdentifier() : defaultLocaleIdentifier;
    const QList<CZSRLanguageItemPtr> items = languageItemsFromLocaleIdentifiers(available);
    const qsizetype index = bestIndexFromLanguageItems(items, fallback);
    if (index < 0 || index >= items.size()) {
        return fallback;
    }
    return items.at(index)->localeIdentifier();
}

std::optional<QVariantMap> CZSRLanguageItem::visibleSRLanguageItemsTable()
{
    Platform::PreferencesStore &preferences = Services::preferences();
    (void)preferences.synchronize(SpeechNames::RecognitionPreferencesDomain);
    const QVariant table = preferences.value(VisibleLocalesKey, SpeechNames::RecognitionPreferencesDomain);
    if (table.typeId() != QMetaType::QVariantMap) {
        return std::nullopt;
    }
    return table.toMap();
}

void CZSRLanguageItem::setVisibleSRLanguageItemsTable(const QVariantMap &table)
{
    Platform::PreferencesStore &preferences = Services::preferences();
    preferences.setValue(VisibleLocalesKey, table, SpeechNames::RecognitionPreferencesDomain);
    (void)preferences.synchronize(SpeechNames::RecognitionPreferencesDomain);
    Services::notifications().postNotification(SpeechNames::DefaultSRLanguageChangedNotification);
}

qint64 CZSRLanguageItem::visibiltyValueForLocaleIdentifier(const QString &localeIdentifier, bool *entryExists)
{
    const auto table = visibleSRLanguageItemsTable();
    if (!table) {
        return 2;
    }
    for (auto it = table->cbegin(); it != table->cend(); ++it) {
        if (isSameLocaleIdentifier(it.key(), localeIdentifier) && SpeechItemPrivate::isNumber(it.value())) {
            if (entryExists) {
                *entryExists = true;
            }
            return qint32(it.value().toLongLong());
        }
    }
    return 2;
}

void CZSRLanguageItem::setVisibilityValue(quint64 value, const QString &forLocaleIdentifier)
{
    QVariantMap table = visibleSRLanguageItemsTable().value_or(QVariantMap());
    for (auto it = table.begin(); it != table.end(); ++it) {
        if (isSameLocaleIdentifier(it.key(), forLocaleIdentifier)) {
            it.value() = QVariant::fromValue<qint64>(qint64(value));
            setVisibleSRLanguageItemsTable(table);
            return;
        }
    }
    table.insert(normalizedLocaleIdentifier(forLocaleIdentifier), QVariant::fromValue<qint64>(qint64(value)));
    setVisibleSRLanguageItemsTable(table);
}

QString CZSRLanguageItem::tagNameFromLocaleIdentifier(const QString &localeIdentifier)
{
    const bool outermost = !lookingUpTags;
    lookingUpTags = true;
    const QList<CZSRLanguageItemPtr> downloadable = downloadableLocalSRLanguageItems();
    if (outermost) {
        lookingUpTags = false;
    }
    for (const auto &item : downloadable) {
        if (isSameLocaleIdentifier(item->localeIdentifier(), localeIdentifier)) {
            return item->tagName();
        }
    }
    return {};
}

QString CZSRLanguageItem::description() const
{
    return QStringLiteral("Locale: %1, Language: %2, Country: %3, Visible: %4, Download: %5 (%6)")
        .arg(localeIdentifier(), languageDisplayString(), countryDisplayString())
        .arg(visibility())
        .arg(downloadStatus())
        .arg(downloadPercentComplete(), 0, 'f', 6);
}

} // namespace Cadenza
