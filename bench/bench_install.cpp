// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Installing a large bundle from a file:// repository with the real daemon, beside cp, sha256sum
// and tar -x of the same archive, in the same run.

#include "BenchTable.h"
#include "BenchWorld.h"

#include "core/formats/PropertyList.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/installation/CZSpeechInstallationManager_p.h"
#include "protocol/InstallerProtocol.h"

#include <QCoreApplication>
#include <QCryptographicHash>
#include <QDir>
#include <QEventLoop>
#include <QFile>
#include <QProcess>
#include <QRandomGenerator>
#include <QTemporaryDir>
#include <QThread>
#include <QTimer>

#include <sys/stat.h>

using namespace Cadenza;
using namespace CadenzaBench;

namespace {

double runCommand(const QString &program, const QStringList &arguments)
{
    return secondsOf([&] {
        QProcess process;
        process.setStandardOutputFile(QProcess::nullDevice());
        process.start(program, arguments);
        if (!process.waitForFinished(600000) || process.exitCode() != 0) {
            qFatal("%s failed", qPrintable(program));
        }
    });
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const qint64 megabytes = argc > 1 ? std::atoll(argv[1]) : 100;
    const int runs = argc > 2 ? std::atoi(argv[2]) : 3;
    QTemporaryDir world;
    enterPrivateWorld(world);

    // A bundle of incompressible data, so that the archive is as large as what it holds.
    const QString sources = world.filePath(QStringLiteral("sources"));
    QDir().mkpath(sources + QStringLiteral("/Large.SpeechVoice/Resources"));
    {
        QFile info(sources + QStringLiteral("/Large.SpeechVoice/Info.plist"));
        info.open(QIODevice::WriteOnly);
        info.write(Platform::PropertyList::serialize(QVariantMap {{QStringLiteral("VoiceAttributes"),
            QVariantMap {{QStringLiteral("VoiceIdentifier"), QStringLiteral("bench.large")},
                {QStringLiteral("VoiceName"), QStringLiteral("Large")}}}}));
        QFile data(sources + QStringLiteral("/Large.SpeechVoice/Resources/data.bin"));
        data.open(QIODevice::WriteOnly);
        QByteArray block(1 << 20, Qt::Uninitialized);
        QRandomGenerator random(1);
        for (qint64 i = 0; i < megabytes; ++i) {
            random.fillRange(reinterpret_cast<quint32 *>(block.data()), block.size() / 4);
            data.write(block);
        }
    }
    const QString repository = world.filePath(QStringLiteral("repository"));
    QDir().mkpath(repository);
    const QString archive = repository + QStringLiteral("/Large.SpeechVoice.tar.gz");
    QProcess tar;
    tar.start(QStringLiteral("tar"),
        {QStringLiteral("-C"), sources, QStringLiteral("-czf"), archive,
            QStringLiteral("Large.SpeechVoice")});
    tar.waitForFinished(600000);
    QFile archiveFile(archive);
    archiveFile.open(QIODevice::ReadOnly);
    QCryptographicHash hash(QCryptographicHash::Sha256);
    hash.addData(&archiveFile);
    const qint64 archiveSize = archiveFile.size();
    const QVariantMap packages {{QStringLiteral("VOICEID:bench.large"),
        QVariantMap {{QStringLiteral("Path"), QStringLiteral("Large.SpeechVoice.tar.gz")},
            {QStringLiteral("SHA256"), QString::fromLatin1(hash.result().toHex())},
            {QStringLiteral("ByteSize"), archiveSize}, {QStringLiteral("Kind"), QStringLiteral("voice")},
            {QStringLiteral("BundleName"), QStringLiteral("Large.SpeechVoice")},
            {QStringLiteral("ObjectID"), QStringLiteral("bench.large")}}}};
    QProcess daemon;
    startDaemon(daemon, world, packages, repository);
    CZSpeechInstallationManager manager;
    for (int i = 0; i < 100 && !CZSpeechInstallationManagerPrivate::get(&manager)->_serverIsRunning(); ++i) {
        QThread::msleep(50);
    }

    std::vector<double> installs, copies, sums, unpacks;
    const QString scratch = world.filePath(QStringLiteral("scratch"));
    for (int run = 0; run < runs; ++run) {
        installs.push_back(secondsOf([&] {
            QEventLoop loop;
            qint32 outcome = 0;
            QObject::connect(&manager, &CZSpeechInstallationManager::installationFinished, &loop,
                [&](const QString &, qint32 message, const QVariantMap &) {
                    outcome = message;
                    loop.quit();
                });
            CZSpeechInstallationManagerPrivate::get(&manager)->_requestInstallation(
                QStringLiteral("VOICEID:bench.large"), QStringLiteral("Large"), quint64(archiveSize),
                QStringLiteral("bench.large"), 0);
            loop.exec();
            if (outcome != InstallerProtocol::InstalledCompletion) {
                qFatal("installation failed");
            }
        }));
        QDir(scratch).removeRecursively();
        QDir().mkpath(scratch);
        copies.push_back(
            runCommand(QStringLiteral("cp"), {archive, scratch + QStringLiteral("/copy.tar.gz")}));
        sums.push_back(runCommand(QStringLiteral("sha256sum"), {archive}));
        unpacks.push_back(runCommand(
            QStringLiteral("tar"), {QStringLiteral("-xzf"), archive, QStringLiteral("-C"), scratch}));
    }
    std::sort(installs.begin(), installs.end());
    std::sort(copies.begin(), copies.end());
    std::sort(sums.begin(), sums.end());
    std::sort(unpacks.begin(), unpacks.end());
    const double floor = median(copies) + median(sums) + median(unpacks);
    const std::string size = std::to_string(megabytes) + " MB";
    printTable(
        ("Installing a " + size + " bundle from file:// (median of " + std::to_string(runs) + ")").c_str(),
        {{"quillond: request to installed", median(installs), "s", "cp + sha256sum + tar -xzf", floor},
            {"  cp of the archive", median(copies), "s", "", 0},
            {"  sha256sum of the archive", median(sums), "s", "", 0},
            {"  tar -xzf of the archive", median(unpacks), "s", "", 0}});
    daemon.terminate();
    daemon.waitForFinished();
    return 0;
}
