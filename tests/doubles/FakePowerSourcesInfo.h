// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_FAKEPOWERSOURCESINFO_H
#define CADENZA_TESTS_FAKEPOWERSOURCESINFO_H

#include "core/services/PowerSourcesInfo.h"

namespace Cadenza::Platform {

/// Power sources that a test sets.
class FakePowerSourcesInfo final : public PowerSourcesInfo
{
public:
    std::optional<QList<QVariantMap>> powerSources() override { return m_sources; }
    void setPowerSources(const std::optional<QList<QVariantMap>> &sources) { m_sources = sources; }
    /// One source in @p state.
    void setState(const QString &state) { m_sources = QList<QVariantMap> {{{StateKey, state}}}; }

private:
    std::optional<QList<QVariantMap>> m_sources;
};

} // namespace Cadenza::Platform

#endif
