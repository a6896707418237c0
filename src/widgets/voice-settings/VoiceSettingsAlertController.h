// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICESETTINGS_VOICESETTINGSALERTCONTROLLER_H
#define CADENZA_VOICESETTINGS_VOICESETTINGSALERTCONTROLLER_H

#include "widgets/voice-settings/VoiceSettingsWindowController.h"

namespace Cadenza {

/// The voice settings dialog as a free-standing window, made from "VoiceSettingsWindow.ui".
class CADENZA_EXPORT VoiceSettingsAlertController : public VoiceSettingsWindowController
{
    Q_OBJECT
public:
    explicit VoiceSettingsAlertController(QObject *parent = nullptr);
};

} // namespace Cadenza

#endif
