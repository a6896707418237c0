// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_RUNLOOPTIMER_H
#define CADENZA_PLATFORM_RUNLOOPTIMER_H

#include "cadenzacore_export.h"

#include <QDateTime>
#include <QObject>
#include <QTimer>
#include <QVariant>

namespace Cadenza::Platform {

/**
 * A timer of the thread's event loop: an interval, a repeats flag, user information, a next fire
 * date, and firing by hand.
 */
class CADENZACORE_EXPORT RunLoopTimer : public QObject
{
    Q_OBJECT
public:
    RunLoopTimer(double interval, QVariant userInfo, bool repeats, QObject *parent = nullptr);

    /// Starts counting on the current thread's event loop.
    void schedule();
    /// Fires now; a one-shot timer is invalid afterwards, a repeating one keeps its schedule.
    void fire();
    void invalidate();
    [[nodiscard]] bool isValid() const { return m_valid; }
    [[nodiscard]] double timeInterval() const { return m_interval; }
    [[nodiscard]] QVariant userInfo() const { return m_userInfo; }
    [[nodiscard]] bool repeats() const { return m_repeats; }
    [[nodiscard]] QDateTime fireDate() const;
    /// Moves the next firing; a repeating timer goes on at its interval from then.
    void setFireDate(const QDateTime &date);

Q_SIGNALS:
    void fired(Cadenza::Platform::RunLoopTimer *timer);

private:
    void timeout();

    double m_interval;
    QVariant m_userInfo;
    bool m_repeats;
    bool m_valid = true;
    QTimer m_timer;
    QDateTime m_fireDate;
};

} // namespace Cadenza::Platform

#endif
