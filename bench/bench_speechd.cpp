// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// speech-dispatcher's view of speaking: from SPEAK to the first audio block and to END, for one
// sentence, through sd_cadenza beside speech-dispatcher's own espeak-ng module in the same run.
//
// Both are module programs; each is driven directly over its standard input and output exactly as
// speech-dispatcher drives it (INIT, AUDIO with server-side audio, SET, SPEAK), so the figures are
// the modules' own and leave out the server's fixed cost, the same for both.
//
// A module that only answers, at once, shows what the pipes and the driver cost by themselves.
// A second table takes the module away: the espeak-ng engine plugin called in this process, to show
// what the engine itself needs before its first block (the floor for any module built on it).
//
//   bench_speechd [RUNS]     (default 20; needs speech-dispatcher-espeak-ng)

#include "AudioSender.h"
#include "BenchTable.h"
#include "ModuleDriver.h"

#include "core/engines/SpeechEngine.h"
#include "core/engines/SpeechEngines.h"
#include "core/files/Paths.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"

#include <QCoreApplication>
#include <QCryptographicHash>
#include <QDir>
#include <QDirIterator>
#include <QElapsedTimer>
#include <QFile>
#include <QFileInfo>
#include <QTemporaryDir>

#include <cstring>
#include <unistd.h>

#include <optional>

