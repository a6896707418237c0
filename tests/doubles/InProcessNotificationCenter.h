// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_INPROCESSNOTIFICATIONCENTER_H
#define CADENZA_TESTS_INPROCESSNOTIFICATIONCENTER_H

#include "core/services/DistributedNotificationCenter.h"

namespace Cadenza::Platform {

/// Notifications within this process only, for tests; it remembers what was posted.
class InProcessNotificationCenter final : public DistributedNotificationCenter
{
    Q_OBJECT
public:
    struct Posted
    {
        QString name;
        QString object;
        QVariantMap userInfo;
    };

    using DistributedNotificationCenter::DistributedNotificationCenter;

    void postNotification(const QString &name, const QString &object = QString(),
        const QVariantMap &userInfo = QVariantMap()) override;

    /// Delivers a notification as if another process had posted it.
    void receiveFromOtherProcess(
        const QString &name, const QString &object = QString(), const QVariantMap &userInfo = QVariantMap());
    [[nodiscard]] QList<Posted> posted() const { return m_posted; }

private:
    QList<Posted> m_posted;
};

} // namespace Cadenza::Platform

#endif
