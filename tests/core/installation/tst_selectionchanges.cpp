// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The OK decision of the customise sheets, on plain rows: no sheet, no widgets, no daemon.

#include "core/installation/SelectionChanges.h"
#include "protocol/InstallerProtocol.h"

#include <QTest>

using namespace Cadenza;
using namespace Cadenza::InstallerProtocol;

namespace {

SelectionRow row(const QString &identifier, qint64 status, bool selected)
{
    SelectionRow entry;
    entry.identifier = identifier;
    entry.downloadStatus = status;
    entry.selected = selected;
    return entry;
}

// Nothing stored: only the visibility part would differ, and these tests leave it out.
std::optional<qint64> nothingStored(const QString &)
{
    return std::nullopt;
}

} // namespace

class SelectionChangesTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void tickedDownloadsInstallAndOnlyThey()
    {
        const QList<SelectionRow> rows {row(QStringLiteral("fetch"), NotInstalledStatus, true),
            row(QStringLiteral("leave"), NotInstalledStatus, false),
            row(QStringLiteral("busy"), DownloadingStatus, true),
            row(QStringLiteral("queued"), WaitingStatus, true),
            row(QStringLiteral("have"), InstalledStatus, true)};
        const SelectionChanges changes = decideSelectionChanges(rows, nothingStored, true);
        QCOMPARE(changes.install, QList<qsizetype> {0});
        QVERIFY(changes.remove.isEmpty());
    }

    void anUpgradeInstallsOnlyWhenItsTickIsSet()
    {
        SelectionRow wanted = row(QStringLiteral("wanted"), UpgradeAvailableStatus, true);
        wanted.markedForUpgrade = true;
        SelectionRow declined = row(QStringLiteral("declined"), UpgradeAvailableStatus, true);
        // Marked, but the row itself is unticked: a hidden voice is not upgraded.
        SelectionRow hidden = row(QStringLiteral("hidden"), UpgradeAvailableStatus, false);
        hidden.markedForUpgrade = true;
        const SelectionChanges changes
            = decideSelectionChanges({wanted, declined, hidden}, nothingStored, true);
        QCOMPARE(changes.install, QList<qsizetype> {0});
        QVERIFY(changes.remove.isEmpty());
    }

    void removalNeedsUntickedInstalledAndMarked()
    {
        SelectionRow marked = row(QStringLiteral("marked"), InstalledStatus, false);
        marked.markedForDeletion = true;
        // Unticked but not removable (not marked): only hidden.
        const SelectionRow unmarked = row(QStringLiteral("unmarked"), InstalledStatus, false);
        SelectionRow ticked = row(QStringLiteral("ticked"), InstalledStatus, true);
        ticked.markedForDeletion = true;
        SelectionRow fetching = row(QStringLiteral("fetching"), DownloadingStatus, false);
        fetching.markedForDeletion = true;
        const SelectionChanges changes
            = decideSelectionChanges({marked, unmarked, ticked, fetching}, nothingStored, true);
        QCOMPARE(changes.remove, QList<qsizetype> {0});
        QVERIFY(changes.install.isEmpty());
    }

    void anItemWithAnUpgradeIsRemovedOnlyWhereAllowed()
    {
        SelectionRow fallback = row(QStringLiteral("fallback"), UpgradeAvailableStatus, false);
        fallback.markedForDeletion = true;
        fallback.removableWithUpgradeAvailable = true;
        SelectionRow other = row(QStringLiteral("other"), UpgradeAvailableStatus, false);
        other.markedForDeletion = true;
        const SelectionChanges changes = decideSelectionChanges({other, fallback}, nothingStored, true);
        QCOMPARE(changes.remove, QList<qsizetype> {1});
    }

    void aKeptItemIsNeverRemoved()
    {
        SelectionRow required = row(QStringLiteral("en_US"), InstalledStatus, false);
        required.markedForDeletion = true;
        required.keptInstalled = true;
        QVERIFY(decideSelectionChanges({required}, nothingStored, true).remove.isEmpty());
    }

    void removingTheDefaultIsReportedByPrefix()
    {
        SelectionRow compact = row(QStringLiteral("voice.anna.compact"), InstalledStatus, false);
        compact.markedForDeletion = true;
        SelectionRow other = row(QStringLiteral("voice.bert"), InstalledStatus, false);
        other.markedForDeletion = true;
        QVERIFY(decideSelectionChanges({other, compact}, nothingStored, true, QStringLiteral("voice.anna"))
                    .removesDefault);
        QVERIFY(!decideSelectionChanges({other}, nothingStored, true, QStringLiteral("voice.anna"))
                     .removesDefault);
        // Without a default voice nothing removes it, though every identifier starts with "".
        QVERIFY(!decideSelectionChanges({other, compact}, nothingStored, true).removesDefault);
        // A default that is only hidden, not removed, is not removed.
        compact.markedForDeletion = false;
        QVERIFY(!decideSelectionChanges({compact}, nothingStored, true, QStringLiteral("voice.anna"))
                     .removesDefault);
    }

    void visibilityIsWrittenWhereItDiffersOrIsMissing()
    {
        SelectionRow same = row(QStringLiteral("same"), InstalledStatus, true);
        same.visibility = 1;
        same.visibilityIdentifiers = {QStringLiteral("same")};
        SelectionRow changed = row(QStringLiteral("changed"), InstalledStatus, false);
        changed.visibility = 0;
        changed.visibilityIdentifiers = {QStringLiteral("changed")};
        // A download at full size: the tick follows it to the full-size identifier, stored nowhere yet.
        SelectionRow full = row(QStringLiteral("small"), NotInstalledStatus, true);
        full.visibility = 2;
        full.visibilityIdentifiers = {QStringLiteral("small"), QStringLiteral("large")};
        const QHash<QString, qint64> stored {
            {QStringLiteral("same"), 1}, {QStringLiteral("changed"), 2}, {QStringLiteral("small"), 2}};
        const auto lookUp = [&stored](const QString &identifier) -> std::optional<qint64> {
            const auto found = stored.constFind(identifier);
            return found == stored.constEnd() ? std::nullopt : std::optional<qint64>(*found);
        };
        const SelectionChanges changes = decideSelectionChanges({same, changed, full}, lookUp, true);
        const QHash<QString, qint64> expected {{QStringLiteral("changed"), 0}, {QStringLiteral("large"), 2}};
        QCOMPARE(changes.visibility, expected);
        QCOMPARE(changes.install, QList<qsizetype> {2});
    }

    void withoutInstallationsOnlyVisibilityIsDecided()
    {
        SelectionRow fetch = row(QStringLiteral("fetch"), NotInstalledStatus, true);
        fetch.visibility = 1;
        fetch.visibilityIdentifiers = {QStringLiteral("fetch")};
        SelectionRow drop = row(QStringLiteral("drop"), InstalledStatus, false);
        drop.markedForDeletion = true;
        const SelectionChanges changes = decideSelectionChanges({fetch, drop}, nothingStored, false);
        QVERIFY(changes.install.isEmpty());
        QVERIFY(changes.remove.isEmpty());
        QCOMPARE(changes.visibility.value(QStringLiteral("fetch"), -1), 1);
    }
};

QTEST_GUILESS_MAIN(SelectionChangesTest)
#include "tst_selectionchanges.moc"
