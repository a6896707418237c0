// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// The speech-dispatcher output module: its parts, and whole sessions driven on its standard input.

#include "AudioSender.h"
#include "ModuleDriver.h"
#include "ModuleProtocol.h"
#include "ModuleSession.h"
#include "SpeechWorker.h"
#include "SsmlText.h"
#include "TestEnvironment.h"

#include "core/SpeechNames.h"
#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/services/PreferencesStore.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"

#include <QDir>
#include <QFile>
#include <QTest>

#include <algorithm>
#include <atomic>
#include <cmath>

#include <fcntl.h>
#include <unistd.h>

using namespace Cadenza::Platform;
using namespace Cadenza::Testing;
using namespace SdCadenza;

namespace {

const QString Ada = QStringLiteral("org.example.voice.ada");
const QString Bram = QStringLiteral("org.example.voice.bram");
const QString Clara = QStringLiteral("org.example.voice.clara");
constexpr qint32 Creator = 4242;

const QByteArray Setup = "INIT\nAUDIO\naudio_output_method=server\n.\n";

QByteArray speak(const QByteArray &text)
{
    return "SPEAK\n" + text + "\n.\n";
}

/**
 * An engine that hands out a number of blocks and writes down what it does, so that a test can see
 * in which order the engine's work and the module's audio events happen.
 */
class ScriptedEngine final : public SpeechEngine
{
public:
    int blocks = 8;
    /// Called on the rendering thread after each block was handed out, with the block's number.
    std::function<void(int)> afterBlock;
    QStringList log;
    int renders = 0;

    QString engineName() const override { return QStringLiteral("scripted"); }
    bool renderBlocks(const VoiceDescription &, const QString &, const SynthesisParameters &,
        const AudioBlockSink &sink, QString *) override
    {
        m_cancelled = false;
        ++renders;
        const std::vector<qint16> block(1000, 1200);
        for (int i = 1; i <= blocks && !m_cancelled; ++i) {
            log.append(QStringLiteral("engine renders block %1").arg(i));
            const bool more = sink(block.data(), qsizetype(block.size()), 22050);
            if (afterBlock) {
                afterBlock(i);
            }
            if (!more) {
                log.append(QStringLiteral("engine told to stop"));
                break;
            }
        }
        log.append(QStringLiteral("engine done"));
        return true;
    }
    void cancel() override { m_cancelled = true; }

private:
    std::atomic<bool> m_cancelled {false};
};

/// A pipe standing in for speech-dispatcher: the worker writes to it, the test reads what arrived.
class ServerPipe
{
public:
    ServerPipe()
    {
        if (::pipe(m_fds) == 0) {
            ::fcntl(m_fds[0], F_SETFL, O_NONBLOCK);
        }
    }
    ~ServerPipe()
    {
        ::close(m_fds[0]);
        ::close(m_fds[1]);
    }
    [[nodiscard]] int writeEnd() const { return m_fds[1]; }
    /// Everything written so far.
    QByteArray received()
    {
        char buffer[65536];
        for (;;) {
            const ssize_t got = ::read(m_fds[0], buffer, sizeof buffer);
            if (got <= 0) {
                break;
            }
            m_received.append(buffer, qsizetype(got));
        }
        return m_received;
    }
    /// How many audio events arrived so far (the event's data never holds a line feed).
    int audioEvents() { return int(received().count("\n705 AUDIO\n")); }

private:
    int m_fds[2] = {-1, -1};
    QByteArray m_received;
};

SpeechJob textJob(const QString &text)
{
    SpeechJob job;
    job.voiceIdentifier = Ada;
    job.segments = SsmlText::parse(text);
    return job;
}

} // namespace

class TestSdCadenza : public QObject
{
    Q_OBJECT

private:
    std::unique_ptr<TestEnvironment> m_env;

    /// A voice bundle whose engine pitch tells its speech apart (the engine's output varies slightly
    /// from one rendering to the next, so samples cannot be compared one by one).
    static void writePitchedBundle(
        const QString &name, const QVariantMap &attributes, const QString &engineVoice, int pitch)
    {
        const QString bundle
            = TestEnvironment::writeVoiceBundle(Paths::systemVoicesFolder(), name, attributes);
        const QVariantMap info {
            {QStringLiteral("BundleIdentifier"), attributes.value(QStringLiteral("VoiceIdentifier"))},
            {QStringLiteral("BundleVersion"), QStringLiteral("1.0")},
            {QStringLiteral("Engine"),
                QVariantMap {{QStringLiteral("Voice"), engineVoice}, {QStringLiteral("Pitch"), pitch}}},
            {QStringLiteral("VoiceAttributes"), attributes}};
        QFile file(bundle + QStringLiteral("/Info.plist"));
        QVERIFY(file.open(QIODevice::WriteOnly | QIODevice::Truncate));
        QVERIFY(file.write(PropertyList::serialize(info)) > 0);
    }

