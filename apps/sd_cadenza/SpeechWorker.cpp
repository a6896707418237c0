// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "SpeechWorker.h"

#include "AudioSender.h"
#include "sd_cadenza_logging.h"

#include "core/engines/SpeechEngines.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"

#include <QFileInfo>
#include <QRegularExpression>
#include <QtMath>

using namespace Cadenza;
using namespace Cadenza::Platform;

namespace SdCadenza {

namespace {

constexpr int DefaultSampleRate = 22050;

int cutPoint(const QString &text, qsizetype from, qsizetype maximum)
{
    const qsizetype end = qMin(text.size(), from + maximum);
    if (end == text.size()) {
        return int(end);
    }
    // Prefer a clause end, then a word end, in the second half of the window.
    for (const QString &marks : {QStringLiteral(",;:"), QStringLiteral(" ")}) {
        for (qsizetype i = end - 1; i > from + maximum / 2; --i) {
            if (marks.contains(text.at(i))) {
                return int(i + 1);
            }
        }
    }
    // Never cut a surrogate pair in two.
    return int(text.at(end - 1).isHighSurrogate() ? end - 1 : end);
}

} // namespace

SpeechWorker::SpeechWorker(AudioSender &sender, EngineLookup engines)
    : m_sender(sender)
    , m_engines(engines ? std::move(engines) : EngineLookup(&SpeechEngines::engine))
{
    m_thread = std::thread([this] { run(); });
}

SpeechWorker::~SpeechWorker()
{
    {
        std::lock_guard lock(m_mutex);
        m_quit = true;
        m_interrupt = Interrupt::Stop;
    }
    m_wake.notify_all();
    m_thread.join();
}

bool SpeechWorker::start(SpeechJob job)
{
    std::lock_guard lock(m_mutex);
    if (m_busy.load()) {
        return false;
    }
    // Cleared here, not on the worker, so a STOP right after this message is never lost.
    m_interrupt = Interrupt::None;
    m_job = std::move(job);
    m_busy = true;
    m_wake.notify_all();
    return true;
}

void SpeechWorker::stop()
{
    if (m_busy.load()) {
        m_interrupt = Interrupt::Stop;
    }
}

void SpeechWorker::pause()
{
    Interrupt expected = Interrupt::None;
    if (m_busy.load()) {
        m_interrupt.compare_exchange_strong(expected, Interrupt::Pause);
    }
}

QStringList SpeechWorker::chunks(const QString &text, qsizetype maximum)
{
    static const QRegularExpression sentenceEnd(
        QStringLiteral("[.!?\u2026\u3002\uff01\uff1f]+[\"')\\]]*\\s+"));
    QStringList sentences;
    qsizetype from = 0;
    auto it = sentenceEnd.globalMatch(text);
    while (it.hasNext()) {
        const auto match = it.next();
        sentences.append(text.mid(from, match.capturedEnd() - from));
        from = match.capturedEnd();
    }
    sentences.append(text.mid(from));

    // The first sentence is cut at its first clause end: the listener hears the message begin as soon as
    // that clause is rendered. The engine ends a clause at a comma anyway, so the cut is not heard.
    static const QRegularExpression clauseEnd(QStringLiteral("[,;:、，]\\s+"));
    if (const auto match = clauseEnd.match(sentences.first());
        match.hasMatch() && match.capturedStart() >= 12) {
        const QString first = sentences.takeFirst();
        sentences.prepend(first.mid(match.capturedEnd()));
        sentences.prepend(first.left(match.capturedEnd()));
    }

    QStringList result;
    for (const QString &sentence : std::as_const(sentences)) {
        qsizetype at = 0;
        while (at < sentence.size()) {
            const int end = cutPoint(sentence, at, qMax<qsizetype>(maximum, 2));
            const QString piece = sentence.mid(at, end - at);
            if (!piece.trimmed().isEmpty()) {
                result.append(piece.trimmed());
            }
            at = end;
        }
    }
    return result;
}

std::optional<SpeechWorker::Speaker> SpeechWorker::speakerFor(
    const SpeechJob &job, const EngineLookup &engines, QString *error)
{
    SpeechSynthesisService &service = Services::speechSynthesis();
    const QString identifier = job.voiceIdentifier.isEmpty() ? service.defaultVoice() : job.voiceIdentifier;
    auto voice = service.voice(identifier);
    if (!voice) {
        *error = QStringLiteral("the voice '%1' is not installed").arg(identifier);
        return std::nullopt;
    }
    Speaker speaker;
    speaker.engine = engines(voice->engineName, error);
    if (!speaker.engine) {
        return std::nullopt;
    }
    SynthesisParameters &parameters = speaker.parameters;
    // speech-dispatcher's scales run from -100 to 100 around the voice's own rate and pitch.
    parameters.normalWordsPerMinute = voice->engineRate;
    parameters.wordsPerMinute
        = qBound(80.0, voice->engineRate * std::pow(3.0, qBound(-100, job.rate, 100) / 100.0), 450.0);
    // Pitch moves by up to half the engine's 0..100 scale either way; a capital letter said on its own
    // a further fifth up.
    parameters.normalPitch = voice->enginePitch;
    double pitch = voice->enginePitch + qBound(-100, job.pitch, 100) / 2.0;
    if (job.raisePitch) {
        pitch += 20;
    }
    parameters.pitch = qBound(1.0, pitch, 100.0);
    // speech-dispatcher's 0 is the voice's normal loudness (its clients' usual setting); the samples
    // cannot go louder than full scale without clipping, so only values below 0 make a difference.
    parameters.volume = qMin(0, qBound(-100, job.volume, 100)) / 100.0 + 1.0;
    speaker.voice = std::move(*voice);
    return speaker;
}

void SpeechWorker::run()
{
    for (;;) {
        SpeechJob job;
        {
            std::unique_lock lock(m_mutex);
            m_wake.wait(lock, [this] { return m_quit || m_job.has_value(); });
            if (m_quit) {
                return;
            }
            job = std::move(*m_job);
            m_job.reset();
        }
        const QByteArray ending = speak(job);
        // Free again before the last event leaves: the server answers it with the next message at
        // once. Under the lock, so that message's BEGIN cannot overtake this END.
        std::lock_guard lock(m_mutex);
        m_busy = false;
        m_sender.send(ending);
    }
}

bool SpeechWorker::sendSamples(const qint16 *samples, qsizetype count, int sampleRate)
{
    for (qsizetype at = 0; at < count; at += BlockSamples) {
        if (m_interrupt.load() == Interrupt::Stop) {
            return false;
        }
        if (!m_sender.sendAudio(samples + at, qMin(BlockSamples, count - at), sampleRate)) {
            return false;
        }
        // The server was just woken to read this block, but this thread would go on rendering and keep
        // the processor: on a busy machine the server then waits a scheduler slice (about 1.5 ms
        // measured) before it sees the audio. Giving way lets it read at once.
        std::this_thread::yield();
    }
    return true;
}

QByteArray SpeechWorker::speak(const SpeechJob &job)
{
    m_sender.send("701 BEGIN\n");
    if (!job.icon.isEmpty()) {
        m_sender.send("706-" + job.icon.toUtf8() + "\n706 ICON\n");
        return "702 END\n";
    }
    int sampleRate = DefaultSampleRate;
    const char *ending = "702 END\n";
    std::optional<Speaker> speaker;
    const auto fail = [&](const QString &error) {
        // A voice removed while speaking ends up here: the message ends, the next one chooses its
        // voice again.
        qCWarning(lcModule, "sd_cadenza: cannot speak: %s", qPrintable(error));
        ending = "703 STOP\n";
        m_interrupt = Interrupt::Stop;
    };
    // Audio goes out block by block as the engine renders it; a stop ends the render at the next block.
    const AudioBlockSink sink = [this, &sampleRate](const qint16 *samples, qsizetype count, int rate) {
        sampleRate = rate;
        return sendSamples(samples, count, rate);
    };
    for (const auto &segment : job.segments) {
        if (m_interrupt.load() != Interrupt::None) {
            break;
        }
        switch (segment.kind) {
        case SsmlText::Segment::Kind::Mark:
            m_sender.send("700-" + segment.text.toUtf8() + "\n700 INDEX MARK\n");
            break;
        case SsmlText::Segment::Kind::Pause: {
            const std::vector<qint16> silence(size_t(qint64(sampleRate) * segment.pauseMs / 1000), 0);
            (void)sendSamples(silence.data(), qsizetype(silence.size()), sampleRate);
            break;
        }
        case SsmlText::Segment::Kind::Text:
            for (const QString &chunk : chunks(segment.text)) {
                if (m_interrupt.load() != Interrupt::None) {
                    break;
                }
                QString error;
                if (!speaker) {
                    speaker = speakerFor(job, m_engines, &error);
                } else if (!QFileInfo::exists(speaker->voice.bundlePath)) {
                    // Found once per message, but a voice removed meanwhile is not spoken with.
                    error = QStringLiteral("the voice '%1' was removed").arg(speaker->voice.identifier);
                }
                if (!speaker || !error.isEmpty()
                    || !speaker->engine->renderBlocks(
                        speaker->voice, chunk, speaker->parameters, sink, &error)) {
                    fail(error);
                    break;
                }
            }
            break;
        }
    }
    switch (m_interrupt.load()) {
    case Interrupt::Stop:
        ending = "703 STOP\n";
        break;
    case Interrupt::Pause:
        ending = "704 PAUSE\n";
        break;
    case Interrupt::None:
        break;
    }
    return ending;
}

} // namespace SdCadenza
