#include "CZVoiceRowTextView.h"

namespace Cadenza {

CZVoiceRowTextView::CZVoiceRowTextView(QWidget *parent)
    : Platform::ClickThroughLabel(parent)
{ }

} // namespace Cadenza
