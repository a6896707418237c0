// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeInstallerDaemon.h"

#include "protocol/InstallerProtocol.h"
#include "protocol/SecureArchiving.h"

namespace Cadenza::Testing {

using namespace InstallerProtocol;

FakeInstallerDaemon::FakeInstallerDaemon(Platform::FakeMessagePortService &ports)
    : m_answer(CZEncodeSecureObject(QVariantList()))
{
    m_requestPort = ports.createLocalPort(ServicePortName,
        [this](
            qint32 id, const QByteArray &data, const Platform::MessagePeer &) -> std::optional<QByteArray> {
            m_messages.append({id, data});
            return id == ActiveInstallationsMessage ? m_answer : std::nullopt;
        });
    m_livenessPort = ports.createLocalPort(
        LivenessPortName, [](qint32, const QByteArray &, const Platform::MessagePeer &) {
            return std::optional<QByteArray>();
        });
}

void FakeInstallerDaemon::setActiveRecords(const QVariantList &records)
{
    m_answer = CZEncodeSecureObject(records);
}

QList<QVariantMap> FakeInstallerDaemon::installRequests() const
{
    QList<QVariantMap> requests;
    for (const auto &[id, data] : m_messages) {
        if (id == StartInstallingMessage) {
            requests.append(CZDecodeSecureDictionary(data).value_or(QVariantMap()));
        }
    }
    return requests;
}

} // namespace Cadenza::Testing
