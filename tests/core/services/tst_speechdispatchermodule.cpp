// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Installing speech-dispatcher's module for the current user, and removing it, leaves everything
// that is not Cadenza's alone.

#include "TestEnvironment.h"

#include "cadenza-config.h"

#include "core/files/Paths.h"
#include "core/services/SpeechDispatcherModule.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QProcess>
#include <QTest>

using namespace Cadenza::Platform;
using namespace Cadenza::Testing;

class TestSpeechDispatcherModule : public QObject
{
    Q_OBJECT

private:
    std::unique_ptr<TestEnvironment> m_env;

    static QString writeProgram(const QString &path, const QByteArray &content = "#!/bin/sh\n")
    {
        QDir().mkpath(QFileInfo(path).absolutePath());
        QFile file(path);
        if (!file.open(QIODevice::WriteOnly) || file.write(content) < 0) {
            qFatal("cannot write %s", qPrintable(path));
        }
        file.close();
        file.setPermissions(QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
        return QFileInfo(path).canonicalFilePath();
    }

private Q_SLOTS:
    void init()
    {
        m_env = std::make_unique<TestEnvironment>();
        qunsetenv("CADENZA_SPEECHD_MODULE");
    }
    void cleanup()
    {
        qunsetenv("CADENZA_SPEECHD_MODULE");
        m_env.reset();
    }

    void theUserFolderLiesBesideTheDataFolder()
    {
        QCOMPARE(SpeechDispatcherModule::userModuleFolder(),
            QDir::cleanPath(Paths::userDataHome() + QStringLiteral("/../libexec/speech-dispatcher-modules")));
        QVERIFY(SpeechDispatcherModule::userModulePath().endsWith(QStringLiteral("/sd_cadenza")));
    }

    void installLinksAndRemoveUnlinksOnlyOurs()
    {
        const QString module = writeProgram(m_env->path(QStringLiteral("prefix/lib/modules/sd_cadenza")));
        const QString other
            = writeProgram(SpeechDispatcherModule::userModuleFolder() + QStringLiteral("/sd_other"),
                "#!/bin/sh\n# someone else's\n");
        QVERIFY(!SpeechDispatcherModule::isInstalledForUser());

        QString error;
        QVERIFY2(SpeechDispatcherModule::installForUser(module, &error), qPrintable(error));
        QVERIFY(SpeechDispatcherModule::isInstalledForUser());
        const QFileInfo link(SpeechDispatcherModule::userModulePath());
        QVERIFY(link.isSymLink());
        QCOMPARE(link.symLinkTarget(), module);
        // Again: nothing changes, nothing fails.
        QVERIFY(SpeechDispatcherModule::installForUser(module, &error));
        QVERIFY(!QFileInfo::exists(SpeechDispatcherModule::userModulePath() + QStringLiteral(".new")));

        QVERIFY2(SpeechDispatcherModule::removeForUser(&error), qPrintable(error));
        QVERIFY(!QFileInfo(SpeechDispatcherModule::userModulePath()).isSymLink());
        QVERIFY(!SpeechDispatcherModule::isInstalledForUser());
        // The other module and the folder stay.
        QFile kept(other);
        QVERIFY(kept.open(QIODevice::ReadOnly));
        QCOMPARE(kept.readAll(), QByteArray("#!/bin/sh\n# someone else's\n"));
        QVERIFY(QFileInfo(SpeechDispatcherModule::userModuleFolder()).isDir());
        // Removing what is not there is no error.
        QVERIFY(SpeechDispatcherModule::removeForUser(&error));
    }

    void aFileThatIsNotOursIsLeftAlone()
    {
        const QString module = writeProgram(m_env->path(QStringLiteral("prefix/lib/modules/sd_cadenza")));
        const QString foreign = SpeechDispatcherModule::userModulePath();
        writeProgram(foreign, "#!/bin/sh\n# hand-made\n");
        QString error;
        QVERIFY(!SpeechDispatcherModule::installForUser(module, &error));
        QVERIFY(error.contains(QStringLiteral("not Cadenza's")));
        QVERIFY(!SpeechDispatcherModule::removeForUser(&error));
        QVERIFY(!QFileInfo(foreign).isSymLink());
        QFile kept(foreign);
        QVERIFY(kept.open(QIODevice::ReadOnly));
        QCOMPARE(kept.readAll(), QByteArray("#!/bin/sh\n# hand-made\n"));
        QVERIFY(!SpeechDispatcherModule::isInstalledForUser());
    }

    void nothingToInstallIsAnError()
    {
        QString error;
        QVERIFY(!SpeechDispatcherModule::installForUser(QString(), &error));
        QVERIFY(!error.isEmpty());
        QVERIFY(!SpeechDispatcherModule::installForUser(
            m_env->path(QStringLiteral("missing/sd_cadenza")), &error));
        QVERIFY(!QFileInfo(SpeechDispatcherModule::userModulePath()).isSymLink());
    }

    void theShippedModuleIsFoundUnderThePrefix()
    {
        // bin/ and the module folder under one prefix, as "cmake --install" lays them out.
        const QString prefix = m_env->path(QStringLiteral("prefix"));
        QVERIFY(QDir().mkpath(prefix + QStringLiteral("/bin")));
        QCOMPARE(SpeechDispatcherModule::shippedModule(prefix + QStringLiteral("/bin")), QString());
        const QString installed
            = writeProgram(prefix + QStringLiteral("/" CADENZA_SPEECHD_MODULEDIR "/sd_cadenza"));
        QCOMPARE(SpeechDispatcherModule::shippedModule(prefix + QStringLiteral("/bin")), installed);
        // The environment wins.
        const QString elsewhere = writeProgram(m_env->path(QStringLiteral("elsewhere/sd_cadenza")));
        qputenv("CADENZA_SPEECHD_MODULE", QFile::encodeName(elsewhere));
        QCOMPARE(SpeechDispatcherModule::shippedModule(prefix + QStringLiteral("/bin")), elsewhere);
    }

    void settingsAppInstallsAndRemovesFromTheCommandLine()
    {
        const QString module = writeProgram(m_env->path(QStringLiteral("prefix/lib/modules/sd_cadenza")));
        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        environment.insert(QStringLiteral("CADENZA_SPEECHD_MODULE"), module);
        // As on a machine without a display (the main script runs it before any window exists).
        for (const char *variable : {"QT_QPA_PLATFORM", "DISPLAY", "WAYLAND_DISPLAY"}) {
            environment.remove(QString::fromLatin1(variable));
        }
        QProcess settings;
        settings.setProcessEnvironment(environment);
        settings.start(QStringLiteral(CADENZA_SETTINGS_PATH), {QStringLiteral("--help")});
        QVERIFY(settings.waitForFinished(30000));
        QCOMPARE(settings.exitCode(), 0);
        QVERIFY(settings.readAllStandardOutput().contains("--install-speech-dispatcher-module"));
        settings.start(
            QStringLiteral(CADENZA_SETTINGS_PATH), {QStringLiteral("--install-speech-dispatcher-module")});
        QVERIFY(settings.waitForFinished(30000));
        QCOMPARE(settings.exitCode(), 0);
        QCOMPARE(QFileInfo(SpeechDispatcherModule::userModulePath()).symLinkTarget(), module);

        settings.start(
            QStringLiteral(CADENZA_SETTINGS_PATH), {QStringLiteral("--remove-speech-dispatcher-module")});
        QVERIFY(settings.waitForFinished(30000));
        QCOMPARE(settings.exitCode(), 0);
        QVERIFY(!QFileInfo(SpeechDispatcherModule::userModulePath()).isSymLink());

        // A hand-made sd_cadenza: refused with a message, kept.
        writeProgram(SpeechDispatcherModule::userModulePath());
        settings.start(
            QStringLiteral(CADENZA_SETTINGS_PATH), {QStringLiteral("--install-speech-dispatcher-module")});
        QVERIFY(settings.waitForFinished(30000));
        QCOMPARE(settings.exitCode(), 1);
        QVERIFY(settings.readAllStandardError().contains("not Cadenza's"));
        QVERIFY(QFileInfo(SpeechDispatcherModule::userModulePath()).isFile());
    }
};

QTEST_GUILESS_MAIN(TestSpeechDispatcherModule)
#include "tst_speechdispatchermodule.moc"
