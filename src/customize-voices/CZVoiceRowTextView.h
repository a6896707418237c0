#ifndef CADENZA_CUSTOMIZEVOICES_CZVOICEROWTEXTVIEW_H
#define CADENZA_CUSTOMIZEVOICES_CZVOICEROWTEXTVIEW_H

#include "cadenza_export.h"

#include <QLabel>

namespace Cadenza {

/**
 * The label of a voice row. A press on its text goes on to the widget that holds it, so clicking a
 * voice's name selects the row instead of being swallowed by the label; a label with no holder
 * drops the press.
 */
class CADENZA_EXPORT CZVoiceRowTextView : public QLabel
{
    Q_OBJECT
public:
    explicit CZVoiceRowTextView(QWidget *parent = nullptr);

protected:
    void mousePressEvent(QMouseEvent *event) override;
};

} // namespace Cadenza

#endif
