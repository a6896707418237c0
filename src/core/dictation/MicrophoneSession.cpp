// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "MicrophoneSession.h"

#include "Transcriber.h"
#include "core/services/Microphone.h"

#include <QCoreApplication>
#include <QThread>

namespace Cadenza {

MicrophoneSession::MicrophoneSession(const QString &language, const QString &grammarFile)
    : m_language(language)
    , m_grammarFile(grammarFile)
{ }

MicrophoneSession::~MicrophoneSession() = default;

namespace {
QThread *sharedAudioThread = nullptr;

void stopAudioThread()
{
    if (sharedAudioThread) {
        sharedAudioThread->quit();
        // A sound server that stopped answering must not hold up the application's exit: the thread
        // is then left to the end of the process.
        if (sharedAudioThread->wait(3000)) {
            delete sharedAudioThread;
        }
        sharedAudioThread = nullptr;
    }
}
} // namespace

QThread *MicrophoneSession::audioThread()
{
    if (!sharedAudioThread) {
        sharedAudioThread = new QThread;
        sharedAudioThread->setObjectName(QStringLiteral("cadenza-microphone"));
        sharedAudioThread->start();
        qAddPostRoutine(&stopAudioThread);
    }
    return sharedAudioThread;
}

void MicrophoneSession::start()
{
    QString error;
    m_transcriber = Transcriber::loadForLanguage(m_language, &error);
    if (!m_transcriber || !m_transcriber->begin(m_grammarFile, &error)) {
        return abandon(error);
    }
    m_microphone = std::make_unique<Platform::Microphone>();
    connect(m_microphone.get(), &Platform::Microphone::samplesAvailable, this, &MicrophoneSession::feed);
    if (!m_microphone->start(m_transcriber->sampleRate(), &error)) {
        return abandon(error);
    }
    Q_EMIT listening();
}

void MicrophoneSession::feed(const QVector<qint16> &samples)
{
    if (!m_transcriber) {
        return;
    }
    QString error;
    if (!m_transcriber->feed(samples.constData(), samples.size(), &error)) {
        return abandon(error);
    }
    const QString partial = m_transcriber->partialResult();
    if (partial != m_shown) {
        m_shown = partial;
        Q_EMIT partialResult(partial);
    }
}

void MicrophoneSession::finish()
{
    if (!m_transcriber) {
        return;
    }
    if (m_microphone) {
        // What the sound server still holds for us belongs to the recording.
        m_microphone->finish();
    }
    m_microphone.reset();
    QString error;
    const auto text = m_transcriber->finish(&error);
    m_transcriber.reset();
    if (text) {
        Q_EMIT finalResult(*text);
    } else {
        Q_EMIT failed(error);
    }
}

void MicrophoneSession::abandon(const QString &reason)
{
    m_microphone.reset();
    m_transcriber.reset();
    Q_EMIT failed(reason);
}

} // namespace Cadenza
