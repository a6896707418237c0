#ifndef CADENZA_SETTINGS_SETTINGSWINDOW_H
#define CADENZA_SETTINGS_SETTINGSWINDOW_H

#include <QVariant>
#include <QWidget>

class QLabel;
class QProgressBar;

namespace Cadenza {
class CZVoicePopUpButton;
}

/**
 * The main window of cadenza-settings: the voice pop-up with its download status line, and buttons
 * that open the voice settings dialog as a window and as a sheet and show what it returned.
 */
class SettingsWindow : public QWidget
{
    Q_OBJECT
public:
    explicit SettingsWindow(QWidget *parent = nullptr);

    [[nodiscard]] Cadenza::CZVoicePopUpButton *voicePopUp() const { return m_voicePopUp; }
    /// The voice settings the dialog returned last.
    [[nodiscard]] QVariantMap voiceSettings() const { return m_voiceSettings; }

    /// Receives the voice settings dialog's answer: a QVariantMap, or null when cancelled.
    Q_INVOKABLE void didEndWithVoiceSettings(const QVariant &settings);

    void openVoiceSettingsWindow();
    void openVoiceSettingsSheet();

private:
    void showVoiceSettings();

    Cadenza::CZVoicePopUpButton *m_voicePopUp;
    QLabel *m_downloadStatus;
    QProgressBar *m_downloadIndicator;
    QLabel *m_voiceSettingsSummary;
    QVariantMap m_voiceSettings;
};

#endif
