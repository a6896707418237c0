// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "FakeMessagePortService.h"
#include "core/files/Paths.h"
#include "core/services/UnixMessagePortService.h"
#include "protocol/MessageFrame.h"

#include <QDir>
#include <QFileInfo>
#include <QLocalSocket>
#include <QMutex>
#include <QSemaphore>
#include <QTest>
#include <QThread>

#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

using namespace Cadenza::Platform;

namespace {

/// A local port with an echo handler, living on a thread of its own so that blocking sends from
/// the test's thread can be answered.
class PortHost
{
public:
    PortHost(MessagePortService &service, const QString &name, bool ownThread, LocalPortLimits limits = {},
        int answerDelayMs = 0)
    {
        auto make = [&, name, limits, answerDelayMs] {
            m_port = service.createLocalPort(
                name,
                [this, answerDelayMs](
                    qint32 id, const QByteArray &data, const MessagePeer &peer) -> std::optional<QByteArray> {
                    {
                        QMutexLocker locker(&m_mutex);
                        m_received.append({id, data});
                        m_lastPeer = peer;
                    }
                    m_arrived.release();
                    if (answerDelayMs) {
                        QThread::msleep(answerDelayMs);
                    }
                    if (data == "no answer") {
                        return std::nullopt;
                    }
                    return QByteArray("echo:") + data;
                },
                limits);
        };
        if (!ownThread) {
            make();
            return;
        }
        m_thread = std::make_unique<QThread>();
        m_thread->start();
        m_context = std::make_unique<QObject>();
        m_context->moveToThread(m_thread.get());
        QMetaObject::invokeMethod(m_context.get(), make, Qt::BlockingQueuedConnection);
    }

    ~PortHost()
    {
        if (m_thread) {
            QMetaObject::invokeMethod(
                m_context.get(), [this] { m_port.reset(); }, Qt::BlockingQueuedConnection);
            m_thread->quit();
            m_thread->wait();
            m_context.reset();
        }
    }

    LocalMessagePort *port() const { return m_port.get(); }
    void invalidate()
    {
        if (m_thread) {
            QMetaObject::invokeMethod(
                m_context.get(), [this] { m_port->invalidate(); }, Qt::BlockingQueuedConnection);
        } else {
            m_port->invalidate();
        }
    }
    bool waitForMessages(int count) { return m_arrived.tryAcquire(count, 5000); }
    QList<std::pair<qint32, QByteArray>> received()
    {
        QMutexLocker locker(&m_mutex);
        return m_received;
    }
    MessagePeer lastPeer()
    {
        QMutexLocker locker(&m_mutex);
        return m_lastPeer;
    }

private:
    std::unique_ptr<QThread> m_thread;
    std::unique_ptr<QObject> m_context;
    std::unique_ptr<LocalMessagePort> m_port;
    QMutex m_mutex;
    QList<std::pair<qint32, QByteArray>> m_received;
    MessagePeer m_lastPeer;
    QSemaphore m_arrived;
};

} // namespace

