// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "UserLocaleService.h"

namespace Cadenza::Platform {

UserLocaleService::~UserLocaleService() = default;

} // namespace Cadenza::Platform
