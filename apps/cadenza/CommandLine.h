#ifndef CADENZA_APPS_COMMANDLINE_H
#define CADENZA_APPS_COMMANDLINE_H

#include <QCommandLineParser>
#include <QStringList>

#include <optional>

/// What every command does with its options: parse, answer --help, refuse bad options.
class CommandLine
{
public:
    /**
     * Parses @p arguments ("cadenza COMMAND" first). Returns the exit status when the command is
     * already done (help printed: 0; bad options: 2, with a message on standard error), else nothing.
     */
    [[nodiscard]] static std::optional<int> parse(QCommandLineParser &parser, const QStringList &arguments);
    /// Prints "cadenza COMMAND: message" on standard error.
    static void fail(const QStringList &arguments, const QString &message);
};

#endif
