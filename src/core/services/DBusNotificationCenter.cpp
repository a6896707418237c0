// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "DBusNotificationCenter.h"

#include "cadenzacore_logging.h"
#include "protocol/KeyedArchive.h"

#include <QDBusMessage>
#include <QMetaObject>

namespace Cadenza::Platform {

const QString DBusNotificationCenter::ObjectPath = QStringLiteral("/org/cadenza/Notifications");
const QString DBusNotificationCenter::Interface = QStringLiteral("org.cadenza.Notifications");

namespace {
const QString SignalName = QStringLiteral("Posted");

KeyedArchive::Limits notificationLimits()
{
    KeyedArchive::Limits limits;
    limits.maximumDepth = 8;
    limits.maximumItems = 1000;
    limits.maximumStringBytes = 64 * 1024;
    return limits;
}
} // namespace

DBusNotificationCenter::DBusNotificationCenter(QObject *parent)
    : DistributedNotificationCenter(parent)
    , m_bus(QDBusConnection::sessionBus())
{
    m_connected = m_bus.isConnected()
        && m_bus.connect(QString(), ObjectPath, Interface, SignalName, this, SLOT(receive(QDBusMessage)));
    if (!m_connected) {
        qCWarning(lcNotifications, "No session bus: notifications reach only this process");
    }
}

DBusNotificationCenter::~DBusNotificationCenter()
{
    if (m_connected) {
        m_bus.disconnect(QString(), ObjectPath, Interface, SignalName, this, SLOT(receive(QDBusMessage)));
    }
}

void DBusNotificationCenter::postNotification(
    const QString &name, const QString &object, const QVariantMap &userInfo)
{
    // This process hears its own notifications from here; its own signals coming back are dropped.
    QMetaObject::invokeMethod(
        this, [this, name, object, userInfo] { Q_EMIT notificationPosted(name, object, userInfo); },
        Qt::QueuedConnection);
    if (!m_connected) {
        return;
    }
    QString error;
    const auto archived = KeyedArchive::encode(userInfo, &error);
    if (!archived) {
        qCWarning(lcNotifications, "Notification %s not sent to other processes: %s", qPrintable(name),
            qPrintable(error));
        return;
    }
    QDBusMessage signal = QDBusMessage::createSignal(ObjectPath, Interface, SignalName);
    signal << name << object << *archived;
    if (!m_bus.send(signal)) {
        qCWarning(lcNotifications, "Notification %s not sent to other processes: %s", qPrintable(name),
            qPrintable(m_bus.lastError().message()));
    }
}

void DBusNotificationCenter::receive(const QDBusMessage &message)
{
    if (message.service() == m_bus.baseService()) {
        return;
    }
    const QVariantList arguments = message.arguments();
    if (arguments.size() != 3 || arguments.at(0).typeId() != QMetaType::QString
        || arguments.at(1).typeId() != QMetaType::QString
        || arguments.at(2).typeId() != QMetaType::QByteArray) {
        qCWarning(
            lcNotifications, "Ignoring a malformed notification from %s", qPrintable(message.service()));
        return;
    }
    QVariantMap userInfo;
    const QByteArray archived = arguments.at(2).toByteArray();
    if (!archived.isEmpty()) {
        QString error;
        const auto decoded = KeyedArchive::decode(archived,
            ArchiveClasses(ArchiveClass::Dictionary) | ArchiveClass::Array | PropertyListLeaves, &error,
            notificationLimits());
        if (!decoded || decoded->typeId() != QMetaType::QVariantMap) {
            qCWarning(lcNotifications, "Ignoring notification %s from %s: %s",
                qPrintable(arguments.at(0).toString()), qPrintable(message.service()),
                qPrintable(decoded ? QStringLiteral("not a dictionary") : error));
            return;
        }
        userInfo = decoded->toMap();
    }
    Q_EMIT notificationPosted(arguments.at(0).toString(), arguments.at(1).toString(), userInfo);
}

} // namespace Cadenza::Platform