    void installVoices()
    {
        QVariantMap ada
            = TestEnvironment::voiceAttributes(Ada, QStringLiteral("Ada"), QStringLiteral("en_US"));
        writePitchedBundle(QStringLiteral("Ada"), ada, QStringLiteral("en-us"), 30);
        QVariantMap bram = TestEnvironment::voiceAttributes(
            Bram, QStringLiteral("Bram"), QStringLiteral("en_GB"), QStringLiteral("VoiceGenderMale"));
        bram.insert(QStringLiteral("VoiceCreator"), Creator);
        bram.insert(QStringLiteral("VoiceID"), 2);
        writePitchedBundle(QStringLiteral("Bram"), bram, QStringLiteral("en-gb-x-rp"), 90);
        TestEnvironment::writeVoiceBundle(Paths::systemVoicesFolder(), QStringLiteral("Clara"),
            TestEnvironment::voiceAttributes(Clara, QStringLiteral("Clara"), QStringLiteral("de_DE")),
            QStringLiteral("de"));
    }

    /// A module started and initialised; its first answers are taken.
    void startModule(ModuleDriver &module)
    {
        QVERIFY(module.start(QStringLiteral(SD_CADENZA_PATH)));
        module.send(Setup);
        QVERIFY(module.waitForLine("203 OK AUDIO INITIALIZED"));
        (void)module.takeItems();
    }

    /// Speaks @p message and returns everything said up to its last event.
    QList<ModuleDriver::Item> say(ModuleDriver &module, const QByteArray &settings, const QByteArray &message)
    {
        if (!settings.isEmpty()) {
            module.send("SET\n" + settings + ".\n");
            if (!module.waitForLine("203 OK SETTINGS RECEIVED")) {
                return {};
            }
        }
        module.send(speak(message));
        if (module.waitForAny({"702 END", "703 STOP"}).isEmpty()) {
            return {};
        }
        return module.takeItems();
    }

private Q_SLOTS:
    void init()
    {
        m_env = std::make_unique<TestEnvironment>();
        installVoices();
    }
    void cleanup() { m_env.reset(); }

    // --- the parts ---

    void protocolSplitsCommandsAndUnescapesDots()
    {
        ModuleProtocol protocol;
        // Cut at awkward places: inside a word, between CR and LF, inside the closing dot line.
        for (const QByteArray &piece :
            {QByteArray("SPE"), QByteArray("AK\r\n..hidden\n.."), QByteArray("\nline\r"), QByteArray("\n."),
                QByteArray("\nLIST VOICES\nfrobnicate\n\nSTOP\n")}) {
            protocol.feed(piece);
        }
        QVERIFY(protocol.hasRequest());
        auto request = protocol.takeRequest();
        QCOMPARE(request.kind, ModuleProtocol::Kind::Speak);
        QCOMPARE(request.stage, ModuleProtocol::Stage::DataFollows);
        request = protocol.takeRequest();
        QCOMPARE(request.stage, ModuleProtocol::Stage::DataComplete);
        QCOMPARE(request.data, QByteArrayList({".hidden", ".", "line"}));
        QCOMPARE(protocol.takeRequest().kind, ModuleProtocol::Kind::ListVoices);
        QCOMPARE(protocol.takeRequest().kind, ModuleProtocol::Kind::Unknown);
        QCOMPARE(protocol.takeRequest().kind, ModuleProtocol::Kind::Unknown); // the empty line
        QCOMPARE(protocol.takeRequest().kind, ModuleProtocol::Kind::Stop);
        QVERIFY(!protocol.hasRequest());
        QVERIFY(!protocol.inData());
    }

    void protocolDropsDataBeyondItsLimit()
    {
        ModuleProtocol protocol;
        protocol.feed("SPEAK\n");
        const QByteArray line(1024 * 1024, 'a');
        for (int i = 0; i < 70; ++i) {
            protocol.feed(line + '\n');
        }
        protocol.feed(".\nQUIT\n");
        (void)protocol.takeRequest();
        const auto data = protocol.takeRequest();
        QVERIFY(data.overflow);
        QVERIFY(data.data.isEmpty());
        QCOMPARE(protocol.takeRequest().kind, ModuleProtocol::Kind::Quit);
    }

