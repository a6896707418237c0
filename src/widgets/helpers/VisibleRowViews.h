// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_VISIBLEROWVIEWS_H
#define CADENZA_PLATFORM_VISIBLEROWVIEWS_H

#include "cadenza_export.h"

#include <QHash>
#include <QObject>
#include <QPointer>

#include <functional>

class QTableView;
class QWidget;

namespace Cadenza::Platform {

/**
 * Row views for the rows of a table that are on screen, and only for those: views appear as rows
 * scroll in and go as they scroll out or the model resets. Views that go are kept and handed to the
 * next row that needs one, so a table of 10,000 rows costs a screenful of widgets.
 *
 * Space in the table ticks the current row: it clicks the row view's focus proxy when that is a button.
 *
 * The filler gets the row and a spare view to fill (null when there is none, then it makes one); it
 * returns the view, or null for rows that are drawn by the table itself.
 */
class CADENZA_EXPORT VisibleRowViews : public QObject
{
    Q_OBJECT
public:
    using Filler = std::function<QWidget *(int row, QWidget *spare)>;

    VisibleRowViews(QTableView *table, Filler filler, QObject *parent = nullptr);
    ~VisibleRowViews() override;

    /// The view the table holds for @p row now; null when it has none.
    [[nodiscard]] QWidget *viewForRow(int row) const { return m_views.value(row); }
    /// Gives every row on screen its view, and takes them from rows that left it.
    void sync();

protected:
    bool eventFilter(QObject *watched, QEvent *event) override;

private:
    void recycle(QWidget *view);

    QTableView *m_table;
    Filler m_filler;
    QHash<int, QPointer<QWidget>> m_views;
    QList<QPointer<QWidget>> m_spares;
};

} // namespace Cadenza::Platform

#endif
