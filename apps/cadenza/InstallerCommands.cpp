// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "InstallerCommands.h"

#include "CommandLine.h"

#include "core/formats/PropertyList.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/installation/CZSpeechInstallationManager_p.h"
#include "core/locale/LocalizationTable.h"
#include "protocol/InstallerProtocol.h"

#include <QCommandLineParser>
#include <QEventLoop>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QLocale>
#include <QTimer>
#include <QtMath>

#include <cstdio>

using namespace Cadenza;
using namespace Cadenza::InstallerProtocol;

namespace {

struct CatalogueItem
{
    QString name;
    QString objectIdentifier;
    quint64 byteSize = 0;
};

// Name, identity and size of a tag, from the catalogue built into Cadenza.
std::optional<CatalogueItem> findInCatalogue(const QString &tag)
{
    const auto catalogue
        = Platform::PropertyList::readFile(QStringLiteral(":/cadenza/SpeechDataDefaults.plist"));
    if (!catalogue) {
        return std::nullopt;
    }
    const QVariantMap voices = catalogue->toMap().value(QStringLiteral("DownloadableVoices")).toMap();
    for (auto it = voices.cbegin(); it != voices.cend(); ++it) {
        const QVariantMap entry = it.value().toMap();
        const QString name = entry.value(QStringLiteral("VoiceAttributes"))
                                 .toMap()
                                 .value(QStringLiteral("VoiceName"))
                                 .toString();
        if (entry.value(QStringLiteral("VoiceTag")).toString() == tag) {
            return CatalogueItem {name, it.key(), entry.value(QStringLiteral("VoiceByteSize")).toULongLong()};
        }
        if (entry.value(QStringLiteral("FullSizeTagName")).toString() == tag) {
            return CatalogueItem {name, entry.value(QStringLiteral("FullSizeBundleIdentifier")).toString(),
                entry.value(QStringLiteral("FullSizeByteSize")).toULongLong()};
        }
    }
    const QVariantMap languages = catalogue->toMap().value(QStringLiteral("DownloadableSRLanguages")).toMap();
    for (auto it = languages.cbegin(); it != languages.cend(); ++it) {
        const QVariantMap entry = it.value().toMap();
        if (entry.value(QStringLiteral("Tag")).toString() == tag) {
            const QString locale = entry.value(QStringLiteral("LocaleIdentifier")).toString();
            return CatalogueItem {locale, locale, entry.value(QStringLiteral("ByteSize")).toULongLong()};
        }
    }
    return std::nullopt;
}

QString describe(const QVariantMap &record)
{
    const QString name = record.value(ItemNameKey).toString();
    const qint64 state = record.value(ItemSoftwareUpdateStateKey).toLongLong();
    if (record.value(ItemDownloadStatusKey).toLongLong() == WaitingStatus) {
        return CommandLine::text(QStringLiteral("CLIStatusWaiting"), {name});
    }
    if (state == DownloadingState) {
        const double remaining = record.value(ItemSecondsRemainingKey).toDouble();
        const QLocale locale(Platform::LocalizationTable::shared().language());
        return CommandLine::text(QStringLiteral("CLIStatusDownloading"),
                   {name, locale.toString(record.value(ItemPercentCompleteKey).toDouble(), 'f', 0),
                       locale.toString(record.value(ItemDownloadByteCountKey).toULongLong()),
                       locale.toString(record.value(ItemByteSizeKey).toULongLong())})
            + (remaining > 0 ? CommandLine::text(
                   QStringLiteral("CLIStatusSecondsLeft"), {QString::number(qCeil(remaining))})
                             : QString());
    }
    if (state == InstallingState) {
        return CommandLine::text(QStringLiteral("CLIStatusInstalling"), {name});
    }
    return CommandLine::text(QStringLiteral("CLIStatusPreparing"), {name});
}

} // namespace

int InstallerCommands::status(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(CommandLine::text(QStringLiteral("CLIStatusDescription")));
    const QCommandLineOption json(
        QStringLiteral("json"), CommandLine::text(QStringLiteral("CLIJsonRecordsOption")));
    parser.addOption(json);
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    CZSpeechInstallationManager manager;
    if (!CZSpeechInstallationManagerPrivate::get(&manager)->_serverIsReachable()) {
        if (parser.isSet(json)) {
            std::fputs("[]\n", stdout);
        }
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIDaemonNotRunning")));
        return CommandLine::DaemonUnreachable;
    }
    // A daemon the service manager has yet to start has nothing to do: it is not asked, or started.
    const QVariantList records = manager.activeInstallations();
    if (parser.isSet(json)) {
        std::fputs(QJsonDocument(QJsonArray::fromVariantList(records)).toJson().constData(), stdout);
        return CommandLine::Success;
    }
    if (records.isEmpty()) {
        CommandLine::print(stdout, CommandLine::text(QStringLiteral("CLINothingInstalling")));
        return CommandLine::Success;
    }
    for (const QVariant &record : records) {
        CommandLine::print(stdout, describe(record.toMap()));
    }
    return CommandLine::Success;
}

