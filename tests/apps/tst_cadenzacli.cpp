#include "TestEnvironment.h"

#include "platform/FilePreferencesStore.h"
#include "platform/Paths.h"
#include "platform/WaveFile.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QProcess>
#include <QTest>

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
        QCOMPARE(lines.size(), 14); // 18 bundles, four of them lesser qualities of another
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
            = r.out.split(QLatin1Char('\n')).filter(QStringLiteral("liesel.premium")).value(0);
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
        QCOMPARE(voices.size(), 18);
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
        const QString voice = QStringLiteral("com.vendra.speech.synthesis.voice.liesel.premium");
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

    void downloadablesRemoveAndUpgrade()
    {
        // Jonas is installed compact: its premium quality is an upgrade. Orin 1.2 is older than the
        // catalogue's.
        Result r = cadenza({QStringLiteral("downloadables"), QStringLiteral("--json")});
        QCOMPARE(r.exitCode, 0);
        QHash<QString, int> status;
        for (const auto &value : QJsonDocument::fromJson(r.out.toUtf8()).array()) {
            status.insert(value.toObject().value(QStringLiteral("identifier")).toString(),
                value.toObject().value(QStringLiteral("status")).toInt());
        }
        QCOMPARE(status.value(QStringLiteral("com.vendra.speech.synthesis.voice.jonas.premium")), 1);
        QCOMPARE(status.value(QStringLiteral("com.vendra.speech.synthesis.voice.ingrid.compact")), 2);
        // Ingrid's premium quality is the full size of her compact entry, not a voice of its own.
        QVERIFY(!status.contains(QStringLiteral("com.vendra.speech.synthesis.voice.ingrid.premium")));
        QCOMPARE(status.value(QStringLiteral("com.vendra.speech.synthesis.voice.Orin")), 1);
        QCOMPARE(status.value(QStringLiteral("en_US")), 2);
        QVERIFY(
            !status.contains(QStringLiteral("com.vendra.speech.synthesis.voice.maren.premium"))); // installed

        // A premium voice the user installed goes at once, and the log remembers it.
        const QString bundle
            = Cadenza::Platform::Paths::userVoicesFolder() + QStringLiteral("/JonasPremium.SpeechVoice");
        QDir().mkpath(bundle);
        QVERIFY(QFile::copy(QStringLiteral(CADENZA_SOURCE_DIR
                                "/data/sample-repository/voices/JonasPremium.SpeechVoice/Info.plist"),
            bundle + QStringLiteral("/Info.plist")));
        r = cadenza(
            {QStringLiteral("remove"), QStringLiteral("com.vendra.speech.synthesis.voice.jonas.premium")});
        QVERIFY2(r.exitCode == 0, qPrintable(r.err));
        QVERIFY(!QFileInfo::exists(bundle));
        Cadenza::Platform::FilePreferencesStore preferences;
        const QVariantMap log = preferences
                                    .value(QStringLiteral("SpeechDataInstallationLog"),
                                        QStringLiteral("com.vendra.speech.voice.prefs"))
                                    .toMap();
        QVERIFY(log.value(QStringLiteral("VOICEID:com.vendra.speech.synthesis.voice.jonas.premium"))
                    .toMap()
                    .contains(QStringLiteral("RemovalDate")));
        r = cadenza(
            {QStringLiteral("remove"), QStringLiteral("com.vendra.speech.synthesis.voice.maren.compact")});
        QCOMPARE(r.exitCode, 1);
        QVERIFY(r.err.contains(QStringLiteral("can be removed")));

        // The user removed it: the background policy does not fetch it again.
        r = cadenza(
            {QStringLiteral("upgrade"), QStringLiteral("com.vendra.speech.synthesis.voice.jonas.compact")});
        QCOMPARE(r.exitCode, 1);
        QCOMPARE(r.out, QStringLiteral("no\n"));
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

private:
    std::unique_ptr<TestEnvironment> m_environment;
};

QTEST_GUILESS_MAIN(CadenzaCliTest)
#include "tst_cadenzacli.moc"
