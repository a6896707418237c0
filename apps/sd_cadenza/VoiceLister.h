// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef SD_CADENZA_VOICELISTER_H
#define SD_CADENZA_VOICELISTER_H

#include <QList>
#include <QString>

namespace SdCadenza {

/**
 * The Cadenza voices as speech-dispatcher sees them, and the choice of a voice for a message.
 *
 * Every question reads the voice folders again (the speech synthesis service rescans only folders
 * whose modification time changed), so a voice installed while speech-dispatcher runs is offered at
 * the next listing and a removed one is no longer chosen.
 */
class VoiceLister
{
public:
    struct Voice
    {
        QString name; ///< the display name, unique in the list
        QString language; ///< BCP 47, such as "en-US"
        QString variant; ///< "male1", "female1", "child1" or "none", after the voice's gender
        QString identifier;
    };

    /// Every installed voice, ordered by name.
    [[nodiscard]] static QList<Voice> voices();
    /// The LIST VOICES answer.
    [[nodiscard]] static QByteArray listing();

    /**
     * The voice for a message: @p synthesisVoice when it names an installed voice (by display name or
     * identifier); otherwise the default of @p language, which is the user's selected voice when that
     * speaks the language, else the best voice of the language, preferring the gender of @p voiceType
     * ("male1", "female2", ...). Without a language: the user's default voice. Empty when no voice is
     * installed.
     */
    [[nodiscard]] static QString choose(
        const QString &synthesisVoice, const QString &language, const QString &voiceType);

    /// "en_US" → "en-US".
    [[nodiscard]] static QString bcp47(const QString &localeIdentifier);
    /// Protocol fields must not hold tabs or line ends.
    [[nodiscard]] static QString field(const QString &text);
};

} // namespace SdCadenza

#endif
