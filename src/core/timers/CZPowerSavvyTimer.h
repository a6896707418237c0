// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TIMERS_CZPOWERSAVVYTIMER_H
#define CADENZA_TIMERS_CZPOWERSAVVYTIMER_H

#include "cadenzacore_export.h"

#include "core/services/RunLoopTimer.h"

#include <QByteArray>
#include <QObject>
#include <QPointer>

namespace Cadenza {

/**
 * A timer that tells the system-behaviour registry while it is a frequent one (interval above 0
 * and below 30 seconds). It wraps one event-loop timer and forwards the usual operations to it.
 *
 * The action is a slot or invokable method of the target taking one argument, the firing
 * Platform::RunLoopTimer (whose userInfo() holds the user information):
 * `Q_INVOKABLE void tick(Cadenza::Platform::RunLoopTimer *timer);`
 */
class CADENZACORE_EXPORT CZPowerSavvyTimer : public QObject
{
    Q_OBJECT
public:
    ~CZPowerSavvyTimer() override;

    /// A new timer, already counting on the current thread's event loop. It is deleted (later, by
    /// the event loop) once it stops: when a one-shot timer has fired or any timer is invalidated,
    /// and at the latest with @p target. Keep it in a QPointer to ask it afterwards.
    static CZPowerSavvyTimer *scheduledTimerWithTimeInterval(
        double interval, QObject *target, const char *selector, const QVariant &userInfo, bool repeats);
    /// Calls @p selector on @p target once, after @p delay seconds, with the timer (whose user
    /// information is @p object) as the argument.
    static void requestTarget(
        QObject *target, const char *performSelector, const QVariant &withObject, double afterDelay);

    void fire();
    [[nodiscard]] QDateTime fireDate() const;
    void setFireDate(const QDateTime &date);
    [[nodiscard]] double timeInterval() const;
    [[nodiscard]] bool isValid() const;
    [[nodiscard]] QVariant userInfo() const;
    void invalidate();

    [[nodiscard]] Platform::RunLoopTimer *timer() const { return _timer; }
    [[nodiscard]] bool repeats() const { return _repeats; }
    [[nodiscard]] QObject *target() const { return _target; }
    [[nodiscard]] QByteArray selector() const { return _selector; }

private:
    explicit CZPowerSavvyTimer(QObject *parent);
    void _target_(Platform::RunLoopTimer *firing);
    void release();

    Platform::RunLoopTimer *_timer = nullptr;
    bool _repeats = false;
    QPointer<QObject> _target;
    QByteArray _selector;
    bool m_released = false;
};

} // namespace Cadenza

#endif
