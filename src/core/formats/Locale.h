// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_LOCALE_H
#define CADENZA_PLATFORM_LOCALE_H

#include "cadenzacore_export.h"

#include <QString>

namespace Cadenza::Platform {

/// The parts of a locale identifier such as "zh_Hans_CN"; absent parts are empty.
struct CADENZACORE_EXPORT LocaleComponents
{
    QString languageCode;
    QString scriptCode;
    QString countryCode;
    QString variantCode;
    bool operator==(const LocaleComponents &) const = default;
};

/**
 * A locale, named by an identifier in the underscore form ("en_US", "zh_Hans_CN").
 *
 * Parsing and canonicalisation are ICU's. The component keys name what a display name is asked for.
 */
class CADENZACORE_EXPORT Locale
{
public:
    static const QString IdentifierKey;
    static const QString LanguageCodeKey;
    static const QString CountryCodeKey;
    static const QString ScriptCodeKey;
    static const QString VariantCodeKey;
    static const QString CollationIdentifierKey;

    Locale() = default;
    explicit Locale(const QString &identifier);

    /// The canonical identifier; empty for the root locale.
    [[nodiscard]] QString identifier() const { return m_identifier; }
    [[nodiscard]] LocaleComponents components() const { return componentsFromLocaleIdentifier(m_identifier); }
    [[nodiscard]] QString languageCode() const { return components().languageCode; }
    [[nodiscard]] QString countryCode() const { return components().countryCode; }

    /// ICU's standard display name of @p value for @p key, in this locale, without capitalisation context.
    /// Returns a null string when the key is unknown or ICU fails.
    [[nodiscard]] QString displayNameForKey(const QString &key, const QString &value) const;

    /// "en-us", "en_US.UTF-8", "iw" → "en_US", "en_US", "he". Accepts language tags and identifiers.
    /// Answers are kept per thread, so asking again costs a lookup.
    [[nodiscard]] static QString canonicalLocaleIdentifier(const QString &identifier);
    [[nodiscard]] static LocaleComponents componentsFromLocaleIdentifier(const QString &identifier);
    [[nodiscard]] static QString localeIdentifierFromComponents(const LocaleComponents &components);
    /// True when @p identifier parses and names a language (a code of two to eight letters): what a
    /// bundle's locale must do before any list shows it, since every row is titled by its language.
    [[nodiscard]] static bool namesALanguage(const QString &identifier);

private:
    static QString canonicalLocaleIdentifierUncached(const QString &identifier);

    QString m_identifier;
};

} // namespace Cadenza::Platform

#endif
