// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "VoicesCommand.h"

#include "CommandLine.h"

#include "core/engines/SpeechEngines.h"
#include "core/formats/Locale.h"
#include "core/locale/LocaleDisplayName.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"
#include "core/voices/SpeechSynthesizer.h"

#include <QCommandLineParser>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>

#include <cstdio>

using namespace Cadenza;
using namespace Cadenza::Platform;

namespace {

struct VoiceLine
{
    QString identifier, name, locale, language, country, gender;
    QString engine; ///< the speech engine the voice's bundle names
    bool engineInstalled = true;
    bool isDefault = false;
};

QString genderText(const QString &gender, const LocalizationTable &table)
{
    if (gender == VoiceGender::Male) {
        return table.text(QStringLiteral("Male"));
    }
    if (gender == VoiceGender::Female) {
        return table.text(QStringLiteral("Female"));
    }
    if (gender == VoiceGender::Neuter) {
        return table.text(QStringLiteral("Novelty"));
    }
    return {};
}

QString displayName(const Platform::Locale &in, const QString &key, const QString &code)
{
    if (code.isEmpty()) {
        return {};
    }
    return displayNameForKey(in, key, code, LocaleDisplayNameOptions::CapitalizationForListOrMenu);
}

} // namespace

int VoicesCommand::run(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(CommandLine::text(QStringLiteral("CLIVoicesDescription")));
    const QCommandLineOption all(QStringLiteral("all"), CommandLine::text(QStringLiteral("CLIAllOption")));
    const QCommandLineOption json(QStringLiteral("json"), CommandLine::text(QStringLiteral("CLIJsonOption")));
    parser.addOptions({all, json});
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }

    const bool everyQuality = parser.isSet(all);
    const QStringList identifiers
        = everyQuality ? SpeechSynthesizer::allVoices() : SpeechSynthesizer::avaliableMainstreamVoices();
    const QString defaultVoice = everyQuality ? SpeechSynthesizer::defaultVoiceFromAllVoices()
                                              : SpeechSynthesizer::defaultVoiceFromMainstreamVoices();
    const LocalizationTable &table = LocalizationTable::shared();
    const Platform::Locale displayLocale(table.language());
    SpeechSynthesisService &service = Services::speechSynthesis();

    QList<VoiceLine> lines;
    for (const QString &identifier : identifiers) {
        const QVariantMap attributes = service.attributesForVoice(identifier);
        VoiceLine line;
        line.identifier = identifier;
        line.name = attributes.value(VoiceAttribute::Name).toString();
        QString locale = attributes.value(VoiceAttribute::LocaleIdentifier).toString();
        if (locale.isEmpty()) {
            locale = attributes.value(VoiceAttribute::Language).toString();
        }
        line.locale = Platform::Locale::canonicalLocaleIdentifier(
            locale.isEmpty() ? QStringLiteral("en_US") : locale);
        const LocaleComponents parts = Platform::Locale::componentsFromLocaleIdentifier(line.locale);
        line.language = displayName(displayLocale, Platform::Locale::LanguageCodeKey, parts.languageCode);
        line.country = displayName(displayLocale, Platform::Locale::CountryCodeKey, parts.countryCode);
        line.gender = genderText(attributes.value(VoiceAttribute::Gender).toString(), table);
        line.isDefault = identifier == defaultVoice;
        if (const auto voice = service.voice(identifier)) {
            line.engine = voice->engineName;
            line.engineInstalled = SpeechEngines::isAvailable(line.engine);
        }
        lines.append(line);
    }

    if (parser.isSet(json)) {
        QJsonArray array;
        for (const auto &line : lines) {
            array.append(QJsonObject {{QStringLiteral("identifier"), line.identifier},
                {QStringLiteral("name"), line.name}, {QStringLiteral("locale"), line.locale},
                {QStringLiteral("language"), line.language}, {QStringLiteral("country"), line.country},
                {QStringLiteral("gender"), line.gender}, {QStringLiteral("default"), line.isDefault},
                {QStringLiteral("engine"), line.engine},
                {QStringLiteral("engineInstalled"), line.engineInstalled}});
        }
        std::fputs(QJsonDocument(array).toJson(QJsonDocument::Indented).constData(), stdout);
        return 0;
    }

    if (lines.isEmpty()) {
        CommandLine::print(stderr, CommandLine::text(QStringLiteral("CLINoVoicesInstalled")));
        return CommandLine::Success;
    }
    qsizetype widths[5] = {0, 0, 0, 0, 0};
    for (const auto &line : lines) {
        const QString cells[5] = {line.identifier, line.name, line.locale, line.language, line.country};
        for (int i = 0; i < 5; ++i) {
            widths[i] = qMax(widths[i], cells[i].size());
        }
    }
    for (const auto &line : lines) {
        const QString row = QStringLiteral("%1 %2  %3  %4  %5  %6  %7")
                                .arg(line.isDefault ? QStringLiteral("*") : QStringLiteral(" "))
                                .arg(line.identifier, -int(widths[0]))
                                .arg(line.name, -int(widths[1]))
                                .arg(line.locale, -int(widths[2]))
                                .arg(line.language, -int(widths[3]))
                                .arg(line.country, -int(widths[4]))
                                .arg(line.gender);
        QString text = row;
        while (text.endsWith(QLatin1Char(' '))) {
            text.chop(1);
        }
        std::fputs(qPrintable(text + QLatin1Char('\n')), stdout);
    }
    return 0;
}
