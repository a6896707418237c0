// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "VoiceTableCellView.h"

#include "CZVoiceRowCheckboxButton.h"
#include "CZVoiceRowTextView.h"

#include <QComboBox>

namespace Cadenza {

VoiceTableCellView::VoiceTableCellView(QWidget *parent)
    : CustomizeSheetRowView(
        new CZVoiceRowCheckboxButton, new CZVoiceRowTextView, QStringLiteral("VoiceRow"), parent)
    , m_downloadCheckbox(new CZVoiceRowCheckboxButton)
{
    // Before the upgrade tick joins, which applies the row's focus rules once more: the new policy
    // gives the pop-up a list that would otherwise be a tab stop of its own.
    downloadVariantPopUpButton()->setSizeAdjustPolicy(QComboBox::AdjustToContents);
    m_downloadCheckbox->setObjectName(QStringLiteral("downloadCheckbox"));
    m_downloadCheckbox->hide();
    addTrailingControl(m_downloadCheckbox);
}

VoiceTableCellView::~VoiceTableCellView() = default;

CZVoiceRowCheckboxButton *VoiceTableCellView::activeCheckbox() const
{
    return static_cast<CZVoiceRowCheckboxButton *>(tick());
}

CZVoiceRowTextView *VoiceTableCellView::textField() const
{
    return static_cast<CZVoiceRowTextView *>(nameLabel());
}

} // namespace Cadenza
