// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// cadenza-remove-bundle: removes exactly one voice or recognizer bundle, run through pkexec.
//
// It trusts nothing it is given: the path must name a ".SpeechVoice" or ".SpeechRecognition" folder
// directly inside a known voice or recognizer folder, reached without symbolic links, and the
// deletion never follows a link.

#include "core/services/BundleRemoval.h"

#include <QCoreApplication>

#include <cstdio>

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const QStringList arguments = QCoreApplication::arguments();
    if (arguments.size() == 2 && (arguments.at(1) == u"--help" || arguments.at(1) == u"-h")) {
        std::fputs("Usage: cadenza-remove-bundle PATH\n"
                   "Removes the voice or recognizer bundle PATH, which must lie directly inside a voice or\n"
                   "recognizer folder of Cadenza. Meant to be run through pkexec.\n",
            stdout);
        return 0;
    }
    if (arguments.size() != 2) {
        std::fputs("cadenza-remove-bundle: give exactly one bundle path (see --help)\n", stderr);
        return 2;
    }
    // pkexec clears the environment: the folders are the system's, never a caller's choice.
    QString error;
    if (!Cadenza::Platform::BundleRemoval::remove(arguments.at(1), &error)) {
        std::fprintf(stderr, "cadenza-remove-bundle: refusing to remove %s: %s\n",
            qPrintable(arguments.at(1)), qPrintable(error));
        return 1;
    }
    return 0;
}