namespace {

const QByteArray Sentence
    = "The quick brown fox jumps over the lazy dog, and then it runs all the way back home.";

struct Timing
{
    std::vector<double> firstAudioMs;
    std::vector<double> endMs;
    qsizetype samples = 0;
    qsizetype firstBlockSamples = 0;
};

bool setUp(
    ModuleDriver &module, const QString &program, const QStringList &arguments, const QByteArray &settings)
{
    if (!module.start(program, arguments)) {
        return false;
    }
    module.send("INIT\nAUDIO\naudio_output_method=server\n.\nSET\n" + settings + ".\n");
    if (!module.waitForLine("299 OK LOADED SUCCESSFULLY")
        || !module.waitForLine("203 OK SETTINGS RECEIVED")) {
        return false;
    }
    (void)module.takeItems();
    return true;
}

/// Speaks the sentence once and adds its times to @p timing.
bool speakOnce(ModuleDriver &module, Timing &timing)
{
    QElapsedTimer clock;
    clock.start();
    module.send("SPEAK\n<speak>" + Sentence + "</speak>\n.\n");
    if (!module.waitForLine("705 AUDIO")) {
        return false;
    }
    timing.firstAudioMs.push_back(double(clock.nsecsElapsed()) / 1e6);
    if (module.waitForAny({"702 END", "703 STOP"}) != "702 END") {
        return false;
    }
    timing.endMs.push_back(double(clock.nsecsElapsed()) / 1e6);
    const auto items = module.takeItems();
    timing.samples = qsizetype(ModuleDriver::samplesOf(items).size());
    for (const auto &item : items) {
        if (!item.samples.empty()) {
            timing.firstBlockSamples = qsizetype(item.samples.size());
            break;
        }
    }
    return true;
}

/// An engine plugin alone, in this process: from the render call to its first block, with the voice
/// already chosen and (when @p other is given) with the voice chosen anew each time; the first
/// block's size; and the whole render.
void measureEngine(const char *title, const Cadenza::Platform::VoiceDescription &voice,
    const std::optional<Cadenza::Platform::VoiceDescription> &other, int runs)
{
    using namespace Cadenza::Platform;
    QString error;
    SpeechEngine *engine = SpeechEngines::engine(voice.engineName, &error);
    if (!engine) {
        std::fprintf(
            stderr, "bench_speechd: no engine %s: %s\n", qPrintable(voice.engineName), qPrintable(error));
        return;
    }
    SynthesisParameters parameters;
    parameters.normalWordsPerMinute = parameters.wordsPerMinute = voice.engineRate;
    parameters.normalPitch = parameters.pitch = voice.enginePitch;
    const QString text = QString::fromUtf8(Sentence);
    qsizetype samples = 0;
    const auto firstBlock = [&](const VoiceDescription &with) {
        QElapsedTimer clock;
        clock.start();
        double ms = -1;
        if (!engine->renderBlocks(
                with, text, parameters,
                [&](const qint16 *, qsizetype count, int) {
                    ms = double(clock.nsecsElapsed()) / 1e6;
                    samples = count;
                    return false; // the first block is all this measures
                },
                &error)) {
            std::fprintf(stderr, "bench_speechd: %s\n", qPrintable(error));
        }
        return ms;
    };
    std::vector<double> kept;
    std::vector<double> anew;
    std::vector<double> whole;
    (void)firstBlock(voice);
    for (int i = 0; i < runs; ++i) {
        kept.push_back(firstBlock(voice));
        if (other) {
            anew.push_back(firstBlock(i % 2 ? voice : *other));
        }
        QElapsedTimer clock;
        clock.start();
        (void)engine->render(voice, text, parameters, &error);
        whole.push_back(double(clock.nsecsElapsed()) / 1e6);
    }
    (void)firstBlock(voice);
    for (auto *list : {&kept, &anew, &whole}) {
        std::sort(list->begin(), list->end());
    }
    using CadenzaBench::median;
    std::vector<CadenzaBench::Row> rows {
        {"render call to first block, voice kept, ms", median(kept), "ms", "", 0}};
    if (other) {
        rows.push_back({"render call to first block, voice chosen, ms", median(anew), "ms", "", 0});
    }
    rows.push_back({"first block, samples", double(samples), "samples", "", 0});
    rows.push_back({"whole sentence rendered, ms", median(whole), "ms", "", 0});
    CadenzaBench::printTable(title, rows);
}

/// A flite voice description for the build's slt voice, its file in a bundle folder under @p folder.
std::optional<Cadenza::Platform::VoiceDescription> fliteVoice(const QString &folder)
{
    const QString source = QStringLiteral(CADENZA_FLITE_VOICES_DIR "/cmu_us_slt.flitevox");
    QFile file(source);
    if (!file.open(QIODevice::ReadOnly) || !QDir().mkpath(folder + QStringLiteral("/Resources"))) {
        return std::nullopt;
    }
    const QByteArray data = file.readAll();
    (void)QFile::copy(source, folder + QStringLiteral("/Resources/cmu_us_slt.flitevox"));
    Cadenza::Platform::VoiceDescription voice;
    voice.identifier = QStringLiteral("bench.slt");
    voice.engineName = QStringLiteral("flite");
    voice.engineVoice = QStringLiteral("cmu_us_slt.flitevox");
    voice.bundlePath = folder;
    voice.engineSettings = {{QStringLiteral("VoiceFileSize"), qint64(data.size())},
        {QStringLiteral("VoiceFileSHA256"),
            QString::fromLatin1(QCryptographicHash::hash(data, QCryptographicHash::Sha256).toHex())}};
    return voice;
}

/**
 * The floor: a module that does nothing but answer. It reads lines with plain read(), and answers the
 * end of each message's data with the answers and events of speaking and one block of silence as
 * large as sd_cadenza's first. Run as "bench_speechd --answering-module".
 */
int answeringModule()
{
    const std::vector<qint16> silence(1324, 0);
    const QByteArray speech = "701 BEGIN\n"
        + SdCadenza::AudioSender::audioEvent(silence.data(), qsizetype(silence.size()), 22050) + "702 END\n";
    QByteArray pending;
    QByteArray command; // the command whose data is being read
    char buffer[65536];
    for (;;) {
        const ssize_t got = ::read(STDIN_FILENO, buffer, sizeof buffer);
        if (got <= 0) {
            return 0;
        }
        pending.append(buffer, qsizetype(got));
        for (qsizetype end = pending.indexOf('\n'); end >= 0; end = pending.indexOf('\n')) {
            const QByteArray line = pending.left(end);
            pending.remove(0, end + 1);
            QByteArrayList answers; // each written on its own, as a module answers before it speaks
            if (command.isEmpty()) {
                if (line == "INIT") {
                    answers = {"299 OK LOADED SUCCESSFULLY\n"};
                } else {
                    command = line;
                    if (line == "AUDIO") {
                        answers = {"207 OK RECEIVING AUDIO SETTINGS\n"};
                    } else if (line == "SET") {
                        answers = {"203 OK RECEIVING SETTINGS\n"};
                    }
                }
            } else if (line == ".") {
                if (command == "AUDIO") {
                    answers = {"203 OK AUDIO INITIALIZED\n"};
                } else if (command == "SET") {
                    answers = {"203 OK SETTINGS RECEIVED\n"};
                } else {
                    answers = {"200 OK SPEAKING\n", speech};
                }
                command.clear();
            }
            for (const QByteArray &answer : std::as_const(answers)) {
                for (qsizetype at = 0; at < answer.size();) {
                    const ssize_t written
                        = ::write(STDOUT_FILENO, answer.constData() + at, size_t(answer.size() - at));
                    if (written <= 0) {
                        return 1;
                    }
                    at += written;
                }
            }
        }
    }
}

/// Copies the shipped compact sample voice into this private world's system voice folder.
void installCompactVoice()
{
    const QString source = QStringLiteral(CADENZA_SOURCE_DIR "/data/sample-voices/MarenCompact.SpeechVoice");
    const QString target
        = Cadenza::Platform::Paths::systemVoicesFolder() + QStringLiteral("/MarenCompact.SpeechVoice");
    QDirIterator it(source, QDir::Files, QDirIterator::Subdirectories);
    while (it.hasNext()) {
        const QString file = it.next();
        const QString destination = target + file.mid(source.size());
        QDir().mkpath(QFileInfo(destination).absolutePath());
        QFile::copy(file, destination);
    }
}

} // namespace

