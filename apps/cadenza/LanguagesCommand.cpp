#include "LanguagesCommand.h"

#include "CommandLine.h"

#include "recognition-languages/CZSRLanguageItem.h"

#include <QCommandLineParser>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>

#include <cstdio>

using namespace Cadenza;

int LanguagesCommand::run(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral(
        "Lists the recognition (dictation) languages: those installed on this computer and those that can be "
        "downloaded, with their names in your language and whether you chose to show them (0 hidden, 1 "
        "shown, "
        "2 automatic)."));
    const QCommandLineOption json(
        QStringLiteral("json"), QStringLiteral("Print a JSON array instead of a table."));
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
    for (const auto &item : CZSRLanguageItem::downloadableLocalSRLanguageItems()) {
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
        return 0;
    }
    if (lines.isEmpty()) {
        std::fputs("No recognition languages are installed or offered.\n", stderr);
        return 0;
    }
    for (const auto &line : lines) {
        std::fprintf(stdout, "%-12s %-8s %-40s %lld %s\n", qPrintable(line.kind),
            qPrintable(line.item->localeIdentifier()), qPrintable(line.item->displayTitle()),
            static_cast<long long>(line.item->visibility()),
            line.kind == u"downloadable" ? qPrintable(line.item->displayedSize()) : "");
    }
    return 0;
}
