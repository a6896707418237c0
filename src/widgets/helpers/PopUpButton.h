#ifndef CADENZA_PLATFORM_POPUPBUTTON_H
#define CADENZA_PLATFORM_POPUPBUTTON_H

#include "cadenza_export.h"

#include <QComboBox>

class QLabel;

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
    /**
     * Shows @p line in the status @p field (null: none) and makes it this pop-up's description; when it
     * changed, assistive technology is told, so a screen reader hears "Downloading Femke, 40 %" on the
     * pop-up and on the field.
     */
    void showStatusLine(QLabel *field, const QString &line);

    void keyPressEvent(QKeyEvent *event) override;
    void wheelEvent(QWheelEvent *event) override;
};

} // namespace Cadenza::Platform

#endif
