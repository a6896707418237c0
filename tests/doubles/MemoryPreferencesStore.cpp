// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "MemoryPreferencesStore.h"

namespace Cadenza::Platform {

MemoryPreferencesStore::MemoryPreferencesStore()
    : MemoryPreferencesStore(std::make_shared<Backing>())
{ }

MemoryPreferencesStore::MemoryPreferencesStore(std::shared_ptr<Backing> backing)
    : m_backing(std::move(backing))
{ }

QVariant MemoryPreferencesStore::value(const QString &key, const QString &domain)
{
    if (!isValidDomainName(domain)) {
        return {};
    }
    const auto pending = m_pending.value(domain);
    if (auto it = pending.constFind(key); it != pending.cend()) {
        return it.value();
    }
    // Like the file store, other writers become visible as soon as they have synchronised.
    return m_backing->value(domain).value(key);
}

void MemoryPreferencesStore::setValue(const QString &key, const QVariant &value, const QString &domain)
{
    if (!isValidDomainName(domain)) {
        return;
    }
    m_pending[domain].insert(key, value);
}

bool MemoryPreferencesStore::synchronize(const QString &domain)
{
    ++m_synchronizeCount;
    if (!isValidDomainName(domain) || m_failsToWrite) {
        return false;
    }
    QVariantMap &disk = (*m_backing)[domain];
    const auto pending = m_pending.take(domain);
    for (auto it = pending.cbegin(); it != pending.cend(); ++it) {
        if (it.value().isValid()) {
            disk.insert(it.key(), it.value());
        } else {
            disk.remove(it.key());
        }
    }
    return true;
}

} // namespace Cadenza::Platform
