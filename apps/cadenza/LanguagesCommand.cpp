// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "LanguagesCommand.h"

#include "CommandLine.h"

#include "core/installation/CZSpeechInstallationManager.h"
#include "core/recognition-items/CZSRLanguageItem.h"

#include <QCommandLineParser>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>

#include <cstdio>

using namespace Cadenza;

int LanguagesCommand::run(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(CommandLine::text(QStringLiteral("CLILanguagesDescription")));
    const QCommandLineOption json(QStringLiteral("json"), CommandLine::text(QStringLiteral("CLIJsonOption")));
    parser.addOption(json);
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    struct Line
    {
        QString kind;
        CZSRLanguageItemPtr item;
    };
    QList<Line> lines;
    for (const auto &item : CZSRLanguageItem::availableLocalRecognizerLanguageItems()) {
        lines.append({QStringLiteral("installed"), item});
    }
    // The installation manager's list, as the sheets show it: what is installed is not offered again.
    for (const auto &item : CZSpeechInstallationManager::sharedManager()->downloadableSRLanguageItems()) {
        lines.append({QStringLiteral("downloadable"), item});
    }
    for (auto &line : lines) {
        line.item->setShowCountryInDisplayTitle(true);
    }
    if (parser.isSet(json)) {
        QJsonArray array;
        for (const auto &line : lines) {
            array.append(QJsonObject {{QStringLiteral("kind"), line.kind},
                {QStringLiteral("locale"), line.item->localeIdentifier()},
                {QStringLiteral("title"), line.item->displayTitle()},
                {QStringLiteral("visibility"), line.item->visibility()},
                {QStringLiteral("tag"), line.item->tagName()},
                {QStringLiteral("size"), QString::number(line.item->byteSize())}});
        }
        std::fputs(QJsonDocument(array).toJson().constData(), stdout);
        return CommandLine::Success;
    }
    if (lines.isEmpty()) {
        CommandLine::print(stderr, CommandLine::text(QStringLiteral("CLINoLanguages")));
        return CommandLine::Success;
    }
    const QString installed = CommandLine::text(QStringLiteral("CLIKindInstalled"));
    const QString downloadable = CommandLine::text(QStringLiteral("CLIKindDownloadable"));
    const qsizetype kindWidth = qMax(installed.size(), downloadable.size());
    for (const auto &line : lines) {
        const bool offered = line.kind == u"downloadable";
        QString text = QStringLiteral("%1 %2 %3 %4 %5")
                           .arg(offered ? downloadable : installed, -int(kindWidth))
                           .arg(line.item->localeIdentifier(), -8)
                           .arg(line.item->displayTitle(), -40)
                           .arg(line.item->visibility())
                           .arg(offered ? line.item->displayedSize() : QString());
        CommandLine::print(stdout, text.trimmed());
    }
    return CommandLine::Success;
}
