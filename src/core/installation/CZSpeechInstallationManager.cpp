// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZSpeechInstallationManager.h"

#include "CZSpeechInstallationManager_p.h"
#include "protocol/InstallerProtocol.h"
#include "protocol/SecureArchiving.h"

#include "cadenzacore_logging.h"
#include "core/services/MessagePort.h"
#include "core/services/Services.h"

#include <QCoreApplication>
#include <QPointer>
#include <QRandomGenerator>

namespace Cadenza {

using namespace InstallerProtocol;
using Platform::lcInstallation;

CZSpeechInstallationManagerDelegate::~CZSpeechInstallationManagerDelegate() = default;

CZSpeechInstallationManager *CZSpeechInstallationManager::sharedManager()
{
    static CZSpeechInstallationManager *manager = new CZSpeechInstallationManager; // lives until exit
    return manager;
}

CZSpeechInstallationManagerPrivate::CZSpeechInstallationManagerPrivate(CZSpeechInstallationManager *q)
    : q(q)
{ }

CZSpeechInstallationManagerPrivate::~CZSpeechInstallationManagerPrivate()
{
    if (_serverPortRef) {
        _serverPortRef->invalidate();
    }
}

CZSpeechInstallationManager::CZSpeechInstallationManager(QObject *parent)
    : QObject(parent)
    , d(std::make_unique<CZSpeechInstallationManagerPrivate>(this))
{ }

CZSpeechInstallationManager::~CZSpeechInstallationManager() = default;

std::shared_ptr<CZSpeechInstallationManagerDelegate> CZSpeechInstallationManager::delegate() const
{
    QMutexLocker locker(&d->m_delegateMutex);
    return d->_delegate;
}

void CZSpeechInstallationManager::setDelegate(std::shared_ptr<CZSpeechInstallationManagerDelegate> delegate)
{
    QMutexLocker locker(&d->m_delegateMutex);
    d->_delegate = std::move(delegate);
}

bool CZSpeechInstallationManagerPrivate::_serverIsRunning()
{
    auto probe = Platform::Services::messagePorts().createRemotePort(LivenessPortName);
    if (!probe) {
        return false;
    }
    const bool valid = probe->isValid();
    probe->invalidate();
    return valid;
}

bool CZSpeechInstallationManagerPrivate::_serverIsReachable()
{
    // The request port accepts connections while a daemon or the service manager listens on it; a
    // socket left by a daemon that died refuses them.
    return _serverIsRunning() || _createServerPortIfNeeded();
}

bool CZSpeechInstallationManagerPrivate::_createServerPortIfNeeded()
{
    if (_serverPortRef && !_serverPortRef->isValid()) {
        _serverPortRef.reset(); // the daemon went away; a new one may be listening
    }
    if (_serverPortRef) {
        return true;
    }
    auto port = Platform::Services::messagePorts().createRemotePort(ServicePortName);
    if (!port || !port->isValid()) {
        return false;
    }
    _serverPortRef = std::move(port);
    return true;
}

Platform::LocalMessagePort *CZSpeechInstallationManagerPrivate::_createLocalPort()
{
    const quint32 number = QRandomGenerator::system()->generate() & 0xFFFF;
    const QString name = LocalPortNameFormat.arg(ServicePortName).arg(number);
    QPointer<CZSpeechInstallationManager> self(q);
    // The callback needs its own port; it is known once the port exists.
    auto slot = std::make_shared<Platform::LocalMessagePort *>(nullptr);
    std::unique_ptr<Platform::LocalMessagePort> port = Platform::Services::messagePorts().createLocalPort(
        name, [self, slot](qint32 messageId, const QByteArray &data, const Platform::MessagePeer &) {
            if (!self || !*slot) {
                return std::optional<QByteArray>();
            }
            return QLNDLocalCallBack(*slot, messageId, data, self.data());
        });
    if (!port || !port->isValid()) {
        qCWarning(lcInstallation, "Failed to create port with name: %s", qPrintable(name));
        return nullptr;
    }
    *slot = port.get();
    Platform::LocalMessagePort *raw = port.get();
    m_localPorts.insert(name, std::shared_ptr<Platform::LocalMessagePort>(std::move(port)));
    return raw;
}

std::optional<QByteArray> CZSpeechInstallationManagerPrivate::_sendMessage(
    qint32 messageId, const QByteArray &withData, bool withReply)
{
    m_lastSendStatus = Platform::MessagePortStatus::IsInvalid;
    if (!_createServerPortIfNeeded()) {
        return std::nullopt;
    }
    const double receiveTimeout = withReply ? ReceiveTimeout : 0.0;
    const QByteArray data = withData.isNull() ? QByteArray("") : withData;
    const auto result = _serverPortRef->sendRequest(messageId, data, SendTimeout, receiveTimeout, withReply);
    m_lastSendStatus = result.status;
    if (result.status != Platform::MessagePortStatus::Success) {
        qCWarning(lcInstallation, "failed to send request %d: %d", int(messageId), result.status);
        return std::nullopt;
    }
    if (withReply && !result.reply) {
        qCWarning(lcInstallation, "client got NULL return data");
    }
    return result.reply;
}

QVariantList CZSpeechInstallationManager::activeInstallations()
{
    QVariantList records;
    if (!d->_serverIsRunning()) {
        return records;
    }
    const QByteArray request = CZEncodeSecureObject(
        QVariantMap {{ClientProcessIDKey, qint64(QCoreApplication::applicationPid())}});
    const auto reply = d->_sendMessage(ActiveInstallationsMessage, request, true);
    if (!reply) {
        return records;
    }
    if (const auto list = CZDecodeSecureArray(*reply)) {
        records.append(*list);
    }
    return records;
}

QVariantList CZSpeechInstallationManager::activeVoiceInstallations()
{
    return activeInstallations();
}

void CZSpeechInstallationManager::showProgressWindow()
{
    if (!d->_serverIsRunning()) {
        return;
    }
    (void)d->_sendMessage(ShowProgressWindowMessage,
        CZEncodeSecureObject(QVariantMap {{ClientProcessIDKey, qint64(QCoreApplication::applicationPid())}}),
        false);
}

void CZSpeechInstallationManager::cancelAllInstallations()
{
    (void)d->_sendMessage(CancelAllMessage, QByteArray(), false);
}

bool CZSpeechInstallationManagerPrivate::_requestInstallation(const QString &tagName, const QString &itemName,
    quint64 byteSize, const QString &objectIdentifier, qint64 userInteractionMode)
{
    if (tagName.isEmpty() || objectIdentifier.isEmpty() || itemName.isEmpty()) {
        return false;
    }
    Platform::LocalMessagePort *port = _createLocalPort();
    if (!port) {
        return false;
    }
    const QVariantMap record {{TagNameKey, tagName}, {ItemNameKey, itemName},
        {ItemByteSizeKey, QVariant::fromValue<quint64>(byteSize)}, {ClientPortNameKey, port->name()},
        {ClientProcessIDKey, qint64(QCoreApplication::applicationPid())}, {ObjectIDKey, objectIdentifier},
        {UserInteractionModeKey, userInteractionMode}, {ItemDownloadStatusKey, qint64(WaitingStatus)}};
    (void)_sendMessage(StartInstallingMessage, CZEncodeSecureObject(record), false);
    if (m_lastSendStatus != Platform::MessagePortStatus::Success) {
        // Nobody will ever answer this port: close it, and let the user know.
        releaseLocalPort(port->name());
        Q_EMIT q->installationRequestFailed(tagName, itemName, userInteractionMode);
        return false;
    }
    return true;
}

QStringList CZSpeechInstallationManagerPrivate::pendingLocalPortNames() const
{
    return m_localPorts.keys();
}

void CZSpeechInstallationManagerPrivate::releaseLocalPort(const QString &name)
{
    // Kept alive until the callback that released it has returned.
    const auto port = m_localPorts.take(name);
    if (port) {
        port->invalidate();
        QMetaObject::invokeMethod(
            q, [port] {}, Qt::QueuedConnection);
    }
}

std::optional<QByteArray> QLNDLocalCallBack(Platform::LocalMessagePort *port, qint32 messageId,
    const QByteArray &data, CZSpeechInstallationManager *info)
{
    if (data.isEmpty()) {
        qCWarning(lcInstallation, "Quillond returned nil data to port %s", qPrintable(port->name()));
        return std::nullopt;
    }
    const auto record = CZDecodeSecureDictionary(data);
    if (messageId == InstalledCompletion || messageId == CancelledCompletion
        || messageId == FailedCompletion) {
        const QString tag = record.value_or(QVariantMap()).value(TagNameKey).toString();
        if (const auto delegate = info->delegate()) {
            delegate->speechItemTags({tag}, messageId);
        }
        Q_EMIT info->installationFinished(tag, messageId, record.value_or(QVariantMap()));
        CZSpeechInstallationManagerPrivate::get(info)->releaseLocalPort(port->name());
    }
    return std::nullopt;
}

} // namespace Cadenza
