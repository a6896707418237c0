// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZSystemBehaviorManager.h"

namespace Cadenza {

CZSystemBehaviorManager &CZSystemBehaviorManager::sharedCZSystemBehaviorManager()
{
    static CZSystemBehaviorManager *manager = new CZSystemBehaviorManager; // never released
    return *manager;
}

quintptr CZSystemBehaviorManager::_numberObjectFromTimer(const CZPowerSavvyTimer *timer)
{
    return reinterpret_cast<quintptr>(timer);
}

void CZSystemBehaviorManager::addTimer(const CZPowerSavvyTimer *timer)
{
    _registeredTimers.insert(_numberObjectFromTimer(timer));
}

void CZSystemBehaviorManager::removeTimer(const CZPowerSavvyTimer *timer)
{
    _registeredTimers.remove(_numberObjectFromTimer(timer));
}

} // namespace Cadenza
