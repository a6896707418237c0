#include "PostCommand.h"

#include "CommandLine.h"

#include "platform/DBusNotificationCenter.h"

#include <QCommandLineParser>
#include <QDBusConnection>
#include <QDBusConnectionInterface>

using namespace Cadenza::Platform;

int PostCommand::run(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral(
        "Posts the distributed notification NAME to every process of this session, such as "
        "com.vendra.speech.DefaultVoiceChangedNotification, or the dictation engine's "
        "DictationIMNotificationRecognizerDidPreHeat and DictationIMNotificationWillStartListening. "
        "'cadenza notify' is the same command."));
    const QCommandLineOption object(
        QStringLiteral("object"), QStringLiteral("The notification's object."), QStringLiteral("TEXT"));
    const QCommandLineOption info(QStringLiteral("info"),
        QStringLiteral("Adds KEY with the string VALUE to the user information; may be repeated."),
        QStringLiteral("KEY=VALUE"));
    parser.addOptions({object, info});
    parser.addPositionalArgument(QStringLiteral("NAME"), QStringLiteral("The notification's name."));
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    if (parser.positionalArguments().size() != 1) {
        CommandLine::fail(arguments, QStringLiteral("give exactly one notification name"));
        return 2;
    }
    QVariantMap userInfo;
    for (const QString &pair : parser.values(info)) {
        const qsizetype equals = pair.indexOf(QLatin1Char('='));
        if (equals <= 0) {
            CommandLine::fail(arguments, QStringLiteral("--info takes KEY=VALUE, not '%1'").arg(pair));
            return 2;
        }
        userInfo.insert(pair.left(equals), pair.mid(equals + 1));
    }
    DBusNotificationCenter center;
    if (!center.isConnectedToSessionBus()) {
        CommandLine::fail(arguments, QStringLiteral("no session bus: nobody else can hear the notification"));
        return 1;
    }
    center.postNotification(parser.positionalArguments().first(), parser.value(object), userInfo);
    // A round trip to the bus makes sure the signal has left before the process ends.
    (void)QDBusConnection::sessionBus().interface()->isServiceRegistered(
        QStringLiteral("org.freedesktop.DBus"));
    return 0;
}
