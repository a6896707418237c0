// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZVoiceRowTextView.h"

namespace Cadenza {

CZVoiceRowTextView::CZVoiceRowTextView(QWidget *parent)
    : Platform::ClickThroughLabel(parent)
{ }

} // namespace Cadenza
