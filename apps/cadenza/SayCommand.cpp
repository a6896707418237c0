// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "SayCommand.h"

#include "CommandLine.h"

#include "core/files/OutputFile.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"
#include "core/voices/SpeechSynthesizer.h"

#include <QCommandLineParser>
#include <QEventLoop>
#include <QFile>
#include <QTimer>

#include <cmath>
#include <limits>

using namespace Cadenza;
using namespace Cadenza::Platform;

int SayCommand::run(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(CommandLine::text(QStringLiteral("CLISayDescription")));
    const QCommandLineOption voice(
        QStringLiteral("voice"), CommandLine::text(QStringLiteral("CLIVoiceOption")), QStringLiteral("ID"));
    const QCommandLineOption rate(
        QStringLiteral("rate"), CommandLine::text(QStringLiteral("CLIRateOption")), QStringLiteral("WPM"));
    const QCommandLineOption output(QStringLiteral("output"),
        CommandLine::text(QStringLiteral("CLIOutputOption")), QStringLiteral("FILE.wav"));
    parser.addOptions({voice, rate, output});
    parser.addPositionalArgument(QStringLiteral("TEXT"), CommandLine::text(QStringLiteral("CLITextOperand")),
        QStringLiteral("[TEXT...]"));
    if (const auto done = CommandLine::parse(parser, arguments, std::numeric_limits<qsizetype>::max())) {
        return *done;
    }

    SpeechRequest request;
    // The values are checked before any work, and before standard input is read.
    if (parser.isSet(rate)) {
        bool ok = false;
        request.wordsPerMinute = parser.value(rate).toDouble(&ok);
        if (!ok || !std::isfinite(request.wordsPerMinute) || request.wordsPerMinute < 80
            || request.wordsPerMinute > 450) {
            CommandLine::fail(
                arguments, CommandLine::text(QStringLiteral("CLIRateRange"), {parser.value(rate)}));
            return CommandLine::BadUsage;
        }
    }
    if (parser.isSet(output)) {
        QString reason;
        if (OutputFile::kindOf(parser.value(output), &reason) == OutputFile::Kind::Refused) {
            CommandLine::fail(arguments, reason);
            return CommandLine::BadUsage;
        }
    }
    request.text = parser.positionalArguments().join(QLatin1Char(' '));
    if (parser.positionalArguments().isEmpty()) {
        QFile input;
        if (!input.open(stdin, QIODevice::ReadOnly)) {
            CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLICannotReadInput")));
            return CommandLine::Failed;
        }
        request.text = QString::fromUtf8(input.readAll());
    }
    if (request.text.trimmed().isEmpty()) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLINothingToSay")));
        return CommandLine::BadUsage;
    }
    if (parser.isSet(voice)) {
        const QString wanted = parser.value(voice);
        request.voiceIdentifier
            = SpeechSynthesizer::resolveVoiceIdentifier(wanted, SpeechSynthesizer::allVoices());
        if (request.voiceIdentifier.isEmpty()) {
            CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLINoSuchVoice"), {wanted}));
            return CommandLine::Failed;
        }
    } else {
        request.voiceIdentifier = SpeechSynthesizer::defaultVoiceFromMainstreamVoices();
        if (request.voiceIdentifier.isEmpty()) {
            CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLINoVoices")));
            return CommandLine::Failed;
        }
    }

    SpeechSynthesisService &service = Services::speechSynthesis();
    if (parser.isSet(output)) {
        QString error;
        if (!service.renderToFile(request, parser.value(output), &error)) {
            CommandLine::fail(arguments, error);
            return CommandLine::Failed;
        }
        return CommandLine::Success;
    }

    QEventLoop loop;
    bool completed = false;
    quint64 requestId = 0;
    QObject::connect(&service, &SpeechSynthesisService::speakingFinished, &loop, [&](quint64 id, bool done) {
        if (id == requestId) {
            completed = done;
            loop.quit();
        }
    });
    requestId = service.startSpeaking(request);
    if (requestId == 0) {
        CommandLine::fail(
            arguments, CommandLine::text(QStringLiteral("CLICannotSpeak"), {request.voiceIdentifier}));
        return CommandLine::Failed;
    }
    loop.exec();
    if (!completed) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLISpeakingFailed")));
        return CommandLine::Failed;
    }
    return CommandLine::Success;
}
