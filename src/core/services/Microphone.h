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
    void stop();

Q_SIGNALS:
    void samplesAvailable(const QVector<qint16> &samples);

private:
    QAudioSource *m_source = nullptr;
    QIODevice *m_device = nullptr;
    QByteArray m_pending;
};

} // namespace Cadenza::Platform

#endif
