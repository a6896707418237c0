#ifndef CADENZA_PLATFORM_ESPEAKENGINE_H
#define CADENZA_PLATFORM_ESPEAKENGINE_H

#include "cadenzacore_export.h"

#include "SpeechSynthesisService.h"
#include "WaveFile.h"

#include <atomic>

namespace Cadenza::Platform {

/**
 * Renders speech with espeak-ng into memory.
 *
 * espeak-ng keeps one global synthesiser, so renders are serialised; any thread may call render().
 */
class CADENZACORE_EXPORT EspeakEngine
{
public:
    static EspeakEngine &instance();

    /// Speaks @p request with @p voice; nothing when the engine cannot start or the voice is unknown.
    /// A render cut short by cancel() returns what was rendered so far.
    [[nodiscard]] std::optional<PcmAudio> render(
        const VoiceDescription &voice, const SpeechRequest &request, QString *error);
    /// Makes the running render return early.
    void cancel();

private:
    EspeakEngine() = default;
    bool initialise(QString *error);

    int m_sampleRate = 0;
    bool m_initialised = false;
    std::atomic<bool> m_cancelled {false};
};

} // namespace Cadenza::Platform

#endif
