// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "UnixMessagePortService.h"

#include "cadenzacore_logging.h"
#include "core/files/Paths.h"
#include "protocol/MessageFrame.h"

#include <QDeadlineTimer>
#include <QDir>
#include <QFile>
#include <QHash>
#include <QLocalServer>
#include <QLocalSocket>
#include <QPointer>
#include <QSocketNotifier>
#include <QTimer>

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <poll.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

#include <optional>
#include <vector>

namespace Cadenza::Platform {

namespace {

int milliseconds(double seconds)
{
    return seconds <= 0 ? 0 : int(qMin(seconds * 1000.0, 3600.0 * 1000.0));
}

// A client connection with plain blocking system calls: requests are synchronous, and nothing here
// needs an event loop.
class UnixRemotePort final : public RemoteMessagePort
{
public:
    UnixRemotePort(const QString &name, int descriptor)
        : m_name(name)
        , m_fd(descriptor)
    { }
    ~UnixRemotePort() override { invalidate(); }

    QString name() const override { return m_name; }

    bool isValid() override
    {
        if (m_fd < 0) {
            return false;
        }
        // A peer that went away shows as a hang-up, or as readable with nothing to read.
        pollfd p {m_fd, POLLIN, 0};
        if (::poll(&p, 1, 0) > 0) {
            if (p.revents & (POLLHUP | POLLERR | POLLNVAL)) {
                return false;
            }
            if (p.revents & POLLIN) {
                char c;
                if (::recv(m_fd, &c, 1, MSG_PEEK | MSG_DONTWAIT) == 0) {
                    return false;
                }
            }
        }
        return true;
    }

    Result sendRequest(qint32 messageId, const QByteArray &data, double sendTimeout, double receiveTimeout,
        bool replyWanted) override
    {
        if (!isValid()) {
            return {MessagePortStatus::IsInvalid, std::nullopt};
        }
        const QByteArray frame
            = MessageFrame {messageId, replyWanted ? quint32(MessageFrame::ReplyWanted) : 0u, data}.encode();
        QDeadlineTimer sendDeadline(milliseconds(sendTimeout));
        qsizetype sent = 0;
        while (sent < frame.size()) {
            const ssize_t n = ::send(
                m_fd, frame.constData() + sent, size_t(frame.size() - sent), MSG_NOSIGNAL | MSG_DONTWAIT);
            if (n > 0) {
                sent += n;
                continue;
            }
            if (n < 0 && errno != EAGAIN && errno != EWOULDBLOCK && errno != EINTR) {
                invalidate();
                return {MessagePortStatus::BecameInvalid, std::nullopt};
            }
            if (!waitFor(POLLOUT, sendDeadline)) {
                // Half a frame may be on its way: the connection cannot be trusted any more.
                invalidate();
                return {MessagePortStatus::SendTimeout, std::nullopt};
            }
        }
        if (!replyWanted) {
            return {MessagePortStatus::Success, std::nullopt};
        }
        QDeadlineTimer receiveDeadline(milliseconds(receiveTimeout));
        QByteArray buffer(64 * 1024, Qt::Uninitialized);
        while (true) {
            while (auto reply = m_reader.next()) {
                if ((reply->flags & MessageFrame::IsReply) && reply->messageId == messageId) {
                    if (reply->payload.isEmpty()) {
                        return {MessagePortStatus::Success, std::nullopt};
                    }
                    return {MessagePortStatus::Success, reply->payload};
                }
            }
            if (m_reader.isBroken()) {
                invalidate();
                return {MessagePortStatus::TransportError, std::nullopt};
            }
            const ssize_t n = ::recv(m_fd, buffer.data(), size_t(buffer.size()), MSG_DONTWAIT);
            if (n > 0) {
                (void)m_reader.append(QByteArray(buffer.constData(), n));
                continue;
            }
            if (n == 0 || (errno != EAGAIN && errno != EWOULDBLOCK && errno != EINTR)) {
                invalidate();
                return {MessagePortStatus::BecameInvalid, std::nullopt};
            }
            if (!waitFor(POLLIN, receiveDeadline)) {
                // A late answer would be taken for the next request's: start afresh.
                invalidate();
                return {MessagePortStatus::ReceiveTimeout, std::nullopt};
            }
        }
    }

