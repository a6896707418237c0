// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "InProcessNotificationCenter.h"
#include "core/SpeechNames.h"
#include "core/services/DBusNotificationCenter.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QProcess>
#include <QSignalSpy>
#include <QTest>

using namespace Cadenza::Platform;

/// The contract of every notification center: what this process posts, it hears, later.
class NotificationCenterContract : public QObject
{
    Q_OBJECT
public:
    NotificationCenterContract(
        const QString &name, std::function<std::unique_ptr<DistributedNotificationCenter>()> make)
        : m_make(std::move(make))
    {
        setObjectName(name);
    }

private Q_SLOTS:
    void postsReachThisProcessFromTheEventLoop()
    {
        auto center = m_make();
        QSignalSpy spy(center.get(), &DistributedNotificationCenter::notificationPosted);
        const QVariantMap info {
            {QStringLiteral("QLNDObjectID"), QStringLiteral("com.vendra.x")}, {QStringLiteral("n"), 3}};
        center->postNotification(
            Cadenza::SpeechNames::DefaultVoiceChangedNotification, QStringLiteral("object"), info);
        QCOMPARE(spy.size(), 0); // never inside the post
        QVERIFY(spy.wait(2000));
        QCOMPARE(spy.first().at(0).toString(), Cadenza::SpeechNames::DefaultVoiceChangedNotification);
        QCOMPARE(spy.first().at(1).toString(), QStringLiteral("object"));
        QCOMPARE(spy.first().at(2).toMap(), info);
        QTest::qWait(200);
        QCOMPARE(spy.size(), 1); // and exactly once
    }

private:
    std::function<std::unique_ptr<DistributedNotificationCenter>()> m_make;
};

/// Across processes, through the session bus.
class DBusNotificationCenterTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase()
    {
        if (!QDBusConnection::sessionBus().isConnected()) {
            QSKIP("no session bus (the suite runs under dbus-run-session)");
        }
    }

    void anotherProcessIsHeard()
    {
        DBusNotificationCenter center;
        QVERIFY(center.isConnectedToSessionBus());
        QSignalSpy spy(&center, &DistributedNotificationCenter::notificationPosted);
        QProcess poster;
        poster.start(QStringLiteral(CADENZA_CLI_PATH),
            {QStringLiteral("post"),
                QStringLiteral("com.vendra.speech.quillond.finishedInstallationNofication"),
                QStringLiteral("--info"),
                QStringLiteral("QLNDObjectID=com.vendra.speech.synthesis.voice.x")});
        QVERIFY(poster.waitForFinished(10000));
        QCOMPARE(poster.exitCode(), 0);
        QTRY_COMPARE_WITH_TIMEOUT(spy.size(), 1, 5000);
        QCOMPARE(spy.first().at(0).toString(),
            QStringLiteral("com.vendra.speech.quillond.finishedInstallationNofication"));
        QCOMPARE(spy.first().at(2).toMap().value(QStringLiteral("QLNDObjectID")).toString(),
            QStringLiteral("com.vendra.speech.synthesis.voice.x"));
    }

    void malformedSignalsAreIgnored()
    {
        DBusNotificationCenter center;
        QSignalSpy spy(&center, &DistributedNotificationCenter::notificationPosted);
        // Sent from a second connection, as another process would.
        QDBusConnection other
            = QDBusConnection::connectToBus(QDBusConnection::SessionBus, QStringLiteral("other"));
        QDBusMessage wrongTypes = QDBusMessage::createSignal(
            DBusNotificationCenter::ObjectPath, DBusNotificationCenter::Interface, QStringLiteral("Posted"));
        wrongTypes << 42 << QStringLiteral("x");
        QDBusMessage badArchive = QDBusMessage::createSignal(
            DBusNotificationCenter::ObjectPath, DBusNotificationCenter::Interface, QStringLiteral("Posted"));
        badArchive << QStringLiteral("name") << QString() << QByteArray("\xff\xfe garbage");
        QTest::ignoreMessage(
            QtWarningMsg, QRegularExpression(QStringLiteral("Ignoring a malformed notification")));
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Ignoring notification name")));
        QVERIFY(other.send(wrongTypes));
        QVERIFY(other.send(badArchive));
        QDBusMessage good = QDBusMessage::createSignal(
            DBusNotificationCenter::ObjectPath, DBusNotificationCenter::Interface, QStringLiteral("Posted"));
        good << QStringLiteral("after") << QString() << QByteArray();
        QVERIFY(other.send(good));
        QTRY_COMPARE_WITH_TIMEOUT(spy.size(), 1, 5000);
        QCOMPARE(spy.first().at(0).toString(), QStringLiteral("after"));
        QDBusConnection::disconnectFromBus(QStringLiteral("other"));
    }
};

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    NotificationCenterContract inProcess(
        QStringLiteral("in-process"), [] { return std::make_unique<InProcessNotificationCenter>(); });
    NotificationCenterContract dbus(
        QStringLiteral("dbus"), [] { return std::make_unique<DBusNotificationCenter>(); });
    DBusNotificationCenterTest dbusOnly;
    return QTest::qExec(&inProcess, argc, argv) | QTest::qExec(&dbus, argc, argv)
        | QTest::qExec(&dbusOnly, argc, argv);
}

#include "tst_notificationcenter.moc"
