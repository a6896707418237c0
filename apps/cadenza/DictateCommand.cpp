// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "DictateCommand.h"

#include "CommandLine.h"

#include "core/dictation/Recognizer.h"
#include "core/dictation/Transcriber.h"
#include "core/formats/AudioFileReader.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/services/RecognitionService.h"
#include "core/services/Services.h"

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QFileInfo>
#include <QSocketNotifier>

#include <unistd.h>

#include <cstdio>

using namespace Cadenza;
using namespace Cadenza::Platform;

namespace {
/// About a quarter of a second at the usual rates: small blocks keep memory flat.
constexpr qsizetype BlockFrames = 4096;

/**
 * Listens until Enter (or the end of standard input): partial results on standard error as they
 * change, the final text on standard output. The recognizer loads the model, opens the microphone
 * and decodes on its own thread, so Enter is heard however busy it is.
 */
int dictateFromMicrophone(const QStringList &arguments, const QString &locale, const QString &grammarFile)
{
    Recognizer recognizer;
    recognizer.setLanguage(locale);
    recognizer.setGrammarFile(grammarFile);
    int status = CommandLine::Success;
    QString text;
    QObject::connect(&recognizer, &Recognizer::listening,
        [] { CommandLine::print(stderr, CommandLine::text(QStringLiteral("CLIListening"))); });
    QObject::connect(&recognizer, &Recognizer::partialResult,
        [](const QString &partial) { CommandLine::print(stderr, QStringLiteral("… ") + partial); });
    QObject::connect(&recognizer, &Recognizer::finalResult, [&](const QString &words) {
        text = words;
        QCoreApplication::quit();
    });
    QObject::connect(&recognizer, &Recognizer::failed, [&](const QString &reason) {
        CommandLine::fail(arguments, reason);
        status = CommandLine::Failed;
        QCoreApplication::quit();
    });
    QSocketNotifier enter(STDIN_FILENO, QSocketNotifier::Read);
    QObject::connect(&enter, &QSocketNotifier::activated, [&] {
        char ignored[256];
        (void)::read(STDIN_FILENO, ignored, sizeof ignored);
        enter.setEnabled(false);
        // Before the microphone is open this ends the recognition with nothing heard.
        recognizer.stop();
    });
    recognizer.startFromMicrophone();
    QCoreApplication::exec();
    if (status != CommandLine::Success) {
        return status;
    }
    if (text.isEmpty()) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLINoWordsHeard")));
        return CommandLine::Success;
    }
    CommandLine::print(stdout, text);
    return CommandLine::Success;
}

} // namespace

int DictateCommand::run(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(CommandLine::text(QStringLiteral("CLIDictateDescription")));
    const QCommandLineOption language(QStringLiteral("language"),
        CommandLine::text(QStringLiteral("CLILanguageOption")), QStringLiteral("LOCALE"));
    const QCommandLineOption grammar(QStringLiteral("grammar"),
        CommandLine::text(QStringLiteral("CLIGrammarOption")), QStringLiteral("FILE.gram"));
    const QCommandLineOption microphoneOption(
        QStringLiteral("microphone"), CommandLine::text(QStringLiteral("CLIMicrophoneOption")));
    parser.addOptions({language, grammar, microphoneOption});
    parser.addPositionalArgument(QStringLiteral("FILE.wav"),
        CommandLine::text(QStringLiteral("CLIRecordingOperand")), QStringLiteral("[FILE.wav]"));
    if (const auto done = CommandLine::parse(parser, arguments, 1)) {
        return *done;
    }
    const bool fromMicrophone = parser.isSet(microphoneOption);
    if (parser.positionalArguments().size() != (fromMicrophone ? 0 : 1)) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLIGiveOneRecording")));
        return CommandLine::BadUsage;
    }
    const QString path = fromMicrophone ? QString() : parser.positionalArguments().constFirst();
    if (!fromMicrophone && !QFileInfo(path).isFile()) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLINoSuchRecording"), {path}));
        return CommandLine::Failed;
    }
    const QString grammarFile = parser.value(grammar);
    if (!grammarFile.isEmpty() && !QFileInfo(grammarFile).isFile()) {
        CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLINoSuchGrammar"), {grammarFile}));
        return CommandLine::Failed;
    }

    RecognitionService &recognition = Services::recognition();
    QString locale = parser.value(language);
    if (locale.isEmpty()) {
        const QStringList installed = recognition.installedLanguages().value_or(QStringList());
        if (installed.isEmpty()) {
            CommandLine::fail(arguments, CommandLine::text(QStringLiteral("CLINoRecognitionLanguage")));
            return CommandLine::Failed;
        }
        locale = CZSRLanguageItem::preferredDictationLocaleIdentifierFromAvaiableLocaleIdentifiers(
            installed, QString());
    }
    if (fromMicrophone) {
        return dictateFromMicrophone(arguments, locale, grammarFile);
    }
    QString error;
    const auto transcriber = Transcriber::loadForLanguage(locale, &error);
    if (!transcriber) {
        CommandLine::fail(arguments, error);
        return CommandLine::Failed;
    }
    AudioFileReader reader(transcriber->sampleRate());
    if (!reader.open(path, &error) || !transcriber->begin(grammarFile, &error)) {
        CommandLine::fail(arguments, error);
        return CommandLine::Failed;
    }
    for (;;) {
        const auto block = reader.read(BlockFrames, &error);
        if (!block) {
            CommandLine::fail(arguments, error);
            return CommandLine::Failed;
        }
        if (block->empty()) {
            break;
        }
        if (!transcriber->feed(block->data(), qsizetype(block->size()), &error)) {
            CommandLine::fail(arguments, error);
            return CommandLine::Failed;
        }
    }
    const auto text = transcriber->finish(&error);
    if (!text) {
        CommandLine::fail(arguments, error);
        return CommandLine::Failed;
    }
    if (text->isEmpty()) {
        CommandLine::fail(arguments,
            CommandLine::text(QStringLiteral("CLINoWordsRecognised"),
                {path, QString::number(transcriber->fedSeconds(), 'f', 1)}));
        return CommandLine::Success;
    }
    CommandLine::print(stdout, *text);
    return CommandLine::Success;
}