    void invalidate() override
    {
        if (m_fd >= 0) {
            ::close(m_fd);
            m_fd = -1;
        }
    }

private:
    bool waitFor(short events, const QDeadlineTimer &deadline)
    {
        while (!deadline.hasExpired()) {
            pollfd p {m_fd, events, 0};
            const int ready = ::poll(&p, 1, int(qMin<qint64>(deadline.remainingTime(), 1000)));
            if (ready > 0) {
                return true;
            }
            if (ready < 0 && errno != EINTR) {
                return false;
            }
        }
        return false;
    }

    QString m_name;
    int m_fd = -1;
    MessageFrameReader m_reader;
};

class UnixLocalPort final : public QObject, public LocalMessagePort
{
public:
    UnixLocalPort(const QString &name, LocalMessagePort::Handler handler, const LocalPortLimits &limits)
        : m_name(name)
        , m_handler(std::move(handler))
        , m_limits(limits)
        , m_alive(std::make_shared<bool>(true))
    {
        m_server.setSocketOptions(QLocalServer::UserAccessOption);
        m_server.setMaxPendingConnections(limits.maximumConnections);
        connect(&m_server, &QLocalServer::newConnection, this, &UnixLocalPort::acceptConnections);
    }

    ~UnixLocalPort() override
    {
        *m_alive = false;
        invalidate();
    }

    bool listen(const QString &path) { return m_server.listen(path); }

    // A socket handed over by the service manager belongs to it: it is accepted on here, but never
    // unlinked, or nobody could reach the next instance it starts. QLocalServer would unlink it on
    // close, so it is not given to QLocalServer.
    bool adopt(int descriptor)
    {
        int accepting = 0;
        socklen_t size = sizeof(accepting);
        if (::getsockopt(descriptor, SOL_SOCKET, SO_ACCEPTCONN, &accepting, &size) != 0 || !accepting) {
            return false;
        }
        const int flags = ::fcntl(descriptor, F_GETFL);
        if (flags < 0 || ::fcntl(descriptor, F_SETFL, flags | O_NONBLOCK) != 0) {
            return false;
        }
        m_adopted = descriptor;
        m_adoptedNotifier = std::make_unique<QSocketNotifier>(descriptor, QSocketNotifier::Read);
        connect(
            m_adoptedNotifier.get(), &QSocketNotifier::activated, this, &UnixLocalPort::acceptConnections);
        return true;
    }

    QString name() const override { return m_name; }
    bool isValid() const override { return m_adopted >= 0 || m_server.isListening(); }

    void invalidate() override
    {
        if (m_adopted >= 0) {
            m_adoptedNotifier.reset();
            ::close(std::exchange(m_adopted, -1));
        }
        if (m_server.isListening()) {
            const QString path = m_server.fullServerName();
            m_server.close();
            QFile::remove(path);
        }
        const auto sockets = m_connections.keys();
        m_connections.clear();
        for (QLocalSocket *socket : sockets) {
            socket->disconnect(this);
            socket->abort();
            socket->deleteLater();
        }
    }

private:
    struct Connection
    {
        MessageFrameReader reader;
        MessagePeer peer;
    };

    QLocalSocket *nextPendingConnection()
    {
        if (m_adopted < 0) {
            return m_server.nextPendingConnection();
        }
        while (true) {
            const int fd = ::accept4(m_adopted, nullptr, nullptr, SOCK_NONBLOCK | SOCK_CLOEXEC);
            if (fd < 0) {
                return nullptr; // EAGAIN: none left; anything else: the next notification tries again
            }
            auto *socket = new QLocalSocket(this);
            if (socket->setSocketDescriptor(fd, QLocalSocket::ConnectedState, QIODevice::ReadWrite)) {
                return socket;
            }
            ::close(fd);
            delete socket;
        }
    }

