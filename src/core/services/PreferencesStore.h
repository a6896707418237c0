// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_PREFERENCESSTORE_H
#define CADENZA_PLATFORM_PREFERENCESSTORE_H

#include "cadenzacore_export.h"

#include <QString>
#include <QVariant>

namespace Cadenza::Platform {

/**
 * Per-domain user preferences shared by every process of the user.
 *
 * Values written with setValue() are seen at once by this process and reach other processes at the
 * next synchronize(); synchronize() also brings in what other processes wrote. Values are property
 * list values (see PropertyList).
 */
class CADENZACORE_EXPORT PreferencesStore
{
public:
    virtual ~PreferencesStore();

    /// The value of @p key in @p domain, or an invalid QVariant when absent.
    [[nodiscard]] virtual QVariant value(const QString &key, const QString &domain) = 0;
    /// Sets @p key; an invalid @p value removes it.
    virtual void setValue(const QString &key, const QVariant &value, const QString &domain) = 0;
    /// Writes this process's changes and reads other processes' ones. False when the domain could not be
    /// written.
    [[nodiscard]] virtual bool synchronize(const QString &domain) = 0;

    /// A domain name is a reverse-domain word: it becomes a file name, so nothing else is accepted.
    [[nodiscard]] static bool isValidDomainName(const QString &domain);
};

} // namespace Cadenza::Platform

#endif
