// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEITEM_H
#define CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEITEM_H

#include "core/speech-items/CZSpeechItem.h"

namespace Cadenza {

class CZSRLanguageItem;
using CZSRLanguageItemPtr = std::shared_ptr<CZSRLanguageItem>;

/**
 * One speech-recognition (dictation) language: installed on this machine or offered for download.
 *
 * The class side lists the installed and downloadable languages, picks the best one for a locale,
 * and keeps the user's visibility table "VisibleSRLocaleIdentifiers".
 */
class CADENZACORE_EXPORT CZSRLanguageItem : public CZSpeechItem
{
public:
    /// The key of the visibility table in SpeechNames::RecognitionPreferencesDomain.
    static const QString VisibleLocalesKey;

    [[nodiscard]] static CZSRLanguageItemPtr initWithLocaleIdentifier(const QString &localeIdentifier);
    /// nullptr when @p properties is not a dictionary.
    [[nodiscard]] static CZSRLanguageItemPtr initWithDownloadableBundleIdentifier(
        const QString &bundleIdentifier, const QVariant &properties);

    /// The installed recognizer languages, each followed by the downloadable languages that extend it.
    [[nodiscard]] static QList<CZSRLanguageItemPtr> availableLocalRecognizerLanguageItems();
    /// One item per entry of the catalogue's "DownloadableSRLanguages".
    [[nodiscard]] static QList<CZSRLanguageItemPtr> downloadableLocalSRLanguageItems();
    /// One item per identifier, the downloadable item where one has that locale.
    [[nodiscard]] static QList<CZSRLanguageItemPtr> languageItemsFromLocaleIdentifiers(
        const QStringList &identifiers);
    /// The first exact match, else the first of the same language (en_US first for English), else
    /// en_US; -1 when none.
    [[nodiscard]] static qsizetype bestIndexFromLanguageItems(
        const QList<CZSRLanguageItemPtr> &items, const QString &forLocaleIdentifier);
    [[nodiscard]] static QString preferredDictationLocaleIdentifierFromAvaiableLocaleIdentifiers(
        const QStringList &available, const QString &defaultLocaleIdentifier);
    [[nodiscard]] static std::optional<QVariantMap> visibleSRLanguageItemsTable();
    static void setVisibleSRLanguageItemsTable(const QVariantMap &table);
    /// 0 hidden, 1 shown, 2 no entry; sets @p entryExists (when given) only when an entry was found.
    [[nodiscard]] static qint64 visibiltyValueForLocaleIdentifier(
        const QString &localeIdentifier, bool *entryExists);
    static void setVisibilityValue(quint64 value, const QString &forLocaleIdentifier);
    [[nodiscard]] static QString tagNameFromLocaleIdentifier(const QString &localeIdentifier);

    [[nodiscard]] QString description() const;

private:
    CZSRLanguageItem() = default;
};

} // namespace Cadenza

#endif
