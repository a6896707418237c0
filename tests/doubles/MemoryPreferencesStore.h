// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_MEMORYPREFERENCESSTORE_H
#define CADENZA_TESTS_MEMORYPREFERENCESSTORE_H

#include "core/services/PreferencesStore.h"

#include <QHash>
#include <QVariantMap>

namespace Cadenza::Platform {

/**
 * In-memory preferences for tests. Several stores made from one shared backing stand for several
 * processes: each keeps its own unsynchronised changes until synchronize().
 */
class MemoryPreferencesStore final : public PreferencesStore
{
public:
    using Backing = QHash<QString, QVariantMap>;

    MemoryPreferencesStore();
    /// Shares @p backing (the "disk") with other stores.
    explicit MemoryPreferencesStore(std::shared_ptr<Backing> backing);

    QVariant value(const QString &key, const QString &domain) override;
    void setValue(const QString &key, const QVariant &value, const QString &domain) override;
    bool synchronize(const QString &domain) override;

    /// Makes the next synchronize() fail, as a full disk would.
    void setFailsToWrite(bool fails) { m_failsToWrite = fails; }
    [[nodiscard]] std::shared_ptr<Backing> backing() const { return m_backing; }
    /// How often synchronize() ran, so tests can check that writes are synchronised.
    [[nodiscard]] int synchronizeCount() const { return m_synchronizeCount; }

private:
    std::shared_ptr<Backing> m_backing;
    QHash<QString, QHash<QString, QVariant>> m_pending; // invalid QVariant = removal
    bool m_failsToWrite = false;
    int m_synchronizeCount = 0;
};

} // namespace Cadenza::Platform

#endif
