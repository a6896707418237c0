// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_LOCALIZATIONTABLE_H
#define CADENZA_PLATFORM_LOCALIZATIONTABLE_H

#include "cadenzacore_export.h"

#include <QString>
#include <QStringList>

#include <memory>

class QTranslator;

namespace Cadenza::Platform {

/**
 * Cadenza's user-visible texts, looked up by key. A key without a text gives the empty string.
 *
 * One table per language is compiled into the library; shared() follows the host application's
 * preferred localisation: the first of the user's languages that has a table, else English.
 */
class CADENZACORE_EXPORT LocalizationTable
{
public:
    explicit LocalizationTable(const QString &language);
    ~LocalizationTable();
    LocalizationTable(const LocalizationTable &) = delete;
    LocalizationTable &operator=(const LocalizationTable &) = delete;

    /// The process's table, chosen on first use.
    static const LocalizationTable &shared();
    /// Chooses the shared table again, after the user's languages changed.
    static void resetShared();

    /// Language codes that have a table, English first.
    [[nodiscard]] static QStringList shippedLanguages();
    /// The host application's preferred localisation: a language code of shippedLanguages().
    [[nodiscard]] static QString hostPreferredLocalization();

    [[nodiscard]] QString language() const { return m_language; }
    [[nodiscard]] QString text(const QString &key) const;
    /// text(@p key) filled with @p arguments (see format()).
    [[nodiscard]] QString format(const QString &key, const QStringList &arguments) const;

    /**
     * Fills a template: "%1".."%9" and "%1$@".."%9$@" take the numbered argument, "%@" the next one
     * in turn, "%%" is a percent sign. Missing arguments read as empty.
     */
    [[nodiscard]] static QString fill(const QString &templateText, const QStringList &arguments);

private:
    QString m_language;
    std::unique_ptr<QTranslator> m_translator;
};

} // namespace Cadenza::Platform

#endif
