// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_FAKEINSTALLERDAEMON_H
#define CADENZA_TESTS_FAKEINSTALLERDAEMON_H

#include "FakeMessagePortService.h"

#include <QVariantList>

#include <memory>
#include <optional>

namespace Cadenza::Testing {

/// An installer daemon made of fake ports: it records every message and answers the list of active
/// installations with what the test sets.
class FakeInstallerDaemon
{
public:
    explicit FakeInstallerDaemon(Platform::FakeMessagePortService &ports);

    /// The answer to message 3; nothing answers with no data.
    void setAnswer(const std::optional<QByteArray> &answer) { m_answer = answer; }
    /// Answers message 3 with these status records.
    void setActiveRecords(const QVariantList &records);

    [[nodiscard]] QList<std::pair<qint32, QByteArray>> messages() const { return m_messages; }
    /// The decoded payloads of the installation requests (message 1).
    [[nodiscard]] QList<QVariantMap> installRequests() const;

private:
    std::unique_ptr<Platform::LocalMessagePort> m_requestPort;
    std::unique_ptr<Platform::LocalMessagePort> m_livenessPort;
    QList<std::pair<qint32, QByteArray>> m_messages;
    std::optional<QByteArray> m_answer;
};

} // namespace Cadenza::Testing

#endif
