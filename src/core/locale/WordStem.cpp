// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "WordStem.h"

#include <QStringList>

namespace Cadenza {

bool containsWordStem(QStringView text, QStringView stem)
{
    // The empty string is never found, as an empty search word must not match everything here.
    if (stem.isEmpty()) {
        return false;
    }
    const qsizetype at = firstIndexIgnoringCase(text, stem);
    if (at < 0) {
        return false;
    }
    return at == 0 || text.at(at - 1) == QLatin1Char(' ');
}

qsizetype firstIndexIgnoringCase(QStringView text, QStringView stem)
{
    // Searches run for every voice on every keystroke, with stems of a few letters in names of a few
    // dozen: comparing at each place whose first letter folds alike beats a general search, which
    // prepares tables for every call.
    const qsizetype last = text.size() - stem.size();
    if (stem.isEmpty() || last < 0) {
        return stem.isEmpty() ? 0 : -1;
    }
    const char16_t first = stem.front().unicode();
    if (QChar::isSurrogate(first)) {
        return text.indexOf(stem, 0, Qt::CaseInsensitive);
    }
    const char32_t firstFolded = QChar::toCaseFolded(char32_t(first));
    for (qsizetype i = 0; i <= last; ++i) {
        const char16_t unit = text[i].unicode();
        if (QChar::isSurrogate(unit)) {
            // Letters outside the first plane fold as pairs: leave the rest to the general search.
            const qsizetype rest = text.sliced(i).indexOf(stem, 0, Qt::CaseInsensitive);
            return rest < 0 ? -1 : i + rest;
        }
        if (QChar::toCaseFolded(char32_t(unit)) == firstFolded
            && text.sliced(i, stem.size()).compare(stem, Qt::CaseInsensitive) == 0) {
            return i;
        }
    }
    return -1;
}

bool containsWords(const QString &text, const QString &words)
{
    const QStringList list = words.split(QLatin1Char(' '));
    for (const QString &word : list) {
        if (containsWordStem(text, word)) {
            return true;
        }
    }
    return false;
}

} // namespace Cadenza
