// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// quillond killed with SIGKILL at each stage of an installation, then started again: the bundle is
// wholly there or absent, nothing temporary is left, and the client carries on.
#include "QuillondProcess.h"
#include "TestEnvironment.h"
#include "TestHttpServer.h"

#include "core/files/Paths.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/installation/CZSpeechInstallationManager_p.h"

#include <QDir>
#include <QElapsedTimer>
#include <QTest>

using namespace Cadenza;

namespace {
const QString FemkeTag = QStringLiteral("VOICEID:com.vendra.speech.synthesis.voice.femke.compact");

QString femkeBundle()
{
    return Platform::Paths::userVoicesFolder() + QStringLiteral("/FemkeCompact.SpeechVoice");
}
} // namespace

class DaemonKillTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void killedAtEachStage_data()
    {
        QTest::addColumn<QString>("stage");
        QTest::newRow("downloading") << QStringLiteral("downloading");
        QTest::newRow("verifying") << QStringLiteral("verifying");
        QTest::newRow("unpacking") << QStringLiteral("unpacking");
        QTest::newRow("renaming") << QStringLiteral("renaming");
    }
    void killedAtEachStage()
    {
        QFETCH(QString, stage);
        Testing::TestEnvironment environment;
        Testing::TestHttpServer http(QStringLiteral(CADENZA_SAMPLE_REPOSITORY));
        QVERIFY(http.listen());
        const QStringList repository {QStringLiteral("--repository"), http.baseUrl().toString()};
        CZSpeechInstallationManager manager;

        Testing::QuillondProcess daemon;
        if (stage == u"downloading") {
            http.setBytesPerSecond(50); // the download is still running when the daemon dies
            QVERIFY(daemon.start(repository));
        } else {
            QVERIFY(daemon.start(repository, {QStringLiteral("QUILLOND_STALL_BEFORE=") + stage}));
        }
        QVERIFY(CZSpeechInstallationManagerPrivate::get(&manager)->_requestInstallation(FemkeTag,
            QStringLiteral("Femke"), 696, QStringLiteral("com.vendra.speech.synthesis.voice.femke.compact"),
            0));
        if (stage == u"downloading") {
            QTRY_VERIFY_WITH_TIMEOUT(
                !Testing::QuillondProcess::leftovers().isEmpty(), 10000); // the partial download
        } else {
            QVERIFY(daemon.waitForLog(QStringLiteral("Stalled before ") + stage));
        }
        if (stage == u"renaming") {
            // Fully unpacked in the staging folder, not yet in place.
            const QStringList staged = Testing::QuillondProcess::leftovers();
            QVERIFY2(std::any_of(staged.cbegin(), staged.cend(),
                         [](const QString &path) {
                             return path.endsWith(QStringLiteral("/FemkeCompact.SpeechVoice"));
                         }),
                qPrintable(staged.join(u' ')));
        }
        daemon.kill();
        QVERIFY(!QFileInfo::exists(femkeBundle())); // absent, not half there

        // Without the daemon the client answers at once, with nothing.
        QElapsedTimer clock;
        clock.start();
        QVERIFY(manager.activeInstallations().isEmpty());
        QVERIFY(clock.elapsed() < 3000);

        // The next daemon clears what was left; asking again installs the voice whole.
        http.setBytesPerSecond(0);
        Testing::QuillondProcess next;
        QVERIFY(next.start(repository));
        QVERIFY2(Testing::QuillondProcess::leftovers().isEmpty(),
            qPrintable(Testing::QuillondProcess::leftovers().join(u' ')));
        QVERIFY(CZSpeechInstallationManagerPrivate::get(&manager)->_requestInstallation(FemkeTag,
            QStringLiteral("Femke"), 696, QStringLiteral("com.vendra.speech.synthesis.voice.femke.compact"),
            0));
        QTRY_VERIFY_WITH_TIMEOUT(QFileInfo::exists(femkeBundle() + QStringLiteral("/Info.plist")), 10000);
        QTRY_VERIFY_WITH_TIMEOUT(manager.activeInstallations().isEmpty(), 10000);
        QVERIFY(Testing::QuillondProcess::leftovers().isEmpty());
    }
};

QTEST_GUILESS_MAIN(DaemonKillTest)
#include "tst_daemonkill.moc"
