// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_FAKESPEECHSYNTHESISSERVICE_H
#define CADENZA_TESTS_FAKESPEECHSYNTHESISSERVICE_H

#include "core/services/SpeechSynthesisService.h"

namespace Cadenza::Platform {

/**
 * A speech synthesis service whose voices, speech language and speaking a test sets.
 *
 * Speaking "renders" a tone of 60 ms per character; requests finish on the next turn of the event
 * loop unless the test holds them (setHoldsSpeaking()) or makes them fail.
 */
class FakeSpeechSynthesisService final : public SpeechSynthesisService
{
    Q_OBJECT
public:
    explicit FakeSpeechSynthesisService(QObject *parent = nullptr);

    QList<VoiceDescription> installedVoices() override { return m_voices; }
    quint64 voicesGeneration() const override { return m_generation; }
    std::optional<QString> speechLanguageLocale() override { return m_speechLanguage; }
    quint64 startSpeaking(const SpeechRequest &request) override;
    void stopSpeaking() override;
    bool isSpeaking() const override { return !m_pending.isEmpty(); }
    void setSpeakingVolume(double volume) override { m_speakingVolume = volume; }
    bool renderToFile(const SpeechRequest &request, const QString &wavPath, QString *error) override;

    /// Adds or replaces a voice; the list stays ordered by identifier.
    void addVoice(const VoiceDescription &voice);
    /// Adds a voice from its attributes (identifier, name, locale, gender, …).
    void addVoice(const QVariantMap &attributes);
    void removeVoice(const QString &identifier);
    void setSpeechLanguageLocale(const std::optional<QString> &locale) { m_speechLanguage = locale; }
    void setSpeakingFails(bool fails) { m_speakingFails = fails; }
    void setHoldsSpeaking(bool holds) { m_holdsSpeaking = holds; }
    /// Finishes every held request.
    void finishHeldRequests(bool completed);
    /// Every request made so far, oldest first.
    [[nodiscard]] QList<SpeechRequest> requests() const { return m_requests; }
    /// The last volume given to the speech in progress; negative when never given.
    [[nodiscard]] double speakingVolume() const { return m_speakingVolume; }

private:
    QList<VoiceDescription> m_voices;
    quint64 m_generation = 1;
    std::optional<QString> m_speechLanguage;
    QList<quint64> m_pending;
    QList<SpeechRequest> m_requests;
    quint64 m_nextRequest = 1;
    bool m_speakingFails = false;
    bool m_holdsSpeaking = false;
    double m_speakingVolume = -1;
};

} // namespace Cadenza::Platform

#endif
