#include "CZVoiceRowCheckboxButton.h"

namespace Cadenza {

CZVoiceRowCheckboxButton::CZVoiceRowCheckboxButton(QWidget *parent)
    : Platform::IdentifiedCheckBox(parent)
{ }

} // namespace Cadenza