    void audioEscapingHidesLineFeedsAndRoundTrips()
    {
        QByteArray all;
        for (int i = 0; i < 256; ++i) {
            all += char(i);
        }
        all += "\n\n}}";
        const QByteArray escaped = AudioSender::escape(all);
        QVERIFY(!escaped.contains('\n'));
        QCOMPARE(escaped.size(), all.size() + 4 + 2); // LF and 0x7D once each in 0..255, plus four
        QCOMPARE(AudioSender::unescape(escaped), all);

        const qint16 samples[] = {0x0a0a, 0x7d00, -1, 10};
        const QByteArray event = AudioSender::audioEvent(samples, 4, 16000);
        QVERIFY(
            event.startsWith("705-bits=16\n705-num_channels=1\n705-sample_rate=16000\n705-num_samples=4\n"));
        QVERIFY(event.endsWith("\n705 AUDIO\n"));
        QCOMPARE(event.count('\n'), 7); // five fields, the data line and the closing line
    }

    void ssmlKeepsWordsMarksAndBreaks()
    {
        const auto segments = SsmlText::parse(QStringLiteral(
            "<speak>One <mark name=\"m1\"/>two<break time=\"1.5s\"/> <say-as interpret-as=\"characters\">ab"
            "</say-as> <say-as interpret-as=\"date\">now</say-as> &amp; <break "
            "strength=\"none\"/>x</speak>"));
        QCOMPARE(segments.size(), 5);
        QCOMPARE(segments.at(0).text, QStringLiteral("One "));
        QCOMPARE(segments.at(1).kind, SsmlText::Segment::Kind::Mark);
        QCOMPARE(segments.at(1).text, QStringLiteral("m1"));
        QCOMPARE(segments.at(2).text, QStringLiteral("two"));
        QCOMPARE(segments.at(3).kind, SsmlText::Segment::Kind::Pause);
        QCOMPARE(segments.at(3).pauseMs, 1500);
        QCOMPARE(segments.at(4).text.simplified(), QStringLiteral("a b now & x"));

        QCOMPARE(SsmlText::breakMilliseconds(QStringLiteral("250ms"), {}), 250);
        QCOMPARE(SsmlText::breakMilliseconds(QStringLiteral("99999s"), {}), 10000);
        QCOMPARE(SsmlText::breakMilliseconds(QStringLiteral("soon"), {}), -1);
        QCOMPARE(SsmlText::breakMilliseconds({}, QStringLiteral("strong")), 700);
    }

    void brokenSsmlIsReadAsText()
    {
        const auto segments = SsmlText::parse(QStringLiteral("<speak>Fish &amp; <b>chips</speak"));
        QCOMPARE(segments.size(), 1);
        QCOMPARE(segments.at(0).text, QStringLiteral("Fish & chips"));
        QVERIFY(SsmlText::parse(QString()).isEmpty());
    }

    void decodingDropsBrokenUtf8AndControls()
    {
        QCOMPARE(SsmlText::decode("a\xff\xfe"
                                  "b\x01\x1b[31mc\xc3\xa9\xe2\x82"),
            QStringLiteral("ab[31mc\u00e9"));
        QCOMPARE(SsmlText::decode("tab\tline\n"), QStringLiteral("tab\tline\n"));
    }

    void chunksStayShortAndFollowSentences()
    {
        QCOMPARE(SpeechWorker::chunks(QStringLiteral("Hello there. How are you? Fine!")),
            QStringList(
                {QStringLiteral("Hello there."), QStringLiteral("How are you?"), QStringLiteral("Fine!")}));
        // The first sentence is cut once more at its first clause end, so speech starts sooner.
        QCOMPARE(
            SpeechWorker::chunks(QStringLiteral("When the day is done, we go home, all of us. Then, sleep.")),
            QStringList({QStringLiteral("When the day is done,"), QStringLiteral("we go home, all of us."),
                QStringLiteral("Then, sleep.")}));
        const QString words = QStringLiteral("word ").repeated(500);
        const QStringList pieces = SpeechWorker::chunks(words, 100);
        QVERIFY(pieces.size() >= 25);
        for (const QString &piece : pieces) {
            QVERIFY(piece.size() <= 100);
        }
        QCOMPARE(pieces.join(QLatin1Char(' ')).simplified(), words.simplified());
        // No spaces at all: cut hard, but never through a surrogate pair.
        const QString emoji = QString::fromUtf8("\xf0\x9f\x98\x80").repeated(80);
        for (const QString &piece : SpeechWorker::chunks(emoji, 9)) {
            QVERIFY(!piece.back().isHighSurrogate());
        }
        QVERIFY(SpeechWorker::chunks(QStringLiteral("   ")).isEmpty());
    }

