#include "WordStem.h"

#include <QStringList>

namespace Cadenza {

bool containsWordStem(QStringView text, QStringView stem)
{
    // The empty string is never found, as an empty search word must not match everything here.
    if (stem.isEmpty()) {
        return false;
    }
    const qsizetype at = text.indexOf(stem, 0, Qt::CaseInsensitive);
    if (at < 0) {
        return false;
    }
    return at == 0 || text.at(at - 1) == QLatin1Char(' ');
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
