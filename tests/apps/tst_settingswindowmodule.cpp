// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The settings window's button that offers the Cadenza voices to other apps through
// speech-dispatcher: it installs the per-user module, then removes it, and says which it will do.

#include "SettingsWindow.h"
#include "TestEnvironment.h"

#include "core/services/SpeechDispatcherModule.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QLabel>
#include <QPushButton>
#include <QTest>

using namespace Cadenza::Platform;
using namespace Cadenza::Testing;

class TestSettingsWindowModule : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void buttonInstallsAndRemovesTheModule()
    {
        TestEnvironment env;
        const QString module = env.path(QStringLiteral("prefix/lib/modules/sd_cadenza"));
        QVERIFY(QDir().mkpath(QFileInfo(module).absolutePath()));
        QFile file(module);
        QVERIFY(file.open(QIODevice::WriteOnly));
        file.write("#!/bin/sh\n");
        file.close();
        QVERIFY(file.setPermissions(QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner));
        qputenv("CADENZA_SPEECHD_MODULE", QFile::encodeName(module));

        SettingsWindow window;
        auto *button = window.findChild<QPushButton *>(QStringLiteral("speechDispatcherModuleButton"));
        auto *status = window.findChild<QLabel *>(QStringLiteral("speechDispatcherModuleStatus"));
        QVERIFY(button);
        QVERIFY(status);
        QVERIFY(button->isEnabled());
        const QString installText = button->text();
        QVERIFY(status->text().isEmpty());

        button->click();
        QVERIFY(SpeechDispatcherModule::isInstalledForUser());
        QCOMPARE(QFileInfo(SpeechDispatcherModule::userModulePath()).symLinkTarget(),
            QFileInfo(module).canonicalFilePath());
        QVERIFY(button->text() != installText);
        QVERIFY(!status->text().isEmpty());

        button->click();
        QVERIFY(!SpeechDispatcherModule::isInstalledForUser());
        QVERIFY(!QFileInfo(SpeechDispatcherModule::userModulePath()).isSymLink());
        QCOMPARE(button->text(), installText);

        // A hand-made sd_cadenza in the folder: the click fails, says why, and keeps the file.
        QFile foreign(SpeechDispatcherModule::userModulePath());
        QVERIFY(foreign.open(QIODevice::WriteOnly));
        foreign.write("#!/bin/sh\n# hand-made\n");
        foreign.close();
        button->click();
        QVERIFY(status->text().contains(QStringLiteral("not Cadenza's")));
        QVERIFY(QFileInfo(SpeechDispatcherModule::userModulePath()).isFile());
        QVERIFY(!QFileInfo(SpeechDispatcherModule::userModulePath()).isSymLink());
        qunsetenv("CADENZA_SPEECHD_MODULE");
    }

    void withoutAModuleTheButtonIsDisabled()
    {
        TestEnvironment env;
        qputenv("CADENZA_SPEECHD_MODULE", QFile::encodeName(env.path(QStringLiteral("missing/sd_cadenza"))));
        SettingsWindow window;
        auto *button = window.findChild<QPushButton *>(QStringLiteral("speechDispatcherModuleButton"));
        QVERIFY(button);
        QVERIFY(!button->isEnabled());
        qunsetenv("CADENZA_SPEECHD_MODULE");
    }
};

QTEST_MAIN(TestSettingsWindowModule)
#include "tst_settingswindowmodule.moc"
