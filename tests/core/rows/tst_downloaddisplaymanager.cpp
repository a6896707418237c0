// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "core/rows/CZDownloadDisplayManager.h"
#include "protocol/InstallerProtocol.h"

#include <QTest>

#include <cmath>

using namespace Cadenza;
using namespace Cadenza::InstallerProtocol;

namespace {
constexpr double Now = 800000000.0;

QVariantMap queued(const QString &tag, quint64 bytes)
{
    return {{TagNameKey, tag}, {ItemByteSizeKey, QVariant::fromValue(bytes)}};
}

// Downloading at a measured 1,000 bytes per second for 1,000 s, 2,000,000 bytes left, the daemon
// saying 1,000 s (2,000 bytes per second).
QVariantMap downloading()
{
    return {{TagNameKey, QStringLiteral("VOICEID:a")},
        {ItemByteSizeKey, QVariant::fromValue<quint64>(3000000)},
        {ItemDownloadByteCountKey, QVariant::fromValue<quint64>(1000000)},
        {ItemDownloadStartRefTimeKey, Now - 1000.0}, {ItemSecondsRemainingKey, 1000.0},
        {ItemSoftwareUpdateStateKey, qint64(DownloadingState)}};
}
} // namespace

class DownloadDisplayManagerTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void theWorkedExample()
    {
        CZDownloadDisplayManager manager;
        const QVariantList records {downloading(), queued(QStringLiteral("VOICEID:b"), 3000000),
            queued(QStringLiteral("VOICEID:c"), 3000000)};
        // B = (1,000 + 2,000) / 2 = 1,500; E = 2 x 30 + 1,000 + 6,000,000 / 1,500.
        QCOMPARE(
            manager.timeRemainingForActiveInstallations(records, QStringLiteral("VOICEID:"), Now), 5060.0);
        QCOMPARE(manager.currentBytesPerSecondValue(), 1000.0);
    }

    void otherKindsInTheQueueAreNotCounted()
    {
        CZDownloadDisplayManager manager;
        const QVariantList records {downloading(), queued(QStringLiteral("SRCLANGID:de_DE"), 9000000),
            queued(QStringLiteral("VOICEID:b"), 3000000), queued(QStringLiteral("VOICEID:c"), 3000000)};
        QCOMPARE(
            manager.timeRemainingForActiveInstallations(records, QStringLiteral("VOICEID:"), Now), 5060.0);
        // The first record counts for its speed whatever its kind, never as queued.
        QVariantMap language = downloading();
        language.insert(TagNameKey, QStringLiteral("SRCLANGID:fr_FR"));
        manager.reset();
        QCOMPARE(
            manager.timeRemainingForActiveInstallations({language}, QStringLiteral("VOICEID:"), Now), 1000.0);
    }

    void theSpeedFallsBackToTheLastMeasured()
    {
        CZDownloadDisplayManager manager;
        (void)manager.timeRemainingForActiveInstallations({downloading()}, QStringLiteral("VOICEID:"), Now);
        QCOMPARE(manager.currentBytesPerSecondValue(), 1000.0);
        // Now nothing is measured (no bytes yet) and the daemon gives no estimate.
        QVariantMap stalled = downloading();
        stalled.insert(ItemDownloadByteCountKey, QVariant::fromValue<quint64>(0));
        stalled.insert(ItemSoftwareUpdateStateKey, qint64(PreparingState));
        stalled.insert(ItemSecondsRemainingKey, 0.0);
        manager._appendAveragingTimeInterval(0.0); // a fresh window; the stored speed stays
        // 30 s for the queued voice, and its bytes at the stored 1,000 bytes per second.
        QCOMPARE(
            manager.timeRemainingForActiveInstallations(
                {stalled, queued(QStringLiteral("VOICEID:b"), 1000000)}, QStringLiteral("VOICEID:"), Now),
            1030.0);
        QCOMPARE(manager.currentBytesPerSecondValue(), 1000.0);
        manager.reset();
        QCOMPARE(manager.currentBytesPerSecondValue(), 0.0);
    }

    void theWindow()
    {
        CZDownloadDisplayManager manager;
        QCOMPARE(manager._averagedTimeInterval(), 0.0);
        manager._appendAveragingTimeInterval(10.0);
        QCOMPARE(manager._averagedTimeInterval(), 10.0); // the first estimate as it is
        for (int i = 0; i < 6; ++i) {
            manager._appendAveragingTimeInterval(10.0);
        }
        manager._appendAveragingTimeInterval(80.0); // the eighth pushes the oldest out
        QCOMPARE(manager._averagedTimeInterval(), (80.0 + 6 * 10.0) / 7);
        QCOMPARE(manager.window().back(), 10.0);
        manager._appendAveragingTimeInterval(0.0); // an empty queue: the average is 0 at once
        QCOMPARE(manager._averagedTimeInterval(), 0.0);
        manager._appendAveragingTimeInterval(std::nan(""));
        QVERIFY(std::isnan(manager._averagedTimeInterval())); // NaN is no zero: it is averaged in
        manager.reset();
        QCOMPARE(manager.window(), (std::array<double, 7> {}));
        QCOMPARE(manager.timeRemainingForActiveInstallations({}, QStringLiteral("VOICEID:"), Now), 0.0);
    }
};

QTEST_GUILESS_MAIN(DownloadDisplayManagerTest)
#include "tst_downloaddisplaymanager.moc"
