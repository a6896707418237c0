// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZSRLanguageRowTextView.h"

namespace Cadenza {

CZSRLanguageRowTextView::CZSRLanguageRowTextView(QWidget *parent)
    : Platform::ClickThroughLabel(parent)
{ }

} // namespace Cadenza
