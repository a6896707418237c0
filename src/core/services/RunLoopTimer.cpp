// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RunLoopTimer.h"

namespace Cadenza::Platform {

namespace {
int milliseconds(double seconds)
{
    return int(qBound(0.0, seconds * 1000.0, double(std::numeric_limits<int>::max())));
}
} // namespace

RunLoopTimer::RunLoopTimer(double interval, QVariant userInfo, bool repeats, QObject *parent)
    : QObject(parent)
    , m_interval(qMax(0.0, interval))
    , m_userInfo(std::move(userInfo))
    , m_repeats(repeats)
{
    m_timer.setTimerType(Qt::PreciseTimer);
    m_timer.setSingleShot(true);
    connect(&m_timer, &QTimer::timeout, this, &RunLoopTimer::timeout);
}

void RunLoopTimer::schedule()
{
    if (!m_valid) {
        return;
    }
    m_fireDate = QDateTime::currentDateTimeUtc().addMSecs(milliseconds(m_interval));
    m_timer.start(milliseconds(m_interval));
}

void RunLoopTimer::timeout()
{
    if (!m_valid) {
        return;
    }
    if (m_repeats) {
        // A zero interval would spin; a repeating timer waits at least a millisecond.
        m_fireDate = QDateTime::currentDateTimeUtc().addMSecs(qMax(1, milliseconds(m_interval)));
        m_timer.start(qMax(1, milliseconds(m_interval)));
    } else {
        m_valid = false;
    }
    Q_EMIT fired(this);
}

void RunLoopTimer::fire()
{
    if (!m_valid) {
        return;
    }
    if (!m_repeats) {
        m_valid = false;
        m_timer.stop();
    }
    Q_EMIT fired(this);
}

void RunLoopTimer::invalidate()
{
    m_valid = false;
    m_timer.stop();
}

QDateTime RunLoopTimer::fireDate() const
{
    return m_fireDate;
}

void RunLoopTimer::setFireDate(const QDateTime &date)
{
    if (!m_valid) {
        return;
    }
    m_fireDate = date.toUTC();
    m_timer.start(int(qMax<qint64>(0, QDateTime::currentDateTimeUtc().msecsTo(m_fireDate))));
}

} // namespace Cadenza::Platform
