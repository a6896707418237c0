#ifndef CADENZA_VOICES_SPEECHSYNTHESIZER_H
#define CADENZA_VOICES_SPEECHSYNTHESIZER_H

#include "cadenzacore_export.h"

#include <QString>
#include <QStringList>

namespace Cadenza {

/**
 * Which voices exist, which one is the user's default, and which installed voice a stored
 * identifier stands for. Answers come from the platform's speech synthesis service.
 */
class CADENZACORE_EXPORT SpeechSynthesizer
{
public:
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
};

} // namespace Cadenza

#endif
