// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RowViewTable.h"

#include "RowView.h"
#include "RowViewAccessible.h"
#include "RowViewTableAccessible.h"
#include "TableRowAccessible.h"

#include <QCoreApplication>
#include <QKeyEvent>
#include <QTimer>

namespace Cadenza::Platform {

namespace {
QAccessibleInterface *accessibleFactory(const QString &className, QObject *object)
{
    Q_UNUSED(className)
    if (auto *table = qobject_cast<RowViewTable *>(object)) {
        return new RowViewTableAccessible(table);
    }
    if (auto *view = qobject_cast<RowView *>(object)) {
        return new RowViewAccessible(view);
    }
    return nullptr;
}
} // namespace

RowViewTable::RowViewTable(QWidget *parent)
    : QTableView(parent)
{
    static const bool installed = [] {
        QAccessible::installFactory(accessibleFactory);
        return true;
    }();
    Q_UNUSED(installed)
    setTabKeyNavigation(false); // Tab leaves the table
}

RowViewTable::~RowViewTable()
{
    // After the application object is gone the accessibility cache may be gone too; then the
    // process ends and the stand-ins with it.
    if (QCoreApplication::instance()) {
        forgetAccessibleRows();
    }
}

void RowViewTable::setModel(QAbstractItemModel *model)
{
    for (const QMetaObject::Connection &connection : std::as_const(m_modelConnections)) {
        disconnect(connection);
    }
    m_modelConnections.clear();
    forgetAccessibleRows();
    QTableView::setModel(model);
    if (!model) {
        return;
    }
    // Stand-ins know their row by number: any change of the rows makes them stale.
    const auto reordered = [this] {
        forgetAccessibleRows();
        QAccessibleEvent event(this, QAccessible::ObjectReorder);
        QAccessible::updateAccessibility(&event);
    };
    m_modelConnections.append(connect(model, &QAbstractItemModel::modelReset, this, reordered));
    m_modelConnections.append(connect(model, &QAbstractItemModel::layoutChanged, this, reordered));
    for (auto signal : {&QAbstractItemModel::rowsInserted, &QAbstractItemModel::rowsRemoved}) {
        m_modelConnections.append(connect(model, signal, this, [this] { forgetAccessibleRows(); }));
    }
}

void RowViewTable::forgetAccessibleRows()
{
    for (const QAccessible::Id id : std::as_const(m_accessibleRows)) {
        QAccessible::deleteAccessibleInterface(id);
    }
    m_accessibleRows.clear();
}

QAccessibleInterface *RowViewTable::accessibleRow(int row) const
{
    if (!model() || row < 0 || row >= model()->rowCount()) {
        return nullptr;
    }
    if (QWidget *view = indexWidget(model()->index(row, 0))) {
        return QAccessible::queryAccessibleInterface(view);
    }
    if (const auto known = m_accessibleRows.constFind(row); known != m_accessibleRows.constEnd()) {
        if (QAccessibleInterface *iface = QAccessible::accessibleInterface(*known)) {
            return iface;
        }
    }
    auto *standIn = new TableRowAccessible(const_cast<RowViewTable *>(this), row);
    m_accessibleRows.insert(row, QAccessible::registerAccessibleInterface(standIn));
    return standIn;
}

int RowViewTable::rowOfView(const QWidget *view) const
{
    if (!view || !model() || view->parentWidget() != viewport()) {
        return -1;
    }
    const QModelIndex index = indexAt(view->geometry().center());
    return index.isValid() && indexWidget(index) == view ? index.row() : -1;
}

bool RowViewTable::isHeadingRow(int row) const
{
    return model() && !(model()->flags(model()->index(row, 0)) & Qt::ItemIsSelectable);
}

void RowViewTable::adoptRowView(int row, QWidget *view)
{
    if (auto *rowView = qobject_cast<RowView *>(view)) {
        rowView->setHighlighted(selectionModel() && selectionModel()->isRowSelected(row, rootIndex()));
    }
    view->removeEventFilter(this);
    view->installEventFilter(this); // after the delegate's, so seen first
    const QList<QWidget *> children = view->findChildren<QWidget *>();
    for (QWidget *child : children) {
        child->removeEventFilter(this);
        child->installEventFilter(this);
    }
}

QModelIndex RowViewTable::moveCursor(CursorAction cursorAction, Qt::KeyboardModifiers modifiers)
{
    const QModelIndex from = currentIndex();
    QModelIndex to;
    if ((cursorAction == MoveHome || cursorAction == MoveEnd) && model() && model()->rowCount() > 0) {
        // One column: Home and End go to the first and last row, as in a list.
        to = model()->index(cursorAction == MoveHome ? 0 : model()->rowCount() - 1, 0);
    } else {
        to = QTableView::moveCursor(cursorAction, modifiers);
    }
    if (!to.isValid() || !isHeadingRow(to.row())) {
        return to;
    }
    // Pass over headings in the direction of the move; where none is left, stay.
    const int rows = model()->rowCount();
    const bool up = from.isValid()
        && (cursorAction == MoveUp || cursorAction == MovePrevious || cursorAction == MovePageUp
            || cursorAction == MoveEnd);
    const int step = up ? -1 : 1;
    for (int row = to.row() + step; row >= 0 && row < rows; row += step) {
        if (!isHeadingRow(row) && !isRowHidden(row)) {
            return model()->index(row, to.column());
        }
    }
    if (from.isValid()) {
        return from;
    }
    for (int row = to.row() - step; row >= 0 && row < rows; row -= step) {
        if (!isHeadingRow(row) && !isRowHidden(row)) {
            return model()->index(row, to.column());
        }
    }
    return {};
}

bool RowViewTable::focusNextPrevChild(bool next)
{
    if (next && hasFocus() && currentIndex().isValid()) {
        if (auto *view = qobject_cast<RowView *>(indexWidget(currentIndex()))) {
            if (const QList<QWidget *> controls = view->keyboardControls(); !controls.isEmpty()) {
                controls.first()->setFocus(Qt::TabFocusReason);
                return true;
            }
        }
    }
    return QTableView::focusNextPrevChild(next);
}

QWidget *RowViewTable::nextControlAfterTable(bool next) const
{
    // Walks the window's tab chain from the table, over everything inside it.
    QWidget *candidate = next ? nextInFocusChain() : previousInFocusChain();
    while (candidate && candidate != this) {
        if (!isAncestorOf(candidate) && (candidate->focusPolicy() & Qt::TabFocus) && candidate->isEnabled()
            && candidate->isVisible() && candidate->window() == window()) {
            return candidate;
        }
        candidate = next ? candidate->nextInFocusChain() : candidate->previousInFocusChain();
    }
    return nullptr;
}

bool RowViewTable::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() != QEvent::KeyPress) {
        return QTableView::eventFilter(watched, event);
    }
    auto *key = static_cast<QKeyEvent *>(event);
    auto *widget = qobject_cast<QWidget *>(watched);
    auto *view = widget ? qobject_cast<RowView *>(widget->parentWidget()) : nullptr;
    if (view && (key->key() == Qt::Key_Tab || key->key() == Qt::Key_Backtab)) {
        // Tab inside a row: its next control, then the window's control after the table; Shift+Tab
        // its previous control, then the table.
        const bool forward = key->key() == Qt::Key_Tab && !(key->modifiers() & Qt::ShiftModifier);
        const QList<QWidget *> controls = view->keyboardControls();
        const qsizetype at = controls.indexOf(widget);
        if (forward && at >= 0 && at + 1 < controls.size()) {
            controls.at(at + 1)->setFocus(Qt::TabFocusReason);
        } else if (!forward && at > 0) {
            controls.at(at - 1)->setFocus(Qt::BacktabFocusReason);
        } else if (forward) {
            if (QWidget *after = nextControlAfterTable(true)) {
                after->setFocus(Qt::TabFocusReason);
            }
        } else {
            setFocus(Qt::BacktabFocusReason);
        }
        return true;
    }
    if (qobject_cast<RowView *>(watched) && key->key() == Qt::Key_Escape) {
        // The item delegate would take Escape as "stop editing"; a row view is no editor.
        QCoreApplication::sendEvent(this, event);
        return true;
    }
    return QTableView::eventFilter(watched, event);
}

