// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_SPEECHITEMS_CZSPEECHITEM_H
#define CADENZA_SPEECHITEMS_CZSPEECHITEM_H

#include "cadenzacore_export.h"

#include <QMutex>
#include <QString>
#include <QStringList>
#include <QVariantMap>

#include <memory>
#include <optional>

namespace Cadenza {

class CZSpeechItem;
using CZSpeechItemPtr = std::shared_ptr<CZSpeechItem>;

/**
 * One piece of downloadable speech data: identity, locale, size, version, installer tag, download
 * state and the texts it is listed, sorted and searched by.
 *
 * The class side holds the locale rules shared by voices and recognition languages, the filter of
 * visible items, the size and time-remaining texts, and the installation catalogue.
 */
class CADENZACORE_EXPORT CZSpeechItem
{
public:
    /// A plain item with nothing set.
    CZSpeechItem();
    virtual ~CZSpeechItem();

    /// An item from its catalogue entry; nullptr when the entry is not a dictionary. Values of the
    /// wrong type count as absent.
    [[nodiscard]] static CZSpeechItemPtr initWithDownloadableBundleIdentifier(
        const QString &bundleIdentifier, const QVariant &properties);

    // The class side.
    /// The speech service's speech-language locale, or a null string.
    [[nodiscard]] static QString systemLocaleIdentifier();
    /// Same language (case-insensitive) and either no country on both sides or the same country.
    [[nodiscard]] static bool isSameLocaleIdentifier(
        const QString &first, const QString &secondLocaleIdentifier);
    /// Same language code, case-insensitive; both must have one.
    [[nodiscard]] static bool isSameLangaugeFromLocaleIdentifier(
        const QString &first, const QString &secondLocaleIdentifier);
    [[nodiscard]] static bool isLocaleIdentifier(
        const QString &localeIdentifier, const QStringList &containedInLocaleIdentifiers);
    /// The items shown for @p forLocaleIdentifier: shown by the user, of that locale, or required;
    /// when none is, the first en_US item alone.
    [[nodiscard]] static QList<CZSpeechItemPtr> visibleObjectsFromItems(const QList<CZSpeechItemPtr> &items,
        const QString &forLocaleIdentifier, const QStringList &additionalRequiredItems);
    /// The canonical identifier with every "-" made "_".
    [[nodiscard]] static QString normalizedLocaleIdentifier(const QString &identifier);
    /// "999 bytes", "2 KB", "1.5 GB": decimal units, in the user's number format.
    [[nodiscard]] static QString displayStringForByteSize(quint64 byteSize);
    /// "Less than a minute remaining", "About 3 minutes remaining", …
    [[nodiscard]] static QString displayStringForTimeRemaining(double seconds);
    /// @p percent (0 to 100) in the user's percent format: "44%" in English, "44 %" in German.
    [[nodiscard]] static QString displayStringForPercent(qint64 percent);
    /// The catalogue "SpeechDataDefaults", loaded once; empty when it cannot be read.
    [[nodiscard]] static QVariantMap installationDictionaryCache();

    // The instance side.
    [[nodiscard]] QString displayTitle() const;
    [[nodiscard]] QString languageIdentifier() const;
    [[nodiscard]] QString countryIdentifier() const;
    /// The language's name; a language without a name stops the process, by design.
    [[nodiscard]] QString languageDisplayString() const;
    [[nodiscard]] QString countryDisplayString() const;
    [[nodiscard]] bool matchesSearchString(const QString &searchString) const;
    [[nodiscard]] bool doesMatchSystemLocale() const;
    [[nodiscard]] bool isAppropriateForSystemLangauge() const;
    [[nodiscard]] QString displayedSize() const;
    /// Orderings: bundle identifiers as plain strings; display texts as names shown to users.
    [[nodiscard]] int compare(const CZSpeechItem &other) const;
    [[nodiscard]] int compareDisplayTitle(const CZSpeechItem &other) const;
    [[nodiscard]] int compareLanguageTitle(const CZSpeechItem &other) const;
    [[nodiscard]] int compareCountryTitle(const CZSpeechItem &other) const;

    [[nodiscard]] QString bundleIdentifier() const { return _bundleIdentifier; }
    [[nodiscard]] QString localeIdentifier() const;
    void setLocaleIdentifier(const QString &identifier);
    [[nodiscard]] QString fallbackLocaleIdentifier() const;
    void setFallbackLocaleIdentifier(const QString &identifier);
    [[nodiscard]] quint64 byteSize() const { return _byteSize; }
    [[nodiscard]] QString variant() const;
    [[nodiscard]] QString version() const;
    [[nodiscard]] QString tagName() const;
    [[nodiscard]] qint64 visibility() const { return _visibility; }
    void setVisibility(qint64 visibility) { _visibility = visibility; }
    [[nodiscard]] qint64 downloadStatus() const { return _downloadStatus; }
    void setDownloadStatus(qint64 status) { _downloadStatus = status; }
    [[nodiscard]] double downloadPercentComplete() const { return _downloadPercentComplete; }
    void setDownloadPercentComplete(double percent) { _downloadPercentComplete = percent; }
    [[nodiscard]] QString fullSizeBundleIdentifier() const { return _fullSizeBundleIdentifier; }
    [[nodiscard]] quint64 fullSizeByteSize() const { return _fullSizeByteSize; }
    [[nodiscard]] QString fullSizeTagName() const { return _fullSizeTagName; }
    [[nodiscard]] bool showCountryInDisplayTitle() const { return _showCountryInDisplayTitle; }
    void setShowCountryInDisplayTitle(bool show) { _showCountryInDisplayTitle = show; }
    [[nodiscard]] bool downloadFullSize() const { return _downloadFullSize; }
    void setDownloadFullSize(bool fullSize) { _downloadFullSize = fullSize; }
    [[nodiscard]] bool offlineDictationOnly() const { return _offlineDictationOnly; }
    void setOfflineDictationOnly(bool only) { _offlineDictationOnly = only; }

protected:
    /// Sets the fields from a catalogue entry; false when @p properties is not a dictionary.
    bool initializeFromCatalogue(const QString &bundleIdentifier, const QVariant &properties);
    void setVariant(const QString &variant);
    void setTagName(const QString &tagName);

private:
    mutable QMutex m_atomic; // the atomic properties
    QString _bundleIdentifier;
    QString _localeIdentifier;
    QString _fallbackLocaleIdentifier;
    quint64 _byteSize = 0;
    QString _variant;
    QString _version;
    QString _tagName;
    qint64 _visibility = 0;
    qint64 _downloadStatus = 0;
    double _downloadPercentComplete = 0;
    QString _fullSizeBundleIdentifier;
    quint64 _fullSizeByteSize = 0;
    QString _fullSizeTagName;
    bool _showCountryInDisplayTitle = false;
    bool _downloadFullSize = false;
    bool _offlineDictationOnly = false;
};

} // namespace Cadenza

#endif
