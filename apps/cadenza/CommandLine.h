// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_APPS_COMMANDLINE_H
#define CADENZA_APPS_COMMANDLINE_H

#include <QCommandLineParser>
#include <QStringList>

#include <optional>

/// What every command does with its options: parse, answer --help, refuse what it does not understand.
class CommandLine
{
public:
    /// The exit statuses of every command, as the README and 'cadenza --help' describe them.
    enum ExitStatus : int {
        Success = 0,
        Failed = 1, ///< the operation failed
        BadUsage = 2, ///< unknown option, stray operand, bad value
        DaemonUnreachable = 3, ///< the installer daemon cannot be reached
    };

    /**
     * Parses @p arguments ("cadenza COMMAND" first). Returns the exit status when the command is
     * already done (help printed: Success; an unknown option, a missing value or more than
     * @p maximumOperands operands: BadUsage, with a message naming it), else nothing.
     */
    [[nodiscard]] static std::optional<int> parse(
        QCommandLineParser &parser, const QStringList &arguments, qsizetype maximumOperands = 0);
    /// Prints "cadenza COMMAND: message" on standard error.
    static void fail(const QStringList &arguments, const QString &message);
    /// The text of @p key in the user's language, filled with @p arguments.
    [[nodiscard]] static QString text(const QString &key, const QStringList &arguments = {});
    /// Prints @p line and a line break on @p to, in the terminal's encoding.
    static void print(FILE *to, const QString &line);
};

#endif
