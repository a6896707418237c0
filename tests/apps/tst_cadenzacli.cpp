// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RecognizerFixture.h"
#include "TestEnvironment.h"

#include "core/SpeechNames.h"
#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/formats/WaveFile.h"
#include "core/services/FilePreferencesStore.h"
#include "protocol/InstallerProtocol.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QLocalServer>
#include <QProcess>
#include <QTest>
#include <qplatformdefs.h>

#include <sys/stat.h>

using Cadenza::Testing::RecognizerFixture;
using Cadenza::Testing::TestEnvironment;

namespace {
struct Result
{
    int exitCode = -1;
    QString out;
    QString err;
};

Result cadenza(const QStringList &arguments, const QHash<QString, QString> &extra = {})
{
    QProcess process;
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    for (auto it = extra.cbegin(); it != extra.cend(); ++it) {
        environment.insert(it.key(), it.value());
    }
    process.setProcessEnvironment(environment);
    process.start(QStringLiteral(CADENZA_CLI_PATH), arguments);
    process.closeWriteChannel();
    if (!process.waitForFinished(60000)) {
        process.kill();
        return {};
    }
    return {process.exitStatus() == QProcess::NormalExit ? process.exitCode() : -1,
        QString::fromUtf8(process.readAllStandardOutput()),
        QString::fromUtf8(process.readAllStandardError())};
}
} // namespace

class CadenzaCliTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_environment->installSampleVoices();
    }
    void cleanup() { m_environment.reset(); }

    void voicesListsTheSampleVoicesInEnglish()
    {
        const Result r = cadenza({QStringLiteral("voices")});
        QCOMPARE(r.exitCode, 0);
        const QStringList lines = r.out.split(QLatin1Char('\n'), Qt::SkipEmptyParts);
        QCOMPARE(lines.size(), 13); // 14 bundles, one of them the lesser quality of another
        const QString orin = lines.filter(QStringLiteral("voice.Orin ")).value(0);
        QVERIFY2(orin.startsWith(QLatin1Char('*')), qPrintable(orin));
        QVERIFY(orin.contains(QStringLiteral("English")));
        QVERIFY(orin.contains(QStringLiteral("United States")));
        QVERIFY(orin.contains(QStringLiteral("Male")));
        QCOMPARE(lines.filter(QRegularExpression(QStringLiteral("^\\*"))).size(), 1);
    }

    void voicesSpeaksTheSecondLanguage()
    {
        const Result r
            = cadenza({QStringLiteral("voices")}, {{QStringLiteral("LANGUAGE"), QStringLiteral("de")}});
        QCOMPARE(r.exitCode, 0);
        const QString liesel
            = r.out.split(QLatin1Char('\n')).filter(QStringLiteral("liesel.compact")).value(0);
        QVERIFY2(liesel.contains(QStringLiteral("Deutsch")), qPrintable(liesel));
        QVERIFY(liesel.contains(QStringLiteral("Deutschland")));
        QVERIFY(liesel.contains(QStringLiteral("Weiblich")));
    }

    void voicesAsJson()
    {
        const Result r
            = cadenza({QStringLiteral("voices"), QStringLiteral("--all"), QStringLiteral("--json")});
        QCOMPARE(r.exitCode, 0);
        const QJsonArray voices = QJsonDocument::fromJson(r.out.toUtf8()).array();
        QCOMPARE(voices.size(), 14);
        int defaults = 0;
        QSet<QString> languages;
        for (const auto &value : voices) {
            const QJsonObject voice = value.toObject();
            defaults += voice.value(QStringLiteral("default")).toBool() ? 1 : 0;
            languages.insert(voice.value(QStringLiteral("locale")).toString().left(2));
            QVERIFY(!voice.value(QStringLiteral("language")).toString().isEmpty());
        }
        QCOMPARE(defaults, 1);
        QVERIFY(languages.size() >= 6);
    }

    /// Each voice says which engine speaks it, and every listed voice speaks through "say".
    void everyListedVoiceSaysItsEngineAndSpeaks()
    {
        const Result r
            = cadenza({QStringLiteral("voices"), QStringLiteral("--all"), QStringLiteral("--json")});
        QCOMPARE(r.exitCode, 0);
        const QJsonArray voices = QJsonDocument::fromJson(r.out.toUtf8()).array();
        QVERIFY(!voices.isEmpty());
        QSet<QString> engines;
        for (const auto &value : voices) {
            const QJsonObject voice = value.toObject();
            const QString identifier = voice.value(QStringLiteral("identifier")).toString();
            const QString engine = voice.value(QStringLiteral("engine")).toString();
            engines.insert(engine);
            QVERIFY2(voice.value(QStringLiteral("engineInstalled")).toBool(), qPrintable(identifier));
            if (identifier.endsWith(QStringLiteral("maren.premium"))) {
                QCOMPARE(engine, QStringLiteral("flite"));
            } else {
                QCOMPARE(engine, QStringLiteral("espeak-ng"));
            }
            const QString path = m_environment->path(QStringLiteral("voice.wav"));
            QFile::remove(path);
            const Result said = cadenza({QStringLiteral("say"), QStringLiteral("--voice"), identifier,
                QStringLiteral("--output"), path, QStringLiteral("One, two, three.")});
            QVERIFY2(said.exitCode == 0, qPrintable(identifier + QLatin1Char(' ') + said.err));
            QString error;
            const auto audio = Cadenza::Platform::WaveFile::read(path, &error);
            QVERIFY2(
                audio && audio->rootMeanSquare() > 300.0, qPrintable(identifier + QLatin1Char(' ') + error));
        }
        QCOMPARE(engines, (QSet<QString> {QStringLiteral("espeak-ng"), QStringLiteral("flite")}));
    }

    /// An upgrade must be heard: the premium quality is the flite voice, not its compact twin again.
    void premiumAndCompactQualitiesDiffer()
    {
        const QString text = QStringLiteral("Hello, my name is Maren.");
        QByteArray rendered[2];
        int index = 0;
        for (const QString &quality : {QStringLiteral("compact"), QStringLiteral("premium")}) {
            const QString path = m_environment->path(quality + QStringLiteral(".wav"));
            const Result said = cadenza({QStringLiteral("say"), QStringLiteral("--voice"),
                QStringLiteral("com.vendra.speech.synthesis.voice.maren.") + quality,
                QStringLiteral("--output"), path, text});
            QVERIFY2(said.exitCode == 0, qPrintable(said.err));
            QFile file(path);
            QVERIFY(file.open(QIODevice::ReadOnly));
            rendered[index++] = file.readAll();
            QString error;
            const auto audio = Cadenza::Platform::WaveFile::read(path, &error);
            QVERIFY2(audio, qPrintable(error));
            // espeak-ng renders at 22050 Hz, the flite voices at 16000 Hz.
            QCOMPARE(audio->sampleRate, quality == u"premium" ? 16000 : 22050);
        }
        QVERIFY(rendered[0] != rendered[1]);
    }

    void sayWritesAudibleSpeech()
    {
        const QString path = m_environment->path(QStringLiteral("x.wav"));
        const Result r
            = cadenza({QStringLiteral("say"), QStringLiteral("--output"), path, QStringLiteral("Hello")});
        QVERIFY2(r.exitCode == 0, qPrintable(r.err));
        QString error;
        const auto audio = Cadenza::Platform::WaveFile::read(path, &error);
        QVERIFY2(audio, qPrintable(error));
        QVERIFY(audio->durationSeconds() > 0.2);
        QVERIFY(audio->rootMeanSquare() > 300.0);
    }

    void sayWithAChosenVoiceAndRate()
    {
        const QString slow = m_environment->path(QStringLiteral("slow.wav"));
        const QString fast = m_environment->path(QStringLiteral("fast.wav"));
        const QString text = QStringLiteral("Guten Tag, wie geht es Ihnen heute?");
        const QString voice = QStringLiteral("com.vendra.speech.synthesis.voice.liesel.compact");
        QCOMPARE(cadenza({QStringLiteral("say"), QStringLiteral("--voice"), voice, QStringLiteral("--rate"),
                             QStringLiteral("100"), QStringLiteral("--output"), slow, text})
                     .exitCode,
            0);
        QCOMPARE(cadenza({QStringLiteral("say"), QStringLiteral("--voice"), voice, QStringLiteral("--rate"),
                             QStringLiteral("400"), QStringLiteral("--output"), fast, text})
                     .exitCode,
            0);
        QString error;
        const double slowSeconds = Cadenza::Platform::WaveFile::read(slow, &error)->durationSeconds();
        const double fastSeconds = Cadenza::Platform::WaveFile::read(fast, &error)->durationSeconds();
        QVERIFY2(slowSeconds > 2.0 * fastSeconds,
            qPrintable(QStringLiteral("%1 vs %2").arg(slowSeconds).arg(fastSeconds)));
    }

    void badInputIsRefusedClearly()
    {
        Result r = cadenza({QStringLiteral("say"), QStringLiteral("--voice"), QStringLiteral("nobody"),
            QStringLiteral("Hi")});
        QCOMPARE(r.exitCode, 1);
        QVERIFY(r.err.contains(QStringLiteral("no installed voice 'nobody'")));
        r = cadenza(
            {QStringLiteral("say"), QStringLiteral("--rate"), QStringLiteral("fast"), QStringLiteral("Hi")});
        QCOMPARE(r.exitCode, 2);
        QVERIFY(r.err.contains(QStringLiteral("--rate")));
        r = cadenza({QStringLiteral("frobnicate")});
        QCOMPARE(r.exitCode, 2);
        QVERIFY(r.err.contains(QStringLiteral("unknown command 'frobnicate'")));
        r = cadenza({QStringLiteral("voices"), QStringLiteral("--bogus")});
        QCOMPARE(r.exitCode, 2);
        r = cadenza({});
        QCOMPARE(r.exitCode, 2);
    }

    void languagesListsTheCatalogue()
    {
        const Result r = cadenza({QStringLiteral("languages"), QStringLiteral("--json")});
        QCOMPARE(r.exitCode, 0);
        const QJsonArray languages = QJsonDocument::fromJson(r.out.toUtf8()).array();
        // The sample repository offers only languages with a real model: US English. None is installed.
        QCOMPARE(languages.size(), 1);
        const QJsonObject first = languages.first().toObject();
        QCOMPARE(first.value(QStringLiteral("kind")).toString(), QStringLiteral("downloadable"));
        QCOMPARE(first.value(QStringLiteral("locale")).toString(), QStringLiteral("en_US"));
        QCOMPARE(first.value(QStringLiteral("title")).toString(), QStringLiteral("English (United States)"));
        QCOMPARE(first.value(QStringLiteral("visibility")).toInt(), 2);
        QCOMPARE(first.value(QStringLiteral("tag")).toString(), QStringLiteral("SRCLANGID:en_US"));
        // Tens of megabytes: the model itself, not a placeholder.
        QVERIFY2(first.value(QStringLiteral("size")).toString().toLongLong() > 20'000'000,
            qPrintable(first.value(QStringLiteral("size")).toString()));
    }

    void bundlesThatNameNoLanguageAreLeftOut()
    {
        // A recognizer (with a model its engine accepts) and a voice whose locale is "_": listing
        // languages or voices used to stop the whole process for want of a language name.
        const Result before = cadenza({QStringLiteral("languages"), QStringLiteral("--json")});
        QCOMPARE(before.exitCode, 0);
        RecognizerFixture::writeTinyBundle(Cadenza::Platform::Paths::userRecognizersFolder(),
            QStringLiteral("_"), QStringLiteral("_.SpeechRecognition"));
        TestEnvironment::writeVoiceBundle(Cadenza::Platform::Paths::userVoicesFolder(),
            QStringLiteral("Nobody"),
            TestEnvironment::voiceAttributes(
                QStringLiteral("com.example.voice.nobody"), QStringLiteral("Nobody"), QStringLiteral("_")));

        Result r = cadenza({QStringLiteral("languages"), QStringLiteral("--json")});
        QVERIFY2(r.exitCode == 0, qPrintable(r.err));
        QVERIFY2(r.err.contains(QStringLiteral("_.SpeechRecognition")), qPrintable(r.err));
        const QJsonArray languages = QJsonDocument::fromJson(r.out.toUtf8()).array();
        QCOMPARE(languages, QJsonDocument::fromJson(before.out.toUtf8()).array());
        for (const QJsonValue &language : languages) {
            QVERIFY(
                !language.toObject().value(QStringLiteral("locale")).toString().startsWith(QLatin1Char('_')));
        }

        r = cadenza({QStringLiteral("voices")});
        QVERIFY2(r.exitCode == 0, qPrintable(r.err));
        QVERIFY2(r.err.contains(QStringLiteral("Nobody")), qPrintable(r.err));
        QVERIFY(!r.out.contains(QStringLiteral("nobody")));
        QCOMPARE(r.out.split(QLatin1Char('\n'), Qt::SkipEmptyParts).size(), 13);
    }

    void downloadablesRemoveAndUpgrade()
    {
        // Orin 1.2 is older than the catalogue's: an upgrade. Tobias is downloadable in two sizes, one entry.
        Result r = cadenza({QStringLiteral("downloadables"), QStringLiteral("--json")});
        QCOMPARE(r.exitCode, 0);
        QHash<QString, int> status;
        for (const auto &value : QJsonDocument::fromJson(r.out.toUtf8()).array()) {
            const QString identifier = value.toObject().value(QStringLiteral("identifier")).toString();
            status.insert(identifier, value.toObject().value(QStringLiteral("status")).toInt());
        }
        QCOMPARE(status.value(Cadenza::SpeechNames::OrinIdentifier),
            int(Cadenza::InstallerProtocol::UpgradeAvailableStatus));
        QCOMPARE(status.value(QStringLiteral("com.vendra.speech.synthesis.voice.tobias.compact")),
            int(Cadenza::InstallerProtocol::NotInstalledStatus));
        QCOMPARE(status.value(QStringLiteral("com.vendra.speech.synthesis.voice.ingrid.compact")),
            int(Cadenza::InstallerProtocol::NotInstalledStatus));
        // Tobias's premium quality is the full size of his compact entry, not a voice of its own; the
        // voices of other languages have no premium quality at all.
        QVERIFY(!status.contains(QStringLiteral("com.vendra.speech.synthesis.voice.tobias.premium")));
        for (auto it = status.cbegin(); it != status.cend(); ++it) {
            QVERIFY2(!it.key().endsWith(QStringLiteral(".premium")), qPrintable(it.key()));
        }
        QCOMPARE(status.value(QStringLiteral("en_US")), int(Cadenza::InstallerProtocol::NotInstalledStatus));
        QVERIFY(
            !status.contains(QStringLiteral("com.vendra.speech.synthesis.voice.maren.premium"))); // installed

        // A premium voice the user installed goes at once, and the log remembers it.
        const QString bundle
            = Cadenza::Platform::Paths::userVoicesFolder() + QStringLiteral("/TobiasPremium.SpeechVoice");
        QDir().mkpath(bundle);
        QVERIFY(QFile::copy(
            QStringLiteral(CADENZA_SAMPLE_REPOSITORY_BUNDLES "/voices/TobiasPremium.SpeechVoice/Info.plist"),
            bundle + QStringLiteral("/Info.plist")));
        r = cadenza(
            {QStringLiteral("remove"), QStringLiteral("com.vendra.speech.synthesis.voice.tobias.premium")});
        QVERIFY2(r.exitCode == 0, qPrintable(r.err));
        QVERIFY(!QFileInfo::exists(bundle));
        Cadenza::Platform::FilePreferencesStore preferences;
        const QVariantMap log = preferences
                                    .value(QStringLiteral("SpeechDataInstallationLog"),
                                        Cadenza::SpeechNames::VoicePreferencesDomain)
                                    .toMap();
        QVERIFY(log.value(QStringLiteral("VOICEID:com.vendra.speech.synthesis.voice.tobias.premium"))
                    .toMap()
                    .contains(QStringLiteral("RemovalDate")));
        r = cadenza(
            {QStringLiteral("remove"), QStringLiteral("com.vendra.speech.synthesis.voice.maren.compact")});
        QCOMPARE(r.exitCode, 1);
        QVERIFY(r.err.contains(QStringLiteral("can be removed")));
    }

    void everyCommandHasHelp()
    {
        for (const QString &command : {QStringLiteral("voices"), QStringLiteral("say"),
                 QStringLiteral("languages"), QStringLiteral("status"), QStringLiteral("install"),
                 QStringLiteral("cancel"), QStringLiteral("post")}) {
            const Result r = cadenza({command, QStringLiteral("--help")});
            QCOMPARE(r.exitCode, 0);
            QVERIFY(r.out.contains(QStringLiteral("Usage: cadenza ") + command));
        }
        QCOMPARE(cadenza({QStringLiteral("--help")}).exitCode, 0);
    }

    void noVoicesIsNoError()
    {
        TestEnvironment empty; // a world without voices
        const Result r = cadenza({QStringLiteral("voices")});
        QCOMPARE(r.exitCode, 0);
        QVERIFY(r.out.isEmpty());
        QVERIFY(r.err.contains(QStringLiteral("No voices")));
        QCOMPARE(cadenza({QStringLiteral("say"), QStringLiteral("Hi")}).exitCode, 1);
    }

    void badCommandLinesAreRefusedByName_data()
    {
        QTest::addColumn<QStringList>("arguments");
        QTest::addColumn<int>("exitCode");
        QTest::addColumn<QString>("message");
        const QString longTag = QStringLiteral("VOICEID:") + QString(1100, QLatin1Char('x'));
        QTest::newRow("languages operand") << QStringList {QStringLiteral("languages"),
            QStringLiteral("extra")} << 2 << QStringLiteral("unexpected argument 'extra'");
        QTest::newRow("status operand") << QStringList {QStringLiteral("status"), QStringLiteral("now")} << 2
                                        << QStringLiteral("unexpected argument 'now'");
        QTest::newRow("downloadables operand") << QStringList {QStringLiteral("downloadables"),
            QStringLiteral("all")} << 2 << QStringLiteral("unexpected argument 'all'");
        QTest::newRow("power operand") << QStringList {QStringLiteral("power"), QStringLiteral("on")} << 2
                                       << QStringLiteral("unexpected argument 'on'");
        QTest::newRow("voices operand") << QStringList {QStringLiteral("voices"), QStringLiteral("x")} << 2
                                        << QStringLiteral("unexpected argument 'x'");
        QTest::newRow("cancel operand") << QStringList {QStringLiteral("cancel"), QStringLiteral("SOMETHING")}
                                        << 2 << QStringLiteral("unexpected argument 'SOMETHING'");
        QTest::newRow("install two tags") << QStringList {QStringLiteral("install"), QStringLiteral("a"),
            QStringLiteral("b")} << 2 << QStringLiteral("unexpected argument 'b'");
        QTest::newRow("empty tag") << QStringList {QStringLiteral("install"), QString()} << 2
                                   << QStringLiteral("the tag is empty");
        QTest::newRow("long tag") << QStringList {QStringLiteral("install"), longTag} << 2
                                  << QStringLiteral("the tag is longer than 1024 characters");
        QTest::newRow("unknown option") << QStringList {QStringLiteral("voices"), QStringLiteral("--bogus")}
                                        << 2 << QStringLiteral("unknown option '--bogus'");
        QTest::newRow("missing value")
            << QStringList {QStringLiteral("say"), QStringLiteral("--rate")} << 2 << QStringLiteral("rate");
        for (const QString &rate : {QStringLiteral("nan"), QStringLiteral("inf"), QStringLiteral("-inf"),
                 QStringLiteral("-100"), QStringLiteral("0"), QStringLiteral("1e9")}) {
            QTest::addRow("rate %s", qPrintable(rate))
                << QStringList {QStringLiteral("say"), QStringLiteral("--rate"), rate, QStringLiteral("Hi")}
                << 2 << QStringLiteral("not '%1'").arg(rate);
        }
    }
    void badCommandLinesAreRefusedByName()
    {
        QFETCH(QStringList, arguments);
        QFETCH(int, exitCode);
        QFETCH(QString, message);
        const Result r = cadenza(arguments);
        QCOMPARE(r.exitCode, exitCode);
        QVERIFY2(r.err.contains(message), qPrintable(r.err));
        QVERIFY(r.out.isEmpty());
    }

    void withoutADaemonTheExitStatusIsThree()
    {
        for (const QStringList &arguments :
            {QStringList {QStringLiteral("status")}, QStringList {QStringLiteral("cancel")},
                QStringList {QStringLiteral("install"), QStringLiteral("SRCLANGID:de_DE")}}) {
            const Result r = cadenza(arguments);
            QCOMPARE(r.exitCode, 3);
            QVERIFY2(r.err.contains(QStringLiteral("installer daemon")), qPrintable(r.err));
        }
        // A socket left by a daemon that died is no daemon.
        QDir().mkpath(Cadenza::Platform::Paths::runtimeFolder());
        QLocalServer dead;
        QVERIFY(dead.listen(
            Cadenza::Platform::Paths::runtimeFolder() + QStringLiteral("/com.vendra.speech.quillond")));
        const QString path = dead.fullServerName();
        dead.close();
        QFile stale(path);
        QVERIFY(stale.open(QIODevice::WriteOnly)); // a file where the socket was
        stale.close();
        QCOMPARE(cadenza({QStringLiteral("status")}).exitCode, 3);
        QVERIFY(cadenza({QStringLiteral("--help")}).out.contains(QStringLiteral("3 the installer daemon")));
    }

    void outputGoesIntoDevicesAndFifosAndRefusesFolders()
    {
        // A character device is written, never replaced.
        Result r = cadenza({QStringLiteral("say"), QStringLiteral("--output"), QStringLiteral("/dev/null"),
            QStringLiteral("Hello")});
        QVERIFY2(r.exitCode == 0, qPrintable(r.err));
        QT_STATBUF st;
        QCOMPARE(QT_STAT("/dev/null", &st), 0);
        QVERIFY(S_ISCHR(st.st_mode));

        // A FIFO is written in place: its reader gets a whole WAV file, and it stays a FIFO.
        const QString fifo = m_environment->path(QStringLiteral("speech.fifo"));
        QCOMPARE(::mkfifo(QFile::encodeName(fifo).constData(), 0600), 0);
        QProcess reader;
        reader.start(QStringLiteral("cat"), {fifo});
        QVERIFY(reader.waitForStarted());
        // Until the reader is there, a FIFO nobody reads is refused rather than waited on.
        for (int attempt = 0; attempt < 50; ++attempt) {
            r = cadenza({QStringLiteral("say"), QStringLiteral("--output"), fifo, QStringLiteral("Hello")});
            if (r.exitCode == 0 || !r.err.contains(QStringLiteral("nobody reads"))) {
                break;
            }
            QTest::qWait(100);
        }
        QVERIFY2(r.exitCode == 0, qPrintable(r.err));
        QVERIFY(reader.waitForFinished(10000));
        const QByteArray wav = reader.readAllStandardOutput();
        QVERIFY(wav.startsWith("RIFF"));
        QVERIFY(wav.size() > 10000);
        QVERIFY(QFileInfo(fifo).exists() && !QFileInfo(fifo).isFile());
        QCOMPARE(QT_STAT(QFile::encodeName(fifo).constData(), &st), 0);
        QVERIFY(S_ISFIFO(st.st_mode));

        // A folder is refused by name, and left as it was.
        const QString folder = m_environment->path(QStringLiteral("folder"));
        QVERIFY(QDir().mkpath(folder + QStringLiteral("/inside")));
        r = cadenza({QStringLiteral("say"), QStringLiteral("--output"), folder, QStringLiteral("Hello")});
        QCOMPARE(r.exitCode, 2);
        QVERIFY2(r.err.contains(folder + QStringLiteral(" is a folder")), qPrintable(r.err));
        QVERIFY(QFileInfo(folder + QStringLiteral("/inside")).isDir());

        // A regular file is replaced whole; a symbolic link to one stays a link to the new file.
        const QString file = m_environment->path(QStringLiteral("old.wav"));
        QFile old(file);
        QVERIFY(old.open(QIODevice::WriteOnly));
        old.write("old");
        old.close();
        const QString link = m_environment->path(QStringLiteral("link.wav"));
        QVERIFY(QFile::link(file, link));
        r = cadenza({QStringLiteral("say"), QStringLiteral("--output"), link, QStringLiteral("Hello")});
        QVERIFY2(r.exitCode == 0, qPrintable(r.err));
        QVERIFY(QFileInfo(link).isSymLink());
        QVERIFY(QFileInfo(file).size() > 10000);
        QVERIFY(QDir(m_environment->root())
                    .entryList({QStringLiteral("*.wav*")}, QDir::Files | QDir::Hidden | QDir::System)
                    .size()
            == 2); // no temporary file left beside them
    }

    void languagesListsAnInstalledLanguageOnce()
    {
        // US English is in the catalogue; once installed it must not be offered again.
        RecognizerFixture::writeTinyBundle(
            Cadenza::Platform::Paths::userRecognizersFolder(), QStringLiteral("en_US"));
        const Result r = cadenza({QStringLiteral("languages"), QStringLiteral("--json")});
        QCOMPARE(r.exitCode, 0);
        int englishLines = 0;
        QString kind;
        for (const auto &value : QJsonDocument::fromJson(r.out.toUtf8()).array()) {
            if (value.toObject().value(QStringLiteral("locale")).toString() == u"en_US") {
                ++englishLines;
                kind = value.toObject().value(QStringLiteral("kind")).toString();
            }
        }
        QCOMPARE(englishLines, 1);
        QCOMPARE(kind, QStringLiteral("installed"));
    }

    void messagesFollowTheUsersLanguage()
    {
        const QHash<QString, QString> german {{QStringLiteral("LANGUAGE"), QStringLiteral("de_DE")}};
        Result r = cadenza({QStringLiteral("frobnicate")}, german);
        QCOMPARE(r.exitCode, 2);
        QVERIFY2(r.err.contains(QStringLiteral("unbekannter Befehl „frobnicate“")), qPrintable(r.err));
        QVERIFY(r.err.contains(QStringLiteral("Befehle:")));
        r = cadenza({QStringLiteral("status")}, german);
        QCOMPARE(r.exitCode, 3);
        QVERIFY2(r.err.contains(QStringLiteral("Der Installationsdienst läuft nicht.")), qPrintable(r.err));
        r = cadenza({QStringLiteral("cancel"), QStringLiteral("alles")}, german);
        QVERIFY2(r.err.contains(QStringLiteral("unerwartetes Argument „alles“")), qPrintable(r.err));
        r = cadenza({QStringLiteral("voices"), QStringLiteral("--help")}, german);
        QVERIFY2(r.out.contains(QStringLiteral("Listet die installierten Stimmen auf")), qPrintable(r.out));
        QVERIFY2(
            r.out.startsWith(QStringLiteral("Aufruf: cadenza voices")), qPrintable(r.out)); // Qt's words too
        r = cadenza({QStringLiteral("languages")}, german);
        QVERIFY2(r.out.contains(QStringLiteral("ladbar")), qPrintable(r.out));
    }

private:
    std::unique_ptr<TestEnvironment> m_environment;
};

QTEST_GUILESS_MAIN(CadenzaCliTest)
#include "tst_cadenzacli.moc"
