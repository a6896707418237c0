// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RowViewTableAccessible.h"

#include "RowViewTable.h"
#include "TableRowAccessible.h"

namespace Cadenza::Platform {

RowViewTableAccessible::RowViewTableAccessible(RowViewTable *table)
    : QAccessibleWidget(table, QAccessible::List)
{ }

RowViewTable *RowViewTableAccessible::table() const
{
    return static_cast<RowViewTable *>(widget());
}

int RowViewTableAccessible::childCount() const
{
    return table()->model() ? table()->model()->rowCount() : 0;
}

QAccessibleInterface *RowViewTableAccessible::child(int index) const
{
    return table()->accessibleRow(index);
}

int RowViewTableAccessible::indexOfChild(const QAccessibleInterface *child) const
{
    if (!child) {
        return -1;
    }
    if (child->object()) {
        return table()->rowOfView(qobject_cast<const QWidget *>(child->object()));
    }
    // Stand-ins are this table's own; their row is what they read.
    const auto *row = dynamic_cast<const TableRowAccessible *>(child);
    return row && row->parent() == this ? row->row() : -1;
}

QAccessibleInterface *RowViewTableAccessible::childAt(int x, int y) const
{
    const QPoint local = table()->viewport()->mapFromGlobal(QPoint(x, y));
    const QModelIndex index = table()->indexAt(local);
    return index.isValid() ? table()->accessibleRow(index.row()) : nullptr;
}

QAccessibleInterface *RowViewTableAccessible::focusChild() const
{
    const QModelIndex current = table()->currentIndex();
    return table()->hasFocus() && current.isValid() ? table()->accessibleRow(current.row()) : nullptr;
}

} // namespace Cadenza::Platform
