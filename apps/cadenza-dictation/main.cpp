// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// cadenza-dictation: the dictation engine of the user's session (see docs/dictation.md).
#include "DictationService.h"

#include <QCommandLineParser>
#include <QCoreApplication>

#include <cstdio>

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    QCoreApplication::setApplicationName(QStringLiteral("cadenza-dictation"));
    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral(
        "The dictation engine: loads recognition languages as they are installed and transcribes sound "
        "files for clients on the session bus (org.cadenza.Dictation)."));
    parser.addHelpOption();
    const QCommandLineOption idleExit(QStringLiteral("idle-exit"),
        QStringLiteral("Quit after SECONDS without a request."), QStringLiteral("SECONDS"));
    parser.addOption(idleExit);
    parser.process(app);
    int idleSeconds = 0;
    if (parser.isSet(idleExit)) {
        bool ok = false;
        idleSeconds = parser.value(idleExit).toInt(&ok);
        if (!ok || idleSeconds < 1) {
            std::fprintf(stderr, "cadenza-dictation: --idle-exit takes a number of seconds\n");
            return 2;
        }
    }
    Cadenza::DictationService service(idleSeconds);
    QString error;
    if (!service.publish(&error)) {
        std::fprintf(stderr, "cadenza-dictation: %s\n", qPrintable(error));
        return 1;
    }
    return app.exec();
}
