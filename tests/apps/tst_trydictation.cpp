// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// The settings app's "Try dictation" area: what it shows when recording cannot start.
#include "PrivateSoundServer.h"
#include "RecognizerFixture.h"
#include "TestEnvironment.h"
#include "TryDictationArea.h"

#include "core/files/Paths.h"

#include <QLabel>
#include <QPushButton>
#include <QTemporaryDir>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Testing;

class TryDictationTest : public QObject
{
    Q_OBJECT
    std::unique_ptr<TestEnvironment> m_environment;
    QTemporaryDir m_soundFolder;

private Q_SLOTS:
    void initTestCase()
    {
        // Where no sound server listens: the process has no microphone (set before Qt looks).
        qputenv("PULSE_SERVER", PrivateSoundServer::absentAddress(m_soundFolder.path()).toLocal8Bit());
    }

    void init() { m_environment = std::make_unique<TestEnvironment>(); }
    void cleanup() { m_environment.reset(); }

    void withoutARecognizerTheAreaSaysSo()
    {
        TryDictationArea area([] { return QStringLiteral("en_US"); });
        area.show();
        auto *button = area.findChild<QPushButton *>(QStringLiteral("tryDictationButton"));
        auto *words = area.findChild<QLabel *>(QStringLiteral("tryDictationText"));
        QVERIFY(button && words);
        QCOMPARE(button->text(), QStringLiteral("Record"));
        QCOMPARE(words->text(), QStringLiteral("Press Record, speak, then press Stop."));
        button->click();
        QTRY_VERIFY2(words->text().contains(QStringLiteral("no recognizer for en_US is installed")),
            qPrintable(words->text()));
        QCOMPARE(button->text(), QStringLiteral("Record"));
    }

    /// The test world has no sound server: the area names the missing microphone and stays ready.
    void withoutAMicrophoneTheAreaSaysSo()
    {
        RecognizerFixture::writeModelBundle(
            Platform::Paths::userRecognizersFolder(), QStringLiteral("en_US"));
        TryDictationArea area([] { return QStringLiteral("en_US"); });
        area.show();
        auto *button = area.findChild<QPushButton *>(QStringLiteral("tryDictationButton"));
        auto *words = area.findChild<QLabel *>(QStringLiteral("tryDictationText"));
        QVERIFY(button && words);
        button->click();
        // The model loads on the recognizer's thread: the event loop runs meanwhile.
        QCOMPARE(words->text(), QStringLiteral("Preparing…"));
        QCOMPARE(button->text(), QStringLiteral("Stop"));
        QTRY_VERIFY2_WITH_TIMEOUT(words->text().contains(QStringLiteral("no microphone is connected")),
            qPrintable(words->text()), 60000);
        QCOMPARE(button->text(), QStringLiteral("Record"));
    }
};

QTEST_MAIN(TryDictationTest)
#include "tst_trydictation.moc"
