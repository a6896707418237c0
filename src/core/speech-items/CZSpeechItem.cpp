// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZSpeechItem.h"
#include "CZSpeechItem_p.h"

#include "cadenzacore_logging.h"
#include "core/Assertion.h"
#include "core/formats/PropertyList.h"
#include "core/locale/LocaleDisplayName.h"
#include "core/locale/LocalizationTable.h"
#include "core/locale/WordStem.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"
#include "core/services/UserLocaleService.h"

#include <QCollator>
#include <QHash>
#include <QLocale>

#include <cmath>
#include <cstdlib>
#include <limits>

#include <unicode/unum.h>

namespace Cadenza {

using Platform::Locale;
using Platform::LocalizationTable;

namespace {

const QString CatalogueResource = QStringLiteral(":/cadenza/SpeechDataDefaults.plist");

struct SharedState
{
    QMutex mutex;
    std::optional<QVariantMap> catalogue;
    bool catalogueLoaded = false;
    std::optional<Locale> conversionLocale;
};

SharedState &shared()
{
    static SharedState state; // lives until exit
    return state;
}

} // namespace

namespace SpeechItemPrivate {

void setInstallationDictionary(const std::optional<QVariantMap> &catalogue)
{
    SharedState &s = shared();
    QMutexLocker locker(&s.mutex);
    s.catalogue = catalogue;
    s.catalogueLoaded = true;
}

void resetConversionLocale()
{
    SharedState &s = shared();
    QMutexLocker locker(&s.mutex);
    s.conversionLocale.reset();
}

bool isNumber(const QVariant &value)
{
    switch (value.typeId()) {
    case QMetaType::LongLong:
    case QMetaType::ULongLong:
    case QMetaType::Int:
    case QMetaType::UInt:
    case QMetaType::Double:
    case QMetaType::Float:
    case QMetaType::Bool:
        return true;
    default:
        return false;
    }
}

quint64 unsignedValue(const QVariant &value)
{
    if (!isNumber(value)) {
        return 0;
    }
    if (value.typeId() == QMetaType::Double) {
        return value.toDouble() > 0 ? quint64(value.toDouble()) : 0;
    }
    return value.toULongLong();
}

QString stringValue(const QVariant &value)
{
    return value.typeId() == QMetaType::QString ? value.toString() : QString();
}

QString conversionDisplayName(const QString &key, const QString &code)
{
    if (code.isEmpty()) {
        return {};
    }
    // Lists ask for the names of the same few codes thousands of times. Names ICU knew are kept;
    // a code that fell back to itself is asked again, so its log line is written every time.
    // Kept by key, then by code, so that a lookup makes no new string.
    struct Cache
    {
        QString localeIdentifier;
        QHash<QString, QHash<QString, QString>> namesByKey;
        qsizetype size = 0;
    };
    thread_local Cache cache;
    const Platform::Locale locale = _conversionLocale();
    if (cache.localeIdentifier != locale.identifier() || cache.size > 4096) {
        cache = {locale.identifier(), {}, 0};
    }
    QHash<QString, QString> &names = cache.namesByKey[key];
    if (const auto it = names.constFind(code); it != names.cend()) {
        return *it;
    }
    QString name;
    try {
        name = displayNameForKey(locale, key, code, LocaleDisplayNameOptions::CapitalizationForListOrMenu);
    } catch (const Platform::AssertionFailure &) {
        return {}; // a code without a language name: the caller decides what that means
    }
    if (!name.isNull() && name != code) {
        names.insert(code, name);
        ++cache.size;
    }
    return name;
}

int compareForDisplay(const QString &a, const QString &b)
{
    thread_local QCollator collator = [] {
        QCollator c(QLocale(Platform::Services::userLocale().currentLocaleIdentifier()));
        c.setNumericMode(true);
        c.setCaseSensitivity(Qt::CaseInsensitive);
        return c;
    }();
    return collator.compare(a, b);
}

} // namespace SpeechItemPrivate

using namespace SpeechItemPrivate;

CZSpeechItem::CZSpeechItem() = default;
CZSpeechItem::~CZSpeechItem() = default;

CZSpeechItemPtr CZSpeechItem::initWithDownloadableBundleIdentifier(
    const QString &bundleIdentifier, const QVariant &properties)
{
    auto item = std::make_shared<CZSpeechItem>();
    if (!item->initializeFromCatalogue(bundleIdentifier, properties)) {
        return nullptr;
    }
    return item;
}

bool CZSpeechItem::initializeFromCatalogue(const QString &bundleIdentifier, const QVariant &entry)
{
    if (entry.typeId() != QMetaType::QVariantMap) {
        return false;
    }
    const QVariantMap properties = entry.toMap();
    QMutexLocker locker(&m_atomic);
    _bundleIdentifier = bundleIdentifier;
    _localeIdentifier = stringValue(properties.value(QStringLiteral("LocaleIdentifier")));
    _fallbackLocaleIdentifier = stringValue(properties.value(QStringLiteral("FallbackLocaleIdentifier")));
    _byteSize = unsignedValue(properties.value(QStringLiteral("ByteSize")));
    _version = stringValue(properties.value(QStringLiteral("Version")));
    _tagName = stringValue(properties.value(QStringLiteral("Tag")));
    _fullSizeByteSize = unsignedValue(properties.value(QStringLiteral("FullSizeByteSize")));
    _fullSizeBundleIdentifier = stringValue(properties.value(QStringLiteral("FullSizeBundleIdentifier")));
    _fullSizeTagName = stringValue(properties.value(QStringLiteral("FullSizeTagName")));
    return true;
}

QString CZSpeechItem::systemLocaleIdentifier()
{
    return Platform::Services::speechSynthesis().speechLanguageLocale().value_or(QString());
}

bool CZSpeechItem::isSameLocaleIdentifier(const QString &first, const QString &secondLocaleIdentifier)
{
    const auto a = Locale::componentsFromLocaleIdentifier(first);
    const auto b = Locale::componentsFromLocaleIdentifier(secondLocaleIdentifier);
    if (a.languageCode.isEmpty() || b.languageCode.isEmpty()
        || a.languageCode.compare(b.languageCode, Qt::CaseInsensitive) != 0) {
        return false;
    }
    if (a.countryCode.isEmpty() && b.countryCode.isEmpty()) {
        return true;
    }
    if (a.countryCode.isEmpty() != b.countryCode.isEmpty()) {
        return false;
    }
    return a.countryCode.compare(b.countryCode, Qt::CaseInsensitive) == 0;
}

bool CZSpeechItem::isSameLangaugeFromLocaleIdentifier(
    const QString &first, const QString &secondLocaleIdentifier)
{
    const QString a = Locale::componentsFromLocaleIdentifier(first).languageCode;
    const QString b = Locale::componentsFromLocaleIdentifier(secondLocaleIdentifier).languageCode;
    return !a.isEmpty() && !b.isEmpty() && a.compare(b, Qt::CaseInsensitive) == 0;
}

bool CZSpeechItem::isLocaleIdentifier(
    const QString &localeIdentifier, const QStringList &containedInLocaleIdentifiers)
{
    for (const QString &candidate : containedInLocaleIdentifiers) {
        if (isSameLocaleIdentifier(candidate, localeIdentifier)) {
            return true;
        }
    }
    return false;
}

QList<CZSpeechItemPtr> CZSpeechItem::visibleObjectsFromItems(const QList<CZSpeechItemPtr> &items,
    const QString &forLocaleIdentifier, const QStringList &additionalRequiredItems)
{
    QList<CZSpeechItemPtr> kept;
    CZSpeechItemPtr english;
    for (const auto &item : items) {
        const QString locale = item->localeIdentifier();
        if (item->visibility() == 1 || isSameLocaleIdentifier(locale, forLocaleIdentifier)
            || additionalRequiredItems.contains(locale)) {
            kept.append(item);
        }
        if (!english && isSameLocaleIdentifier(locale, QStringLiteral("en_US"))) {
            english = item;
        }
    }
    if (kept.isEmpty() && english) {
        return {english};
    }
    return kept;
}

QString CZSpeechItem::normalizedLocaleIdentifier(const QString &identifier)
{
    QString canonical = Locale::canonicalLocaleIdentifier(identifier);
    return canonical.replace(QLatin1Char('-'), QLatin1Char('_'));
}

QString CZSpeechItem::displayStringForByteSize(quint64 byteSize)
{
    const QLocale numbers(Platform::Services::userLocale().currentLocaleIdentifier());
    const LocalizationTable &table = LocalizationTable::shared();
    if (byteSize <= 999) {
        return table.format(QStringLiteral("ByteSize"), {numbers.toString(byteSize)});
    }
    if (byteSize <= 999999) {
        return table.format(QStringLiteral("KBSize"), {numbers.toString((byteSize + 500) / 1000)});
    }
    if (byteSize <= 999999999) {
        return table.format(QStringLiteral("MBSize"), {numbers.toString((byteSize + 500000) / 1000000)});
    }
    // At most one decimal, and none when it would be 0: "1.5 GB", "2 GB".
    QString gigabytes = numbers.toString(double(byteSize) / 1e9, 'f', 1);
    const QString zero = numbers.decimalPoint() + numbers.zeroDigit();
    if (gigabytes.endsWith(zero)) {
        gigabytes.chop(zero.size());
    }
    return table.format(QStringLiteral("GBSize"), {gigabytes});
}

QString CZSpeechItem::displayStringForPercent(qint64 percent)
{
    const QString locale = Platform::Services::userLocale().currentLocaleIdentifier();
    // ICU knows where each language puts the sign and whether a space comes before it.
    UErrorCode status = U_ZERO_ERROR;
    UNumberFormat *format
        = unum_open(UNUM_PERCENT, nullptr, 0, locale.toUtf8().constData(), nullptr, &status);
    if (U_SUCCESS(status)) {
        UChar buffer[64];
        const int32_t length
            = unum_formatDouble(format, double(percent) / 100.0, buffer, 64, nullptr, &status);
        unum_close(format);
        if (U_SUCCESS(status) && length > 0 && length <= 64) {
            return QString(reinterpret_cast<const QChar *>(buffer), length);
        }
    }
    return QLocale(locale).toString(percent) + QLocale(locale).percent();
}

QString CZSpeechItem::displayStringForTimeRemaining(double seconds)
{
    // The estimate keeps NaN samples on purpose and a daemon's record can carry any number: a time
    // that is no number, or minus infinity, reads as no time at all; one beyond a century (plus
    // infinity included) as the formatter's infinity. Whole hours are then always exact.
    constexpr double Century = 100.0 * 365.25 * 24 * 3600;
    if (std::isnan(seconds) || seconds == -std::numeric_limits<double>::infinity()) {
        return QString();
    }
    const QLocale numbers(Platform::Services::userLocale().currentLocaleIdentifier());
    const LocalizationTable &table = LocalizationTable::shared();
    if (seconds >= Century) {
        return table.format(
            QStringLiteral("DownloadingProgressTimeRemainingNHours"), {QStringLiteral("\u221E")});
    }
    if (seconds < 120) {
        return table.text(QStringLiteral("DownloadingProgressTimeRemainingLessThanAMinute"));
    }
    if (seconds < 3300) {
        return table.format(QStringLiteral("DownloadingProgressTimeRemainingNMinutes"),
            {numbers.toString(qint64(seconds / 60))});
    }
    if (seconds < 7200) {
        return table.text(QStringLiteral("DownloadingProgressTimeRemainingAboutAnHour"));
    }
    return table.format(
        QStringLiteral("DownloadingProgressTimeRemainingNHours"), {numbers.toString(qint64(seconds / 3600))});
}

QVariantMap CZSpeechItem::installationDictionaryCache()
{
    SharedState &s = shared();
    QMutexLocker locker(&s.mutex);
    if (!s.catalogueLoaded) {
        s.catalogueLoaded = true;
        QString error;
        const auto parsed = Platform::PropertyList::readFile(CatalogueResource, &error);
        if (parsed && parsed->typeId() == QMetaType::QVariantMap) {
            s.catalogue = parsed->toMap();
        } else {
            qCWarning(
                Platform::lcInstallation, "Cannot read the installation catalogue: %s", qPrintable(error));
        }
    }
    return s.catalogue.value_or(QVariantMap());
}

Platform::Locale SpeechItemPrivate::_conversionLocale()
{
    SharedState &s = shared();
    QMutexLocker locker(&s.mutex);
    if (!s.conversionLocale) {
        const QString language = LocalizationTable::hostPreferredLocalization();
        const QString identifier = Locale::localeIdentifierFromComponents({language, {}, {}, {}});
        Locale locale(identifier);
        if (locale.identifier().isEmpty()) {
            locale = Locale(Platform::Services::userLocale().currentLocaleIdentifier());
        }
        s.conversionLocale = locale;
    }
    return *s.conversionLocale;
}

QString CZSpeechItem::displayTitle() const
{
    if (!_showCountryInDisplayTitle) {
        return languageDisplayString();
    }
    return LocalizationTable::shared().format(
        QStringLiteral("LanguageWithCountryGroupFormat"), {languageDisplayString(), countryDisplayString()});
}

QString CZSpeechItem::languageIdentifier() const
{
    return Locale::componentsFromLocaleIdentifier(localeIdentifier()).languageCode;
}

QString CZSpeechItem::countryIdentifier() const
{
    return Locale::componentsFromLocaleIdentifier(localeIdentifier()).countryCode;
}

QString CZSpeechItem::languageDisplayString() const
{
    const QString language = languageIdentifier();
    const QString name
        = language.isEmpty() ? QString() : conversionDisplayName(Locale::LanguageCodeKey, language);
    if (!name.isNull()) {
        return name;
    }
    // A row without a language name would be blank: stopping makes the broken data visible.
    const QStringList preferred = Platform::Services::userLocale().preferredLanguages();
    qCCritical(Platform::lcLocale, "%s",
        qPrintable(QStringLiteral("Language display name is nil for locale: %1, lang: %2, for curLocale: %3, "
                                  "autoCurLocale: %4, prefLangs: %5.")
                       .arg(localeIdentifier(), language, SpeechItemPrivate::_conversionLocale().identifier(),
                           Platform::Services::userLocale().currentLocaleIdentifier(),
                           preferred.join(QStringLiteral(", ")))));
    std::abort();
}

QString CZSpeechItem::countryDisplayString() const
{
    QString identifier = localeIdentifier();
    if (identifier == u"ar") {
        identifier = QStringLiteral("ar_SA");
    }
    const auto parts = Locale::componentsFromLocaleIdentifier(identifier);
    if (!parts.countryCode.isEmpty()) {
        return conversionDisplayName(Locale::CountryCodeKey, parts.countryCode);
    }
    if (!parts.variantCode.isEmpty()) {
        return conversionDisplayName(Locale::VariantCodeKey, parts.variantCode);
    }
    return conversionDisplayName(Locale::LanguageCodeKey, parts.languageCode);
}

bool CZSpeechItem::matchesSearchString(const QString &searchString) const
{
    const QStringList words = searchString.split(QLatin1Char(' '));
    for (const QString &word : words) {
        if (word.isEmpty()) {
            continue;
        }
        if (!containsWordStem(displayTitle(), word) && !containsWordStem(languageDisplayString(), word)
            && !containsWordStem(countryDisplayString(), word)) {
            return false;
        }
    }
    return true;
}

bool CZSpeechItem::doesMatchSystemLocale() const
{
    return isSameLocaleIdentifier(systemLocaleIdentifier(), localeIdentifier());
}

bool CZSpeechItem::isAppropriateForSystemLangauge() const
{
    return isSameLangaugeFromLocaleIdentifier(systemLocaleIdentifier(), localeIdentifier());
}

QString CZSpeechItem::displayedSize() const
{
    return displayStringForByteSize(_byteSize);
}

int CZSpeechItem::compare(const CZSpeechItem &other) const
{
    return QString::compare(_bundleIdentifier, other._bundleIdentifier);
}

int CZSpeechItem::compareDisplayTitle(const CZSpeechItem &other) const
{
    return compareForDisplay(displayTitle(), other.displayTitle());
}

int CZSpeechItem::compareLanguageTitle(const CZSpeechItem &other) const
{
    return compareForDisplay(languageDisplayString(), other.languageDisplayString());
}

int CZSpeechItem::compareCountryTitle(const CZSpeechItem &other) const
{
    return compareForDisplay(countryDisplayString(), other.countryDisplayString());
}

QString CZSpeechItem::localeIdentifier() const
{
    QMutexLocker locker(&m_atomic);
    return _localeIdentifier;
}

void CZSpeechItem::setLocaleIdentifier(const QString &identifier)
{
    QMutexLocker locker(&m_atomic);
    _localeIdentifier = identifier;
}

QString CZSpeechItem::fallbackLocaleIdentifier() const
{
    QMutexLocker locker(&m_atomic);
    return _fallbackLocaleIdentifier;
}

void CZSpeechItem::setFallbackLocaleIdentifier(const QString &identifier)
{
    QMutexLocker locker(&m_atomic);
    _fallbackLocaleIdentifier = identifier;
}

QString CZSpeechItem::variant() const
{
    QMutexLocker locker(&m_atomic);
    return _variant;
}

void CZSpeechItem::setVariant(const QString &variant)
{
    QMutexLocker locker(&m_atomic);
    _variant = variant;
}

QString CZSpeechItem::version() const
{
    QMutexLocker locker(&m_atomic);
    return _version;
}

QString CZSpeechItem::tagName() const
{
    QMutexLocker locker(&m_atomic);
    return _tagName;
}

void CZSpeechItem::setTagName(const QString &tagName)
{
    QMutexLocker locker(&m_atomic);
    _tagName = tagName;
}

} // namespace Cadenza
