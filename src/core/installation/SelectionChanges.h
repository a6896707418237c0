// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_INSTALLATION_SELECTIONCHANGES_H
#define CADENZA_INSTALLATION_SELECTIONCHANGES_H

#include "cadenzacore_export.h"

#include <QHash>
#include <QList>
#include <QString>
#include <QStringList>

#include <functional>
#include <optional>

namespace Cadenza {

/// One item row of a customise sheet as OK sees it: what the row stands for and how it was left.
struct SelectionRow
{
    /// The voice or locale identifier of the row.
    QString identifier;
    /// The visibility value the row's tick stands for now.
    qint64 visibility = 0;
    /// The identifiers whose stored visibility follow the row (the row's own, and for a voice fetched
    /// at full size the full-size voice as well).
    QStringList visibilityIdentifiers;
    /// An InstallerProtocol::DownloadStatus.
    qint64 downloadStatus = 0;
    bool selected = false;
    /// The user ticked the row's upgrade.
    bool markedForUpgrade = false;
    /// The user unticked an installed row that can be removed.
    bool markedForDeletion = false;
    /// Removed even when an upgrade is offered for it (the default voice, unticked, goes).
    bool removableWithUpgradeAvailable = false;
    /// Never removed (the locale a dictation pop-up requires).
    bool keptInstalled = false;
};

/// What OK does with a customise sheet's rows.
struct SelectionChanges
{
    /// Indices into the rows: the items to download.
    QList<qsizetype> install;
    /// Indices into the rows: the installed items to remove (after the user agrees).
    QList<qsizetype> remove;
    /// The visibility values to store: identifier to value, only where the stored value differs.
    QHash<QString, qint64> visibility;
    /// One of the removed items is (a quality of) the default item.
    bool removesDefault = false;
};

/**
 * The OK decision of the customise sheets, without widgets: which rows to install (ticked and not
 * installed, or ticked for an upgrade), which to remove (unticked, installed, marked for deletion and
 * not kept), and which visibility values to store.
 *
 * @p storedVisibility answers the value stored for an identifier, or nothing when none is stored (a
 * missing entry is always written). Without @p changesInstallations only the visibility is decided.
 * @p defaultIdentifier, when not empty, is the prefix that makes a removal remove the default.
 */
[[nodiscard]] CADENZACORE_EXPORT SelectionChanges decideSelectionChanges(const QList<SelectionRow> &rows,
    const std::function<std::optional<qint64>(const QString &)> &storedVisibility, bool changesInstallations,
    const QString &defaultIdentifier = QString());

} // namespace Cadenza

#endif
