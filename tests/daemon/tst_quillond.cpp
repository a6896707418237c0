// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "QuillondProcess.h"
#include "TestEnvironment.h"
#include "TestHttpServer.h"
#include "core/SpeechNames.h"
#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/formats/WaveFile.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/installation/CZSpeechInstallationManager_p.h"
#include "core/services/BundleSpeechSynthesisService.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/Services.h"
#include "core/services/UnixMessagePortService.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "core/voices/DownloadableVoice.h"
#include "protocol/InstallerProtocol.h"
#include "protocol/SecureArchiving.h"

#include <QCryptographicHash>
#include <QDBusConnection>
#include <QDir>
#include <QLocalSocket>
#include <QProcess>
#include <QRandomGenerator>
#include <QSignalSpy>
#include <QStandardPaths>
#include <QTest>

#include <csignal>

using namespace Cadenza;
using namespace Cadenza::InstallerProtocol;
using Cadenza::Testing::TestEnvironment;
using Cadenza::Testing::TestHttpServer;

namespace {

const QString BigTag = QStringLiteral("VOICEID:com.vendra.test.big.premium");
const QString SmallTag = QStringLiteral("VOICEID:com.vendra.test.small.premium");
const QString BadSumTag = QStringLiteral("VOICEID:com.vendra.test.badsum.premium");
const QString MissingTag = QStringLiteral("VOICEID:com.vendra.test.missing.premium");

QString voicesFolder()
{
    return Platform::Paths::userVoicesFolder();
}

/// Files that an installation may leave only while it runs.

} // namespace

class QuillondTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        makeRepository();
        m_http = std::make_unique<TestHttpServer>(m_environment->path(QStringLiteral("repository")));
        QVERIFY(m_http->listen());
        m_manager = std::make_unique<CZSpeechInstallationManager>();
        m_finished = std::make_unique<QSignalSpy>(
            m_manager.get(), &CZSpeechInstallationManager::installationFinished);
    }
    void cleanup()
    {
        m_daemon.reset();
        m_finished.reset();
        m_manager.reset();
        m_http.reset();
        m_environment.reset();
    }

    void installsFromTheSampleRepository()
    {
        startDaemon({QStringLiteral("--repository"),
            QUrl::fromLocalFile(QStringLiteral(CADENZA_SAMPLE_REPOSITORY)).toString()});
        QSignalSpy notifications(&Platform::Services::notifications(),
            &Platform::DistributedNotificationCenter::notificationPosted);
        const QString voice = QStringLiteral("com.vendra.speech.synthesis.voice.tobias.premium");
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())
                    ->_requestInstallation(
                        QStringLiteral("VOICEID:") + voice, QStringLiteral("Tobias"), 1, voice, 0));
        QVERIFY(waitForCompletion(InstalledCompletion));
        QVERIFY(QFile::exists(voicesFolder() + QStringLiteral("/TobiasPremium.SpeechVoice/Info.plist")));
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())->pendingLocalPortNames().isEmpty());
        if (QDBusConnection::sessionBus().isConnected()) {
            // Other tests share the session bus: only this voice's notifications count.
            auto namesForThisVoice = [&] {
                QStringList names;
                for (const auto &n : notifications) {
                    if (n.at(2).toMap().value(ObjectIDKey).toString() == voice) {
                        names.append(n.at(0).toString());
                    }
                }
                return names;
            };
            QTRY_VERIFY_WITH_TIMEOUT(namesForThisVoice().size() >= 2, 5000);
            QCOMPARE(namesForThisVoice(),
                QStringList({StartedInstallationNotification, FinishedInstallationNotification}));
        }
        QVERIFY(Testing::QuillondProcess::leftovers().isEmpty());

        // Installing again replaces the bundle in one step.
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())
                    ->_requestInstallation(
                        QStringLiteral("VOICEID:") + voice, QStringLiteral("Tobias"), 1, voice, 0));
        QVERIFY(waitForCompletion(InstalledCompletion));
        QVERIFY(QFile::exists(voicesFolder() + QStringLiteral("/TobiasPremium.SpeechVoice/Info.plist")));
        QVERIFY(Testing::QuillondProcess::leftovers().isEmpty());
    }

    void progressIsReportedWhileDownloading()
    {
        m_http->setBytesPerSecond(3 * 1024 * 1024);
        startTestDaemon();
        QVERIFY(request(BigTag));
        QVERIFY(request(SmallTag));
        QVariantMap downloading;
        QVariantMap waiting;
        QTRY_VERIFY_WITH_TIMEOUT(
            [&] {
                const QVariantList records = m_manager->activeInstallations();
                for (const QVariant &r : records) {
                    const QVariantMap record = r.toMap();
                    if (record.value(TagNameKey) == BigTag
                        && record.value(ItemSoftwareUpdateStateKey).toLongLong() == DownloadingState
                        && record.value(ItemDownloadByteCountKey).toULongLong() > 0
                        && record.value(ItemSecondsRemainingKey).toDouble() > 0) {
                        downloading = record;
                    }
                    if (record.value(TagNameKey) == SmallTag) {
                        waiting = record;
                    }
                }
                return !downloading.isEmpty();
            }(),
            10000);
        QCOMPARE(downloading.value(ItemDownloadStatusKey).toLongLong(), qint64(DownloadingStatus));
        QVERIFY(downloading.value(ItemPercentCompleteKey).toDouble() > 0);
        QVERIFY(downloading.value(ItemPercentCompleteKey).toDouble() < 100);
        QVERIFY(downloading.value(ItemDownloadStartRefTimeKey).toDouble()
            > 7e8); // after 2023, in 2001-based seconds
        QCOMPARE(downloading.value(ItemByteSizeKey).toULongLong(), m_bigSize);
        QCOMPARE(waiting.value(ItemDownloadStatusKey).toLongLong(), qint64(WaitingStatus));
        // One at a time, in request order; each request's own port is closed by its own completion.
        QCOMPARE(CZSpeechInstallationManagerPrivate::get(m_manager.get())->pendingLocalPortNames().size(), 2);
        QVERIFY(waitForCompletion(InstalledCompletion, 30000));
        QCOMPARE(m_finished->first().at(0).toString(), BigTag);
        QVERIFY(waitForCompletions(2, 10000));
        QCOMPARE(m_finished->at(1).at(0).toString(), SmallTag);
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())->pendingLocalPortNames().isEmpty());
        QVERIFY(m_manager->activeInstallations().isEmpty());
    }

    void cancellingLeavesNothingBehind()
    {
        m_http->setBytesPerSecond(1024 * 1024);
        startTestDaemon();
        QVERIFY(request(BigTag));
        QVERIFY(request(SmallTag));
        QTRY_VERIFY_WITH_TIMEOUT(isDownloading(BigTag), 10000);
        m_manager->cancelAllInstallations();
        QVERIFY(waitForCompletions(2, 10000));
        QCOMPARE(m_finished->at(0).at(1).toInt(), int(CancelledCompletion));
        QCOMPARE(m_finished->at(1).at(1).toInt(), int(CancelledCompletion));
        QVERIFY(!QFile::exists(voicesFolder() + QStringLiteral("/Big.SpeechVoice")));
        QVERIFY(!QFile::exists(voicesFolder() + QStringLiteral("/Small.SpeechVoice")));
        QTRY_VERIFY(Testing::QuillondProcess::leftovers().isEmpty());
    }

    void wrongChecksumsAndUnknownTagsFail()
    {
        startTestDaemon();
        QVERIFY(request(BadSumTag));
        QVERIFY(waitForCompletion(FailedCompletion));
        QVERIFY(m_finished->first()
                    .at(2)
                    .toMap()
                    .value(FailureReasonKey)
                    .toString()
                    .startsWith(QStringLiteral("checksum")));
        QVERIFY(!QFile::exists(voicesFolder() + QStringLiteral("/Big.SpeechVoice")));
        QVERIFY(Testing::QuillondProcess::leftovers().isEmpty());

        QVERIFY(request(QStringLiteral("VOICEID:no.such.voice")));
        QVERIFY(waitForCompletions(2));
        QCOMPARE(m_finished->at(1).at(1).toInt(), int(FailedCompletion));
        QVERIFY(m_finished->at(1)
                    .at(2)
                    .toMap()
                    .value(FailureReasonKey)
                    .toString()
                    .contains(QStringLiteral("unknown tag")));

        QVERIFY(request(MissingTag));
        QVERIFY(waitForCompletions(3));
        QCOMPARE(m_finished->at(2).at(1).toInt(), int(FailedCompletion));
        QVERIFY(m_finished->at(2)
                    .at(2)
                    .toMap()
                    .value(FailureReasonKey)
                    .toString()
                    .startsWith(QStringLiteral("network")));
    }

    void droppedConnectionsAreResumed()
    {
        m_http->dropNextTransferAfter(1024 * 1024 + 17);
        startTestDaemon();
        QVERIFY(request(BigTag));
        QVERIFY(waitForCompletion(InstalledCompletion, 30000));
        QVERIFY(m_http->rangeRequestCount() >= 1);
        QVERIFY(QFile::exists(voicesFolder() + QStringLiteral("/Big.SpeechVoice/Resources/data.bin")));
        QCOMPARE(QFileInfo(voicesFolder() + QStringLiteral("/Big.SpeechVoice/Resources/data.bin")).size(),
            m_payloadSize);
    }

    /// The upgrade of Orin carries a real flite voice of megabytes: it downloads over HTTP, survives a
    /// dropped connection by resuming, installs, and then speaks as the flite voice.
    void premiumFliteVoiceInstallsOverHttpResumesAndSpeaks()
    {
        TestHttpServer server(QStringLiteral(CADENZA_SAMPLE_REPOSITORY));
        QVERIFY(server.listen());
        server.dropNextTransferAfter(1024 * 1024 + 17);
        startDaemon({QStringLiteral("--repository"), server.baseUrl().toString()});
        const QString voice = Cadenza::SpeechNames::OrinIdentifier;
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())
                    ->_requestInstallation(
                        QStringLiteral("VOICEID:") + voice, QStringLiteral("Orin"), 1, voice, 0));
        QVERIFY(waitForCompletion(InstalledCompletion, 30000));
        QVERIFY(server.rangeRequestCount() >= 1);
        const QString voiceFile
            = voicesFolder() + QStringLiteral("/Orin.SpeechVoice/Resources/cmu_us_rms.flitevox");
        QVERIFY(QFileInfo(voiceFile).size() > 2 * 1024 * 1024);

        Platform::BundleSpeechSynthesisService service;
        const auto installed = service.voice(voice);
        QVERIFY(installed);
        QCOMPARE(installed->engineName, QStringLiteral("flite"));
        const QString wav = m_environment->path(QStringLiteral("orin.wav"));
        QString error;
        QVERIFY2(service.renderToFile({QStringLiteral("Hello, my name is Orin."), voice}, wav, &error),
            qPrintable(error));
        const auto audio = Platform::WaveFile::read(wav, &error);
        QVERIFY2(audio, qPrintable(error));
        QCOMPARE(audio->sampleRate, 16000);
        QVERIFY(audio->rootMeanSquare() > 1000.0);
    }

    void aKilledDaemonLeavesNoHalfBundle()
    {
        m_http->setBytesPerSecond(1024 * 1024);
        startTestDaemon();
        QVERIFY(request(BigTag));
        QTRY_VERIFY_WITH_TIMEOUT(isDownloading(BigTag), 10000);
        m_daemon->kill();
        QVERIFY(!QFile::exists(voicesFolder() + QStringLiteral("/Big.SpeechVoice")));

        // The client notices at once and answers with empty lists.
        QElapsedTimer clock;
        clock.start();
        QVERIFY(m_manager->activeInstallations().isEmpty());
        m_manager->cancelAllInstallations();
        QVERIFY(clock.elapsed() < 3000);

        // The next daemon clears what the killed one left, and the client finds it again.
        m_http->setBytesPerSecond(0);
        startTestDaemon();
        QVERIFY(Testing::QuillondProcess::leftovers().isEmpty());
        QVERIFY(request(SmallTag));
        QVERIFY(waitForCompletion(InstalledCompletion));
        QCOMPARE(m_finished->last().at(0).toString(), SmallTag);
    }

    void downloadableVoicesFollowAnInstallation()
    {
        SpeechItemPrivate::setInstallationDictionary(QVariantMap {{QStringLiteral("DownloadableVoices"),
            QVariantMap {{QStringLiteral("com.vendra.test.big.premium"),
                QVariantMap {{QStringLiteral("VoiceAttributes"),
                                 QVariantMap {{QStringLiteral("VoiceName"), QStringLiteral("Big Premium")}}},
                    {QStringLiteral("VoiceTag"), BigTag},
                    {QStringLiteral("VoiceByteSize"), qint64(m_bigSize)}}}}}});
        m_http->setBytesPerSecond(2 * 1024 * 1024);
        startTestDaemon();
        auto status = [this]() -> qint64 {
            for (const auto &voice : m_manager->downloadableVoices()) {
                if (voice->identifier() == u"com.vendra.test.big.premium") {
                    return voice->downloadStatus();
                }
            }
            return -1; // not listed: installed
        };
        QCOMPARE(status(), qint64(NotInstalledStatus));
        // A request waiting behind another shows 4, the running one 3, and an installed voice is gone.
        QVERIFY(request(SmallTag));
        const auto voices = m_manager->downloadableVoices();
        QVERIFY(m_manager->startInstallingDownloadableVoices(voices, true, 0));
        QTRY_VERIFY_WITH_TIMEOUT(status() == WaitingStatus || status() == DownloadingStatus, 10000);
        QTRY_COMPARE_WITH_TIMEOUT(status(), qint64(DownloadingStatus), 10000);
        QVERIFY(waitForCompletions(2, 30000));
        QTRY_COMPARE_WITH_TIMEOUT(status(), qint64(-1), 5000);
        SpeechItemPrivate::setInstallationDictionary(std::nullopt);
    }

    void hostileClientsDoNotStopTheDaemon()
    {
        startTestDaemon();
        QLocalSocket flood;
        flood.connectToServer(Platform::UnixMessagePortService::socketPath(ServicePortName));
        QVERIFY(flood.waitForConnected(2000));
        QByteArray header(12, '\0');
        header[11] = '\x7f';
        header[8] = '\x7f'; // a payload of about two gigabytes
        flood.write(header);
        flood.write(QByteArray(4096, 'x'));
        QVERIFY(flood.waitForBytesWritten(2000));
        QTRY_COMPARE_WITH_TIMEOUT(flood.state(), QLocalSocket::UnconnectedState, 5000);

        QLocalSocket garbage;
        garbage.connectToServer(Platform::UnixMessagePortService::socketPath(ServicePortName));
        QVERIFY(garbage.waitForConnected(2000));
        // A well-formed frame whose payload does not decode, then one with a port that is no port.
        garbage.write(QByteArray::fromHex("00000001000000000000000a") + QByteArray(10, '\xff'));
        QVERIFY(garbage.waitForBytesWritten(2000));

        QVERIFY(m_manager->activeInstallations().isEmpty());
        QVERIFY(request(SmallTag));
        QVERIFY(waitForCompletion(InstalledCompletion));
    }

    void anOutageIsWaitedOut()
    {
        // The server goes down at 40 % and is back a second later: the download waits, resumes from
        // the bytes it has, and the voice is installed.
        m_http->setBytesPerSecond(2 * 1024 * 1024);
        startDaemon({QStringLiteral("--catalogue"), m_catalogue, QStringLiteral("--repository"),
            m_http->baseUrl().toString(), QStringLiteral("--retry-window"), QStringLiteral("20")});
        QVERIFY(request(BigTag));
        QVERIFY(QTest::qWaitFor([&] { return downloadedBytes(BigTag) >= m_bigSize * 4 / 10; }, 20000));
        const int rangesBefore = m_http->rangeRequestCount();
        m_http->close();
        QTest::qWait(1000);
        QVERIFY(m_http->listen());
        QVERIFY(waitForCompletion(InstalledCompletion, 40000));
        QVERIFY(m_http->rangeRequestCount() > rangesBefore); // resumed, not fetched again from the start
        QCOMPARE(QFileInfo(voicesFolder() + QStringLiteral("/Big.SpeechVoice/Resources/data.bin")).size(),
            m_payloadSize);
        QVERIFY(Testing::QuillondProcess::leftovers().isEmpty());
    }

    void anotherRepositoryServesWhenOneIsDown()
    {
        TestHttpServer second(m_environment->path(QStringLiteral("repository")));
        QVERIFY(second.listen());
        const QUrl down = m_http->baseUrl();
        m_http->close();
        startDaemon({QStringLiteral("--catalogue"), m_catalogue, QStringLiteral("--repository"),
            down.toString(), QStringLiteral("--repository"), second.baseUrl().toString()});
        QVERIFY(request(SmallTag));
        QVERIFY(waitForCompletion(InstalledCompletion, 20000));
        QVERIFY(second.requestCount() >= 1);
    }

    void aLongOutageFailsWithAReadableReason()
    {
        m_http->close();
        startDaemon({QStringLiteral("--catalogue"), m_catalogue, QStringLiteral("--repository"),
            m_http->baseUrl().toString(), QStringLiteral("--retry-window"), QStringLiteral("3")});
        QElapsedTimer clock;
        clock.start();
        QVERIFY(request(SmallTag));
        QVERIFY(waitForCompletion(FailedCompletion, 20000));
        QVERIFY2(clock.elapsed() >= 2500, "the window was not waited out");
        const QString reason = m_finished->last().at(2).toMap().value(FailureReasonKey).toString();
        QVERIFY2(reason.startsWith(QStringLiteral("network: no source answered for")), qPrintable(reason));
        QVERIFY(Testing::QuillondProcess::leftovers().isEmpty());
    }

    void everyMalformedRequestIsAnswered_data()
    {
        QTest::addColumn<QVariantMap>("changes");
        QTest::addColumn<QString>("named");
        QTest::newRow("tag too long") << QVariantMap {{TagNameKey, QString(1025, QLatin1Char('x'))}}
                                      << QStringLiteral("QLNDTagName is longer than 1024");
        QTest::newRow("empty tag") << QVariantMap {{TagNameKey, QString()}}
                                   << QStringLiteral("QLNDTagName is empty");
        QTest::newRow("tag not a string")
            << QVariantMap {{TagNameKey, qint64(7)}} << QStringLiteral("QLNDTagName is not a string");
        QTest::newRow("nested mode") << QVariantMap {{UserInteractionModeKey, nested(30)}}
                                     << QStringLiteral("QLNDUserInteractionMode is not an integer");
        QTest::newRow("size a string") << QVariantMap {{ItemByteSizeKey, QStringLiteral("big")}}
                                       << QStringLiteral("QLNDItemByteSize is not an integer");
        QTest::newRow("object a list") << QVariantMap {{ObjectIDKey, QVariantList {1, 2}}}
                                       << QStringLiteral("QLNDObjectID is not a string");
    }
    void everyMalformedRequestIsAnswered()
    {
        QFETCH(QVariantMap, changes);
        QFETCH(QString, named);
        startTestDaemon();
        // A job that runs meanwhile stays visible to every client.
        m_http->setBytesPerSecond(256 * 1024);
        QVERIFY(request(BigTag));
        QVERIFY(QTest::qWaitFor([&] { return downloadedBytes(BigTag) > 0; }, 10000));

        Platform::LocalMessagePort *port
            = CZSpeechInstallationManagerPrivate::get(m_manager.get())->_createLocalPort();
        QVERIFY(port);
        QVariantMap record {{TagNameKey, SmallTag}, {ItemNameKey, QStringLiteral("Small")},
            {ItemByteSizeKey, qint64(1)}, {ClientPortNameKey, port->name()},
            {ClientProcessIDKey, qint64(QCoreApplication::applicationPid())},
            {ObjectIDKey, QStringLiteral("com.vendra.test.small.premium")},
            {UserInteractionModeKey, qint64(0)}, {ItemDownloadStatusKey, qint64(WaitingStatus)}};
        for (auto it = changes.cbegin(); it != changes.cend(); ++it) {
            record.insert(it.key(), it.value());
        }
        const QByteArray archived = CZEncodeSecureObject(record);
        QVERIFY(!archived.isEmpty());
        (void)CZSpeechInstallationManagerPrivate::get(m_manager.get())
            ->_sendMessage(StartInstallingMessage, archived, false);
        QVERIFY2(waitForCompletion(FailedCompletion), "the malformed request got no answer");
        const QString reason = m_finished->last().at(2).toMap().value(FailureReasonKey).toString();
        QVERIFY2(reason.contains(named), qPrintable(reason));
        QVERIFY(isDownloading(BigTag));
        QCOMPARE(m_manager->activeInstallations().size(), 1);
    }

    void aSocketActivatedDaemonIsReachedAndItsSocketKept()
    {
        const QString activator = QStandardPaths::findExecutable(QStringLiteral("systemd-socket-activate"));
        if (activator.isEmpty()) {
            QFAIL("systemd-socket-activate is missing (Debian package systemd)");
        }
        QVERIFY(Platform::UnixMessagePortService::ensureRuntimeFolder());
        const QString socket = Platform::UnixMessagePortService::socketPath(ServicePortName);
        QProcess manager;
        manager.setProcessChannelMode(QProcess::ForwardedChannels);
        // The activator passes on only the variables it is told to.
        QStringList arguments {QStringLiteral("-l"), socket};
        for (const char *name : {"HOME", "XDG_RUNTIME_DIR", "XDG_DATA_HOME", "XDG_CACHE_HOME",
                 "XDG_CONFIG_HOME", "CADENZA_ROOT", "DBUS_SESSION_BUS_ADDRESS"}) {
            arguments << QStringLiteral("-E") << QString::fromLatin1(name);
        }
        manager.start(activator,
            arguments
                + QStringList {QStringLiteral(QUILLOND_PATH), QStringLiteral("--idle-exit"),
                    QStringLiteral("2"), QStringLiteral("--catalogue"), m_catalogue,
                    QStringLiteral("--repository"), m_http->baseUrl().toString()});
        QVERIFY(manager.waitForStarted(5000));
        QVERIFY(QTest::qWaitFor([&] { return QFileInfo::exists(socket); }, 5000));
        // The service manager holds the request port; the daemon itself is not there yet.
        QVERIFY(!CZSpeechInstallationManagerPrivate::get(m_manager.get())->_serverIsRunning());
        QVERIFY(CZSpeechInstallationManagerPrivate::get(m_manager.get())->_serverIsReachable());
        QVERIFY(request(SmallTag));
        QVERIFY(waitForCompletion(InstalledCompletion, 20000));
        // After its idle time it exits, and leaves the socket it was given where it was.
        QVERIFY(manager.waitForFinished(15000));
        QCOMPARE(manager.exitCode(), 0);
        QVERIFY(QFileInfo::exists(socket));
        QVERIFY(!CZSpeechInstallationManagerPrivate::get(m_manager.get())->_serverIsRunning());
    }