int InstallerCommands::install(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(CommandLine::text(QStringLiteral("CLIInstallDescription")));
    const QCommandLineOption noWait(
        QStringLiteral("no-wait"), CommandLine::text(QStringLiteral("CLINoWaitOption")));
    parser.addOption(noWait);
    parser.addPositionalArgument(QStringLiteral("TAG"), CommandLine::text(QStringLiteral("CLITagOperand")));
    if (const auto done = CommandLine::parse(parser, arguments, 1)) {
        return *done;
    }
    if (parser.positionalArguments().size() != 1) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIGiveOneTag")));
        return CommandLine::BadUsage;
    }
    const QString tag = parser.positionalArguments().first();
    if (tag.trimmed().isEmpty()) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIEmptyTag")));
        return CommandLine::BadUsage;
    }
    if (tag.size() > MaximumFieldLength) {
        CommandLine::fail(arguments,
            CommandLine::text(QStringLiteral("CLITagTooLong"), {QString::number(MaximumFieldLength)}));
        return CommandLine::BadUsage;
    }
    CZSpeechInstallationManager manager;
    if (!CZSpeechInstallationManagerPrivate::get(&manager)->_serverIsReachable()) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIDaemonUnreachable")));
        return CommandLine::DaemonUnreachable;
    }
    // Tags the catalogue does not know still go to the daemon, which has the last word.
    CatalogueItem item = findInCatalogue(tag).value_or(
        CatalogueItem {tag.section(QLatin1Char(':'), 1), tag.section(QLatin1Char(':'), 1), 0});
    if (item.name.isEmpty()) {
        item.name = tag;
    }
    if (item.objectIdentifier.isEmpty()) {
        item.objectIdentifier = tag;
    }
    QEventLoop loop;
    int exitCode = CommandLine::Failed;
    QObject::connect(&manager, &CZSpeechInstallationManager::installationFinished, &loop,
        [&](const QString &finishedTag, qint32 message, const QVariantMap &answer) {
            if (finishedTag != tag) {
                return;
            }
            if (message == InstalledCompletion) {
                CommandLine::print(stdout, CommandLine::text(QStringLiteral("CLIInstalled"), {tag}));
                exitCode = CommandLine::Success;
            } else if (message == CancelledCompletion) {
                CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIInstallCancelled"), {tag}));
            } else {
                CommandLine::fail(arguments,
                    CommandLine::text(QStringLiteral("CLIInstallFailed"),
                        {tag, answer.value(FailureReasonKey).toString()}));
            }
            loop.quit();
        });
    if (!CZSpeechInstallationManagerPrivate::get(&manager)->_requestInstallation(
            tag, item.name, item.byteSize, item.objectIdentifier, 0)) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIDaemonUnreachable")));
        return CommandLine::DaemonUnreachable;
    }
    if (parser.isSet(noWait)) {
        return CommandLine::Success;
    }
    QTimer progress;
    QString lastLine;
    bool seenRunning = false;
    QObject::connect(&progress, &QTimer::timeout, &loop, [&] {
        for (const QVariant &record : manager.activeInstallations()) {
            if (record.toMap().value(TagNameKey).toString() == tag) {
                const QString line = describe(record.toMap());
                if (line != lastLine) {
                    CommandLine::print(stderr, line);
                    lastLine = line;
                }
            }
        }
        // A socket-activated daemon may take a moment to come up; once it ran, its going is the end.
        const bool running = CZSpeechInstallationManagerPrivate::get(&manager)->_serverIsRunning();
        seenRunning = seenRunning || running;
        if ((seenRunning && !running)
            || !CZSpeechInstallationManagerPrivate::get(&manager)->_serverIsReachable()) {
            CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIDaemonStopped")));
            exitCode = CommandLine::DaemonUnreachable;
            loop.exit();
        }
    });
    progress.start(500);
    loop.exec();
    return exitCode;
}

int InstallerCommands::cancel(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(CommandLine::text(QStringLiteral("CLICancelDescription")));
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    CZSpeechInstallationManager manager;
    if (!CZSpeechInstallationManagerPrivate::get(&manager)->_serverIsReachable()) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIDaemonNotRunning")));
        return CommandLine::DaemonUnreachable;
    }
    manager.cancelAllInstallations();
    return CommandLine::Success;
}
