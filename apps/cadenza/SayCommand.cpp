#include "SayCommand.h"

#include "CommandLine.h"

#include "platform/Services.h"
#include "platform/SpeechSynthesisService.h"
#include "voices/SpeechSynthesizer.h"

#include <QCommandLineParser>
#include <QEventLoop>
#include <QFile>
#include <QTimer>

#include <cstdio>

using namespace Cadenza;
using namespace Cadenza::Platform;

int SayCommand::run(const QStringList &arguments)
{
    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral(
        "Speaks TEXT (or standard input when no TEXT is given) with the default voice or the one chosen "
        "with --voice, on the audio output or into a WAV file."));
    const QCommandLineOption voice(QStringLiteral("voice"),
        QStringLiteral(
            "Speak with the voice ID (an identifier, or the start of one of 36 characters or more)."),
        QStringLiteral("ID"));
    const QCommandLineOption rate(QStringLiteral("rate"),
        QStringLiteral("Speak at WPM words per minute (80 to 450)."), QStringLiteral("WPM"));
    const QCommandLineOption output(QStringLiteral("output"),
        QStringLiteral("Write the speech to FILE.wav (16-bit mono) instead of playing it."),
        QStringLiteral("FILE.wav"));
    parser.addOptions({voice, rate, output});
    parser.addPositionalArgument(
        QStringLiteral("TEXT"), QStringLiteral("What to say."), QStringLiteral("[TEXT...]"));
    const QString program = arguments.first();
    if (const auto done = CommandLine::parse(parser, arguments)) {
        return *done;
    }

    SpeechRequest request;
    request.text = parser.positionalArguments().join(QLatin1Char(' '));
    if (parser.positionalArguments().isEmpty()) {
        QFile input;
        if (!input.open(stdin, QIODevice::ReadOnly)) {
            std::fprintf(stderr, "%s: cannot read standard input\n", qPrintable(program));
            return 1;
        }
        request.text = QString::fromUtf8(input.readAll());
    }
    if (request.text.trimmed().isEmpty()) {
        std::fprintf(stderr, "%s: nothing to say\n", qPrintable(program));
        return 2;
    }
    if (parser.isSet(rate)) {
        bool ok = false;
        request.wordsPerMinute = parser.value(rate).toDouble(&ok);
        if (!ok || request.wordsPerMinute < 80 || request.wordsPerMinute > 450) {
            std::fprintf(stderr, "%s: --rate takes words per minute from 80 to 450, not '%s'\n",
                qPrintable(program), qPrintable(parser.value(rate)));
            return 2;
        }
    }
    if (parser.isSet(voice)) {
        const QString wanted = parser.value(voice);
        request.voiceIdentifier
            = SpeechSynthesizer::resolveVoiceIdentifier(wanted, SpeechSynthesizer::allVoices());
        if (request.voiceIdentifier.isEmpty()) {
            std::fprintf(stderr, "%s: no installed voice '%s' (see 'cadenza voices --all')\n",
                qPrintable(program), qPrintable(wanted));
            return 1;
        }
    } else {
        request.voiceIdentifier = SpeechSynthesizer::defaultVoiceFromMainstreamVoices();
        if (request.voiceIdentifier.isEmpty()) {
            std::fprintf(stderr, "%s: no voices are installed\n", qPrintable(program));
            return 1;
        }
    }

    SpeechSynthesisService &service = Services::speechSynthesis();
    if (parser.isSet(output)) {
        QString error;
        if (!service.renderToFile(request, parser.value(output), &error)) {
            std::fprintf(stderr, "%s: %s\n", qPrintable(program), qPrintable(error));
            return 1;
        }
        return 0;
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
        std::fprintf(stderr, "%s: could not speak with '%s'\n", qPrintable(program),
            qPrintable(request.voiceIdentifier));
        return 1;
    }
    loop.exec();
    if (!completed) {
        std::fprintf(stderr, "%s: speaking failed\n", qPrintable(program));
        return 1;
    }
    return 0;
}
