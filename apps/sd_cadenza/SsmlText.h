// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef SD_CADENZA_SSMLTEXT_H
#define SD_CADENZA_SSMLTEXT_H

#include <QList>
#include <QString>

namespace SdCadenza {

/**
 * A message reduced to what the engines can say: runs of plain text, pauses and index marks, in order.
 *
 * speech-dispatcher wraps every message in <speak>; text that is no well-formed XML is taken as plain
 * text with its tags dropped. Breaks ("time" in s or ms, or a "strength") become pauses, <mark/>
 * becomes an index mark, <say-as interpret-as="characters"> is spelled, everything else is read as
 * its text. Control characters other than line ends and tabs are dropped, and so is broken UTF-8.
 */
class SsmlText
{
public:
    struct Segment
    {
        enum class Kind { Text, Pause, Mark };
        Kind kind = Kind::Text;
        QString text; ///< the words (Text) or the mark's name (Mark)
        int pauseMs = 0; ///< Pause only
    };

    [[nodiscard]] static QList<Segment> parse(const QString &message);
    /// @p bytes decoded as UTF-8, with invalid sequences and control characters removed.
    [[nodiscard]] static QString decode(const QByteArray &bytes);
    /// @p text with each character spoken on its own (letters separated by spaces).
    [[nodiscard]] static QString spelled(const QString &text);
    /// The pause of a <break/>: its time attribute, else its strength; -1 for a value not understood.
    [[nodiscard]] static int breakMilliseconds(const QString &time, const QString &strength);

private:
    static QList<Segment> parsePlain(const QString &message);
};

} // namespace SdCadenza

#endif
