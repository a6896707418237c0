// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// The settings app's "Try dictation" area recording from a microphone: the test's own sound server,
// whose only input hears what the test plays, speech made by the project's flite voice.
#include "PrivateSoundServer.h"
#include "RecognizerFixture.h"
#include "TestEnvironment.h"
#include "TryDictationArea.h"

#include "core/dictation/Recognizer.h"
#include "core/files/Paths.h"

#include <QLabel>
#include <QProcess>
#include <QPushButton>
#include <QSignalSpy>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Testing;

class TryDictationMicrophoneTest : public QObject
{
    Q_OBJECT
    std::unique_ptr<PrivateSoundServer> m_server;
    std::unique_ptr<TestEnvironment> m_environment;

private Q_SLOTS:
    void initTestCase()
    {
        // Qt Multimedia connects to the sound server once per process: it must be ours from the start.
        m_server = std::make_unique<PrivateSoundServer>();
        QVERIFY2(m_server->isRunning(), qPrintable(m_server->error()));
        qputenv("PULSE_SERVER", m_server->address().toLocal8Bit());
    }
    void cleanupTestCase() { m_server.reset(); }
    void init() { m_environment = std::make_unique<TestEnvironment>(); }
    void cleanup() { m_environment.reset(); }

    void recordingShowsTheSpokenWords()
    {
        const QString voice = QStringLiteral("com.vendra.test.trydictation.rms");
        TestEnvironment::writeFliteVoiceBundle(Platform::Paths::userVoicesFolder(), QStringLiteral("Rms"),
            TestEnvironment::voiceAttributes(
                voice, QStringLiteral("Rms"), QStringLiteral("en_US"), QStringLiteral("VoiceGenderMale")),
            QStringLiteral("rms"));
        RecognizerFixture::writeModelBundle(
            Platform::Paths::userRecognizersFolder(), QStringLiteral("en_US"));
        const QString wav = m_environment->path(QStringLiteral("spoken.wav"));
        QCOMPARE(QProcess::execute(QStringLiteral(CADENZA_CLI_PATH),
                     {QStringLiteral("say"), QStringLiteral("--voice"), voice, QStringLiteral("--output"),
                         wav, QStringLiteral("Please send the report to the office.")}),
            0);

        TryDictationArea area([] { return QStringLiteral("en_US"); });
        area.show();
        auto *button = area.findChild<QPushButton *>(QStringLiteral("tryDictationButton"));
        auto *words = area.findChild<QLabel *>(QStringLiteral("tryDictationText"));
        auto *recognizer = area.findChild<Recognizer *>();
        QVERIFY(button && words && recognizer);
        QSignalSpy partial(recognizer, &Recognizer::partialResult);
        QSignalSpy final(recognizer, &Recognizer::finalResult);
        button->click();
        QCOMPARE(button->text(), QStringLiteral("Stop"));
        QTRY_COMPARE_WITH_TIMEOUT(words->text(), QStringLiteral("Listening…"), 60000);
        // paplay plays in real time in its own process; the area keeps its event loop meanwhile.
        QProcess player;
        player.setProcessEnvironment(m_server->clientEnvironment());
        player.start(QStringLiteral("paplay"), {QStringLiteral("--device=room"), wav});
        QTRY_VERIFY_WITH_TIMEOUT(player.state() == QProcess::NotRunning, 60000);
        QCOMPARE(player.exitCode(), 0);
        QTRY_VERIFY_WITH_TIMEOUT(partial.count() > 0, 10000);
        // Words appear while recording.
        QVERIFY2(words->text().contains(QStringLiteral("report")), qPrintable(words->text()));
        QTest::qWait(800);
        button->click();
        QTRY_COMPARE_WITH_TIMEOUT(final.count(), 1, 30000);
        QCOMPARE(button->text(), QStringLiteral("Record"));
        QCOMPARE(words->text(), final.at(0).at(0).toString());
        // Free dictation: within the word error rate goal.
        const double rate = RecognizerFixture::wordErrorRate(
            QStringLiteral("Please send the report to the office."), words->text());
        QVERIFY2(rate <= 0.2, qPrintable(QStringLiteral("%1 %: %2").arg(rate * 100).arg(words->text())));
    }
};

QTEST_MAIN(TryDictationMicrophoneTest)
#include "tst_trydictationmicrophone.moc"
