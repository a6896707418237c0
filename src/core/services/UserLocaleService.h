// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_USERLOCALESERVICE_H
#define CADENZA_PLATFORM_USERLOCALESERVICE_H

#include "cadenzacore_export.h"

#include <QString>
#include <QStringList>

namespace Cadenza::Platform {

/// The user's language and region settings.
class CADENZACORE_EXPORT UserLocaleService
{
public:
    virtual ~UserLocaleService();

    /// The user's languages, most preferred first, as canonical identifiers ("de_DE", "en").
    [[nodiscard]] virtual QStringList preferredLanguages() = 0;
    /// The canonical identifier of the user's current (formats) locale, such as "en_US".
    [[nodiscard]] virtual QString currentLocaleIdentifier() = 0;
};

} // namespace Cadenza::Platform

#endif
