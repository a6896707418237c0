// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_FAKERECOGNITIONSERVICE_H
#define CADENZA_TESTS_FAKERECOGNITIONSERVICE_H

#include "core/services/RecognitionService.h"

#include <QHash>

namespace Cadenza::Platform {

/// Recognizer languages that a test sets.
class FakeRecognitionService final : public RecognitionService
{
public:
    std::optional<QStringList> installedLanguages() override { return m_languages; }
    QString bundlePathForIdentifier(const QString &bundleIdentifier) override
    {
        return m_byIdentifier.value(bundleIdentifier);
    }
    QString bundlePathForLocale(const QString &localeIdentifier) override
    {
        return m_byLocale.value(localeIdentifier);
    }
    std::optional<RecognizerModel> modelForLocale(const QString &localeIdentifier, QString *reason) override
    {
        if (reason) {
            *reason = QStringLiteral("the test recognizer of %1 has no model").arg(localeIdentifier);
        }
        return std::nullopt;
    }
    void setInstalledLanguages(const std::optional<QStringList> &languages) { m_languages = languages; }
    void addBundle(const QString &path, const QString &identifier, const QString &locale)
    {
        m_byIdentifier.insert(identifier, path);
        m_byLocale.insert(locale, path);
    }

private:
    std::optional<QStringList> m_languages;
    QHash<QString, QString> m_byIdentifier;
    QHash<QString, QString> m_byLocale;
};

} // namespace Cadenza::Platform

#endif
