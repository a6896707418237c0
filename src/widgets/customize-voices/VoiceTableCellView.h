// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_CUSTOMIZEVOICES_VOICETABLECELLVIEW_H
#define CADENZA_CUSTOMIZEVOICES_VOICETABLECELLVIEW_H

#include "cadenza_export.h"
#include "widgets/helpers/CustomizeSheetRowView.h"

namespace Cadenza {

class CZVoiceRowCheckboxButton;
class CZVoiceRowTextView;

/**
 * The view of one voice row in the customise voices table: the row of every customise sheet (show
 * tick, name, download status line, size choice) and, after them, the upgrade tick
 * ("downloadCheckbox").
 */
class CADENZA_EXPORT VoiceTableCellView : public CustomizeSheetRowView
{
    Q_OBJECT
public:
    explicit VoiceTableCellView(QWidget *parent = nullptr);
    ~VoiceTableCellView() override;

    [[nodiscard]] CZVoiceRowCheckboxButton *activeCheckbox() const;
    [[nodiscard]] CZVoiceRowTextView *textField() const;
    [[nodiscard]] CZVoiceRowCheckboxButton *downloadCheckbox() const { return m_downloadCheckbox; }

private:
    CZVoiceRowCheckboxButton *m_downloadCheckbox;
};

} // namespace Cadenza

#endif