    /// Each block reaches the server as soon as the engine hands it out: the engine sees the audio
    /// event of its first block before it renders the second.
    void audioIsSentWhileTheEngineRenders()
    {
        ServerPipe server;
        AudioSender sender(server.writeEnd());
        ScriptedEngine engine;
        int lookups = 0;
        SpeechWorker worker(sender, [&](const QString &, QString *) {
            ++lookups;
            return &engine;
        });
        engine.afterBlock = [&](int) {
            engine.log.append(QStringLiteral("server has %1 audio events").arg(server.audioEvents()));
        };
        QVERIFY(worker.start(
            textJob(QStringLiteral("One sentence to speak. And another one after it. A third."))));
        QTRY_VERIFY(!worker.isBusy());
        QStringList expected;
        for (int render = 0; render < 3; ++render) {
            for (int i = 1; i <= engine.blocks; ++i) {
                expected << QStringLiteral("engine renders block %1").arg(i)
                         << QStringLiteral("server has %1 audio events").arg(render * engine.blocks + i);
            }
            expected << QStringLiteral("engine done");
        }
        QCOMPARE(engine.log, expected);
        // Three sentences, three renders, one look-up of the voice and its engine.
        QCOMPARE(engine.renders, 3);
        QCOMPARE(lookups, 1);
        const QByteArray stream = server.received();
        QVERIFY(stream.startsWith("701 BEGIN\n"));
        QVERIFY(stream.endsWith("\n705 AUDIO\n702 END\n"));
        QCOMPARE(ModuleDriver::samplesOfStream(stream).size(), size_t(3 * engine.blocks * 1000));
    }

    /// A stop that comes while the engine renders ends the render at the next block: STOP follows,
    /// and no audio after it.
    void stopDuringARenderEndsAtTheNextBlock()
    {
        ServerPipe server;
        AudioSender sender(server.writeEnd());
        ScriptedEngine engine;
        engine.blocks = 100000; // minutes of audio
        SpeechWorker worker(sender, [&](const QString &, QString *) { return &engine; });
        engine.afterBlock = [&](int block) {
            if (block == 3) {
                worker.stop(); // as when STOP arrives from the server now
            }
        };
        QVERIFY(worker.start(textJob(QStringLiteral("A long text. ").repeated(50))));
        QTRY_VERIFY(!worker.isBusy());
        QCOMPARE(engine.log,
            QStringList({QStringLiteral("engine renders block 1"), QStringLiteral("engine renders block 2"),
                QStringLiteral("engine renders block 3"), QStringLiteral("engine renders block 4"),
                QStringLiteral("engine told to stop"), QStringLiteral("engine done")}));
        QCOMPARE(engine.renders, 1); // the other sentences are not rendered at all
        const QByteArray stream = server.received();
        QCOMPARE(stream.count("\n705 AUDIO\n"), 3);
        QVERIFY(stream.endsWith("\n705 AUDIO\n703 STOP\n"));
        QCOMPARE(stream.count("702 END"), 0);
        // The worker serves the next message.
        engine.blocks = 2;
        engine.afterBlock = {};
        QVERIFY(worker.start(textJob(QStringLiteral("Next."))));
        QTRY_VERIFY(!worker.isBusy());
        QVERIFY(server.received().endsWith("\n705 AUDIO\n702 END\n"));
    }

    /// A voice that cannot be found ends the message with STOP before any audio.
    void missingEngineEndsTheMessageWithStop()
    {
        ServerPipe server;
        AudioSender sender(server.writeEnd());
        SpeechWorker worker(sender, [](const QString &name, QString *error) -> SpeechEngine * {
            *error = QStringLiteral("no engine %1").arg(name);
            return nullptr;
        });
        QVERIFY(worker.start(textJob(QStringLiteral("Hello."))));
        QTRY_VERIFY(!worker.isBusy());
        QCOMPARE(server.received(), QByteArray("701 BEGIN\n703 STOP\n"));
    }

    void settingsAreCheckedLineByLine()
    {
        SpeechSettings settings;
        QVERIFY(ModuleSession::applySetting(settings, "rate=250"));
        QCOMPARE(settings.rate, 100);
        QVERIFY(ModuleSession::applySetting(settings, "pitch=-30"));
        QCOMPARE(settings.pitch, -30);
        QVERIFY(!ModuleSession::applySetting(settings, "pitch=high"));
        QCOMPARE(settings.pitch, -30);
        QVERIFY(ModuleSession::applySetting(settings, "pitch=NULL"));
        QVERIFY(!ModuleSession::applySetting(settings, "no equals sign"));
        QVERIFY(!ModuleSession::applySetting(settings, "=5"));
        QVERIFY(ModuleSession::applySetting(settings, "synthesis_voice=Bram"));
        QCOMPARE(settings.synthesisVoice, QStringLiteral("Bram"));
        QVERIFY(ModuleSession::applySetting(settings, "spelling_mode=on"));
        QVERIFY(settings.spelling);
        QVERIFY(ModuleSession::applySetting(settings, "pitch_range=50")); // known, not used
    }

