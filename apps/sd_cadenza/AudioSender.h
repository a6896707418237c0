// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef SD_CADENZA_AUDIOSENDER_H
#define SD_CADENZA_AUDIOSENDER_H

#include <QByteArray>
#include <QMutex>
#include <QString>

namespace SdCadenza {

/**
 * Everything the module writes to speech-dispatcher: answers, events and audio, each written whole so
 * that the worker's events never cut into an answer.
 *
 * Audio goes to the server (server-side audio) as "705" events of 16-bit mono samples, escaped so
 * that the data holds no line feed: LF and 0x7D become 0x7D followed by the byte with bit 5 flipped.
 */
class AudioSender
{
public:
    /// Writes to file descriptor @p fd (standard output in the module).
    explicit AudioSender(int fd);

    /// Writes @p text (one or more lines, each ended by LF); false when the server is gone.
    bool send(const QByteArray &text);
    /// Sends @p count samples at @p sampleRate as one audio event.
    bool sendAudio(const qint16 *samples, qsizetype count, int sampleRate);

    /// The audio event for @p count samples.
    [[nodiscard]] static QByteArray audioEvent(const qint16 *samples, qsizetype count, int sampleRate);
    /// The escaped form of @p data.
    [[nodiscard]] static QByteArray escape(const QByteArray &data);
    /// Undoes escape(); for the tests and the benchmark, which read audio events back.
    [[nodiscard]] static QByteArray unescape(const QByteArray &data);

private:
    bool writeAll(const QByteArray &bytes);

    int m_fd;
    QMutex m_mutex;
    bool m_broken = false;
};

} // namespace SdCadenza

#endif
