// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// Recognition with the pocketsphinx engine: which recognizer bundles count as installed, and
// "cadenza dictate" on speech made by the project's own voices and on bad sound files.
#include "PrivateSoundServer.h"
#include "RecognizerFixture.h"
#include "TestEnvironment.h"

#include "core/dictation/Recognizer.h"
#include "core/dictation/Transcriber.h"
#include "core/engines/RecognitionEngines.h"
#include "core/files/Paths.h"
#include "core/formats/AudioFileReader.h"
#include "core/formats/WaveFile.h"
#include "core/services/RecognitionService.h"

#include <QElapsedTimer>
#include <QFile>
#include <QProcess>
#include <QRegularExpression>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QTest>

#include <cmath>

using namespace Cadenza;
using namespace Cadenza::Platform;
using namespace Cadenza::Testing;

namespace {

const QString P = QStringLiteral("com.vendra.test.dictation.");

struct Result
{
    int exitCode = -1;
    QString out;
    QString err;
};

/// The sound server the tests' own processes use unless a test starts one: none listens there.
QString absentSoundServer;

Result cadenza(const QStringList &arguments, const QProcessEnvironment &environment = {})
{
    QProcess process;
    QProcessEnvironment used = environment.isEmpty() ? QProcessEnvironment::systemEnvironment() : environment;
    if (!used.contains(QStringLiteral("PULSE_SERVER"))) {
        used.insert(QStringLiteral("PULSE_SERVER"), absentSoundServer);
    }
    process.setProcessEnvironment(used);
    process.start(QStringLiteral(CADENZA_CLI_PATH), arguments);
    process.closeWriteChannel();
    if (!process.waitForFinished(120000)) {
        process.kill();
        return {};
    }
    return {process.exitStatus() == QProcess::NormalExit ? process.exitCode() : -1,
        QString::fromUtf8(process.readAllStandardOutput()),
        QString::fromUtf8(process.readAllStandardError())};
}

QStringList words(const QString &text)
{
    QString cleaned = text.toLower();
    cleaned.replace(QRegularExpression(QStringLiteral("[^a-z' ]")), QStringLiteral(" "));
    return cleaned.split(QLatin1Char(' '), Qt::SkipEmptyParts);
}

/// Word error rate: the edit distance between the word lists over the reference's length.
double wordErrorRate(const QStringList &reference, const QStringList &hypothesis)
{
    std::vector<int> previous(size_t(hypothesis.size()) + 1);
    std::vector<int> current(previous.size());
    for (size_t j = 0; j < previous.size(); ++j) {
        previous[j] = int(j);
    }
    for (qsizetype i = 1; i <= reference.size(); ++i) {
        current[0] = int(i);
        for (qsizetype j = 1; j <= hypothesis.size(); ++j) {
            const int substitution
                = previous[size_t(j - 1)] + (reference[i - 1] == hypothesis[j - 1] ? 0 : 1);
            current[size_t(j)]
                = std::min({previous[size_t(j)] + 1, current[size_t(j - 1)] + 1, substitution});
        }
        std::swap(previous, current);
    }
    return reference.isEmpty() ? 0.0 : double(previous.back()) / double(reference.size());
}

} // namespace

class DictationTest : public QObject
{
    Q_OBJECT

    std::unique_ptr<TestEnvironment> m_environment;

    QString speak(const QString &voice, const QString &text, const QString &name)
    {
        const QString path = m_environment->path(name);
        const Result said = cadenza({QStringLiteral("say"), QStringLiteral("--voice"), P + voice,
            QStringLiteral("--output"), path, text});
        if (said.exitCode != 0) {
            qWarning("cadenza say failed: %s", qPrintable(said.err));
            return {};
        }
        return path;
    }

