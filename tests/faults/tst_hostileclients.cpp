// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Hostile clients against the real daemon: 100 idle connections, a client that never reads its
// replies, garbage bytes and an oversized frame, while a good client keeps asking for the status.
// Every one of its questions must be answered; the medians with and without the load are printed.
#include "QuillondProcess.h"
#include "TestEnvironment.h"
#include "TestHttpServer.h"

#include "core/SpeechNames.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/installation/CZSpeechInstallationManager_p.h"
#include "core/services/UnixMessagePortService.h"
#include "protocol/InstallerProtocol.h"
#include "protocol/MessageFrame.h"

#include <QElapsedTimer>
#include <QLocalSocket>
#include <QRandomGenerator>
#include <QTest>

#include <algorithm>

using namespace Cadenza;

namespace {
const QString FemkeTag = QStringLiteral("VOICEID:com.vendra.speech.synthesis.voice.femke.compact");

/// Asks @p count times; the median in microseconds, and how many answers held the one record.
std::pair<double, int> ask(CZSpeechInstallationManager &manager, int count)
{
    std::vector<double> times;
    int answered = 0;
    for (int i = 0; i < count; ++i) {
        QElapsedTimer clock;
        clock.start();
        const QVariantList records = manager.activeInstallations();
        times.push_back(double(clock.nsecsElapsed()) / 1000.0);
        answered += records.size() == 1 ? 1 : 0;
        QCoreApplication::processEvents(); // the hostile sockets' own traffic
    }
    std::sort(times.begin(), times.end());
    return {times[times.size() / 2], answered};
}

QLocalSocket *connectTo(QObject *parent)
{
    auto *socket = new QLocalSocket(parent);
    socket->connectToServer(Platform::UnixMessagePortService::socketPath(InstallerProtocol::ServicePortName));
    return socket->waitForConnected(2000) ? socket : nullptr;
}
} // namespace

class HostileClientsTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void goodClientIsServedUnderAttack()
    {
        Testing::TestEnvironment environment;
        Testing::TestHttpServer http(QStringLiteral(CADENZA_SAMPLE_REPOSITORY));
        QVERIFY(http.listen());
        http.setBytesPerSecond(10); // one installation stays in the queue for the whole test
        Testing::QuillondProcess daemon;
        QVERIFY(daemon.start({QStringLiteral("--repository"), http.baseUrl().toString()}));
        CZSpeechInstallationManager manager;
        QVERIFY(CZSpeechInstallationManagerPrivate::get(&manager)->_requestInstallation(FemkeTag,
            QStringLiteral("Femke"), 696, QStringLiteral("com.vendra.speech.synthesis.voice.femke.compact"),
            0));
        QTRY_COMPARE(manager.activeInstallations().size(), 1);

        const auto [quiet, quietAnswered] = ask(manager, 200);
        QCOMPARE(quietAnswered, 200);

        QObject attackers;
        for (int i = 0; i < 100; ++i) {
            QVERIFY2(connectTo(&attackers), "an idle connection was refused");
        }
        QLocalSocket *deaf = connectTo(&attackers);
        QVERIFY(deaf);
        const QByteArray statusQuestion
            = Platform::MessageFrame {InstallerProtocol::ActiveInstallationsMessage,
                Platform::MessageFrame::ReplyWanted, QByteArray()}
                  .encode();
        for (int i = 0; i < 200; ++i) {
            deaf->write(statusQuestion); // and never reads an answer
        }
        QLocalSocket *noisy = connectTo(&attackers);
        QVERIFY(noisy);
        QByteArray noise(64 * 1024, Qt::Uninitialized);
        QRandomGenerator(3).fillRange(reinterpret_cast<quint32 *>(noise.data()), noise.size() / 4);
        noisy->write(noise);
        QLocalSocket *huge = connectTo(&attackers);
        QVERIFY(huge);
        huge->write(QByteArray::fromHex("00000003000000017fffffff")); // announces 2 GB

        const auto [loaded, loadedAnswered] = ask(manager, 200);
        qInfo("activeInstallations median: %.0f us quiet, %.0f us under attack (%.2fx)", quiet, loaded,
            loaded / quiet);
        QCOMPARE(loadedAnswered, 200);
        // The garbage and the oversized frame cost their senders the connection.
        QTRY_COMPARE(noisy->state(), QLocalSocket::UnconnectedState);
        QTRY_COMPARE(huge->state(), QLocalSocket::UnconnectedState);
        // And the daemon still takes work.
        QVERIFY(CZSpeechInstallationManagerPrivate::get(&manager)->_requestInstallation(
            InstallerProtocol::VoiceTagPrefix + Cadenza::SpeechNames::OrinIdentifier, QStringLiteral("Orin"),
            709, Cadenza::SpeechNames::OrinIdentifier, 0));
        QTRY_COMPARE(manager.activeInstallations().size(), 2);
    }
};

QTEST_GUILESS_MAIN(HostileClientsTest)
#include "tst_hostileclients.moc"
