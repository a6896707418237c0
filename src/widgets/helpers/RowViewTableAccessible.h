// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_ROWVIEWTABLEACCESSIBLE_H
#define CADENZA_PLATFORM_ROWVIEWTABLEACCESSIBLE_H

#include "cadenza_export.h"

#include <QAccessibleWidget>

namespace Cadenza::Platform {

class RowViewTable;

/**
 * A customise sheet's table as assistive technology sees it: a list with one child per row, in order:
 * headings, and one check box per item (its row view while on screen, a stand-in built from the model
 * while scrolled away). The table's own cells, which read only a title and never a tick, are not shown.
 */
class CADENZA_EXPORT RowViewTableAccessible : public QAccessibleWidget
{
public:
    explicit RowViewTableAccessible(RowViewTable *table);

    [[nodiscard]] int childCount() const override;
    [[nodiscard]] QAccessibleInterface *child(int index) const override;
    [[nodiscard]] int indexOfChild(const QAccessibleInterface *child) const override;
    [[nodiscard]] QAccessibleInterface *childAt(int x, int y) const override;
    [[nodiscard]] QAccessibleInterface *focusChild() const override;

private:
    [[nodiscard]] RowViewTable *table() const;
};

} // namespace Cadenza::Platform

#endif
