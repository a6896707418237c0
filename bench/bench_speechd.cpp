// SPDX-License-Identifier: GPL-3.0-or-later
// speech-dispatcher's view of speaking: from SPEAK to the first audio block and to END, for one
// sentence, through sd_cadenza beside speech-dispatcher's own espeak-ng module in the same run.
//
// Both are module programs; each is driven directly over its standard input and output exactly as
// speech-dispatcher drives it (INIT, AUDIO with server-side audio, SET, SPEAK), so the figures are
// the modules' own and leave out the server's fixed cost, the same for both.
//
//   bench_speechd [RUNS]     (default 20; needs speech-dispatcher-espeak-ng)

#include "BenchTable.h"
#include "ModuleDriver.h"

#include "core/files/Paths.h"

#include <QCoreApplication>
#include <QDir>
#include <QDirIterator>
#include <QElapsedTimer>
#include <QFile>
#include <QFileInfo>

namespace {

const QByteArray Sentence
    = "The quick brown fox jumps over the lazy dog, and then it runs all the way back home.";

struct Timing
{
    std::vector<double> firstAudioMs;
    std::vector<double> endMs;
    qsizetype samples = 0;
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
    timing.samples = qsizetype(ModuleDriver::samplesOf(module.takeItems()).size());
    return true;
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
    QCoreApplication app(argc, argv);
    const int runs = argc > 1 ? qMax(1, std::atoi(argv[1])) : 20;
    installCompactVoice();

    const QString espeak = QStringLiteral("/usr/lib/speech-dispatcher-modules/sd_espeak-ng");
    ModuleDriver cadenza;
    ModuleDriver peer;
    if (!setUp(cadenza, QStringLiteral(SD_CADENZA_PATH), {},
            "synthesis_voice=Maren Compact\nrate=0\npitch=0\nvolume=100\nlanguage=en\n")
        || !setUp(peer, espeak, {QStringLiteral("/etc/speech-dispatcher/modules/espeak-ng.conf")},
            "language=en-us\nvoice=female1\nsynthesis_voice=NULL\nrate=0\npitch=0\nvolume=100\n"
            "punctuation_mode=none\nspelling_mode=off\ncap_let_recogn=none\n")) {
        std::fprintf(
            stderr, "bench_speechd: cannot start both modules (is %s installed?)\n", qPrintable(espeak));
        return 1;
    }

    Timing ours;
    Timing theirs;
    // One warm-up each, then the two in turn, so that both see the same machine.
    (void)speakOnce(cadenza, ours);
    (void)speakOnce(peer, theirs);
    ours = {};
    theirs = {};
    for (int i = 0; i < runs; ++i) {
        if (!speakOnce(cadenza, ours) || !speakOnce(peer, theirs)) {
            std::fprintf(stderr, "bench_speechd: a module did not finish speaking\n");
            return 1;
        }
    }
    for (auto *list : {&ours.firstAudioMs, &ours.endMs, &theirs.firstAudioMs, &theirs.endMs}) {
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
                double(theirs.samples) / 22050.0, true}});
    return 0;
}