void RowViewTable::currentChanged(const QModelIndex &current, const QModelIndex &previous)
{
    // QTableView's own report names a cell this table's accessible form does not have.
    QAbstractItemView::currentChanged(current, previous);
    if (hasFocus() && current.isValid()) {
        reportFocusOnCurrentRow();
    }
}

void RowViewTable::selectionChanged(const QItemSelection &selected, const QItemSelection &deselected)
{
    QAbstractItemView::selectionChanged(selected, deselected);
    highlightRowViews();
}

void RowViewTable::focusInEvent(QFocusEvent *event)
{
    QTableView::focusInEvent(event);
    // After the window reported the table itself as focused.
    QTimer::singleShot(0, this, [this] {
        if (hasFocus() && currentIndex().isValid()) {
            reportFocusOnCurrentRow();
        }
    });
}

void RowViewTable::reportFocusOnCurrentRow()
{
    if (QAccessibleInterface *row = accessibleRow(currentIndex().row())) {
        QAccessibleEvent event(row, QAccessible::Focus);
        QAccessible::updateAccessibility(&event);
    }
}

void RowViewTable::highlightRowViews()
{
    if (!model()) {
        return;
    }
    const int rows = model()->rowCount();
    const QList<RowView *> views = viewport()->findChildren<RowView *>(Qt::FindDirectChildrenOnly);
    for (RowView *view : views) {
        const int row = rowOfView(view);
        view->setHighlighted(row >= 0 && row < rows && selectionModel()->isRowSelected(row, rootIndex()));
    }
}

} // namespace Cadenza::Platform
