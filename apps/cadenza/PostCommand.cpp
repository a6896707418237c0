// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "PostCommand.h"

#include "CommandLine.h"

#include "core/services/DBusNotificationCenter.h"

#include <QCommandLineParser>
#include <QDBusConnection>
#include <QDBusConnectionInterface>

using namespace Cadenza::Platform;

int PostCommand::run(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(CommandLine::text(QStringLiteral("CLIPostDescription")));
    const QCommandLineOption object(QStringLiteral("object"),
        CommandLine::text(QStringLiteral("CLIObjectOption")), QStringLiteral("TEXT"));
    const QCommandLineOption info(QStringLiteral("info"), CommandLine::text(QStringLiteral("CLIInfoOption")),
        QStringLiteral("KEY=VALUE"));
    parser.addOptions({object, info});
    parser.addPositionalArgument(QStringLiteral("NAME"), CommandLine::text(QStringLiteral("CLINameOperand")));
    if (const auto done = CommandLine::parse(parser, arguments, 1)) {
        return *done;
    }
    if (parser.positionalArguments().size() != 1) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIGiveOneName")));
        return CommandLine::BadUsage;
    }
    QVariantMap userInfo;
    for (const QString &pair : parser.values(info)) {
        const qsizetype equals = pair.indexOf(QLatin1Char('='));
        if (equals <= 0) {
            CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIInfoFormat"), {pair}));
            return CommandLine::BadUsage;
        }
        userInfo.insert(pair.left(equals), pair.mid(equals + 1));
    }
    DBusNotificationCenter center;
    if (!center.isConnectedToSessionBus()) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLINoSessionBus")));
        return CommandLine::Failed;
    }
    center.postNotification(parser.positionalArguments().first(), parser.value(object), userInfo);
    // A round trip to the bus makes sure the signal has left before the process ends.
    (void)QDBusConnection::sessionBus().interface()->isServiceRegistered(
        QStringLiteral("org.freedesktop.DBus"));
    return CommandLine::Success;
}
