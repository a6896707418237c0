// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_LOCALE_LOCALEDISPLAYNAME_H
#define CADENZA_LOCALE_LOCALEDISPLAYNAME_H

#include "cadenzacore_export.h"

#include "core/formats/Locale.h"

#include <QString>
#include <QVariant>

struct ULocaleDisplayNames;

namespace Cadenza {

/// Options of displayNameForKey(): a capitalisation (low four bits) and dialect handling (bit 3).
namespace LocaleDisplayNameOptions {
constexpr quint64 CapitalizationNone = 0;
constexpr quint64 CapitalizationForListOrMenu = 1;
constexpr quint64 CapitalizationStandalone = 2;
constexpr quint64 CapitalizationForBeginningOfSentence = 3;
constexpr quint64 CapitalizationForMiddleOfSentence = 4;
constexpr quint64 DialectNames = 8;
} // namespace LocaleDisplayNameOptions

/**
 * The name of @p value (a locale identifier or a code, as @p key says) in @p displayLocale,
 * capitalised as @p options ask.
 *
 * For the language code key the value is a whole locale identifier and the answer names its
 * qualifiers too: "English (United States)". A null value gives a null string; so does a failure of
 * ICU. When ICU knows no name, the locale's plain display name is returned after one log line.
 * Misuse (a key that is not a string, an unsupported key, an invalid capitalisation, a value without
 * a language name) raises Platform::AssertionFailure.
 */
[[nodiscard]] CADENZACORE_EXPORT QString displayNameForKey(
    const Platform::Locale &displayLocale, const QVariant &key, const QString &value, quint64 options);

/// One ICU display-name call for @p key on an open handle; null on failure or an empty name.
[[nodiscard]] CADENZACORE_EXPORT QString _icuDisplayName(
    ULocaleDisplayNames *displayNames, const QString &key, const QString &value);

} // namespace Cadenza

#endif
