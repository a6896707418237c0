// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeAdministratorService.h"

#include "core/services/BundleRemoval.h"

namespace Cadenza::Platform {

AdministratorService::Removal FakeAdministratorService::removeBundle(const QString &path)
{
    if (!m_authenticated) {
        return Removal::Refused;
    }
    QString error;
    if (!BundleRemoval::remove(path, &error)) {
        return Removal::Failed;
    }
    m_removed.append(path);
    return Removal::Removed;
}

} // namespace Cadenza::Platform
