// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// The dictation engine cadenza-dictation as its own process beside the real installer daemon: it loads
// a language once the daemon has installed it (and the pop-up's installing line clears then), and
// transcribes sound files for clients on the session bus, a damaged model failing on its own.
#include "QuillondProcess.h"
#include "RecognizerFixture.h"
#include "TestEnvironment.h"

#include "core/files/Paths.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/RecognitionService.h"
#include "core/services/Services.h"
#include "widgets/installation/CZSpeechInstallationManagerSheets.h"
#include "widgets/recognition-languages/CZCustomizeSRLanguagesWindowController.h"
#include "widgets/recognition-languages/CZSRLanguagePopUpButton.h"
#include "widgets/recognition-languages/CZSRLanguagePopUpButton_p.h"

#include <QDBusConnection>
#include <QDBusConnectionInterface>
#include <QDBusInterface>
#include <QDBusReply>
#include <QDialog>
#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QLabel>
#include <QProcess>
#include <QProgressBar>
#include <QPushButton>
#include <QTest>

using namespace Cadenza;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString Service = QStringLiteral("org.cadenza.Dictation");
const QString Path = QStringLiteral("/org/cadenza/Dictation");
const QString PreHeat = QStringLiteral("DictationIMNotificationRecognizerDidPreHeat");
const QString WillStartListening = QStringLiteral("DictationIMNotificationWillStartListening");
const QString VoiceId = QStringLiteral("com.vendra.test.dictationservice.slt");
} // namespace

class DictationServiceTest : public QObject
{
    Q_OBJECT

    struct Posted
    {
        QString name;
        QString object;
        qint64 at;
    };

    std::unique_ptr<TestEnvironment> m_environment;
    Testing::QuillondProcess m_daemon;
    QProcess m_engine;
    QElapsedTimer m_clock;
    QList<Posted> m_posted;

    QString speak(const QString &text, const QString &name)
    {
        const QString path = m_environment->path(name);
        QProcess say;
        say.start(QStringLiteral(CADENZA_CLI_PATH),
            {QStringLiteral("say"), QStringLiteral("--voice"), VoiceId, QStringLiteral("--output"), path,
                text});
        if (!say.waitForFinished(60000) || say.exitCode() != 0) {
            qWarning("cadenza say failed: %s", say.readAllStandardError().constData());
            return {};
        }
        return path;
    }

    QDBusMessage call(const QString &method, const QVariantList &arguments)
    {
        QDBusInterface engine(Service, Path, Service);
        engine.setTimeout(120000);
        return engine.callWithArgumentList(QDBus::Block, method, arguments);
    }

    QString writeGrammar()
    {
        const QString path = m_environment->path(QStringLiteral("commands.gram"));
        QFile file(path);
        if (file.open(QIODevice::WriteOnly)) {
            file.write("#JSGF V1.0;\ngrammar commands;\n"
                       "public <command> = (open | close | lock) the (window | door | garage);\n");
        }
        return path;
    }

    bool posted(const QString &name, const QString &object) const
    {
        return std::any_of(m_posted.cbegin(), m_posted.cend(),
            [&](const Posted &p) { return p.name == name && p.object == object; });
    }

private Q_SLOTS:
    void initTestCase()
    {
        m_clock.start();
        m_environment = std::make_unique<TestEnvironment>();
        m_environment->installSampleVoices();
        TestEnvironment::writeFliteVoiceBundle(Platform::Paths::userVoicesFolder(), QStringLiteral("Slt"),
            TestEnvironment::voiceAttributes(VoiceId, QStringLiteral("Slt"), QStringLiteral("en_US")));
        connect(&Platform::Services::notifications(),
            &Platform::DistributedNotificationCenter::notificationPosted, this,
            [this](const QString &name, const QString &object, const QVariantMap &) {
                m_posted.append({name, object, m_clock.elapsed()});
            });
        // The build's sample repository, whose US English recognizer carries the real model.
        QVERIFY2(m_daemon.start({QStringLiteral("--repository"),
                     QUrl::fromLocalFile(QStringLiteral(CADENZA_SAMPLE_REPOSITORY)).toString()}),
            "quillond did not start");
        m_engine.setProcessChannelMode(QProcess::ForwardedChannels);
        m_engine.start(
            QStringLiteral(CADENZA_DICTATION_PATH), {QStringLiteral("--idle-exit"), QStringLiteral("600")});
        QVERIFY(m_engine.waitForStarted());
        QTRY_VERIFY_WITH_TIMEOUT(
            QDBusConnection::sessionBus().interface()->isServiceRegistered(Service).value(), 10000);
    }
    void cleanupTestCase()
    {
        m_engine.terminate();
        m_engine.waitForFinished(10000);
        m_daemon.terminate();
        m_environment.reset();
    }

