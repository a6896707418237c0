// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "core/timers/CZPowerSavvyTimer.h"
#include "core/timers/CZSystemBehaviorManager.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QPointer>
#include <QTest>

using namespace Cadenza;
using Cadenza::Platform::RunLoopTimer;

namespace {
bool registered(const CZPowerSavvyTimer *timer)
{
    return CZSystemBehaviorManager::sharedCZSystemBehaviorManager().registeredTimers().contains(
        CZSystemBehaviorManager::_numberObjectFromTimer(timer));
}
} // namespace

/// The target of the timers: records each firing and what it saw then.
class Receiver : public QObject
{
    Q_OBJECT
public:
    struct Call
    {
        RunLoopTimer *timer;
        QVariant userInfo;
        bool registeredWhenCalled;
        qint64 elapsed;
        bool validWhenCalled;
    };
    enum class Stop { No, Invalidate, DestroyTarget };
    QList<Call> calls;
    const CZPowerSavvyTimer *watched = nullptr;
    QElapsedTimer clock;
    Stop stopOnCall = Stop::No;
    QPointer<CZPowerSavvyTimer> stopping;

    Q_INVOKABLE void tick(Cadenza::Platform::RunLoopTimer *timer)
    {
        calls.append(
            {timer, timer->userInfo(), watched && registered(watched), clock.elapsed(), timer->isValid()});
        if (stopOnCall == Stop::Invalidate && stopping) {
            stopping->invalidate();
        } else if (stopOnCall == Stop::DestroyTarget) {
            delete this; // takes its timers with it, the firing one included
        }
    }
};

class PowerSavvyTimerTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void onlyFrequentTimersAreRegistered_data()
    {
        QTest::addColumn<double>("interval");
        QTest::addColumn<bool>("expected");
        QTest::newRow("29.9 s") << 29.9 << true;
        QTest::newRow("30 s") << 30.0 << false;
        QTest::newRow("0 s") << 0.0 << false;
        QTest::newRow("negative") << -1.0 << false;
        QTest::newRow("1 ms") << 0.001 << true;
    }
    void onlyFrequentTimersAreRegistered()
    {
        QFETCH(double, interval);
        QFETCH(bool, expected);
        Receiver receiver;
        CZPowerSavvyTimer *timer = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(
            interval, &receiver, "tick", QVariant(), true);
        QCOMPARE(registered(timer), expected);
        timer->invalidate();
        QVERIFY(!registered(timer));
        QVERIFY(!timer->isValid());
    }

    void aOneShotTimerLeavesBeforeItsActionRuns()
    {
        Receiver receiver;
        CZPowerSavvyTimer *timer = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(
            0.05, &receiver, "tick", QStringLiteral("info"), false);
        receiver.watched = timer;
        QVERIFY(registered(timer));
        Platform::RunLoopTimer *const inner = timer->timer();
        QTRY_COMPARE(receiver.calls.size(), 1);
        QVERIFY(!receiver.calls.first().registeredWhenCalled);
        QCOMPARE(receiver.calls.first().timer, inner); // the inner timer, not the wrapper
        QCOMPARE(receiver.calls.first().userInfo, QVariant(QStringLiteral("info")));
        QVERIFY(!receiver.calls.first().validWhenCalled);
        QTest::qWait(150);
        QCOMPARE(receiver.calls.size(), 1);
    }

    void stoppedTimersAreFreedBeforeTheirTarget()
    {
        Receiver receiver;
        // A one-shot timer that fired, by its clock or by hand.
        QPointer<CZPowerSavvyTimer> fired
            = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(0.01, &receiver, "tick", QVariant(), false);
        QPointer<CZPowerSavvyTimer> firedByHand
            = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(100.0, &receiver, "tick", QVariant(), false);
        firedByHand->fire();
        QVERIFY(firedByHand); // still there for whoever fired it, until the event loop runs
        QVERIFY(!firedByHand->isValid());
        // Repeating and one-shot timers that were invalidated.
        QPointer<CZPowerSavvyTimer> repeating
            = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(0.01, &receiver, "tick", QVariant(), true);
        QPointer<CZPowerSavvyTimer> oneShot
            = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(100.0, &receiver, "tick", QVariant(), false);
        oneShot->invalidate();
        QTRY_VERIFY(receiver.calls.size() >= 3);
        repeating->invalidate();
        // A delayed request.
        CZPowerSavvyTimer::requestTarget(&receiver, "tick", QVariant(), 0.01);
        const qsizetype before = receiver.calls.size();
        QTRY_COMPARE(receiver.calls.size(), before + 1);
        // A repeating timer that runs on stays.
        QPointer<CZPowerSavvyTimer> running
            = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(100.0, &receiver, "tick", QVariant(), true);
        QTRY_VERIFY(!fired && !firedByHand && !repeating && !oneShot);
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
        QVERIFY(running);
        QCOMPARE(receiver.findChildren<CZPowerSavvyTimer *>(), QList<CZPowerSavvyTimer *>({running.data()}));
        QCOMPARE(CZSystemBehaviorManager::sharedCZSystemBehaviorManager().registeredTimers().size(), 0);
    }

    void aTimerInvalidatedOrItsTargetDestroyedByItsActionIsFreedOnce()
    {
        auto *receiver = new Receiver;
        receiver->stopOnCall = Receiver::Stop::Invalidate;
        QPointer<CZPowerSavvyTimer> repeating
            = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(0.01, receiver, "tick", QVariant(), true);
        receiver->stopping = repeating;
        QTRY_VERIFY(!repeating);
        QCOMPARE(receiver->calls.size(), 1);
        receiver->stopOnCall = Receiver::Stop::DestroyTarget;
        QPointer<Receiver> target(receiver);
        QPointer<CZPowerSavvyTimer> oneShot
            = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(0.01, receiver, "tick", QVariant(), false);
        QTRY_VERIFY(!target);
        QVERIFY(!oneShot);
    }

    void aRepeatingTimerStaysUntilInvalidated()
    {
        Receiver receiver;
        CZPowerSavvyTimer *timer
            = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(0.02, &receiver, "tick", QVariant(7), true);
        receiver.watched = timer;
        QTRY_VERIFY(receiver.calls.size() >= 3);
        for (const auto &call : receiver.calls) {
            QVERIFY(call.registeredWhenCalled);
        }
        QVERIFY(timer->isValid());
        QCOMPARE(timer->timeInterval(), 0.02);
        timer->invalidate();
        QVERIFY(!registered(timer));
        const qsizetype count = receiver.calls.size();
        QTest::qWait(100);
        QCOMPARE(receiver.calls.size(), count);
    }

    void aDelayedRequestRunsOnceWithTheTimer()
    {
        Receiver receiver;
        receiver.clock.start();
        CZPowerSavvyTimer::requestTarget(&receiver, "tick", QStringLiteral("object"), 0.3);
        QTRY_COMPARE(receiver.calls.size(), 1);
        QCOMPARE(receiver.calls.first().userInfo, QVariant(QStringLiteral("object")));
        QVERIFY(receiver.calls.first().elapsed >= 280);
        QTest::qWait(400);
        QCOMPARE(receiver.calls.size(), 1);
    }

    void forwardedOperations()
    {
        Receiver receiver;
        CZPowerSavvyTimer *timer
            = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(100.0, &receiver, "tick", QVariant(), false);
        QVERIFY(!registered(timer));
        const QDateTime soon = QDateTime::currentDateTimeUtc().addMSecs(50);
        timer->setFireDate(soon);
        QCOMPARE(timer->fireDate(), soon);
        QTRY_COMPARE(receiver.calls.size(), 1);
        // Firing by hand on a repeating timer keeps it scheduled.
        CZPowerSavvyTimer *repeating
            = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(100.0, &receiver, "tick", QVariant(), true);
        repeating->fire();
        QCOMPARE(receiver.calls.size(), 2);
        QVERIFY(repeating->isValid());
    }

    void destroyedTimersLeaveTheRegistry()
    {
        quintptr identity = 0;
        {
            Receiver receiver;
            CZPowerSavvyTimer *timer
                = CZPowerSavvyTimer::scheduledTimerWithTimeInterval(1.0, &receiver, "tick", QVariant(), true);
            identity = CZSystemBehaviorManager::_numberObjectFromTimer(timer);
            QVERIFY(registered(timer));
        } // the receiver takes its timer with it
        QVERIFY(
            !CZSystemBehaviorManager::sharedCZSystemBehaviorManager().registeredTimers().contains(identity));
        CZSystemBehaviorManager::sharedCZSystemBehaviorManager().removeTimer(nullptr); // harmless
    }
};

QTEST_GUILESS_MAIN(PowerSavvyTimerTest)
#include "tst_powersavvytimer.moc"
