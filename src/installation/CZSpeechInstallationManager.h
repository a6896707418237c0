#ifndef CADENZA_INSTALLATION_CZSPEECHINSTALLATIONMANAGER_H
#define CADENZA_INSTALLATION_CZSPEECHINSTALLATIONMANAGER_H

#include "cadenzacore_export.h"

#include <QByteArray>
#include <QHash>
#include <QMutex>
#include <QObject>
#include <QVariantList>

#include <memory>
#include <optional>

namespace Cadenza {

namespace Platform {
class LocalMessagePort;
class RemoteMessagePort;
} // namespace Platform

/// Told when the installer daemon has finished with a requested item.
class CADENZACORE_EXPORT CZSpeechInstallationManagerDelegate
{
public:
    virtual ~CZSpeechInstallationManagerDelegate();
    /// @p tags holds the item's tag; @p message is 1 (installed), 2 (cancelled) or 3 (failed).
    virtual void speechItemTags(const QStringList &tags, qint32 finishedWithMessage) = 0;
};

/**
 * The process's door to the speech-data installer daemon: installation requests, the running
 * installations, cancelling, and the completion of each request.
 *
 * Requests block the calling (main) thread for at most 10 seconds to send and, for the list of
 * running installations, 10 seconds more for the answer. Completions arrive on the main thread.
 */
class CADENZACORE_EXPORT CZSpeechInstallationManager : public QObject
{
    Q_OBJECT
public:
    /// The one manager of the process, made on first use.
    static CZSpeechInstallationManager *sharedManager();

    explicit CZSpeechInstallationManager(QObject *parent = nullptr);
    ~CZSpeechInstallationManager() override;

    [[nodiscard]] std::shared_ptr<CZSpeechInstallationManagerDelegate> delegate() const;
    void setDelegate(std::shared_ptr<CZSpeechInstallationManagerDelegate> delegate);

    /// The daemon's status records of every running or waiting installation; empty when it is not running.
    [[nodiscard]] QVariantList activeInstallations();
    /// The same as activeInstallations().
    [[nodiscard]] QVariantList activeVoiceInstallations();
    void showProgressWindow();
    void cancelAllInstallations();

    /// Sends one installation request (message 1) with its own local port; false when none was sent.
    bool _requestInstallation(const QString &tagName, const QString &itemName, quint64 byteSize,
        const QString &objectIdentifier, qint64 userInteractionMode);

    [[nodiscard]] bool _serverIsRunning();
    [[nodiscard]] bool _createServerPortIfNeeded();
    /// A new local port for one request's completion, owned by the manager until it completes.
    [[nodiscard]] Platform::LocalMessagePort *_createLocalPort();
    [[nodiscard]] std::optional<QByteArray> _sendMessage(
        qint32 messageId, const QByteArray &withData, bool withReply);

    /// Names of the local ports still waiting for their completion.
    [[nodiscard]] QStringList pendingLocalPortNames() const;

Q_SIGNALS:
    /// Emitted with each completion, after the delegate: the whole answer, which may carry
    /// "QLNDFailureReason".
    void installationFinished(const QString &tagName, qint32 message, const QVariantMap &answer);

private:
    friend std::optional<QByteArray> QLNDLocalCallBack(Platform::LocalMessagePort *port, qint32 messageId,
        const QByteArray &data, CZSpeechInstallationManager *info);
    void releaseLocalPort(const QString &name);

    mutable QMutex m_delegateMutex;
    std::shared_ptr<CZSpeechInstallationManagerDelegate> _delegate;
    std::unique_ptr<Platform::RemoteMessagePort> _serverPortRef;
    QHash<QString, std::shared_ptr<Platform::LocalMessagePort>> m_localPorts;
};

/// A local port's callback: hands a completion to the manager's delegate and closes the port.
CADENZACORE_EXPORT std::optional<QByteArray> QLNDLocalCallBack(Platform::LocalMessagePort *port,
    qint32 messageId, const QByteArray &data, CZSpeechInstallationManager *info);

} // namespace Cadenza

#endif
