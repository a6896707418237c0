// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "VoiceSettingsAlertController.h"

#include "ui_VoiceSettingsWindow.h"

namespace Cadenza {

namespace {
QDialog *makeWindowFromInterfaceFile()
{
    auto *window = new QDialog;
    Ui::VoiceSettingsWindow().setupUi(window);
    return window;
}
} // namespace

VoiceSettingsAlertController::VoiceSettingsAlertController(QObject *parent)
    : VoiceSettingsWindowController(&makeWindowFromInterfaceFile, parent)
{ }

} // namespace Cadenza