    // --- whole sessions ---

    void hostileSessionKeepsServing()
    {
        ModuleDriver module;
        QVERIFY(module.start(QStringLiteral(SD_CADENZA_PATH)));
        module.send("INIT\n");
        QVERIFY(module.waitForLine("299 OK LOADED SUCCESSFULLY"));
        (void)module.takeItems();
        module.send("HELLO WORLD\n\n\x01\x02\xff\xfe garbage\nSET\nrate=fast\nnonsense\n.\n");
        QVERIFY(module.waitForLine("302 ERROR BAD SYNTAX"));
        QCOMPARE(module.linesOf(module.takeItems()),
            QByteArrayList({"300 ERR UNKNOWN COMMAND", "300 ERR UNKNOWN COMMAND", "300 ERR UNKNOWN COMMAND",
                "203 OK RECEIVING SETTINGS", "302 ERROR BAD SYNTAX"}));

        // A key name spread over two lines is refused; the session goes on.
        module.send("KEY\nshift\na\n.\n");
        QVERIFY(module.waitForLine("305 DATA MORE THAN ONE LINE"));

        // Broken UTF-8, escape sequences and NUL bytes inside a message are left out of the speech.
        auto items
            = say(module, {}, QByteArray("<speak>Caf\xc3\xa9 \xff\xfe\x1b[2J ok\x00 fine.</speak>", 46));
        QVERIFY(!items.isEmpty());
        QByteArrayList lines = module.linesOf(items);
        QVERIFY2(lines.contains("200 OK SPEAKING"), lines.join('|'));
        QCOMPARE(lines.count("701 BEGIN"), 1);
        QCOMPARE(lines.last(), QByteArray("702 END"));
        QVERIFY(module.samplesOf(items).size() > 1000);

        // An empty message begins and ends, with nothing to hear.
        items = say(module, {}, "<speak></speak>");
        lines = module.linesOf(items);
        QCOMPARE(
            lines, QByteArrayList({"202 OK RECEIVING MESSAGE", "200 OK SPEAKING", "701 BEGIN", "702 END"}));

        // Words ending in ordinary lines between the voice list and speech: still answered.
        module.send("LIST VOICES\n");
        QVERIFY(module.waitForLine("200 OK VOICE LIST SENT"));
        module.send("QUIT\n");
        QVERIFY(module.waitForLine("210 OK QUIT"));
        QVERIFY(module.process().waitForFinished(10000));
        QCOMPARE(module.process().exitStatus(), QProcess::NormalExit);
        QCOMPARE(module.process().exitCode(), 0);
    }

    void megabytesOfTextStopWithinABlock()
    {
        ModuleDriver module;
        startModule(module);
        // Some 2 MB: hours of speech if nothing stopped it.
        const QByteArray sentence = "This sentence is one of very many in a long text. ";
        module.send(speak(sentence.repeated(40000)));
        QVERIFY(module.waitForLine("200 OK SPEAKING", 60000));
        QVERIFY(module.waitForLine("705 AUDIO", 60000));
        module.send("STOP\n");
        QVERIFY(module.waitForLine("703 STOP", 60000));
        const auto items = module.takeItems();
        // The audio stops at the block after STOP's arrival; what came before depends on the machine.
        const auto samples = module.samplesOf(items);
        QVERIFY2(samples.size() < 22050 * 60, QByteArray::number(qulonglong(samples.size())));
        QCOMPARE(module.linesOf(items).count("702 END"), 0);
        // STOP when nothing is spoken is no error and gets no answer; the next message is spoken.
        module.send("STOP\n");
        QVERIFY(!say(module, {}, "<speak>Again.</speak>").isEmpty());
        QCOMPARE(module.linesOf(module.takeItems()).count("300 ERR UNKNOWN COMMAND"), 0);
    }

    void speakWhileSpeakingIsRefused()
    {
        ModuleDriver module;
        startModule(module);
        module.send(speak(QByteArray("Long text goes on. ").repeated(200)));
        QVERIFY(module.waitForLine("701 BEGIN"));
        module.send(speak("Second."));
        QVERIFY(module.waitForLine("301 ERROR CANT SPEAK"));
        module.send("STOP\n");
        QVERIFY(module.waitForLine("703 STOP"));
    }

