// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICESETTINGS_VOICESETTINGSWINDOWCONTROLLER_H
#define CADENZA_VOICESETTINGS_VOICESETTINGSWINDOWCONTROLLER_H

#include "cadenza_export.h"

#include <QObject>
#include <QVariantMap>

#include <functional>
#include <memory>

class QCheckBox;
class QDialog;
class QPushButton;
class QSlider;

namespace Cadenza {

class CZFloatSlider;
class CZVoicePopUpButton;
class SpeechSynthesizer;
class VoiceSettingsAlertController;
class VoiceSettingsSheetController;
class VoiceSettingsWindowControllerPrivate;

/**
 * The voice settings dialog: a voice, optionally a custom speaking rate and volume, and a Play button
 * that speaks the voice's demo text with them. The choice travels as a voice-settings dictionary
 * ("VoiceIdentifier", "CustomRelativeRate", "CustomVolume"; see SpeechSynthesizer).
 *
 * Two forms share this controller: a free-standing window (VoiceSettingsAlertController) and a sheet on
 * a client's window (VoiceSettingsSheetController), each made once per process. Clients usually go
 * through SpeechSynthesizerVoiceSettings. The result reaches the modal delegate, a QObject with the
 * invokable method `didEndWithVoiceSettings(QVariant)`: a QVariantMap, or a null QVariant when the
 * user cancelled. A delegate without that method is not called.
 *
 * The rate slider's positions run from 0 to its maximum with normal speed in the middle; its left half
 * covers 50 % to 100 % of the voice's normal rate and its right half 100 % to 200 %.
 */
class CADENZA_EXPORT VoiceSettingsWindowController : public QObject
{
    Q_OBJECT
public:
    ~VoiceSettingsWindowController() override;

    [[nodiscard]] static VoiceSettingsAlertController *defaultVoiceSettingsAlertController();
    [[nodiscard]] static VoiceSettingsSheetController *defaultVoiceSettingsSheetController();

    /// The dialog; made again should a client window have taken it along when it was destroyed.
    [[nodiscard]] QDialog *window();

    /// Sets up and shows the window; when it is already visible, only brings it to the front.
    void showWindowWithVoiceSettings(
        const QVariantMap &voiceSettings, QObject *modalDelegate, const QString &windowTitle = QString());
    /// Sets up and shows the window as a sheet on @p modalForWindow; when visible, only brings it forward.
    void showSheetWithVoiceSettings(
        const QVariantMap &voiceSettings, QObject *modalDelegate, QWidget *modalForWindow);
    /// Loads @p voiceSettings into the controls and makes a new synthesizer from them.
    void setUpWindowWithVoiceSettings(const QVariantMap &voiceSettings, QObject *modalDelegate);
    /// Stops speaking and closes the window.
    virtual void closeWindow();
    /// The dictionary the controls describe now.
    [[nodiscard]] QVariantMap voiceSettingsFromWindow() const;

    /// OK: returns the settings unless the user declines a voice of another language.
    void saveVoiceSettings();
    void cancelVoiceSettings();
    void playStopVoiceSettings();
    void voicePopupMenuChanged();
    void rateSliderChanged();
    void volumeSliderChanged();
    void rateCheckboxClicked();
    void volumeCheckboxClicked();
    void speechSynthesizerDidFinishSpeaking(bool finishedSpeaking);

    void setValueOfSliderUsingPercentOfNormal(QSlider *slider, float percentOfNormal);
    void setValueOfSliderUsingWordsPerMinute(QSlider *slider, float wordsPerMinute);
    [[nodiscard]] float percentOfNormalFromSlider(const QSlider *slider) const;
    [[nodiscard]] float wordsPerMinuteFromSlider(const QSlider *slider) const;

    [[nodiscard]] SpeechSynthesizer *speechSynthesizer() const;
    [[nodiscard]] CZVoicePopUpButton *voicePopupMenu() const;
    [[nodiscard]] QSlider *rateSlider() const;
    [[nodiscard]] CZFloatSlider *volumeSlider() const;
    [[nodiscard]] QCheckBox *useCustomRateCheckbox() const;
    [[nodiscard]] QCheckBox *useCustomVolumeCheckbox() const;
    [[nodiscard]] QPushButton *startStopSpeakingButton() const;

protected:
    /// @p windowLoader makes the dialog from an interface file with the outlets' object names.
    explicit VoiceSettingsWindowController(
        std::function<QDialog *()> windowLoader, QObject *parent = nullptr);

private:
    friend class VoiceSettingsWindowControllerPrivate;
    std::unique_ptr<VoiceSettingsWindowControllerPrivate> const d;
};

} // namespace Cadenza

#endif
