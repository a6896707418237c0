// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICES_SPEECHSYNTHESIZER_H
#define CADENZA_VOICES_SPEECHSYNTHESIZER_H

#include "cadenzacore_export.h"

#include <QObject>
#include <QPointer>
#include <QString>
#include <QStringList>
#include <QVariant>

#include <memory>

namespace Cadenza {

namespace Platform {
struct SpeechRequest;
class SpeechSynthesisService;
} // namespace Platform

/// Keys of a voice-settings dictionary (every key optional).
CADENZACORE_EXPORT extern const QString kVoiceSettingsVoiceIdentifierKey; ///< "VoiceIdentifier"
CADENZACORE_EXPORT extern const QString kVoiceSettingsCustomRelativeRateKey; ///< "CustomRelativeRate"
CADENZACORE_EXPORT extern const QString kVoiceSettingsCustomVolumeKey; ///< "CustomVolume"

/**
 * A speaker with one voice, and the questions about voices in general: which voices exist, which one
 * is the user's default, and which installed voice a stored identifier stands for.
 *
 * An instance speaks through the platform's speech synthesis service with its own voice, rate, pitch
 * and volume, and reports the end of each utterance with didFinishSpeaking(). Channel properties are
 * addressed by four-character codes and hold 16.16 fixed-point numbers:
 *
 * | Code | Meaning | Size |
 * |---|---|---|
 * | PitchBaseProperty ("pbas") | base pitch on the engine's 0..100 scale (the voice's own, often 50) | 4 |
 * | VolumeProperty ("volm") | loudness, 1.0 is full volume | 4 |
 * | SpeechChannelProperty ("crbr") | the channel's handle, a plain integer, read only | 8 |
 */
class CADENZACORE_EXPORT SpeechSynthesizer : public QObject
{
    Q_OBJECT
public:
    static constexpr quint32 PitchBaseProperty = 0x70626173;
    static constexpr quint32 VolumeProperty = 0x766f6c6d;
    static constexpr quint32 SpeechChannelProperty = 0x63726272;

    /// A speaker with @p voiceIdentifier (null: the user's default voice); null when that voice is not
    /// installed.
    [[nodiscard]] static std::unique_ptr<SpeechSynthesizer> initWithVoice(const QString &voiceIdentifier);
    /**
     * A speaker configured by a voice-settings dictionary: its "VoiceIdentifier" (absent: the default
     * voice), "CustomRelativeRate" as a fraction of the voice's normal rate and "CustomVolume" (1.0
     * full). Null when the voice is not installed.
     */
    [[nodiscard]] static std::unique_ptr<SpeechSynthesizer> initWithVoiceSettings(
        const QVariantMap &settings);
    ~SpeechSynthesizer() override;

    /// The identifier of the voice this speaker uses.
    [[nodiscard]] QString voice() const { return m_voice; }
    /// Starts saying @p text; false when nothing could be spoken. Stops any other speech first.
    [[nodiscard]] bool startSpeakingString(const QString &text);
    /// Renders @p text into a WAV file with the current settings; blocks until done.
    [[nodiscard]] bool startSpeakingStringToFile(
        const QString &text, const QString &wavPath, QString *error = nullptr);
    void stopSpeaking();
    [[nodiscard]] bool isSpeaking() const { return m_request != 0; }

    /// Speaking rate in words per minute.
    [[nodiscard]] float rate() const { return m_rate; }
    void setRate(float wordsPerMinute) { m_rate = wordsPerMinute; }
    /// The voice's own rate in words per minute.
    [[nodiscard]] float _normalSpeakingRate() const;
    /// A channel property; null for an unknown code, a wrong size, or a requested type that is not a
    /// number.
    [[nodiscard]] QVariant _objectForProperty(quint32 property, int dataSize, QMetaType requestedType) const;
    /// Writes a channel property; false for an unknown or read-only code, a wrong size or a non-number.
    bool _setObjectForProperty(const QVariant &object, quint32 property, int dataSize);

    // Typed access to the channel properties.
    [[nodiscard]] float speechRate() const { return rate(); }
    void setSpeechRate(float wordsPerMinute) { setRate(wordsPerMinute); }
    /// The pitch base; 0 when it cannot be read.
    [[nodiscard]] float speechPitch() const;
    /// Sets the pitch base, truncated to the fixed-point grid.
    void setSpeechPitch(float pitch);
    [[nodiscard]] QVariant objectForProperty(quint32 property, int dataSize, QMetaType requestedType) const
    {
        return _objectForProperty(property, dataSize, requestedType);
    }
    void setObject(const QVariant &object, quint32 property, int dataSize)
    {
        (void)_setObjectForProperty(object, property, dataSize);
    }
    /// The handle of the underlying speech channel.
    [[nodiscard]] qint64 _speechChannel() const;

    /// Every voice of the default and compact voice groups.
    [[nodiscard]] static QStringList allVoices();
    /// The service's ordinary list of available voices.
    [[nodiscard]] static QStringList avaliableMainstreamVoices();
    /// The user's default voice among all voices: the stored voice spec, else the preferred voice of
    /// allVoices() for the speech language.
    [[nodiscard]] static QString defaultVoiceFromAllVoices();
    /// The service's ordinary default voice.
    [[nodiscard]] static QString defaultVoiceFromMainstreamVoices();
    /**
     * The voice of @p voices that @p identifier stands for: itself when present; otherwise, for
     * identifiers of 36 characters or more, the second voice beginning with it when that one ends in
     * "premium", else the first such voice. Null when none.
     */
    [[nodiscard]] static QString resolveVoiceIdentifier(
        const QString &identifier, const QStringList &usingVoices);

Q_SIGNALS:
    /// The utterance ended: @p finishedSpeaking is false when it was stopped or failed.
    void didFinishSpeaking(bool finishedSpeaking);

private:
    SpeechSynthesizer(const QString &voice, int normalRate, int normalPitch);
    [[nodiscard]] Platform::SpeechRequest speechRequest(const QString &text) const;
    void listenTo(Platform::SpeechSynthesisService &service);

    QString m_voice;
    float m_normalRate;
    float m_rate;
    qint64 m_pitchBase; // 16.16
    qint64 m_volume; // 16.16
    qint64 m_channel;
    quint64 m_request = 0;
    QPointer<Platform::SpeechSynthesisService> m_service;
};

} // namespace Cadenza

#endif
