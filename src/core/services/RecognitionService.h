// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_RECOGNITIONSERVICE_H
#define CADENZA_PLATFORM_RECOGNITIONSERVICE_H

#include "cadenzacore_export.h"
#include "core/engines/RecognitionEngine.h"

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
    /**
     * The model of the first installed bundle for @p localeIdentifier (spelled "en_US" or "en-US")
     * whose engine can load it; nothing, with a readable @p reason, when the language is not
     * installed or no bundle for it can recognise.
     */
    [[nodiscard]] virtual std::optional<RecognizerModel> modelForLocale(
        const QString &localeIdentifier, QString *reason)
        = 0;
};

/**
 * The recognizer bundles (".SpeechRecognition", with "LocaleIdentifier" in their Info.plist) of the
 * recognizer folders, user first. A language counts as installed only when one of its bundles names a
 * recognition engine ("RecognitionEngine") that is present and whose check of the bundle's model
 * ("RecognitionModel") passes; the others are skipped with a logged reason.
 */
class CADENZACORE_EXPORT BundleRecognitionService final : public RecognitionService
{
public:
    std::optional<QStringList> installedLanguages() override;
    QString bundlePathForIdentifier(const QString &bundleIdentifier) override;
    QString bundlePathForLocale(const QString &localeIdentifier) override;
    std::optional<RecognizerModel> modelForLocale(const QString &localeIdentifier, QString *reason) override;

    /**
     * Reads the bundle at @p bundlePath and checks its model with its engine; nothing, with a
     * readable @p reason, when it cannot recognise.
     */
    [[nodiscard]] static std::optional<RecognizerModel> usableModel(
        const QString &bundlePath, QString *reason);
};

} // namespace Cadenza::Platform

#endif