    /// Installing US English through the pop-up's sheet: the engine loads the model once the daemon
    /// reports the installation finished, and the installing line clears with its notification.
    void theInstalledLanguageIsPreHeatedAndTheInstallingLineClears()
    {
        QWidget window;
        auto *popUp = new CZSRLanguagePopUpButton(&window);
        auto *status = new QLabel(&window);
        auto *spinner = new QProgressBar(&window);
        popUp->setDownloadStatusTextField(status);
        popUp->setDownloadStatusProgressIndicator(spinner);
        popUp->setLanguagesAreDownloadable(true);
        window.show();
        popUp->buildPopUpButtonAndSelectLocaleIdentifier(
            QStringLiteral("en_US"), QStringList {QStringLiteral("en_US")}, std::nullopt);
        popUp->setEnabled(true);
        popUp->setCurrentIndex(popUp->count() - 1);
        QVERIFY(!popUp->sendAction());
        CZCustomizeSRLanguagesWindowController *sheet
            = CZSpeechInstallationManagerSheets::srLanguagesSelectionWindowController();
        QPushButton *ok = sheet->window()->findChild<QPushButton *>(QStringLiteral("okButton"));
        QVERIFY(ok && ok->isEnabled());
        ok->click();

        const QString bundle
            = Platform::Paths::userRecognizersFolder() + QStringLiteral("/en_US.SpeechRecognition");
        bool sawInstalling = false;
        QElapsedTimer wait;
        wait.start();
        while (wait.elapsed() < 120000 && !QDir(bundle).exists()) {
            CZSRLanguagePopUpButtonPrivate::get(popUp)->_updateDownloadStatusFields();
            sawInstalling = sawInstalling || !status->text().isEmpty();
            QTest::qWait(20);
        }
        QVERIFY(QDir(bundle).exists());
        QVERIFY(sawInstalling);
        const qint64 installed = m_clock.elapsed();
        QTRY_VERIFY_WITH_TIMEOUT(
            CZSpeechInstallationManager::sharedManager()->activeInstallations().isEmpty(), 20000);

        // Cleared by the engine's notification, well before the pop-up's own 30 s wait ends.
        QTRY_VERIFY_WITH_TIMEOUT(status->text().isEmpty(), 20000);
        const qint64 cleared = m_clock.elapsed();
        QVERIFY(!spinner->isVisible());
        QVERIFY2(posted(PreHeat, QStringLiteral("en_US")), "no pre-heat notification for en_US");
        const auto preHeat = std::find_if(
            m_posted.cbegin(), m_posted.cend(), [](const Posted &p) { return p.name == PreHeat; });
        QVERIFY(preHeat->at >= installed - 1000);
        QVERIFY(preHeat->at <= cleared);
        qInfo("pre-heated %lld ms after the bundle appeared", preHeat->at - installed);
        QCOMPARE(m_engine.state(), QProcess::Running);
    }

    /// A client's file, in a grammar and in free dictation; the engine says it starts listening.
    void aClientsFileIsTranscribed()
    {
        const QString grammar = writeGrammar();
        const QString wav = speak(QStringLiteral("lock the garage"), QStringLiteral("command.wav"));
        QVERIFY(!wav.isEmpty());
        m_posted.clear();
        QDBusMessage reply
            = call(QStringLiteral("TranscribeFileWithGrammar"), {wav, QStringLiteral("en-US"), grammar});
        QVERIFY2(reply.type() == QDBusMessage::ReplyMessage, qPrintable(reply.errorMessage()));
        QCOMPARE(reply.arguments().value(0).toString(), QStringLiteral("lock the garage"));
        QTRY_VERIFY(posted(WillStartListening, QStringLiteral("en_US")));

        const QString sentence = QStringLiteral("please send the report to the office before noon");
        const QString free = speak(sentence, QStringLiteral("free.wav"));
        reply = call(QStringLiteral("TranscribeFile"), {free, QStringLiteral("en_US")});
        QVERIFY2(reply.type() == QDBusMessage::ReplyMessage, qPrintable(reply.errorMessage()));
        const QString text = reply.arguments().value(0).toString();
        qInfo("free dictation: %s", qPrintable(text));
        int found = 0;
        for (const QString &word : {QStringLiteral("send"), QStringLiteral("report"),
                 QStringLiteral("office"), QStringLiteral("before"), QStringLiteral("noon")}) {
            found += text.split(u' ').contains(word) ? 1 : 0;
        }
        QVERIFY2(found >= 4, qPrintable(text));

        // Not a sound file: an error for this client only.
        reply = call(QStringLiteral("TranscribeFile"), {grammar, QStringLiteral("en_US")});
        QCOMPARE(reply.type(), QDBusMessage::ErrorMessage);
        QVERIFY(!reply.errorMessage().isEmpty());
    }

