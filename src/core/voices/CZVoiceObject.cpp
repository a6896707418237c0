// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZVoiceObject.h"

#include "core/Assertion.h"
#include "core/SpeechNames.h"
#include "core/formats/Locale.h"
#include "core/formats/VoiceDescription.h"
#include "core/locale/LocaleDisplayName.h"
#include "core/locale/LocalizationTable.h"
#include "core/locale/WordStem.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/PreferencesStore.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"
#include "core/services/UserLocaleService.h"
#include "core/speech-items/CZSpeechItem.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "core/voices/SpeechSynthesizer.h"

#include <QStringTokenizer>

namespace Cadenza {

using Platform::Locale;
using Platform::Services;
namespace VoiceAttribute = Platform::VoiceAttribute;

const QString CZVoiceObject::VisibleIdentifiersKey = QStringLiteral("VisibleIdentifiers");

CZVoiceObject::~CZVoiceObject() = default;

qint64 CZVoiceObject::visibilityFromTable(const std::optional<QVariantMap> &table,
    const QString &attributesIdentifier, const QString &givenIdentifier, bool premiumFallback)
{
    if (!table) {
        return 2;
    }
    QVariant value = table->value(attributesIdentifier);
    // A compact voice inherits what the user chose for its premium form.
    if (!value.isValid() && premiumFallback && !givenIdentifier.endsWith(QLatin1String("premium"))
        && !givenIdentifier.endsWith(QLatin1String("compact"))) {
        value = table->value(givenIdentifier + QStringLiteral(".premium"));
    }
    return SpeechItemPrivate::isNumber(value) ? value.toLongLong() : 2;
}

CZVoiceObjectPtr CZVoiceObject::make(const QString &identifier, const std::optional<QVariantMap> &table)
{
    auto voice = std::shared_ptr<CZVoiceObject>(new CZVoiceObject);
    voice->_voiceAttributes = Services::speechSynthesis().attributesForVoice(identifier);
    voice->_visibility = visibilityFromTable(table, voice->identifier(), identifier, true);
    return voice;
}

CZVoiceObjectPtr CZVoiceObject::initWithVoiceIdentifier(const QString &identifier)
{
    return make(identifier, visibleVoicesTable());
}

QString CZVoiceObject::displayName() const
{
    return SpeechItemPrivate::stringValue(_voiceAttributes.value(VoiceAttribute::Name));
}

QString CZVoiceObject::displayNameRoot() const
{
    const QString root = SpeechItemPrivate::stringValue(_voiceAttributes.value(VoiceAttribute::NameRoot));
    if (!root.isNull()) {
        return root;
    }
    const QString name = displayName();
    if (name.endsWith(QLatin1String("Compact")) || name.endsWith(QLatin1String("Premium"))) {
        return name.chopped(qMin<qsizetype>(8, name.size()));
    }
    return name;
}

QString CZVoiceObject::identifier() const
{
    return SpeechItemPrivate::stringValue(_voiceAttributes.value(VoiceAttribute::Identifier));
}

QString CZVoiceObject::gender() const
{
    return SpeechItemPrivate::stringValue(_voiceAttributes.value(VoiceAttribute::Gender));
}

CZVoiceObject::Derived &CZVoiceObject::derived() const
{
    if (!m_derived) {
        m_derived = std::make_unique<Derived>();
        QString locale
            = SpeechItemPrivate::stringValue(_voiceAttributes.value(VoiceAttribute::LocaleIdentifier));
        if (locale.isEmpty()) {
            locale = SpeechItemPrivate::stringValue(_voiceAttributes.value(VoiceAttribute::Language));
        }
        if (locale.isEmpty()) {
            locale = QStringLiteral("en_US");
        }
        m_derived->localeIdentifier = Locale::canonicalLocaleIdentifier(locale);
        const auto parts = Locale::componentsFromLocaleIdentifier(m_derived->localeIdentifier);
        m_derived->languageCode = parts.languageCode;
        m_derived->countryCode = parts.countryCode;
        m_derived->variantCode = parts.variantCode;
    }
    return *m_derived;
}

QString CZVoiceObject::localeIdentifier() const
{
    return derived().localeIdentifier;
}

QString CZVoiceObject::languageIdentifier() const
{
    const QString &code = derived().languageCode;
    return code.isEmpty() ? QString() : code;
}

QString CZVoiceObject::countryIdentifier() const
{
    const QString &code = derived().countryCode;
    return code.isEmpty() ? QString() : code;
}

QString CZVoiceObject::languageDisplayString() const
{
    Derived &d = derived();
    if (!d.languageDisplay) {
        d.languageDisplay = SpeechItemPrivate::conversionDisplayName(Locale::LanguageCodeKey, d.languageCode);
    }
    return *d.languageDisplay;
}

QString CZVoiceObject::countryDisplayString() const
{
    Derived &d = derived();
    if (!d.countryDisplay) {
        QString name;
        if (!d.countryCode.isEmpty()) {
            name = SpeechItemPrivate::conversionDisplayName(Locale::CountryCodeKey, d.countryCode);
        } else if (!d.variantCode.isEmpty()) {
            name = SpeechItemPrivate::conversionDisplayName(Locale::VariantCodeKey, d.variantCode);
        } else if (!d.languageCode.isEmpty()) {
            name = SpeechItemPrivate::conversionDisplayName(Locale::LanguageCodeKey, d.languageCode);
        }
        d.countryDisplay = name.isNull() ? QStringLiteral("") : name;
    }
    return *d.countryDisplay;
}

qint64 CZVoiceObject::relativeDesirability() const
{
    const QVariant value = _voiceAttributes.value(VoiceAttribute::RelativeDesirability);
    return SpeechItemPrivate::isNumber(value) ? value.toLongLong() : 0;
}

bool CZVoiceObject::showsInFullListOnly() const
{
    const QVariant value = _voiceAttributes.value(VoiceAttribute::ShowInFullListOnly);
    return SpeechItemPrivate::isNumber(value) && value.toBool();
}

QString CZVoiceObject::genderDisplayString() const
{
    Derived &d = derived();
    if (!d.genderDisplay) {
        d.genderDisplay = genderDisplayStringUncached();
    }
    return *d.genderDisplay;
}

QString CZVoiceObject::genderDisplayStringUncached() const
{
    // Every voice of a list asks once; the three texts depend only on the table's language.
    struct GenderTexts
    {
        QString language;
        QString male, female, novelty;
    };
    thread_local GenderTexts texts;
    const Platform::LocalizationTable &table = Platform::LocalizationTable::shared();
    if (texts.language.isNull() || texts.language != table.language()) {
        texts = {table.language(), table.text(QStringLiteral("Male")), table.text(QStringLiteral("Female")),
            table.text(QStringLiteral("Novelty"))};
    }
    const QString value = gender();
    if (value == Platform::VoiceGender::Male) {
        return texts.male;
    }
    if (value == Platform::VoiceGender::Female) {
        return texts.female;
    }
    if (value == Platform::VoiceGender::Neuter) {
        return texts.novelty;
    }
    return {};
}

bool CZVoiceObject::doesMatchSystemLocale() const
{
    return isSameLocaleIdentifier(systemLocaleIdentifier(), localeIdentifier());
}

bool CZVoiceObject::isAppropriateForSystemLangauge() const
{
    return isSameLangaugeFromLocaleIdentifier(systemLocaleIdentifier(), localeIdentifier());
}

int CZVoiceObject::compare(const CZVoiceObject &other) const
{
    return SpeechItemPrivate::compareForDisplay(displayName(), other.displayName());
}

bool CZVoiceObject::matchesSearchString(const QString &searchString) const
{
    // Called for every voice on every keystroke: the words are views into the search string, so
    // nothing is allocated for them.
    QString language, country, genderText;
    bool namesKnown = false;
    for (const QStringView word : qTokenize(searchString, QLatin1Char(' '))) {
        if (word.isEmpty()) {
            continue;
        }
        if (containsWordStem(displayName(), word)) {
            continue;
        }
        if (!namesKnown) {
            language = languageDisplayString();
            country = countryDisplayString();
            genderText = genderDisplayString();
            namesKnown = true;
        }
        if (!containsWordStem(language, word) && !containsWordStem(country, word)
            && !containsWordStem(genderText, word)) {
            return false;
        }
    }
    return true;
}

QString CZVoiceObject::description() const
{
    return QStringLiteral(
        "Name: %1, Identifier: %2, Locale: %3, Language: %4, Country: %5, Gender: %6, Download: %7 (%8)")
        .arg(displayName(), identifier(), localeIdentifier(), languageDisplayString(), countryDisplayString(),
            genderDisplayString())
        .arg(_downloadStatus)
        .arg(_downloadPercentComplete, 0, 'f', 6);
}

QString CZVoiceObject::systemLocaleIdentifier()
{
    if (const auto speech = Services::speechSynthesis().speechLanguageLocale()) {
        return *speech;
    }
    const QStringList preferred = Services::userLocale().preferredLanguages();
    if (preferred.isEmpty()) {
        return {};
    }
    auto parts = Locale::componentsFromLocaleIdentifier(preferred.first());
    if (!parts.countryCode.isEmpty()) {
        return preferred.first();
    }
    const QString country
        = Locale::componentsFromLocaleIdentifier(Services::userLocale().currentLocaleIdentifier())
              .countryCode;
    if (!country.isEmpty()) {
        parts.countryCode = country;
    }
    return Locale::localeIdentifierFromComponents(parts);
}

bool CZVoiceObject::isSameLocaleIdentifier(const QString &first, const QString &secondLocaleIdentifier)
{
    return CZSpeechItem::isSameLocaleIdentifier(first, secondLocaleIdentifier);
}

bool CZVoiceObject::isSameLangaugeFromLocaleIdentifier(
    const QString &first, const QString &secondLocaleIdentifier)
{
    return CZSpeechItem::isSameLangaugeFromLocaleIdentifier(first, secondLocaleIdentifier);
}

std::optional<QVariantMap> CZVoiceObject::visibleVoicesTable()
{
    Platform::PreferencesStore &preferences = Services::preferences();
    (void)preferences.synchronize(SpeechNames::VoicePreferencesDomain);
    const QVariant table = preferences.value(VisibleIdentifiersKey, SpeechNames::VoicePreferencesDomain);
    if (table.typeId() != QMetaType::QVariantMap) {
        return std::nullopt;
    }
    return table.toMap();
}

void CZVoiceObject::setVisibleVoicesTable(const QVariantMap &table)
{
    Platform::PreferencesStore &preferences = Services::preferences();
    preferences.setValue(VisibleIdentifiersKey, table, SpeechNames::VoicePreferencesDomain);
    (void)preferences.synchronize(SpeechNames::VoicePreferencesDomain);
    Services::notifications().postNotification(SpeechNames::DefaultVoiceChangedNotification);
}

QList<CZVoiceObjectPtr> CZVoiceObject::visibleVoicesForLocaleIdentifier(
    const QString &localeIdentifier, const QStringList &additionalRequiredVoices, bool allowAllVoices)
{
    const QStringList candidates
        = allowAllVoices ? SpeechSynthesizer::allVoices() : SpeechSynthesizer::avaliableMainstreamVoices();
    Platform::SpeechSynthesisService &service = Services::speechSynthesis();

    // First pass: is there a voice of exactly this locale, or at least of its language?
    bool exactMatch = false;
    bool languageMatch = false;
    for (const QString &candidate : candidates) {
        const QVariantMap attributes = service.attributesForVoice(candidate);
        const QString locale
            = SpeechItemPrivate::stringValue(attributes.value(VoiceAttribute::LocaleIdentifier));
        if (isSameLocaleIdentifier(locale, localeIdentifier)) {
            exactMatch = true;
            languageMatch = true;
            break;
        }
        if (isSameLangaugeFromLocaleIdentifier(locale, localeIdentifier)) {
            languageMatch = true;
        }
    }
    const QString defaultVoice = allowAllVoices ? SpeechSynthesizer::defaultVoiceFromAllVoices()
                                                : SpeechSynthesizer::defaultVoiceFromMainstreamVoices();

    // Read once for the whole pass: the table and the system locale cannot change in between.
    const std::optional<QVariantMap> table = visibleVoicesTable();
    const QString system = systemLocaleIdentifier();
    QList<CZVoiceObjectPtr> included;
    for (const QString &candidate : candidates) {
        CZVoiceObjectPtr voice = make(candidate, table);
        const qint64 visibility = voice->visibility();
        const bool automatic = visibility == 2 && !voice->showsInFullListOnly();
        bool include = visibility == 1;
        if (!include && automatic) {
            include = exactMatch ? isSameLocaleIdentifier(system, voice->localeIdentifier())
                                 : isSameLangaugeFromLocaleIdentifier(system, voice->localeIdentifier());
        }
        if (!include && automatic && !languageMatch) {
            include = isSameLocaleIdentifier(voice->localeIdentifier(), QStringLiteral("en_US"));
        }
        if (!include) {
            include = voice->identifier() == defaultVoice
                || additionalRequiredVoices.contains(voice->identifier());
        }
        if (include) {
            included.append(voice);
        }
    }
    return included;
}

} // namespace Cadenza
