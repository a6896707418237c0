// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_MICROPHONE_H
#define CADENZA_PLATFORM_MICROPHONE_H

#include "cadenzacore_export.h"

#include <QObject>
#include <QVector>

class QAudioSource;
class QIODevice;

namespace Cadenza::Platform {

/// The default audio input, delivering 16-bit mono samples at one rate as they arrive.
class CADENZACORE_EXPORT Microphone : public QObject
{
    Q_OBJECT
public:
    explicit Microphone(QObject *parent = nullptr);
    ~Microphone() override;

    /**
     * Starts recording at @p sampleRate; false with a readable @p error when there is no
     * microphone or it cannot record 16-bit mono at that rate.
     */
    [[nodiscard]] bool start(int sampleRate, QString *error);
    /// Hands on what was recorded but not yet delivered, then stops recording.
    void finish();
    /// Stops recording and drops what was not yet delivered.
    void stop();

Q_SIGNALS:
    void samplesAvailable(const QVector<qint16> &samples);

private:
    void deliver();

    QAudioSource *m_source = nullptr;
    QIODevice *m_device = nullptr;
    QByteArray m_pending;
};

} // namespace Cadenza::Platform

#endif
