// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_ROWVIEWTABLE_H
#define CADENZA_PLATFORM_ROWVIEWTABLE_H

#include "cadenza_export.h"

#include <QAccessible>
#include <QHash>
#include <QTableView>

namespace Cadenza::Platform {

/**
 * The table of a customise sheet, whose item rows are shown by row views (RowView) and whose headings
 * are drawn by the table, for keyboard and screen-reader users:
 *
 * - Tab and Shift+Tab leave the table; Tab first visits the current row's shown controls (size pop-up,
 *   upgrade tick), then goes on to the window's next control.
 * - Arrow, page, Home and End keys move between item rows and pass over headings.
 * - The selected row is painted with the highlight colours, row view included.
 * - Over the accessibility bridge the table is a list of headings and check boxes (RowViewTableAccessible);
 *   moving the current row reports the focus on that row's check box.
 * - Escape pressed inside a row's control goes to the window (Cancel), as everywhere else.
 */
class CADENZA_EXPORT RowViewTable : public QTableView
{
    Q_OBJECT
public:
    explicit RowViewTable(QWidget *parent = nullptr);
    ~RowViewTable() override;

    void setModel(QAbstractItemModel *model) override;

    /// Takes @p view in as the view of @p row, just placed with setIndexWidget().
    void adoptRowView(int row, QWidget *view);
    /// The row @p view shows; -1 when it shows none.
    [[nodiscard]] int rowOfView(const QWidget *view) const;
    /// Whether @p row is a heading: shown, never selected.
    [[nodiscard]] bool isHeadingRow(int row) const;
    /// What assistive technology reads for @p row: its row view, or a stand-in made from the model.
    [[nodiscard]] QAccessibleInterface *accessibleRow(int row) const;

protected:
    QModelIndex moveCursor(CursorAction cursorAction, Qt::KeyboardModifiers modifiers) override;
    bool focusNextPrevChild(bool next) override;
    void currentChanged(const QModelIndex &current, const QModelIndex &previous) override;
    void selectionChanged(const QItemSelection &selected, const QItemSelection &deselected) override;
    void focusInEvent(QFocusEvent *event) override;
    bool eventFilter(QObject *watched, QEvent *event) override;

private:
    void forgetAccessibleRows();
    void reportFocusOnCurrentRow();
    void highlightRowViews();
    [[nodiscard]] QWidget *nextControlAfterTable(bool next) const;

    mutable QHash<int, QAccessible::Id> m_accessibleRows;
    QList<QMetaObject::Connection> m_modelConnections;
};

} // namespace Cadenza::Platform

#endif
