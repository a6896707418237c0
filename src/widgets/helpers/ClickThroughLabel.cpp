// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "ClickThroughLabel.h"

#include <QCoreApplication>
#include <QMouseEvent>

namespace Cadenza::Platform {

ClickThroughLabel::ClickThroughLabel(QWidget *parent)
    : QLabel(parent)
{
    setTextInteractionFlags(Qt::NoTextInteraction);
}

void ClickThroughLabel::mousePressEvent(QMouseEvent *event)
{
    QWidget *nextResponder = parentWidget();
    if (!nextResponder) {
        event->accept(); // nobody to hand it to: dropped
        return;
    }
    // The same press, in the holder's coordinates, so it lands where the user clicked.
    const QPointF position = mapTo(nextResponder, event->position().toPoint());
    QMouseEvent forwarded(event->type(), position, event->scenePosition(), event->globalPosition(),
        event->button(), event->buttons(), event->modifiers(), event->pointingDevice());
    QCoreApplication::sendEvent(nextResponder, &forwarded);
    event->accept(); // handed on once; Qt must not propagate the original a second time
}

} // namespace Cadenza::Platform
