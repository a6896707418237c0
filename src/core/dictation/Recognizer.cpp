// SPDX-License-Identifier: LGPL-2.1-or-later
#include "Recognizer.h"

#include "MicrophoneSession.h"
#include "Transcriber.h"
#include "core/formats/AudioFileReader.h"

#include <QCoreApplication>
#include <QPointer>
#include <QThread>

namespace Cadenza {

Recognizer::Recognizer(QObject *parent)
    : QObject(parent)
{ }

Recognizer::~Recognizer()
{
    cancel();
}

void Recognizer::startFromFile(const QString &path)
{
    cancel();
    m_running = true;
    const quint64 generation = ++m_generation;
    auto cancelled = std::make_shared<std::atomic<bool>>(false);
    m_cancelled = cancelled;
    const QString language = m_language;
    const QString grammar = m_grammarFile;
    QPointer<Recognizer> self(this);
    // Results travel back through the event loop; a cancelled or newer run drops them.
    const auto post = [self, generation, cancelled](auto deliver) {
        if (*cancelled) {
            return;
        }
        // The application object is the context: the recognizer may be gone by the time this runs.
        QMetaObject::invokeMethod(
            QCoreApplication::instance(),
            [self, generation, cancelled, deliver] {
                if (self && !*cancelled && self->m_generation == generation) {
                    deliver(self.data());
                }
            },
            Qt::QueuedConnection);
    };
    QThread *worker = QThread::create([post, cancelled, path, language, grammar] {
        QString error;
        const auto fail = [&](const QString &reason) {
            post([reason](Recognizer *r) {
                r->m_running = false;
                Q_EMIT r->failed(reason);
            });
        };
        const auto transcriber = Transcriber::loadForLanguage(language, &error);
        if (!transcriber) {
            return fail(error);
        }
        Platform::AudioFileReader reader(transcriber->sampleRate());
        if (!reader.open(path, &error) || !transcriber->begin(grammar, &error)) {
            return fail(error);
        }
        QString shown;
        while (!*cancelled) {
            const auto block = reader.read(4096, &error);
            if (!block) {
                return fail(error);
            }
            if (block->empty()) {
                break;
            }
            if (!transcriber->feed(block->data(), qsizetype(block->size()), &error)) {
                return fail(error);
            }
            const QString partial = transcriber->partialResult();
            if (partial != shown) {
                shown = partial;
                post([partial](Recognizer *r) { Q_EMIT r->partialResult(partial); });
            }
        }
        if (*cancelled) {
            return;
        }
        const auto text = transcriber->finish(&error);
        if (!text) {
            return fail(error);
        }
        post([text = *text](Recognizer *r) {
            r->m_running = false;
            Q_EMIT r->finalResult(text);
        });
    });
    connect(worker, &QThread::finished, worker, &QObject::deleteLater);
    worker->start();
}

void Recognizer::startFromMicrophone()
{
    cancel();
    ++m_generation;
    m_running = true;
    m_session = new MicrophoneSession(m_language, m_grammarFile);
    m_session->moveToThread(MicrophoneSession::audioThread());
    // Queued: the session's signals come from the audio thread; once it is ended or cancelled it
    // is disconnected, so nothing it still sends arrives.
    connect(m_session, &MicrophoneSession::listening, this, &Recognizer::listening);
    connect(m_session, &MicrophoneSession::partialResult, this, &Recognizer::partialResult);
    connect(m_session, &MicrophoneSession::finalResult, this, [this](const QString &text) {
        endMicrophone();
        Q_EMIT finalResult(text);
    });
    connect(m_session, &MicrophoneSession::failed, this, [this](const QString &reason) {
        endMicrophone();
        Q_EMIT failed(reason);
    });
    QMetaObject::invokeMethod(m_session, &MicrophoneSession::start, Qt::QueuedConnection);
}

void Recognizer::stop()
{
    if (m_session) {
        QMetaObject::invokeMethod(m_session, &MicrophoneSession::finish, Qt::QueuedConnection);
    }
}

void Recognizer::endMicrophone()
{
    if (m_session) {
        disconnect(m_session, nullptr, this, nullptr);
        m_session->deleteLater(); // on its own thread
        m_session = nullptr;
    }
    m_running = false;
}

void Recognizer::cancel()
{
    if (m_cancelled) {
        *m_cancelled = true;
        m_cancelled.reset();
    }
    endMicrophone();
}

} // namespace Cadenza
