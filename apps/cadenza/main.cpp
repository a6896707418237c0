// cadenza: Cadenza's command-line tool.

#include "DictateCommand.h"
#include "DownloadCommands.h"
#include "InstallerCommands.h"
#include "LanguagesCommand.h"
#include "PostCommand.h"
#include "SayCommand.h"
#include "VoicesCommand.h"

#include <QCoreApplication>
#include <QTextStream>

#include <cstdio>

namespace {

void printUsage(FILE *to)
{
    std::fputs(
        "Usage: cadenza COMMAND [OPTIONS]\n"
        "\n"
        "Commands:\n"
        "  voices   list the installed voices\n"
        "  say      speak a text, or write it to a WAV file\n"
        "  languages list the installed and downloadable recognition languages\n"
        "  dictate  print the words spoken in a WAV file\n"
        "  post     post a notification to every process of the session\n"
        "  notify   the same as post, e.g. cadenza notify DictationIMNotificationRecognizerDidPreHeat\n"
        "  status   show what the installer daemon is installing\n"
        "  install  install a voice or recognition language by its tag\n"
        "  cancel   cancel every installation\n"
        "  downloadables list what can be downloaded or upgraded\n"
        "  remove   remove a downloaded voice or recognition language\n"
        "  upgrade  fetch the best quality of a voice in the background, when allowed\n"
        "  power    say whether this computer runs on mains power\n"
        "\n"
        "Run 'cadenza COMMAND --help' for the options of a command.\n",
        to);
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    QCoreApplication::setApplicationName(QStringLiteral("cadenza"));
    QStringList arguments = QCoreApplication::arguments();
    if (arguments.size() < 2) {
        printUsage(stderr);
        return 2;
    }
    const QString command = arguments.at(1);
    if (command == u"-h" || command == u"--help" || command == u"help") {
        printUsage(stdout);
        return 0;
    }
    // Each command parses "cadenza COMMAND ..." as its own program name and options.
    arguments.removeAt(1);
    arguments[0] = QStringLiteral("cadenza ") + command;
    if (command == u"voices") {
        return VoicesCommand::run(arguments);
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
    std::fprintf(stderr, "cadenza: unknown command '%s'\n\n", qPrintable(command));
    printUsage(stderr);
    return 2;
}