    /// A model that cannot be loaded fails with an error naming its language; the engine goes on.
    void aDamagedModelFailsAndTheEngineKeepsServing()
    {
        const QString dutch = Testing::RecognizerFixture::writeModelBundle(
            Platform::Paths::userRecognizersFolder(), QStringLiteral("nl_NL"));
        const QString lm = dutch + QStringLiteral("/Resources/language.lm.bin");
        QFile whole(Testing::RecognizerFixture::debianModelFolder() + QStringLiteral("/en-us.lm.bin"));
        QVERIFY(whole.open(QIODevice::ReadOnly));
        QVERIFY(QFile::remove(lm));
        QFile cut(lm);
        QVERIFY(cut.open(QIODevice::WriteOnly));
        cut.write(whole.read(100000));
        cut.close();

        const QString wav = speak(QStringLiteral("open the door"), QStringLiteral("door.wav"));
        QDBusMessage reply = call(QStringLiteral("TranscribeFile"), {wav, QStringLiteral("nl_NL")});
        QCOMPARE(reply.type(), QDBusMessage::ErrorMessage);
        QVERIFY2(reply.errorMessage().contains(QStringLiteral("nl_NL")), qPrintable(reply.errorMessage()));
        reply = call(QStringLiteral("PreHeat"), {QStringLiteral("sv_SE")});
        QCOMPARE(reply.type(), QDBusMessage::ErrorMessage);
        QVERIFY2(reply.errorMessage().contains(QStringLiteral("sv_SE")), qPrintable(reply.errorMessage()));

        QCOMPARE(m_engine.state(), QProcess::Running);
        reply = call(QStringLiteral("PreHeat"), {QStringLiteral("en_US")});
        QVERIFY2(reply.type() == QDBusMessage::ReplyMessage, qPrintable(reply.errorMessage()));
        reply = call(
            QStringLiteral("TranscribeFileWithGrammar"), {wav, QStringLiteral("en_US"), writeGrammar()});
        QVERIFY2(reply.type() == QDBusMessage::ReplyMessage, qPrintable(reply.errorMessage()));
        QCOMPARE(reply.arguments().value(0).toString(), QStringLiteral("open the door"));
    }

    /// Every file of a model damaged in turn (zeroed, cut short, a foreign first word): the engine
    /// reports the language unusable with a reason and goes on serving the intact one.
    void everyDamagedModelFileFailsInTheEngine()
    {
        using Testing::RecognizerFixture;
        const QString wav = speak(QStringLiteral("close the window"), QStringLiteral("window.wav"));
        const QString folder = Platform::Paths::userRecognizersFolder();
        if (Platform::Services::recognition().bundlePathForLocale(QStringLiteral("en_US")).isEmpty()) {
            RecognizerFixture::writeModelBundle(folder, QStringLiteral("en_US")); // run on its own
        }
        const QStringList binary {QStringLiteral("acoustic/mdef"), QStringLiteral("acoustic/means"),
            QStringLiteral("acoustic/variances"), QStringLiteral("acoustic/sendump"),
            QStringLiteral("acoustic/transition_matrices"), QStringLiteral("language.lm.bin")};
        for (const QString &file : RecognizerFixture::modelFiles()) {
            for (const auto damage : {RecognizerFixture::Damage::Zeroed, RecognizerFixture::Damage::Truncated,
                     RecognizerFixture::Damage::WrongMagic}) {
                if (damage != RecognizerFixture::Damage::Zeroed && !binary.contains(file)) {
                    continue; // a text file cut short or with another first word may still be a model
                }
                const QString what = file + QStringLiteral(" damage ") + QString::number(int(damage));
                QDir(folder + QStringLiteral("/nl_NL.SpeechRecognition")).removeRecursively();
                RecognizerFixture::writeDamagedBundle(folder, QStringLiteral("nl_NL"), file, damage);
                const QDBusMessage reply
                    = call(QStringLiteral("TranscribeFile"), {wav, QStringLiteral("nl_NL")});
                QVERIFY2(reply.type() == QDBusMessage::ErrorMessage, qPrintable(what));
                QVERIFY2(reply.errorMessage().contains(
                             QStringLiteral("The recognition language nl_NL is unusable: ")),
                    qPrintable(what + u' ' + reply.errorMessage()));
                QVERIFY2(m_engine.state() == QProcess::Running, qPrintable(what));
            }
        }
        const QDBusMessage reply = call(
            QStringLiteral("TranscribeFileWithGrammar"), {wav, QStringLiteral("en_US"), writeGrammar()});
        QVERIFY2(reply.type() == QDBusMessage::ReplyMessage, qPrintable(reply.errorMessage()));
        QCOMPARE(reply.arguments().value(0).toString(), QStringLiteral("close the window"));
    }
};

QTEST_MAIN(DictationServiceTest)
#include "tst_dictationservice.moc"
