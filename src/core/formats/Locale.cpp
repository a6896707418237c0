// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "Locale.h"

#include <algorithm>

#include <unicode/uldnames.h>
#include <unicode/uloc.h>

#include <QHash>

#include <array>

namespace Cadenza::Platform {

const QString Locale::IdentifierKey = QStringLiteral("locale:identifier");
const QString Locale::LanguageCodeKey = QStringLiteral("locale:languageCode");
const QString Locale::CountryCodeKey = QStringLiteral("locale:countryCode");
const QString Locale::ScriptCodeKey = QStringLiteral("locale:scriptCode");
const QString Locale::VariantCodeKey = QStringLiteral("locale:variantCode");
const QString Locale::CollationIdentifierKey = QStringLiteral("locale:collation");

namespace {

constexpr int IdentifierCapacity = ULOC_FULLNAME_CAPACITY + ULOC_KEYWORD_AND_VALUES_CAPACITY;

template<typename Getter>
QString component(const QByteArray &identifier, Getter getter)
{
    std::array<char, ULOC_FULLNAME_CAPACITY> buffer {};
    UErrorCode status = U_ZERO_ERROR;
    const int32_t length = getter(identifier.constData(), buffer.data(), int32_t(buffer.size()), &status);
    if (U_FAILURE(status) || status == U_STRING_NOT_TERMINATED_WARNING) {
        return {};
    }
    return QString::fromLatin1(buffer.data(), length);
}

} // namespace

Locale::Locale(const QString &identifier)
    : m_identifier(canonicalLocaleIdentifier(identifier))
{ }

namespace {
// Menus and searches ask about the same few dozen locales again and again; ICU is asked once each.
template<typename Value>
struct AnswerCache
{
    static constexpr qsizetype Capacity = 4096;
    QHash<QString, Value> answers;

    template<typename Compute>
    Value get(const QString &key, Compute compute)
    {
        if (auto it = answers.constFind(key); it != answers.cend()) {
            return *it;
        }
        if (answers.size() >= Capacity) {
            answers.clear();
        }
        Value value = compute();
        answers.insert(key, value);
        return value;
    }
};
} // namespace

QString Locale::canonicalLocaleIdentifier(const QString &identifier)
{
    thread_local AnswerCache<QString> cache;
    return cache.get(identifier, [&] { return canonicalLocaleIdentifierUncached(identifier); });
}

QString Locale::canonicalLocaleIdentifierUncached(const QString &identifier)
{
    QByteArray input = identifier.trimmed().toLatin1();
    // POSIX names carry an encoding and modifier that are not part of the locale.
    if (const int dot = input.indexOf('.'); dot >= 0) {
        input.truncate(dot);
    }
    if (input.isEmpty() || input.size() >= IdentifierCapacity) {
        return {};
    }
    std::array<char, IdentifierCapacity> buffer {};
    UErrorCode status = U_ZERO_ERROR;
    if (input.contains('-')) {
        int32_t parsed = 0;
        uloc_forLanguageTag(input.constData(), buffer.data(), int32_t(buffer.size()), &parsed, &status);
        if (U_SUCCESS(status) && parsed > 0 && status != U_STRING_NOT_TERMINATED_WARNING) {
            input = QByteArray(buffer.data());
        }
        status = U_ZERO_ERROR;
        buffer.fill(0);
    }
    const int32_t length
        = uloc_canonicalize(input.constData(), buffer.data(), int32_t(buffer.size()), &status);
    if (U_FAILURE(status) || status == U_STRING_NOT_TERMINATED_WARNING) {
        return {};
    }
    return QString::fromLatin1(buffer.data(), length);
}

LocaleComponents Locale::componentsFromLocaleIdentifier(const QString &identifier)
{
    thread_local AnswerCache<LocaleComponents> cache;
    return cache.get(identifier, [&] {
        const QByteArray id = canonicalLocaleIdentifier(identifier).toLatin1();
        if (id.isEmpty()) {
            return LocaleComponents();
        }
        return LocaleComponents {component(id, uloc_getLanguage), component(id, uloc_getScript),
            component(id, uloc_getCountry), component(id, uloc_getVariant)};
    });
}

bool Locale::namesALanguage(const QString &identifier)
{
    const QString language = componentsFromLocaleIdentifier(identifier).languageCode;
    return language.size() >= 2 && language.size() <= 8
        && std::all_of(language.cbegin(), language.cend(),
            [](QChar c) { return (c >= u'a' && c <= u'z') || (c >= u'A' && c <= u'Z'); });
}

QString Locale::localeIdentifierFromComponents(const LocaleComponents &components)
{
    QString id = components.languageCode;
    if (!components.scriptCode.isEmpty()) {
        id += QLatin1Char('_') + components.scriptCode;
    }
    if (!components.countryCode.isEmpty() || !components.variantCode.isEmpty()) {
        id += QLatin1Char('_') + components.countryCode;
    }
    if (!components.variantCode.isEmpty()) {
        id += QLatin1Char('_') + components.variantCode;
    }
    return id;
}

QString Locale::displayNameForKey(const QString &key, const QString &value) const
{
    if (value.isNull()) {
        return {};
    }
    UErrorCode status = U_ZERO_ERROR;
    ULocaleDisplayNames *names = uldn_open(m_identifier.toLatin1().constData(), ULDN_STANDARD_NAMES, &status);
    if (U_FAILURE(status)) {
        return {};
    }
    const QByteArray v = value.toUtf8();
    std::array<UChar, 256> buffer {};
    int32_t length = 0;
    status = U_ZERO_ERROR;
    if (key == IdentifierKey) {
        length = uldn_localeDisplayName(names, v.constData(), buffer.data(), int32_t(buffer.size()), &status);
    } else if (key == LanguageCodeKey) {
        length
            = uldn_languageDisplayName(names, v.constData(), buffer.data(), int32_t(buffer.size()), &status);
    } else if (key == CountryCodeKey) {
        length = uldn_regionDisplayName(names, v.constData(), buffer.data(), int32_t(buffer.size()), &status);
    } else if (key == ScriptCodeKey) {
        length = uldn_scriptDisplayName(names, v.constData(), buffer.data(), int32_t(buffer.size()), &status);
    } else if (key == VariantCodeKey) {
        length
            = uldn_variantDisplayName(names, v.constData(), buffer.data(), int32_t(buffer.size()), &status);
    } else if (key == CollationIdentifierKey) {
        length = uldn_keyValueDisplayName(
            names, "collation", v.constData(), buffer.data(), int32_t(buffer.size()), &status);
    } else {
        status = U_ILLEGAL_ARGUMENT_ERROR;
    }
    uldn_close(names);
    if (U_FAILURE(status) || status == U_STRING_NOT_TERMINATED_WARNING || length <= 0) {
        return {};
    }
    return QString(reinterpret_cast<const QChar *>(buffer.data()), length);
}

} // namespace Cadenza::Platform
