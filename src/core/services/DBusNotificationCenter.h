// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_DBUSNOTIFICATIONCENTER_H
#define CADENZA_PLATFORM_DBUSNOTIFICATIONCENTER_H

#include "DistributedNotificationCenter.h"

#include <QDBusConnection>

class QDBusMessage;

namespace Cadenza::Platform {

/**
 * Notifications as the D-Bus signal org.cadenza.Notifications.Posted(name, object, userInfo) on the
 * session bus, the user information travelling as a keyed archive. Without a session bus they stay
 * within this process (one log line says so).
 */
class CADENZACORE_EXPORT DBusNotificationCenter final : public DistributedNotificationCenter
{
    Q_OBJECT
public:
    static const QString ObjectPath;
    static const QString Interface;

    explicit DBusNotificationCenter(QObject *parent = nullptr);
    ~DBusNotificationCenter() override;

    void postNotification(const QString &name, const QString &object = QString(),
        const QVariantMap &userInfo = QVariantMap()) override;

    [[nodiscard]] bool isConnectedToSessionBus() const { return m_connected; }

private Q_SLOTS:
    void receive(const QDBusMessage &message);

private:
    QDBusConnection m_bus;
    bool m_connected = false;
};

} // namespace Cadenza::Platform

#endif
