// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_SOUNDSERVICE_H
#define CADENZA_PLATFORM_SOUNDSERVICE_H

#include "cadenzacore_export.h"

#include <QByteArray>
#include <QObject>
#include <QString>

namespace Cadenza::Platform {

/**
 * Plays recorded sounds (the voice samples) without ever holding up the caller: play() hands the
 * sound over and returns at once; started(), finished() or failed() tell the rest later, on the
 * caller's thread. One sound at a time: playing another, or stop(), ends the one before, and a sound
 * that was stopped reports nothing more.
 */
class CADENZACORE_EXPORT SoundService : public QObject
{
    Q_OBJECT
public:
    ~SoundService() override;

    /// Starts playing @p data, the bytes of a sound file; @p fileName tells its type ("x.m4a").
    virtual void play(const QByteArray &data, const QString &fileName) = 0;
    /// Ends the current sound, if any.
    virtual void stop() = 0;
    /// A sound is starting or playing.
    [[nodiscard]] virtual bool isActive() const = 0;

Q_SIGNALS:
    /// The sound is audible now.
    void started();
    /// The sound played to its end.
    void finished();
    /// The sound cannot be played (no decoder, no audio device, no answer in time).
    void failed(const QString &reason);

protected:
    explicit SoundService(QObject *parent = nullptr);
};

} // namespace Cadenza::Platform

#endif
