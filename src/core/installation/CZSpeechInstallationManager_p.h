// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_INSTALLATION_CZSPEECHINSTALLATIONMANAGER_P_H
#define CADENZA_INSTALLATION_CZSPEECHINSTALLATIONMANAGER_P_H

#include "cadenzacore_export.h"
#include "core/installation/CZSpeechInstallationManager.h"

#include <QHash>
#include <QMutex>

// Not public API: the installation manager's connection to quillond and its internal operations,
// for the command-line tool, cadenza-settings, the tests and the benchmarks.
namespace Cadenza {

namespace Platform {
class LocalMessagePort;
class RemoteMessagePort;
} // namespace Platform

class CADENZACORE_EXPORT CZSpeechInstallationManagerPrivate
{
public:
    explicit CZSpeechInstallationManagerPrivate(CZSpeechInstallationManager *q);
    ~CZSpeechInstallationManagerPrivate();

    [[nodiscard]] static CZSpeechInstallationManagerPrivate *get(CZSpeechInstallationManager *manager)
    {
        return manager->d.get();
    }

    /**
     * Sends one installation request (message 1) with its own local port; false when none was sent.
     * A request that cannot reach the daemon emits installationRequestFailed().
     */
    bool _requestInstallation(const QString &tagName, const QString &itemName, quint64 byteSize,
        const QString &objectIdentifier, qint64 userInteractionMode);

    [[nodiscard]] bool _serverIsRunning();
    /**
     * Whether a request would reach the daemon: it runs, or its request port is held for it by the
     * service manager, which starts it on the first request (socket activation).
     */
    [[nodiscard]] bool _serverIsReachable();
    [[nodiscard]] bool _createServerPortIfNeeded();
    /// A new local port for one request's completion, owned by the manager until it completes.
    [[nodiscard]] Platform::LocalMessagePort *_createLocalPort();
    [[nodiscard]] std::optional<QByteArray> _sendMessage(
        qint32 messageId, const QByteArray &withData, bool withReply);

    /// Names of the local ports still waiting for their completion.
    [[nodiscard]] QStringList pendingLocalPortNames() const;

    void releaseLocalPort(const QString &name);
    void removeNow(const QList<RemovableSpeechItem> &items);
    void logRemoval(const QString &tag);

    CZSpeechInstallationManager *const q;
    mutable QMutex m_delegateMutex;
    std::shared_ptr<CZSpeechInstallationManagerDelegate> _delegate;
    std::unique_ptr<Platform::RemoteMessagePort> _serverPortRef;
    QHash<QString, std::shared_ptr<Platform::LocalMessagePort>> m_localPorts;
    int m_lastSendStatus = 0; ///< of the last _sendMessage()
};

/// A local port's callback: hands a completion to the manager's delegate and closes the port.
CADENZACORE_EXPORT std::optional<QByteArray> QLNDLocalCallBack(Platform::LocalMessagePort *port,
    qint32 messageId, const QByteArray &data, CZSpeechInstallationManager *info);

} // namespace Cadenza

#endif
