// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZSRLanguageRowCheckboxButton.h"

namespace Cadenza {

CZSRLanguageRowCheckboxButton::CZSRLanguageRowCheckboxButton(QWidget *parent)
    : Platform::IdentifiedCheckBox(parent)
{ }

} // namespace Cadenza
