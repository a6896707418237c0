// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZSRLanguageTableCellView.h"

#include "CZSRLanguageRowCheckboxButton.h"
#include "CZSRLanguageRowTextView.h"

namespace Cadenza {

CZSRLanguageTableCellView::CZSRLanguageTableCellView(QWidget *parent)
    : CustomizeSheetRowView(
        new CZSRLanguageRowCheckboxButton, new CZSRLanguageRowTextView, QStringLiteral("LanguageRow"), parent)
{ }

CZSRLanguageTableCellView::~CZSRLanguageTableCellView() = default;

CZSRLanguageRowCheckboxButton *CZSRLanguageTableCellView::activeCheckbox() const
{
    return static_cast<CZSRLanguageRowCheckboxButton *>(tick());
}

CZSRLanguageRowTextView *CZSRLanguageTableCellView::textField() const
{
    return static_cast<CZSRLanguageRowTextView *>(nameLabel());
}

} // namespace Cadenza
