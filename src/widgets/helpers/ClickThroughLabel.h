// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_CLICKTHROUGHLABEL_H
#define CADENZA_PLATFORM_CLICKTHROUGHLABEL_H

#include "cadenza_export.h"

#include <QLabel>

namespace Cadenza::Platform {

/**
 * A label whose mouse presses go on to the widget that holds it, so a click on a row's text selects
 * the row instead of being swallowed by the label; a label with no holder drops the press.
 */
class CADENZA_EXPORT ClickThroughLabel : public QLabel
{
    Q_OBJECT
public:
    explicit ClickThroughLabel(QWidget *parent = nullptr);

protected:
    void mousePressEvent(QMouseEvent *event) override;
};

} // namespace Cadenza::Platform

#endif
