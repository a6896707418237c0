// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "FliteVoiceFile.h"
#include "core/engines/SpeechEngine.h"
#include "core/engines/SpeechEngines.h"
#include "core/files/Paths.h"
#include "core/formats/WaveFile.h"
#include "core/services/BundleSpeechSynthesisService.h"

#include <QDir>
#include <QFile>
#include <QProcess>
#include <QTest>

#include <algorithm>
#include <cmath>
#include <numeric>

using namespace Cadenza::Platform;
using Cadenza::Engines::FliteVoiceFile;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString P = QStringLiteral("com.vendra.speech.synthesis.voice.");
const QString Text
    = QStringLiteral("The quick brown fox jumps over the lazy dog. A rainbow appears after the rain.");

/// The median fundamental frequency of the voiced frames, by normalised autocorrelation.
double medianPitch(const PcmAudio &audio)
{
    const int rate = audio.sampleRate;
    const int frame = rate * 40 / 1000, hop = rate / 100, shortest = rate / 400, longest = rate / 60;
    const auto &s = audio.samples;
    std::vector<double> pitches;
    for (size_t start = 0; start + frame + longest < s.size(); start += hop) {
        double energy = 0;
        for (int i = 0; i < frame; ++i) {
            energy += double(s[start + i]) * s[start + i];
        }
        if (energy / frame < 1e5) {
            continue;
        }
        double best = 0;
        int bestLag = 0;
        for (int lag = shortest; lag <= longest; ++lag) {
            double product = 0, lagged = 0;
            for (int i = 0; i < frame; ++i) {
                product += double(s[start + i]) * s[start + i + lag];
                lagged += double(s[start + i + lag]) * s[start + i + lag];
            }
            const double r = product / std::sqrt(energy * lagged + 1);
            if (r > best) {
                best = r;
                bestLag = lag;
            }
        }
        if (best > 0.6) {
            pitches.push_back(double(rate) / bestLag);
        }
    }
    if (pitches.empty()) {
        return 0;
    }
    std::nth_element(pitches.begin(), pitches.begin() + pitches.size() / 2, pitches.end());
    return pitches[pitches.size() / 2];
}
} // namespace

class SpeechEnginesTest : public QObject
{
    Q_OBJECT

    std::optional<PcmAudio> render(
        BundleSpeechSynthesisService &service, const SpeechRequest &request, QString *error)
    {
        const QString path = m_environment->path(QStringLiteral("out.wav"));
        QFile::remove(path);
        if (!service.renderToFile(request, path, error)) {
            return std::nullopt;
        }
        return WaveFile::read(path, error);
    }

    void installVoices()
    {
        const QString folder = Paths::userVoicesFolder();
        TestEnvironment::writeFliteVoiceBundle(folder, QStringLiteral("Slt"),
            TestEnvironment::voiceAttributes(
                P + QStringLiteral("slt"), QStringLiteral("Slt"), QStringLiteral("en_US")));
        TestEnvironment::writeFliteVoiceBundle(folder, QStringLiteral("Rms"),
            TestEnvironment::voiceAttributes(P + QStringLiteral("rms"), QStringLiteral("Rms"),
                QStringLiteral("en_US"), QStringLiteral("VoiceGenderMale")),
            QStringLiteral("rms"));
        TestEnvironment::writeVoiceBundle(folder, QStringLiteral("Espeak"),
            TestEnvironment::voiceAttributes(
                P + QStringLiteral("espeak"), QStringLiteral("Espeak"), QStringLiteral("en_US")));
    }

