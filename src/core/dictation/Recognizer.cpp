// SPDX-License-Identifier: LGPL-2.1-or-later
#include "Recognizer.h"

#include "Transcriber.h"
#include "core/formats/AudioFileReader.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/services/Microphone.h"
#include "core/services/RecognitionService.h"
#include "core/services/Services.h"

#include <QCoreApplication>
#include <QPointer>
#include <QThread>

namespace Cadenza {

namespace {

/// The model for @p language, or for the preferred dictation language among the installed ones.
std::unique_ptr<Transcriber> loadTranscriber(const QString &language, QString *error)
{
    Platform::RecognitionService &recognition = Platform::Services::recognition();
    QString locale = language;
    if (locale.isEmpty()) {
        const QStringList installed = recognition.installedLanguages().value_or(QStringList());
        if (installed.isEmpty()) {
            *error = QStringLiteral("no recognition language is installed");
            return nullptr;
        }
        locale = CZSRLanguageItem::preferredDictationLocaleIdentifierFromAvaiableLocaleIdentifiers(
            installed, QString());
    }
    const auto model = recognition.modelForLocale(locale, error);
    return model ? Transcriber::load(*model, error) : nullptr;
}

} // namespace

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
        const auto transcriber = loadTranscriber(language, &error);
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
    QString error;
    m_transcriber = loadTranscriber(m_language, &error);
    if (!m_transcriber || !m_transcriber->begin(m_grammarFile, &error)) {
        m_transcriber.reset();
        Q_EMIT failed(error);
        return;
    }
    m_microphone = std::make_unique<Platform::Microphone>();
    if (!m_microphone->start(m_transcriber->sampleRate(), &error)) {
        m_microphone.reset();
        m_transcriber.reset();
        Q_EMIT failed(error);
        return;
    }
    m_running = true;
    connect(m_microphone.get(), &Platform::Microphone::samplesAvailable, this,
        [this](const QVector<qint16> &samples) {
            QString error;
            if (!m_transcriber || !m_transcriber->feed(samples.constData(), samples.size(), &error)) {
                cancel();
                Q_EMIT failed(error);
                return;
            }
            Q_EMIT partialResult(m_transcriber->partialResult());
        });
}

void Recognizer::stop()
{
    if (m_microphone) {
        finishMicrophone();
    }
}

void Recognizer::finishMicrophone()
{
    m_microphone.reset();
    QString error;
    const auto text = m_transcriber ? m_transcriber->finish(&error) : std::nullopt;
    m_transcriber.reset();
    m_running = false;
    if (text) {
        Q_EMIT finalResult(*text);
    } else {
        Q_EMIT failed(error);
    }
}

void Recognizer::cancel()
{
    if (m_cancelled) {
        *m_cancelled = true;
        m_cancelled.reset();
    }
    m_microphone.reset();
    m_transcriber.reset();
    m_running = false;
}

} // namespace Cadenza
