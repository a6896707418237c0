// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_SPEECHITEMS_CZSPEECHITEM_P_H
#define CADENZA_SPEECHITEMS_CZSPEECHITEM_P_H

#include "cadenzacore_export.h"
#include "core/formats/Locale.h"

#include <QVariantMap>

#include <optional>

namespace Cadenza::SpeechItemPrivate {

/// The locale that display names are given in: the language of the host's localisation.
[[nodiscard]] CADENZACORE_EXPORT Platform::Locale _conversionLocale();
/// Replaces the catalogue (tests); nothing goes back to the shipped one.
CADENZACORE_EXPORT void setInstallationDictionary(const std::optional<QVariantMap> &catalogue);
/// Forgets the conversion locale, so that it follows the current user locale service (tests).
CADENZACORE_EXPORT void resetConversionLocale();

/// Reads a catalogue number as unsigned 64-bit; anything else counts as 0.
[[nodiscard]] CADENZACORE_EXPORT quint64 unsignedValue(const QVariant &value);
/// A catalogue string, or a null string when the value is not a string.
[[nodiscard]] CADENZACORE_EXPORT QString stringValue(const QVariant &value);
/// Whether @p value is a number of a property list (integer, real or boolean).
[[nodiscard]] CADENZACORE_EXPORT bool isNumber(const QVariant &value);
/// The conversion locale's name of @p code for @p key, capitalised for a menu; null when there is none.
[[nodiscard]] CADENZACORE_EXPORT QString conversionDisplayName(const QString &key, const QString &code);
/// Digit-aware, case-insensitive comparison of names shown to users, in the user's locale.
[[nodiscard]] CADENZACORE_EXPORT int compareForDisplay(const QString &a, const QString &b);

} // namespace Cadenza::SpeechItemPrivate

#endif
