#include "CZSRLanguageRowTextView.h"

namespace Cadenza {

CZSRLanguageRowTextView::CZSRLanguageRowTextView(QWidget *parent)
    : Platform::ClickThroughLabel(parent)
{ }

} // namespace Cadenza
