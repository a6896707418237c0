// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_CUSTOMIZESHEETROWVIEW_H
#define CADENZA_PLATFORM_CUSTOMIZESHEETROWVIEW_H

#include "cadenza_export.h"
#include "widgets/helpers/RowView.h"

class QComboBox;
class QLabel;

namespace Cadenza {

/**
 * The view of one item row of a customise sheet: the show tick, the item's name, a download status
 * line and the choice between the item's two download sizes, laid out in that order; a sheet may add
 * controls after them.
 *
 * The children carry object names ("activeCheckbox", "textField", "downloadMessageTextField",
 * "downloadVariantPopUpButton") so tests and style sheets can find them. The size pop-up holds two
 * items whose data are the tags 0 (compact) and 1 (full size).
 */
class CADENZA_EXPORT CustomizeSheetRowView : public Platform::RowView
{
    Q_OBJECT
public:
    ~CustomizeSheetRowView() override;

    [[nodiscard]] QLabel *downloadMessageTextField() const { return m_downloadMessageTextField; }
    [[nodiscard]] QComboBox *downloadVariantPopUpButton() const { return m_downloadVariantPopUpButton; }

protected:
    /// Takes @p tick and @p textField as its own; @p objectName names the row.
    CustomizeSheetRowView(
        QAbstractButton *tick, QLabel *textField, const QString &objectName, QWidget *parent);
    /// Adds @p control after the size pop-up.
    void addTrailingControl(QWidget *control);

private:
    QLabel *m_downloadMessageTextField;
    QComboBox *m_downloadVariantPopUpButton;
};

} // namespace Cadenza

#endif
