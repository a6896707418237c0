// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "MessagePort.h"

namespace Cadenza::Platform {

RemoteMessagePort::~RemoteMessagePort() = default;
LocalMessagePort::~LocalMessagePort() = default;
MessagePortService::~MessagePortService() = default;

bool MessagePortService::isValidPortName(const QString &name)
{
    if (name.isEmpty() || name.size() > 80 || name.startsWith(QLatin1Char('.'))) {
        return false;
    }
    for (const QChar c : name) {
        const bool allowed = (c >= u'a' && c <= u'z') || (c >= u'A' && c <= u'Z') || (c >= u'0' && c <= u'9')
            || c == u'.' || c == u'-' || c == u'_';
        if (!allowed) {
            return false;
        }
    }
    return true;
}

} // namespace Cadenza::Platform
