// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_FAKEMESSAGEPORTSERVICE_H
#define CADENZA_TESTS_FAKEMESSAGEPORTSERVICE_H

#include "core/services/MessagePort.h"

#include <QHash>
#include <QList>

namespace Cadenza::Platform {

/**
 * Message ports within one process, for tests: a remote port calls the named local port's handler
 * directly, on the sender's thread. A test can make sends fail and read every message sent.
 */
class FakeMessagePortService final : public MessagePortService
{
public:
    struct SentMessage
    {
        QString portName;
        qint32 messageId;
        QByteArray data;
        bool replyWanted;
    };

    FakeMessagePortService();
    ~FakeMessagePortService() override;

    std::unique_ptr<RemoteMessagePort> createRemotePort(const QString &name) override;
    std::unique_ptr<LocalMessagePort> createLocalPort(const QString &name, LocalMessagePort::Handler handler,
        const LocalPortLimits &limits = LocalPortLimits()) override;
    std::unique_ptr<LocalMessagePort> createPresencePort(const QString &name) override;

    /// Every later send answers @p status instead of delivering (Success delivers again).
    void setSendStatus(int status);
    /// Names of the local ports that exist now.
    [[nodiscard]] QStringList localPortNames() const;
    [[nodiscard]] QList<SentMessage> sentMessages() const;
    /// Sends as a remote process would, to a local port of this service; false when there is none.
    bool deliver(const QString &portName, qint32 messageId, const QByteArray &data);

    struct State;

private:
    std::shared_ptr<State> m_state;
};

} // namespace Cadenza::Platform

#endif
