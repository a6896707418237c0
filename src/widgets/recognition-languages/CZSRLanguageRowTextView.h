// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEROWTEXTVIEW_H
#define CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEROWTEXTVIEW_H

#include "cadenza_export.h"
#include "widgets/helpers/ClickThroughLabel.h"

namespace Cadenza {

/// The label of a language row: a click on it selects the row rather than stopping at the label.
class CADENZA_EXPORT CZSRLanguageRowTextView : public Platform::ClickThroughLabel
{
    Q_OBJECT
public:
    explicit CZSRLanguageRowTextView(QWidget *parent = nullptr);
};

} // namespace Cadenza

#endif
