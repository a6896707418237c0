// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "MediaSoundService.h"

#include "cadenzacore_logging.h"

#include <QAudioDevice>
#include <QAudioOutput>
#include <QBuffer>
#include <QCoreApplication>
#include <QMediaDevices>
#include <QMediaPlayer>
#include <QThread>
#include <QUrl>

namespace Cadenza::Platform {

namespace {

constexpr int DefaultStartTimeoutMilliseconds = 5000;

enum Event { Started, Finished, Failed };

} // namespace

// Made once and never destroyed: if a backend call hangs in it, the process can still end.
QThread *MediaSoundService::playbackThread()
{
    static QThread *thread = [] {
        auto *t = new QThread;
        t->setObjectName(QStringLiteral("cadenza-sound"));
        t->start();
        if (QCoreApplication *app = QCoreApplication::instance()) {
            QObject::connect(
                app, &QCoreApplication::aboutToQuit, t,
                [t] {
                    t->quit();
                    (void)t->wait(1000); // bounded: a hung backend does not hold up the exit
                },
                Qt::DirectConnection);
        }
        return t;
    }();
    return thread;
}

/// One sound on the playback thread: its bytes, its player and its audio output.
class MediaSoundPlayer : public QObject
{
    Q_OBJECT
public:
    using Reporter = std::function<void(int event, const QString &reason)>;

    explicit MediaSoundPlayer(Reporter reporter)
        : m_reporter(std::move(reporter))
    { }

    void start(const QByteArray &data, const QString &fileName)
    {
        // Qt 6.4's FFmpeg player crashes in its audio thread when there is no output device at all.
        if (QMediaDevices::defaultAudioOutput().isNull()) {
            m_reporter(Failed, QStringLiteral("there is no audio output device"));
            return;
        }
        m_data = new QBuffer(this);
        m_data->setData(data);
        m_data->open(QIODevice::ReadOnly);
        m_output = new QAudioOutput(this);
        m_player = new QMediaPlayer(this);
        m_player->setAudioOutput(m_output);
        connect(
            m_player, &QMediaPlayer::playbackStateChanged, this, [this](QMediaPlayer::PlaybackState state) {
                if (state == QMediaPlayer::PlayingState && !m_startReported) {
                    m_startReported = true;
                    m_reporter(Started, {});
                }
            });
        connect(m_player, &QMediaPlayer::mediaStatusChanged, this, [this](QMediaPlayer::MediaStatus status) {
            if (status == QMediaPlayer::EndOfMedia) {
                m_reporter(Finished, {});
            } else if (status == QMediaPlayer::InvalidMedia) {
                m_reporter(Failed, QStringLiteral("the sound cannot be decoded"));
            }
        });
        connect(m_player, &QMediaPlayer::errorOccurred, this,
            [this](QMediaPlayer::Error, const QString &text) { m_reporter(Failed, text); });
        m_player->setSourceDevice(m_data, QUrl(fileName));
        m_player->play();
    }

private:
    Reporter m_reporter;
    QBuffer *m_data = nullptr;
    QAudioOutput *m_output = nullptr;
    QMediaPlayer *m_player = nullptr;
    bool m_startReported = false;
};

MediaSoundService::MediaSoundService(QObject *parent)
    : SoundService(parent)
{
    chooseMediaBackend();
    m_startTimeout.setSingleShot(true);
    m_startTimeout.setInterval(DefaultStartTimeoutMilliseconds);
    connect(&m_startTimeout, &QTimer::timeout, this,
        [this] { report(m_generation, Failed, QStringLiteral("the sound did not start in time")); });
}

MediaSoundService::~MediaSoundService()
{
    stop();
}

void MediaSoundService::chooseMediaBackend()
{
    if (qEnvironmentVariableIsEmpty("QT_MEDIA_BACKEND")) {
        qputenv("QT_MEDIA_BACKEND", "ffmpeg");
    }
}

void MediaSoundService::play(const QByteArray &data, const QString &fileName)
{
    stop();
    const quint64 generation = ++m_generation;
    m_active = true;
    m_started = false;
    m_startTimeout.start();
    QPointer<MediaSoundService> self(this);
    auto *player = new MediaSoundPlayer([self, generation](int event, const QString &reason) {
        // Called on the playback thread: the answer travels to the service's thread.
        QMetaObject::invokeMethod(
            self.data(),
            [self, generation, event, reason] {
                if (self) {
                    self->report(generation, event, reason);
                }
            },
            Qt::QueuedConnection);
    });
    player->moveToThread(playbackThread());
    m_player = player;
    QMetaObject::invokeMethod(
        player, [player, data, fileName] { player->start(data, fileName); }, Qt::QueuedConnection);
}

void MediaSoundService::stop()
{
    ++m_generation;
    m_active = false;
    m_started = false;
    m_startTimeout.stop();
    if (m_player) {
        // Stopped and freed on its own thread, where it lives.
        m_player->deleteLater();
        m_player = nullptr;
    }
}

void MediaSoundService::report(quint64 generation, int event, const QString &reason)
{
    if (generation != m_generation || !m_active) {
        return; // a sound that was stopped or replaced says nothing more
    }
    switch (event) {
    case Started:
        m_startTimeout.stop();
        if (!m_started) {
            m_started = true;
            Q_EMIT started();
        }
        break;
    case Finished:
        stop();
        Q_EMIT finished();
        break;
    default:
        qCWarning(lcSpeech, "A sound could not be played: %s", qPrintable(reason));
        stop();
        Q_EMIT failed(reason);
        break;
    }
}

} // namespace Cadenza::Platform

// Before the application makes its first multimedia object, whatever that is.
static void cadenzaChooseMediaBackendAtStartUp()
{
    Cadenza::Platform::MediaSoundService::chooseMediaBackend();
}
Q_COREAPP_STARTUP_FUNCTION(cadenzaChooseMediaBackendAtStartUp)

#include "MediaSoundService.moc"
