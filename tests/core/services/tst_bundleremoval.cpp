// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "core/files/Paths.h"
#include "core/services/BundleRemoval.h"

#include <QDir>
#include <QFile>
#include <QProcess>
#include <QTest>

#include <atomic>
#include <thread>
#include <unistd.h>

using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {
void touch(const QString &path)
{
    QDir().mkpath(QFileInfo(path).absolutePath());
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly)) {
        qFatal("cannot write %s", qPrintable(path));
    }
    file.write("x");
}
} // namespace

class BundleRemovalTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_voices = Paths::userVoicesFolder();
        m_outside = m_environment->path(QStringLiteral("precious"));
        touch(m_outside + QStringLiteral("/keep.txt"));
        touch(m_voices + QStringLiteral("/Good.SpeechVoice/Info.plist"));
        touch(m_voices + QStringLiteral("/Good.SpeechVoice/Resources/data.bin"));
    }
    void cleanup() { m_environment.reset(); }

    void hostilePathsAreRefused_data()
    {
        QTest::addColumn<QString>("path");
        const QString v = Paths::userVoicesFolder();
        QTest::newRow("relative") << "Good.SpeechVoice";
        QTest::newRow("empty") << QString();
        QTest::newRow("traversal out") << v + "/../../precious";
        QTest::newRow("traversal back in") << v + "/../voices/Good.SpeechVoice";
        QTest::newRow("traversal inside") << v + "/Good.SpeechVoice/../Good.SpeechVoice";
        QTest::newRow("the folder itself") << v;
        QTest::newRow("the folder with a slash") << v + "/";
        QTest::newRow("root") << "/";
        QTest::newRow("outside folder") << "/tmp/Good.SpeechVoice";
        QTest::newRow("no suffix") << v + "/Good";
        QTest::newRow("suffix alone") << v + "/.SpeechVoice";
        QTest::newRow("suffix inside") << v + "/Good.SpeechVoice.old";
        QTest::newRow("nested") << v + "/Good.SpeechVoice/Resources.SpeechVoice";
        QTest::newRow("hidden") << v + "/.Good.SpeechVoice";
        QTest::newRow("newline") << v + "/Good\n.SpeechVoice";
        QTest::newRow("escape") << v + "/Good\x1b.SpeechVoice";
        QTest::newRow("missing") << v + "/Missing.SpeechVoice";
        QTest::newRow("very long") << v + "/" + QString(5000, 'a') + ".SpeechVoice";
        QTest::newRow("a file") << v + "/File.SpeechVoice";
        QTest::newRow("a link to outside") << v + "/Link.SpeechVoice";
        QTest::newRow("through a linked folder") << v + "/linked/Good.SpeechVoice";
        QTest::newRow("recognizer in a voice folder name") << v + "/Good.SpeechRecognitionX";
    }
    void hostilePathsAreRefused()
    {
        QFETCH(QString, path);
        touch(m_voices + QStringLiteral("/File.SpeechVoice"));
        QFile::link(m_outside, m_voices + QStringLiteral("/Link.SpeechVoice"));
        QFile::link(m_voices, m_voices + QStringLiteral("/linked"));
        QString error;
        QVERIFY(!BundleRemoval::remove(path, &error));
        QVERIFY2(!error.isEmpty(), "a refusal says why");
        QVERIFY(QFile::exists(m_outside + QStringLiteral("/keep.txt")));
        QVERIFY(QFile::exists(m_voices + QStringLiteral("/Good.SpeechVoice/Info.plist")));
    }

    void aBundleGoesWholeAndLinksInsideAreNotFollowed()
    {
        QFile::link(m_outside, m_voices + QStringLiteral("/Good.SpeechVoice/Resources/escape"));
        QFile::link(m_outside + QStringLiteral("/keep.txt"),
            m_voices + QStringLiteral("/Good.SpeechVoice/file-link"));
        QString error;
        QVERIFY2(
            BundleRemoval::remove(m_voices + QStringLiteral("/Good.SpeechVoice"), &error), qPrintable(error));
        QVERIFY(!QFileInfo::exists(m_voices + QStringLiteral("/Good.SpeechVoice")));
        QVERIFY(QFile::exists(m_outside + QStringLiteral("/keep.txt")));
        QVERIFY(QFileInfo(m_voices).isDir());
    }

    void recognizerBundlesToo()
    {
        const QString bundle = Paths::systemRecognizersFolder() + QStringLiteral("/de_DE.SpeechRecognition");
        touch(bundle + QStringLiteral("/Info.plist"));
        QString error;
        QVERIFY2(BundleRemoval::remove(bundle, &error), qPrintable(error));
        QVERIFY(!QFileInfo::exists(bundle));
    }

    void aLinkSwappedInDuringRemovalRemovesNothingOutside()
    {
        // Another process keeps replacing the bundle by a link to a folder outside while we remove.
        for (int round = 0; round < 200; ++round) {
            const QString bundle = m_voices + QStringLiteral("/Race.SpeechVoice");
            const QString aside = m_voices + QStringLiteral("/.aside");
            QDir(aside).removeRecursively();
            QFile::remove(bundle);
            QDir(bundle).removeRecursively();
            for (int i = 0; i < 20; ++i) {
                touch(bundle + QStringLiteral("/d%1/f").arg(i));
            }
            std::atomic<bool> stop {false};
            std::thread swapper([&] {
                const QByteArray b = QFile::encodeName(bundle);
                const QByteArray a = QFile::encodeName(aside);
                const QByteArray target = QFile::encodeName(m_outside);
                while (!stop.load()) {
                    if (::rename(b.constData(), a.constData()) == 0) {
                        (void)::symlink(target.constData(), b.constData());
                        ::usleep(50);
                        ::unlink(b.constData());
                        (void)::rename(a.constData(), b.constData());
                    }
                }
            });
            QString error;
            (void)BundleRemoval::remove(bundle, &error);
            stop = true;
            swapper.join();
            QVERIFY2(QFile::exists(m_outside + QStringLiteral("/keep.txt")),
                qPrintable(QStringLiteral("round %1").arg(round)));
        }
    }

    void theHelperRefusesAndRemoves()
    {
        QProcess helper;
        helper.start(
            QStringLiteral(CADENZA_REMOVE_HELPER_PATH), {m_voices + QStringLiteral("/../../precious")});
        QVERIFY(helper.waitForFinished(10000));
        QCOMPARE(helper.exitCode(), 1);
        QVERIFY(helper.readAllStandardError().contains("refusing to remove"));
        helper.start(
            QStringLiteral(CADENZA_REMOVE_HELPER_PATH), {m_voices + QStringLiteral("/Good.SpeechVoice")});
        QVERIFY(helper.waitForFinished(10000));
        QCOMPARE(helper.exitCode(), 0);
        QVERIFY(!QFileInfo::exists(m_voices + QStringLiteral("/Good.SpeechVoice")));
        helper.start(QStringLiteral(CADENZA_REMOVE_HELPER_PATH), {});
        QVERIFY(helper.waitForFinished(10000));
        QCOMPARE(helper.exitCode(), 2);
    }

private:
    std::unique_ptr<TestEnvironment> m_environment;
    QString m_voices;
    QString m_outside;
};

QTEST_GUILESS_MAIN(BundleRemovalTest)
#include "tst_bundleremoval.moc"
