// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_DICTATION_RECOGNIZER_H
#define CADENZA_DICTATION_RECOGNIZER_H

#include "cadenzacore_export.h"

#include <QObject>
#include <QString>

#include <memory>

namespace Cadenza {

class RecognizerPrivate;

/**
 * Speech to text for applications. A recognition runs on a worker thread for files (the event loop
 * never waits for decoding) and follows the microphone as it records; results arrive as signals in
 * the recognizer's thread. One recognition at a time; starting another cancels the running one.
 */
class CADENZACORE_EXPORT Recognizer : public QObject
{
    Q_OBJECT
public:
    explicit Recognizer(QObject *parent = nullptr);
    ~Recognizer() override;

    /// The installed recognizer of @p locale, or of the preferred dictation language when empty.
    void setLanguage(const QString &locale);
    /// A JSGF grammar to recognise instead of free dictation; empty for free dictation.
    void setGrammarFile(const QString &path);

    /// Transcribes the sound file @p path; finalResult() or failed() follows.
    void startFromFile(const QString &path);
    /**
     * Listens to the microphone until stop(): listening() once the model is loaded and the microphone
     * open, failed() when there is none. The model is loaded and the microphone opened and decoded on
     * a thread of the library's, so this returns at once.
     */
    void startFromMicrophone();
    /// Ends listening to the microphone; finalResult() follows.
    void stop();
    /// Abandons the running recognition: neither finalResult() nor failed() follows.
    void cancel();
    [[nodiscard]] bool isRunning() const;

Q_SIGNALS:
    /// The microphone is open: what is said from now on is recognised.
    void listening();
    void partialResult(const QString &text);
    void finalResult(const QString &text);
    void failed(const QString &reason);

private:
    friend class RecognizerPrivate;
    std::unique_ptr<RecognizerPrivate> const d;
};

} // namespace Cadenza

#endif
