// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_ENVIRONMENTUSERLOCALESERVICE_H
#define CADENZA_PLATFORM_ENVIRONMENTUSERLOCALESERVICE_H

#include "UserLocaleService.h"

namespace Cadenza::Platform {

/// The session's settings from LANGUAGE, LC_ALL, LC_MESSAGES and LANG, as Qt reports them.
class CADENZACORE_EXPORT EnvironmentUserLocaleService final : public UserLocaleService
{
public:
    QStringList preferredLanguages() override;
    QString currentLocaleIdentifier() override;
};

} // namespace Cadenza::Platform

#endif
