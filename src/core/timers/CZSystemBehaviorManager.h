// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TIMERS_CZSYSTEMBEHAVIORMANAGER_H
#define CADENZA_TIMERS_CZSYSTEMBEHAVIORMANAGER_H

#include "cadenzacore_export.h"

#include <QSet>

namespace Cadenza {

class CZPowerSavvyTimer;

/**
 * The process-wide registry of frequent timers: every power-savvy timer with an interval of more than
 * 0 and less than 30 seconds, from creation until it stops. It records; it changes no timer.
 */
class CADENZACORE_EXPORT CZSystemBehaviorManager
{
public:
    static CZSystemBehaviorManager &sharedCZSystemBehaviorManager();

    void addTimer(const CZPowerSavvyTimer *timer);
    /// Harmless for a timer that is not registered.
    void removeTimer(const CZPowerSavvyTimer *timer);
    /// The identities of the registered timers.
    [[nodiscard]] QSet<quintptr> registeredTimers() const { return _registeredTimers; }
    [[nodiscard]] static quintptr _numberObjectFromTimer(const CZPowerSavvyTimer *timer);

private:
    CZSystemBehaviorManager() = default;

    // Identities, not timers: the registry keeps nothing alive, and a timer can leave while it dies.
    QSet<quintptr> _registeredTimers;
};

} // namespace Cadenza

#endif
