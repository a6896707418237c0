// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_MESSAGEPORT_H
#define CADENZA_PLATFORM_MESSAGEPORT_H

#include "cadenzacore_export.h"

#include <QByteArray>
#include <QObject>
#include <QString>

#include <functional>
#include <memory>
#include <optional>

namespace Cadenza::Platform {

/// Outcomes of RemoteMessagePort::sendRequest().
namespace MessagePortStatus {
constexpr int Success = 0;
constexpr int SendTimeout = -1;
constexpr int ReceiveTimeout = -2;
constexpr int IsInvalid = -3;
constexpr int TransportError = -4;
constexpr int BecameInvalid = -5;
} // namespace MessagePortStatus

/// Who sent a message to a local port.
struct CADENZACORE_EXPORT MessagePeer
{
    qint64 processId = -1;
    qint64 userId = -1;
};

/// A connection to a named port of another process (or of this one).
class CADENZACORE_EXPORT RemoteMessagePort
{
public:
    struct Result
    {
        int status = MessagePortStatus::IsInvalid;
        std::optional<QByteArray> reply;
    };

    virtual ~RemoteMessagePort();
    [[nodiscard]] virtual QString name() const = 0;
    /// Whether the port's owner still answers.
    [[nodiscard]] virtual bool isValid() = 0;
    /**
     * Sends a message and, when @p replyWanted, waits for the answer. Blocks for at most
     * @p sendTimeout seconds to send and @p receiveTimeout seconds for the answer.
     */
    [[nodiscard]] virtual Result sendRequest(
        qint32 messageId, const QByteArray &data, double sendTimeout, double receiveTimeout, bool replyWanted)
        = 0;
    virtual void invalidate() = 0;
};

/// A named port of this process that receives messages on the thread that made it.
class CADENZACORE_EXPORT LocalMessagePort
{
public:
    /// Answers a message; the answer is sent back only when the sender wants one.
    using Handler = std::function<std::optional<QByteArray>(
        qint32 messageId, const QByteArray &data, const MessagePeer &peer)>;

    virtual ~LocalMessagePort();
    [[nodiscard]] virtual QString name() const = 0;
    [[nodiscard]] virtual bool isValid() const = 0;
    /// Stops receiving and frees the name.
    virtual void invalidate() = 0;
};

/// Limits a local port keeps against its peers.
struct CADENZACORE_EXPORT LocalPortLimits
{
    qsizetype maximumFrameBytes = 16 * 1024 * 1024;
    /// Room for many idle peers: connections that say nothing are closed after maximumIdleMilliseconds,
    /// so they cannot keep the port from the clients that do talk.
    int maximumConnections = 512;
    int maximumPendingRequests = 256; ///< per connection; beyond it the connection is closed
    int maximumIdleMilliseconds = 20000;
};

/// Makes message ports. Names are of letters, digits, '.', '-' and '_' only.
class CADENZACORE_EXPORT MessagePortService
{
public:
    virtual ~MessagePortService();
    /// A connection to the port named @p name; nullptr when no such port exists.
    [[nodiscard]] virtual std::unique_ptr<RemoteMessagePort> createRemotePort(const QString &name) = 0;
    /// A new port named @p name; nullptr when the name is taken or cannot be used.
    [[nodiscard]] virtual std::unique_ptr<LocalMessagePort> createLocalPort(const QString &name,
        LocalMessagePort::Handler handler, const LocalPortLimits &limits = LocalPortLimits())
        = 0;

    /**
     * A port that receives nothing and only shows that this process is there: remote ports made for
     * its name are valid while it exists. Probing it costs its owner next to nothing, so a server can
     * be probed before every request.
     */
    [[nodiscard]] virtual std::unique_ptr<LocalMessagePort> createPresencePort(const QString &name) = 0;
    [[nodiscard]] static bool isValidPortName(const QString &name);
};

} // namespace Cadenza::Platform

#endif