private:
    void makeRepository()
    {
        const QString repository = m_environment->path(QStringLiteral("repository"));
        const QString sources = m_environment->path(QStringLiteral("sources"));
        QDir().mkpath(repository);
        auto bundle = [&](const QString &name, const QString &identifier, qint64 payload) {
            const QString folder = TestEnvironment::writeVoiceBundle(
                sources, name, TestEnvironment::voiceAttributes(identifier, name, QStringLiteral("en_US")));
            QFile data(folder + QStringLiteral("/Resources/data.bin"));
            QVERIFY(data.open(QIODevice::WriteOnly));
            QByteArray bytes(payload, Qt::Uninitialized);
            QRandomGenerator(7).fillRange(reinterpret_cast<quint32 *>(bytes.data()), bytes.size() / 4);
            data.write(bytes);
            data.close();
            QProcess tar;
            tar.start(QStringLiteral("tar"),
                {QStringLiteral("-C"), sources, QStringLiteral("-czf"),
                    repository + QLatin1Char('/') + name + QStringLiteral(".SpeechVoice.tar.gz"),
                    name + QStringLiteral(".SpeechVoice")});
            QVERIFY(tar.waitForFinished(30000));
            QCOMPARE(tar.exitCode(), 0);
        };
        m_payloadSize = 6 * 1024 * 1024;
        bundle(QStringLiteral("Big"), QStringLiteral("com.vendra.test.big.premium"), m_payloadSize);
        bundle(QStringLiteral("Small"), QStringLiteral("com.vendra.test.small.premium"), 4096);
        auto describe = [&](const QString &name, bool correctSum, const QString &path) {
            QFile archive(repository + QLatin1Char('/') + name + QStringLiteral(".SpeechVoice.tar.gz"));
            if (!archive.open(QIODevice::ReadOnly)) {
                qFatal("no archive");
            }
            QCryptographicHash hash(QCryptographicHash::Sha256);
            hash.addData(&archive);
            QByteArray sum = hash.result().toHex();
            if (!correctSum) {
                sum[0] = sum[0] == '0' ? '1' : '0';
            }
            if (name == u"Big") {
                m_bigSize = quint64(archive.size());
            }
            return QVariantMap {{QStringLiteral("Path"), path},
                {QStringLiteral("SHA256"), QString::fromLatin1(sum)},
                {QStringLiteral("ByteSize"), qint64(archive.size())},
                {QStringLiteral("Kind"), QStringLiteral("voice")},
                {QStringLiteral("BundleName"), QString(name + QStringLiteral(".SpeechVoice"))},
                {QStringLiteral("ObjectID"),
                    QStringLiteral("com.vendra.test.%1.premium").arg(name.toLower())}};
        };
        const QVariantMap packages = {
            {BigTag, describe(QStringLiteral("Big"), true, QStringLiteral("Big.SpeechVoice.tar.gz"))},
            {SmallTag, describe(QStringLiteral("Small"), true, QStringLiteral("Small.SpeechVoice.tar.gz"))},
            {BadSumTag, describe(QStringLiteral("Big"), false, QStringLiteral("Big.SpeechVoice.tar.gz"))},
            {MissingTag, describe(QStringLiteral("Small"), true, QStringLiteral("Gone.SpeechVoice.tar.gz"))}};
        m_catalogue = m_environment->path(QStringLiteral("catalogue.plist"));
        QFile file(m_catalogue);
        QVERIFY(file.open(QIODevice::WriteOnly));
        file.write(Platform::PropertyList::serialize(QVariantMap {{QStringLiteral("Packages"), packages}}));
    }

    void startDaemon(const QStringList &arguments)
    {
        m_daemon = std::make_unique<Testing::QuillondProcess>();
        QVERIFY2(m_daemon->start(arguments), "quillond did not start");
    }
    void startTestDaemon()
    {
        startDaemon({QStringLiteral("--catalogue"), m_catalogue, QStringLiteral("--repository"),
            m_http->baseUrl().toString()});
    }

    bool request(const QString &tag)
    {
        return CZSpeechInstallationManagerPrivate::get(m_manager.get())
            ->_requestInstallation(tag, tag.section(QLatin1Char('.'), -2, -2), 1, tag.mid(8), 0);
    }
    static QVariant nested(int depth)
    {
        QVariant value = qint64(1);
        for (int i = 0; i < depth; ++i) {
            value = QVariantMap {{QStringLiteral("k"), value}};
        }
        return value;
    }
    quint64 downloadedBytes(const QString &tag)
    {
        for (const QVariant &r : m_manager->activeInstallations()) {
            if (r.toMap().value(TagNameKey) == tag) {
                return r.toMap().value(ItemDownloadByteCountKey).toULongLong();
            }
        }
        return 0;
    }
    bool isDownloading(const QString &tag)
    {
        for (const QVariant &r : m_manager->activeInstallations()) {
            const QVariantMap record = r.toMap();
            if (record.value(TagNameKey) == tag && record.value(ItemDownloadByteCountKey).toULongLong() > 0) {
                return true;
            }
        }
        return false;
    }
    bool waitForCompletions(int count, int timeout = 10000)
    {
        QElapsedTimer clock;
        clock.start();
        while (m_finished->size() < count && clock.elapsed() < timeout) {
            m_finished->wait(qMax<int>(1, int(timeout - clock.elapsed())));
        }
        return m_finished->size() >= count;
    }
    bool waitForCompletion(qint32 expected, int timeout = 10000)
    {
        const int before = int(m_finished->size());
        if (!waitForCompletions(before + 1, timeout)) {
            return false;
        }
        const qint32 message = m_finished->at(before).at(1).toInt();
        if (message != expected) {
            qWarning("completion %d, expected %d: %s", message, expected,
                qPrintable(m_finished->at(before).at(2).toMap().value(FailureReasonKey).toString()));
        }
        return message == expected;
    }

    std::unique_ptr<TestEnvironment> m_environment;
    std::unique_ptr<TestHttpServer> m_http;
    std::unique_ptr<Testing::QuillondProcess> m_daemon;
    std::unique_ptr<CZSpeechInstallationManager> m_manager;
    std::unique_ptr<QSignalSpy> m_finished;
    QString m_catalogue;
    qint64 m_payloadSize = 0;
    quint64 m_bigSize = 0;
};

QTEST_GUILESS_MAIN(QuillondTest)
#include "tst_quillond.moc"