    QString voiceFile(const QString &bundle, const QString &voice = QStringLiteral("slt"))
    {
        return Paths::userVoicesFolder() + QLatin1Char('/') + bundle
            + QStringLiteral(".SpeechVoice/Resources/cmu_us_%1.flitevox").arg(voice);
    }

private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        installVoices();
    }
    void cleanup() { m_environment.reset(); }

    void bothEnginesAreFoundInTheBuildTree()
    {
        const QStringList engines = SpeechEngines::availableEngines();
        QVERIFY2(engines.contains(QStringLiteral("espeak-ng")), qPrintable(engines.join(u' ')));
        QVERIFY2(engines.contains(QStringLiteral("flite")), qPrintable(engines.join(u' ')));
    }

    void fliteVoicesSpeakFromTheirBundles()
    {
        BundleSpeechSynthesisService service;
        const auto voice = service.voice(P + QStringLiteral("slt"));
        QVERIFY(voice);
        QCOMPARE(voice->engineName, QStringLiteral("flite"));
        QString error;
        const auto audio = render(service, {Text, P + QStringLiteral("slt")}, &error);
        QVERIFY2(audio, qPrintable(error));
        QCOMPARE(audio->sampleRate, 16000);
        QVERIFY(audio->durationSeconds() > 2.0);
        QVERIFY2(audio->rootMeanSquare() > 1000.0, qPrintable(QString::number(audio->rootMeanSquare())));
        // slt is a woman's voice, rms a man's: each keeps its own pitch.
        const double female = medianPitch(*audio);
        const auto male = render(service, {Text, P + QStringLiteral("rms")}, &error);
        QVERIFY2(male, qPrintable(error));
        QVERIFY2(female > 140 && medianPitch(*male) < 130,
            qPrintable(QStringLiteral("%1 %2").arg(female).arg(medianPitch(*male))));
    }

    void bothEnginesHandOutBlocksAndStopBetweenThem_data()
    {
        QTest::addColumn<QString>("voice");
        QTest::newRow("espeak-ng") << QStringLiteral("espeak");
        QTest::newRow("flite") << QStringLiteral("slt");
    }
    /// The audio comes in many blocks, which together are the whole render; a sink that refuses a
    /// block ends the render there.
    void bothEnginesHandOutBlocksAndStopBetweenThem()
    {
        QFETCH(QString, voice);
        BundleSpeechSynthesisService service;
        const auto description = service.voice(P + voice);
        QVERIFY(description);
        QString error;
        SpeechEngine *engine = SpeechEngines::engine(description->engineName, &error);
        QVERIFY2(engine, qPrintable(error));
        SynthesisParameters parameters;
        parameters.wordsPerMinute = parameters.normalWordsPerMinute = description->engineRate;
        parameters.pitch = parameters.normalPitch = description->enginePitch;
        const QString text = Text + QLatin1Char(' ') + Text;

        const auto whole = engine->render(*description, text, parameters, &error);
        QVERIFY2(whole && whole->durationSeconds() > 4.0, qPrintable(error));
        std::vector<qsizetype> blocks;
        QVERIFY2(engine->renderBlocks(
                     *description, text, parameters,
                     [&](const qint16 *, qsizetype count, int sampleRate) {
                         blocks.push_back(sampleRate == whole->sampleRate ? count : -1);
                         return true;
                     },
                     &error),
            qPrintable(error));
        QVERIFY2(blocks.size() >= 20, qPrintable(QString::number(blocks.size())));
        QCOMPARE(std::count(blocks.cbegin(), blocks.cend(), -1), 0);
        // No block holds more than a fifth of a second.
        QVERIFY(*std::max_element(blocks.cbegin(), blocks.cend()) <= whole->sampleRate / 5);
        const qsizetype total = std::accumulate(blocks.cbegin(), blocks.cend(), qsizetype(0));
        QVERIFY2(std::abs(double(total) / double(whole->samples.size()) - 1.0) < 0.05,
            qPrintable(QStringLiteral("%1 of %2").arg(total).arg(whole->samples.size())));

        int calls = 0;
        QVERIFY2(engine->renderBlocks(
                     *description, text, parameters,
                     [&](const qint16 *, qsizetype, int) {
                         ++calls;
                         return calls < 2;
                     },
                     &error),
            qPrintable(error));
        QCOMPARE(calls, 2);
        // The engine speaks again after a stop.
        const auto again = engine->render(*description, Text, parameters, &error);
        QVERIFY2(again && again->durationSeconds() > 2.0, qPrintable(error));
    }

    void rateChangesBothEngines_data()
    {
        QTest::addColumn<QString>("voice");
        QTest::newRow("espeak-ng") << QStringLiteral("espeak");
        QTest::newRow("flite") << QStringLiteral("slt");
    }
    void rateChangesBothEngines()
    {
        QFETCH(QString, voice);
        BundleSpeechSynthesisService service;
        QString error;
        SpeechRequest request {Text, P + voice};
        request.wordsPerMinute = 120;
        const auto slow = render(service, request, &error);
        request.wordsPerMinute = 300;
        const auto fast = render(service, request, &error);
        QVERIFY2(slow && fast, qPrintable(error));
        // 2.5 times the words per minute: well under half the time on both engines.
        const double ratio = fast->durationSeconds() / slow->durationSeconds();
        QVERIFY2(ratio > 0.3 && ratio < 0.55, qPrintable(QString::number(ratio)));
    }

    void pitchChangesBothEngines_data() { rateChangesBothEngines_data(); }
    void pitchChangesBothEngines()
    {
        QFETCH(QString, voice);
        BundleSpeechSynthesisService service;
        QString error;
        SpeechRequest request {Text, P + voice};
        request.pitch = 30;
        const auto low = render(service, request, &error);
        request.pitch = 80;
        const auto high = render(service, request, &error);
        QVERIFY2(low && high, qPrintable(error));
        // 50 steps apart on the shared scale: about 1.4 times the pitch on either engine.
        const double ratio = medianPitch(*high) / medianPitch(*low);
        QVERIFY2(ratio > 1.25 && ratio < 1.8, qPrintable(QString::number(ratio)));
    }

    void pitchOfAVoiceWithAnAccentModelFollowsTheScale()
    {
        BundleSpeechSynthesisService service;
        QString error;
        SpeechRequest request {Text, P + QStringLiteral("rms")};
        const auto own = render(service, request, &error);
        request.pitch = 90;
        const auto high = render(service, request, &error);
        QVERIFY2(own && high, qPrintable(error));
        const double ratio = medianPitch(*high) / medianPitch(*own);
        QVERIFY2(ratio > 1.3, qPrintable(QString::number(ratio)));
    }

    void volumeScalesBothEngines_data() { rateChangesBothEngines_data(); }
    void volumeScalesBothEngines()
    {
        QFETCH(QString, voice);
        BundleSpeechSynthesisService service;
        QString error;
        SpeechRequest request {Text, P + voice};
        const auto loud = render(service, request, &error);
        request.volume = 0.5;
        const auto soft = render(service, request, &error);
        QVERIFY2(loud && soft, qPrintable(error));
        const double ratio = soft->rootMeanSquare() / loud->rootMeanSquare();
        QVERIFY2(ratio > 0.4 && ratio < 0.6, qPrintable(QString::number(ratio)));
    }

    void damagedVoiceFilesFailClearlyAndOthersKeepSpeaking_data()
    {
        QTest::addColumn<QString>("damage");
        QTest::addColumn<QString>("expected");
        QTest::newRow("truncated") << QStringLiteral("truncate")
                                   << QStringLiteral("is damaged: 100000 bytes");
        QTest::newRow("flipped byte") << QStringLiteral("flip") << QStringLiteral("SHA-256 differs");
        QTest::newRow("missing") << QStringLiteral("remove") << QStringLiteral("cannot read the voice file");
    }
    void damagedVoiceFilesFailClearlyAndOthersKeepSpeaking()
    {
        QFETCH(QString, damage);
        QFETCH(QString, expected);
        QFile file(voiceFile(QStringLiteral("Slt")));
        QVERIFY(file.open(QIODevice::ReadWrite));
        QByteArray data = file.readAll();
        file.close();
        if (damage == u"truncate") {
            QVERIFY(file.resize(100000));
        } else if (damage == u"flip") {
            data[1200000] = char(data[1200000] ^ 0x5a);
            QVERIFY(file.open(QIODevice::WriteOnly | QIODevice::Truncate));
            file.write(data);
            file.close();
        } else {
            QVERIFY(file.remove());
        }
        BundleSpeechSynthesisService service;
        QString error;
        QVERIFY(!render(service, {Text, P + QStringLiteral("slt")}, &error));
        QVERIFY2(error.contains(QStringLiteral("the voice 'Slt' cannot speak")) && error.contains(expected),
            qPrintable(error));
        for (const QString &other : {QStringLiteral("rms"), QStringLiteral("espeak")}) {
            const auto audio = render(service, {Text, P + other}, &error);
            QVERIFY2(audio && audio->rootMeanSquare() > 300.0, qPrintable(error));
        }
    }

    void headerOfARealVoiceFileReads()
    {
        QFile file(voiceFile(QStringLiteral("Slt")));
        QVERIFY(file.open(QIODevice::ReadOnly));
        QString error;
        const auto header = FliteVoiceFile::readHeader(file.readAll(), &error);
        QVERIFY2(header, qPrintable(error));
        QCOMPARE(header->voiceName, QByteArray("cmu_us_slt"));
        QCOMPARE(header->features.value("language"), QByteArray("eng"));
    }

    void damagedHeadersAreRefused_data()
    {
        QTest::addColumn<int>("offset");
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<QString>("expected");
        QTest::newRow("magic") << 0 << QByteArray("XMU") << QStringLiteral("does not start with");
        QTest::newRow("byte order") << 26 << QByteArray("\x00\x00\x00\x01", 4)
                                    << QStringLiteral("byte order");
        QTest::newRow("huge length") << 30 << QByteArray("\xff\xff\xff\x7f", 4)
                                     << QStringLiteral("impossible length");
        QTest::newRow("negative length")
            << 30 << QByteArray("\xf0\xff\xff\xff", 4) << QStringLiteral("impossible length");
        QTest::newRow("unterminated") << 42 << QByteArray("X") << QStringLiteral("not terminated");
        QTest::newRow("language") << 47 << QByteArray("fra") << QStringLiteral("language 'fra'");
    }
    void damagedHeadersAreRefused()
    {
        QFETCH(int, offset);
        QFETCH(QByteArray, bytes);
        QFETCH(QString, expected);
        QFile file(voiceFile(QStringLiteral("Slt")));
        QVERIFY(file.open(QIODevice::ReadOnly));
        QByteArray data = file.readAll();
        data.replace(offset, bytes.size(), bytes);
        QString error;
        QVERIFY(!FliteVoiceFile::readHeader(data, &error));
        QVERIFY2(error.contains(expected), qPrintable(error));
        // Every prefix of the header fails cleanly too.
        for (int length = 0; length < 400; ++length) {
            QVERIFY(!FliteVoiceFile::readHeader(QByteArrayView(data).first(length), &error));
        }
    }

    /// Without the flite plugin, its voices are listed, refuse to speak with a readable error, and the
    /// espeak-ng voices keep speaking. Run in a process of its own, whose plugin folder holds espeak-ng only.
    void missingPluginIsListedAndRefusesToSpeak()
    {
        const QString plugins = m_environment->path(QStringLiteral("plugins"));
        QVERIFY(QDir().mkpath(plugins));
        QVERIFY(QFile::link(QStringLiteral(CADENZA_BUILD_PLUGIN_DIR "/cadenza_espeak_ng.so"),
            plugins + QStringLiteral("/cadenza_espeak_ng.so")));
        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        environment.insert(QStringLiteral("CADENZA_PLUGIN_PATH"), plugins);
        const auto run = [&](const QStringList &arguments, QString *err) {
            QProcess process;
            process.setProcessEnvironment(environment);
            process.start(QStringLiteral(CADENZA_CLI_PATH), arguments);
            if (!process.waitForFinished(30000) || process.exitStatus() != QProcess::NormalExit) {
                return -1;
            }
            *err = QString::fromUtf8(process.readAllStandardError());
            return process.exitCode();
        };
        QString err;
        QCOMPARE(run({QStringLiteral("voices"), QStringLiteral("--all")}, &err), 0);
        QVERIFY2(err.contains(QStringLiteral("the speech engine 'flite' is not installed")), qPrintable(err));
        QCOMPARE(err.count(QStringLiteral("'flite' is not installed")), 1);
        const QString wav = m_environment->path(QStringLiteral("x.wav"));
        QCOMPARE(run({QStringLiteral("say"), QStringLiteral("--voice"), P + QStringLiteral("slt"),
                         QStringLiteral("--output"), wav, QStringLiteral("Hello")},
                     &err),
            1);
        QVERIFY2(err.contains(QStringLiteral(
                     "the voice 'Slt' cannot speak: the speech engine 'flite' is not installed")),
            qPrintable(err));
        QVERIFY(!QFile::exists(wav));
        QCOMPARE(run({QStringLiteral("say"), QStringLiteral("--voice"), P + QStringLiteral("espeak"),
                         QStringLiteral("--output"), wav, QStringLiteral("Hello")},
                     &err),
            0);
        QString error;
        const auto audio = WaveFile::read(wav, &error);
        QVERIFY2(audio && audio->rootMeanSquare() > 300.0, qPrintable(error));
    }

    /// A plugin built for an older version of the engine interface is refused with a line saying so,
    /// and the engine of a later folder is used instead.
    void pluginOfAnOlderInterfaceIsRefused()
    {
        const QString old = m_environment->path(QStringLiteral("old-plugins"));
        const QString current = m_environment->path(QStringLiteral("plugins"));
        QVERIFY(QDir().mkpath(old) && QDir().mkpath(current));
        QVERIFY(
            QFile::link(QStringLiteral(OLD_ENGINE_PLUGIN), old + QStringLiteral("/cadenza_espeak_ng.so")));
        QVERIFY(QFile::link(QStringLiteral(CADENZA_BUILD_PLUGIN_DIR "/cadenza_espeak_ng.so"),
            current + QStringLiteral("/cadenza_espeak_ng.so")));
        const QString wav = m_environment->path(QStringLiteral("x.wav"));
        const auto say = [&](const QString &pluginPath, QString *err) {
            QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
            environment.insert(QStringLiteral("CADENZA_PLUGIN_PATH"), pluginPath);
            QProcess process;
            process.setProcessEnvironment(environment);
            process.start(QStringLiteral(CADENZA_CLI_PATH),
                {QStringLiteral("say"), QStringLiteral("--voice"), P + QStringLiteral("espeak"),
                    QStringLiteral("--output"), wav, QStringLiteral("Hello")});
            if (!process.waitForFinished(30000) || process.exitStatus() != QProcess::NormalExit) {
                return -1;
            }
            *err = QString::fromUtf8(process.readAllStandardError());
            return process.exitCode();
        };
        const QString refusal
            = QStringLiteral("Skipping the speech engine plugin %1/cadenza_espeak_ng.so: it was "
                             "built for org.cadenza.SpeechEngine/1, this library needs %2")
                  .arg(old, QStringLiteral(CadenzaSpeechEngine_iid));
        QString err;
        QCOMPARE(say(old, &err), 1);
        QVERIFY2(err.contains(refusal), qPrintable(err));
        QVERIFY2(
            err.contains(QStringLiteral("the speech engine 'espeak-ng' is not installed")), qPrintable(err));
        QVERIFY(!QFile::exists(wav));
        QCOMPARE(say(old + QLatin1Char(':') + current, &err), 0);
        QVERIFY2(err.contains(refusal), qPrintable(err));
        QString error;
        const auto audio = WaveFile::read(wav, &error);
        QVERIFY2(audio && audio->rootMeanSquare() > 300.0, qPrintable(error));
    }

private:
    std::unique_ptr<TestEnvironment> m_environment;
};

QTEST_GUILESS_MAIN(SpeechEnginesTest)
#include "tst_speechengines.moc"
