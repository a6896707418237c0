// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "PopUpButton.h"

#include <QAbstractItemView>
#include <QCoreApplication>
#include <QKeyEvent>
#include <QWheelEvent>

namespace Cadenza::Platform {

PopUpButton::PopUpButton(QWidget *parent)
    : QComboBox(parent)
{ }

PopUpButton::~PopUpButton() = default;

void PopUpButton::keyPressEvent(QKeyEvent *event)
{
    const Qt::KeyboardModifiers modifiers = event->modifiers() & ~Qt::KeypadModifier;
    switch (event->key()) {
    case Qt::Key_Up:
    case Qt::Key_Down:
    case Qt::Key_PageUp:
    case Qt::Key_PageDown:
    case Qt::Key_Home:
    case Qt::Key_End:
    case Qt::Key_Left:
    case Qt::Key_Right:
        if (modifiers == Qt::NoModifier || modifiers == Qt::AltModifier) {
            showPopup();
            event->accept();
            return;
        }
        break;
    default:
        break;
    }
    const QString text = event->text();
    if (!text.isEmpty() && text.at(0).isPrint() && !text.at(0).isSpace()
        && !(modifiers & (Qt::ControlModifier | Qt::AltModifier | Qt::MetaModifier))) {
        // The letter searches the open menu, where moving is not choosing.
        showPopup();
        if (QAbstractItemView *list = view(); list && list->isVisible()) {
            QKeyEvent copy(event->type(), event->key(), event->modifiers(), text);
            QCoreApplication::sendEvent(list, &copy);
        }
        event->accept();
        return;
    }
    QComboBox::keyPressEvent(event); // Space, F4 and Alt+Down open it; Return and Escape go on
}

void PopUpButton::wheelEvent(QWheelEvent *event)
{
    event->ignore();
}

} // namespace Cadenza::Platform