int main(int argc, char *argv[])
{
    if (argc > 1 && std::strcmp(argv[1], "--answering-module") == 0) {
        return answeringModule();
    }
    QCoreApplication app(argc, argv);
    const int runs = argc > 1 ? qMax(1, std::atoi(argv[1])) : 20;
    installCompactVoice();

    const QString espeak = QStringLiteral("/usr/lib/speech-dispatcher-modules/sd_espeak-ng");
    ModuleDriver cadenza;
    ModuleDriver peer;
    ModuleDriver answering;
    if (!setUp(cadenza, QStringLiteral(SD_CADENZA_PATH), {},
            "synthesis_voice=Maren Compact\nrate=0\npitch=0\nvolume=100\nlanguage=en\n")
        || !setUp(peer, espeak, {QStringLiteral("/etc/speech-dispatcher/modules/espeak-ng.conf")},
            "language=en-us\nvoice=female1\nsynthesis_voice=NULL\nrate=0\npitch=0\nvolume=100\n"
            "punctuation_mode=none\nspelling_mode=off\ncap_let_recogn=none\n")
        || !setUp(
            answering, QCoreApplication::applicationFilePath(), {QStringLiteral("--answering-module")}, "")) {
        std::fprintf(
            stderr, "bench_speechd: cannot start both modules (is %s installed?)\n", qPrintable(espeak));
        return 1;
    }

    Timing ours;
    Timing theirs;
    Timing floor;
    // One warm-up each, then the three in turn, so that all see the same machine.
    (void)speakOnce(cadenza, ours);
    (void)speakOnce(peer, theirs);
    (void)speakOnce(answering, floor);
    ours = {};
    theirs = {};
    floor = {};
    for (int i = 0; i < runs; ++i) {
        if (!speakOnce(cadenza, ours) || !speakOnce(peer, theirs) || !speakOnce(answering, floor)) {
            std::fprintf(stderr, "bench_speechd: a module did not finish speaking\n");
            return 1;
        }
    }
    for (auto *list :
        {&ours.firstAudioMs, &ours.endMs, &theirs.firstAudioMs, &theirs.endMs, &floor.firstAudioMs}) {
        std::sort(list->begin(), list->end());
    }
    using CadenzaBench::median;
    using CadenzaBench::percentile;
    const std::string title
        = "speech-dispatcher modules, one sentence (" + std::to_string(runs) + " runs each)";
    CadenzaBench::printTable(title.c_str(),
        {{"SPEAK to first audio, median, ms", median(ours.firstAudioMs), "ms", "sd_espeak-ng",
             median(theirs.firstAudioMs)},
            {"SPEAK to first audio, 90th percentile, ms", percentile(ours.firstAudioMs, 0.9), "ms",
                "sd_espeak-ng", percentile(theirs.firstAudioMs, 0.9)},
            {"SPEAK to END, median, ms", median(ours.endMs), "ms", "sd_espeak-ng", median(theirs.endMs)},
            {"audio of the sentence, s", double(ours.samples) / 22050.0, "s", "sd_espeak-ng",
                double(theirs.samples) / 22050.0, true},
            {"first audio block, samples", double(ours.firstBlockSamples), "samples", "sd_espeak-ng",
                double(theirs.firstBlockSamples)},
            // The pipes and the driver's own reading, the same for every module.
            {"module that only answers: first audio, ms", median(floor.firstAudioMs), "ms", "", 0},
            {"first audio above that module's, ms", median(ours.firstAudioMs) - median(floor.firstAudioMs),
                "ms", "sd_espeak-ng", median(theirs.firstAudioMs) - median(floor.firstAudioMs)}});
    if (const auto maren = Cadenza::Platform::Services::speechSynthesis().voice(
            QStringLiteral("com.vendra.speech.synthesis.voice.maren.compact"))) {
        // Another variant of the same voice makes the engine choose its voice again.
        auto other = *maren;
        other.engineVariant = QStringLiteral("f3");
        measureEngine("espeak-ng engine plugin alone, in this process (Maren Compact)", *maren, other, runs);
    }
    QTemporaryDir scratch;
    if (const auto slt = fliteVoice(scratch.filePath(QStringLiteral("slt")))) {
        measureEngine("flite engine plugin alone, in this process (slt)", *slt, std::nullopt, runs);
    }
    return 0;
}
