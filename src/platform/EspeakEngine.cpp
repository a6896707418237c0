#include "EspeakEngine.h"

#include "Logging.h"

#include <QMutex>

#include <espeak-ng/speak_lib.h>

namespace Cadenza::Platform {

namespace {

QMutex &engineMutex()
{
    static QMutex mutex;
    return mutex;
}

struct RenderTarget
{
    std::vector<qint16> *samples = nullptr;
    std::atomic<bool> *cancelled = nullptr;
};
RenderTarget currentTarget; // guarded by engineMutex()

int collectSamples(short *wav, int count, espeak_EVENT *)
{
    if (currentTarget.cancelled && currentTarget.cancelled->load()) {
        return 1; // asks espeak-ng to stop
    }
    if (wav && count > 0 && currentTarget.samples) {
        currentTarget.samples->insert(currentTarget.samples->end(), wav, wav + count);
    }
    return 0;
}

} // namespace

EspeakEngine &EspeakEngine::instance()
{
    static EspeakEngine engine;
    return engine;
}

bool EspeakEngine::initialise(QString *error)
{
    if (m_initialised) {
        return m_sampleRate > 0;
    }
    m_initialised = true;
    m_sampleRate = espeak_Initialize(AUDIO_OUTPUT_SYNCHRONOUS, 0, nullptr, espeakINITIALIZE_DONT_EXIT);
    if (m_sampleRate <= 0) {
        if (error) {
            *error = QStringLiteral("the espeak-ng engine could not start (is espeak-ng-data installed?)");
        }
        return false;
    }
    espeak_SetSynthCallback(collectSamples);
    return true;
}

std::optional<PcmAudio> EspeakEngine::render(
    const VoiceDescription &voice, const SpeechRequest &request, QString *error)
{
    QMutexLocker locker(&engineMutex());
    if (!initialise(error)) {
        if (error && error->isEmpty()) {
            *error = QStringLiteral("the espeak-ng engine could not start");
        }
        return std::nullopt;
    }
    m_cancelled = false;

    QByteArray name = voice.engineVoice.toUtf8();
    if (!voice.engineVariant.isEmpty()) {
        name += '+' + voice.engineVariant.toUtf8();
    }
    if (espeak_SetVoiceByName(name.constData()) != EE_OK) {
        if (error) {
            *error = QStringLiteral("espeak-ng has no voice '%1'").arg(QString::fromUtf8(name));
        }
        return std::nullopt;
    }
    const double rate = request.wordsPerMinute > 0 ? request.wordsPerMinute : voice.engineRate;
    const double pitch = request.pitch > 0 ? request.pitch : voice.enginePitch;
    espeak_SetParameter(espeakRATE, int(qBound(80.0, rate, 450.0)), 0);
    espeak_SetParameter(espeakPITCH, int(qBound(0.0, pitch, 100.0)), 0);
    // espeak-ng's volume runs 0..200 with 100 as normal loudness.
    espeak_SetParameter(espeakVOLUME, int(qBound(0.0, request.volume, 1.0) * 100.0), 0);

    PcmAudio audio;
    audio.sampleRate = m_sampleRate;
    currentTarget = {&audio.samples, &m_cancelled};
    const QByteArray text = request.text.toUtf8();
    const espeak_ERROR result = espeak_Synth(
        text.constData(), size_t(text.size()) + 1, 0, POS_CHARACTER, 0, espeakCHARS_UTF8, nullptr, nullptr);
    espeak_Synchronize();
    currentTarget = {};
    if (result != EE_OK) {
        if (error) {
            *error = QStringLiteral("espeak-ng could not speak the text");
        }
        return std::nullopt;
    }
    return audio;
}

void EspeakEngine::cancel()
{
    m_cancelled = true;
}

} // namespace Cadenza::Platform
