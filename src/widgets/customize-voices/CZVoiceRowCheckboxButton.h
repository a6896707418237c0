// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_CUSTOMIZEVOICES_CZVOICEROWCHECKBOXBUTTON_H
#define CADENZA_CUSTOMIZEVOICES_CZVOICEROWCHECKBOXBUTTON_H

#include "cadenza_export.h"
#include "widgets/helpers/IdentifiedCheckBox.h"

namespace Cadenza {

/// A checkbox in a voice row that knows the voice it ticks.
class CADENZA_EXPORT CZVoiceRowCheckboxButton : public Platform::IdentifiedCheckBox
{
    Q_OBJECT
    Q_PROPERTY(QString voiceIdentifier READ voiceIdentifier WRITE setVoiceIdentifier)
public:
    explicit CZVoiceRowCheckboxButton(QWidget *parent = nullptr);

    [[nodiscard]] QString voiceIdentifier() const { return identifier(); }
    void setVoiceIdentifier(const QString &voiceIdentifier) { setIdentifier(voiceIdentifier); }
};

} // namespace Cadenza

#endif
