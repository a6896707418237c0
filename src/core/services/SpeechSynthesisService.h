// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_SPEECHSYNTHESISSERVICE_H
#define CADENZA_PLATFORM_SPEECHSYNTHESISSERVICE_H

#include "cadenzacore_export.h"

#include "core/formats/VoiceDescription.h"

#include <QMutex>
#include <QObject>
#include <QStringList>

#include <functional>
#include <memory>
#include <optional>

namespace Cadenza::Platform {

/// What to say and how.
struct CADENZACORE_EXPORT SpeechRequest
{
    QString text;
    QString voiceIdentifier; ///< empty: the ordinary default voice
    double wordsPerMinute = 0; ///< 0: the voice's normal rate
    double pitch = 0; ///< pitch on the 0..100 pitch scale (see SynthesisParameters); 0: the voice's own
    double volume = 1.0; ///< 0..1
};

/**
 * The speech synthesis service: the installed voices, their groups and attributes, the user's
 * default voice and speech language, and speaking.
 *
 * Subclasses say which voices are installed and how to speak; the choice of voices built on them
 * (the ordinary list, the default, the preferred voice of a locale) is the same for all.
 */
class CADENZACORE_EXPORT SpeechSynthesisService : public QObject
{
    Q_OBJECT
public:
    static inline const QString &DefaultVoiceGroup = VoiceGroup::Default;
    static inline const QString &CompactVoiceGroup = VoiceGroup::Compact;
    /// Preference key (in SpeechNames::VoicePreferencesDomain) of the speech language.
    static const QString SpeechLanguageKey;

    explicit SpeechSynthesisService(QObject *parent = nullptr);
    ~SpeechSynthesisService() override;

    /// Every installed voice, each identifier once, ordered by identifier.
    [[nodiscard]] virtual QList<VoiceDescription> installedVoices() = 0;
    /// Changes whenever installedVoices() answers differently; lets the choices below be kept.
    [[nodiscard]] virtual quint64 voicesGeneration() const = 0;
    /// The locale speech should use, when the user chose one.
    [[nodiscard]] virtual std::optional<QString> speechLanguageLocale() = 0;

    /// Starts speaking; returns the request's number, or 0 when nothing could be spoken.
    /// speakingFinished() follows for every request that got a number.
    [[nodiscard]] virtual quint64 startSpeaking(const SpeechRequest &request) = 0;
    /// Stops every request; each ends with speakingFinished(id, false).
    virtual void stopSpeaking() = 0;
    [[nodiscard]] virtual bool isSpeaking() const = 0;
    /// Changes the loudness (0..1) of the speech now playing, without restarting it.
    virtual void setSpeakingVolume(double volume) = 0;
    /// Renders @p request into a 16-bit mono WAV file; blocks until done.
    [[nodiscard]] virtual bool renderToFile(
        const SpeechRequest &request, const QString &wavPath, QString *error)
        = 0;

    /// The identifiers of the voices in any of @p groups, in installedVoices() order.
    [[nodiscard]] QStringList voiceIdentifiersInGroups(const QStringList &groups);
    /// The ordinary list: each voice once, in its best installed quality (premium, plain, compact).
    [[nodiscard]] QStringList availableVoices();
    /// The ordinary default voice: the user's selected voice in its best quality, else the preferred
    /// voice of the ordinary list for the speech language.
    [[nodiscard]] QString defaultVoice();
    /// The attributes of an installed voice; empty when the voice is not installed.
    [[nodiscard]] QVariantMap attributesForVoice(const QString &identifier);
    [[nodiscard]] std::optional<VoiceDescription> voice(const QString &identifier);
    /// The voice whose (creator, id) spec this is; empty when none.
    [[nodiscard]] QString voiceIdentifierForSpec(qint32 creator, qint32 id);
    /**
     * The voice of @p identifiers that best suits @p localeIdentifier (the user's first language when
     * empty): same language and country first, then same language, higher desirability and better
     * quality breaking ties; without a voice of the language, the fallback voice or the first one.
     */
    [[nodiscard]] QString preferredVoiceForLocale(
        const QStringList &identifiers, const QString &localeIdentifier);
    /**
     * What @p compute answers for @p key, computed once for the installed voices as they are: a
     * change of the voices (a new voicesGeneration()) forgets every answer. @p key must name every
     * other input of the answer, such as the preferences it read.
     */
    [[nodiscard]] QString rememberedForVoices(const QString &key, const std::function<QString()> &compute);

Q_SIGNALS:
    void speakingFinished(quint64 requestId, bool completed);

private:
    struct Catalog;
    /// The installed voices with what is derived from them, made again only when they change.
    std::shared_ptr<const Catalog> catalog();

    QMutex m_catalogMutex;
    std::shared_ptr<const Catalog> m_catalog;
};

} // namespace Cadenza::Platform

#endif
