// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICEPOPUP_CZDOWNLOADDISPLAYMANAGER_H
#define CADENZA_VOICEPOPUP_CZDOWNLOADDISPLAYMANAGER_H

#include "cadenzacore_export.h"

#include <QString>
#include <QVariantList>

#include <array>

namespace Cadenza {

/**
 * Estimates the time left for the running installations of one kind: the speed measured since the
 * download began blended with the daemon's own estimate, the bytes of the queued items of that kind
 * plus 30 seconds each, averaged over the last seven estimates.
 */
class CADENZACORE_EXPORT CZDownloadDisplayManager
{
public:
    static constexpr int WindowSize = 7;
    static constexpr double SecondsPerQueuedItem = 30.0;

    CZDownloadDisplayManager();

    /// Speed and window back to nothing.
    void reset();
    /// One estimate from the daemon's records (in its order) for tags beginning with @p withTagPrefix;
    /// returns the average of the window after adding it.
    double timeRemainingForActiveInstallations(const QVariantList &records, const QString &withTagPrefix);
    /// The same, at @p now seconds since the reference date (1 January 2001).
    double timeRemainingForActiveInstallations(
        const QVariantList &records, const QString &withTagPrefix, double now);

    void _appendAveragingTimeInterval(double interval);
    /// The mean of the newest samples up to the first that is exactly 0.
    [[nodiscard]] double _averagedTimeInterval() const;

    [[nodiscard]] double currentBytesPerSecondValue() const { return _currentBytesPerSecondValue; }
    [[nodiscard]] const std::array<double, WindowSize> &window() const
    {
        return _timeRemainingAvergingWindow;
    }

private:
    double _currentBytesPerSecondValue = 0;
    std::array<double, WindowSize> _timeRemainingAvergingWindow {};
};

} // namespace Cadenza

#endif
