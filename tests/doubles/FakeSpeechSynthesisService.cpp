// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeSpeechSynthesisService.h"

#include "core/formats/WaveFile.h"

#include <QLoggingCategory>
#include <QTimer>

#include <algorithm>
#include <cmath>
#include <numbers>

namespace Cadenza::Platform {

// The double logs under its own name: the library keeps its categories to itself.
Q_LOGGING_CATEGORY(lcFakeSpeech, "cadenza.speech.fake", QtInfoMsg)

FakeSpeechSynthesisService::FakeSpeechSynthesisService(QObject *parent)
    : SpeechSynthesisService(parent)
{ }

void FakeSpeechSynthesisService::addVoice(const VoiceDescription &voice)
{
    removeVoice(voice.identifier);
    const auto at = std::lower_bound(m_voices.begin(), m_voices.end(), voice.identifier,
        [](const VoiceDescription &v, const QString &id) { return v.identifier < id; });
    m_voices.insert(at, voice);
    ++m_generation;
}

void FakeSpeechSynthesisService::addVoice(const QVariantMap &attributes)
{
    QString error;
    auto voice = VoiceDescription::fromInfo({{QStringLiteral("VoiceAttributes"), attributes}}, &error);
    Q_ASSERT_X(voice, "FakeSpeechSynthesisService::addVoice", qPrintable(error));
    if (voice) {
        addVoice(*voice);
    }
}

void FakeSpeechSynthesisService::removeVoice(const QString &identifier)
{
    if (m_voices.removeIf([&](const VoiceDescription &v) { return v.identifier == identifier; }) > 0) {
        ++m_generation;
    }
}

quint64 FakeSpeechSynthesisService::startSpeaking(const SpeechRequest &request)
{
    const QString identifier = request.voiceIdentifier.isEmpty() ? defaultVoice() : request.voiceIdentifier;
    if (!voice(identifier)) {
        qCWarning(lcFakeSpeech, "No installed voice '%s' to speak with", qPrintable(identifier));
        return 0;
    }
    stopSpeaking();
    const quint64 id = m_nextRequest++;
    m_requests.append(request);
    m_pending.append(id);
    if (!m_holdsSpeaking) {
        QTimer::singleShot(0, this, [this, id] {
            if (m_pending.removeOne(id)) {
                Q_EMIT speakingFinished(id, !m_speakingFails);
            }
        });
    }
    return id;
}

void FakeSpeechSynthesisService::stopSpeaking()
{
    finishHeldRequests(false);
}

void FakeSpeechSynthesisService::finishHeldRequests(bool completed)
{
    const auto pending = std::exchange(m_pending, {});
    for (const quint64 id : pending) {
        Q_EMIT speakingFinished(id, completed);
    }
}

bool FakeSpeechSynthesisService::renderToFile(
    const SpeechRequest &request, const QString &wavPath, QString *error)
{
    const QString identifier = request.voiceIdentifier.isEmpty() ? defaultVoice() : request.voiceIdentifier;
    if (!voice(identifier) || m_speakingFails) {
        if (error) {
            *error = QStringLiteral("no installed voice '%1'").arg(identifier);
        }
        return false;
    }
    m_requests.append(request);
    PcmAudio audio;
    const size_t count = size_t(request.text.size()) * size_t(audio.sampleRate) * 60 / 1000;
    audio.samples.resize(count);
    for (size_t i = 0; i < count; ++i) {
        const double t = double(i) / audio.sampleRate;
        audio.samples[i] = qint16(8000.0 * request.volume * std::sin(2.0 * std::numbers::pi * 220.0 * t));
    }
    return WaveFile::write(wavPath, audio, error);
}

} // namespace Cadenza::Platform
