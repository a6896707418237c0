// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_SPEECHENGINE_H
#define CADENZA_PLATFORM_SPEECHENGINE_H

#include "core/formats/VoiceDescription.h"
#include "core/formats/WaveFile.h"

#include <QString>
#include <QtPlugin>

#include <cmath>
#include <functional>
#include <optional>

namespace Cadenza::Platform {

/**
 * How to speak, resolved against the voice: every engine receives the same figures and must make
 * them sound alike.
 *
 * The pitch scale is 0..100; a voice's own pitch sits at its bundle's "Pitch" (50 when it says
 * nothing), and pitchFactor() says how far the mean pitch moves when the scale moves away from it.
 */
struct SynthesisParameters
{
    double wordsPerMinute = 175; ///< requested speaking rate
    double normalWordsPerMinute = 175; ///< the voice's own rate
    double pitch = 50; ///< requested pitch on the 0..100 scale
    double normalPitch = 50; ///< the voice's own pitch on that scale
    double volume = 1.0; ///< 0..1

    /// The factor by which the voice's mean pitch changes. Measured on espeak-ng, whose pitch base
    /// runs on this scale: each 10 steps up raise the pitch by about 10.7 %, each 10 steps down lower
    /// it by about 6 %, down to 0.7 of the own pitch 50 steps below.
    [[nodiscard]] double pitchFactor() const
    {
        const double steps = pitch - normalPitch;
        return steps >= 0 ? std::exp(0.0102 * steps) : std::max(0.3, 1.0 + 0.006 * steps);
    }
    /// The factor by which durations stretch: above 1 slower, below 1 faster.
    [[nodiscard]] double durationStretch() const
    {
        return wordsPerMinute > 0 ? normalWordsPerMinute / wordsPerMinute : 1.0;
    }
};

/// Receives rendered audio block by block; returning false stops the render after this block.
using AudioBlockSink = std::function<bool(const qint16 *samples, qsizetype count, int sampleRate)>;

/**
 * A speech engine: turns text into 16-bit mono PCM with one voice. Each engine is a Qt plugin in
 * the library's plugin folder (see SpeechEngines); voice bundles name the engine they need.
 *
 * Renders may be called from any thread; an engine serialises its renders when it must.
 */
class SpeechEngine
{
public:
    virtual ~SpeechEngine() = default;

    /// The name bundles use for this engine ("espeak-ng", "flite").
    [[nodiscard]] virtual QString engineName() const = 0;
    /**
     * Speaks @p text with @p voice (its bundle folder in voice.bundlePath, its engine settings in
     * voice.engineSettings), handing the audio to @p sink in blocks as the engine produces them, so
     * that the first block can be played long before the whole text is rendered. The render ends
     * early, still successfully, after a block for which @p sink returns false or after cancel().
     * Returns false, with a readable @p error, when the voice cannot speak.
     */
    [[nodiscard]] virtual bool renderBlocks(const VoiceDescription &voice, const QString &text,
        const SynthesisParameters &parameters, const AudioBlockSink &sink, QString *error)
        = 0;
    /**
     * Speaks @p text whole. Returns nothing, with a readable @p error, when the voice cannot speak.
     * A render cut short by cancel() returns what was rendered so far.
     */
    [[nodiscard]] std::optional<PcmAudio> render(const VoiceDescription &voice, const QString &text,
        const SynthesisParameters &parameters, QString *error)
    {
        PcmAudio audio;
        const bool spoken = renderBlocks(
            voice, text, parameters,
            [&audio](const qint16 *samples, qsizetype count, int sampleRate) {
                audio.sampleRate = sampleRate;
                audio.samples.insert(audio.samples.end(), samples, samples + count);
                return true;
            },
            error);
        if (!spoken) {
            return std::nullopt;
        }
        return audio;
    }
    /// Makes the running render return early.
    virtual void cancel() = 0;
};

} // namespace Cadenza::Platform

#define CadenzaSpeechEngine_iid "org.cadenza.SpeechEngine/2" // raised whenever the class above changes
Q_DECLARE_INTERFACE(Cadenza::Platform::SpeechEngine, CadenzaSpeechEngine_iid)

#endif