    QString writeGrammar()
    {
        const QString path = m_environment->path(QStringLiteral("commands.gram"));
        QFile file(path);
        if (file.open(QIODevice::WriteOnly)) {
            file.write("#JSGF V1.0;\n"
                       "grammar commands;\n"
                       "public <command> = <action> the <thing> | turn (on | off) the light | "
                       "call (mother | father | the office);\n"
                       "<action> = open | close | lock;\n"
                       "<thing> = window | door | garage;\n");
        }
        return path;
    }

private Q_SLOTS:
    void initTestCase()
    {
        // No sound server of the machine's, nor one started on demand, is ever reached.
        static QTemporaryDir folder;
        absentSoundServer = PrivateSoundServer::absentAddress(folder.path());
        qputenv("PULSE_SERVER", absentSoundServer.toLocal8Bit());
    }

    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        TestEnvironment::writeFliteVoiceBundle(Paths::userVoicesFolder(), QStringLiteral("Slt"),
            TestEnvironment::voiceAttributes(
                P + QStringLiteral("slt"), QStringLiteral("Slt"), QStringLiteral("en_US")));
        TestEnvironment::writeFliteVoiceBundle(Paths::userVoicesFolder(), QStringLiteral("Rms"),
            TestEnvironment::voiceAttributes(P + QStringLiteral("rms"), QStringLiteral("Rms"),
                QStringLiteral("en_US"), QStringLiteral("VoiceGenderMale")),
            QStringLiteral("rms"));
        RecognizerFixture::writeModelBundle(Paths::userRecognizersFolder(), QStringLiteral("en_US"));
    }
    void cleanup() { m_environment.reset(); }

    void thePocketsphinxEngineIsFoundInTheBuildTree()
    {
        QVERIFY2(RecognitionEngines::availableEngines().contains(QStringLiteral("pocketsphinx")),
            qPrintable(RecognitionEngines::availableEngines().join(u' ')));
        QString error;
        QVERIFY(!RecognitionEngines::engine(QStringLiteral("nosuchengine"), &error));
        QVERIFY2(error.contains(QStringLiteral("'nosuchengine' is not installed")), qPrintable(error));
    }

    /// Only bundles whose engine accepts their model count; the reasons for the others are kept.
    void onlyBundlesWithAModelAreInstalled()
    {
        const QString folder = Paths::userRecognizersFolder();
        RecognizerFixture::writeBareBundle(folder, QStringLiteral("de_DE.SpeechRecognition"),
            {{QStringLiteral("LocaleIdentifier"), QStringLiteral("de_DE")}});
        const QString french = RecognizerFixture::writeTinyBundle(folder, QStringLiteral("fr_FR"));
        QFile lm(french + QStringLiteral("/Resources/language.lm.bin"));
        QVERIFY(lm.open(QIODevice::WriteOnly));
        lm.write("this is no language model");
        lm.close();
        const QString spanish = RecognizerFixture::writeTinyBundle(folder, QStringLiteral("es_ES"));
        QVERIFY(QFile::remove(spanish + QStringLiteral("/Resources/pronunciation.dict")));
        const QString italian = RecognizerFixture::writeTinyBundle(folder, QStringLiteral("it_IT"));
        QVariantMap info {{QStringLiteral("LocaleIdentifier"), QStringLiteral("it_IT")},
            {QStringLiteral("RecognitionEngine"), QStringLiteral("nosuchengine")}};
        RecognizerFixture::writeBareBundle(folder, QStringLiteral("it_IT.SpeechRecognition"), info);
        RecognizerFixture::writeTinyBundle(folder, QStringLiteral("nl_NL"));

        for (int i = 0; i < 4; ++i) {
            QTest::ignoreMessage(
                QtWarningMsg, QRegularExpression(QStringLiteral("Skipping recognizer bundle")));
        }
        BundleRecognitionService service;
        QCOMPARE(service.installedLanguages().value_or(QStringList()),
            QStringList({QStringLiteral("en_US"), QStringLiteral("nl_NL")}));

        QString reason;
        QVERIFY(!service.modelForLocale(QStringLiteral("de_DE"), &reason));
        QVERIFY2(reason.contains(QStringLiteral("names no recognition engine")), qPrintable(reason));
        QVERIFY(!service.modelForLocale(QStringLiteral("fr-FR"), &reason));
        QVERIFY2(reason.contains(QStringLiteral("is not one pocketsphinx reads")), qPrintable(reason));
        QVERIFY(!service.modelForLocale(QStringLiteral("es_ES"), &reason));
        QVERIFY2(reason.contains(QStringLiteral("dictionary")), qPrintable(reason));
        QVERIFY(!service.modelForLocale(QStringLiteral("it_IT"), &reason));
        QVERIFY2(reason.contains(QStringLiteral("'nosuchengine' is not installed")), qPrintable(reason));
        QVERIFY(!service.modelForLocale(QStringLiteral("sv_SE"), &reason));
        QVERIFY2(reason.contains(QStringLiteral("no recognizer for sv_SE is installed")), qPrintable(reason));
        const auto english = service.modelForLocale(QStringLiteral("en-US"), &reason);
        QVERIFY2(english, qPrintable(reason));
        QCOMPARE(english->engineName, QStringLiteral("pocketsphinx"));
        QVERIFY(!english->filePath(QStringLiteral("AcousticModel")).isEmpty());
    }

    /// A model that passes the quick check but cannot be loaded (its language model cut short) fails
    /// with a reason; the other language still loads.
    void aDamagedModelFailsToLoadAndOthersKeepWorking()
    {
        const QString dutch
            = RecognizerFixture::writeModelBundle(Paths::userRecognizersFolder(), QStringLiteral("nl_NL"));
        const QString lm = dutch + QStringLiteral("/Resources/language.lm.bin");
        QFile whole(RecognizerFixture::debianModelFolder() + QStringLiteral("/en-us.lm.bin"));
        QVERIFY(whole.open(QIODevice::ReadOnly));
        QVERIFY(QFile::remove(lm));
        QFile cut(lm);
        QVERIFY(cut.open(QIODevice::WriteOnly));
        cut.write(whole.read(100000));
        cut.close();
        BundleRecognitionService service;
        QString error;
        const auto model = service.modelForLocale(QStringLiteral("nl_NL"), &error);
        QVERIFY2(model, qPrintable(error));
        QVERIFY(!Transcriber::load(*model, &error));
        QVERIFY2(error.contains(QStringLiteral("could not load the model")), qPrintable(error));
        const auto english = service.modelForLocale(QStringLiteral("en_US"), &error);
        QVERIFY2(english, qPrintable(error));
        QVERIFY2(Transcriber::load(*english, &error), qPrintable(error));

        const Result dictated
            = cadenza({QStringLiteral("dictate"), QStringLiteral("--language"), QStringLiteral("nl_NL"),
                speak(QStringLiteral("slt"), QStringLiteral("open the door"), QStringLiteral("a.wav"))});
        QCOMPARE(dictated.exitCode, 1);
        QVERIFY2(dictated.err.contains(QStringLiteral("could not load the model")), qPrintable(dictated.err));
    }

    void aCommandGrammarIsRecognisedExactly_data()
    {
        QTest::addColumn<QString>("voice");
        QTest::addColumn<QString>("sentence");
        for (const QString voice : {QStringLiteral("slt"), QStringLiteral("rms")}) {
            for (const QString sentence : {QStringLiteral("open the window"),
                     QStringLiteral("lock the garage"), QStringLiteral("turn off the light"),
                     QStringLiteral("call the office"), QStringLiteral("close the door")}) {
                QTest::newRow(qPrintable(voice + u' ' + sentence)) << voice << sentence;
            }
        }
    }
    void aCommandGrammarIsRecognisedExactly()
    {
        QFETCH(QString, voice);
        QFETCH(QString, sentence);
        const QString wav = speak(voice, sentence, QStringLiteral("command.wav"));
        QVERIFY(!wav.isEmpty());
        const Result dictated
            = cadenza({QStringLiteral("dictate"), QStringLiteral("--grammar"), writeGrammar(), wav});
        QVERIFY2(dictated.exitCode == 0, qPrintable(dictated.err));
        QCOMPARE(dictated.out.trimmed(), sentence);
    }

    void freeDictationStaysWithinTheErrorGoal_data()
    {
        QTest::addColumn<QString>("voice");
        QTest::newRow("slt") << QStringLiteral("slt");
        QTest::newRow("rms") << QStringLiteral("rms");
    }
    void freeDictationStaysWithinTheErrorGoal()
    {
        QFETCH(QString, voice);
        const QString text = QStringLiteral(
            "The weather will be sunny this afternoon. Please send the report to the office before noon. "
            "We are going to the station tomorrow morning. I would like a cup of coffee and a glass of "
            "water.");
        const QString wav = speak(voice, text, QStringLiteral("free.wav"));
        QVERIFY(!wav.isEmpty());
        const Result dictated = cadenza(
            {QStringLiteral("dictate"), QStringLiteral("--language"), QStringLiteral("en_US"), wav});
        QVERIFY2(dictated.exitCode == 0, qPrintable(dictated.err));
        const double rate = wordErrorRate(words(text), words(dictated.out));
        qInfo("%s: word error rate %.1f %% for: %s", qPrintable(voice), rate * 100,
            qPrintable(dictated.out.trimmed()));
        QVERIFY2(rate <= 0.20, qPrintable(QStringLiteral("%1 %: %2").arg(rate * 100).arg(dictated.out)));
    }

    /// Another rate, sample format and channel count are converted before recognition.
    void otherFormatsAreConverted_data()
    {
        QTest::addColumn<QStringList>("soxOptions");
        QTest::newRow("44.1 kHz stereo 8-bit") << QStringList {QStringLiteral("-r"), QStringLiteral("44100"),
            QStringLiteral("-c"), QStringLiteral("2"), QStringLiteral("-b"), QStringLiteral("8")};
        QTest::newRow("8 kHz float") << QStringList {QStringLiteral("-r"), QStringLiteral("8000"),
            QStringLiteral("-e"), QStringLiteral("floating-point"), QStringLiteral("-b"),
            QStringLiteral("32")};
        QTest::newRow("48 kHz 24-bit") << QStringList {
            QStringLiteral("-r"), QStringLiteral("48000"), QStringLiteral("-b"), QStringLiteral("24")};
    }
    void otherFormatsAreConverted()
    {
        QFETCH(QStringList, soxOptions);
        const QString wav
            = speak(QStringLiteral("slt"), QStringLiteral("turn on the light"), QStringLiteral("in.wav"));
        const QString converted = m_environment->path(QStringLiteral("converted.wav"));
        QCOMPARE(QProcess::execute(
                     QStringLiteral("sox"), QStringList {wav} + soxOptions + QStringList {converted}),
            0);
        const Result dictated
            = cadenza({QStringLiteral("dictate"), QStringLiteral("--grammar"), writeGrammar(), converted});
        QVERIFY2(dictated.exitCode == 0, qPrintable(dictated.err));
        QCOMPARE(dictated.out.trimmed(), QStringLiteral("turn on the light"));
    }

    void badFilesGiveClearErrors()
    {
        const QString wav
            = speak(QStringLiteral("slt"), QStringLiteral("open the window"), QStringLiteral("good.wav"));
        QFile good(wav);
        QVERIFY(good.open(QIODevice::ReadOnly));
        const QByteArray bytes = good.readAll();

        const auto write = [this](const QString &name, const QByteArray &content) {
            const QString path = m_environment->path(name);
            QFile file(path);
            if (file.open(QIODevice::WriteOnly)) {
                file.write(content);
            }
            return path;
        };
        // Not a sound file at all.
        Result r = cadenza(
            {QStringLiteral("dictate"), write(QStringLiteral("text.wav"), "hello, I am no sound\n")});
        QCOMPARE(r.exitCode, 1);
        QVERIFY2(r.err.contains(QStringLiteral("is not a sound file")), qPrintable(r.err));
        // Cut inside the header.
        r = cadenza({QStringLiteral("dictate"), write(QStringLiteral("header.wav"), bytes.left(30))});
        QCOMPARE(r.exitCode, 1);
        QVERIFY2(r.err.contains(QStringLiteral("is not a sound file")), qPrintable(r.err));
        // Cut inside the samples: what is there is transcribed.
        r = cadenza({QStringLiteral("dictate"), QStringLiteral("--grammar"), writeGrammar(),
            write(QStringLiteral("cut.wav"), bytes.left(bytes.size() * 3 / 4))});
        QVERIFY2(r.exitCode == 0, qPrintable(r.err));
        // Silence: no words, said on standard error.
        PcmAudio silence;
        silence.sampleRate = 22050;
        silence.samples.assign(22050 * 3, 0);
        QString error;
        QVERIFY(WaveFile::write(m_environment->path(QStringLiteral("silence.wav")), silence, &error));
        r = cadenza({QStringLiteral("dictate"), m_environment->path(QStringLiteral("silence.wav"))});
        QCOMPARE(r.exitCode, 0);
        QCOMPARE(r.out, QString());
        QVERIFY2(r.err.contains(QStringLiteral("no words were recognised")), qPrintable(r.err));
        // Missing file, missing grammar, no recognizer for the language, bad usage.
        r = cadenza({QStringLiteral("dictate"), m_environment->path(QStringLiteral("absent.wav"))});
        QCOMPARE(r.exitCode, 1);
        r = cadenza({QStringLiteral("dictate"), QStringLiteral("--grammar"),
            QStringLiteral("/nonexistent.gram"), wav});
        QCOMPARE(r.exitCode, 1);
        r = cadenza({QStringLiteral("dictate"), QStringLiteral("--language"), QStringLiteral("sv_SE"), wav});
        QCOMPARE(r.exitCode, 1);
        QVERIFY2(r.err.contains(QStringLiteral("no recognizer for sv_SE is installed")), qPrintable(r.err));
        r = cadenza({QStringLiteral("dictate")});
        QCOMPARE(r.exitCode, 2);
        r = cadenza({QStringLiteral("dictate"), wav, wav});
        QCOMPARE(r.exitCode, 2);
        // A grammar that is not JSGF.
        r = cadenza({QStringLiteral("dictate"), QStringLiteral("--grammar"),
            write(QStringLiteral("bad.gram"), "public <x> = ;;; ((\n"), wav});
        QCOMPARE(r.exitCode, 1);
        QVERIFY2(r.err.contains(QStringLiteral("grammar")), qPrintable(r.err));
    }

    /// The test world has no sound server, so no microphone: dictating from it says so plainly.
    void aMissingMicrophoneIsNamed()
    {
        Result r = cadenza({QStringLiteral("dictate"), QStringLiteral("--microphone")});
        QCOMPARE(r.exitCode, 1);
        QVERIFY2(r.err.contains(QStringLiteral("no microphone is connected")), qPrintable(r.err));
        QCOMPARE(r.out, QString());
        r = cadenza({QStringLiteral("dictate"), QStringLiteral("--microphone"), QStringLiteral("x.wav")});
        QCOMPARE(r.exitCode, 2);
    }

    /// A sound server that runs but has no input: the same plain message.
    void aServerWithoutInputsHasNoMicrophone()
    {
        PrivateSoundServer server(PrivateSoundServer::Input::None);
        QVERIFY2(server.isRunning(), qPrintable(server.error()));
        const Result r = cadenza(
            {QStringLiteral("dictate"), QStringLiteral("--microphone")}, server.clientEnvironment());
        QCOMPARE(r.exitCode, 1);
        QVERIFY2(r.err.contains(QStringLiteral("no microphone is connected")), qPrintable(r.err));
        QCOMPARE(r.out, QString());
    }

    /// Speech played into the sound server's only input while "cadenza dictate --microphone" listens:
    /// partial results appear on standard error as it speaks, the text on standard output after Enter.
    void dictatingFromTheMicrophone_data()
    {
        QTest::addColumn<QString>("voice");
        QTest::addColumn<QString>("sentence");
        QTest::addColumn<bool>("grammar");
        QTest::newRow("grammar slt") << QStringLiteral("slt") << QStringLiteral("lock the garage") << true;
        QTest::newRow("grammar rms") << QStringLiteral("rms") << QStringLiteral("turn off the light") << true;
        QTest::newRow("free rms") << QStringLiteral("rms")
                                  << QStringLiteral("We are going to the station tomorrow morning.") << false;
    }
    void dictatingFromTheMicrophone()
    {
        QFETCH(QString, voice);
        QFETCH(QString, sentence);
        QFETCH(bool, grammar);
        const QString wav = speak(voice, sentence, QStringLiteral("spoken.wav"));
        QVERIFY(!wav.isEmpty());
        PrivateSoundServer server;
        QVERIFY2(server.isRunning(), qPrintable(server.error()));

        QProcess dictate;
        dictate.setProcessEnvironment(server.clientEnvironment());
        QStringList arguments {QStringLiteral("dictate"), QStringLiteral("--microphone")};
        if (grammar) {
            arguments << QStringLiteral("--grammar") << writeGrammar();
        }
        dictate.start(QStringLiteral(CADENZA_CLI_PATH), arguments);
        QVERIFY(dictate.waitForStarted());
        QByteArray err;
        QElapsedTimer waited;
        waited.start();
        while (
            !err.contains("Listening") && waited.elapsed() < 60000 && dictate.state() == QProcess::Running) {
            dictate.waitForReadyRead(200);
            err += dictate.readAllStandardError();
        }
        QVERIFY2(err.contains("Listening; press Enter to finish."), err.constData());
        QVERIFY(server.play(wav));
        // The pause after the words ends the utterance; then Enter.
        QTest::qWait(1200);
        dictate.write("\n");
        QVERIFY(dictate.waitForFinished(60000));
        err += dictate.readAllStandardError();
        const QString out = QString::fromUtf8(dictate.readAllStandardOutput()).trimmed();
        QCOMPARE(dictate.exitStatus(), QProcess::NormalExit);
        QVERIFY2(dictate.exitCode() == 0, err.constData());
        const QStringList partials
            = QString::fromUtf8(err).split(QLatin1Char('\n')).filter(QStringLiteral("… "));
        QVERIFY2(!partials.isEmpty(), err.constData());
        if (grammar) {
            QCOMPARE(out, sentence);
        } else {
            const double rate = wordErrorRate(words(sentence), words(out));
            QVERIFY2(rate <= 0.20, qPrintable(QStringLiteral("%1 %: %2").arg(rate * 100).arg(out)));
        }
        // The last partial result already held the words; the final text is no shorter.
        QVERIFY2(words(out).size() >= words(partials.last()).size(), err.constData());
    }

    /// A damaged file in a model: the language is unusable with a reason, the command ends normally
    /// with status 1, and another language keeps working.
    void aDamagedModelFileMakesTheLanguageUnusable_data()
    {
        QTest::addColumn<QString>("file");
        QTest::addColumn<int>("damage");
        QTest::addColumn<bool>("mayStillLoad");
        for (const QString &file : RecognizerFixture::modelFiles()) {
            // A pronouncing dictionary or noise dictionary cut at half, or with another first word,
            // is still one (fewer or other words).
            const bool text
                = file.endsWith(QStringLiteral(".dict")) || file.endsWith(QStringLiteral("noisedict"));
            QTest::newRow(qPrintable(file + QStringLiteral(" truncated")))
                << file << int(RecognizerFixture::Damage::Truncated) << text;
            QTest::newRow(qPrintable(file + QStringLiteral(" zeroed")))
                << file << int(RecognizerFixture::Damage::Zeroed) << false;
            QTest::newRow(qPrintable(file + QStringLiteral(" wrong magic")))
                << file << int(RecognizerFixture::Damage::WrongMagic) << text;
        }
    }
    void aDamagedModelFileMakesTheLanguageUnusable()
    {
        QFETCH(QString, file);
        QFETCH(int, damage);
        QFETCH(bool, mayStillLoad);
        RecognizerFixture::writeDamagedBundle(
            Paths::userRecognizersFolder(), QStringLiteral("nl_NL"), file, RecognizerFixture::Damage(damage));
        const QString wav
            = speak(QStringLiteral("slt"), QStringLiteral("open the door"), QStringLiteral("door.wav"));
        const Result dutch = cadenza({QStringLiteral("dictate"), QStringLiteral("--language"),
            QStringLiteral("nl_NL"), QStringLiteral("--grammar"), writeGrammar(), wav});
        if (mayStillLoad) {
            // A smaller dictionary is still one: words, or a clear error (its grammar's words are
            // missing), never the end of the process.
            QVERIFY2(dutch.exitCode == 0 || dutch.exitCode == 1,
                qPrintable(QString::number(dutch.exitCode) + u' ' + dutch.err));
        } else {
            QVERIFY2(dutch.exitCode == 1, qPrintable(QString::number(dutch.exitCode) + u' ' + dutch.err));
            QVERIFY2(dutch.err.contains(QStringLiteral("the recognition language nl_NL is unusable: ")),
                qPrintable(dutch.err));
            QCOMPARE(dutch.out, QString());
        }
        if (RecognizerFixture::Damage(damage) != RecognizerFixture::Damage::WrongMagic) {
            return; // once per file is enough to see the intact language keep working
        }
        const Result english = cadenza({QStringLiteral("dictate"), QStringLiteral("--language"),
            QStringLiteral("en_US"), QStringLiteral("--grammar"), writeGrammar(), wav});
        QVERIFY2(english.exitCode == 0, qPrintable(english.err));
        QCOMPARE(english.out.trimmed(), QStringLiteral("open the door"));
    }

    /// The command's messages follow the user's language.
    void theMessagesAreLocalized()
    {
        QProcessEnvironment german = QProcessEnvironment::systemEnvironment();
        german.insert(QStringLiteral("LANGUAGE"), QStringLiteral("de_DE"));
        german.insert(QStringLiteral("LANG"), QStringLiteral("de_DE.UTF-8"));
        Result r = cadenza({QStringLiteral("dictate")}, german);
        QCOMPARE(r.exitCode, 2);
        QVERIFY2(r.err.contains(QStringLiteral("geben Sie eine Tondatei oder --microphone an")),
            qPrintable(r.err));
        r = cadenza({QStringLiteral("dictate"), m_environment->path(QStringLiteral("absent.wav"))}, german);
        QCOMPARE(r.exitCode, 1);
        QVERIFY2(r.err.contains(QStringLiteral("keine Datei")), qPrintable(r.err));
        r = cadenza({QStringLiteral("dictate"), QStringLiteral("--microphone")}, german);
        QCOMPARE(r.exitCode, 1);
        QVERIFY2(r.err.contains(QStringLiteral("kein Mikrofon ist angeschlossen")), qPrintable(r.err));
        r = cadenza({QStringLiteral("dictate"), QStringLiteral("--help")}, german);
        QCOMPARE(r.exitCode, 0);
        QVERIFY2(r.out.contains(QStringLiteral("Dem Mikrofon statt einer Datei zuhören")), qPrintable(r.out));
    }

    /// The application interface: results as signals, a cancelled run says nothing more.
    void theRecognizerSignalsItsResults()
    {
        const QString first
            = speak(QStringLiteral("slt"), QStringLiteral("lock the door"), QStringLiteral("r1.wav"));
        const QString second
            = speak(QStringLiteral("rms"), QStringLiteral("call mother"), QStringLiteral("r2.wav"));
        Recognizer recognizer;
        recognizer.setGrammarFile(writeGrammar());
        QSignalSpy partial(&recognizer, &Recognizer::partialResult);
        QSignalSpy final(&recognizer, &Recognizer::finalResult);
        QSignalSpy failed(&recognizer, &Recognizer::failed);
        recognizer.startFromFile(first);
        QVERIFY(recognizer.isRunning());
        QTRY_COMPARE_WITH_TIMEOUT(final.count() + failed.count(), 1, 60000);
        QCOMPARE(failed.count(), 0);
        QCOMPARE(final.at(0).at(0).toString(), QStringLiteral("lock the door"));
        QVERIFY(partial.count() >= 1);
        QVERIFY(!recognizer.isRunning());

        // Cancelled at once, then started on another file: only the second result arrives.
        final.clear();
        recognizer.startFromFile(first);
        recognizer.cancel();
        QVERIFY(!recognizer.isRunning());
        recognizer.startFromFile(second);
        QTRY_COMPARE_WITH_TIMEOUT(final.count() + failed.count(), 1, 60000);
        QCOMPARE(final.at(0).at(0).toString(), QStringLiteral("call mother"));

        recognizer.startFromFile(m_environment->path(QStringLiteral("absent.wav")));
        QTRY_COMPARE_WITH_TIMEOUT(failed.count(), 1, 60000);
        QVERIFY2(failed.at(0).at(0).toString().contains(QStringLiteral("is not a sound file")),
            qPrintable(failed.at(0).at(0).toString()));
        QSignalSpy listening(&recognizer, &Recognizer::listening);
        recognizer.startFromMicrophone();
        QVERIFY(recognizer.isRunning()); // the model loads and the microphone opens on another thread
        QTRY_COMPARE_WITH_TIMEOUT(failed.count(), 2, 60000);
        QCOMPARE(listening.count(), 0);
        QVERIFY2(failed.at(1).at(0).toString().contains(QStringLiteral("no microphone")),
            qPrintable(failed.at(1).at(0).toString()));
        QVERIFY(!recognizer.isRunning());
        QCOMPARE(final.count(), 1);
    }

    /// A stream longer than one utterance is cut at pauses and every part is kept, in order.
    void aLongStreamIsCutIntoUtterancesAndJoined()
    {
        const QString wav
            = speak(QStringLiteral("rms"), QStringLiteral("close the door"), QStringLiteral("one.wav"));
        QString error;
        const auto model = BundleRecognitionService().modelForLocale(QStringLiteral("en_US"), &error);
        QVERIFY2(model, qPrintable(error));
        const auto transcriber = Transcriber::load(*model, &error);
        QVERIFY2(transcriber, qPrintable(error));
        AudioFileReader reader(transcriber->sampleRate());
        QVERIFY2(reader.open(wav, &error), qPrintable(error));
        std::vector<qint16> samples;
        while (true) {
            const auto block = reader.read(4096, &error);
            QVERIFY2(block, qPrintable(error));
            if (block->empty()) {
                break;
            }
            samples.insert(samples.end(), block->begin(), block->end());
        }
        QVERIFY(transcriber->begin(writeGrammar(), &error));
        const std::vector<qint16> pause(size_t(transcriber->sampleRate()), 0);
        const int times = 12;
        for (int i = 0; i < times; ++i) {
            QVERIFY2(transcriber->feed(samples.data(), qsizetype(samples.size()), &error), qPrintable(error));
            QVERIFY2(transcriber->feed(pause.data(), qsizetype(pause.size()), &error), qPrintable(error));
            // Finished utterances show in the partial result as soon as their pause ended.
            QCOMPARE(transcriber->partialResult().count(QStringLiteral("close the door")), i + 1);
        }
        QStringList expected;
        for (int i = 0; i < times; ++i) {
            expected.append(QStringLiteral("close the door"));
        }
        const auto text = transcriber->finish(&error);
        QVERIFY2(text, qPrintable(error));
        QCOMPARE(*text, expected.join(QLatin1Char(' ')));
    }

    /// A long recording is read in blocks and cut into utterances; the reader never holds the file.
    void longRecordingsStreamInBlocks()
    {
        // Ten minutes of quiet noise at 8 kHz, read back at 16 kHz block by block.
        const QString path = m_environment->path(QStringLiteral("long.wav"));
        QCOMPARE(
            QProcess::execute(QStringLiteral("sox"),
                {QStringLiteral("-n"), QStringLiteral("-r"), QStringLiteral("8000"), QStringLiteral("-b"),
                    QStringLiteral("16"), path, QStringLiteral("synth"), QStringLiteral("600"),
                    QStringLiteral("whitenoise"), QStringLiteral("vol"), QStringLiteral("0.001")}),
            0);
        AudioFileReader reader(16000);
        QString error;
        QVERIFY2(reader.open(path, &error), qPrintable(error));
        QCOMPARE(std::lround(reader.durationSeconds()), 600L);
        qint64 total = 0;
        size_t largest = 0;
        for (;;) {
            const auto block = reader.read(4096, &error);
            QVERIFY2(block, qPrintable(error));
            if (block->empty()) {
                break;
            }
            largest = std::max(largest, block->size());
            total += qint64(block->size());
        }
        QVERIFY2(std::abs(total - 600 * 16000) < 1600, qPrintable(QString::number(total)));
        QVERIFY2(largest <= 8192 + 512, qPrintable(QString::number(largest)));
    }
};

QTEST_GUILESS_MAIN(DictationTest)
#include "tst_dictation.moc"
