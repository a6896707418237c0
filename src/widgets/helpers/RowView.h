// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_ROWVIEW_H
#define CADENZA_PLATFORM_ROWVIEW_H

#include "cadenza_export.h"

#include <QWidget>

class QAbstractButton;
class QLabel;

namespace Cadenza::Platform {

/**
 * The view of one item row of a customise sheet: a tick that stands for the row, the label naming it,
 * a status line and further controls (a size pop-up, an upgrade tick).
 *
 * Over the accessibility bridge the row is one check box named after the item, checked as its tick
 * is, whose children are the status line and the further controls (see RowViewAccessible). The tick
 * and the label take no focus of their own: the table holds the focus and Space ticks its current row;
 * Tab from the table reaches the current row's further controls (see RowViewTable).
 */
class CADENZA_EXPORT RowView : public QWidget
{
    Q_OBJECT
public:
    explicit RowView(QWidget *parent = nullptr);
    ~RowView() override;

    /// The tick that stands for the row.
    [[nodiscard]] QAbstractButton *tick() const { return m_tick; }
    /// The label that shows the row's name; it is read as the tick's name, not on its own.
    [[nodiscard]] QLabel *nameLabel() const { return m_nameLabel; }
    [[nodiscard]] QLabel *statusLabel() const { return m_statusLabel; }
    /// What a screen reader calls the row: the tick's accessible name, else the label's text.
    [[nodiscard]] QString accessibleRowName() const;
    /// The shown controls, other than the tick, a keyboard user reaches with Tab from the table.
    [[nodiscard]] QList<QWidget *> keyboardControls() const;
    /// Paints the row as selected (the table's highlight) or plain.
    void setHighlighted(bool highlighted);
    [[nodiscard]] bool isHighlighted() const { return m_highlighted; }

    /// Sets the row status @p label (a RowView's status label) to @p text and, when it changed, tells
    /// assistive technology, so a screen reader on the row hears "Downloading 40 %".
    static void setStatusText(QLabel *label, const QString &text);

protected:
    /// Names the parts; subclasses call it once their children exist.
    void setParts(QAbstractButton *tick, QLabel *nameLabel, QLabel *statusLabel);

private:
    // Children of this view, so they live as long as it does.
    QAbstractButton *m_tick = nullptr;
    QLabel *m_nameLabel = nullptr;
    QLabel *m_statusLabel = nullptr;
    bool m_highlighted = false;
};

} // namespace Cadenza::Platform

#endif
