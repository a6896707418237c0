// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_DICTATION_MICROPHONESESSION_H
#define CADENZA_DICTATION_MICROPHONESESSION_H

#include <QObject>
#include <QString>
#include <QVector>

#include <memory>

class QThread;

namespace Cadenza {

namespace Platform {
class Microphone;
}
class Transcriber;

/**
 * One dictation from the microphone, living on a thread of its own: loading the model, opening the
 * sound server's input and decoding all happen there, so the thread that shows the results never
 * waits for any of them. Results leave through the signals (queued to the receiver's thread).
 */
class MicrophoneSession : public QObject
{
    Q_OBJECT
public:
    MicrophoneSession(const QString &language, const QString &grammarFile);
    ~MicrophoneSession() override;

    /// Loads the model and opens the microphone; listening() or failed() follows.
    Q_INVOKABLE void start();
    /// Stops recording and ends the transcript; finalResult() or failed() follows.
    Q_INVOKABLE void finish();

    /**
     * The thread every session lives on. It lasts as long as the application, because the sound
     * server connection Qt Multimedia makes on first use belongs to the thread that made it.
     */
    [[nodiscard]] static QThread *audioThread();

Q_SIGNALS:
    void listening();
    void partialResult(const QString &text);
    void finalResult(const QString &text);
    void failed(const QString &reason);

private:
    void feed(const QVector<qint16> &samples);
    void abandon(const QString &reason);

    QString m_language;
    QString m_grammarFile;
    std::unique_ptr<Transcriber> m_transcriber;
    std::unique_ptr<Platform::Microphone> m_microphone;
    QString m_shown;
};

} // namespace Cadenza

#endif
