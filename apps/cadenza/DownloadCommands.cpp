#include "DownloadCommands.h"

#include "CommandLine.h"

#include "installation/CZSpeechInstallationManager.h"
#include "recognition-languages/CZSRLanguageItem.h"
#include "voices/DownloadableVoice.h"

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
    parser.setApplicationDescription(QStringLiteral(
        "Lists the voices and recognition languages that can be downloaded or upgraded, with their download "
        "status (1 upgrade available, 2 not installed, 3 downloading, 4 waiting) and size."));
    const QCommandLineOption json(
        QStringLiteral("json"), QStringLiteral("Print a JSON array instead of a table."));
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
        return 0;
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
    parser.setApplicationDescription(QStringLiteral(
        "Removes a downloaded voice (by identifier) or recognition language (by locale, such as de_DE), "
        "asking "
        "for administrator rights when it is installed for every user, and records the removal."));
    parser.addPositionalArgument(QStringLiteral("ID|LOCALE"), QStringLiteral("What to remove."));
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    if (parser.positionalArguments().size() != 1) {
        CommandLine::fail(arguments, QStringLiteral("give one voice identifier or locale"));
        return 2;
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
        CommandLine::fail(arguments,
            QStringLiteral("'%1' is not a downloaded voice or language that can be removed").arg(what));
        return 1;
    }
    manager.startRemovingDownloadedSpeechItems({item});
    QTimer::singleShot(0, qApp, &QCoreApplication::quit); // after the removal, which runs from the event loop
    QCoreApplication::exec();
    if (QFileInfo::exists(bundle->path)) {
        CommandLine::fail(arguments, QStringLiteral("%1 was not removed").arg(bundle->path));
        return 1;
    }
    std::fprintf(stdout, "Removed %s\n", qPrintable(bundle->path));
    return 0;
}

int DownloadCommands::upgrade(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral(
        "Starts downloading the best quality of voice ID in the background when the rules allow it: on mains "
        "power, not removed or prohibited by the user, within the attempt limits. Prints whether it may go "
        "on."));
    parser.addPositionalArgument(QStringLiteral("ID"), QStringLiteral("A voice identifier."));
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    if (parser.positionalArguments().size() != 1) {
        CommandLine::fail(arguments, QStringLiteral("give one voice identifier"));
        return 2;
    }
    const bool allowed
        = StartDownloadingHighestQualityIfNecessaryForVoiceIdentifier(parser.positionalArguments().first());
    std::fputs(allowed ? "yes\n" : "no\n", stdout);
    return allowed ? 0 : 1;
}

int DownloadCommands::power(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(
        QStringLiteral("Says whether this computer runs on mains power (\"AC Power\")."));
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    const bool ac = CZSpeechInstallationManager::sharedManager()->isRunningOnACPower();
    std::fputs(ac ? "AC Power\n" : "Battery Power\n", stdout);
    return 0;
}