/// The contract of every message port service.
class MessagePortContract : public QObject
{
    Q_OBJECT
public:
    MessagePortContract(
        const QString &name, std::function<std::shared_ptr<MessagePortService>()> make, bool threads)
        : m_make(std::move(make))
        , m_threads(threads)
    {
        setObjectName(name);
    }

private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<Cadenza::Testing::TestEnvironment>();
        m_service = m_make();
    }
    void cleanup()
    {
        m_service.reset();
        m_environment.reset();
    }

    void requestsAreAnswered()
    {
        PortHost host(*m_service, QStringLiteral("test.port"), m_threads);
        QVERIFY(host.port());
        auto remote = m_service->createRemotePort(QStringLiteral("test.port"));
        QVERIFY(remote);
        QVERIFY(remote->isValid());
        for (int i = 0; i < 3; ++i) {
            const auto result = remote->sendRequest(3 + i, QByteArray::number(i), 10.0, 10.0, true);
            QCOMPARE(result.status, MessagePortStatus::Success);
            QCOMPARE(result.reply.value_or(QByteArray()), QByteArray("echo:") + QByteArray::number(i));
        }
        QCOMPARE(host.received().at(2).first, 5);
    }

    void requestsWithoutReplyAreDelivered()
    {
        PortHost host(*m_service, QStringLiteral("test.port"), m_threads);
        auto remote = m_service->createRemotePort(QStringLiteral("test.port"));
        QVERIFY(remote);
        const auto result = remote->sendRequest(1, QByteArray("payload"), 10.0, 0.0, false);
        QCOMPARE(result.status, MessagePortStatus::Success);
        QVERIFY(!result.reply);
        QVERIFY(host.waitForMessages(1));
        QCOMPARE(host.received().first().second, QByteArray("payload"));
    }

    void anEmptyAnswerIsNoData()
    {
        PortHost host(*m_service, QStringLiteral("test.port"), m_threads);
        auto remote = m_service->createRemotePort(QStringLiteral("test.port"));
        const auto result = remote->sendRequest(3, QByteArray("no answer"), 10.0, 10.0, true);
        QCOMPARE(result.status, MessagePortStatus::Success);
        QVERIFY(!result.reply);
    }

    void absentPortsCannotBeReached()
    {
        QVERIFY(!m_service->createRemotePort(QStringLiteral("nobody.here")));
    }

    void namesAreTakenOnce()
    {
        PortHost first(*m_service, QStringLiteral("test.port"), m_threads);
        QVERIFY(first.port());
        QVERIFY(!m_service->createLocalPort(QStringLiteral("test.port"), {}));
        first.invalidate();
        QVERIFY(!first.port()->isValid());
        auto again = m_service->createLocalPort(QStringLiteral("test.port"),
            [](qint32, const QByteArray &, const MessagePeer &) { return std::optional<QByteArray>(); });
        QVERIFY(again);
    }

    void invalidatedPortsInvalidateTheirRemotes()
    {
        PortHost host(*m_service, QStringLiteral("test.port"), m_threads);
        auto remote = m_service->createRemotePort(QStringLiteral("test.port"));
        QVERIFY(remote->isValid());
        host.invalidate();
        QTRY_VERIFY(!remote->isValid());
        QVERIFY(remote->sendRequest(1, QByteArray("x"), 1.0, 1.0, true).status != MessagePortStatus::Success);
        QVERIFY(!m_service->createRemotePort(QStringLiteral("test.port")));
    }

    void badNamesAreRefused_data()
    {
        QTest::addColumn<QString>("name");
        QTest::newRow("traversal") << QStringLiteral("../../etc/x");
        QTest::newRow("slash") << QStringLiteral("a/b");
        QTest::newRow("empty") << QString();
        QTest::newRow("hidden") << QStringLiteral(".x");
        QTest::newRow("too long") << QString(200, QLatin1Char('a'));
        QTest::newRow("space") << QStringLiteral("a b");
    }
    void badNamesAreRefused()
    {
        QFETCH(QString, name);
        QVERIFY(!m_service->createLocalPort(name, {}));
        QVERIFY(!m_service->createRemotePort(name));
    }

    void aHandlerMayReleaseItsOwnPort()
    {
        std::unique_ptr<LocalMessagePort> port;
        bool called = false;
        port = m_service->createLocalPort(
            QStringLiteral("self.release"), [&](qint32, const QByteArray &, const MessagePeer &) {
                called = true;
                port.reset();
                return std::optional<QByteArray>();
            });
        QVERIFY(port);
        if (m_threads) {
            // Another process sends; here a raw client does, and the port's own event loop answers.
            QLocalSocket client;
            client.connectToServer(UnixMessagePortService::socketPath(QStringLiteral("self.release")));
            QVERIFY(client.waitForConnected(2000));
            client.write(MessageFrame {1, 0, QByteArray("done")}.encode());
            QVERIFY(client.waitForBytesWritten(2000));
            QTRY_VERIFY(called);
        } else {
            auto remote = m_service->createRemotePort(QStringLiteral("self.release"));
            QCOMPARE(remote->sendRequest(1, QByteArray("done"), 1.0, 0.0, false).status,
                MessagePortStatus::Success);
            QVERIFY(called);
        }
        QVERIFY(!port);
        QVERIFY(!m_service->createRemotePort(QStringLiteral("self.release")));
    }

    void presencePortsShowTheirOwnerWhileTheyStand()
    {
        const QString name = QStringLiteral("test.presence");
        auto presence = m_service->createPresencePort(name);
        QVERIFY(presence && presence->isValid());
        QVERIFY(!m_service->createPresencePort(name)); // the name is taken
        QVERIFY(!m_service->createLocalPort(name, {}));
        QVERIFY(!m_service->createPresencePort(QStringLiteral("../presence")));
        // A client probes before every request: many probes made, checked and dropped in a row.
        for (int i = 0; i < 2000; ++i) {
            auto probe = m_service->createRemotePort(name);
            QVERIFY(probe && probe->isValid());
            probe->invalidate();
            if (i % 100 == 0) {
                QCoreApplication::processEvents();
            }
        }
        // The owner tidies up after the probes that left, never after one still looking.
        auto held = m_service->createRemotePort(name);
        QVERIFY(held);
        for (int i = 0; i < 5; ++i) {
            QTest::qWait(20);
            QVERIFY(held->isValid());
        }
        presence->invalidate();
        QTRY_VERIFY(!held->isValid());
        QVERIFY(!m_service->createRemotePort(name));
        QVERIFY(m_service->createPresencePort(name)); // free again
    }

