// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_RECYCLINGITEMDELEGATE_H
#define CADENZA_PLATFORM_RECYCLINGITEMDELEGATE_H

#include "cadenza_export.h"

#include <QStyledItemDelegate>

#include <functional>

namespace Cadenza::Platform {

/**
 * Draws a table's rows and hands the row views (index widgets) the table lets go of (on scrolling and on
 * every reset) back to their owner instead of deleting them, so a search keystroke refills a few views rather
 * than building new ones.
 */
class CADENZA_EXPORT RecyclingItemDelegate : public QStyledItemDelegate
{
    Q_OBJECT
public:
    using Recycler = std::function<void(QWidget *view)>;

    explicit RecyclingItemDelegate(Recycler recycler, QObject *parent = nullptr);

    void destroyEditor(QWidget *editor, const QModelIndex &index) const override;

private:
    Recycler m_recycler;
};

} // namespace Cadenza::Platform

#endif
