// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_DICTATION_TRANSCRIBER_H
#define CADENZA_DICTATION_TRANSCRIBER_H

#include "cadenzacore_export.h"
#include "core/engines/RecognitionEngine.h"

#include <QString>

#include <functional>
#include <memory>
#include <optional>

namespace Cadenza {

/**
 * Turns a stream of 16-bit mono samples into text with one loaded model.
 *
 * The stream is cut into utterances at pauses (and at the latest every MaxUtteranceSeconds), so the
 * decoder's memory stays bounded however long the recording is; the words of finished utterances
 * are kept and joined.
 */
class CADENZACORE_EXPORT Transcriber
{
public:
    static constexpr double MaxUtteranceSeconds = 30.0;

    /// Loads the model of @p model with its engine; nothing, with a readable @p error, when it fails.
    [[nodiscard]] static std::unique_ptr<Transcriber> load(
        const Platform::RecognizerModel &model, QString *error);

    /**
     * Loads the model of the installed recognizer of @p language, or of the preferred dictation
     * language among the installed ones when it is empty.
     */
    [[nodiscard]] static std::unique_ptr<Transcriber> loadForLanguage(
        const QString &language, QString *error);

    Transcriber(std::unique_ptr<Platform::RecognitionDecoder> decoder, int sampleRate);
    ~Transcriber();

    /// The rate the samples must have.
    [[nodiscard]] int sampleRate() const { return m_sampleRate; }
    /// Starts a new transcript, with a JSGF @p grammarFile or free dictation when empty.
    [[nodiscard]] bool begin(const QString &grammarFile, QString *error);
    /// Feeds samples; false with a readable @p error when the decoder fails.
    [[nodiscard]] bool feed(const qint16 *samples, qsizetype count, QString *error);
    /// The words so far, including the best guess for the utterance under way.
    [[nodiscard]] QString partialResult();
    /// Ends the transcript and returns all its words.
    [[nodiscard]] std::optional<QString> finish(QString *error);
    /// Seconds of audio fed since begin().
    [[nodiscard]] double fedSeconds() const { return double(m_fedSamples) / m_sampleRate; }

private:
    bool endUtterance(QString *error);

    std::unique_ptr<Platform::RecognitionDecoder> m_decoder;
    int m_sampleRate;
    QString m_grammarFile;
    QStringList m_words;
    qint64 m_fedSamples = 0;
    qint64 m_utteranceSamples = 0;
    qint64 m_quietSamples = 0;
    bool m_heardSpeech = false;
    // The level of the current 10 ms frame, carried across feeds.
    double m_frameEnergy = 0;
    int m_frameFill = 0;
};

} // namespace Cadenza

#endif
