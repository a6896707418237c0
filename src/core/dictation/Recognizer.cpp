// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "Recognizer.h"

#include "MicrophoneSession.h"
#include "Transcriber.h"
#include "core/formats/AudioFileReader.h"

#include <QCoreApplication>
#include <QPointer>
#include <QThread>

#include <atomic>

namespace Cadenza {

class RecognizerPrivate
{
public:
    explicit RecognizerPrivate(Recognizer *q)
        : q(q)
    { }

    /// Disconnects and lets go of the microphone session, if there is one.
    void endMicrophone();

    Recognizer *const q;
    QString m_language;
    QString m_grammarFile;
    bool m_running = false;
    std::shared_ptr<std::atomic<bool>> m_cancelled;
    MicrophoneSession *m_session = nullptr; ///< lives on MicrophoneSession::audioThread()
    quint64 m_generation = 0;
};

Recognizer::Recognizer(QObject *parent)
    : QObject(parent)
    , d(std::make_unique<RecognizerPrivate>(this))
{ }

void Recognizer::setLanguage(const QString &locale)
{
    d->m_language = locale;
}

void Recognizer::setGrammarFile(const QString &path)
{
    d->m_grammarFile = path;
}

bool Recognizer::isRunning() const
{
    return d->m_running;
}

Recognizer::~Recognizer()
{
    cancel();
}

void Recognizer::startFromFile(const QString &path)
{
    cancel();
    d->m_running = true;
    const quint64 generation = ++d->m_generation;
    auto cancelled = std::make_shared<std::atomic<bool>>(false);
    d->m_cancelled = cancelled;
    const QString language = d->m_language;
    const QString grammar = d->m_grammarFile;
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
                if (self && !*cancelled && self->d->m_generation == generation) {
                    deliver(self.data());
                }
            },
            Qt::QueuedConnection);
    };
    QThread *worker = QThread::create([post, cancelled, path, language, grammar] {
        QString error;
        const auto fail = [&](const QString &reason) {
            post([reason](Recognizer *r) {
                r->d->m_running = false;
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
            r->d->m_running = false;
            Q_EMIT r->finalResult(text);
        });
    });
    connect(worker, &QThread::finished, worker, &QObject::deleteLater);
    worker->start();
}

void Recognizer::startFromMicrophone()
{
    cancel();
    ++d->m_generation;
    d->m_running = true;
    d->m_session = new MicrophoneSession(d->m_language, d->m_grammarFile);
    d->m_session->moveToThread(MicrophoneSession::audioThread());
    // Queued: the session's signals come from the audio thread; once it is ended or cancelled it
    // is disconnected, so nothing it still sends arrives.
    connect(d->m_session, &MicrophoneSession::listening, this, &Recognizer::listening);
    connect(d->m_session, &MicrophoneSession::partialResult, this, &Recognizer::partialResult);
    connect(d->m_session, &MicrophoneSession::finalResult, this, [this](const QString &text) {
        d->endMicrophone();
        Q_EMIT finalResult(text);
    });
    connect(d->m_session, &MicrophoneSession::failed, this, [this](const QString &reason) {
        d->endMicrophone();
        Q_EMIT failed(reason);
    });
    QMetaObject::invokeMethod(d->m_session, &MicrophoneSession::start, Qt::QueuedConnection);
}

void Recognizer::stop()
{
    if (d->m_session) {
        QMetaObject::invokeMethod(d->m_session, &MicrophoneSession::finish, Qt::QueuedConnection);
    }
}

void RecognizerPrivate::endMicrophone()
{
    if (m_session) {
        QObject::disconnect(m_session, nullptr, q, nullptr);
        m_session->deleteLater(); // on its own thread
        m_session = nullptr;
    }
    m_running = false;
}

void Recognizer::cancel()
{
    if (d->m_cancelled) {
        *d->m_cancelled = true;
        d->m_cancelled.reset();
    }
    d->endMicrophone();
}

} // namespace Cadenza
