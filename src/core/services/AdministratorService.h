// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_ADMINISTRATORSERVICE_H
#define CADENZA_PLATFORM_ADMINISTRATORSERVICE_H

#include "cadenzacore_export.h"

#include <QString>
#include <QStringList>

namespace Cadenza::Platform {

/// Administrator rights: an authorisation, an administrator session, and removing bundles with them.
class CADENZACORE_EXPORT AdministratorService
{
public:
    enum class Removal { Removed, Refused, Failed };

    virtual ~AdministratorService();
    [[nodiscard]] virtual bool isAuthenticated() = 0;
    /// Obtains @p right with @p flags (1 interaction allowed, 2 extend rights).
    [[nodiscard]] virtual bool obtainRight(const QString &right, int flags) = 0;
    /// Authenticates the session with the right obtained; blocks.
    [[nodiscard]] virtual bool authenticate() = 0;
    /// Removes one bundle folder with the session's rights.
    [[nodiscard]] virtual Removal removeBundle(const QString &path) = 0;
};

/**
 * polkit: bundles in folders the user can write are removed in this process; others by
 * "pkexec cadenza-remove-bundle PATH", which asks polkit for the action
 * org.cadenza.remove-speech-bundle. A refusal there is a refusal of the removal.
 */
class CADENZACORE_EXPORT PolkitAdministratorService final : public AdministratorService
{
public:
    bool isAuthenticated() override { return m_authenticated; }
    bool obtainRight(const QString &right, int flags) override;
    bool authenticate() override;
    Removal removeBundle(const QString &path) override;

    /// The helper that pkexec runs.
    [[nodiscard]] static QString helperPath();

private:
    bool m_authenticated = false;
    bool m_hasRight = false;
};

} // namespace Cadenza::Platform

#endif
