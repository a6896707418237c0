#include "VoiceSettingsWindowController.h"

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

VoiceSettingsWindowController::VoiceSettingsWindowController(
    std::function<QDialog *()> windowLoader, QObject *parent)
    : QObject(parent)
    , m_windowLoader(std::move(windowLoader))
{
    loadWindow();
}

void VoiceSettingsWindowController::loadWindow()
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

    connect(m_useCustomRateCheckbox, &QCheckBox::clicked, this,
        &VoiceSettingsWindowController::rateCheckboxClicked);
    connect(m_useCustomVolumeCheckbox, &QCheckBox::clicked, this,
        &VoiceSettingsWindowController::volumeCheckboxClicked);
    connect(m_startStopSpeakingButton, &QPushButton::clicked, this,
        &VoiceSettingsWindowController::playStopVoiceSettings);
    connect(m_rateSlider, &QSlider::valueChanged, this, &VoiceSettingsWindowController::rateSliderChanged);
    connect(
        m_volumeSlider, &QSlider::valueChanged, this, &VoiceSettingsWindowController::volumeSliderChanged);
    connect(m_voicePopupMenu, &CZVoicePopUpButton::voiceActivated, this,
        &VoiceSettingsWindowController::voicePopupMenuChanged);
    if (auto *ok = window->findChild<QPushButton *>(QStringLiteral("okButton"))) {
        connect(ok, &QPushButton::clicked, this, &VoiceSettingsWindowController::saveVoiceSettings);
    }
    if (auto *cancel = window->findChild<QPushButton *>(QStringLiteral("cancelButton"))) {
        connect(cancel, &QPushButton::clicked, this, &VoiceSettingsWindowController::cancelVoiceSettings);
    }
    // Escape and the window's close button mean Cancel.
    connect(m_window, &QDialog::rejected, this, [this] {
        if (!m_closing) {
            cancelVoiceSettings();
        }
    });
}

VoiceSettingsWindowController::~VoiceSettingsWindowController()
{
    if (m_speechSynthesizer) {
        m_speechSynthesizer->stopSpeaking();
    }
    delete m_window.data();
}

