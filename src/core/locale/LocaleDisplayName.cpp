// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "LocaleDisplayName.h"
#include "LocaleDisplayName_p.h"

#include "cadenzacore_logging.h"
#include "core/Assertion.h"
#include "core/locale/LocalizationTable.h"

#include <QHash>

#include <unicode/udisplaycontext.h>
#include <unicode/uldnames.h>

#include <atomic>
#include <vector>

namespace Cadenza {

using Platform::Locale;

namespace {

// Assertion reports name this source file and these lines.
const QString SourcePath = QStringLiteral("SpeechDataInstallation/Locale_DisplayName_Priv");
constexpr int UnsupportedKeyLine = 32;
constexpr int InvalidKeyTypeLine = 70;
constexpr int InvalidCapitalizationLine = 104;
constexpr int MissingLanguageLine = 119;

std::atomic<bool> handleCacheEnabled {true};

// Answers already given, per thread. Names that took the fallback are not kept, so their log line
// appears on every call as before.
struct ResultCache
{
    static constexpr qsizetype Capacity = 4096;
    QHash<QString, QString> results;
};
ResultCache &resultCache()
{
    thread_local ResultCache cache;
    return cache;
}

// Read once and kept for the life of the process; meant for the main thread.
QString qualifiedTemplate;

struct HandleCache
{
    QHash<QString, ULocaleDisplayNames *> handles;
    ~HandleCache()
    {
        for (ULocaleDisplayNames *handle : std::as_const(handles)) {
            uldn_close(handle);
        }
    }
};

ULocaleDisplayNames *openHandle(
    const QString &localeIdentifier, UDisplayContext dialect, UDisplayContext capitalization)
{
    UDisplayContext contexts[] = {dialect, capitalization};
    UErrorCode status = U_ZERO_ERROR;
    ULocaleDisplayNames *handle
        = uldn_openForContext(localeIdentifier.toLatin1().constData(), contexts, 2, &status);
    if (U_FAILURE(status)) {
        if (handle) {
            uldn_close(handle);
        }
        return nullptr;
    }
    return handle;
}

// With the cache on, a handle stays open for the thread's life; the caller must not close it.
ULocaleDisplayNames *handleFor(
    const QString &localeIdentifier, UDisplayContext dialect, UDisplayContext capitalization, bool *owned)
{
    if (!handleCacheEnabled.load(std::memory_order_relaxed)) {
        *owned = true;
        return openHandle(localeIdentifier, dialect, capitalization);
    }
    thread_local HandleCache cache;
    const QString key = localeIdentifier + QLatin1Char('|') + QString::number(int(dialect)) + QLatin1Char('|')
        + QString::number(int(capitalization));
    *owned = false;
    if (auto it = cache.handles.constFind(key); it != cache.handles.cend()) {
        return *it;
    }
    ULocaleDisplayNames *handle = openHandle(localeIdentifier, dialect, capitalization);
    if (handle) {
        cache.handles.insert(key, handle);
    }
    return handle;
}

const QString &qualifiedNameTemplate()
{
    if (qualifiedTemplate.isNull()) {
        const QString fromTable
            = Platform::LocalizationTable::shared().text(QStringLiteral("DisplayLanguageQualifiedTemplate"));
        qualifiedTemplate = fromTable.isEmpty() ? QStringLiteral("%@ (%@)") : fromTable;
    }
    return qualifiedTemplate;
}

} // namespace

namespace LocaleDisplayNamePrivate {

void setHandleCacheEnabled(bool enabled)
{
    handleCacheEnabled = enabled;
}

void resetQualifiedTemplate()
{
    qualifiedTemplate = QString();
    resultCache().results.clear();
}

} // namespace LocaleDisplayNamePrivate

QString _icuDisplayName(ULocaleDisplayNames *displayNames, const QString &key, const QString &value)
{
    using Call = int32_t (*)(const ULocaleDisplayNames *, const char *, UChar *, int32_t, UErrorCode *);
    Call call = nullptr;
    bool collation = false;
    if (key == Locale::IdentifierKey) {
        call = uldn_localeDisplayName;
    } else if (key == Locale::LanguageCodeKey) {
        call = uldn_languageDisplayName;
    } else if (key == Locale::CountryCodeKey) {
        call = uldn_regionDisplayName;
    } else if (key == Locale::ScriptCodeKey) {
        call = uldn_scriptDisplayName;
    } else if (key == Locale::VariantCodeKey) {
        call = uldn_variantDisplayName;
    } else if (key == Locale::CollationIdentifierKey) {
        collation = true;
    } else {
        Platform::raiseAssertion(QStringLiteral("_icuDisplayName"), SourcePath, UnsupportedKeyLine,
            QStringLiteral("Unsupported key type %1").arg(key));
    }
    if (value.isNull()) {
        return {};
    }
    const QByteArray utf8 = value.toUtf8();
    auto ask = [&](UChar *buffer, int32_t capacity, UErrorCode *status) {
        return collation
            ? uldn_keyValueDisplayName(displayNames, "collation", utf8.constData(), buffer, capacity, status)
            : call(displayNames, utf8.constData(), buffer, capacity, status);
    };
    // Pre-flight for the length; anything but an overflow means there is no name (or an error).
    UErrorCode status = U_ZERO_ERROR;
    const int32_t length = ask(nullptr, 0, &status);
    if (status != U_BUFFER_OVERFLOW_ERROR) {
        return {};
    }
    std::vector<UChar> buffer(size_t(length) + 1);
    status = U_ZERO_ERROR;
    const int32_t written = ask(buffer.data(), int32_t(buffer.size()), &status);
    if (U_FAILURE(status)) {
        return {};
    }
    return QString(reinterpret_cast<const QChar *>(buffer.data()), written);
}

QString displayNameForKey(
    const Locale &displayLocale, const QVariant &key, const QString &value, quint64 options)
{
    static const QString operationName = QStringLiteral("displayNameForKey:value:options:");
    if (key.typeId() != QMetaType::QString) {
        Platform::raiseAssertion(operationName, SourcePath, InvalidKeyTypeLine,
            QStringLiteral("Invalid key type %1")
                .arg(key.isValid() ? QString::fromLatin1(key.typeName()) : QStringLiteral("null")));
    }
    if (value.isNull()) {
        return {};
    }
    const QString &qualified = qualifiedNameTemplate();

    const UDisplayContext dialect = (options & LocaleDisplayNameOptions::DialectNames)
        ? UDISPCTX_DIALECT_NAMES
        : UDISPCTX_STANDARD_NAMES;
    UDisplayContext capitalization = UDISPCTX_CAPITALIZATION_NONE;
    switch (options & 15) {
    case LocaleDisplayNameOptions::CapitalizationNone:
        capitalization = UDISPCTX_CAPITALIZATION_NONE;
        break;
    case LocaleDisplayNameOptions::CapitalizationForListOrMenu:
        capitalization = UDISPCTX_CAPITALIZATION_FOR_UI_LIST_OR_MENU;
        break;
    case LocaleDisplayNameOptions::CapitalizationStandalone:
        capitalization = UDISPCTX_CAPITALIZATION_FOR_STANDALONE;
        break;
    case LocaleDisplayNameOptions::CapitalizationForBeginningOfSentence:
        capitalization = UDISPCTX_CAPITALIZATION_FOR_BEGINNING_OF_SENTENCE;
        break;
    case LocaleDisplayNameOptions::CapitalizationForMiddleOfSentence:
        capitalization = UDISPCTX_CAPITALIZATION_FOR_MIDDLE_OF_SENTENCE;
        break;
    default:
        // Bit 3 lies inside the low four bits, so dialect names always land here too; kept on purpose.
        Platform::raiseAssertion(operationName, SourcePath, InvalidCapitalizationLine,
            QStringLiteral("Invalid capitalization LocaleDisplayNameOptions %1").arg(options & 15));
    }

    const bool caching = handleCacheEnabled.load(std::memory_order_relaxed);
    const QString keyString = key.toString();
    QString cacheKey;
    if (caching) {
        cacheKey = displayLocale.identifier() + QLatin1Char('|') + QString::number(int(dialect))
            + QLatin1Char('|') + QString::number(int(capitalization)) + QLatin1Char('|') + keyString
            + QLatin1Char('|') + value;
        const auto &results = resultCache().results;
        if (auto it = results.constFind(cacheKey); it != results.cend()) {
            return *it;
        }
    }

    bool owned = false;
    ULocaleDisplayNames *names = handleFor(displayLocale.identifier(), dialect, capitalization, &owned);
    if (!names) {
        return {};
    }
    struct Closer
    {
        ULocaleDisplayNames *names;
        bool owned;
        ~Closer()
        {
            if (owned) {
                uldn_close(names);
            }
        }
    } closer {names, owned};

    QString result;
    if (keyString == Locale::LanguageCodeKey) {
        const Platform::LocaleComponents parts = Locale::componentsFromLocaleIdentifier(value);
        const QString language = _icuDisplayName(names, Locale::LanguageCodeKey, parts.languageCode);
        if (language.isNull()) {
            Platform::raiseAssertion(operationName, SourcePath, MissingLanguageLine,
                QStringLiteral("Could not get language for \u2018%1\u2019").arg(value));
        }
        QStringList qualifiers;
        for (const QString &qualifier : {_icuDisplayName(names, Locale::CountryCodeKey, parts.countryCode),
                 _icuDisplayName(names, Locale::ScriptCodeKey, parts.scriptCode),
                 _icuDisplayName(names, Locale::VariantCodeKey, parts.variantCode)}) {
            if (!qualifier.isNull()) {
                qualifiers.append(qualifier);
            }
        }
        result = qualifiers.isEmpty()
            ? language
            : Platform::LocalizationTable::fill(qualified, {language, qualifiers.join(QStringLiteral(", "))});
    } else {
        result = _icuDisplayName(names, keyString, value);
    }

    if (result == value) {
        qCInfo(Platform::lcLocale, "%s failed to get display name for \u2018%s/%s\u2019",
            qPrintable(operationName), qPrintable(keyString), qPrintable(value));
        return displayLocale.displayNameForKey(keyString, value);
    }
    if (caching) {
        auto &results = resultCache().results;
        if (results.size() >= ResultCache::Capacity) {
            results.clear();
        }
        results.insert(cacheKey, result);
    }
    return result;
}

} // namespace Cadenza
