// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// activeInstallations round trip against the real daemon with 0, 10 and 100 active records, beside a
// bare Unix-socket ping-pong that moves the same number of bytes, in the same run.

#include "BenchTable.h"
#include "BenchWorld.h"

#include "core/formats/PropertyList.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/installation/CZSpeechInstallationManager_p.h"
#include "core/services/Services.h"
#include "core/services/UnixMessagePortService.h"
#include "protocol/InstallerProtocol.h"
#include "protocol/SecureArchiving.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QProcess>
#include <QTemporaryDir>
#include <QThread>

#include <csignal>
#include <sys/socket.h>
#include <sys/stat.h>
#include <unistd.h>

using namespace Cadenza;
using namespace CadenzaBench;

namespace {

bool readFully(int fd, char *buffer, size_t size)
{
    while (size > 0) {
        const ssize_t n = ::read(fd, buffer, size);
        if (n <= 0) {
            return false;
        }
        buffer += n;
        size -= size_t(n);
    }
    return true;
}

bool writeFully(int fd, const char *buffer, size_t size)
{
    while (size > 0) {
        const ssize_t n = ::write(fd, buffer, size);
        if (n <= 0) {
            return false;
        }
        buffer += n;
        size -= size_t(n);
    }
    return true;
}

// The floor: one request of requestSize bytes and one answer of replySize bytes over a Unix socket.
std::vector<double> pingPong(size_t requestSize, size_t replySize, int rounds)
{
    int pair[2];
    ::socketpair(AF_UNIX, SOCK_STREAM, 0, pair);
    std::thread echo([&] {
        std::vector<char> in(requestSize);
        std::vector<char> out(replySize, 'r');
        for (int i = 0; i < rounds; ++i) {
            if (!readFully(pair[1], in.data(), in.size()) || !writeFully(pair[1], out.data(), out.size())) {
                return;
            }
        }
    });
    std::vector<char> request(requestSize, 'q');
    std::vector<char> reply(replySize);
    auto samples = samplesOf(rounds, [&] {
        writeFully(pair[0], request.data(), request.size());
        readFully(pair[0], reply.data(), reply.size());
    });
    echo.join();
    ::close(pair[0]);
    ::close(pair[1]);
    return samples;
}

// The records rebuilt as a decoder must: a new dictionary per record, a new string per text value,
// the keys shared.
QVariantList assembledCopy(const QVariantList &records)
{
    QVariantList copy;
    copy.reserve(records.size());
    for (const QVariant &record : records) {
        const QVariantMap source = record.toMap();
        QVariantMap map;
        for (auto it = source.cbegin(); it != source.cend(); ++it) {
            const QVariant &value = it.value();
            if (value.typeId() == QMetaType::QString) {
                const QString text = value.toString();
                map.insert(map.cend(), it.key(), QString(text.constData(), text.size()));
            } else {
                map.insert(map.cend(), it.key(), value);
            }
        }
        copy.append(map);
    }
    return copy;
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const int rounds = argc > 1 ? std::atoi(argv[1]) : 2000;
    QTemporaryDir world;
    enterPrivateWorld(world);

    // Every package points at a pipe nobody writes to: the first download waits for ever, the rest queue.
    const QString pipe = world.filePath(QStringLiteral("repository/stalled"));
    QDir().mkpath(world.filePath(QStringLiteral("repository")));
    ::mkfifo(QFile::encodeName(pipe).constData(), 0600);
    QVariantMap packages;
    for (int i = 0; i < 101; ++i) {
        packages.insert(QStringLiteral("VOICEID:bench.%1").arg(i),
            QVariantMap {{QStringLiteral("Path"), QStringLiteral("stalled")},
                {QStringLiteral("SHA256"), QString(64, QLatin1Char('0'))},
                {QStringLiteral("ByteSize"), qint64(1000000)},
                {QStringLiteral("Kind"), QStringLiteral("voice")},
                {QStringLiteral("BundleName"), QStringLiteral("Bench%1.SpeechVoice").arg(i)},
                {QStringLiteral("ObjectID"), QStringLiteral("bench.%1").arg(i)}});
    }
    QProcess daemon;
    startDaemon(daemon, world, packages, world.filePath(QStringLiteral("repository")));
    CZSpeechInstallationManager manager;
    for (int i = 0; i < 100 && !CZSpeechInstallationManagerPrivate::get(&manager)->_serverIsRunning(); ++i) {
        QThread::msleep(50);
    }
    if (!CZSpeechInstallationManagerPrivate::get(&manager)->_serverIsRunning()) {
        std::fputs("quillond did not start\n", stderr);
        return 1;
    }

    std::vector<Row> rows;
    int queued = 0;
    for (const int active : {0, 10, 100}) {
        while (queued < active) {
            // A request's reply port has a random 16-bit number in its name; a number already taken
            // by an earlier request fails this one, so it is asked again.
            if (CZSpeechInstallationManagerPrivate::get(&manager)->_requestInstallation(
                    QStringLiteral("VOICEID:bench.%1").arg(queued), QStringLiteral("Bench"), 1,
                    QStringLiteral("bench.%1").arg(queued), 0)) {
                ++queued;
            }
        }
        QThread::msleep(200);
        QCoreApplication::processEvents();
        if (manager.activeInstallations().size() != active) {
            std::fprintf(stderr, "expected %d records, the daemon has %lld\n", active,
                static_cast<long long>(manager.activeInstallations().size()));
            return 1;
        }
        // The same bytes on the wire: the frame of the request and of the archived answer.
        const QByteArray request
            = CZEncodeSecureObject(QVariantMap {{InstallerProtocol::ClientProcessIDKey, qint64(1)}});
        QVariantList records;
        for (const QVariant &r : manager.activeInstallations()) {
            records.append(r);
        }
        const QByteArray reply = CZEncodeSecureObject(records);
        const auto ours = samplesOf(rounds, [&] { (void)manager.activeInstallations(); });
        // The share of the client's decoding, to tell it from the transport's; and the least any
        // decoder must spend: making the same dictionaries, strings and all, from values at hand.
        const auto decoding = samplesOf(rounds, [&] { (void)CZDecodeSecureArray(reply); });
        const auto assembling = samplesOf(rounds, [&] { (void)assembledCopy(records); });
        const auto floor = pingPong(size_t(request.size()) + 12, size_t(reply.size()) + 12, rounds);
        const std::string n = std::to_string(active);
        rows.push_back({"activeInstallations, " + n + " records, median", median(ours) * 1e6, "us",
            "socket ping-pong, same bytes, median", median(floor) * 1e6});
        rows.push_back({"activeInstallations, " + n + " records, p99", percentile(ours, 0.99) * 1e6, "us",
            "socket ping-pong, same bytes, p99", percentile(floor, 0.99) * 1e6});
        rows.push_back({"  of which decoding the answer, " + n + " records, median", median(decoding) * 1e6,
            "us", "socket ping-pong, same bytes, median", median(floor) * 1e6});
        rows.push_back({"  making the same dictionaries alone, " + n + " records, median",
            median(assembling) * 1e6, "us", "socket ping-pong, same bytes, median", median(floor) * 1e6});
    }
    printTable("Installer round trip (real quillond, Unix sockets)", rows);
    ::kill(pid_t(daemon.processId()), SIGKILL);
    daemon.waitForFinished();
    return 0;
}
