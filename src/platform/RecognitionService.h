#ifndef CADENZA_PLATFORM_RECOGNITIONSERVICE_H
#define CADENZA_PLATFORM_RECOGNITIONSERVICE_H

#include "cadenzacore_export.h"

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
};

/// The recognizer bundles (".SpeechRecognition", with "LocaleIdentifier" in their Info.plist) of the
/// recognizer folders, user first.
class CADENZACORE_EXPORT BundleRecognitionService final : public RecognitionService
{
public:
    std::optional<QStringList> installedLanguages() override;
};

/// Recognizer languages that a test sets.
class CADENZACORE_EXPORT FakeRecognitionService final : public RecognitionService
{
public:
    std::optional<QStringList> installedLanguages() override { return m_languages; }
    void setInstalledLanguages(const std::optional<QStringList> &languages) { m_languages = languages; }

private:
    std::optional<QStringList> m_languages;
};

} // namespace Cadenza::Platform

#endif
