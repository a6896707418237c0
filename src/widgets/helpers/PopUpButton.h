// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_POPUPBUTTON_H
#define CADENZA_PLATFORM_POPUPBUTTON_H

#include "cadenza_export.h"

#include <QComboBox>

namespace Cadenza::Platform {

/**
 * A pop-up button whose choice is made only in its open menu. A closed QComboBox moves its selection
 * (and emits activated()) on arrow keys, page keys, typed letters and the mouse wheel, so a keyboard
 * user walking past it would commit every item on the way. Here every such key opens the menu instead
 * (a typed letter is handed on to the open menu's search), and the wheel is left to the window.
 * Space, F4 and Alt+Down open the menu as usual; there Return chooses and Escape closes it.
 */
class CADENZA_EXPORT PopUpButton : public QComboBox
{
    Q_OBJECT
public:
    explicit PopUpButton(QWidget *parent = nullptr);
    ~PopUpButton() override;

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void wheelEvent(QWheelEvent *event) override;
};

} // namespace Cadenza::Platform

#endif
