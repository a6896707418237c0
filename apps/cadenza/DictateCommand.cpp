// SPDX-License-Identifier: GPL-3.0-or-later
#include "DictateCommand.h"

#include "CommandLine.h"

#include "dictation/Transcriber.h"
#include "platform/AudioFileReader.h"
#include "platform/RecognitionService.h"
#include "platform/Services.h"
#include "recognition-languages/CZSRLanguageItem.h"

#include <QCommandLineParser>
#include <QFileInfo>

#include <cstdio>

using namespace Cadenza;
using namespace Cadenza::Platform;

namespace {
/// About a quarter of a second at the usual rates: small blocks keep memory flat.
constexpr qsizetype BlockFrames = 4096;
} // namespace

int DictateCommand::run(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral(
        "Prints the words spoken in FILE.wav (any sample rate, format or number of channels), recognised "
        "with the installed recognizer of your preferred dictation language or the one chosen with "
        "--language."));
    const QCommandLineOption language(QStringLiteral("language"),
        QStringLiteral("Recognise with the recognizer of LOCALE (e.g. en_US)."), QStringLiteral("LOCALE"));
    const QCommandLineOption grammar(QStringLiteral("grammar"),
        QStringLiteral("Recognise only the sentences of the JSGF grammar FILE.gram."),
        QStringLiteral("FILE.gram"));
    parser.addOptions({language, grammar});
    parser.addPositionalArgument(QStringLiteral("FILE.wav"), QStringLiteral("The recording to transcribe."));
    const QString program = arguments.first();
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }
    if (parser.positionalArguments().size() != 1) {
        std::fprintf(stderr, "%s: give one sound file (see --help)\n", qPrintable(program));
        return 2;
    }
    const QString path = parser.positionalArguments().constFirst();
    if (!QFileInfo(path).isFile()) {
        std::fprintf(stderr, "%s: no file %s\n", qPrintable(program), qPrintable(path));
        return 1;
    }
    const QString grammarFile = parser.value(grammar);
    if (!grammarFile.isEmpty() && !QFileInfo(grammarFile).isFile()) {
        std::fprintf(stderr, "%s: no grammar file %s\n", qPrintable(program), qPrintable(grammarFile));
        return 1;
    }

    RecognitionService &recognition = Services::recognition();
    QString locale = parser.value(language);
    if (locale.isEmpty()) {
        const QStringList installed = recognition.installedLanguages().value_or(QStringList());
        if (installed.isEmpty()) {
            std::fprintf(stderr,
                "%s: no recognition language is installed (see 'cadenza languages' and 'cadenza install')\n",
                qPrintable(program));
            return 1;
        }
        locale = CZSRLanguageItem::preferredDictationLocaleIdentifierFromAvaiableLocaleIdentifiers(
            installed, QString());
    }
    QString error;
    const auto model = recognition.modelForLocale(locale, &error);
    if (!model) {
        std::fprintf(stderr, "%s: %s\n", qPrintable(program), qPrintable(error));
        return 1;
    }
    const auto transcriber = Transcriber::load(*model, &error);
    if (!transcriber) {
        std::fprintf(stderr, "%s: %s\n", qPrintable(program), qPrintable(error));
        return 1;
    }
    AudioFileReader reader(transcriber->sampleRate());
    if (!reader.open(path, &error) || !transcriber->begin(grammarFile, &error)) {
        std::fprintf(stderr, "%s: %s\n", qPrintable(program), qPrintable(error));
        return 1;
    }
    for (;;) {
        const auto block = reader.read(BlockFrames, &error);
        if (!block) {
            std::fprintf(stderr, "%s: %s\n", qPrintable(program), qPrintable(error));
            return 1;
        }
        if (block->empty()) {
            break;
        }
        if (!transcriber->feed(block->data(), qsizetype(block->size()), &error)) {
            std::fprintf(stderr, "%s: %s\n", qPrintable(program), qPrintable(error));
            return 1;
        }
    }
    const auto text = transcriber->finish(&error);
    if (!text) {
        std::fprintf(stderr, "%s: %s\n", qPrintable(program), qPrintable(error));
        return 1;
    }
    if (text->isEmpty()) {
        std::fprintf(stderr, "%s: no words were recognised in %s (%.1f s of sound)\n", qPrintable(program),
            qPrintable(path), transcriber->fedSeconds());
        return 0;
    }
    std::printf("%s\n", text->toUtf8().constData());
    return 0;
}