private:
    std::function<std::shared_ptr<MessagePortService>()> m_make;
    bool m_threads;
    std::unique_ptr<Cadenza::Testing::TestEnvironment> m_environment;
    std::shared_ptr<MessagePortService> m_service;
};

/// What only sockets can show.
class UnixMessagePortTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init() { m_environment = std::make_unique<Cadenza::Testing::TestEnvironment>(); }
    void cleanup() { m_environment.reset(); }

    void theSocketFolderIsPrivateAndPeersAreKnown()
    {
        UnixMessagePortService service;
        PortHost host(service, QStringLiteral("test.port"), true);
        QVERIFY(host.port());
        const QFileInfo folder(Paths::runtimeFolder());
        QCOMPARE(
            folder.permissions() & (QFile::ReadGroup | QFile::ReadOther | QFile::ExeGroup | QFile::ExeOther),
            QFile::Permissions());
        auto remote = service.createRemotePort(QStringLiteral("test.port"));
        QCOMPARE(remote->sendRequest(1, QByteArray("x"), 5.0, 5.0, true).status, MessagePortStatus::Success);
        QCOMPARE(host.lastPeer().processId, qint64(::getpid()));
        QCOMPARE(host.lastPeer().userId, qint64(::geteuid()));
    }

    void slowAnswersTimeOut()
    {
        UnixMessagePortService service;
        PortHost host(service, QStringLiteral("slow.port"), true, {}, 1500);
        auto remote = service.createRemotePort(QStringLiteral("slow.port"));
        QElapsedTimer clock;
        clock.start();
        const auto result = remote->sendRequest(3, QByteArray("x"), 5.0, 0.3, true);
        QCOMPARE(result.status, MessagePortStatus::ReceiveTimeout);
        QVERIFY(clock.elapsed() < 1400);
        // The late answer must never be taken for the next request's: the connection is dropped.
        QVERIFY(!remote->isValid());
    }

    void oversizedFramesCloseOnlyTheirConnection()
    {
        UnixMessagePortService service;
        LocalPortLimits limits;
        limits.maximumFrameBytes = 1024;
        QTest::ignoreMessage(
            QtWarningMsg, QRegularExpression(QStringLiteral("malformed or oversized frame")));
        PortHost host(service, QStringLiteral("small.port"), true, limits);
        auto greedy = service.createRemotePort(QStringLiteral("small.port"));
        const auto result = greedy->sendRequest(1, QByteArray(4096, 'x'), 5.0, 5.0, true);
        QVERIFY(result.status == MessagePortStatus::BecameInvalid
            || result.status == MessagePortStatus::TransportError);
        auto polite = service.createRemotePort(QStringLiteral("small.port"));
        QVERIFY(polite);
        QCOMPARE(
            polite->sendRequest(1, QByteArray(100, 'x'), 5.0, 5.0, true).status, MessagePortStatus::Success);
    }

    void garbageClosesTheConnection()
    {
        UnixMessagePortService service;
        QTest::ignoreMessage(
            QtWarningMsg, QRegularExpression(QStringLiteral("malformed or oversized frame")));
        PortHost host(service, QStringLiteral("test.port"), true);
        QLocalSocket raw;
        raw.connectToServer(UnixMessagePortService::socketPath(QStringLiteral("test.port")));
        QVERIFY(raw.waitForConnected(2000));
        raw.write(QByteArray(64, '\xff'));
        QVERIFY(raw.waitForBytesWritten(2000));
        QTRY_COMPARE(raw.state(), QLocalSocket::UnconnectedState);
        auto remote = service.createRemotePort(QStringLiteral("test.port"));
        QCOMPARE(remote->sendRequest(1, QByteArray("ok"), 5.0, 5.0, true).status, MessagePortStatus::Success);
    }

    void probesOfAPresencePortAreNotKept()
    {
        const auto openDescriptors = [] {
            return QDir(QStringLiteral("/proc/self/fd")).entryList(QDir::Files | QDir::System).size();
        };
        UnixMessagePortService service;
        auto presence = service.createPresencePort(QStringLiteral("test.presence"));
        QVERIFY(presence);
        const qsizetype before = openDescriptors();
        for (int i = 0; i < 3000; ++i) {
            service.createRemotePort(QStringLiteral("test.presence"))->invalidate();
            if (i % 200 == 0) {
                QCoreApplication::processEvents();
            }
        }
        // Every probe was let go: the last ones at the latest by the owner's periodic sweep.
        QTRY_VERIFY_WITH_TIMEOUT(openDescriptors() <= before + 1, 3000);
        const QFileInfo socket(UnixMessagePortService::socketPath(QStringLiteral("test.presence")));
        QCOMPARE(socket.permissions()
                & (QFile::ReadOther | QFile::WriteOther | QFile::ReadGroup | QFile::WriteGroup),
            QFile::Permissions());
        presence.reset();
        QVERIFY(!QFileInfo::exists(socket.filePath()));
    }

    void aSocketLeftByACrashIsReplaced()
    {
        QVERIFY(UnixMessagePortService::ensureRuntimeFolder());
        const QByteArray path
            = QFile::encodeName(UnixMessagePortService::socketPath(QStringLiteral("stale.port")));
        const int fd = ::socket(AF_UNIX, SOCK_STREAM, 0);
        sockaddr_un address {};
        address.sun_family = AF_UNIX;
        std::memcpy(address.sun_path, path.constData(), size_t(path.size()));
        QCOMPARE(::bind(fd, reinterpret_cast<sockaddr *>(&address), sizeof(address)), 0);
        ::close(fd); // the file stays, nobody listens
        UnixMessagePortService service;
        QVERIFY(!service.createRemotePort(QStringLiteral("stale.port")));
        PortHost host(service, QStringLiteral("stale.port"), true);
        QVERIFY(host.port());
        QVERIFY(service.createRemotePort(QStringLiteral("stale.port")));
    }

private:
    std::unique_ptr<Cadenza::Testing::TestEnvironment> m_environment;
};

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    MessagePortContract fake(
        QStringLiteral("fake"), [] { return std::make_shared<FakeMessagePortService>(); }, false);
    MessagePortContract unix(
        QStringLiteral("unix"), [] { return std::make_shared<UnixMessagePortService>(); }, true);
    UnixMessagePortTest unixOnly;
    return QTest::qExec(&fake, argc, argv) | QTest::qExec(&unix, argc, argv)
        | QTest::qExec(&unixOnly, argc, argv);
}

#include "tst_messageport.moc"
