// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RowView.h"

#include <QAbstractButton>
#include <QAccessible>
#include <QLabel>

namespace Cadenza::Platform {

RowView::RowView(QWidget *parent)
    : QWidget(parent)
{
    // A row view lies over the table's own drawing of the row; it must hide it.
    setAutoFillBackground(true);
}

RowView::~RowView() = default;

void RowView::setParts(QAbstractButton *tick, QLabel *nameLabel, QLabel *statusLabel)
{
    m_tick = tick;
    m_nameLabel = nameLabel;
    m_statusLabel = statusLabel;
    setFocusProxy(tick);
    // The table keeps the focus; Space there ticks, and Tab reaches the other controls of the current
    // row only (RowViewTable), so a screenful of rows never fills the window's tab chain.
    const QList<QWidget *> children = findChildren<QWidget *>();
    for (QWidget *child : children) {
        if (child != tick && (child->focusPolicy() & Qt::TabFocus)) {
            child->setProperty("cadenzaRowControl", true);
        }
        child->setFocusPolicy(Qt::NoFocus);
    }
}

QString RowView::accessibleRowName() const
{
    if (m_tick && !m_tick->accessibleName().isEmpty()) {
        return m_tick->accessibleName();
    }
    return m_nameLabel ? m_nameLabel->text() : QString();
}

QList<QWidget *> RowView::keyboardControls() const
{
    QList<QWidget *> controls;
    const QList<QWidget *> children = findChildren<QWidget *>(Qt::FindDirectChildrenOnly);
    for (QWidget *child : children) {
        if (child->property("cadenzaRowControl").toBool() && child->isVisibleTo(this) && child->isEnabled()) {
            controls.append(child);
        }
    }
    return controls;
}

void RowView::setHighlighted(bool highlighted)
{
    if (highlighted == m_highlighted) {
        return;
    }
    m_highlighted = highlighted;
    if (!highlighted) {
        setPalette(QPalette()); // back to the table's colours
        return;
    }
    const QPalette from = parentWidget() ? parentWidget()->palette() : palette();
    QPalette selected;
    for (const auto group : {QPalette::Active, QPalette::Inactive, QPalette::Disabled}) {
        selected.setColor(group, QPalette::Window, from.color(group, QPalette::Highlight));
        selected.setColor(group, QPalette::WindowText, from.color(group, QPalette::HighlightedText));
        selected.setColor(group, QPalette::PlaceholderText, from.color(group, QPalette::HighlightedText));
    }
    setPalette(selected);
}

void RowView::setStatusText(QLabel *label, const QString &text)
{
    if (label->text() == text) {
        return;
    }
    label->setText(text);
    QAccessibleEvent nameChanged(label, QAccessible::NameChanged);
    QAccessible::updateAccessibility(&nameChanged);
    // The row reads its status as its description; a screen reader speaks a change of the focused one.
    if (auto *row = qobject_cast<RowView *>(label->parentWidget()); row && row->statusLabel() == label) {
        QAccessibleEvent rowChanged(row, QAccessible::DescriptionChanged);
        QAccessible::updateAccessibility(&rowChanged);
    }
}

} // namespace Cadenza::Platform