    void voicesAreListedWithNamesLanguagesAndVariants()
    {
        ModuleDriver module;
        startModule(module);
        module.send("LIST VOICES\n");
        QVERIFY(module.waitForLine("200 OK VOICE LIST SENT"));
        QCOMPARE(module.linesOf(module.takeItems()),
            QByteArrayList({"200-Ada\ten-US\tfemale1", "200-Bram\ten-GB\tmale1", "200-Clara\tde-DE\tfemale1",
                "200 OK VOICE LIST SENT"}));

        // Installed while the module runs: listed at once. Removed: gone at once.
        TestEnvironment::writeVoiceBundle(Paths::userVoicesFolder(), QStringLiteral("Dora"),
            TestEnvironment::voiceAttributes(QStringLiteral("org.example.voice.dora"), QStringLiteral("Dora"),
                QStringLiteral("it_IT"), QStringLiteral("VoiceGenderNeuter")),
            QStringLiteral("it"));
        module.send("LIST VOICES\n");
        QVERIFY(module.waitForLine("200 OK VOICE LIST SENT"));
        QVERIFY(module.linesOf(module.takeItems()).contains("200-Dora\tit-IT\tchild1"));
        QVERIFY(QDir(Paths::systemVoicesFolder() + QStringLiteral("/Clara.SpeechVoice")).removeRecursively());
        module.send("LIST VOICES\n");
        QVERIFY(module.waitForLine("200 OK VOICE LIST SENT"));
        const QByteArrayList lines = module.linesOf(module.takeItems());
        QVERIFY(!lines.contains("200-Clara\tde-DE\tfemale1"));
        QCOMPARE(lines.size(), 4);
    }

    void twoQualitiesOfOneVoiceGetTwoNames()
    {
        TestEnvironment::writeVoiceBundle(Paths::systemVoicesFolder(), QStringLiteral("AdaCompact"),
            TestEnvironment::voiceAttributes(
                Ada + QStringLiteral(".compact"), QStringLiteral("Ada"), QStringLiteral("en_US")));
        ModuleDriver module;
        startModule(module);
        module.send("LIST VOICES\n");
        QVERIFY(module.waitForLine("200 OK VOICE LIST SENT"));
        const QByteArrayList lines = module.linesOf(module.takeItems());
        QVERIFY2(
            lines.contains("200-Ada\ten-US\tfemale1") || lines.contains("200-Ada (Compact)\ten-US\tfemale1"),
            lines.join('|'));
        QVERIFY(lines.contains("200-Ada (Compact)\ten-US\tfemale1"));
    }

    void twoVoicesOfOneNameGetTwoNames()
    {
        TestEnvironment::writeVoiceBundle(Paths::systemVoicesFolder(), QStringLiteral("AdaGB"),
            TestEnvironment::voiceAttributes(
                QStringLiteral("org.example.voice.ada-gb"), QStringLiteral("Ada"), QStringLiteral("en_GB")));
        TestEnvironment::writeVoiceBundle(Paths::systemVoicesFolder(), QStringLiteral("AdaGB2"),
            TestEnvironment::voiceAttributes(
                QStringLiteral("org.example.voice.ada-gb2"), QStringLiteral("Ada"), QStringLiteral("en_GB")));
        ModuleDriver module;
        startModule(module);
        module.send("LIST VOICES\n");
        QVERIFY(module.waitForLine("200 OK VOICE LIST SENT"));
        const QByteArrayList lines = module.linesOf(module.takeItems());
        QVERIFY2(lines.contains("200-Ada (en-US)\ten-US\tfemale1"), lines.join('|'));
        QVERIFY(lines.contains("200-Ada (en-GB) (org.example.voice.ada-gb)\ten-GB\tfemale1"));
        QVERIFY(lines.contains("200-Ada (en-GB) (org.example.voice.ada-gb2)\ten-GB\tfemale1"));
    }

