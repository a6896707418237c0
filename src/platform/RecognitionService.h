#ifndef CADENZA_PLATFORM_RECOGNITIONSERVICE_H
#define CADENZA_PLATFORM_RECOGNITIONSERVICE_H

#include "cadenzacore_export.h"

#include <QHash>
#include <QStringList>

#include <optional>

namespace Cadenza::Platform {

/// The speech-recognition core: which recognizer languages are installed.
class CADENZACORE_EXPORT RecognitionService
{
public:
    virtual ~RecognitionService();
    /// Locale identifiers of the installed recognizer languages, as the recognizers spell them;
    /// nothing when the core gives no answer.
    [[nodiscard]] virtual std::optional<QStringList> installedLanguages() = 0;
    /// The folder of the installed recognizer bundle with this bundle identifier; empty when none.
    [[nodiscard]] virtual QString bundlePathForIdentifier(const QString &bundleIdentifier) = 0;
    /// The folder of the installed recognizer bundle named "<locale>.SpeechRecognition"; empty when none.
    [[nodiscard]] virtual QString bundlePathForLocale(const QString &localeIdentifier) = 0;
};

/// The recognizer bundles (".SpeechRecognition", with "LocaleIdentifier" in their Info.plist) of the
/// recognizer folders, user first.
class CADENZACORE_EXPORT BundleRecognitionService final : public RecognitionService
{
public:
    std::optional<QStringList> installedLanguages() override;
    QString bundlePathForIdentifier(const QString &bundleIdentifier) override;
    QString bundlePathForLocale(const QString &localeIdentifier) override;
};

/// Recognizer languages that a test sets.
class CADENZACORE_EXPORT FakeRecognitionService final : public RecognitionService
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
