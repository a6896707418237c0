// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "SelectionChanges.h"

#include "protocol/InstallerProtocol.h"

namespace Cadenza {

namespace Protocol = InstallerProtocol;

SelectionChanges decideSelectionChanges(const QList<SelectionRow> &rows,
    const std::function<std::optional<qint64>(const QString &)> &storedVisibility, bool changesInstallations,
    const QString &defaultIdentifier)
{
    SelectionChanges changes;
    for (const SelectionRow &row : rows) {
        for (const QString &identifier : row.visibilityIdentifiers) {
            const std::optional<qint64> stored = storedVisibility(identifier);
            if (!stored || *stored != row.visibility) {
                changes.visibility.insert(identifier, row.visibility);
            }
        }
    }
    if (!changesInstallations) {
        return changes;
    }
    for (qsizetype index = 0; index < rows.size(); ++index) {
        const SelectionRow &row = rows.at(index);
        const qint64 status = row.downloadStatus;
        const bool upgradeAvailable = status == Protocol::UpgradeAvailableStatus;
        if (row.selected) {
            if (status == Protocol::NotInstalledStatus || (upgradeAvailable && row.markedForUpgrade)) {
                changes.install.append(index);
            }
            continue;
        }
        const bool installed
            = status == Protocol::InstalledStatus || (upgradeAvailable && row.removableWithUpgradeAvailable);
        if (installed && row.markedForDeletion && !row.keptInstalled) {
            changes.remove.append(index);
            if (!defaultIdentifier.isEmpty() && row.identifier.startsWith(defaultIdentifier)) {
                changes.removesDefault = true;
            }
        }
    }
    return changes;
}

} // namespace Cadenza
