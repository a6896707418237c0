// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEROWCHECKBOXBUTTON_H
#define CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEROWCHECKBOXBUTTON_H

#include "cadenza_export.h"
#include "widgets/helpers/IdentifiedCheckBox.h"

namespace Cadenza {

/// A checkbox in a language row that knows the language it ticks.
class CADENZA_EXPORT CZSRLanguageRowCheckboxButton : public Platform::IdentifiedCheckBox
{
    Q_OBJECT
    Q_PROPERTY(QString localeIdentifier READ localeIdentifier WRITE setLocaleIdentifier)
public:
    explicit CZSRLanguageRowCheckboxButton(QWidget *parent = nullptr);

    [[nodiscard]] QString localeIdentifier() const { return identifier(); }
    void setLocaleIdentifier(const QString &localeIdentifier) { setIdentifier(localeIdentifier); }
};

} // namespace Cadenza

#endif
