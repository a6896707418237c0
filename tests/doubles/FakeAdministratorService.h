// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_FAKEADMINISTRATORSERVICE_H
#define CADENZA_TESTS_FAKEADMINISTRATORSERVICE_H

#include "core/services/AdministratorService.h"

#include <QStringList>

namespace Cadenza::Platform {

/// Administrator rights that a test grants or refuses; removals really remove (with the same checks).
class FakeAdministratorService final : public AdministratorService
{
public:
    bool isAuthenticated() override { return m_authenticated; }
    bool obtainRight(const QString &, int flags) override
    {
        m_flags = flags;
        return m_grants;
    }
    bool authenticate() override
    {
        m_authenticated = m_grants;
        return m_grants;
    }
    Removal removeBundle(const QString &path) override;

    void setGrants(bool grants) { m_grants = grants; }
    [[nodiscard]] QStringList removed() const { return m_removed; }
    [[nodiscard]] int flags() const { return m_flags; }

private:
    bool m_grants = true;
    bool m_authenticated = false;
    int m_flags = 0;
    QStringList m_removed;
};

} // namespace Cadenza::Platform

#endif
