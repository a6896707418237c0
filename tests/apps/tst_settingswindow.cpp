// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The host's window shows what the voice settings dialog returned in the user's words.
#include "TestEnvironment.h"

#include "SettingsWindow.h"

#include "FakeUserLocaleService.h"
#include "core/files/Paths.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem.h"
#include "core/voices/SpeechSynthesizer.h"

#include <QLabel>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

class SettingsWindowTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        const QString maren = QStringLiteral("com.vendra.speech.synthesis.voice.maren.compact");
        (void)TestEnvironment::writeVoiceBundle(Paths::systemVoicesFolder(), QStringLiteral("MarenCompact"),
            TestEnvironment::voiceAttributes(
                maren, QStringLiteral("Maren Compact"), QStringLiteral("en_US")));
    }
    void cleanup() { m_environment.reset(); }

    void theSummaryNamesTheVoiceAndWritesPercentsAsTheLocaleDoes()
    {
        SettingsWindow window;
        auto *summary = window.findChild<QLabel *>(QStringLiteral("voiceSettingsSummary"));
        QVERIFY(summary);
        QCOMPARE(summary->text(), QStringLiteral("Reading voice: system voice"));
        window.didEndWithVoiceSettings(
            QVariantMap {{kVoiceSettingsVoiceIdentifierKey,
                             QStringLiteral("com.vendra.speech.synthesis.voice.maren.compact")},
                {kVoiceSettingsCustomRelativeRateKey, 1.2}, {kVoiceSettingsCustomVolumeKey, 0.5}});
        QCOMPARE(summary->text(), QStringLiteral("Reading voice: Maren Compact, rate 120%, volume 50%"));
        QVERIFY(!summary->text().contains(QLatin1String("com.vendra")));
        // A voice that is gone is still named, by its identifier.
        window.didEndWithVoiceSettings(
            QVariantMap {{kVoiceSettingsVoiceIdentifierKey, QStringLiteral("com.example.gone")}});
        QCOMPARE(summary->text(), QStringLiteral("Reading voice: com.example.gone"));
    }

    void percentsFollowTheLocale()
    {
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>(
            QStringList {QStringLiteral("de_DE")}, QStringLiteral("de_DE")));
        QCOMPARE(CZSpeechItem::displayStringForPercent(44), QStringLiteral("44\u00a0%"));
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>(
            QStringList {QStringLiteral("en_US")}, QStringLiteral("en_US")));
        QCOMPARE(CZSpeechItem::displayStringForPercent(44), QStringLiteral("44%"));
        Services::setUserLocale(nullptr);
    }

private:
    std::unique_ptr<TestEnvironment> m_environment;
};

QTEST_MAIN(SettingsWindowTest)
#include "tst_settingswindow.moc"
