// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RecyclingItemDelegate.h"

namespace Cadenza::Platform {

RecyclingItemDelegate::RecyclingItemDelegate(Recycler recycler, QObject *parent)
    : QStyledItemDelegate(parent)
    , m_recycler(std::move(recycler))
{ }

void RecyclingItemDelegate::destroyEditor(QWidget *editor, const QModelIndex &index) const
{
    if (m_recycler) {
        m_recycler(editor);
        return;
    }
    QStyledItemDelegate::destroyEditor(editor, index);
}

} // namespace Cadenza::Platform
