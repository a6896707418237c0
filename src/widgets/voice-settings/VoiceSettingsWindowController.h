#ifndef CADENZA_VOICESETTINGS_VOICESETTINGSWINDOWCONTROLLER_H
#define CADENZA_VOICESETTINGS_VOICESETTINGSWINDOWCONTROLLER_H

#include "cadenza_export.h"

#include <QObject>
#include <QPointer>
#include <QVariantMap>

#include <functional>
#include <memory>

class QCheckBox;
class QDialog;
class QLabel;
class QPushButton;
class QSlider;

namespace Cadenza {

class CZFloatSlider;
class CZVoicePopUpButton;
class SpeechSynthesizer;
class VoiceSettingsAlertController;
class VoiceSettingsSheetController;

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

    [[nodiscard]] SpeechSynthesizer *speechSynthesizer() const { return m_speechSynthesizer.get(); }
    [[nodiscard]] CZVoicePopUpButton *voicePopupMenu() const { return m_voicePopupMenu; }
    [[nodiscard]] QSlider *rateSlider() const { return m_rateSlider; }
    [[nodiscard]] CZFloatSlider *volumeSlider() const { return m_volumeSlider; }
    [[nodiscard]] QCheckBox *useCustomRateCheckbox() const { return m_useCustomRateCheckbox; }
    [[nodiscard]] QCheckBox *useCustomVolumeCheckbox() const { return m_useCustomVolumeCheckbox; }
    [[nodiscard]] QPushButton *startStopSpeakingButton() const { return m_startStopSpeakingButton; }

protected:
    /// @p windowLoader makes the dialog from an interface file with the outlets' object names.
    explicit VoiceSettingsWindowController(
        std::function<QDialog *()> windowLoader, QObject *parent = nullptr);

private:
    void loadWindow();
    void replaceSynthesizer(std::unique_ptr<SpeechSynthesizer> synthesizer);
    void writeVolumeFromSlider();
    void tellDelegate(const QVariant &settings);
    void showPlayTitle();

    std::function<QDialog *()> m_windowLoader;
    QPointer<QDialog> m_window;
    QCheckBox *m_useCustomRateCheckbox = nullptr;
    QCheckBox *m_useCustomVolumeCheckbox = nullptr;
    QPushButton *m_startStopSpeakingButton = nullptr;
    QSlider *m_rateSlider = nullptr;
    CZFloatSlider *m_volumeSlider = nullptr;
    QLabel *m_volumeQuietIcon = nullptr;
    QLabel *m_volumeLoudIcon = nullptr;
    CZVoicePopUpButton *m_voicePopupMenu = nullptr;
    std::unique_ptr<SpeechSynthesizer> m_speechSynthesizer;
    QPointer<QObject> m_modalDelegate;
    QString m_playDisplayString;
    bool m_closing = false;
};

} // namespace Cadenza

#endif
