// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "VoiceSettingsSheetController.h"

#include "ui_VoiceSettingsSheet.h"

namespace Cadenza {

namespace {
QDialog *makeWindowFromInterfaceFile()
{
    auto *window = new QDialog;
    Ui::VoiceSettingsSheet().setupUi(window);
    return window;
}
} // namespace

VoiceSettingsSheetController::VoiceSettingsSheetController(QObject *parent)
    : VoiceSettingsWindowController(&makeWindowFromInterfaceFile, parent)
{ }

void VoiceSettingsSheetController::closeWindow()
{
    if (window()->isVisible()) {
        // Hiding a window-modal dialog ends the sheet: the parent window takes input again.
        window()->hide();
    }
    VoiceSettingsWindowController::closeWindow();
}

} // namespace Cadenza
