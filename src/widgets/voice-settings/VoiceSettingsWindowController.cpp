// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "VoiceSettingsWindowController.h"

#include "VoiceSettingsWindowController_p.h"
#include "core/formats/VoiceDescription.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/Services.h"
#include "core/services/SpeechSynthesisService.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "core/voices/SpeechSynthesizer.h"
#include "widgets/voice-popup/CZVoicePopUpButton.h"
#include "widgets/voice-settings/CZFloatSlider.h"
#include "widgets/voice-settings/VoiceSettingsAlertController.h"
#include "widgets/voice-settings/VoiceSettingsSheetController.h"

#include <QApplication>
#include <QCheckBox>
#include <QDialog>
#include <QLabel>
#include <QPushButton>
#include <QScreen>
#include <QSlider>
#include <QStyle>
#include <QThread>

#include <cmath>

namespace Cadenza {

namespace {
constexpr double FixedOne = 65536.0;
constexpr float DefaultWordsPerMinute = 150.0f;

template<typename T>
T *outlet(QDialog *window, const char *name)
{
    T *found = window->findChild<T *>(QLatin1String(name));
    Q_ASSERT_X(found, "VoiceSettingsWindowController", name);
    return found;
}

const Platform::LocalizationTable &texts()
{
    return Platform::LocalizationTable::shared();
}

void setText(QDialog *window, const char *name, const char *key)
{
    if (auto *widget = window->findChild<QWidget *>(QLatin1String(name))) {
        const QString text = texts().text(QLatin1String(key));
        if (auto *label = qobject_cast<QLabel *>(widget)) {
            label->setText(text);
        } else if (auto *button = qobject_cast<QAbstractButton *>(widget)) {
            button->setText(text);
        }
    }
}
} // namespace

VoiceSettingsWindowControllerPrivate::VoiceSettingsWindowControllerPrivate(
    VoiceSettingsWindowController *q, std::function<QDialog *()> windowLoader)
    : q(q)
    , m_windowLoader(std::move(windowLoader))
{ }

VoiceSettingsWindowController::VoiceSettingsWindowController(
    std::function<QDialog *()> windowLoader, QObject *parent)
    : QObject(parent)
    , d(std::make_unique<VoiceSettingsWindowControllerPrivate>(this, std::move(windowLoader)))
{
    d->loadWindow();
}

void VoiceSettingsWindowControllerPrivate::loadWindow()
{
    QDialog *window = m_windowLoader();
    m_window = window;
    m_useCustomRateCheckbox = outlet<QCheckBox>(window, "useCustomRateCheckbox");
    m_useCustomVolumeCheckbox = outlet<QCheckBox>(window, "useCustomVolumeCheckbox");
    m_startStopSpeakingButton = outlet<QPushButton>(window, "startStopSpeakingButton");
    m_rateSlider = outlet<QSlider>(window, "rateSlider");
    m_volumeSlider = outlet<CZFloatSlider>(window, "volumeSlider");
    m_volumeQuietIcon = outlet<QLabel>(window, "volumeQuietIcon");
    m_volumeLoudIcon = outlet<QLabel>(window, "volumeLoudIcon");
    m_voicePopupMenu = outlet<CZVoicePopUpButton>(window, "voicePopupMenu");
    // The interface files carry English; the shared table gives the user's language.
    window->setWindowTitle(texts().text(QStringLiteral("VoiceSettingsWindowTitle")));
    setText(window, "titleLabel", "VoiceSettingsWindowTitle");
    setText(window, "voiceLabel", "VoiceSettingsVoiceLabel");
    setText(window, "useCustomRateCheckbox", "VoiceSettingsCustomRateCheckbox");
    setText(window, "useCustomVolumeCheckbox", "VoiceSettingsCustomVolumeCheckbox");
    setText(window, "rateSlowLabel", "VoiceSettingsSlowLabel");
    setText(window, "rateFastLabel", "VoiceSettingsFastLabel");
    setText(window, "startStopSpeakingButton", "PlayButtonName");
    setText(window, "okButton", "OK");
    setText(window, "cancelButton", "Cancel");
    m_startStopSpeakingButton->setProperty("alternateTitle", texts().text(QStringLiteral("StopButtonName")));
    m_voicePopupMenu->setAccessibleName(texts().text(QStringLiteral("VoiceSettingsVoiceLabel")).remove(u':'));
    m_rateSlider->setAccessibleName(texts().text(QStringLiteral("VoiceSettingsRateSlider")));
    m_volumeSlider->setAccessibleName(texts().text(QStringLiteral("VoiceSettingsVolumeSlider")));
    m_volumeQuietIcon->setAccessibleName(texts().text(QStringLiteral("VoiceSettingsQuietIcon")));
    m_volumeLoudIcon->setAccessibleName(texts().text(QStringLiteral("VoiceSettingsLoudIcon")));

    QObject::connect(
        m_useCustomRateCheckbox, &QCheckBox::clicked, q, &VoiceSettingsWindowController::rateCheckboxClicked);
    QObject::connect(m_useCustomVolumeCheckbox, &QCheckBox::clicked, q,
        &VoiceSettingsWindowController::volumeCheckboxClicked);
    QObject::connect(m_startStopSpeakingButton, &QPushButton::clicked, q,
        &VoiceSettingsWindowController::playStopVoiceSettings);
    QObject::connect(
        m_rateSlider, &QSlider::valueChanged, q, &VoiceSettingsWindowController::rateSliderChanged);
    QObject::connect(
        m_volumeSlider, &QSlider::valueChanged, q, &VoiceSettingsWindowController::volumeSliderChanged);
    QObject::connect(m_voicePopupMenu, &CZVoicePopUpButton::voiceActivated, q,
        &VoiceSettingsWindowController::voicePopupMenuChanged);
    if (auto *ok = window->findChild<QPushButton *>(QStringLiteral("okButton"))) {
        QObject::connect(ok, &QPushButton::clicked, q, &VoiceSettingsWindowController::saveVoiceSettings);
    }
    if (auto *cancel = window->findChild<QPushButton *>(QStringLiteral("cancelButton"))) {
        QObject::connect(
            cancel, &QPushButton::clicked, q, &VoiceSettingsWindowController::cancelVoiceSettings);
    }
    // Escape and the window's close button mean Cancel.
    QObject::connect(m_window, &QDialog::rejected, q, [this] {
        if (!m_closing) {
            q->cancelVoiceSettings();
        }
    });
}

VoiceSettingsWindowController::~VoiceSettingsWindowController()
{
    if (d->m_speechSynthesizer) {
        d->m_speechSynthesizer->stopSpeaking();
    }
    delete d->m_window.data();
}

SpeechSynthesizer *VoiceSettingsWindowController::speechSynthesizer() const
{
    return d->m_speechSynthesizer.get();
}

CZVoicePopUpButton *VoiceSettingsWindowController::voicePopupMenu() const
{
    return d->m_voicePopupMenu;
}

QSlider *VoiceSettingsWindowController::rateSlider() const
{
    return d->m_rateSlider;
}

CZFloatSlider *VoiceSettingsWindowController::volumeSlider() const
{
    return d->m_volumeSlider;
}

QCheckBox *VoiceSettingsWindowController::useCustomRateCheckbox() const
{
    return d->m_useCustomRateCheckbox;
}

QCheckBox *VoiceSettingsWindowController::useCustomVolumeCheckbox() const
{
    return d->m_useCustomVolumeCheckbox;
}

QPushButton *VoiceSettingsWindowController::startStopSpeakingButton() const
{
    return d->m_startStopSpeakingButton;
}

QDialog *VoiceSettingsWindowController::window()
{
    // A sheet's window dies with a client window that is closed for good; make it again.
    if (!d->m_window) {
        d->loadWindow();
    }
    return d->m_window;
}

// The shared controllers live until the process ends and are never deleted: a dialog deleted after the
// application object has gone would touch freed font and window state.
VoiceSettingsAlertController *VoiceSettingsWindowController::defaultVoiceSettingsAlertController()
{
    static VoiceSettingsAlertController *controller = [] {
        auto *made = new VoiceSettingsAlertController;
        QDialog *window = made->window();
        window->adjustSize();
        if (QScreen *screen = QGuiApplication::primaryScreen()) {
            window->move(screen->availableGeometry().center() - window->rect().center());
        }
        return made;
    }();
    return controller;
}

VoiceSettingsSheetController *VoiceSettingsWindowController::defaultVoiceSettingsSheetController()
{
    static VoiceSettingsSheetController *controller = new VoiceSettingsSheetController;
    return controller;
}

void VoiceSettingsWindowControllerPrivate::replaceSynthesizer(std::unique_ptr<SpeechSynthesizer> synthesizer)
{
    m_speechSynthesizer = std::move(synthesizer);
    if (m_speechSynthesizer) {
        QObject::connect(m_speechSynthesizer.get(), &SpeechSynthesizer::didFinishSpeaking, q,
            &VoiceSettingsWindowController::speechSynthesizerDidFinishSpeaking);
    }
}

void VoiceSettingsWindowController::setUpWindowWithVoiceSettings(
    const QVariantMap &voiceSettings, QObject *modalDelegate)
{
    (void)window();
    d->replaceSynthesizer(SpeechSynthesizer::initWithVoiceSettings(voiceSettings));
    d->m_modalDelegate = modalDelegate;
    QStyle *style = d->m_window->style();
    d->m_volumeQuietIcon->setPixmap(style->standardIcon(QStyle::SP_MediaVolumeMuted).pixmap(16, 16));
    d->m_volumeLoudIcon->setPixmap(style->standardIcon(QStyle::SP_MediaVolume).pixmap(16, 16));

    d->m_voicePopupMenu->setAllowSystemVoiceChoice(true);
    const QVariant voice = voiceSettings.value(kVoiceSettingsVoiceIdentifierKey);
    d->m_voicePopupMenu->buildPopUpButtonWithSelectVoiceIdentifier(
        voice.typeId() == QMetaType::QString ? voice.toString() : QString());

    const QSignalBlocker rateBlocker(d->m_rateSlider);
    const QVariant rate = voiceSettings.value(kVoiceSettingsCustomRelativeRateKey);
    const bool customRate = SpeechItemPrivate::isNumber(rate);
    setValueOfSliderUsingPercentOfNormal(d->m_rateSlider, customRate ? rate.toFloat() : 1.0f);
    d->m_useCustomRateCheckbox->setChecked(customRate);
    d->m_rateSlider->setEnabled(customRate);

    const QSignalBlocker volumeBlocker(d->m_volumeSlider);
    const QVariant volume = voiceSettings.value(kVoiceSettingsCustomVolumeKey);
    const bool customVolume = SpeechItemPrivate::isNumber(volume);
    if (customVolume) {
        d->m_volumeSlider->setFloatValue(volume.toDouble());
    } else {
        const qint32 current = d->m_speechSynthesizer
            ? qint32(
                d->m_speechSynthesizer
                    ->objectForProperty(SpeechSynthesizer::VolumeProperty, 4, QMetaType::fromType<qint32>())
                    .toLongLong())
            : 0;
        d->m_volumeSlider->setFloatValue(double(current) * 1.52587890625e-5);
    }
    d->m_useCustomVolumeCheckbox->setChecked(customVolume);
    d->m_volumeSlider->setEnabled(customVolume);

    if (d->m_playDisplayString.isNull()) {
        d->m_playDisplayString = d->m_startStopSpeakingButton->text();
    }
}

void VoiceSettingsWindowController::showWindowWithVoiceSettings(
    const QVariantMap &voiceSettings, QObject *modalDelegate, const QString &windowTitle)
{
    if (window()->isVisible()) {
        d->m_window->raise();
        d->m_window->activateWindow();
        return;
    }
    setUpWindowWithVoiceSettings(voiceSettings, modalDelegate);
    if (!windowTitle.isEmpty()) {
        d->m_window->setWindowTitle(windowTitle);
    }
    d->m_window->show();
}

void VoiceSettingsWindowController::showSheetWithVoiceSettings(
    const QVariantMap &voiceSettings, QObject *modalDelegate, QWidget *modalForWindow)
{
    if (window()->isVisible()) {
        d->m_window->raise();
        d->m_window->activateWindow();
        return;
    }
    setUpWindowWithVoiceSettings(voiceSettings, modalDelegate);
    if (modalForWindow) {
        d->m_window->setParent(modalForWindow->window(), d->m_window->windowFlags());
    }
    d->m_window->setWindowModality(modalForWindow ? Qt::WindowModal : Qt::ApplicationModal);
    d->m_window->show();
}

void VoiceSettingsWindowControllerPrivate::showPlayTitle()
{
    m_startStopSpeakingButton->setText(
        m_playDisplayString.isNull() ? texts().text(QStringLiteral("PlayButtonName")) : m_playDisplayString);
}

void VoiceSettingsWindowController::closeWindow()
{
    if (d->m_speechSynthesizer) {
        d->m_speechSynthesizer->stopSpeaking();
    }
    d->showPlayTitle();
    if (!d->m_window) {
        return;
    }
    d->m_closing = true;
    d->m_window->hide();
    if (d->m_window->parentWidget()) {
        // Back to a window of its own, so the client's window can go without taking it along.
        d->m_window->setParent(nullptr, d->m_window->windowFlags());
    }
    d->m_closing = false;
}

QVariantMap VoiceSettingsWindowController::voiceSettingsFromWindow() const
{
    QVariantMap settings;
    if (d->m_voicePopupMenu->selectedVoiceAttributes() && d->m_speechSynthesizer) {
        settings.insert(kVoiceSettingsVoiceIdentifierKey, d->m_speechSynthesizer->voice());
    }
    if (d->m_useCustomRateCheckbox->isChecked()) {
        settings.insert(kVoiceSettingsCustomRelativeRateKey, percentOfNormalFromSlider(d->m_rateSlider));
    }
    if (d->m_useCustomVolumeCheckbox->isChecked()) {
        settings.insert(kVoiceSettingsCustomVolumeKey, float(d->m_volumeSlider->floatValue()));
    }
    return settings;
}

void VoiceSettingsWindowControllerPrivate::tellDelegate(const QVariant &settings)
{
    QObject *delegate = m_modalDelegate;
    if (!delegate || delegate->metaObject()->indexOfMethod("didEndWithVoiceSettings(QVariant)") < 0) {
        return;
    }
    QMetaObject::invokeMethod(
        delegate, "didEndWithVoiceSettings", Qt::DirectConnection, Q_ARG(QVariant, settings));
}

void VoiceSettingsWindowController::saveVoiceSettings()
{
    const QVariantMap settings = voiceSettingsFromWindow();
    const bool ok = d->m_voicePopupMenu->isSelectedVoiceAppropriateForCurrentLanguageWithUserConfirmation(
        true, nullptr);
    if (ok) {
        closeWindow();
    }
    // Told even when the user keeps the dialog open to choose again: nil, then.
    d->tellDelegate(ok ? QVariant(settings) : QVariant());
}

void VoiceSettingsWindowController::cancelVoiceSettings()
{
    closeWindow();
    d->tellDelegate(QVariant());
}

void VoiceSettingsWindowController::playStopVoiceSettings()
{
    if (!d->m_speechSynthesizer) {
        return;
    }
    if (d->m_speechSynthesizer->isSpeaking()) {
        d->m_speechSynthesizer->stopSpeaking();
        d->showPlayTitle();
        return;
    }
    const QString demoText = Platform::Services::speechSynthesis()
                                 .attributesForVoice(d->m_speechSynthesizer->voice())
                                 .value(Platform::VoiceAttribute::DemoText)
                                 .toString();
    if (d->m_speechSynthesizer->startSpeakingString(demoText)) {
        d->m_startStopSpeakingButton->setText(
            d->m_startStopSpeakingButton->property("alternateTitle").toString());
    }
}

void VoiceSettingsWindowController::voicePopupMenuChanged()
{
    const bool wasSpeaking = d->m_speechSynthesizer && d->m_speechSynthesizer->isSpeaking();
    if (d->m_speechSynthesizer) {
        d->m_speechSynthesizer->stopSpeaking();
    }
    d->showPlayTitle();
    const auto attributes = d->m_voicePopupMenu->selectedVoiceAttributes();
    d->replaceSynthesizer(SpeechSynthesizer::initWithVoice(
        attributes ? attributes->value(Platform::VoiceAttribute::Identifier).toString() : QString()));
    if (d->m_speechSynthesizer && d->m_useCustomRateCheckbox->isChecked()) {
        d->m_speechSynthesizer->setSpeechRate(wordsPerMinuteFromSlider(d->m_rateSlider));
    }
    if (d->m_useCustomVolumeCheckbox->isChecked()) {
        d->writeVolumeFromSlider();
    }
    if (wasSpeaking) {
        playStopVoiceSettings();
    }
}

void VoiceSettingsWindowController::rateSliderChanged()
{
    const bool wasSpeaking = d->m_speechSynthesizer && d->m_speechSynthesizer->isSpeaking();
    if (wasSpeaking) {
        d->m_speechSynthesizer->stopSpeaking();
        d->showPlayTitle();
    }
    if (d->m_speechSynthesizer) {
        d->m_speechSynthesizer->setSpeechRate(wordsPerMinuteFromSlider(d->m_rateSlider));
    }
    if (wasSpeaking) {
        // A speech channel can take a moment to fall silent; restarting before would be refused.
        for (int attempt = 0; attempt < 19 && d->m_speechSynthesizer->isSpeaking(); ++attempt) {
            QThread::msleep(100);
        }
        playStopVoiceSettings();
    }
}

void VoiceSettingsWindowControllerPrivate::writeVolumeFromSlider()
{
    if (m_speechSynthesizer) {
        m_speechSynthesizer->setObject(qint64(double(float(m_volumeSlider->floatValue())) * FixedOne),
            SpeechSynthesizer::VolumeProperty, 4);
    }
}

void VoiceSettingsWindowController::volumeSliderChanged()
{
    d->writeVolumeFromSlider();
}

void VoiceSettingsWindowController::rateCheckboxClicked()
{
    d->m_rateSlider->setEnabled(d->m_useCustomRateCheckbox->isChecked());
}

void VoiceSettingsWindowController::volumeCheckboxClicked()
{
    d->m_volumeSlider->setEnabled(d->m_useCustomVolumeCheckbox->isChecked());
}

void VoiceSettingsWindowController::speechSynthesizerDidFinishSpeaking(bool finishedSpeaking)
{
    if (finishedSpeaking && d->m_speechSynthesizer && !d->m_speechSynthesizer->isSpeaking()) {
        d->showPlayTitle();
    }
}

void VoiceSettingsWindowController::setValueOfSliderUsingPercentOfNormal(
    QSlider *slider, float percentOfNormal)
{
    const int half = int((slider->maximum() - slider->minimum()) * 0.5);
    const float percent = percentOfNormal * 100.0f;
    const float scaled = percent < 100.0f ? (percent - 50.0f) * 100.0f / 50.0f
                                          : (percent - 100.0f) * 100.0f / 100.0f + 100.0f;
    int position = int(float(half) * scaled / 100.0f);
    if (slider->minimum() > position) {
        position = slider->minimum();
    } else if (position > slider->maximum()) {
        position = slider->maximum();
    }
    slider->setValue(position);
}

void VoiceSettingsWindowController::setValueOfSliderUsingWordsPerMinute(QSlider *slider, float wordsPerMinute)
{
    const float normal = d->m_speechSynthesizer
        ? float(std::trunc(d->m_speechSynthesizer->_normalSpeakingRate()))
        : DefaultWordsPerMinute;
    setValueOfSliderUsingPercentOfNormal(slider, wordsPerMinute / normal);
}

float VoiceSettingsWindowController::percentOfNormalFromSlider(const QSlider *slider) const
{
    const int minimum = slider->minimum();
    const int maximum = slider->maximum();
    const int half = int((maximum - minimum) * 0.5);
    const int value = slider->value();
    double percent;
    if (value >= half) {
        percent = double((value - half) * 100) / (double((maximum - half) * 100) / 100.0) + 100.0;
    } else {
        percent = double((half - value) * 100) / (double((half - minimum) * 100) / -50.0) + 100.0;
    }
    // Whole percent steps only.
    return float(std::trunc(percent) / 100.0);
}

float VoiceSettingsWindowController::wordsPerMinuteFromSlider(const QSlider *slider) const
{
    const float normal = d->m_speechSynthesizer
        ? float(std::trunc(d->m_speechSynthesizer->_normalSpeakingRate()))
        : DefaultWordsPerMinute;
    return percentOfNormalFromSlider(slider) * normal;
}

} // namespace Cadenza
