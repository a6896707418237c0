// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "InProcessNotificationCenter.h"
#include "MemoryPreferencesStore.h"
#include "core/services/Services.h"
#include "core/voices/CZVoiceObject.h"
#include "core/voices/SpeechSynthesizer.h"
#include "widgets/helpers/Alert.h"
#include "widgets/voice-popup/CZVoicePopUpButton.h"
#include "widgets/voice-settings/CZFloatSlider.h"
#include "widgets/voice-settings/SpeechSynthesizerVoiceSettings.h"
#include "widgets/voice-settings/VoiceSettingsAlertController.h"
#include "widgets/voice-settings/VoiceSettingsSheetController.h"

#include <QCheckBox>
#include <QDialog>
#include <QLabel>
#include <QPushButton>
#include <QSlider>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString P = QStringLiteral("com.vendra.speech.synthesis.voice.");
} // namespace

/// A client that records what the dialog hands back.
class RecordingDelegate : public QObject
{
    Q_OBJECT
public:
    QVariantList received;
    Q_INVOKABLE void didEndWithVoiceSettings(const QVariant &settings) { received.append(settings); }
};

class VoiceSettingsTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_speech = std::make_shared<FakeSpeechSynthesisService>();
        Services::setSpeechSynthesis(m_speech);
        Services::setPreferences(std::make_shared<MemoryPreferencesStore>());
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>());
        Services::setNotifications(std::make_shared<InProcessNotificationCenter>());
        addVoice(
            QStringLiteral("maren.compact"), QStringLiteral("Maren Compact"), QStringLiteral("en_US"), 175);
        addVoice(
            QStringLiteral("tobias.compact"), QStringLiteral("Tobias Compact"), QStringLiteral("en_US"), 200);
        addVoice(
            QStringLiteral("liesel.compact"), QStringLiteral("Liesel Compact"), QStringLiteral("de_DE"), 160);
        CZVoiceObject::setVisibleVoicesTable({{QString(P + QStringLiteral("liesel.compact")), 1}});
        Alert::setResponder([this](const AlertRequest &) { return m_alertAnswer; });
    }
    void cleanupTestCase()
    {
        Alert::setResponder({});
        m_environment.reset();
    }
    void init()
    {
        m_speech->setHoldsSpeaking(false);
        m_alertAnswer = 0;
    }
    void cleanup()
    {
        VoiceSettingsWindowController::defaultVoiceSettingsAlertController()->closeWindow();
        VoiceSettingsWindowController::defaultVoiceSettingsSheetController()->closeWindow();
    }

    void rateSliderTable_data()
    {
        QTest::addColumn<int>("position");
        QTest::addColumn<float>("fraction");
        QTest::newRow("slowest") << 0 << 0.5f;
        QTest::newRow("quarter") << 50 << 0.75f;
        QTest::newRow("normal") << 100 << 1.0f;
        QTest::newRow("one and a half") << 150 << 1.5f;
        QTest::newRow("fastest") << 200 << 2.0f;
    }
    void rateSliderTable()
    {
        QFETCH(int, position);
        QFETCH(float, fraction);
        VoiceSettingsWindowController *controller
            = VoiceSettingsWindowController::defaultVoiceSettingsAlertController();
        QSlider slider;
        slider.setRange(0, 200);
        controller->setValueOfSliderUsingPercentOfNormal(&slider, fraction);
        QCOMPARE(slider.value(), position);
        QCOMPARE(controller->percentOfNormalFromSlider(&slider), fraction);
    }

    void rateSliderClampsAndSteps()
    {
        VoiceSettingsWindowController *controller
            = VoiceSettingsWindowController::defaultVoiceSettingsAlertController();
        QSlider slider;
        slider.setRange(0, 200);
        controller->setValueOfSliderUsingPercentOfNormal(&slider, 2.5f);
        QCOMPARE(slider.value(), 200);
        controller->setValueOfSliderUsingPercentOfNormal(&slider, 3.0f);
        QCOMPARE(slider.value(), 200);
        controller->setValueOfSliderUsingPercentOfNormal(&slider, 0.25f);
        QCOMPARE(slider.value(), 0);
        // Two positions make one percent below the middle, one above it.
        slider.setValue(99);
        QCOMPARE(controller->percentOfNormalFromSlider(&slider), 0.99f);
        slider.setValue(98);
        QCOMPARE(controller->percentOfNormalFromSlider(&slider), 0.99f);
        slider.setValue(97);
        QCOMPARE(controller->percentOfNormalFromSlider(&slider), 0.98f);
        slider.setValue(101);
        QCOMPARE(controller->percentOfNormalFromSlider(&slider), 1.01f);
        // Words per minute follow the voice's normal rate.
        controller->setUpWindowWithVoiceSettings(
            {{kVoiceSettingsVoiceIdentifierKey, QString(P + QStringLiteral("tobias.compact"))}}, nullptr);
        slider.setValue(150);
        QCOMPARE(controller->wordsPerMinuteFromSlider(&slider), 300.0f);
        controller->setValueOfSliderUsingWordsPerMinute(&slider, 100.0f);
        QCOMPARE(slider.value(), 0);
    }

    void emptySettingsOpenWithTheSystemVoice()
    {
        RecordingDelegate delegate;
        SpeechSynthesizerVoiceSettings::beginAlertForVoiceSettings(
            {}, &delegate, QStringLiteral("Reader Voice"));
        VoiceSettingsAlertController *controller
            = VoiceSettingsWindowController::defaultVoiceSettingsAlertController();
        QDialog *window = controller->window();
        QVERIFY(window->isVisible());
        QCOMPARE(window->windowTitle(), QStringLiteral("Reader Voice"));
        QCOMPARE(controller->voicePopupMenu()->currentIndex(), 0); // the system voice
        QVERIFY(!controller->useCustomRateCheckbox()->isChecked());
        QVERIFY(!controller->rateSlider()->isEnabled());
        QCOMPARE(controller->rateSlider()->value(), 100);
        QVERIFY(!controller->useCustomVolumeCheckbox()->isChecked());
        QCOMPARE(controller->volumeSlider()->floatValue(), 1.0);
        QVERIFY(!window->findChild<QLabel *>(QStringLiteral("volumeQuietIcon"))->pixmap().isNull());

        window->findChild<QPushButton *>(QStringLiteral("okButton"))->click();
        QVERIFY(!window->isVisible());
        QCOMPARE(delegate.received.size(), 1);
        QCOMPARE(delegate.received.first().typeId(), QMetaType::QVariantMap);
        QVERIFY(delegate.received.first().toMap().isEmpty());
    }

    void settingsRoundTrip()
    {
        RecordingDelegate delegate;
        SpeechSynthesizerVoiceSettings::beginAlertForVoiceSettings(
            {{kVoiceSettingsVoiceIdentifierKey, QString(P + QStringLiteral("tobias.compact"))},
                {kVoiceSettingsCustomRelativeRateKey, 0.5f}, {kVoiceSettingsCustomVolumeKey, 0.25f}},
            &delegate);
        VoiceSettingsAlertController *controller
            = VoiceSettingsWindowController::defaultVoiceSettingsAlertController();
        QCOMPARE(controller->voicePopupMenu()->currentText(), QStringLiteral("Tobias"));
        QCOMPARE(controller->rateSlider()->value(), controller->rateSlider()->minimum());
        QVERIFY(controller->rateSlider()->isEnabled());
        QCOMPARE(controller->volumeSlider()->floatValue(), 0.25);
        QCOMPARE(controller->speechSynthesizer()->speechRate(), 100.0f);

        // Showing again while visible changes nothing.
        SpeechSynthesizerVoiceSettings::beginAlertForVoiceSettings({}, nullptr);
        QCOMPARE(controller->voicePopupMenu()->currentText(), QStringLiteral("Tobias"));

        // Unticking the rate drops it from the answer; the volume stays.
        controller->useCustomRateCheckbox()->click();
        QVERIFY(!controller->rateSlider()->isEnabled());
        SpeechSynthesizerVoiceSettings::endAlertSavingChanges(true);
        QCOMPARE(delegate.received.size(), 1);
        const QVariantMap answer = delegate.received.first().toMap();
        QCOMPARE(
            answer.value(kVoiceSettingsVoiceIdentifierKey).toString(), P + QStringLiteral("tobias.compact"));
        QVERIFY(!answer.contains(kVoiceSettingsCustomRelativeRateKey));
        QCOMPARE(answer.value(kVoiceSettingsCustomVolumeKey).toFloat(), 0.25f);

        // 2.0 puts the slider at its maximum.
        SpeechSynthesizerVoiceSettings::beginAlertForVoiceSettings(
            {{kVoiceSettingsCustomRelativeRateKey, 2.0}}, nullptr);
        QCOMPARE(controller->rateSlider()->value(), controller->rateSlider()->maximum());
    }

    void declinedLanguageKeepsTheDialogOpen()
    {
        QWidget client;
        client.show();
        RecordingDelegate delegate;
        SpeechSynthesizerVoiceSettings::beginSheetForVoiceSettings(
            {{kVoiceSettingsVoiceIdentifierKey, QString(P + QStringLiteral("liesel.compact"))}}, &delegate,
            &client);
        VoiceSettingsSheetController *controller
            = VoiceSettingsWindowController::defaultVoiceSettingsSheetController();
        QCOMPARE(controller->window()->parentWidget(), &client);
        QCOMPARE(controller->window()->windowModality(), Qt::WindowModal);
        QCOMPARE(controller->voicePopupMenu()->currentText(), QStringLiteral("Liesel"));
        m_alertAnswer = 1; // "Cancel"
        controller->window()->findChild<QPushButton *>(QStringLiteral("okButton"))->click();
        QVERIFY(controller->window()->isVisible());
        QCOMPARE(delegate.received.size(), 1);
        QVERIFY(!delegate.received.first().isValid());
        QCOMPARE(Alert::answeredRequests().last().buttons.first(), QStringLiteral("Use Voice"));

        // Accepting the voice this time; ending the sheet saving changes is the same as OK.
        m_alertAnswer = 0;
        SpeechSynthesizerVoiceSettings::endSheetSavingChanges(true);
        QVERIFY(!controller->window()->isVisible());
        QCOMPARE(delegate.received.size(), 2);
        QCOMPARE(delegate.received.last().toMap().value(kVoiceSettingsVoiceIdentifierKey).toString(),
            P + QStringLiteral("liesel.compact"));
    }

    void cancelAndEscapeAnswerNothing()
    {
        RecordingDelegate delegate;
        SpeechSynthesizerVoiceSettings::beginAlertForVoiceSettings({}, &delegate);
        SpeechSynthesizerVoiceSettings::endAlertSavingChanges(false);
        QCOMPARE(delegate.received, QVariantList {QVariant()});
        VoiceSettingsAlertController *controller
            = VoiceSettingsWindowController::defaultVoiceSettingsAlertController();
        QVERIFY(!controller->window()->isVisible());

        SpeechSynthesizerVoiceSettings::beginAlertForVoiceSettings({}, &delegate);
        QVERIFY(QTest::qWaitForWindowExposed(controller->window()));
        QTest::keyClick(controller->window(), Qt::Key_Escape);
        QVERIFY(!controller->window()->isVisible());
        QCOMPARE(delegate.received.size(), 2);
        QVERIFY(!delegate.received.last().isValid());

        // A delegate without the callback is simply not called.
        QObject mute;
        SpeechSynthesizerVoiceSettings::beginAlertForVoiceSettings({}, &mute);
        SpeechSynthesizerVoiceSettings::endAlertSavingChanges(true);
        QVERIFY(!controller->window()->isVisible());
    }

    void playStopAndLiveChanges()
    {
        m_speech->setHoldsSpeaking(true);
        SpeechSynthesizerVoiceSettings::beginAlertForVoiceSettings(
            {{kVoiceSettingsVoiceIdentifierKey, QString(P + QStringLiteral("maren.compact"))}}, nullptr);
        VoiceSettingsAlertController *controller
            = VoiceSettingsWindowController::defaultVoiceSettingsAlertController();
        QPushButton *play = controller->startStopSpeakingButton();
        QCOMPARE(play->text(), QStringLiteral("Play"));
        play->click();
        QCOMPARE(play->text(), QStringLiteral("Stop"));
        QCOMPARE(m_speech->requests().last().text, QStringLiteral("Demo of Maren Compact"));

        // The rate slider restarts the demo at the new rate.
        controller->useCustomRateCheckbox()->click();
        const qsizetype before = m_speech->requests().size();
        controller->rateSlider()->setValue(150);
        QCOMPARE(m_speech->requests().size(), before + 1);
        QCOMPARE(m_speech->requests().last().wordsPerMinute, 1.5 * 175);
        QCOMPARE(play->text(), QStringLiteral("Stop"));

        // The volume reaches the speech in progress without a restart.
        controller->useCustomVolumeCheckbox()->click();
        controller->volumeSlider()->setFloatValue(0.5);
        QCOMPARE(m_speech->speakingVolume(), 0.5);
        QCOMPARE(m_speech->requests().size(), before + 1);

        // Another voice continues the demo in that voice, with the custom rate.
        CZVoicePopUpButton *voices = controller->voicePopupMenu();
        voices->setCurrentIndex(voices->findText(QStringLiteral("Tobias")));
        QVERIFY(voices->sendAction());
        QCOMPARE(m_speech->requests().last().voiceIdentifier, P + QStringLiteral("tobias.compact"));
        QCOMPARE(m_speech->requests().last().wordsPerMinute, 1.5 * 200);
        QCOMPARE(m_speech->requests().last().volume, 0.5);

        // Finishing normally shows Play again; Stop does too.
        m_speech->finishHeldRequests(true);
        QCOMPARE(play->text(), QStringLiteral("Play"));
        play->click();
        play->click();
        QCOMPARE(play->text(), QStringLiteral("Play"));
        QVERIFY(!controller->speechSynthesizer()->isSpeaking());
    }

    void keyboardAndAccessibility()
    {
        SpeechSynthesizerVoiceSettings::beginAlertForVoiceSettings({}, nullptr);
        VoiceSettingsAlertController *controller
            = VoiceSettingsWindowController::defaultVoiceSettingsAlertController();
        QVERIFY(QTest::qWaitForWindowExposed(controller->window()));
        for (QWidget *control : controller->window()->findChildren<QWidget *>()) {
            if ((control->focusPolicy() & Qt::TabFocus) && control->window() == controller->window()
                && control->isVisible()) {
                const bool named = !control->accessibleName().isEmpty()
                    || (qobject_cast<QAbstractButton *>(control)
                        && !qobject_cast<QAbstractButton *>(control)->text().isEmpty());
                QVERIFY2(named, qPrintable(control->objectName()));
            }
        }
        controller->useCustomRateCheckbox()->setFocus();
        QTest::keyClick(controller->useCustomRateCheckbox(), Qt::Key_Space);
        QVERIFY(controller->rateSlider()->isEnabled());
        QTest::keyClick(controller->window(), Qt::Key_Tab);
        QCOMPARE(QApplication::focusWidget(), controller->rateSlider());
        QTest::keyClick(controller->rateSlider(), Qt::Key_Right);
        QCOMPARE(controller->rateSlider()->value(), 101);
        QCOMPARE(controller->voiceSettingsFromWindow().value(kVoiceSettingsCustomRelativeRateKey).toFloat(),
            1.01f);
    }

private:
    void addVoice(const QString &suffix, const QString &name, const QString &locale, int rate)
    {
        QVariantMap attributes = TestEnvironment::voiceAttributes(P + suffix, name, locale);
        attributes.insert(QStringLiteral("VoiceDemoText"), QString(QStringLiteral("Demo of ") + name));
        VoiceDescription voice
            = *VoiceDescription::fromInfo({{QStringLiteral("VoiceAttributes"), attributes}}, nullptr);
        voice.engineRate = rate;
        m_speech->addVoice(voice);
    }

    std::unique_ptr<TestEnvironment> m_environment;
    std::shared_ptr<FakeSpeechSynthesisService> m_speech;
    int m_alertAnswer = 0;
};

QTEST_MAIN(VoiceSettingsTest)
#include "tst_voicesettings.moc"
