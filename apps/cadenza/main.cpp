// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// cadenza: Cadenza's command-line tool.

#include "CommandLine.h"
#include "DictateCommand.h"
#include "DownloadCommands.h"
#include "InstallerCommands.h"
#include "LanguagesCommand.h"
#include "PostCommand.h"
#include "SayCommand.h"
#include "VoicesCommand.h"

#include "core/locale/LocalizationTable.h"

#include <QCoreApplication>
#include <QLibraryInfo>
#include <QLocale>
#include <QTranslator>

#include <cstdio>
#include <cstdlib>

namespace {

void printUsage(FILE *to)
{
    CommandLine::print(to, CommandLine::text(QStringLiteral("CLIUsage")));
    CommandLine::print(to, CommandLine::text(QStringLiteral("CLIExitStatusHelp")));
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    QCoreApplication::setApplicationName(QStringLiteral("cadenza"));
    // Qt's own words ("Usage:", "Options:") in the language Cadenza's texts are in.
    QTranslator qtTexts;
    const QString language = Cadenza::Platform::LocalizationTable::shared().language();
    if (language != u"en"
        && qtTexts.load(QLocale(language), QStringLiteral("qtbase"), QStringLiteral("_"),
            QLibraryInfo::path(QLibraryInfo::TranslationsPath))) {
        QCoreApplication::installTranslator(&qtTexts);
    }
    QStringList arguments = QCoreApplication::arguments();
    if (arguments.size() < 2) {
        printUsage(stderr);
        return CommandLine::BadUsage;
    }
    const QString command = arguments.at(1);
    if (command == u"-h" || command == u"--help" || command == u"help") {
        printUsage(stdout);
        return CommandLine::Success;
    }
    // Each command parses "cadenza COMMAND ..." as its own program name and options.
    arguments.removeAt(1);
    arguments[0] = QStringLiteral("cadenza ") + command;
    if (command == u"voices") {
        // Freeing every voice description one by one at exit costs as much as reading them from the
        // voice index; the kernel takes back the process's memory at once. Nothing else is pending.
        const int status = VoicesCommand::run(arguments);
        std::fflush(stdout);
        std::fflush(stderr);
        std::_Exit(status);
    }
    if (command == u"say") {
        return SayCommand::run(arguments);
    }
    if (command == u"dictate") {
        return DictateCommand::run(arguments);
    }
    if (command == u"languages") {
        return LanguagesCommand::run(arguments);
    }
    if (command == u"post" || command == u"notify") {
        return PostCommand::run(arguments);
    }
    if (command == u"status") {
        return InstallerCommands::status(arguments);
    }
    if (command == u"install") {
        return InstallerCommands::install(arguments);
    }
    if (command == u"downloadables") {
        return DownloadCommands::downloadables(arguments);
    }
    if (command == u"remove") {
        return DownloadCommands::remove(arguments);
    }
    if (command == u"upgrade") {
        return DownloadCommands::upgrade(arguments);
    }
    if (command == u"power") {
        return DownloadCommands::power(arguments);
    }
    if (command == u"cancel") {
        return InstallerCommands::cancel(arguments);
    }
    CommandLine::print(stderr,
        QStringLiteral("cadenza: ") + CommandLine::text(QStringLiteral("CLIUnknownCommand"), {command})
            + u'\n');
    printUsage(stderr);
    return CommandLine::BadUsage;
}
