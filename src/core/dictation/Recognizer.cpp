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

#include <atomic>

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

class RecognizerPrivate
{
public:
    explicit RecognizerPrivate(Recognizer *q)
        : q(q)
    { }

    void finishMicrophone();

    Recognizer *const q;
    QString m_language;
    QString m_grammarFile;
    bool m_running = false;
    std::shared_ptr<std::atomic<bool>> m_cancelled;
    std::unique_ptr<Platform::Microphone> m_microphone;
    std::unique_ptr<Transcriber> m_transcriber;
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
    QString error;
    d->m_transcriber = loadTranscriber(d->m_language, &error);
    if (!d->m_transcriber || !d->m_transcriber->begin(d->m_grammarFile, &error)) {
        d->m_transcriber.reset();
        Q_EMIT failed(error);
        return;
    }
    d->m_microphone = std::make_unique<Platform::Microphone>();
    if (!d->m_microphone->start(d->m_transcriber->sampleRate(), &error)) {
        d->m_microphone.reset();
        d->m_transcriber.reset();
        Q_EMIT failed(error);
        return;
    }
    d->m_running = true;
    connect(d->m_microphone.get(), &Platform::Microphone::samplesAvailable, this,
        [this](const QVector<qint16> &samples) {
            QString error;
            if (!d->m_transcriber || !d->m_transcriber->feed(samples.constData(), samples.size(), &error)) {
                cancel();
                Q_EMIT failed(error);
                return;
            }
            Q_EMIT partialResult(d->m_transcriber->partialResult());
        });
}

void Recognizer::stop()
{
    if (d->m_microphone) {
        d->finishMicrophone();
    }
}

void Recognizer::cancel()
{
    if (d->m_cancelled) {
        *d->m_cancelled = true;
        d->m_cancelled.reset();
    }
    d->m_microphone.reset();
    d->m_transcriber.reset();
    d->m_running = false;
}

void RecognizerPrivate::finishMicrophone()
{
    m_microphone.reset();
    QString error;
    const auto text = m_transcriber ? m_transcriber->finish(&error) : std::nullopt;
    m_transcriber.reset();
    m_running = false;
    if (text) {
        Q_EMIT q->finalResult(*text);
    } else {
        Q_EMIT q->failed(error);
    }
}

} // namespace Cadenza
