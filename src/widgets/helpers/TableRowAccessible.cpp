// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TableRowAccessible.h"

#include "GroupedRowsModel.h"
#include "RowViewTable.h"

#include <QItemSelectionModel>

namespace Cadenza::Platform {

TableRowAccessible::TableRowAccessible(RowViewTable *table, int row)
    : m_table(table)
    , m_row(row)
{ }

bool TableRowAccessible::isValid() const
{
    return m_table && m_table->model() && m_row >= 0 && m_row < m_table->model()->rowCount();
}

QWindow *TableRowAccessible::window() const
{
    return m_table ? m_table->window()->windowHandle() : nullptr;
}

QAccessibleInterface *TableRowAccessible::parent() const
{
    return m_table ? QAccessible::queryAccessibleInterface(m_table.data()) : nullptr;
}

bool TableRowAccessible::isHeading() const
{
    return m_table && m_table->isHeadingRow(m_row);
}

QString TableRowAccessible::text(QAccessible::Text t) const
{
    if (!isValid() || t != QAccessible::Name) {
        return {};
    }
    const QModelIndex index = m_table->model()->index(m_row, 0);
    const QString accessible = index.data(Qt::AccessibleTextRole).toString();
    return accessible.isEmpty() ? index.data(Qt::DisplayRole).toString() : accessible;
}

QRect TableRowAccessible::rect() const
{
    if (!isValid()) {
        return {};
    }
    const QRect local = m_table->visualRect(m_table->model()->index(m_row, 0));
    return QRect(m_table->viewport()->mapToGlobal(local.topLeft()), local.size());
}

QAccessible::Role TableRowAccessible::role() const
{
    return isHeading() ? QAccessible::Heading : QAccessible::CheckBox;
}

QAccessible::State TableRowAccessible::state() const
{
    QAccessible::State state;
    if (!isValid()) {
        state.invalid = true;
        return state;
    }
    const QRect local = m_table->visualRect(m_table->model()->index(m_row, 0));
    state.invisible = !m_table->isVisible() || !m_table->viewport()->rect().intersects(local);
    state.offscreen = state.invisible;
    if (isHeading()) {
        state.readOnly = true;
        return state;
    }
    state.checkable = true;
    state.checked = m_table->model()->index(m_row, 0).data(GroupedRowsModel::TickedRole).toBool();
    state.selectable = true;
    state.focusable = true;
    state.selected
        = m_table->selectionModel() && m_table->selectionModel()->isRowSelected(m_row, m_table->rootIndex());
    state.focused = m_table->hasFocus() && m_table->currentIndex().row() == m_row;
    return state;
}

} // namespace Cadenza::Platform
