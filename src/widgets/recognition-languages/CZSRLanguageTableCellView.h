// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGETABLECELLVIEW_H
#define CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGETABLECELLVIEW_H

#include "cadenza_export.h"
#include "widgets/helpers/CustomizeSheetRowView.h"

namespace Cadenza {

class CZSRLanguageRowCheckboxButton;
class CZSRLanguageRowTextView;

/**
 * The view of one language row in the customise recognition languages table: the show tick, the
 * country (the language is the heading above), a status line and the choice between two download
 * sizes.
 */
class CADENZA_EXPORT CZSRLanguageTableCellView : public CustomizeSheetRowView
{
    Q_OBJECT
public:
    explicit CZSRLanguageTableCellView(QWidget *parent = nullptr);
    ~CZSRLanguageTableCellView() override;

    [[nodiscard]] CZSRLanguageRowCheckboxButton *activeCheckbox() const;
    [[nodiscard]] CZSRLanguageRowTextView *textField() const;
};

} // namespace Cadenza

#endif
