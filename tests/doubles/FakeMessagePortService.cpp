// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeMessagePortService.h"

namespace Cadenza::Platform {

struct FakeMessagePortService::State
{
    struct Entry
    {
        LocalMessagePort::Handler *handler = nullptr;
        quint64 serial = 0; ///< tells a port from a later one at the same address
    };
    QHash<QString, Entry> ports;
    quint64 nextSerial = 1;
    QList<SentMessage> sent;
    int sendStatus = MessagePortStatus::Success;
};

namespace {

class FakeLocalPort final : public LocalMessagePort
{
public:
    FakeLocalPort(const QString &name, LocalMessagePort::Handler handler,
        std::shared_ptr<FakeMessagePortService::State> state)
        : m_name(name)
        , m_handler(std::move(handler))
        , m_state(std::move(state))
    {
        m_serial = m_state->nextSerial++;
        m_state->ports.insert(m_name, {&m_handler, m_serial});
    }
    ~FakeLocalPort() override { invalidate(); }

    QString name() const override { return m_name; }
    bool isValid() const override { return m_state->ports.value(m_name).serial == m_serial; }
    void invalidate() override
    {
        if (isValid()) {
            m_state->ports.remove(m_name);
        }
    }

private:
    QString m_name;
    LocalMessagePort::Handler m_handler;
    std::shared_ptr<FakeMessagePortService::State> m_state;
    quint64 m_serial = 0;
};

class FakeRemotePort final : public RemoteMessagePort
{
public:
    FakeRemotePort(const QString &name, std::shared_ptr<FakeMessagePortService::State> state)
        : m_name(name)
        , m_target(state->ports.value(name))
        , m_state(std::move(state))
    { }

    QString name() const override { return m_name; }
    bool isValid() override
    {
        return m_target.serial != 0 && m_state->ports.value(m_name).serial == m_target.serial;
    }
    Result sendRequest(qint32 messageId, const QByteArray &data, double, double, bool replyWanted) override
    {
        if (!isValid()) {
            return {MessagePortStatus::IsInvalid, std::nullopt};
        }
        m_state->sent.append({m_name, messageId, data, replyWanted});
        if (m_state->sendStatus != MessagePortStatus::Success) {
            return {m_state->sendStatus, std::nullopt};
        }
        // Copy the handler: it may release its own port while it runs.
        const LocalMessagePort::Handler handler = *m_target.handler;
        std::optional<QByteArray> reply = handler(messageId, data, {qint64(0), qint64(0)});
        if (!replyWanted || !reply || reply->isEmpty()) {
            return {MessagePortStatus::Success, std::nullopt};
        }
        return {MessagePortStatus::Success, reply};
    }
    void invalidate() override { m_target = {}; }

private:
    QString m_name;
    FakeMessagePortService::State::Entry m_target;
    std::shared_ptr<FakeMessagePortService::State> m_state;
};

} // namespace

FakeMessagePortService::FakeMessagePortService()
    : m_state(std::make_shared<State>())
{ }

FakeMessagePortService::~FakeMessagePortService() = default;

std::unique_ptr<RemoteMessagePort> FakeMessagePortService::createRemotePort(const QString &name)
{
    if (!isValidPortName(name) || !m_state->ports.contains(name)) {
        return nullptr;
    }
    return std::make_unique<FakeRemotePort>(name, m_state);
}

std::unique_ptr<LocalMessagePort> FakeMessagePortService::createLocalPort(
    const QString &name, LocalMessagePort::Handler handler, const LocalPortLimits &)
{
    if (!isValidPortName(name) || m_state->ports.contains(name)) {
        return nullptr;
    }
    return std::make_unique<FakeLocalPort>(name, std::move(handler), m_state);
}

std::unique_ptr<LocalMessagePort> FakeMessagePortService::createPresencePort(const QString &name)
{
    return createLocalPort(
        name, [](qint32, const QByteArray &, const MessagePeer &) { return std::optional<QByteArray>(); });
}

void FakeMessagePortService::setSendStatus(int status)
{
    m_state->sendStatus = status;
}

QStringList FakeMessagePortService::localPortNames() const
{
    return m_state->ports.keys();
}

QList<FakeMessagePortService::SentMessage> FakeMessagePortService::sentMessages() const
{
    return m_state->sent;
}

bool FakeMessagePortService::deliver(const QString &portName, qint32 messageId, const QByteArray &data)
{
    const auto *handler = m_state->ports.value(portName).handler;
    if (!handler) {
        return false;
    }
    const LocalMessagePort::Handler copy = *handler;
    (void)copy(messageId, data, {qint64(0), qint64(0)});
    return true;
}

} // namespace Cadenza::Platform
