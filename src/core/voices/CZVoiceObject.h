// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICES_CZVOICEOBJECT_H
#define CADENZA_VOICES_CZVOICEOBJECT_H

#include "cadenzacore_export.h"

#include <QString>
#include <QStringList>
#include <QVariantMap>

#include <memory>
#include <optional>

namespace Cadenza {

class CZVoiceObject;
using CZVoiceObjectPtr = std::shared_ptr<CZVoiceObject>;

/**
 * One speech voice: a copy of its attributes from the speech synthesis service, the user's
 * visibility choice, and its download state.
 *
 * The class side keeps the locale rules, the visibility table "VisibleIdentifiers" of the voice
 * preference domain (SpeechNames::VoicePreferencesDomain), and the filter behind every voice menu.
 */
class CADENZACORE_EXPORT CZVoiceObject
{
public:
    /// The key of the visibility table in SpeechNames::VoicePreferencesDomain.
    static const QString VisibleIdentifiersKey;

    virtual ~CZVoiceObject();

    /// A voice object for an installed voice (attributes empty when it is not installed).
    [[nodiscard]] static CZVoiceObjectPtr initWithVoiceIdentifier(const QString &identifier);

    [[nodiscard]] const QVariantMap &voiceAttributes() const { return _voiceAttributes; }
    [[nodiscard]] QString displayName() const;
    /// The name without " Compact" or " Premium", unless the voice names its root itself.
    [[nodiscard]] QString displayNameRoot() const;
    [[nodiscard]] QString identifier() const;
    [[nodiscard]] QString gender() const;
    [[nodiscard]] QString localeIdentifier() const;
    [[nodiscard]] QString languageIdentifier() const;
    [[nodiscard]] QString countryIdentifier() const;
    [[nodiscard]] QString languageDisplayString() const;
    /// Never null: the empty string at worst.
    [[nodiscard]] QString countryDisplayString() const;
    [[nodiscard]] qint64 relativeDesirability() const;
    [[nodiscard]] bool showsInFullListOnly() const;
    /// "Male", "Female" or "Novelty" in the user's language; null for any other gender.
    [[nodiscard]] QString genderDisplayString() const;
    [[nodiscard]] bool doesMatchSystemLocale() const;
    [[nodiscard]] bool isAppropriateForSystemLangauge() const;
    /// Names as a file browser sorts them: digits by value, case ignored.
    [[nodiscard]] int compare(const CZVoiceObject &other) const;
    [[nodiscard]] bool matchesSearchString(const QString &searchString) const;
    [[nodiscard]] QString description() const;

    [[nodiscard]] qint64 visibility() const { return _visibility; }
    void setVisibility(qint64 visibility) { _visibility = visibility; }
    [[nodiscard]] qint64 downloadStatus() const { return _downloadStatus; }
    void setDownloadStatus(qint64 status) { _downloadStatus = status; }
    [[nodiscard]] double downloadPercentComplete() const { return _downloadPercentComplete; }
    void setDownloadPercentComplete(double percent) { _downloadPercentComplete = percent; }

    /// Whether this is a DownloadableVoice.
    [[nodiscard]] virtual bool isDownloadable() const { return false; }

    // The class side.
    /// The user's speech locale: the speech language, else the first preferred language with a
    /// country (the current locale's country added when it has none).
    [[nodiscard]] static QString systemLocaleIdentifier();
    [[nodiscard]] static bool isSameLocaleIdentifier(
        const QString &first, const QString &secondLocaleIdentifier);
    [[nodiscard]] static bool isSameLangaugeFromLocaleIdentifier(
        const QString &first, const QString &secondLocaleIdentifier);
    /// The visibility table, read afresh; nothing when it was never written.
    [[nodiscard]] static std::optional<QVariantMap> visibleVoicesTable();
    /// Writes the table, synchronises, and tells every process.
    static void setVisibleVoicesTable(const QVariantMap &table);
    /// The voices a voice menu lists for @p localeIdentifier, in enumeration order.
    [[nodiscard]] static QList<CZVoiceObjectPtr> visibleVoicesForLocaleIdentifier(
        const QString &localeIdentifier, const QStringList &additionalRequiredVoices, bool allowAllVoices);

protected:
    CZVoiceObject() = default;
    /// Reads the visibility from @p table for @p identifier, with the premium fallback when allowed.
    static qint64 visibilityFromTable(const std::optional<QVariantMap> &table,
        const QString &attributesIdentifier, const QString &givenIdentifier, bool premiumFallback);

    QVariantMap _voiceAttributes;
    qint64 _visibility = 2;
    qint64 _downloadStatus = 0;
    double _downloadPercentComplete = 0;

private:
    // Texts derived from the attributes, made on first use: searches ask for them again and again.
    struct Derived
    {
        QString localeIdentifier;
        QString languageCode;
        QString countryCode;
        QString variantCode;
        std::optional<QString> languageDisplay;
        std::optional<QString> countryDisplay;
        std::optional<QString> genderDisplay;
    };
    Derived &derived() const;
    QString genderDisplayStringUncached() const;

    mutable std::unique_ptr<Derived> m_derived;

    static CZVoiceObjectPtr make(const QString &identifier, const std::optional<QVariantMap> &table);
};

} // namespace Cadenza

#endif
