// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICESETTINGS_VOICESETTINGSWINDOWCONTROLLER_P_H
#define CADENZA_VOICESETTINGS_VOICESETTINGSWINDOWCONTROLLER_P_H

#include "core/voices/SpeechSynthesizer.h"
#include "widgets/voice-settings/VoiceSettingsWindowController.h"

#include <QPointer>

class QLabel;

// Not public API: the voice settings dialog's outlets, state and internal operations.
namespace Cadenza {

class VoiceSettingsWindowControllerPrivate
{
public:
    VoiceSettingsWindowControllerPrivate(
        VoiceSettingsWindowController *q, std::function<QDialog *()> windowLoader);

    void loadWindow();
    void replaceSynthesizer(std::unique_ptr<SpeechSynthesizer> synthesizer);
    void writeVolumeFromSlider();
    void tellDelegate(const QVariant &settings);
    void showPlayTitle();

    VoiceSettingsWindowController *const q;
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
