// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "DistributedNotificationCenter.h"

namespace Cadenza::Platform {

DistributedNotificationCenter::DistributedNotificationCenter(QObject *parent)
    : QObject(parent)
{ }

DistributedNotificationCenter::~DistributedNotificationCenter() = default;

} // namespace Cadenza::Platform