    void languageDefaultFollowsTheSelectedVoice()
    {
        ModuleDriver module;
        startModule(module);
        const QByteArray text = "<speak>Good morning, how are you today?</speak>";
        // Which voice spoke, told by its pitch: Ada's engine pitch is low, Bram's high.
        auto pitchOf = [&](const QByteArray &settings) {
            return ModuleDriver::medianPitchHz(module.samplesOf(say(module, settings, text)), 22050);
        };
        const double ada = pitchOf("synthesis_voice=Ada\n");
        const double bram = pitchOf("synthesis_voice=Bram\n");
        QVERIFY2(ada > 0 && bram > ada * 1.3, qPrintable(QStringLiteral("%1 %2").arg(ada).arg(bram)));
        const double middle = (ada + bram) / 2;
        auto check = [&](double pitch, bool isBram) {
            QVERIFY2(isBram ? pitch > middle : pitch < middle,
                qPrintable(QStringLiteral("%1 Hz, Ada %2, Bram %3").arg(pitch).arg(ada).arg(bram)));
        };

        // Nothing selected: the language's best voice for the speech language (en_US here).
        Services::preferences().setValue(SpeechSynthesisService::SpeechLanguageKey, QStringLiteral("en_US"),
            Cadenza::SpeechNames::VoicePreferencesDomain);
        QVERIFY(Services::preferences().synchronize(Cadenza::SpeechNames::VoicePreferencesDomain));
        check(pitchOf("synthesis_voice=NULL\nlanguage=en\nvoice=female1\n"), false);
        // The voice type chooses among the voices of the language.
        check(pitchOf("voice=male1\n"), true);
        check(pitchOf("voice=female1\n"), false);

        // The user picks Bram: the module's default for English follows, without a restart.
        PreferencesStore &preferences = Services::preferences();
        preferences.setValue(Cadenza::SpeechNames::SelectedVoiceCreatorKey, Creator,
            Cadenza::SpeechNames::VoicePreferencesDomain);
        preferences.setValue(
            Cadenza::SpeechNames::SelectedVoiceIDKey, 2, Cadenza::SpeechNames::VoicePreferencesDomain);
        QVERIFY(preferences.synchronize(Cadenza::SpeechNames::VoicePreferencesDomain));
        check(pitchOf("language=en\nvoice=female1\n"), true);
        // A name that is no voice: the default again.
        check(pitchOf("synthesis_voice=Nobody\n"), true);
        // Another language keeps its own default: Clara, the only German voice.
        const auto items = say(module, "synthesis_voice=NULL\nlanguage=de\n", "<speak>Guten Morgen.</speak>");
        QCOMPARE(module.linesOf(items).last(), QByteArray("702 END"));
        QVERIFY(!module.samplesOf(items).empty());
    }

    void rateAndPitchChangeTheAudio()
    {
        ModuleDriver module;
        startModule(module);
        const QByteArray text = "<speak>The quick brown fox jumps over the lazy dog.</speak>";
        const auto normal = say(module, "synthesis_voice=Ada\nrate=0\npitch=0\n", text);
        const auto fast = say(module, "rate=80\n", text);
        const auto high = say(module, "rate=0\npitch=90\n", text);
        const auto low = say(module, "pitch=-90\n", text);
        const auto normalSamples = module.samplesOf(normal);
        const auto fastSamples = module.samplesOf(fast);
        QVERIFY(!normalSamples.empty());
        QVERIFY2(fastSamples.size() < normalSamples.size() * 0.7,
            qPrintable(QStringLiteral("%1 vs %2").arg(fastSamples.size()).arg(normalSamples.size())));
        const int rate = normal.first().sampleRate ? normal.first().sampleRate : 22050;
        const double pitchNormal = ModuleDriver::medianPitchHz(normalSamples, rate);
        const double pitchHigh = ModuleDriver::medianPitchHz(module.samplesOf(high), rate);
        const double pitchLow = ModuleDriver::medianPitchHz(module.samplesOf(low), rate);
        QVERIFY2(pitchLow > 0 && pitchHigh > pitchNormal * 1.2 && pitchNormal > pitchLow * 1.2,
            qPrintable(QStringLiteral("%1 %2 %3").arg(pitchLow).arg(pitchNormal).arg(pitchHigh)));
    }

    void volumeScalesTheAudio()
    {
        ModuleDriver module;
        startModule(module);
        const QByteArray text = "<speak>Loud and soft.</speak>";
        auto rms = [](const std::vector<qint16> &samples) {
            double sum = 0;
            for (const qint16 s : samples) {
                sum += double(s) * s;
            }
            return samples.empty() ? 0.0 : std::sqrt(sum / double(samples.size()));
        };
        const double loud = rms(module.samplesOf(say(module, "synthesis_voice=Ada\nvolume=100\n", text)));
        const double soft = rms(module.samplesOf(say(module, "volume=-60\n", text)));
        QVERIFY2(loud > 0 && soft < loud * 0.5, qPrintable(QStringLiteral("%1 %2").arg(loud).arg(soft)));
        // 0, what clients send unless told otherwise, is the voice's normal loudness, not half of it.
        const double normal = rms(module.samplesOf(say(module, "volume=0\n", text)));
        QVERIFY2(normal > loud * 0.8, qPrintable(QStringLiteral("%1 %2").arg(normal).arg(loud)));
    }