    void acceptConnections()
    {
        while (QLocalSocket *socket = nextPendingConnection()) {
            ucred credentials {};
            socklen_t size = sizeof(credentials);
            const int fd = int(socket->socketDescriptor());
            const bool known = ::getsockopt(fd, SOL_SOCKET, SO_PEERCRED, &credentials, &size) == 0;
            if (!known || credentials.uid != ::geteuid()) {
                qCWarning(lcPorts, "Port %s refused a connection from user %d", qPrintable(m_name),
                    known ? int(credentials.uid) : -1);
                socket->abort();
                socket->deleteLater();
                continue;
            }
            if (m_connections.size() >= m_limits.maximumConnections) {
                qCWarning(lcPorts, "Port %s refused a connection: %d connections are open",
                    qPrintable(m_name), m_limits.maximumConnections);
                socket->abort();
                socket->deleteLater();
                continue;
            }
            m_connections.insert(socket,
                {MessageFrameReader(m_limits.maximumFrameBytes),
                    {qint64(credentials.pid), qint64(credentials.uid)}});
            auto *idle = new QTimer(socket);
            idle->setObjectName(QStringLiteral("idle"));
            idle->setSingleShot(true);
            idle->setInterval(m_limits.maximumIdleMilliseconds);
            connect(idle, &QTimer::timeout, this, [this, socket] {
                qCInfo(lcPorts, "Port %s closed a connection that stayed silent", qPrintable(m_name));
                socket->abort();
                drop(socket);
            });
            idle->start();
            connect(socket, &QLocalSocket::readyRead, this, [this, socket, idle] {
                idle->start(); // it talks: not idle
                receive(socket);
            });
            connect(socket, &QLocalSocket::disconnected, this, [this, socket] { drop(socket); });
            if (socket->bytesAvailable() > 0) {
                receive(socket);
            }
        }
    }

    void drop(QLocalSocket *socket)
    {
        if (m_connections.remove(socket)) {
            socket->disconnect(this);
            socket->deleteLater();
        }
    }

    void receive(QLocalSocket *socket)
    {
        auto it = m_connections.find(socket);
        if (it == m_connections.end()) {
            return;
        }
        if (!it->reader.append(socket->readAll())) {
            qCWarning(lcPorts, "Port %s closed a connection that sent a malformed or oversized frame",
                qPrintable(m_name));
            socket->abort();
            drop(socket);
            return;
        }
        const MessagePeer peer = it->peer;
        int handled = 0;
        while (true) {
            auto frameIt = m_connections.find(socket);
            if (frameIt == m_connections.end()) {
                return;
            }
            auto frame = frameIt->reader.next();
            if (!frame) {
                break;
            }
            if (frame->flags & MessageFrame::IsReply) {
                continue; // nobody here asked
            }
            if (++handled > m_limits.maximumPendingRequests) {
                qCWarning(lcPorts, "Port %s closed a connection that sent too many requests at once",
                    qPrintable(m_name));
                socket->abort();
                drop(socket);
                return;
            }
            const std::shared_ptr<bool> alive = m_alive;
            std::optional<QByteArray> reply = m_handler(frame->messageId, frame->payload, peer);
            if (!*alive) {
                return; // the handler released this port
            }
            if ((frame->flags & MessageFrame::ReplyWanted) && m_connections.contains(socket)) {
                // A client that never reads its answers must not make us hold them without end.
                if (socket->bytesToWrite() > m_limits.maximumFrameBytes) {
                    qCWarning(lcPorts, "Port %s closed a connection that does not read its replies",
                        qPrintable(m_name));
                    socket->abort();
                    drop(socket);
                    return;
                }
                socket->write(
                    MessageFrame {frame->messageId, MessageFrame::IsReply, reply.value_or(QByteArray())}
                        .encode());
                // The client is blocked on this answer: hand it to the kernel now rather than on the
                // next turn of the event loop.
                socket->flush();
            }
        }
    }

