// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// sd_cadenza: speech-dispatcher's output module for the Cadenza voices.
//
// speech-dispatcher starts it as "sd_cadenza CONFIGFILE" and talks to it over standard input and
// output; logging goes to standard error, which speech-dispatcher keeps in its log.

#include "AudioSender.h"
#include "ModuleSession.h"

#include <QCoreApplication>

#include <csignal>
#include <cstdio>
#include <unistd.h>

int main(int argc, char *argv[])
{
    // A server that goes away must not kill us in the middle of a write; the write fails instead.
    std::signal(SIGPIPE, SIG_IGN);
    QCoreApplication app(argc, argv);
    QCoreApplication::setApplicationName(QStringLiteral("sd_cadenza"));
    if (app.arguments().contains(QStringLiteral("--help"))) {
        std::puts("Usage: sd_cadenza [CONFIGFILE]\n"
                  "speech-dispatcher's output module for the Cadenza voices; speech-dispatcher starts it.");
        return 0;
    }
    // Whatever the libraries print must not mix into the protocol on standard output.
    const int protocolFd = ::dup(STDOUT_FILENO);
    ::dup2(STDERR_FILENO, STDOUT_FILENO);

    SdCadenza::AudioSender sender(protocolFd);
    SdCadenza::ModuleSession session(STDIN_FILENO, sender);
    QObject::connect(
        &session, &SdCadenza::ModuleSession::finished, &app, &QCoreApplication::quit, Qt::QueuedConnection);
    return app.exec();
}
