// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_CUSTOMIZEVOICES_CZVOICEROWTEXTVIEW_H
#define CADENZA_CUSTOMIZEVOICES_CZVOICEROWTEXTVIEW_H

#include "cadenza_export.h"
#include "widgets/helpers/ClickThroughLabel.h"

namespace Cadenza {

/// The label of a voice row: a click on it selects the row rather than stopping at the label.
class CADENZA_EXPORT CZVoiceRowTextView : public Platform::ClickThroughLabel
{
    Q_OBJECT
public:
    explicit CZVoiceRowTextView(QWidget *parent = nullptr);
};

} // namespace Cadenza

#endif
