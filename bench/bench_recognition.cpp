// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// Recognition with the US English pocketsphinx model: pre-heat (model load) time, real-time factor
// (decode time / audio length) and word error rate of free dictation on speech from each English
// voice of the project (the flite voices slt, rms, awb and the espeak-ng voice).
//   bench_recognition
#include "BenchTable.h"
#include "RecognizerFixture.h"
#include "TestEnvironment.h"

#include "core/dictation/Transcriber.h"
#include "core/files/Paths.h"
#include "core/formats/AudioFileReader.h"
#include "core/services/RecognitionService.h"

#include <QCoreApplication>
#include <QProcess>
#include <QRegularExpression>

#include <cstdlib>
#include <ctime>

using namespace Cadenza;
using namespace Cadenza::Platform;
using namespace Cadenza::Testing;
using namespace CadenzaBench;

namespace {

const char *const Sentences[] = {
    "The weather will be sunny this afternoon.",
    "Please send the report to the office before noon.",
    "We are going to the station tomorrow morning.",
    "I would like a cup of coffee and a glass of water.",
    "The meeting has been moved to next Thursday.",
    "My brother lives in a small house near the river.",
    "Turn left at the second street and walk for five minutes.",
    "She bought three books and a new pair of shoes.",
};

QStringList words(const QString &text)
{
    QString cleaned = text.toLower();
    cleaned.replace(QRegularExpression(QStringLiteral("[^a-z' ]")), QStringLiteral(" "));
    return cleaned.split(QLatin1Char(' '), Qt::SkipEmptyParts);
}

int editDistance(const QStringList &a, const QStringList &b)
{
    std::vector<int> previous(size_t(b.size()) + 1);
    std::vector<int> current(previous.size());
    for (size_t j = 0; j < previous.size(); ++j) {
        previous[j] = int(j);
    }
    for (qsizetype i = 1; i <= a.size(); ++i) {
        current[0] = int(i);
        for (qsizetype j = 1; j <= b.size(); ++j) {
            current[size_t(j)] = std::min({previous[size_t(j)] + 1, current[size_t(j - 1)] + 1,
                previous[size_t(j - 1)] + (a[i - 1] == b[j - 1] ? 0 : 1)});
        }
        std::swap(previous, current);
    }
    return previous.back();
}

struct Decoded
{
    QString text;
    double audioSeconds = 0;
    double decodeSeconds = 0;
    double cpuSeconds = 0; ///< of this thread: what the decoding costs however busy the machine is
};

double threadCpuSeconds()
{
    timespec now {};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return double(now.tv_sec) + double(now.tv_nsec) / 1e9;
}

double loadAverage()
{
    double load[1] = {0};
    return getloadavg(load, 1) == 1 ? load[0] : -1;
}

Decoded decode(Transcriber &transcriber, const QString &path)
{
    Decoded result;
    const double cpuBefore = threadCpuSeconds();
    result.decodeSeconds = secondsOf([&] {
        AudioFileReader reader(transcriber.sampleRate());
        QString error;
        if (!reader.open(path, &error) || !transcriber.begin(QString(), &error)) {
            qFatal("%s", qPrintable(error));
        }
        while (true) {
            const auto block = reader.read(4096, &error);
            if (!block) {
                qFatal("%s", qPrintable(error));
            }
            if (block->empty()) {
                break;
            }
            if (!transcriber.feed(block->data(), qsizetype(block->size()), &error)) {
                qFatal("%s", qPrintable(error));
            }
        }
        result.audioSeconds = transcriber.fedSeconds();
        result.text = transcriber.finish(&error).value_or(QString());
    });
    result.cpuSeconds = threadCpuSeconds() - cpuBefore;
    return result;
}

/**
 * Decodes @p path as the microphone delivers it: 20 ms chunks, the best words so far looked at
 * after every chunk, or only when another @p partialInterval seconds of audio arrived.
 */
Decoded decodeLikeTheMicrophone(Transcriber &transcriber, const QString &path, double partialInterval)
{
    Decoded result;
    const double cpuBefore = threadCpuSeconds();
    result.decodeSeconds = secondsOf([&] {
        AudioFileReader reader(transcriber.sampleRate());
        QString error;
        if (!reader.open(path, &error) || !transcriber.begin(QString(), &error)) {
            qFatal("%s", qPrintable(error));
        }
        const qsizetype chunk = transcriber.sampleRate() / 50;
        qint64 mark = -1;
        while (true) {
            const auto block = reader.read(chunk, &error);
            if (!block) {
                qFatal("%s", qPrintable(error));
            }
            if (block->empty()) {
                break;
            }
            if (!transcriber.feed(block->data(), qsizetype(block->size()), &error)) {
                qFatal("%s", qPrintable(error));
            }
            const qint64 now
                = partialInterval > 0 ? qint64(transcriber.fedSeconds() / partialInterval) : mark - 1;
            if (now != mark) {
                mark = now;
                (void)transcriber.partialResult();
            }
        }
        result.audioSeconds = transcriber.fedSeconds();
        result.text = transcriber.finish(&error).value_or(QString());
    });
    result.cpuSeconds = threadCpuSeconds() - cpuBefore;
    return result;
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    TestEnvironment environment;
    const QString prefix = QStringLiteral("com.vendra.bench.recognition.");
    for (const QString voice : {QStringLiteral("slt"), QStringLiteral("rms"), QStringLiteral("awb")}) {
        TestEnvironment::writeFliteVoiceBundle(Paths::userVoicesFolder(), voice,
            TestEnvironment::voiceAttributes(prefix + voice, voice, QStringLiteral("en_US")), voice);
    }
    TestEnvironment::writeVoiceBundle(Paths::userVoicesFolder(), QStringLiteral("espeak"),
        TestEnvironment::voiceAttributes(
            prefix + QStringLiteral("espeak"), QStringLiteral("espeak"), QStringLiteral("en_US")));
    RecognizerFixture::writeModelBundle(Paths::userRecognizersFolder(), QStringLiteral("en_US"));

    BundleRecognitionService recognition;
    QString error;
    const auto model = recognition.modelForLocale(QStringLiteral("en_US"), &error);
    if (!model) {
        qFatal("%s", qPrintable(error));
    }
    std::unique_ptr<Transcriber> transcriber;
    // The first load of a model's files is tried in a copy of the process before the real load (the
    // verdict is kept in the cache folder), so it costs about two loads; later ones one.
    const double firstLoad = secondsOf([&] {
        transcriber = Transcriber::load(*model, &error);
        if (!transcriber) {
            qFatal("%s", qPrintable(error));
        }
    });
    const std::vector<double> loads = samplesOf(5, [&] {
        transcriber = Transcriber::load(*model, &error);
        if (!transcriber) {
            qFatal("%s", qPrintable(error));
        }
    });

    std::vector<Row> rows;
    rows.push_back({"pre-heat (load en_US model), median of 5", median(loads), "s", "goal", 1.0});
    rows.push_back({"pre-heat, slowest of 5", loads.back(), "s", "goal", 1.0});
    rows.push_back({"first load of new model files (checked in a copy first)", firstLoad, "s", "goal", 1.0});
    QString text;
    for (const char *sentence : Sentences) {
        text += QString::fromUtf8(sentence) + QLatin1Char(' ');
    }
    double allAudio = 0;
    double allDecode = 0;
    double allCpu = 0;
    const double loadBefore = loadAverage();
    for (const QString voice :
        {QStringLiteral("slt"), QStringLiteral("rms"), QStringLiteral("awb"), QStringLiteral("espeak")}) {
        const QString wav = environment.path(voice + QStringLiteral(".wav"));
        const int said = QProcess::execute(QStringLiteral(CADENZA_CLI_PATH),
            {QStringLiteral("say"), QStringLiteral("--voice"), prefix + voice, QStringLiteral("--output"),
                wav, text});
        if (said != 0) {
            qFatal("cadenza say failed for %s", qPrintable(voice));
        }
        const Decoded decoded = decode(*transcriber, wav);
        const QStringList reference = words(text);
        const double rate = double(editDistance(reference, words(decoded.text))) / double(reference.size());
        std::fprintf(stderr, "%s heard: %s\n", qPrintable(voice), qPrintable(decoded.text));
        allAudio += decoded.audioSeconds;
        allDecode += decoded.decodeSeconds;
        allCpu += decoded.cpuSeconds;
        rows.push_back({("word error rate, " + voice.toStdString()).c_str(), rate * 100, "%", "goal", 20.0});
        rows.push_back({("real-time factor, " + voice.toStdString()).c_str(),
            decoded.decodeSeconds / decoded.audioSeconds, "x", "goal", 0.3});
    }
    rows.push_back({"real-time factor, all voices", allDecode / allAudio, "x", "goal", 0.3});
    // The microphone's way, on the first voice's recording: partial results for every chunk, or five a
    // second.
    {
        const QString wav = environment.path(QStringLiteral("slt.wav"));
        const Decoded everyChunk = decodeLikeTheMicrophone(*transcriber, wav, 0);
        const Decoded fiveASecond = decodeLikeTheMicrophone(*transcriber, wav, 0.2);
        rows.push_back({"microphone (slt), partial every 20 ms: RTF in CPU time",
            everyChunk.cpuSeconds / everyChunk.audioSeconds, "x", "goal", 0.3});
        rows.push_back({"microphone (slt), partial every 0.2 s: RTF in CPU time",
            fiveASecond.cpuSeconds / fiveASecond.audioSeconds, "x", "goal", 0.3});
        std::fprintf(stderr, "microphone-like decoding, same words both ways: %s\n",
            everyChunk.text == fiveASecond.text ? "yes" : "no");
    }
    rows.push_back({"real-time factor in CPU time, all voices", allCpu / allAudio, "x", "goal", 0.3});
    std::fprintf(
        stderr, "load average (1 min) before decoding %.2f, after %.2f\n", loadBefore, loadAverage());
    printTable("Recognition (pocketsphinx, en_US)", rows);
    return 0;
}