QDialog *VoiceSettingsWindowController::window()
{
    // A sheet's window dies with a client window that is closed for good; make it again.
    if (!m_window) {
        loadWindow();
    }
    return m_window;
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

void VoiceSettingsWindowController::replaceSynthesizer(std::unique_ptr<SpeechSynthesizer> synthesizer)
{
    m_speechSynthesizer = std::move(synthesizer);
    if (m_speechSynthesizer) {
        connect(m_speechSynthesizer.get(), &SpeechSynthesizer::didFinishSpeaking, this,
            &VoiceSettingsWindowController::speechSynthesizerDidFinishSpeaking);
    }
}

void VoiceSettingsWindowController::setUpWindowWithVoiceSettings(
    const QVariantMap &voiceSettings, QObject *modalDelegate)
{
    (void)window();
    replaceSynthesizer(SpeechSynthesizer::initWithVoiceSettings(voiceSettings));
    m_modalDelegate = modalDelegate;
    QStyle *style = m_window->style();
    m_volumeQuietIcon->setPixmap(style->standardIcon(QStyle::SP_MediaVolumeMuted).pixmap(16, 16));
    m_volumeLoudIcon->setPixmap(style->standardIcon(QStyle::SP_MediaVolume).pixmap(16, 16));

    m_voicePopupMenu->setAllowSystemVoiceChoice(true);
    const QVariant voice = voiceSettings.value(kVoiceSettingsVoiceIdentifierKey);
    m_voicePopupMenu->buildPopUpButtonWithSelectVoiceIdentifier(
        voice.typeId() == QMetaType::QString ? voice.toString() : QString());

    const QSignalBlocker rateBlocker(m_rateSlider);
    const QVariant rate = voiceSettings.value(kVoiceSettingsCustomRelativeRateKey);
    const bool customRate = SpeechItemPrivate::isNumber(rate);
    setValueOfSliderUsingPercentOfNormal(m_rateSlider, customRate ? rate.toFloat() : 1.0f);
    m_useCustomRateCheckbox->setChecked(customRate);
    m_rateSlider->setEnabled(customRate);

    const QSignalBlocker volumeBlocker(m_volumeSlider);
    const QVariant volume = voiceSettings.value(kVoiceSettingsCustomVolumeKey);
    const bool customVolume = SpeechItemPrivate::isNumber(volume);
    if (customVolume) {
        m_volumeSlider->setFloatValue(volume.toDouble());
    } else {
        const qint32 current = m_speechSynthesizer
            ? qint32(
                m_speechSynthesizer
                    ->objectForProperty(SpeechSynthesizer::VolumeProperty, 4, QMetaType::fromType<qint32>())
                    .toLongLong())
            : 0;
        m_volumeSlider->setFloatValue(double(current) * 1.52587890625e-5);
    }
    m_useCustomVolumeCheckbox->setChecked(customVolume);
    m_volumeSlider->setEnabled(customVolume);

    if (m_playDisplayString.isNull()) {
        m_playDisplayString = m_startStopSpeakingButton->text();
    }
}

void VoiceSettingsWindowController::showWindowWithVoiceSettings(
    const QVariantMap &voiceSettings, QObject *modalDelegate, const QString &windowTitle)
{
    if (window()->isVisible()) {
        m_window->raise();
        m_window->activateWindow();
        return;
    }
    setUpWindowWithVoiceSettings(voiceSettings, modalDelegate);
    if (!windowTitle.isEmpty()) {
        m_window->setWindowTitle(windowTitle);
    }
    m_window->show();
}

void VoiceSettingsWindowController::showSheetWithVoiceSettings(
    const QVariantMap &voiceSettings, QObject *modalDelegate, QWidget *modalForWindow)
{
    if (window()->isVisible()) {
        m_window->raise();
        m_window->activateWindow();
        return;
    }
    setUpWindowWithVoiceSettings(voiceSettings, modalDelegate);
    if (modalForWindow) {
        m_window->setParent(modalForWindow->window(), m_window->windowFlags());
    }
    m_window->setWindowModality(modalForWindow ? Qt::WindowModal : Qt::ApplicationModal);
    m_window->show();
}

void VoiceSettingsWindowController::showPlayTitle()
{
    m_startStopSpeakingButton->setText(
        m_playDisplayString.isNull() ? texts().text(QStringLiteral("PlayButtonName")) : m_playDisplayString);
}

void VoiceSettingsWindowController::closeWindow()
{
    if (m_speechSynthesizer) {
        m_speechSynthesizer->stopSpeaking();
    }
    showPlayTitle();
    if (!m_window) {
        return;
    }
    m_closing = true;
    m_window->hide();
    if (m_window->parentWidget()) {
        // Back to a window of its own, so the client's window can go without taking it along.
        m_window->setParent(nullptr, m_window->windowFlags());
    }
    m_closing = false;
}

QVariantMap VoiceSettingsWindowController::voiceSettingsFromWindow() const
{
    QVariantMap settings;
    if (m_voicePopupMenu->selectedVoiceAttributes() && m_speechSynthesizer) {
        settings.insert(kVoiceSettingsVoiceIdentifierKey, m_speechSynthesizer->voice());
    }
    if (m_useCustomRateCheckbox->isChecked()) {
        settings.insert(kVoiceSettingsCustomRelativeRateKey, percentOfNormalFromSlider(m_rateSlider));
    }
    if (m_useCustomVolumeCheckbox->isChecked()) {
        settings.insert(kVoiceSettingsCustomVolumeKey, float(m_volumeSlider->floatValue()));
    }
    return settings;
}

void VoiceSettingsWindowController::tellDelegate(const QVariant &settings)
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
    const bool ok
        = m_voicePopupMenu->isSelectedVoiceAppropriateForCurrentLanguageWithUserConfirmation(true, nullptr);
    if (ok) {
        closeWindow();
    }
    // Told even when the user keeps the dialog open to choose again: nil, then.
    tellDelegate(ok ? QVariant(settings) : QVariant());
}

