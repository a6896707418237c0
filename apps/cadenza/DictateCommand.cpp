// SPDX-License-Identifier: GPL-3.0-or-later
#include "DictateCommand.h"

#include "CommandLine.h"

#include "core/dictation/Transcriber.h"
#include "core/formats/AudioFileReader.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/services/Microphone.h"
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

/// Listens until Enter (or the end of standard input): partial results on standard error as they
/// change, the final text on standard output.
int dictateFromMicrophone(const QString &program, Transcriber &transcriber)
{
    Microphone microphone;
    QString error;
    if (!microphone.start(transcriber.sampleRate(), &error)) {
        std::fprintf(stderr, "%s: %s\n", qPrintable(program), qPrintable(error));
        return 1;
    }
    std::fprintf(stderr, "Listening; press Enter to finish.\n");
    int status = 0;
    QString shown;
    QObject::connect(&microphone, &Microphone::samplesAvailable, [&](const QVector<qint16> &samples) {
        if (status != 0) {
            return;
        }
        if (!transcriber.feed(samples.constData(), samples.size(), &error)) {
            std::fprintf(stderr, "%s: %s\n", qPrintable(program), qPrintable(error));
            status = 1;
            QCoreApplication::quit();
            return;
        }
        const QString partial = transcriber.partialResult();
        if (partial != shown) {
            shown = partial;
            std::fprintf(stderr, "… %s\n", qPrintable(partial));
        }
    });
    QSocketNotifier enter(STDIN_FILENO, QSocketNotifier::Read);
    QObject::connect(&enter, &QSocketNotifier::activated, [&] {
        char ignored[256];
        (void)::read(STDIN_FILENO, ignored, sizeof ignored);
        QCoreApplication::quit();
    });
    QCoreApplication::exec();
    microphone.stop();
    if (status != 0) {
        return status;
    }
    const auto text = transcriber.finish(&error);
    if (!text) {
        std::fprintf(stderr, "%s: %s\n", qPrintable(program), qPrintable(error));
        return 1;
    }
    std::printf("%s\n", text->toUtf8().constData());
    return 0;
}

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
    const QCommandLineOption microphoneOption(QStringLiteral("microphone"),
        QStringLiteral("Listen to the microphone instead of a file: partial results on standard error, the "
                       "final text when Enter is pressed."));
    parser.addOptions({language, grammar, microphoneOption});
    parser.addPositionalArgument(QStringLiteral("FILE.wav"), QStringLiteral("The recording to transcribe."),
        QStringLiteral("[FILE.wav]"));
    const QString program = arguments.first();
    if (const auto done = CommandLine::parse(parser, arguments, 1)) {
        return *done;
    }
    const bool fromMicrophone = parser.isSet(microphoneOption);
    if (parser.positionalArguments().size() != (fromMicrophone ? 0 : 1)) {
        std::fprintf(stderr, "%s: give one sound file or --microphone (see --help)\n", qPrintable(program));
        return 2;
    }
    const QString path = fromMicrophone ? QString() : parser.positionalArguments().constFirst();
    if (!fromMicrophone && !QFileInfo(path).isFile()) {
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
    if (fromMicrophone) {
        if (!transcriber->begin(grammarFile, &error)) {
            std::fprintf(stderr, "%s: %s\n", qPrintable(program), qPrintable(error));
            return 1;
        }
        return dictateFromMicrophone(program, *transcriber);
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