    void marksAndBreaksArriveInOrder()
    {
        ModuleDriver module;
        startModule(module);
        const auto plain = say(module, "synthesis_voice=Ada\n", "<speak>First. Second.</speak>");
        const auto marked = say(module, {},
            "<speak><mark name=\"start\"/>First.<break time=\"500ms\"/><mark name=\"__spd_1\"/>Second.<mark "
            "name=\"end\"/></speak>");
        const QByteArrayList lines = module.linesOf(marked);
        const qsizetype begin = lines.indexOf("701 BEGIN");
        const qsizetype start = lines.indexOf("700-start");
        const qsizetype middle = lines.indexOf("700-__spd_1");
        const qsizetype end = lines.indexOf("700-end");
        QVERIFY2(begin >= 0 && begin < start && start < middle && middle < end, lines.join('|'));
        QCOMPARE(lines.at(start + 1), QByteArray("700 INDEX MARK"));
        // Audio of the first sentence between the first two marks, of the second after.
        QVERIFY(lines.mid(start, middle - start).contains("705 AUDIO"));
        QVERIFY(lines.mid(middle, end - middle).contains("705 AUDIO"));
        QCOMPARE(lines.last(), QByteArray("702 END"));
        // The break adds half a second of silence.
        const qint64 extra = qint64(module.samplesOf(marked).size()) - qint64(module.samplesOf(plain).size());
        QVERIFY2(extra > 22050 / 2 - 4000, QByteArray::number(extra));
    }

    void charKeyAndSoundIconAreSpoken()
    {
        ModuleDriver module;
        startModule(module);
        module.send("SET\nsynthesis_voice=Ada\ncap_let_recogn=spell\n.\n");
        QVERIFY(module.waitForLine("203 OK SETTINGS RECEIVED"));
        module.send("CHAR\nA\n.\n");
        QVERIFY(module.waitForLine("702 END"));
        auto items = module.takeItems();
        QVERIFY(module.linesOf(items).contains("200 OK SPEAKING"));
        QVERIFY(!module.samplesOf(items).empty());
        module.send("KEY\nshift_kp-enter\n.\n");
        QVERIFY(module.waitForLine("702 END"));
        QVERIFY(!module.samplesOf(module.takeItems()).empty());
        module.send("SOUND_ICON\nmessage\n.\n");
        QVERIFY(module.waitForLine("702 END"));
        items = module.takeItems();
        const QByteArrayList lines = module.linesOf(items);
        QVERIFY2(lines.contains("706-message") && lines.contains("706 ICON"), lines.join('|'));
        QVERIFY(module.samplesOf(items).empty());
    }

    void spellingSaysEachLetter()
    {
        ModuleDriver module;
        startModule(module);
        const QByteArray text = "<speak>word</speak>";
        const auto word = module.samplesOf(say(module, "synthesis_voice=Ada\nspelling_mode=off\n", text));
        const auto spelled = module.samplesOf(say(module, "spelling_mode=on\n", text));
        QVERIFY2(spelled.size() > word.size() * 1.5,
            qPrintable(QStringLiteral("%1 vs %2").arg(spelled.size()).arg(word.size())));
    }

    void pauseEndsAtASentenceWithPause()
    {
        ModuleDriver module;
        startModule(module);
        module.send(speak(QByteArray("Sentence after sentence. ").repeated(100)));
        QVERIFY(module.waitForLine("705 AUDIO"));
        module.send("PAUSE\n");
        QCOMPARE(module.waitForAny({"702 END", "703 STOP", "704 PAUSE"}), QByteArray("704 PAUSE"));
        QVERIFY(!say(module, {}, "<speak>Next.</speak>").isEmpty());
    }

    void voiceRemovedWhileSpeakingEndsTheMessage()
    {
        ModuleDriver module;
        startModule(module);
        module.send("SET\nsynthesis_voice=Bram\n.\n");
        QVERIFY(module.waitForLine("203 OK SETTINGS RECEIVED"));
        module.send(speak(QByteArray("A sentence to say. ").repeated(400)));
        QVERIFY(module.waitForLine("705 AUDIO"));
        QVERIFY(QDir(Paths::systemVoicesFolder() + QStringLiteral("/Bram.SpeechVoice")).removeRecursively());
        QCOMPARE(module.waitForAny({"702 END", "703 STOP"}, 120000), QByteArray("703 STOP"));
        // The next message falls back to the default and is spoken whole.
        (void)module.takeItems();
        const auto items = say(module, {}, "<speak>Still here.</speak>");
        QCOMPARE(module.linesOf(items).last(), QByteArray("702 END"));
        QVERIFY(!module.samplesOf(items).empty());
    }

    void endOfInputEndsTheModule()
    {
        ModuleDriver module;
        startModule(module);
        module.send(speak(QByteArray("Talking. ").repeated(200)));
        QVERIFY(module.waitForLine("701 BEGIN"));
        module.process().closeWriteChannel();
        QVERIFY(module.process().waitForFinished(30000));
        QCOMPARE(module.process().exitStatus(), QProcess::NormalExit);
    }
};

QTEST_GUILESS_MAIN(TestSdCadenza)
#include "tst_sdcadenza.moc"
