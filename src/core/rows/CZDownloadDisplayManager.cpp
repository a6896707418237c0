// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZDownloadDisplayManager.h"

#include "protocol/InstallerProtocol.h"

#include <QDateTime>
#include <QVariantMap>

#include <algorithm>

namespace Cadenza {

using namespace InstallerProtocol;

CZDownloadDisplayManager::CZDownloadDisplayManager()
{
    reset();
}

void CZDownloadDisplayManager::reset()
{
    _currentBytesPerSecondValue = 0;
    _timeRemainingAvergingWindow.fill(0.0);
}

double CZDownloadDisplayManager::timeRemainingForActiveInstallations(
    const QVariantList &records, const QString &withTagPrefix)
{
    const double now = double(QDateTime::currentMSecsSinceEpoch()) / 1000.0 - ReferenceDateOffset;
    return timeRemainingForActiveInstallations(records, withTagPrefix, now);
}

double CZDownloadDisplayManager::timeRemainingForActiveInstallations(
    const QVariantList &records, const QString &withTagPrefix, double now)
{
    const QVariantMap first = records.isEmpty() ? QVariantMap() : records.first().toMap();
    // The item the daemon works on is never counted as queued, whatever its kind.
    quint64 queuedBytes = 0;
    quint64 queuedCount = 0;
    for (qsizetype i = 1; i < records.size(); ++i) {
        const QVariantMap record = records.at(i).toMap();
        if (record.value(TagNameKey).toString().startsWith(withTagPrefix)) {
            queuedBytes += record.value(ItemByteSizeKey).toULongLong();
            ++queuedCount;
        }
    }

    double measured = first.value(ItemDownloadByteCountKey).toDouble()
        / (now - first.value(ItemDownloadStartRefTimeKey).toDouble());
    if (measured > 0) {
        _currentBytesPerSecondValue = measured;
    } else {
        measured = _currentBytesPerSecondValue;
    }

    const double byteSize = first.value(ItemByteSizeKey).toDouble();
    const double byteCount = first.value(ItemDownloadByteCountKey).toDouble();
    const double secondsRemaining = first.value(ItemSecondsRemainingKey).toDouble();
    double blended = measured;
    if (byteSize > byteCount && first.value(ItemSoftwareUpdateStateKey).toLongLong() == DownloadingState
        && secondsRemaining > 0) {
        const double implied = (byteSize - byteCount) / secondsRemaining;
        blended = measured + implied;
        if (measured > 0 && implied > 0) {
            blended /= 2.0;
        }
    }
    const double estimate = double(queuedCount) * SecondsPerQueuedItem + secondsRemaining
        + (blended != 0 ? double(queuedBytes) / blended : 0.0);
    _appendAveragingTimeInterval(estimate);
    return _averagedTimeInterval();
}

void CZDownloadDisplayManager::_appendAveragingTimeInterval(double interval)
{
    std::rotate(_timeRemainingAvergingWindow.rbegin(), _timeRemainingAvergingWindow.rbegin() + 1,
        _timeRemainingAvergingWindow.rend());
    _timeRemainingAvergingWindow[0] = interval;
}

double CZDownloadDisplayManager::_averagedTimeInterval() const
{
    double sum = 0;
    int count = 0;
    for (const double sample : _timeRemainingAvergingWindow) {
        if (sample == 0.0) {
            break; // exactly zero ends the valid samples; NaN is not zero and counts
        }
        sum += sample;
        ++count;
    }
    return count ? sum / count : 0.0;
}

} // namespace Cadenza
