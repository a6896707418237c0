// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// quillond: Cadenza's speech-data installer daemon.

#include "PackageCatalogue.h"
#include "QuillonDaemon.h"

#include "core/files/Paths.h"

#include "cadenza-config.h"

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QDir>
#include <QSocketNotifier>

#include <csignal>
#include <cstdio>
#include <fcntl.h>
#include <sys/socket.h>
#include <unistd.h>

namespace {

int signalPipe[2] = {-1, -1};

void onSignal(int)
{
    const char byte = 1;
    [[maybe_unused]] const auto written = ::write(signalPipe[1], &byte, 1);
}

// The listening socket that the service manager passed in, if this is socket activation.
int activatedSocket()
{
    const QByteArray pid = qgetenv("LISTEN_PID");
    const QByteArray fds = qgetenv("LISTEN_FDS");
    if (pid.isEmpty() || fds.isEmpty() || pid.toLongLong() != qint64(::getpid()) || fds.toInt() < 1) {
        return -1;
    }
    constexpr int FirstDescriptor = 3;
    int type = 0;
    socklen_t size = sizeof(type);
    if (::getsockopt(FirstDescriptor, SOL_SOCKET, SO_TYPE, &type, &size) != 0 || type != SOCK_STREAM) {
        return -1;
    }
    ::fcntl(FirstDescriptor, F_SETFD, FD_CLOEXEC);
    qunsetenv("LISTEN_PID");
    qunsetenv("LISTEN_FDS");
    return FirstDescriptor;
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    QCoreApplication::setApplicationName(QStringLiteral("quillond"));
    QCoreApplication::setApplicationVersion(QStringLiteral(CADENZA_VERSION));

    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral(
        "Cadenza's speech-data installer daemon. It downloads, verifies and installs voice and "
        "recognition-language bundles for the user who runs it, one at a time, into the user's "
        "folders, and answers Cadenza's clients on the socket com.vendra.speech.quillond in "
        "$XDG_RUNTIME_DIR/cadenza."));
    parser.addHelpOption();
    parser.addVersionOption();
    const QCommandLineOption repository(QStringLiteral("repository"),
        QStringLiteral("Fetch bundles from URL (file://, http:// or https://); may be given several times, "
                       "tried in order. Default: the sample repository in the system data folder."),
        QStringLiteral("URL"));
    const QCommandLineOption catalogue(QStringLiteral("catalogue"),
        QStringLiteral("Read the catalogue of packages from FILE instead of the one built into Cadenza."),
        QStringLiteral("FILE"));
    const QCommandLineOption idleExit(QStringLiteral("idle-exit"),
        QStringLiteral("Exit after SECONDS without work (for socket activation)."),
        QStringLiteral("SECONDS"));
    const QCommandLineOption retryWindow(QStringLiteral("retry-window"),
        QStringLiteral("Keep trying sources that do not answer for SECONDS before a download fails "
                       "(default 60)."),
        QStringLiteral("SECONDS"));
    const QCommandLineOption fileRate(QStringLiteral("file-rate"),
        QStringLiteral("Copy file:// sources at most BYTES a second, to watch a download's progress with a "
                       "local repository (default: no limit)."),
        QStringLiteral("BYTES"));
    parser.addOptions({repository, catalogue, idleExit, retryWindow, fileRate});
    parser.process(app);

    Quillond::QuillonDaemon::Options options;
    const QStringList repositories = parser.values(repository);
    for (const QString &value : repositories) {
        const QUrl url = QUrl::fromUserInput(value, QDir::currentPath(), QUrl::AssumeLocalFile);
        if (!url.isValid() || !(url.isLocalFile() || url.scheme() == u"http" || url.scheme() == u"https")) {
            std::fprintf(stderr, "quillond: '%s' is not a file, http or https URL\n", qPrintable(value));
            return 2;
        }
        options.repositories.append(url);
    }
    if (options.repositories.isEmpty()) {
        options.repositories.append(QUrl::fromLocalFile(QDir::cleanPath(Cadenza::Platform::Paths::root()
            + QStringLiteral(CADENZA_SYSTEM_DATADIR "/cadenza/repository"))));
    }
    options.cataloguePath = parser.isSet(catalogue) ? parser.value(catalogue)
                                                    : QStringLiteral(":/cadenza/SpeechDataDefaults.plist");
    if (parser.isSet(idleExit)) {
        bool ok = false;
        options.idleExitSeconds = parser.value(idleExit).toInt(&ok);
        if (!ok || options.idleExitSeconds < 1) {
            std::fprintf(stderr, "quillond: --idle-exit takes a number of seconds\n");
            return 2;
        }
    }
    if (parser.isSet(retryWindow)) {
        bool ok = false;
        const double seconds = parser.value(retryWindow).toDouble(&ok);
        if (!ok || !(seconds >= 0 && seconds <= 24 * 3600)) {
            std::fprintf(stderr, "quillond: --retry-window takes a number of seconds, not '%s'\n",
                qPrintable(parser.value(retryWindow)));
            return 2;
        }
        options.retryWindowMilliseconds = int(seconds * 1000);
    }
    if (parser.isSet(fileRate)) {
        bool ok = false;
        options.fileRate = parser.value(fileRate).toLongLong(&ok);
        if (!ok || options.fileRate < 0) {
            std::fprintf(stderr, "quillond: --file-rate takes a number of bytes a second, not '%s'\n",
                qPrintable(parser.value(fileRate)));
            return 2;
        }
    }
    options.requestPortDescriptor = activatedSocket();

    QString error;
    auto packages = Quillond::PackageCatalogue::load(options.cataloguePath, &error);
    if (!packages) {
        std::fprintf(stderr, "quillond: cannot read the catalogue %s: %s\n",
            qPrintable(options.cataloguePath), qPrintable(error));
        return 1;
    }

    Quillond::QuillonDaemon daemon(std::move(*packages), options);
    if (!daemon.start(&error)) {
        std::fprintf(stderr, "quillond: %s\n", qPrintable(error));
        return 1;
    }
    QObject::connect(&daemon, &Quillond::QuillonDaemon::idle, &app, &QCoreApplication::quit);

    // SIGTERM and SIGINT end the daemon cleanly: running installations are cancelled and cleared away.
    if (::pipe2(signalPipe, O_CLOEXEC) == 0) {
        std::signal(SIGTERM, onSignal);
        std::signal(SIGINT, onSignal);
        auto *notifier = new QSocketNotifier(signalPipe[0], QSocketNotifier::Read, &app);
        QObject::connect(notifier, &QSocketNotifier::activated, &app, &QCoreApplication::quit);
    }
    std::signal(SIGPIPE, SIG_IGN);
    const int status = app.exec();
    daemon.stop();
    return status;
}
