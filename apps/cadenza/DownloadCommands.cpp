// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "DownloadCommands.h"

#include "CommandLine.h"

#include "core/installation/CZSpeechInstallationManager.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/voices/DownloadableVoice.h"

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QFileInfo>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QTimer>

#include <cstdio>

using namespace Cadenza;

int DownloadCommands::downloadables(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(CommandLine::text(QStringLiteral("CLIDownloadablesDescription")));
    const QCommandLineOption json(QStringLiteral("json"), CommandLine::text(QStringLiteral("CLIJsonOption")));
    parser.addOption(json);
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    CZSpeechInstallationManager &manager = *CZSpeechInstallationManager::sharedManager();
    QJsonArray rows;
    for (const auto &voice : manager.downloadableVoices()) {
        const quint64 size = voice->downloadFullSize() ? voice->fullSizeByteSize() : voice->byteSize();
        rows.append(QJsonObject {{QStringLiteral("kind"), QStringLiteral("voice")},
            {QStringLiteral("identifier"), voice->identifier()},
            {QStringLiteral("name"), voice->displayName()},
            {QStringLiteral("status"), voice->downloadStatus()},
            {QStringLiteral("size"), CZSpeechItem::displayStringForByteSize(size)},
            {QStringLiteral("tag"),
                voice->downloadFullSize() ? voice->fullSizeTagName() : voice->tagName()}});
    }
    for (const auto &item : manager.downloadableSRLanguageItems()) {
        item->setShowCountryInDisplayTitle(true);
        rows.append(QJsonObject {{QStringLiteral("kind"), QStringLiteral("language")},
            {QStringLiteral("identifier"), item->localeIdentifier()},
            {QStringLiteral("name"), item->displayTitle()},
            {QStringLiteral("status"), item->downloadStatus()},
            {QStringLiteral("size"), item->displayedSize()}, {QStringLiteral("tag"), item->tagName()}});
    }
    if (parser.isSet(json)) {
        std::fputs(QJsonDocument(rows).toJson().constData(), stdout);
        return CommandLine::Success;
    }
    for (const auto &value : rows) {
        const QJsonObject row = value.toObject();
        std::fprintf(stdout, "%-8s %d %-50s %-28s %s\n",
            qPrintable(row.value(QStringLiteral("kind")).toString()),
            row.value(QStringLiteral("status")).toInt(),
            qPrintable(row.value(QStringLiteral("identifier")).toString()),
            qPrintable(row.value(QStringLiteral("name")).toString()),
            qPrintable(row.value(QStringLiteral("size")).toString()));
    }
    return 0;
}

int DownloadCommands::remove(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(CommandLine::text(QStringLiteral("CLIRemoveDescription")));
    parser.addPositionalArgument(
        QStringLiteral("ID|LOCALE"), CommandLine::text(QStringLiteral("CLIRemoveOperand")));
    if (const auto done = CommandLine::parse(parser, arguments, 1)) {
        return *done;
    }
    if (parser.positionalArguments().size() != 1) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIGiveOneVoiceOrLocale")));
        return CommandLine::BadUsage;
    }
    const QString what = parser.positionalArguments().first();
    CZSpeechInstallationManager &manager = *CZSpeechInstallationManager::sharedManager();
    RemovableSpeechItem item;
    std::optional<SpeechBundle> bundle;
    if (what.contains(QLatin1Char('.'))) {
        const auto voice = CZVoiceObject::initWithVoiceIdentifier(what);
        item = voice;
        bundle = manager.bundleForRemovableVoice(*voice, nullptr);
    } else {
        const auto language = CZSRLanguageItem::initWithLocaleIdentifier(what);
        item = language;
        bundle = manager.bundleForRemovableLanguage(*language, nullptr);
    }
    if (!bundle) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLINotRemovable"), {what}));
        return CommandLine::Failed;
    }
    manager.startRemovingDownloadedSpeechItems({item});
    QTimer::singleShot(0, qApp, &QCoreApplication::quit); // after the removal, which runs from the event loop
    QCoreApplication::exec();
    if (QFileInfo::exists(bundle->path)) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLINotRemoved"), {bundle->path}));
        return CommandLine::Failed;
    }
    CommandLine::print(stdout, CommandLine::text(QStringLiteral("CLIRemoved"), {bundle->path}));
    return CommandLine::Success;
}

int DownloadCommands::upgrade(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(CommandLine::text(QStringLiteral("CLIUpgradeDescription")));
    parser.addPositionalArgument(QStringLiteral("ID"), CommandLine::text(QStringLiteral("CLIVoiceOperand")));
    if (const auto done = CommandLine::parse(parser, arguments, 1)) {
        return *done;
    }
    if (parser.positionalArguments().size() != 1) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIGiveOneVoice")));
        return CommandLine::BadUsage;
    }
    const bool allowed
        = StartDownloadingHighestQualityIfNecessaryForVoiceIdentifier(parser.positionalArguments().first());
    std::fputs(allowed ? "yes\n" : "no\n", stdout);
    return allowed ? CommandLine::Success : CommandLine::Failed;
}

int DownloadCommands::power(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(CommandLine::text(QStringLiteral("CLIPowerDescription")));
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    const bool ac = CZSpeechInstallationManager::sharedManager()->isRunningOnACPower();
    std::fputs(ac ? "AC Power\n" : "Battery Power\n", stdout);
    return 0;
}
