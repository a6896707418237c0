// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_MEDIASOUNDSERVICE_H
#define CADENZA_PLATFORM_MEDIASOUNDSERVICE_H

#include "SoundService.h"

#include <QPointer>
#include <QTimer>

class QThread;

namespace Cadenza::Platform {

class MediaSoundPlayer;

/**
 * Sounds through Qt Multimedia, with its FFmpeg backend (see chooseMediaBackend()).
 *
 * The player lives on a thread of its own: a media backend that blocks (a missing plugin, an audio
 * server that does not answer) then holds up only that thread, never the caller's event loop. A sound
 * that has not started after a few seconds counts as failed.
 */
class CADENZACORE_EXPORT MediaSoundService final : public SoundService
{
    Q_OBJECT
public:
    explicit MediaSoundService(QObject *parent = nullptr);
    ~MediaSoundService() override;

    void play(const QByteArray &data, const QString &fileName) override;
    void stop() override;
    [[nodiscard]] bool isActive() const override { return m_active; }

    /// How long a sound may take to start before it counts as failed.
    void setStartTimeout(int milliseconds) { m_startTimeout.setInterval(milliseconds); }

    /**
     * Makes Qt Multimedia use its FFmpeg backend unless the user chose one (QT_MEDIA_BACKEND). Qt 6.4
     * otherwise picks GStreamer, whose plugins Debian does not install by default and whose audio output
     * then waits forever. Runs when the application object is made, before any multimedia object.
     */
    static void chooseMediaBackend();
    /// The thread every sound plays on, made on first use and kept until the process ends.
    [[nodiscard]] static QThread *playbackThread();

private:
    void report(quint64 generation, int event, const QString &reason);

    QPointer<MediaSoundPlayer> m_player;
    QTimer m_startTimeout;
    quint64 m_generation = 0;
    bool m_active = false;
    bool m_started = false;
};

} // namespace Cadenza::Platform

#endif
