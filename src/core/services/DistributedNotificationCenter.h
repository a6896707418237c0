// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_DISTRIBUTEDNOTIFICATIONCENTER_H
#define CADENZA_PLATFORM_DISTRIBUTEDNOTIFICATIONCENTER_H

#include "cadenzacore_export.h"

#include <QObject>
#include <QVariantMap>

namespace Cadenza::Platform {

/**
 * Notifications that reach every process of the user's session, this one included.
 *
 * Observers connect to notificationPosted() and look at the name. Delivery is always queued: an
 * observer runs from the event loop, never inside postNotification().
 */
class CADENZACORE_EXPORT DistributedNotificationCenter : public QObject
{
    Q_OBJECT
public:
    explicit DistributedNotificationCenter(QObject *parent = nullptr);
    ~DistributedNotificationCenter() override;

    /// Posts @p name; @p userInfo holds property-list values.
    virtual void postNotification(
        const QString &name, const QString &object = QString(), const QVariantMap &userInfo = QVariantMap())
        = 0;

Q_SIGNALS:
    void notificationPosted(const QString &name, const QString &object, const QVariantMap &userInfo);
};

} // namespace Cadenza::Platform

#endif
