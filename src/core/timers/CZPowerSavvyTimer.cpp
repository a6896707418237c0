// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZPowerSavvyTimer.h"

#include "CZSystemBehaviorManager.h"
#include "cadenzacore_logging.h"

#include <QLoggingCategory>
#include <QMetaObject>

namespace Cadenza {

namespace {
constexpr double RegisteredBelowSeconds = 30.0;
}

CZPowerSavvyTimer::CZPowerSavvyTimer(QObject *parent)
    : QObject(parent)
{ }

CZPowerSavvyTimer::~CZPowerSavvyTimer()
{
    CZSystemBehaviorManager::sharedCZSystemBehaviorManager().removeTimer(this);
}

CZPowerSavvyTimer *CZPowerSavvyTimer::scheduledTimerWithTimeInterval(
    double interval, QObject *target, const char *selector, const QVariant &userInfo, bool repeats)
{
    auto *wrapper = new CZPowerSavvyTimer(target);
    if (interval > 0.0 && interval < RegisteredBelowSeconds) {
        CZSystemBehaviorManager::sharedCZSystemBehaviorManager().addTimer(wrapper);
    }
    wrapper->_timer = new Platform::RunLoopTimer(interval, userInfo, repeats, wrapper);
    wrapper->_repeats = repeats;
    wrapper->_target = target;
    wrapper->_selector = selector;
    connect(wrapper->_timer, &Platform::RunLoopTimer::fired, wrapper, &CZPowerSavvyTimer::_target_);
    wrapper->_timer->schedule();
    return wrapper;
}

void CZPowerSavvyTimer::requestTarget(
    QObject *target, const char *performSelector, const QVariant &withObject, double afterDelay)
{
    (void)scheduledTimerWithTimeInterval(afterDelay, target, performSelector, withObject, false);
}

void CZPowerSavvyTimer::_target_(Platform::RunLoopTimer *firing)
{
    // The action may invalidate the timer or destroy its target, and with it this wrapper.
    const QPointer<CZPowerSavvyTimer> self(this);
    if (!_repeats) {
        // The action already sees a one-shot timer gone from the registry.
        CZSystemBehaviorManager::sharedCZSystemBehaviorManager().removeTimer(this);
    }
    if (_target) {
        if (!QMetaObject::invokeMethod(_target, _selector.constData(), Qt::DirectConnection,
                Q_ARG(Cadenza::Platform::RunLoopTimer *, firing))) {
            qCWarning(Platform::lcTimers,
                "CZPowerSavvyTimer: %s has no invokable %s(Cadenza::Platform::RunLoopTimer*)",
                _target->metaObject()->className(), _selector.constData());
        }
    }
    if (self && !_repeats) {
        release();
    }
}

void CZPowerSavvyTimer::release()
{
    // A stopped timer never runs again: keeping it until its target goes made a long-lived target
    // grow by every timer it ever scheduled. Later, so that whoever stopped it may still ask it.
    if (!m_released) {
        m_released = true;
        deleteLater();
    }
}

void CZPowerSavvyTimer::fire()
{
    _timer->fire();
}

QDateTime CZPowerSavvyTimer::fireDate() const
{
    return _timer->fireDate();
}

void CZPowerSavvyTimer::setFireDate(const QDateTime &date)
{
    _timer->setFireDate(date);
}

double CZPowerSavvyTimer::timeInterval() const
{
    return _timer->timeInterval();
}

bool CZPowerSavvyTimer::isValid() const
{
    return _timer->isValid();
}

QVariant CZPowerSavvyTimer::userInfo() const
{
    return _timer->userInfo();
}

void CZPowerSavvyTimer::invalidate()
{
    _timer->invalidate();
    CZSystemBehaviorManager::sharedCZSystemBehaviorManager().removeTimer(this);
    release();
}

} // namespace Cadenza
