// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "VisibleRowViews.h"

#include "RecyclingItemDelegate.h"
#include "RowViewTable.h"

#include <QAbstractButton>
#include <QKeyEvent>
#include <QScrollBar>
#include <QTableView>
#include <QTimer>

namespace Cadenza::Platform {

VisibleRowViews::VisibleRowViews(QTableView *table, Filler filler, QObject *parent)
    : QObject(parent)
    , m_table(table)
    , m_filler(std::move(filler))
{
    // The table lets go of its index widgets on scrolling out and on every reset; keep them.
    table->setItemDelegate(new RecyclingItemDelegate([this](QWidget *view) { recycle(view); }, this));
    table->viewport()->installEventFilter(this);
    table->installEventFilter(this);
    connect(table->verticalScrollBar(), &QScrollBar::valueChanged, this, &VisibleRowViews::sync);
    connect(table->model(), &QAbstractItemModel::modelReset, this, [this] {
        m_views.clear();
        QTimer::singleShot(0, this, &VisibleRowViews::sync);
    });
}

VisibleRowViews::~VisibleRowViews()
{
    if (m_table) {
        m_table->setItemDelegate(nullptr);
    }
    for (const QPointer<QWidget> &spare : std::as_const(m_spares)) {
        delete spare.data();
    }
}

bool VisibleRowViews::eventFilter(QObject *watched, QEvent *event)
{
    if (watched == m_table && event->type() == QEvent::KeyPress
        && static_cast<QKeyEvent *>(event)->key() == Qt::Key_Space) {
        // Space ticks the current row, as a click on its checkbox (the view's focus proxy) would.
        QWidget *view = viewForRow(m_table->currentIndex().row());
        auto *tick = view ? qobject_cast<QAbstractButton *>(view->focusProxy()) : nullptr;
        if (tick && tick->isEnabled()) {
            tick->click();
            return true;
        }
    } else if (watched != m_table && (event->type() == QEvent::Resize || event->type() == QEvent::Show)) {
        QTimer::singleShot(0, this, &VisibleRowViews::sync);
    }
    return QObject::eventFilter(watched, event);
}

void VisibleRowViews::recycle(QWidget *view)
{
    view->hide();
    m_spares.append(view);
}

void VisibleRowViews::sync()
{
    QAbstractItemModel *model = m_table->model();
    const int rowCount = model->rowCount();
    if (!m_table->isVisible() || rowCount == 0) {
        return;
    }
    int first = m_table->rowAt(0);
    int last = m_table->rowAt(m_table->viewport()->height() - 1);
    first = first < 0 ? 0 : first;
    last = last < 0 ? rowCount - 1 : last;
    for (auto it = m_views.begin(); it != m_views.end();) {
        if (it.key() < first || it.key() > last || !it.value()) {
            m_table->setIndexWidget(model->index(it.key(), 0), nullptr);
            it = m_views.erase(it);
        } else {
            ++it;
        }
    }
    for (int row = first; row <= last; ++row) {
        if (m_views.contains(row)) {
            continue;
        }
        QWidget *spare = nullptr;
        while (!spare && !m_spares.isEmpty()) {
            spare = m_spares.takeLast();
        }
        QWidget *view = m_filler(row, spare);
        if (!view) {
            if (spare) {
                m_spares.append(spare);
            }
            continue;
        }
        m_table->setIndexWidget(model->index(row, 0), view);
        m_views.insert(row, view);
        if (auto *table = qobject_cast<RowViewTable *>(m_table)) {
            table->adoptRowView(row, view);
        }
    }
}

} // namespace Cadenza::Platform