void VoiceSettingsWindowController::cancelVoiceSettings()
{
    closeWindow();
    tellDelegate(QVariant());
}

void VoiceSettingsWindowController::playStopVoiceSettings()
{
    if (!m_speechSynthesizer) {
        return;
    }
    if (m_speechSynthesizer->isSpeaking()) {
        m_speechSynthesizer->stopSpeaking();
        showPlayTitle();
        return;
    }
    const QString demoText = Platform::Services::speechSynthesis()
                                 .attributesForVoice(m_speechSynthesizer->voice())
                                 .value(Platform::VoiceAttribute::DemoText)
                                 .toString();
    if (m_speechSynthesizer->startSpeakingString(demoText)) {
        m_startStopSpeakingButton->setText(m_startStopSpeakingButton->property("alternateTitle").toString());
    }
}

void VoiceSettingsWindowController::voicePopupMenuChanged()
{
    const bool wasSpeaking = m_speechSynthesizer && m_speechSynthesizer->isSpeaking();
    if (m_speechSynthesizer) {
        m_speechSynthesizer->stopSpeaking();
    }
    showPlayTitle();
    const auto attributes = m_voicePopupMenu->selectedVoiceAttributes();
    replaceSynthesizer(SpeechSynthesizer::initWithVoice(
        attributes ? attributes->value(Platform::VoiceAttribute::Identifier).toString() : QString()));
    if (m_speechSynthesizer && m_useCustomRateCheckbox->isChecked()) {
        m_speechSynthesizer->setSpeechRate(wordsPerMinuteFromSlider(m_rateSlider));
    }
    if (m_useCustomVolumeCheckbox->isChecked()) {
        writeVolumeFromSlider();
    }
    if (wasSpeaking) {
        playStopVoiceSettings();
    }
}

void VoiceSettingsWindowController::rateSliderChanged()
{
    const bool wasSpeaking = m_speechSynthesizer && m_speechSynthesizer->isSpeaking();
    if (wasSpeaking) {
        m_speechSynthesizer->stopSpeaking();
        showPlayTitle();
    }
    if (m_speechSynthesizer) {
        m_speechSynthesizer->setSpeechRate(wordsPerMinuteFromSlider(m_rateSlider));
    }
    if (wasSpeaking) {
        // A speech channel can take a moment to fall silent; restarting before would be refused.
        for (int attempt = 0; attempt < 19 && m_speechSynthesizer->isSpeaking(); ++attempt) {
            QThread::msleep(100);
        }
        playStopVoiceSettings();
    }
}

void VoiceSettingsWindowController::writeVolumeFromSlider()
{
    if (m_speechSynthesizer) {
        m_speechSynthesizer->setObject(qint64(double(float(m_volumeSlider->floatValue())) * FixedOne),
            SpeechSynthesizer::VolumeProperty, 4);
    }
}

void VoiceSettingsWindowController::volumeSliderChanged()
{
    writeVolumeFromSlider();
}

void VoiceSettingsWindowController::rateCheckboxClicked()
{
    m_rateSlider->setEnabled(m_useCustomRateCheckbox->isChecked());
}

void VoiceSettingsWindowController::volumeCheckboxClicked()
{
    m_volumeSlider->setEnabled(m_useCustomVolumeCheckbox->isChecked());
}

void VoiceSettingsWindowController::speechSynthesizerDidFinishSpeaking(bool finishedSpeaking)
{
    if (finishedSpeaking && m_speechSynthesizer && !m_speechSynthesizer->isSpeaking()) {
        showPlayTitle();
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
    const float normal = m_speechSynthesizer ? float(std::trunc(m_speechSynthesizer->_normalSpeakingRate()))
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
    const float normal = m_speechSynthesizer ? float(std::trunc(m_speechSynthesizer->_normalSpeakingRate()))
                                             : DefaultWordsPerMinute;
    return percentOfNormalFromSlider(slider) * normal;
}

} // namespace Cadenza
