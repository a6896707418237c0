// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_TABLEROWACCESSIBLE_H
#define CADENZA_PLATFORM_TABLEROWACCESSIBLE_H

#include "cadenza_export.h"

#include <QAccessibleInterface>
#include <QPointer>

namespace Cadenza::Platform {

class RowViewTable;

/**
 * A row of a RowViewTable that has no row view: a heading (role heading, read, never selected), or an
 * item row scrolled out of sight (a check box whose name and tick come from the model, shown as
 * off-screen). Rows with a view are read through their view instead (RowViewAccessible).
 */
class CADENZA_EXPORT TableRowAccessible : public QAccessibleInterface
{
public:
    TableRowAccessible(RowViewTable *table, int row);

    [[nodiscard]] int row() const { return m_row; }

    [[nodiscard]] bool isValid() const override;
    [[nodiscard]] QObject *object() const override { return nullptr; }
    [[nodiscard]] QWindow *window() const override;
    [[nodiscard]] QAccessibleInterface *parent() const override;
    [[nodiscard]] QAccessibleInterface *child(int) const override { return nullptr; }
    [[nodiscard]] int childCount() const override { return 0; }
    [[nodiscard]] int indexOfChild(const QAccessibleInterface *) const override { return -1; }
    [[nodiscard]] QAccessibleInterface *childAt(int, int) const override { return nullptr; }
    [[nodiscard]] QString text(QAccessible::Text t) const override;
    void setText(QAccessible::Text, const QString &) override { }
    [[nodiscard]] QRect rect() const override;
    [[nodiscard]] QAccessible::Role role() const override;
    [[nodiscard]] QAccessible::State state() const override;

private:
    [[nodiscard]] bool isHeading() const;

    QPointer<RowViewTable> m_table;
    int m_row;
};

} // namespace Cadenza::Platform

#endif
