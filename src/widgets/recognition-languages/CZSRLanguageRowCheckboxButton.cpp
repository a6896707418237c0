#include "CZSRLanguageRowCheckboxButton.h"

namespace Cadenza {

CZSRLanguageRowCheckboxButton::CZSRLanguageRowCheckboxButton(QWidget *parent)
    : Platform::IdentifiedCheckBox(parent)
{ }

} // namespace Cadenza
