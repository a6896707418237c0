// Voice enumeration over a generated root of N voice bundles (default 1,000 and 10,000):
// the first scan beside the floor of reading the same Info.plist files, the cached calls beside the
// floor of checking the three folders, and 'cadenza voices' as a whole process beside
// 'espeak-ng --voices'.

#include "BenchTable.h"

#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/services/BundleSpeechSynthesisService.h"
#include "core/services/Services.h"
#include "core/voices/SpeechSynthesizer.h"

#include <QCoreApplication>
#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QProcess>
#include <QTemporaryDir>

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
    }
}

double processSeconds(const QString &program, const QStringList &arguments, int runs)
{
    const auto samples = samplesOf(runs, [&] {
        QProcess process;
        process.setStandardOutputFile(QProcess::nullDevice());
        process.start(program, arguments);
        process.waitForFinished(120000);
    });
    return median(samples);
}

void measure(int count, const QString &cadenza)
{
    QTemporaryDir world;
    qputenv("CADENZA_ROOT", QFile::encodeName(world.path() + QStringLiteral("/root")));
    qputenv("XDG_DATA_HOME", QFile::encodeName(world.path() + QStringLiteral("/data")));
    qputenv("XDG_CONFIG_HOME", QFile::encodeName(world.path() + QStringLiteral("/config")));
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

    const double cliRuns = count > 5000 ? 5 : 10;
    const double cli = processSeconds(cadenza, {QStringLiteral("voices")}, int(cliRuns));
    const double espeak
        = processSeconds(QStringLiteral("espeak-ng"), {QStringLiteral("--voices")}, int(cliRuns));

    const std::string n = " (" + std::to_string(count) + " bundles)";
    printTable(("Voice enumeration" + n).c_str(),
        {{"first scan, ms", firstScan * 1e3, "ms", "read every Info.plist, no parsing", readFloor * 1e3},
            {"allVoices, cached, us", all * 1e6, "us", "stat the three voice folders", statFloor * 1e6},
            {"avaliableMainstreamVoices, cached, us", mainstream * 1e6, "us", "stat the three voice folders",
                statFloor * 1e6},
            {"defaultVoiceFromAllVoices, cached, us", defaultVoice * 1e6, "us",
                "stat the three voice folders", statFloor * 1e6},
            {"resolveVoiceIdentifier (prefix), us", resolve * 1e6, "us", "QStringList::contains, miss",
                scanFloor * 1e6},
            {"'cadenza voices' process, ms", cli * 1e3, "ms", "'espeak-ng --voices' process", espeak * 1e3}});
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
