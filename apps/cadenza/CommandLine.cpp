// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "CommandLine.h"

#include "core/locale/LocalizationTable.h"

#include <QCoreApplication>

#include <cstdio>

using Cadenza::Platform::LocalizationTable;

std::optional<int> CommandLine::parse(
    QCommandLineParser &parser, const QStringList &arguments, qsizetype maximumOperands)
{
    parser.addHelpOption();
    if (!parser.parse(arguments)) {
        const QStringList unknown = parser.unknownOptionNames();
        if (!unknown.isEmpty()) {
            const QString &name = unknown.first();
            fail(arguments,
                text(QStringLiteral("CLIUnknownOption"),
                    {(name.size() == 1 ? QStringLiteral("-") : QStringLiteral("--")) + name}));
        } else {
            // Qt's own words for the rest (a missing value); they name the option.
            fail(arguments, parser.errorText());
        }
        return BadUsage;
    }
    if (parser.isSet(QStringLiteral("help"))) {
        // Qt names the executable's path; users typed "cadenza COMMAND".
        QString help = parser.helpText();
        const QString executable = QCoreApplication::arguments().value(0);
        const qsizetype lineEnd = help.indexOf(QLatin1Char('\n'));
        const qsizetype at = executable.isEmpty() ? -1 : help.indexOf(executable);
        if (at >= 0 && at < lineEnd) {
            help.replace(at, executable.size(), arguments.first());
        }
        help += QLatin1Char('\n') + text(QStringLiteral("CLIExitStatusHelp")) + QLatin1Char('\n');
        std::fputs(help.toLocal8Bit().constData(), stdout);
        return Success;
    }
    const QStringList operands = parser.positionalArguments();
    if (operands.size() > maximumOperands) {
        fail(arguments, text(QStringLiteral("CLIUnexpectedArgument"), {operands.at(maximumOperands)}));
        return BadUsage;
    }
    return std::nullopt;
}

void CommandLine::fail(const QStringList &arguments, const QString &message)
{
    print(stderr, arguments.first() + QStringLiteral(": ") + message);
}

QString CommandLine::text(const QString &key, const QStringList &arguments)
{
    return LocalizationTable::shared().format(key, arguments);
}

void CommandLine::print(FILE *to, const QString &line)
{
    std::fputs((line + QLatin1Char('\n')).toLocal8Bit().constData(), to);
}
