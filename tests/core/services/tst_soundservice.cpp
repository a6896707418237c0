// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Sound playback never holds up the caller's event loop, whatever the media backend does.
#include "TestEnvironment.h"

#include "FakeSoundService.h"
#include "core/services/MediaSoundService.h"

#include <QFile>
#include <QSemaphore>
#include <QSignalSpy>
#include <QTest>
#include <QThread>
#include <QTimer>

using namespace Cadenza::Platform;

class SoundServiceTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void theFFmpegBackendIsChosenUnlessTheUserChoseOne()
    {
        // The application object was made before this runs: the choice was taken then.
        QCOMPARE(qgetenv("QT_MEDIA_BACKEND"), QByteArray("ffmpeg"));
        qputenv("QT_MEDIA_BACKEND", "something-else");
        MediaSoundService::chooseMediaBackend();
        QCOMPARE(qgetenv("QT_MEDIA_BACKEND"), QByteArray("something-else"));
        qputenv("QT_MEDIA_BACKEND", "ffmpeg");
    }

    void aRecordedSampleLeavesTheEventLoopFree()
    {
        QFile sample(QStringLiteral(
            CADENZA_SOURCE_DIR "/data/samples/Audio/com.vendra.speech.synthesis.voice.femke.compact.m4a"));
        QVERIFY(sample.open(QIODevice::ReadOnly));
        MediaSoundService sound;
        QSignalSpy started(&sound, &SoundService::started);
        QSignalSpy failed(&sound, &SoundService::failed);
        QSignalSpy finished(&sound, &SoundService::finished);
        int ticks = 0;
        QTimer ticker;
        connect(&ticker, &QTimer::timeout, this, [&ticks] { ++ticks; });
        ticker.start(10);
        sound.play(sample.readAll(), QStringLiteral("sample.m4a"));
        QVERIFY(sound.isActive());
        // The timer keeps firing while the sample starts, plays or fails, on whatever device is here.
        QTRY_VERIFY_WITH_TIMEOUT(ticks >= 5, 5000);
        QTRY_VERIFY_WITH_TIMEOUT(!started.isEmpty() || !failed.isEmpty(), 10000);
        qInfo("sample %s after %d ticks", failed.isEmpty() ? "started" : "failed", ticks);
        if (failed.isEmpty()) {
            const int before = ticks;
            QTRY_VERIFY_WITH_TIMEOUT(ticks > before + 5, 5000);
            sound.stop();
            QVERIFY(!sound.isActive());
        } else {
            QVERIFY(!sound.isActive());
            QVERIFY(started.isEmpty());
        }
    }

    void bytesThatAreNoSoundFail()
    {
        MediaSoundService sound;
        QSignalSpy started(&sound, &SoundService::started);
        QSignalSpy failed(&sound, &SoundService::failed);
        sound.play(QByteArray(4096, 'x'), QStringLiteral("sample.m4a"));
        QTRY_COMPARE_WITH_TIMEOUT(failed.size(), 1, 10000);
        QVERIFY(started.isEmpty());
        QVERIFY(!sound.isActive());
    }

    void aBackendThatHangsHoldsUpNothingButItsOwnThread()
    {
        // The playback thread hangs, as inside a media backend that waits forever.
        QSemaphore release;
        auto *hang = new QObject;
        hang->moveToThread(MediaSoundService::playbackThread());
        QMetaObject::invokeMethod(
            hang, [&release] { release.acquire(); }, Qt::QueuedConnection);
        MediaSoundService sound;
        sound.setStartTimeout(300);
        QSignalSpy started(&sound, &SoundService::started);
        QSignalSpy failed(&sound, &SoundService::failed);
        int ticks = 0;
        QTimer ticker;
        connect(&ticker, &QTimer::timeout, this, [&ticks] { ++ticks; });
        ticker.start(10);
        sound.play(QByteArray(4096, 'x'), QStringLiteral("sample.m4a"));
        QTRY_COMPARE(failed.size(), 1);
        QCOMPARE(failed.first().first().toString(), QStringLiteral("the sound did not start in time"));
        QVERIFY(ticks >= 5); // the event loop went on meanwhile
        QVERIFY(!sound.isActive());
        // When the backend comes back, its late answer is not passed on.
        release.release();
        hang->deleteLater();
        QTest::qWait(200);
        QCOMPARE(failed.size(), 1);
        QVERIFY(started.isEmpty());
    }

    void aStoppedSoundSaysNothingMore()
    {
        FakeSoundService sound;
        QSignalSpy started(&sound, &SoundService::started);
        sound.play("a", QStringLiteral("a.m4a"));
        sound.stop();
        QTest::qWait(20);
        QVERIFY(started.isEmpty());
        sound.play("b", QStringLiteral("b.m4a"));
        QTRY_COMPARE(started.size(), 1);
        QCOMPARE(sound.played(), (QStringList {QStringLiteral("a.m4a"), QStringLiteral("b.m4a")}));
    }
};

QTEST_MAIN(SoundServiceTest)
#include "tst_soundservice.moc"
