// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "EspeakEnginePlugin.h"

#include <espeak-ng/speak_lib.h>

namespace Cadenza::Engines {

using Platform::SynthesisParameters;
using Platform::VoiceDescription;

namespace {

struct RenderTarget
{
    const Platform::AudioBlockSink *sink = nullptr;
    std::atomic<bool> *cancelled = nullptr;
    int sampleRate = 0;
    bool stopped = false; ///< the sink or cancel() asked to stop
};
RenderTarget currentTarget; // guarded by the plugin's mutex: espeak-ng has one synthesiser

int collectSamples(short *wav, int count, espeak_EVENT *)
{
    if (currentTarget.stopped || (currentTarget.cancelled && currentTarget.cancelled->load())) {
        currentTarget.stopped = true;
        return 1; // asks espeak-ng to stop
    }
    if (wav && count > 0 && currentTarget.sink) {
        if (!(*currentTarget.sink)(wav, count, currentTarget.sampleRate)) {
            currentTarget.stopped = true;
            return 1;
        }
    }
    return 0;
}

/// Chooses the voice as espeak-ng's own tool does: by name first, else by language; then applies the
/// variant to the voice found. espeak-ng knows many languages ("fr-fr", "en-gb") only as languages.
bool selectVoice(const QString &engineVoice, const QString &variant, const QString &gender)
{
    const QByteArray suffix
        = variant.isEmpty() ? QByteArray() : QByteArray(QByteArray("+") + variant.toUtf8());
    const QByteArray name = engineVoice.toUtf8();
    if (espeak_SetVoiceByName(QByteArray(name + suffix).constData()) == EE_OK) {
        return true;
    }
    espeak_VOICE wanted {};
    wanted.languages = name.constData();
    wanted.gender = gender == Platform::VoiceGender::Male ? 1
        : gender == Platform::VoiceGender::Female         ? 2
                                                          : 0;
    if (espeak_SetVoiceByProperties(&wanted) != EE_OK) {
        return false;
    }
    const espeak_VOICE *found = espeak_GetCurrentVoice();
    if (suffix.isEmpty() || !found || !found->identifier) {
        return true;
    }
    // The identifier names the voice file ("roa/fr"), which takes a variant by name.
    QByteArray identifier(found->identifier);
    identifier.truncate(identifier.indexOf('+') < 0 ? identifier.size() : identifier.indexOf('+'));
    return espeak_SetVoiceByName(QByteArray(identifier + suffix).constData()) == EE_OK;
}

} // namespace

bool EspeakEnginePlugin::initialise(QString *error)
{
    if (m_initialised) {
        return m_sampleRate > 0;
    }
    m_initialised = true;
    m_sampleRate
        = espeak_Initialize(AUDIO_OUTPUT_SYNCHRONOUS, BlockMilliseconds, nullptr, espeakINITIALIZE_DONT_EXIT);
    if (m_sampleRate <= 0) {
        if (error) {
            *error = QStringLiteral("the espeak-ng engine could not start (is espeak-ng-data installed?)");
        }
        return false;
    }
    espeak_SetSynthCallback(collectSamples);
    return true;
}

bool EspeakEnginePlugin::renderBlocks(const VoiceDescription &voice, const QString &text,
    const SynthesisParameters &parameters, const Platform::AudioBlockSink &sink, QString *error)
{
    QMutexLocker locker(&m_mutex);
    if (!initialise(error)) {
        if (error && error->isEmpty()) {
            *error = QStringLiteral("the espeak-ng engine could not start");
        }
        return false;
    }
    m_cancelled = false;

    // Choosing a voice reads its files again; a run of renders with one voice chooses it once.
    const QString gender = voice.attributes.value(Platform::VoiceAttribute::Gender).toString();
    const QString voiceKey
        = voice.engineVoice + QLatin1Char('\n') + voice.engineVariant + QLatin1Char('\n') + gender;
    if (voiceKey != m_currentVoice) {
        m_currentVoice.clear();
        if (!selectVoice(voice.engineVoice, voice.engineVariant, gender)) {
            if (error) {
                *error = QStringLiteral("espeak-ng has no voice or language '%1'").arg(voice.engineVoice);
            }
            return false;
        }
        m_currentVoice = voiceKey;
    }
    // espeak-ng speaks in words per minute and takes its pitch base on the same 0..100 scale.
    espeak_SetParameter(espeakRATE, qRound(parameters.wordsPerMinute), 0);
    espeak_SetParameter(espeakPITCH, qRound(parameters.pitch), 0);
    // espeak-ng's volume runs 0..200 with 100 as normal loudness.
    espeak_SetParameter(espeakVOLUME, qRound(parameters.volume * 100.0), 0);

    currentTarget = {&sink, &m_cancelled, m_sampleRate, false};
    const QByteArray utf8 = text.toUtf8();
    const espeak_ERROR result = espeak_Synth(
        utf8.constData(), size_t(utf8.size()) + 1, 0, POS_CHARACTER, 0, espeakCHARS_UTF8, nullptr, nullptr);
    espeak_Synchronize();
    const bool stopped = currentTarget.stopped;
    currentTarget = {};
    if (result != EE_OK && !stopped) {
        if (error) {
            *error = QStringLiteral("espeak-ng could not speak the text");
        }
        return false;
    }
    return true;
}

} // namespace Cadenza::Engines
