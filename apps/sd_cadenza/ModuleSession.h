// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef SD_CADENZA_MODULESESSION_H
#define SD_CADENZA_MODULESESSION_H

#include "ModuleProtocol.h"
#include "SpeechWorker.h"

#include <QObject>

class QSocketNotifier;

namespace SdCadenza {

class AudioSender;

/// The settings speech-dispatcher sends with SET, kept for the messages that follow.
struct SpeechSettings
{
    int rate = 0;
    int pitch = 0;
    int volume = 0;
    QString language;
    QString voiceType; ///< "male1", "female1", ...
    QString synthesisVoice; ///< a voice name from LIST VOICES
    QString punctuation = QStringLiteral("none");
    bool spelling = false;
    QString capitalLetters = QStringLiteral("none");
};

/**
 * One conversation with speech-dispatcher: reads commands from @p inputFd, answers through @p sender
 * and hands messages to the speech worker. A line it does not understand gets an error answer and the
 * conversation goes on; the end of the input or QUIT ends it with finished().
 */
class ModuleSession : public QObject
{
    Q_OBJECT
public:
    ModuleSession(int inputFd, AudioSender &sender, QObject *parent = nullptr);
    ~ModuleSession() override;

    /// Handles @p bytes as if read from the input.
    void receive(const QByteArray &bytes);
    [[nodiscard]] const SpeechSettings &settings() const { return m_settings; }

    /// Applies one "name=value" line of SET; false when the line is malformed.
    [[nodiscard]] static bool applySetting(SpeechSettings &settings, const QByteArray &line);

Q_SIGNALS:
    void finished();

private:
    void readInput();
    void handle(const ModuleProtocol::Request &request);
    void speak(const ModuleProtocol::Request &request);
    void finish();

    int m_inputFd;
    AudioSender &m_sender;
    QSocketNotifier *m_notifier = nullptr;
    ModuleProtocol m_protocol;
    SpeechWorker m_worker;
    SpeechSettings m_settings;
    bool m_finished = false;
};

} // namespace SdCadenza

#endif
