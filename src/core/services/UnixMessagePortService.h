// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_UNIXMESSAGEPORTSERVICE_H
#define CADENZA_PLATFORM_UNIXMESSAGEPORTSERVICE_H

#include "MessagePort.h"

namespace Cadenza::Platform {

/**
 * Message ports as Unix domain sockets in Paths::runtimeFolder() (mode 0700), one socket per port
 * name. A remote port keeps one connection open; it is valid while that connection stands. A local
 * port serves only processes of its own user, each on a connection of its own.
 */
class CADENZACORE_EXPORT UnixMessagePortService final : public MessagePortService
{
public:
    std::unique_ptr<RemoteMessagePort> createRemotePort(const QString &name) override;
    std::unique_ptr<LocalMessagePort> createLocalPort(const QString &name, LocalMessagePort::Handler handler,
        const LocalPortLimits &limits = LocalPortLimits()) override;
    std::unique_ptr<LocalMessagePort> createPresencePort(const QString &name) override;

    /// A local port on a listening socket handed over by the service manager (socket activation).
    [[nodiscard]] std::unique_ptr<LocalMessagePort> adoptLocalPort(const QString &name,
        int listeningDescriptor, LocalMessagePort::Handler handler,
        const LocalPortLimits &limits = LocalPortLimits());

    /// The socket file of the port named @p name.
    [[nodiscard]] static QString socketPath(const QString &name);
    /// Makes the runtime folder with mode 0700; false when it cannot be made private.
    [[nodiscard]] static bool ensureRuntimeFolder();

private:
    /// Whether a new socket may be made at @p path: it fits, and no living port holds it (a socket
    /// left by a crash is removed).
    [[nodiscard]] static bool claimSocketPath(const QString &path);
};

} // namespace Cadenza::Platform

#endif
