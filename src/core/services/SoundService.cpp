// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "SoundService.h"

namespace Cadenza::Platform {

SoundService::SoundService(QObject *parent)
    : QObject(parent)
{ }

SoundService::~SoundService() = default;

} // namespace Cadenza::Platform
