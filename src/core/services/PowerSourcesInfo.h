// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_POWERSOURCESINFO_H
#define CADENZA_PLATFORM_POWERSOURCESINFO_H

#include "cadenzacore_export.h"

#include <QList>
#include <QVariantMap>

#include <optional>

namespace Cadenza::Platform {

/// The machine's power sources, each described by a dictionary whose "Power Source State" is
/// "AC Power", "Battery Power" or "Off Line".
class CADENZACORE_EXPORT PowerSourcesInfo
{
public:
    static const QString StateKey; ///< "Power Source State"
    static const QString ACPower; ///< "AC Power"
    static const QString BatteryPower; ///< "Battery Power"
    static const QString OffLine; ///< "Off Line"

    virtual ~PowerSourcesInfo();
    /// The sources' descriptions; nothing when the machine gives no power information.
    [[nodiscard]] virtual std::optional<QList<QVariantMap>> powerSources() = 0;
};

/// /sys/class/power_supply (below CADENZA_ROOT): mains and USB supplies that are online give
/// "AC Power"; batteries that discharge give "Battery Power", charging or full ones "AC Power".
class CADENZACORE_EXPORT SysfsPowerSourcesInfo final : public PowerSourcesInfo
{
public:
    std::optional<QList<QVariantMap>> powerSources() override;
};

} // namespace Cadenza::Platform

#endif
