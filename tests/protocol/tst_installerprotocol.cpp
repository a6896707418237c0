// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeInstallerDaemon.h"
#include "TestEnvironment.h"

#include "FakeMessagePortService.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/installation/CZSpeechInstallationManager_p.h"
#include "core/services/Services.h"
#include "protocol/InstallerProtocol.h"
#include "protocol/KeyedArchive.h"
#include "protocol/SecureArchiving.h"

#include <QRegularExpression>
#include <QSignalSpy>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::InstallerProtocol;
using Platform::FakeMessagePortService;

namespace {

class RecordingDelegate : public CZSpeechInstallationManagerDelegate
{
public:
    void speechItemTags(const QStringList &tags, qint32 message) override { calls.append({tags, message}); }
    QList<std::pair<QStringList, qint32>> calls;
};

} // namespace

class InstallerProtocolTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<Testing::TestEnvironment>();
        m_ports = std::make_shared<FakeMessagePortService>();
        Platform::Services::setMessagePorts(m_ports);
        m_manager = std::make_unique<CZSpeechInstallationManager>();
        m_delegate = std::make_shared<RecordingDelegate>();
        m_manager->setDelegate(m_delegate);
    }
    void cleanup()
    {
        m_manager.reset();
        m_environment.reset();
    }

    void archivesRoundTripAndRefuseTheWrongShape()
    {
        const QVariantMap record {{TagNameKey, QStringLiteral("VOICEID:x")}};
        QCOMPARE(CZDecodeSecureDictionary(CZEncodeSecureObject(record)).value_or(QVariantMap()), record);
        QCOMPARE(
            CZDecodeSecureArray(CZEncodeSecureObject(QVariantList {record})).value_or(QVariantList()).size(),
            1);
        // An array where a dictionary belongs is refused with the decoder's words in the log.
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("'array' is not allowed")));
        QVERIFY(!CZDecodeSecureDictionary(CZEncodeSecureObject(QVariantList {1})));
        // A dictionary where an array belongs decodes, and is not an array.
        QVERIFY(!CZDecodeSecureArray(CZEncodeSecureObject(record)));
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("cannot archive")));
        QVERIFY(CZEncodeSecureObject(QVariant::fromValue(QPoint())).isNull());
    }

    void withoutADaemonNothingIsSent()
    {
        QVERIFY(!CZSpeechInstallationManagerPrivate::get(m_manager.get())->_serverIsRunning());
        QVERIFY(m_manager->activeInstallations().isEmpty());
        m_manager->showProgressWindow();
        m_manager->cancelAllInstallations();
        QVERIFY(m_ports->sentMessages().isEmpty());
    }

    void aRequestCarriesEightEntriesAndItsOwnPort()
    {
        Testing::FakeInstallerDaemon daemon(*m_ports);
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())
                    ->_requestInstallation(QStringLiteral("VOICEID:v.premium"), QStringLiteral("V"), 1234,
                        QStringLiteral("v.premium"), 1));
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())
                    ->_requestInstallation(QStringLiteral("VOICEID:w.premium"), QStringLiteral("W"), 99,
                        QStringLiteral("w.premium"), 1));
        QCOMPARE(daemon.messages().size(), 2);
        const QVariantMap first
            = CZDecodeSecureDictionary(daemon.messages().at(0).second).value_or(QVariantMap());
        const QVariantMap second
            = CZDecodeSecureDictionary(daemon.messages().at(1).second).value_or(QVariantMap());
        QCOMPARE(daemon.messages().at(0).first, qint32(StartInstallingMessage));
        QCOMPARE(first.size(), 8);
        QCOMPARE(first.value(ItemDownloadStatusKey).toLongLong(), qint64(WaitingStatus));
        QCOMPARE(first.value(ItemByteSizeKey).toULongLong(), 1234u);
        QCOMPARE(first.value(ClientProcessIDKey).toLongLong(), QCoreApplication::applicationPid());
        static const QRegularExpression name(QStringLiteral("^com\\.vendra\\.speech\\.quillond-(\\d+)$"));
        const auto match = name.match(first.value(ClientPortNameKey).toString());
        QVERIFY(match.hasMatch());
        QVERIFY(match.captured(1).toInt() <= 65535);
        QVERIFY(first.value(ClientPortNameKey) != second.value(ClientPortNameKey));
        QCOMPARE(CZSpeechInstallationManagerPrivate::get(m_manager.get())->pendingLocalPortNames().size(), 2);

        // Each completion closes its own port and reaches the delegate with its tag.
        const QString firstPort = first.value(ClientPortNameKey).toString();
        QVERIFY(m_ports->deliver(firstPort, InstalledCompletion,
            CZEncodeSecureObject(QVariantMap {{TagNameKey, first.value(TagNameKey)}})));
        QCOMPARE(m_delegate->calls.size(), 1);
        QCOMPARE(m_delegate->calls.first().first, QStringList {QStringLiteral("VOICEID:v.premium")});
        QCOMPARE(m_delegate->calls.first().second, qint32(InstalledCompletion));
        QCOMPARE(CZSpeechInstallationManagerPrivate::get(m_manager.get())->pendingLocalPortNames(),
            QStringList {second.value(ClientPortNameKey).toString()});
        QVERIFY(!m_ports->localPortNames().contains(firstPort));
    }

    void incompleteItemsAreSkipped()
    {
        Testing::FakeInstallerDaemon daemon(*m_ports);
        QVERIFY(!CZSpeechInstallationManagerPrivate::get(m_manager.get())
                     ->_requestInstallation(QString(), QStringLiteral("V"), 1, QStringLiteral("v"), 0));
        QVERIFY(
            !CZSpeechInstallationManagerPrivate::get(m_manager.get())
                 ->_requestInstallation(QStringLiteral("VOICEID:v"), QString(), 1, QStringLiteral("v"), 0));
        QVERIFY(
            !CZSpeechInstallationManagerPrivate::get(m_manager.get())
                 ->_requestInstallation(QStringLiteral("VOICEID:v"), QStringLiteral("V"), 1, QString(), 0));
        QVERIFY(daemon.messages().isEmpty());
    }

    void otherCompletionIdsLeaveThePortOpen()
    {
        Testing::FakeInstallerDaemon daemon(*m_ports);
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())
                    ->_requestInstallation(QStringLiteral("SRCLANGID:de_DE"), QStringLiteral("German"), 1,
                        QStringLiteral("de_DE"), 0));
        const QString port
            = CZSpeechInstallationManagerPrivate::get(m_manager.get())->pendingLocalPortNames().value(0);
        const QByteArray answer
            = CZEncodeSecureObject(QVariantMap {{TagNameKey, QStringLiteral("SRCLANGID:de_DE")}});
        QVERIFY(m_ports->deliver(port, 0, answer));
        QVERIFY(m_ports->deliver(port, 4, answer));
        QTest::ignoreMessage(QtWarningMsg,
            QRegularExpression(QStringLiteral(
                "^Quillond returned nil data to port com\\.vendra\\.speech\\.quillond-\\d+$")));
        QVERIFY(m_ports->deliver(port, 1, QByteArray()));
        QVERIFY(m_delegate->calls.isEmpty());
        QCOMPARE(CZSpeechInstallationManagerPrivate::get(m_manager.get())->pendingLocalPortNames(),
            QStringList {port});
        QVERIFY(m_ports->deliver(port, FailedCompletion, answer));
        QCOMPARE(m_delegate->calls.size(), 1);
        QCOMPARE(m_delegate->calls.first().second, qint32(FailedCompletion));
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())->pendingLocalPortNames().isEmpty());
    }

    void activeInstallationsDecodeOnlyArrays()
    {
        Testing::FakeInstallerDaemon daemon(*m_ports);
        const QVariantMap record {{TagNameKey, QStringLiteral("VOICEID:x")}, {ItemPercentCompleteKey, 12.5}};
        daemon.setActiveRecords({record, record});
        QCOMPARE(m_manager->activeInstallations().size(), 2);
        QCOMPARE(daemon.messages().last().first, qint32(ActiveInstallationsMessage));
        QCOMPARE(CZDecodeSecureDictionary(daemon.messages().last().second).value_or(QVariantMap()).keys(),
            QStringList {ClientProcessIDKey});
        daemon.setAnswer(CZEncodeSecureObject(record)); // a dictionary, not an array
        QVERIFY(m_manager->activeInstallations().isEmpty());
        daemon.setAnswer(std::nullopt);
        QTest::ignoreMessage(QtWarningMsg, "client got NULL return data");
        QVERIFY(m_manager->activeInstallations().isEmpty());
    }

    void oneBadRecordDoesNotHideTheOthers()
    {
        Testing::FakeInstallerDaemon daemon(*m_ports);
        const QVariantMap good {{TagNameKey, QStringLiteral("VOICEID:good")}, {ItemPercentCompleteKey, 40.0}};
        QVariant deep = qint64(1);
        for (int i = 0; i < 40; ++i) {
            deep = QVariantMap {{QStringLiteral("k"), deep}};
        }
        const QVariantMap bad {{TagNameKey, QStringLiteral("VOICEID:bad")}, {UserInteractionModeKey, deep}};
        daemon.setAnswer(Platform::KeyedArchive::encodeArray({*Platform::KeyedArchive::encodeItem(bad),
            *Platform::KeyedArchive::encodeItem(good), *Platform::KeyedArchive::encodeItem(good)}));
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("nested deeper")));
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Left out 1 records")));
        const QVariantList records = m_manager->activeInstallations();
        QCOMPARE(records.size(), 2);
        QCOMPARE(records.first().toMap(), good);
        // A damaged archive still gives nothing rather than a guess.
        QByteArray cut = Platform::KeyedArchive::encodeArray(
            {*Platform::KeyedArchive::encodeItem(good), *Platform::KeyedArchive::encodeItem(good)});
        cut.chop(5);
        daemon.setAnswer(cut);
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral(".")));
        QVERIFY(m_manager->activeInstallations().isEmpty());
    }

    void aRequestNobodyReceivesIsReported()
    {
        QSignalSpy failed(m_manager.get(), &CZSpeechInstallationManager::installationRequestFailed);
        QVERIFY(!CZSpeechInstallationManagerPrivate::get(m_manager.get())
                     ->_requestInstallation(QStringLiteral("VOICEID:v.premium"), QStringLiteral("V"), 1,
                         QStringLiteral("v.premium"), 0));
        QCOMPARE(failed.size(), 1);
        QCOMPARE(failed.first().at(0).toString(), QStringLiteral("VOICEID:v.premium"));
        QCOMPARE(failed.first().at(1).toString(), QStringLiteral("V"));
        QCOMPARE(failed.first().at(2).toLongLong(), 0);
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())
                    ->pendingLocalPortNames()
                    .isEmpty()); // nobody would ever answer it

        Testing::FakeInstallerDaemon daemon(*m_ports);
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())
                    ->_requestInstallation(QStringLiteral("VOICEID:v.premium"), QStringLiteral("V"), 1,
                        QStringLiteral("v.premium"), 0));
        QCOMPARE(failed.size(), 1);
    }

    void failedSendsAreLogged()
    {
        Testing::FakeInstallerDaemon daemon(*m_ports);
        m_ports->setSendStatus(Platform::MessagePortStatus::SendTimeout);
        QTest::ignoreMessage(QtWarningMsg, "failed to send request 2: -1");
        m_manager->cancelAllInstallations();
        QTest::ignoreMessage(QtWarningMsg, "failed to send request 3: -1");
        QVERIFY(m_manager->activeInstallations().isEmpty());
    }

    void aRestartedDaemonIsFoundAgain()
    {
        auto daemon = std::make_unique<Testing::FakeInstallerDaemon>(*m_ports);
        daemon->setActiveRecords({});
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())->_createServerPortIfNeeded());
        daemon.reset();
        QVERIFY(!CZSpeechInstallationManagerPrivate::get(m_manager.get())->_createServerPortIfNeeded());
        daemon = std::make_unique<Testing::FakeInstallerDaemon>(*m_ports);
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())->_createServerPortIfNeeded());
        m_manager->cancelAllInstallations();
        QCOMPARE(daemon->messages().size(), 1);
        QCOMPARE(daemon->messages().first().first, qint32(CancelAllMessage));
    }

private:
    std::unique_ptr<Testing::TestEnvironment> m_environment;
    std::shared_ptr<FakeMessagePortService> m_ports;
    std::unique_ptr<CZSpeechInstallationManager> m_manager;
    std::shared_ptr<RecordingDelegate> m_delegate;
};

QTEST_GUILESS_MAIN(InstallerProtocolTest)
#include "tst_installerprotocol.moc"
