// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_RECOGNITIONENGINE_H
#define CADENZA_PLATFORM_RECOGNITIONENGINE_H

#include <QString>
#include <QVariantMap>
#include <QtPlugin>

#include <memory>
#include <optional>

namespace Cadenza::Platform {

/**
 * A recognizer bundle's model as its Info.plist describes it: the engine that reads it
 * ("RecognitionEngine") and the engine's own description of the files ("RecognitionModel", paths
 * relative to the bundle folder).
 */
struct RecognizerModel
{
    QString bundlePath;
    QString localeIdentifier;
    QString engineName;
    QVariantMap files; ///< the "RecognitionModel" dictionary

    /// The absolute path of the model file named by @p key; empty when the bundle names none or
    /// the name leaves the bundle.
    [[nodiscard]] QString filePath(const QString &key) const
    {
        const QString relative = files.value(key).toString();
        if (relative.isEmpty() || relative.startsWith(QLatin1Char('/'))
            || relative.contains(QLatin1String(".."))) {
            return {};
        }
        return bundlePath + QLatin1Char('/') + relative;
    }
};

/**
 * A loaded model turning 16-bit mono PCM at the engine's sample rate into words, one utterance at a
 * time. Not thread-safe: one thread uses one decoder at a time.
 */
class RecognitionDecoder
{
public:
    virtual ~RecognitionDecoder() = default;

    /**
     * Begins an utterance: free dictation with the model's language model, or, with a JSGF
     * @p grammarFile, only the sentences of that grammar. False with a readable @p error when the
     * grammar cannot be used.
     */
    [[nodiscard]] virtual bool begin(const QString &grammarFile, QString *error) = 0;
    /// Feeds the next samples of the utterance.
    [[nodiscard]] virtual bool process(const qint16 *samples, qsizetype count, QString *error) = 0;
    /// The best words so far.
    [[nodiscard]] virtual QString partialResult() = 0;
    /// Ends the utterance and returns its words (empty for silence); nothing with an @p error.
    [[nodiscard]] virtual std::optional<QString> end(QString *error) = 0;
};

/**
 * A speech recognition engine. Each engine is a Qt plugin in the library's recognition plugin folder
 * (see RecognitionEngines); recognizer bundles name the engine that reads their model.
 */
class RecognitionEngine
{
public:
    virtual ~RecognitionEngine() = default;

    /// The name bundles use for this engine ("pocketsphinx").
    [[nodiscard]] virtual QString engineName() const = 0;
    /// The sample rate decoders expect.
    [[nodiscard]] virtual int sampleRate() const = 0;
    /**
     * Whether @p model looks loadable: its files are present and of the right kind. Cheap enough
     * to run for every bundle when languages are listed; false with a readable @p reason.
     */
    [[nodiscard]] virtual bool checkModel(const RecognizerModel &model, QString *reason) const = 0;
    /// Loads @p model; nullptr with a readable @p error when it cannot be loaded.
    [[nodiscard]] virtual std::unique_ptr<RecognitionDecoder> load(
        const RecognizerModel &model, QString *error)
        = 0;
};

} // namespace Cadenza::Platform

#define CadenzaRecognitionEngine_iid "org.cadenza.RecognitionEngine/1"
Q_DECLARE_INTERFACE(Cadenza::Platform::RecognitionEngine, CadenzaRecognitionEngine_iid)

#endif
