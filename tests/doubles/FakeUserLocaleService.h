// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_FAKEUSERLOCALESERVICE_H
#define CADENZA_TESTS_FAKEUSERLOCALESERVICE_H

#include "core/services/UserLocaleService.h"

namespace Cadenza::Platform {

/// Language and region settings that a test sets.
class FakeUserLocaleService final : public UserLocaleService
{
public:
    explicit FakeUserLocaleService(QStringList preferredLanguages = {QStringLiteral("en_US")},
        QString currentLocale = QStringLiteral("en_US"));

    QStringList preferredLanguages() override { return m_preferredLanguages; }
    QString currentLocaleIdentifier() override { return m_currentLocale; }

    void setPreferredLanguages(const QStringList &languages) { m_preferredLanguages = languages; }
    void setCurrentLocaleIdentifier(const QString &identifier) { m_currentLocale = identifier; }

private:
    QStringList m_preferredLanguages;
    QString m_currentLocale;
};

} // namespace Cadenza::Platform

#endif
