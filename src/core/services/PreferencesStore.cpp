// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "PreferencesStore.h"

namespace Cadenza::Platform {

PreferencesStore::~PreferencesStore() = default;

bool PreferencesStore::isValidDomainName(const QString &domain)
{
    if (domain.isEmpty() || domain.size() > 200 || domain.startsWith(QLatin1Char('.'))) {
        return false;
    }
    for (const QChar c : domain) {
        const bool allowed = (c >= u'a' && c <= u'z') || (c >= u'A' && c <= u'Z') || (c >= u'0' && c <= u'9')
            || c == u'.' || c == u'-' || c == u'_';
        if (!allowed) {
            return false;
        }
    }
    return !domain.contains(QStringLiteral(".."));
}

} // namespace Cadenza::Platform
