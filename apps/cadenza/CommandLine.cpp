#include "CommandLine.h"

#include <cstdio>

std::optional<int> CommandLine::parse(QCommandLineParser &parser, const QStringList &arguments)
{
    parser.addHelpOption();
    if (!parser.parse(arguments)) {
        fail(arguments, parser.errorText());
        return 2;
    }
    if (parser.isSet(QStringLiteral("help"))) {
        // Qt names the executable's path; users typed "cadenza COMMAND".
        QString help = parser.helpText();
        const qsizetype lineEnd = help.indexOf(QLatin1Char('\n'));
        const qsizetype optionsAt = help.indexOf(QStringLiteral(" [options]"));
        if (help.startsWith(QStringLiteral("Usage: ")) && optionsAt > 0 && optionsAt < lineEnd) {
            help.replace(7, optionsAt - 7, arguments.first());
        }
        std::fputs(qPrintable(help), stdout);
        return 0;
    }
    return std::nullopt;
}

void CommandLine::fail(const QStringList &arguments, const QString &message)
{
    std::fprintf(stderr, "%s: %s\n", qPrintable(arguments.first()), qPrintable(message));
}
