// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "EnvironmentUserLocaleService.h"

#include "core/formats/Locale.h"

#include <QLocale>

namespace Cadenza::Platform {

namespace {
// "C" and "POSIX" say that no language was chosen; they name no language of their own.
bool namesNoLanguage(const QString &name)
{
    return name.isEmpty() || name == u"C" || name.startsWith(u"C.") || name == u"POSIX";
}
} // namespace

QStringList EnvironmentUserLocaleService::preferredLanguages()
{
    QStringList result;
    const QStringList languages = QLocale::system().uiLanguages();
    for (const QString &language : languages) {
        if (namesNoLanguage(language)) {
            continue;
        }
        const QString canonical = Locale::canonicalLocaleIdentifier(language);
        if (!canonical.isEmpty() && !result.contains(canonical)) {
            result.append(canonical);
        }
    }
    return result;
}

QString EnvironmentUserLocaleService::currentLocaleIdentifier()
{
    const QString name = QLocale::system().name();
    if (namesNoLanguage(name)) {
        return QStringLiteral("en_US");
    }
    return Locale::canonicalLocaleIdentifier(name);
}

} // namespace Cadenza::Platform
