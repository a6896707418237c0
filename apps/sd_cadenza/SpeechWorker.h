// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef SD_CADENZA_SPEECHWORKER_H
#define SD_CADENZA_SPEECHWORKER_H

#include "SsmlText.h"

#include "core/engines/SpeechEngine.h"

#include <QString>
#include <QStringList>

#include <atomic>
#include <condition_variable>
#include <functional>
#include <mutex>
#include <optional>
#include <thread>

namespace SdCadenza {

class AudioSender;

/// One message to speak, with the settings in force when it arrived.
struct SpeechJob
{
    QList<SsmlText::Segment> segments;
    QString icon; ///< a sound icon to hand to the server instead of speech
    QString voiceIdentifier;
    int rate = 0; ///< -100..100, 0 the voice's normal rate
    int pitch = 0; ///< -100..100, 0 the voice's own pitch
    int volume = 0; ///< -100..100; 0 and above the voice's full loudness
    bool raisePitch = false; ///< a capital letter said on its own
};

/**
 * Speaks one message at a time on a thread of its own, so that the protocol is served meanwhile.
 *
 * The voice, its engine and the figures are found once per message. The message is rendered a
 * sentence at a time (long sentences are cut at clause or word ends), and each block of audio is sent
 * as soon as the engine hands it out; a stop is noticed at every block, so speech ends within one
 * block. A pause waits for the end of the sentence, the place where speaking can later go on without
 * a gap. Events follow the protocol: BEGIN, then index marks and audio in order, then exactly one of
 * END, STOP (also after an error) or PAUSE.
 */
class SpeechWorker
{
public:
    static constexpr qsizetype BlockSamples = 4096; ///< the largest audio event
    static constexpr qsizetype MaximumChunk = 300; ///< characters rendered at once

    /// Finds the engine called @p name; nullptr with a readable @p error when there is none.
    using EngineLookup
        = std::function<Cadenza::Platform::SpeechEngine *(const QString &name, QString *error)>;

    /// The voice, engine and figures a message is spoken with.
    struct Speaker
    {
        Cadenza::Platform::VoiceDescription voice;
        Cadenza::Platform::SynthesisParameters parameters;
        Cadenza::Platform::SpeechEngine *engine = nullptr;
    };

    /// Speaks through @p sender with the engines @p engines finds (the engine plugins when not given).
    explicit SpeechWorker(AudioSender &sender, EngineLookup engines = {});
    ~SpeechWorker();
    SpeechWorker(const SpeechWorker &) = delete;
    SpeechWorker &operator=(const SpeechWorker &) = delete;

    /// Starts speaking @p job; false while another message is being spoken.
    [[nodiscard]] bool start(SpeechJob job);
    void stop();
    void pause();
    [[nodiscard]] bool isBusy() const { return m_busy.load(); }

    /// @p text cut into pieces of at most @p maximum characters, at sentence ends where possible.
    [[nodiscard]] static QStringList chunks(const QString &text, qsizetype maximum = MaximumChunk);
    /// The installed voice of @p job with its settings resolved, and its engine from @p engines.
    [[nodiscard]] static std::optional<Speaker> speakerFor(
        const SpeechJob &job, const EngineLookup &engines, QString *error);

private:
    enum class Interrupt { None, Stop, Pause };

    void run();
    /// Speaks @p job; returns its last event.
    QByteArray speak(const SpeechJob &job);
    /// Sends @p samples in blocks; false when a stop came first.
    bool sendSamples(const qint16 *samples, qsizetype count, int sampleRate);

    AudioSender &m_sender;
    EngineLookup m_engines;
    std::thread m_thread;
    std::mutex m_mutex;
    std::condition_variable m_wake;
    std::optional<SpeechJob> m_job;
    bool m_quit = false;
    std::atomic<bool> m_busy {false};
    std::atomic<Interrupt> m_interrupt {Interrupt::None};
};

} // namespace SdCadenza

#endif
