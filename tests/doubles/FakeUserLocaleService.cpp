// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeUserLocaleService.h"

namespace Cadenza::Platform {

FakeUserLocaleService::FakeUserLocaleService(QStringList preferredLanguages, QString currentLocale)
    : m_preferredLanguages(std::move(preferredLanguages))
    , m_currentLocale(std::move(currentLocale))
{ }

} // namespace Cadenza::Platform
