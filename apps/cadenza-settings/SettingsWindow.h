// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_SETTINGS_SETTINGSWINDOW_H
#define CADENZA_SETTINGS_SETTINGSWINDOW_H

#include <QVariant>
#include <QWidget>

class QLabel;
class QPushButton;
class QProgressBar;

class QComboBox;

namespace Cadenza {
class CZSRLanguagePopUpButton;
class CZVoicePopUpButton;
} // namespace Cadenza

/**
 * The main window of cadenza-settings: the voice pop-up with its download status line; buttons that
 * open the voice settings dialog as a window and as a sheet and show what it returned; the dictation
 * language pop-up with its status line and a choice of the locale lists it offers.
 */
class SettingsWindow : public QWidget
{
    Q_OBJECT
public:
    explicit SettingsWindow(QWidget *parent = nullptr);

    [[nodiscard]] Cadenza::CZVoicePopUpButton *voicePopUp() const { return m_voicePopUp; }
    [[nodiscard]] Cadenza::CZSRLanguagePopUpButton *languagePopUp() const { return m_languagePopUp; }
    /// The voice settings the dialog returned last.
    [[nodiscard]] QVariantMap voiceSettings() const { return m_voiceSettings; }

    /// Receives the voice settings dialog's answer: a QVariantMap, or null when cancelled.
    Q_INVOKABLE void didEndWithVoiceSettings(const QVariant &settings);

    /// Makes the voice chosen in the pop-up the user's system voice, for every process.
    void systemVoiceChosen();
    void openVoiceSettingsWindow();
    void openVoiceSettingsSheet();
    /// Installs speech-dispatcher's module for this user, or removes it when installed.
    void toggleSpeechDispatcherModule();

private:
    void showVoiceSettings();
    void rebuildLanguages();
    void showSpeechDispatcherModuleState();

    Cadenza::CZVoicePopUpButton *m_voicePopUp;
    QLabel *m_downloadStatus;
    QProgressBar *m_downloadIndicator;
    QLabel *m_voiceSettingsSummary;
    Cadenza::CZSRLanguagePopUpButton *m_languagePopUp;
    QLabel *m_languageStatus;
    QProgressBar *m_languageIndicator;
    QComboBox *m_localeLists;
    QVariantMap m_voiceSettings;
    QPushButton *m_speechDispatcherButton;
    QLabel *m_speechDispatcherStatus;
};

#endif