    QString m_name;
    LocalMessagePort::Handler m_handler;
    LocalPortLimits m_limits;
    QLocalServer m_server;
    int m_adopted = -1; ///< the service manager's listening socket, when adopted
    std::unique_ptr<QSocketNotifier> m_adoptedNotifier;
    QHash<QLocalSocket *, Connection> m_connections;
    std::shared_ptr<bool> m_alive;
};

// The address of the socket file at @p path; nothing when the path is too long for one.
std::optional<sockaddr_un> socketAddress(const QString &path)
{
    const QByteArray encoded = QFile::encodeName(path);
    sockaddr_un address {};
    if (encoded.size() >= qsizetype(sizeof(address.sun_path))) {
        return std::nullopt;
    }
    address.sun_family = AF_UNIX;
    std::memcpy(address.sun_path, encoded.constData(), size_t(encoded.size()));
    return address;
}

// The presence port holds no Qt socket per peer: a probe is accepted and kept as a bare descriptor
// until its peer hangs up, which a sweep on every later acceptance (and once a second) notices. A probe
// must not be closed before its peer is done, or the peer would take the hang-up for our absence.
// Probes wait in the kernel's backlog (connecting needs no acceptance), so after one wake-up the
// port does not listen again for a while: a client probing before each request then wakes this
// process once, for the request, instead of twice.
class UnixPresencePort final : public QObject, public LocalMessagePort
{
public:
    UnixPresencePort(const QString &name, const QString &path, int listener)
        : m_name(name)
        , m_path(path)
        , m_listener(listener)
        , m_notifier(listener, QSocketNotifier::Read)
    {
        connect(&m_notifier, &QSocketNotifier::activated, this, [this] {
            m_notifier.setEnabled(false);
            acceptProbes();
            m_rearm.start();
        });
        m_rearm.setSingleShot(true);
        m_rearm.setInterval(QuietMilliseconds);
        connect(&m_rearm, &QTimer::timeout, this, [this] {
            acceptProbes();
            m_notifier.setEnabled(true);
        });
        m_sweep.setInterval(1000);
        connect(&m_sweep, &QTimer::timeout, this, &UnixPresencePort::sweep);
    }
    ~UnixPresencePort() override { invalidate(); }

    QString name() const override { return m_name; }
    bool isValid() const override { return m_listener >= 0; }

    void invalidate() override
    {
        if (m_listener < 0) {
            return;
        }
        m_notifier.setEnabled(false);
        m_rearm.stop();
        m_sweep.stop();
        ::close(m_listener);
        m_listener = -1;
        QFile::remove(m_path);
        for (const int probe : std::exchange(m_probes, {})) {
            ::close(probe);
        }
    }

private:
    static constexpr int MaximumProbes = 1024;
    static constexpr int QuietMilliseconds = 100;

    void acceptProbes()
    {
        while (true) {
            const int probe = ::accept4(m_listener, nullptr, nullptr, SOCK_NONBLOCK | SOCK_CLOEXEC);
            if (probe < 0) {
                break; // EAGAIN: none left; anything else: the next notification tries again
            }
            ucred credentials {};
            socklen_t size = sizeof(credentials);
            if (::getsockopt(probe, SOL_SOCKET, SO_PEERCRED, &credentials, &size) != 0
                || credentials.uid != ::geteuid()) {
                ::close(probe);
                continue;
            }
            if (m_probes.size() >= MaximumProbes) {
                // Peers that neither talk nor leave: the oldest has had its answer long ago.
                ::close(m_probes.front());
                m_probes.erase(m_probes.begin());
            }
            m_probes.push_back(probe);
        }
        sweep();
    }

    void sweep()
    {
        std::vector<pollfd> polled;
        polled.reserve(m_probes.size());
        for (const int probe : m_probes) {
            polled.push_back({probe, POLLIN | POLLRDHUP, 0});
        }
        if (!polled.empty() && ::poll(polled.data(), nfds_t(polled.size()), 0) > 0) {
            m_probes.clear();
            for (const pollfd &p : polled) {
                // Nobody has anything to say here: readable means gone (or misbehaving).
                if (p.revents != 0) {
                    ::close(p.fd);
                } else {
                    m_probes.push_back(p.fd);
                }
            }
        }
        if (m_probes.empty()) {
            m_sweep.stop();
        } else if (!m_sweep.isActive()) {
            m_sweep.start();
        }
    }

