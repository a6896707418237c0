// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Voice enumeration over a generated root of N voice bundles (default 1,000 and 10,000):
// the first scan beside the floor of reading the same Info.plist files, the cached calls beside the
// floor of checking the three folders, and 'cadenza voices' as a whole process beside
// 'espeak-ng --voices' (without the voice index, with it warm, and after one bundle changed).

#include "BenchTable.h"

#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/services/BundleSpeechSynthesisService.h"
#include "core/services/Services.h"
#include "core/voices/SpeechSynthesizer.h"

#include <QCoreApplication>
#include <QDateTime>
#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QProcess>
#include <QTemporaryDir>

#include <dirent.h>
#include <sys/stat.h>

using namespace Cadenza;
using namespace CadenzaBench;

namespace {

void generate(const QString &folder, int count)
{
    QDir().mkpath(folder);
    for (int i = 0; i < count; ++i) {
        const QString quality
            = i % 3 == 0 ? QStringLiteral(".compact") : (i % 3 == 1 ? QStringLiteral(".premium") : QString());
        const QString base = QStringLiteral("com.vendra.speech.synthesis.voice.generated%1")
                                 .arg(i / 3, 6, 10, QLatin1Char('0'));
        const QString identifier = base + quality;
        const QVariantMap attributes {{QStringLiteral("VoiceIdentifier"), identifier},
            {QStringLiteral("VoiceName"), QStringLiteral("Voice %1%2").arg(i / 3).arg(quality)},
            {QStringLiteral("VoiceLocaleIdentifier"), QString::fromLatin1(Locales[(i / 3) % 20])},
            {QStringLiteral("VoiceGender"),
                i % 2 ? QStringLiteral("VoiceGenderFemale") : QStringLiteral("VoiceGenderMale")},
            {QStringLiteral("VoiceCreator"), 1}, {QStringLiteral("VoiceID"), i}};
        const QVariantMap info {{QStringLiteral("BundleIdentifier"), identifier},
            {QStringLiteral("BundleVersion"), QStringLiteral("1.0")},
            {QStringLiteral("Engine"), QVariantMap {{QStringLiteral("Voice"), QStringLiteral("en-us")}}},
            {QStringLiteral("VoiceAttributes"), attributes}};
        const QString bundle = folder + QStringLiteral("/V%1.SpeechVoice").arg(i);
        QDir().mkpath(bundle + QStringLiteral("/Resources"));
        QFile file(bundle + QStringLiteral("/Info.plist"));
        if (!file.open(QIODevice::WriteOnly)) {
            qFatal("cannot write %s", qPrintable(file.fileName()));
        }
        file.write(Platform::PropertyList::serialize(info));
        file.flush(); // before the time is set: writing would set it again
        // Installed an hour ago: the voice index keeps only bundles that have settled.
        file.setFileTime(QDateTime::currentDateTimeUtc().addSecs(-3600), QFileDevice::FileModificationTime);
    }
}

/// Median wall time of @p runs processes; @p before runs untimed ahead of each.
double processSeconds(const QString &program, const QStringList &arguments, int runs,
    const std::function<void(int)> &before = {},
    const QProcessEnvironment &environment = QProcessEnvironment::systemEnvironment())
{
    std::vector<double> samples;
    for (int i = 0; i < runs; ++i) {
        if (before) {
            before(i);
        }
        samples.push_back(secondsOf([&] {
            QProcess process;
            process.setProcessEnvironment(environment);
            process.setStandardOutputFile(QProcess::nullDevice());
            process.start(program, arguments);
            if (!process.waitForFinished(120000) || process.exitCode() != 0) {
                qFatal("%s failed", qPrintable(program));
            }
        }));
    }
    std::sort(samples.begin(), samples.end());
    return median(samples);
}

void measure(int count, const QString &cadenza)
{
    QTemporaryDir world;
    qputenv("CADENZA_ROOT", QFile::encodeName(world.path() + QStringLiteral("/root")));
    qputenv("XDG_DATA_HOME", QFile::encodeName(world.path() + QStringLiteral("/data")));
    qputenv("XDG_CONFIG_HOME", QFile::encodeName(world.path() + QStringLiteral("/config")));
    qputenv("XDG_CACHE_HOME", QFile::encodeName(world.path() + QStringLiteral("/cache")));
    generate(Platform::Paths::systemVoicesFolder(), count);

    // Floor of the first scan: list the folder and read every Info.plist, parsing nothing.
    const double readFloor = median(samplesOf(3, [&] {
        QDirIterator it(Platform::Paths::systemVoicesFolder(), {QStringLiteral("*.SpeechVoice")}, QDir::Dirs);
        qint64 bytes = 0;
        while (it.hasNext()) {
            QFile file(it.next() + QStringLiteral("/Info.plist"));
            if (file.open(QIODevice::ReadOnly)) {
                bytes += file.readAll().size();
            }
        }
        if (bytes == 0) {
            qFatal("nothing read");
        }
    }));
    const double firstScan = median(samplesOf(3, [&] {
        Platform::BundleSpeechSynthesisService fresh;
        fresh.setVoiceIndexPath(QString());
        if (fresh.installedVoices().size() != count) {
            qFatal("scan found the wrong number of voices");
        }
    }));
    // The first scan of a process with the voice index warm (the first round writes it).
    const double indexedScan = median(samplesOf(4, [&] {
        Platform::BundleSpeechSynthesisService fresh;
        if (fresh.installedVoices().size() != count) {
            qFatal("scan found the wrong number of voices");
        }
    }));

    auto service = std::make_shared<Platform::BundleSpeechSynthesisService>();
    Platform::Services::setSpeechSynthesis(service);
    (void)service->installedVoices();
    const QStringList folders = Platform::Paths::voiceFolders();
    const double statFloor = median(samplesOf(200, [&] {
        for (const QString &folder : folders) {
            struct stat st
            {
            };
            (void)::stat(QFile::encodeName(folder).constData(), &st);
        }
    }));
    const int runs = count > 5000 ? 20 : 100;
    const double all = median(samplesOf(runs, [] { (void)SpeechSynthesizer::allVoices(); }));
    const double mainstream
        = median(samplesOf(runs, [] { (void)SpeechSynthesizer::avaliableMainstreamVoices(); }));
    const double defaultVoice
        = median(samplesOf(runs, [] { (void)SpeechSynthesizer::defaultVoiceFromAllVoices(); }));
    const QStringList voices = SpeechSynthesizer::allVoices();
    const QString wanted = QStringLiteral("com.vendra.speech.synthesis.voice.generated%1")
                               .arg(count / 3 - 1, 6, 10, QLatin1Char('0'));
    const double resolve = median(samplesOf(runs * 10, [&] {
        if (SpeechSynthesizer::resolveVoiceIdentifier(wanted, voices).isEmpty()) {
            qFatal("resolution failed");
        }
    }));
    // Floor of resolution: one pass comparing every identifier.
    const double scanFloor = median(samplesOf(runs * 10, [&] {
        volatile bool found = voices.contains(wanted + QStringLiteral("x"));
        (void)found;
    }));

    const int cliRuns = count > 5000 ? 5 : 10;
    QProcessEnvironment noIndex = QProcessEnvironment::systemEnvironment();
    noIndex.insert(QStringLiteral("XDG_CACHE_HOME"), QStringLiteral("/dev/null/none"));
    const double cliNoIndex = processSeconds(cadenza, {QStringLiteral("voices")}, cliRuns, {}, noIndex);
    const double cli = processSeconds(cadenza, {QStringLiteral("voices")}, cliRuns);
    // One bundle's Info.plist changes before each run: parsed again, and the index written anew.
    const QString changing
        = Platform::Paths::systemVoicesFolder() + QStringLiteral("/V1.SpeechVoice/Info.plist");
    const double cliChanged = processSeconds(cadenza, {QStringLiteral("voices")}, cliRuns, [&](int i) {
        QFile file(changing);
        if (!file.open(QIODevice::ReadWrite)
            || !file.setFileTime(
                QDateTime::currentDateTimeUtc().addSecs(-3000 + i), QFileDevice::FileModificationTime)) {
            qFatal("cannot touch %s", qPrintable(changing));
        }
    });
    const double espeak = processSeconds(QStringLiteral("espeak-ng"), {QStringLiteral("--voices")}, cliRuns);
    // The process floor of the tool itself: the same command with no voice installed at all.
    QProcessEnvironment empty = QProcessEnvironment::systemEnvironment();
    for (const char *variable : {"CADENZA_ROOT", "XDG_DATA_HOME", "XDG_CACHE_HOME"}) {
        empty.insert(QLatin1String(variable), world.path() + QStringLiteral("/empty"));
    }
    const double cliEmpty = processSeconds(cadenza, {QStringLiteral("voices")}, cliRuns, {}, empty);
    // The floor of any index keyed by each Info.plist's stamp: list the folder and stat every
    // Info.plist, in this process (no process start, nothing decoded).
    const double stampFloor = median(samplesOf(5, [&] {
        const QByteArray folder = QFile::encodeName(Platform::Paths::systemVoicesFolder());
        DIR *dir = ::opendir(folder.constData());
        int found = 0;
        while (const dirent *entry = dir ? ::readdir(dir) : nullptr) {
            struct stat st
            {
            };
            const QByteArray plist = QByteArray(entry->d_name) + "/Info.plist";
            found += ::fstatat(::dirfd(dir), plist.constData(), &st, 0) == 0 ? 1 : 0;
        }
        if (dir) {
            ::closedir(dir);
        }
        if (found != count) {
            qFatal("stat found %d bundles", found);
        }
    }));

    const std::string n = " (" + std::to_string(count) + " bundles)";
    printTable(("Voice enumeration" + n).c_str(),
        {{"first scan, no index, ms", firstScan * 1e3, "ms", "read every Info.plist, no parsing",
             readFloor * 1e3},
            {"first scan, index warm, ms", indexedScan * 1e3, "ms", "read every Info.plist, no parsing",
                readFloor * 1e3},
            {"allVoices, cached, us", all * 1e6, "us", "stat the three voice folders", statFloor * 1e6},
            {"avaliableMainstreamVoices, cached, us", mainstream * 1e6, "us", "stat the three voice folders",
                statFloor * 1e6},
            {"defaultVoiceFromAllVoices, cached, us", defaultVoice * 1e6, "us",
                "stat the three voice folders", statFloor * 1e6},
            {"resolveVoiceIdentifier (prefix), us", resolve * 1e6, "us", "QStringList::contains, miss",
                scanFloor * 1e6},
            {"'cadenza voices' process, no index, ms", cliNoIndex * 1e3, "ms", "'espeak-ng --voices' process",
                espeak * 1e3},
            {"'cadenza voices' process, index warm, ms", cli * 1e3, "ms", "'espeak-ng --voices' process",
                espeak * 1e3},
            {"'cadenza voices', one bundle changed, ms", cliChanged * 1e3, "ms",
                "'espeak-ng --voices' process", espeak * 1e3},
            {"'cadenza voices', no voices installed, ms", cliEmpty * 1e3, "ms",
                "'espeak-ng --voices' process", espeak * 1e3},
            {"list + stat every Info.plist (floor), ms", stampFloor * 1e3, "ms",
                "'espeak-ng --voices' process", espeak * 1e3}});
    Platform::Services::setSpeechSynthesis(nullptr);
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const QString cadenza = QStringLiteral(CADENZA_CLI_PATH);
    for (const int count : countsFromArguments(argc, argv)) {
        measure(count, cadenza);
    }
    return 0;
}
