// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RowViewAccessible.h"

#include "RowView.h"
#include "RowViewTable.h"

#include <QAbstractButton>
#include <QItemSelectionModel>
#include <QLabel>

namespace Cadenza::Platform {

RowViewAccessible::RowViewAccessible(RowView *view)
    : QAccessibleWidget(view, QAccessible::CheckBox)
{ }

RowView *RowViewAccessible::rowView() const
{
    return static_cast<RowView *>(widget());
}

RowViewTable *RowViewAccessible::table() const
{
    // A row view lives in the table's viewport.
    QWidget *viewport = rowView()->parentWidget();
    return viewport ? qobject_cast<RowViewTable *>(viewport->parentWidget()) : nullptr;
}

QAccessibleInterface *RowViewAccessible::parent() const
{
    if (RowViewTable *owner = table()) {
        return QAccessible::queryAccessibleInterface(owner);
    }
    return QAccessibleWidget::parent();
}

QList<QWidget *> RowViewAccessible::shownParts() const
{
    // The tick and the name label are the row itself; a hidden or empty status line says nothing.
    QList<QWidget *> parts;
    RowView *view = rowView();
    const QList<QWidget *> children = view->findChildren<QWidget *>(Qt::FindDirectChildrenOnly);
    for (QWidget *child : children) {
        if (child == view->tick() || child == view->nameLabel() || !child->isVisibleTo(view)) {
            continue;
        }
        if (auto *label = qobject_cast<QLabel *>(child); label && label->text().isEmpty()) {
            continue;
        }
        parts.append(child);
    }
    return parts;
}

int RowViewAccessible::childCount() const
{
    return int(shownParts().size());
}

QAccessibleInterface *RowViewAccessible::child(int index) const
{
    const QList<QWidget *> parts = shownParts();
    return index >= 0 && index < parts.size() ? QAccessible::queryAccessibleInterface(parts.at(index))
                                              : nullptr;
}

int RowViewAccessible::indexOfChild(const QAccessibleInterface *child) const
{
    return child ? int(shownParts().indexOf(qobject_cast<QWidget *>(child->object()))) : -1;
}

QString RowViewAccessible::text(QAccessible::Text t) const
{
    RowView *view = rowView();
    switch (t) {
    case QAccessible::Name:
        return view->accessibleRowName();
    case QAccessible::Description:
        return view->statusLabel() && view->statusLabel()->isVisibleTo(view) ? view->statusLabel()->text()
                                                                             : QString();
    default:
        return QAccessibleWidget::text(t);
    }
}

QAccessible::State RowViewAccessible::state() const
{
    QAccessible::State state = QAccessibleWidget::state();
    RowView *view = rowView();
    QAbstractButton *tick = view->tick();
    state.checkable = true;
    state.checked = tick && tick->isChecked();
    state.disabled = !tick || !tick->isEnabled();
    state.focusable = true;
    state.selectable = true;
    if (RowViewTable *owner = table()) {
        const int row = owner->rowOfView(view);
        state.focused = row >= 0 && owner->hasFocus() && owner->currentIndex().row() == row;
        state.selected = row >= 0 && owner->selectionModel()
            && owner->selectionModel()->isRowSelected(row, owner->rootIndex());
        state.active = state.focused;
    }
    return state;
}

QStringList RowViewAccessible::actionNames() const
{
    QAbstractButton *tick = rowView()->tick();
    if (!tick || !tick->isEnabled()) {
        return {};
    }
    return {toggleAction(), pressAction()};
}

void RowViewAccessible::doAction(const QString &actionName)
{
    QAbstractButton *tick = rowView()->tick();
    if (tick && tick->isEnabled() && (actionName == toggleAction() || actionName == pressAction())) {
        tick->click();
    }
}

QStringList RowViewAccessible::keyBindingsForAction(const QString &actionName) const
{
    if (actionName == toggleAction() || actionName == pressAction()) {
        return {QStringLiteral("Space")};
    }
    return {};
}

} // namespace Cadenza::Platform
