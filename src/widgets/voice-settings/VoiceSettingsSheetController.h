// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICESETTINGS_VOICESETTINGSSHEETCONTROLLER_H
#define CADENZA_VOICESETTINGS_VOICESETTINGSSHEETCONTROLLER_H

#include "widgets/voice-settings/VoiceSettingsWindowController.h"

namespace Cadenza {

/// The voice settings dialog as a sheet (window-modal) on a client's window, from "VoiceSettingsSheet.ui".
class CADENZA_EXPORT VoiceSettingsSheetController : public VoiceSettingsWindowController
{
    Q_OBJECT
public:
    explicit VoiceSettingsSheetController(QObject *parent = nullptr);

    /// Ends the sheet first when it is up.
    void closeWindow() override;
};

} // namespace Cadenza

#endif
