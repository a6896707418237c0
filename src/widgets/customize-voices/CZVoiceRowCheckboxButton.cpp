// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZVoiceRowCheckboxButton.h"

namespace Cadenza {

CZVoiceRowCheckboxButton::CZVoiceRowCheckboxButton(QWidget *parent)
    : Platform::IdentifiedCheckBox(parent)
{ }

} // namespace Cadenza
