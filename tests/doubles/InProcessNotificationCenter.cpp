// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "InProcessNotificationCenter.h"

#include <QMetaObject>

namespace Cadenza::Platform {

void InProcessNotificationCenter::postNotification(
    const QString &name, const QString &object, const QVariantMap &userInfo)
{
    m_posted.append({name, object, userInfo});
    receiveFromOtherProcess(name, object, userInfo);
}

void InProcessNotificationCenter::receiveFromOtherProcess(
    const QString &name, const QString &object, const QVariantMap &userInfo)
{
    QMetaObject::invokeMethod(
        this, [this, name, object, userInfo] { Q_EMIT notificationPosted(name, object, userInfo); },
        Qt::QueuedConnection);
}

} // namespace Cadenza::Platform
