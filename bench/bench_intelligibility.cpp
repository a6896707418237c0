// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// How well a recogniser understands each English sample voice, and how fast each engine speaks.
//
// Each English voice (the installed sample voices and the repository's upgrade of Orin) speaks a fixed
// set of sentences; pocketsphinx (Debian's pocketsphinx_batch with the en-us model, on 16 kHz mono)
// writes down what it hears, and the word error rate of each voice is printed beside the espeak-ng
// voice of the same person. Then each engine's real-time factor (synthesis time / audio length), and
// the time until the first audio of `cadenza say` beside `flite -t` writing the same sentence.
//   bench_intelligibility [RUNS]    RUNS: latency runs per command (default 7)
#include "BenchTable.h"

#include "core/files/Paths.h"
#include "core/formats/WaveFile.h"
#include "core/services/BundleSpeechSynthesisService.h"

#include <QCoreApplication>
#include <QDir>
#include <QDirIterator>
#include <QElapsedTimer>
#include <QFile>
#include <QMap>
#include <QProcess>
#include <QRegularExpression>
#include <QTemporaryDir>

using namespace Cadenza::Platform;
using namespace CadenzaBench;

namespace {

const QStringList Sentences = {
    QStringLiteral("The birch canoe slid on the smooth planks."),
    QStringLiteral("Glue the sheet to the dark blue background."),
    QStringLiteral("It is easy to tell the depth of a well."),
    QStringLiteral("These days a chicken leg is a rare dish."),
    QStringLiteral("Rice is often served in round bowls."),
    QStringLiteral("The juice of lemons makes fine punch."),
    QStringLiteral("The box was thrown beside the parked truck."),
    QStringLiteral("Four hours of steady work faced us."),
};

struct Voice
{
    QString label;
    QString bundle;
    QString identifier;
    QString engine;
};

QStringList words(const QString &text)
{
    return text.toLower()
        .remove(QRegularExpression(QStringLiteral("[^a-z' ]")))
        .split(u' ', Qt::SkipEmptyParts);
}

/// Word-level edit distance.
int editDistance(const QStringList &a, const QStringList &b)
{
    std::vector<int> previous(size_t(b.size()) + 1), current(size_t(b.size()) + 1);
    for (qsizetype j = 0; j <= b.size(); ++j) {
        previous[size_t(j)] = int(j);
    }
    for (qsizetype i = 1; i <= a.size(); ++i) {
        current[0] = int(i);
        for (qsizetype j = 1; j <= b.size(); ++j) {
            const int substitution = previous[size_t(j - 1)] + (a[i - 1] == b[j - 1] ? 0 : 1);
            current[size_t(j)]
                = std::min({previous[size_t(j)] + 1, current[size_t(j - 1)] + 1, substitution});
        }
        std::swap(previous, current);
    }
    return previous[size_t(b.size())];
}

bool copyFolder(const QString &source, const QString &target)
{
    QDirIterator it(source, QDir::Files, QDirIterator::Subdirectories);
    while (it.hasNext()) {
        const QString file = it.next();
        const QString destination = target + file.mid(source.size());
        if (!QDir().mkpath(QFileInfo(destination).absolutePath()) || !QFile::copy(file, destination)) {
            return false;
        }
    }
    return true;
}

bool run(const QString &program, const QStringList &arguments, const QProcessEnvironment &environment = {})
{
    QProcess process;
    if (!environment.isEmpty()) {
        process.setProcessEnvironment(environment);
    }
    process.setProcessChannelMode(QProcess::ForwardedErrorChannel);
    process.start(program, arguments);
    process.closeWriteChannel();
    return process.waitForFinished(600000) && process.exitStatus() == QProcess::NormalExit
        && process.exitCode() == 0;
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const int runs = argc > 1 ? std::max(1, std::atoi(argv[1])) : 7;
    QTemporaryDir work;
    const QString root = work.path();

    // The English voices, each in a voice folder of its own (the two Orins share an identifier).
    QList<Voice> voices;
    const auto add = [&](const QString &label, const QString &bundle) {
        const auto description = BundleSpeechSynthesisService::readBundle(bundle);
        if (description) {
            voices.append({label, bundle, description->identifier, description->engineName});
        }
    };
    const QString installed = QStringLiteral(CADENZA_SAMPLE_VOICES);
    for (const QString &name : {QStringLiteral("MarenCompact"), QStringLiteral("MarenPremium"),
             QStringLiteral("Orin"), QStringLiteral("Wren")}) {
        add(name, installed + QLatin1Char('/') + name + QStringLiteral(".SpeechVoice"));
    }
    // The downloadable English voices: Tobias in both sizes and the upgrade of Orin.
    const QString repository = QStringLiteral(CADENZA_SAMPLE_REPOSITORY_BUNDLES "/voices/");
    for (const QString &name : {QStringLiteral("TobiasCompact"), QStringLiteral("TobiasPremium")}) {
        add(name, repository + name + QStringLiteral(".SpeechVoice"));
    }
    add(QStringLiteral("Orin (upgrade)"), repository + QStringLiteral("Orin.SpeechVoice"));

    QMap<QString, double> synthesisSeconds, audioSeconds;
    QStringList control;
    QDir().mkpath(root + QStringLiteral("/audio"));
    for (int v = 0; v < voices.size(); ++v) {
        const Voice &voice = voices[v];
        const QString data = root + QStringLiteral("/voice%1").arg(v);
        qputenv("XDG_DATA_HOME", QFile::encodeName(data));
        qputenv("CADENZA_ROOT", QFile::encodeName(root + QStringLiteral("/root")));
        if (!copyFolder(voice.bundle, Paths::userVoicesFolder() + QStringLiteral("/Voice.SpeechVoice"))) {
            std::fprintf(stderr, "cannot copy %s\n", qPrintable(voice.bundle));
            return 1;
        }
        BundleSpeechSynthesisService service;
        for (int s = 0; s < Sentences.size(); ++s) {
            const QString wav = root + QStringLiteral("/audio/%1-%2.wav").arg(v).arg(s);
            QString error;
            QElapsedTimer clock;
            clock.start();
            const bool rendered = service.renderToFile({Sentences[s], voice.identifier}, wav, &error);
            const double seconds = clock.nsecsElapsed() / 1e9;
            const auto audio = rendered ? WaveFile::read(wav, &error) : std::nullopt;
            if (!audio) {
                std::fprintf(stderr, "%s: %s\n", qPrintable(voice.label), qPrintable(error));
                return 1;
            }
            synthesisSeconds[voice.engine] += seconds;
            audioSeconds[voice.engine] += audio->durationSeconds();
            // pocketsphinx's models want 16 kHz mono 16-bit; headerless so the batch tool reads samples only.
            const QString raw = root + QStringLiteral("/audio/%1-%2.raw").arg(v).arg(s);
            if (!run(QStringLiteral("sox"),
                    {wav, QStringLiteral("-r"), QStringLiteral("16000"), QStringLiteral("-c"),
                        QStringLiteral("1"), QStringLiteral("-b"), QStringLiteral("16"), QStringLiteral("-e"),
                        QStringLiteral("signed-integer"), raw})) {
                std::fprintf(stderr, "sox failed\n");
                return 1;
            }
            control.append(QStringLiteral("%1-%2").arg(v).arg(s));
        }
    }

    // One recogniser run over every utterance: the model loads once.
    QFile list(root + QStringLiteral("/control"));
    if (!list.open(QIODevice::WriteOnly)) {
        return 1;
    }
    list.write(control.join(u'\n').toUtf8() + '\n');
    list.close();
    const QString hypotheses = root + QStringLiteral("/hypotheses");
    if (!run(QStringLiteral("pocketsphinx_batch"),
            {QStringLiteral("-adcin"), QStringLiteral("yes"), QStringLiteral("-cepdir"),
                root + QStringLiteral("/audio"), QStringLiteral("-cepext"), QStringLiteral(".raw"),
                QStringLiteral("-ctl"), list.fileName(), QStringLiteral("-hyp"), hypotheses,
                QStringLiteral("-logfn"), QStringLiteral("/dev/null")})) {
        std::fprintf(
            stderr, "pocketsphinx_batch failed (Debian packages pocketsphinx, pocketsphinx-en-us)\n");
        return 1;
    }
    QFile result(hypotheses);
    if (!result.open(QIODevice::ReadOnly)) {
        return 1;
    }
    QMap<QString, QString> heard; // utterance → text
    static const QRegularExpression line(QStringLiteral("^(.*) \\((\\S+) [-0-9]+\\)$"));
    for (const QByteArray &bytes : result.readAll().split('\n')) {
        const auto match = line.match(QString::fromUtf8(bytes).trimmed());
        if (match.hasMatch()) {
            heard.insert(match.captured(2), match.captured(1));
        }
    }

    std::vector<double> errorRates(size_t(voices.size()));
    for (int v = 0; v < voices.size(); ++v) {
        int errors = 0, total = 0;
        for (int s = 0; s < Sentences.size(); ++s) {
            const QStringList reference = words(Sentences[s]);
            errors += editDistance(reference, words(heard.value(QStringLiteral("%1-%2").arg(v).arg(s))));
            total += int(reference.size());
        }
        errorRates[size_t(v)] = 100.0 * errors / total;
    }
    const auto rateOf = [&](const QString &label) {
        for (int v = 0; v < voices.size(); ++v) {
            if (voices[v].label == label) {
                return errorRates[size_t(v)];
            }
        }
        return 0.0;
    };
    std::vector<Row> rows;
    const QMap<QString, QString> peers = {{QStringLiteral("MarenPremium"), QStringLiteral("MarenCompact")},
        {QStringLiteral("TobiasPremium"), QStringLiteral("TobiasCompact")},
        {QStringLiteral("Orin (upgrade)"), QStringLiteral("Orin")}};
    for (int v = 0; v < voices.size(); ++v) {
        const QString peer = peers.value(voices[v].label, voices[v].label);
        rows.push_back(
            {QString(voices[v].label + QStringLiteral(" (") + voices[v].engine + QStringLiteral(") WER"))
                    .toStdString(),
                errorRates[size_t(v)], "%", QString(peer + QStringLiteral(" (espeak-ng) WER")).toStdString(),
                rateOf(peer)});
    }
    printTable("Intelligibility: word error rate of pocketsphinx (en-us) on 8 sentences", rows);

    rows.clear();
    for (auto it = synthesisSeconds.cbegin(); it != synthesisSeconds.cend(); ++it) {
        rows.push_back({QString(it.key() + QStringLiteral(" real-time factor")).toStdString(),
            it.value() / audioSeconds.value(it.key()), "x", "goal for flite", 0.05});
    }

    // First audio: `cadenza say` to a file with the flite voice, beside flite itself on the same sentence.
    const QString sentence = Sentences.first();
    const QString data = root + QStringLiteral("/voice1"); // MarenPremium, flite slt
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("XDG_DATA_HOME"), data);
    const QString out = root + QStringLiteral("/latency.wav");
    const auto cadenzaSay = samplesOf(runs, [&] {
        run(QStringLiteral(CADENZA_CLI_PATH),
            {QStringLiteral("say"), QStringLiteral("--voice"), voices[1].identifier,
                QStringLiteral("--output"), out, sentence},
            environment);
    });
    const auto fliteSay = samplesOf(runs, [&] {
        run(QStringLiteral("flite"),
            {QStringLiteral("-voice"), QStringLiteral(CADENZA_FLITE_VOICES_DIR "/cmu_us_slt.flitevox"),
                QStringLiteral("-t"), sentence, QStringLiteral("-o"), out});
    });
    rows.push_back({"first audio, 'cadenza say' (slt), ms", median(cadenzaSay) * 1e3, "ms",
        "'flite -t' (same voice file)", median(fliteSay) * 1e3});
    printTable("Engines: synthesis speed and first audio", rows);
    return 0;
}
