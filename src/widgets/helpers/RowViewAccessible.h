// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_ROWVIEWACCESSIBLE_H
#define CADENZA_PLATFORM_ROWVIEWACCESSIBLE_H

#include "cadenza_export.h"

#include <QAccessibleWidget>

namespace Cadenza::Platform {

class RowView;
class RowViewTable;

/**
 * A row view as assistive technology sees it: a check box named after the item ("Maren, English
 * (United States)"), checkable, checked as the row's tick, disabled while the item is fetched, focused
 * when the table has the focus on this row. Its status line is its description and, with the size
 * pop-up and the upgrade tick, one of its children while shown. Its parent is the table, not the
 * table's viewport. Pressing or toggling it clicks the tick.
 */
class CADENZA_EXPORT RowViewAccessible : public QAccessibleWidget
{
public:
    explicit RowViewAccessible(RowView *view);

    [[nodiscard]] QAccessibleInterface *parent() const override;
    [[nodiscard]] int childCount() const override;
    [[nodiscard]] QAccessibleInterface *child(int index) const override;
    [[nodiscard]] int indexOfChild(const QAccessibleInterface *child) const override;
    [[nodiscard]] QString text(QAccessible::Text t) const override;
    [[nodiscard]] QAccessible::State state() const override;
    [[nodiscard]] QStringList actionNames() const override;
    void doAction(const QString &actionName) override;
    [[nodiscard]] QStringList keyBindingsForAction(const QString &actionName) const override;

private:
    [[nodiscard]] RowView *rowView() const;
    [[nodiscard]] RowViewTable *table() const;
    [[nodiscard]] QList<QWidget *> shownParts() const;
};

} // namespace Cadenza::Platform

#endif
