// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICES_WORDSTEM_H
#define CADENZA_VOICES_WORDSTEM_H

#include "cadenzacore_export.h"

#include <QString>

namespace Cadenza {

/**
 * Whether @p stem begins a word of @p text: its first case-insensitive occurrence must stand at the
 * start or right after a blank. Only the first occurrence counts: "tom" is not a word stem of
 * "Atom Tom".
 */
[[nodiscard]] CADENZACORE_EXPORT bool containsWordStem(QStringView text, QStringView stem);

/// Where @p stem first occurs in @p text, ignoring case as QString::indexOf() does; -1 when nowhere.
[[nodiscard]] CADENZACORE_EXPORT qsizetype firstIndexIgnoringCase(QStringView text, QStringView stem);

/// Whether any blank-separated word of @p words is a word stem of @p text (an empty word never is).
[[nodiscard]] CADENZACORE_EXPORT bool containsWords(const QString &text, const QString &words);

} // namespace Cadenza

#endif