    QString m_name;
    QString m_path;
    int m_listener;
    QSocketNotifier m_notifier;
    QTimer m_rearm;
    QTimer m_sweep;
    std::vector<int> m_probes;
};

} // namespace

QString UnixMessagePortService::socketPath(const QString &name)
{
    return Paths::runtimeFolder() + QLatin1Char('/') + name;
}

bool UnixMessagePortService::ensureRuntimeFolder()
{
    const QString folder = Paths::runtimeFolder();
    if (!QDir().mkpath(folder)) {
        qCWarning(lcPorts, "Cannot create the runtime folder %s", qPrintable(folder));
        return false;
    }
    const QByteArray path = QFile::encodeName(folder);
    struct stat st
    {
    };
    if (::lstat(path.constData(), &st) != 0 || !S_ISDIR(st.st_mode) || st.st_uid != ::geteuid()) {
        qCWarning(lcPorts, "The runtime folder %s is not a folder of this user", qPrintable(folder));
        return false;
    }
    if ((st.st_mode & 077) != 0 && ::chmod(path.constData(), 0700) != 0) {
        qCWarning(lcPorts, "Cannot make the runtime folder %s private", qPrintable(folder));
        return false;
    }
    return true;
}

std::unique_ptr<RemoteMessagePort> UnixMessagePortService::createRemotePort(const QString &name)
{
    if (!isValidPortName(name)) {
        return nullptr;
    }
    const auto address = socketAddress(socketPath(name));
    if (!address) {
        return nullptr;
    }
    const int fd = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0);
    if (fd < 0) {
        return nullptr;
    }
    // Local connections complete at once or are refused; a full backlog is the only wait, and it is
    // not waited out for more than a second.
    QDeadlineTimer deadline(1000);
    while (::connect(fd, reinterpret_cast<const sockaddr *>(&*address), sizeof(*address)) != 0) {
        if ((errno != EAGAIN && errno != EINTR) || deadline.hasExpired()) {
            ::close(fd);
            return nullptr;
        }
        ::usleep(1000);
    }
    return std::make_unique<UnixRemotePort>(name, fd);
}

std::unique_ptr<LocalMessagePort> UnixMessagePortService::createLocalPort(
    const QString &name, LocalMessagePort::Handler handler, const LocalPortLimits &limits)
{
    if (!isValidPortName(name) || !ensureRuntimeFolder()) {
        return nullptr;
    }
    const QString path = socketPath(name);
    if (!claimSocketPath(path)) {
        return nullptr;
    }
    auto port = std::make_unique<UnixLocalPort>(name, std::move(handler), limits);
    if (!port->listen(path)) {
        return nullptr;
    }
    return port;
}

bool UnixMessagePortService::claimSocketPath(const QString &path)
{
    if (!socketAddress(path)) {
        qCWarning(lcPorts, "The socket path %s is too long", qPrintable(path));
        return false;
    }
    if (QFile::exists(path)) {
        // A name is taken while its socket answers; a socket nobody answers is left over from a crash.
        QLocalSocket probe;
        probe.connectToServer(path);
        if (probe.waitForConnected(1000)) {
            return false;
        }
        QLocalServer::removeServer(path);
    }
    return true;
}

std::unique_ptr<LocalMessagePort> UnixMessagePortService::createPresencePort(const QString &name)
{
    if (!isValidPortName(name) || !ensureRuntimeFolder()) {
        return nullptr;
    }
    const QString path = socketPath(name);
    if (!claimSocketPath(path)) {
        return nullptr;
    }
    const auto address = socketAddress(path); // claimSocketPath() checked that it fits
    const int listener = ::socket(AF_UNIX, SOCK_STREAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0);
    if (!address || listener < 0) {
        if (listener >= 0) {
            ::close(listener);
        }
        return nullptr;
    }
    if (::bind(listener, reinterpret_cast<const sockaddr *>(&*address), sizeof(*address)) != 0
        || ::chmod(address->sun_path, 0600) != 0 || ::listen(listener, SOMAXCONN) != 0) {
        qCWarning(lcPorts, "Cannot listen on %s: %s", qPrintable(path), std::strerror(errno));
        ::close(listener);
        QFile::remove(path);
        return nullptr;
    }
    return std::make_unique<UnixPresencePort>(name, path, listener);
}

std::unique_ptr<LocalMessagePort> UnixMessagePortService::adoptLocalPort(const QString &name,
    int listeningDescriptor, LocalMessagePort::Handler handler, const LocalPortLimits &limits)
{
    auto port = std::make_unique<UnixLocalPort>(name, std::move(handler), limits);
    if (!port->adopt(listeningDescriptor)) {
        return nullptr;
    }
    return port;
}

} // namespace Cadenza::Platform
