#include "UnixMessagePortService.h"

#include "Logging.h"
#include "MessageFrame.h"
#include "Paths.h"

#include <QDeadlineTimer>
#include <QDir>
#include <QFile>
#include <QHash>
#include <QLocalServer>
#include <QLocalSocket>
#include <QPointer>

#include <poll.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

namespace Cadenza::Platform {

namespace {

int milliseconds(double seconds)
{
    return seconds <= 0 ? 0 : int(qMin(seconds * 1000.0, 3600.0 * 1000.0));
}

class UnixRemotePort final : public RemoteMessagePort
{
public:
    UnixRemotePort(const QString &name, std::unique_ptr<QLocalSocket> socket)
        : m_name(name)
        , m_socket(std::move(socket))
    { }

    QString name() const override { return m_name; }

    bool isValid() override
    {
        if (!m_socket || m_socket->state() != QLocalSocket::ConnectedState) {
            return false;
        }
        // A peer that went away shows as a hang-up, or as readable with nothing to read.
        pollfd p {int(m_socket->socketDescriptor()), POLLIN, 0};
        if (::poll(&p, 1, 0) > 0) {
            if (p.revents & (POLLHUP | POLLERR | POLLNVAL)) {
                return false;
            }
            if (p.revents & POLLIN) {
                char c;
                if (::recv(p.fd, &c, 1, MSG_PEEK | MSG_DONTWAIT) == 0) {
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
        MessageFrame frame {messageId, replyWanted ? quint32(MessageFrame::ReplyWanted) : 0u, data};
        m_socket->write(frame.encode());
        QDeadlineTimer sendDeadline(milliseconds(sendTimeout));
        while (m_socket->bytesToWrite() > 0) {
            if (m_socket->state() != QLocalSocket::ConnectedState) {
                return {MessagePortStatus::BecameInvalid, std::nullopt};
            }
            if (sendDeadline.hasExpired()
                || !m_socket->waitForBytesWritten(int(sendDeadline.remainingTime()))) {
                if (m_socket->state() != QLocalSocket::ConnectedState) {
                    return {MessagePortStatus::BecameInvalid, std::nullopt};
                }
                if (sendDeadline.hasExpired()) {
                    // Half a frame may be on its way: the connection cannot be trusted any more.
                    m_socket->abort();
                    return {MessagePortStatus::SendTimeout, std::nullopt};
                }
            }
        }
        if (!replyWanted) {
            return {MessagePortStatus::Success, std::nullopt};
        }
        QDeadlineTimer receiveDeadline(milliseconds(receiveTimeout));
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
                m_socket->abort();
                return {MessagePortStatus::TransportError, std::nullopt};
            }
            if (m_socket->bytesAvailable() > 0) {
                (void)m_reader.append(m_socket->readAll());
                continue;
            }
            if (m_socket->state() != QLocalSocket::ConnectedState) {
                return {MessagePortStatus::BecameInvalid, std::nullopt};
            }
            if (receiveDeadline.hasExpired()
                || !m_socket->waitForReadyRead(int(receiveDeadline.remainingTime()))) {
                if (m_socket->state() != QLocalSocket::ConnectedState) {
                    return {MessagePortStatus::BecameInvalid, std::nullopt};
                }
                if (receiveDeadline.hasExpired()) {
                    // A late answer would be taken for the next request's: start afresh.
                    m_socket->abort();
                    return {MessagePortStatus::ReceiveTimeout, std::nullopt};
                }
            }
        }
    }

    void invalidate() override
    {
        if (m_socket) {
            m_socket->abort();
        }
    }

private:
    QString m_name;
    std::unique_ptr<QLocalSocket> m_socket;
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
    bool adopt(int descriptor) { return m_server.listen(qintptr(descriptor)); }

    QString name() const override { return m_name; }
    bool isValid() const override { return m_server.isListening(); }

    void invalidate() override
    {
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

    void acceptConnections()
    {
        while (QLocalSocket *socket = m_server.nextPendingConnection()) {
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
            connect(socket, &QLocalSocket::readyRead, this, [this, socket] { receive(socket); });
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
            }
        }
    }

    QString m_name;
    LocalMessagePort::Handler m_handler;
    LocalPortLimits m_limits;
    QLocalServer m_server;
    QHash<QLocalSocket *, Connection> m_connections;
    std::shared_ptr<bool> m_alive;
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
    const QString path = socketPath(name);
    if (!QFile::exists(path)) {
        return nullptr;
    }
    auto socket = std::make_unique<QLocalSocket>();
    socket->connectToServer(path);
    if (!socket->waitForConnected(1000)) {
        return nullptr;
    }
    return std::make_unique<UnixRemotePort>(name, std::move(socket));
}

std::unique_ptr<LocalMessagePort> UnixMessagePortService::createLocalPort(
    const QString &name, LocalMessagePort::Handler handler, const LocalPortLimits &limits)
{
    if (!isValidPortName(name) || !ensureRuntimeFolder()) {
        return nullptr;
    }
    const QString path = socketPath(name);
    if (QFile::encodeName(path).size() >= qsizetype(sizeof(sockaddr_un::sun_path))) {
        qCWarning(lcPorts, "The socket path %s is too long", qPrintable(path));
        return nullptr;
    }
    if (QFile::exists(path)) {
        // A name is taken while its socket answers; a socket nobody answers is left over from a crash.
        QLocalSocket probe;
        probe.connectToServer(path);
        if (probe.waitForConnected(1000)) {
            return nullptr;
        }
        QLocalServer::removeServer(path);
    }
    auto port = std::make_unique<UnixLocalPort>(name, std::move(handler), limits);
    if (!port->listen(path)) {
        return nullptr;
    }
    return port;
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
