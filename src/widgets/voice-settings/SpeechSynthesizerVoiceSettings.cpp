// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "SpeechSynthesizerVoiceSettings.h"

#include "widgets/voice-settings/VoiceSettingsAlertController.h"
#include "widgets/voice-settings/VoiceSettingsSheetController.h"

namespace Cadenza {

void SpeechSynthesizerVoiceSettings::beginAlertForVoiceSettings(
    const QVariantMap &voiceSettings, QObject *modalDelegate, const QString &windowTitle)
{
    VoiceSettingsWindowController::defaultVoiceSettingsAlertController()->showWindowWithVoiceSettings(
        voiceSettings, modalDelegate, windowTitle);
}

void SpeechSynthesizerVoiceSettings::beginSheetForVoiceSettings(
    const QVariantMap &voiceSettings, QObject *modalDelegate, QWidget *modalForWindow)
{
    VoiceSettingsWindowController::defaultVoiceSettingsSheetController()->showSheetWithVoiceSettings(
        voiceSettings, modalDelegate, modalForWindow);
}

void SpeechSynthesizerVoiceSettings::endAlertSavingChanges(bool savingChanges)
{
    VoiceSettingsAlertController *controller
        = VoiceSettingsWindowController::defaultVoiceSettingsAlertController();
    savingChanges ? controller->saveVoiceSettings() : controller->cancelVoiceSettings();
}

void SpeechSynthesizerVoiceSettings::endSheetSavingChanges(bool savingChanges)
{
    VoiceSettingsSheetController *controller
        = VoiceSettingsWindowController::defaultVoiceSettingsSheetController();
    savingChanges ? controller->saveVoiceSettings() : controller->cancelVoiceSettings();
}

} // namespace Cadenza
