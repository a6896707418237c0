// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_INSTALLATION_SECUREARCHIVING_H
#define CADENZA_INSTALLATION_SECUREARCHIVING_H

#include "cadenzaprotocol_export.h"

#include <QByteArray>
#include <QVariant>

#include <optional>

namespace Cadenza {

/// The keyed archive of @p object; a null QByteArray, after one log line, when it cannot be archived.
[[nodiscard]] CADENZAPROTOCOL_EXPORT QByteArray CZEncodeSecureObject(const QVariant &object);

/// The array archived in @p data (arrays and dictionaries allowed); nothing, after one log line,
/// when the data is damaged or holds anything else.
[[nodiscard]] CADENZAPROTOCOL_EXPORT std::optional<QVariantList> CZDecodeSecureArray(const QByteArray &data);

/// The dictionary archived in @p data (dictionaries allowed, nothing else); nothing when damaged.
[[nodiscard]] CADENZAPROTOCOL_EXPORT std::optional<QVariantMap> CZDecodeSecureDictionary(
    const QByteArray &data);

} // namespace Cadenza

#endif
