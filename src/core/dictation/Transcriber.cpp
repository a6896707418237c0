// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "Transcriber.h"

#include "core/engines/RecognitionEngines.h"
#include "core/locale/LocalizationTable.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/services/RecognitionService.h"
#include "core/services/Services.h"

#include <cmath>

namespace Cadenza {

namespace {
/// Below this root mean square (about -44 dBFS) a 10 ms frame counts as quiet.
constexpr double QuietLevel = 200.0;
/// A pause this long after speech ends an utterance.
constexpr double PauseSeconds = 0.4;
} // namespace

std::unique_ptr<Transcriber> Transcriber::load(const Platform::RecognizerModel &model, QString *error)
{
    Platform::RecognitionEngine *engine = Platform::RecognitionEngines::engine(model.engineName, error);
    if (!engine) {
        return nullptr;
    }
    auto decoder = engine->load(model, error);
    if (!decoder) {
        return nullptr;
    }
    return std::make_unique<Transcriber>(std::move(decoder), engine->sampleRate());
}

std::unique_ptr<Transcriber> Transcriber::loadForLanguage(const QString &language, QString *error)
{
    Platform::RecognitionService &recognition = Platform::Services::recognition();
    QString locale = language;
    if (locale.isEmpty()) {
        const QStringList installed = recognition.installedLanguages().value_or(QStringList());
        if (installed.isEmpty()) {
            *error = QStringLiteral("no recognition language is installed");
            return nullptr;
        }
        locale = CZSRLanguageItem::preferredDictationLocaleIdentifierFromAvaiableLocaleIdentifiers(
            installed, QString());
    }
    const auto model = recognition.modelForLocale(locale, error);
    auto transcriber = model ? load(*model, error) : nullptr;
    // A language that has a bundle but cannot be used is named so; a missing one keeps its reason.
    if (!transcriber && !recognition.bundlePathForLocale(locale).isEmpty()) {
        *error = Platform::LocalizationTable::shared().format(
            QStringLiteral("RecognitionLanguageUnusable"), {locale, *error});
    }
    return transcriber;
}

Transcriber::Transcriber(std::unique_ptr<Platform::RecognitionDecoder> decoder, int sampleRate)
    : m_decoder(std::move(decoder))
    , m_sampleRate(sampleRate)
{ }

Transcriber::~Transcriber() = default;

bool Transcriber::begin(const QString &grammarFile, QString *error)
{
    m_grammarFile = grammarFile;
    m_words.clear();
    m_fedSamples = 0;
    m_utteranceSamples = 0;
    m_quietSamples = 0;
    m_heardSpeech = false;
    m_frameEnergy = 0;
    m_frameFill = 0;
    return m_decoder->begin(grammarFile, error);
}

bool Transcriber::endUtterance(QString *error)
{
    const auto words = m_decoder->end(error);
    if (!words) {
        return false;
    }
    if (!words->isEmpty()) {
        m_words.append(*words);
    }
    m_utteranceSamples = 0;
    m_quietSamples = 0;
    m_heardSpeech = false;
    return true;
}

bool Transcriber::feed(const qint16 *samples, qsizetype count, QString *error)
{
    const int frameLength = m_sampleRate / 100;
    const qint64 pauseLength = qint64(PauseSeconds * m_sampleRate);
    const qint64 maxLength = qint64(MaxUtteranceSeconds * m_sampleRate);
    qsizetype start = 0;
    for (qsizetype i = 0; i < count; ++i) {
        m_frameEnergy += double(samples[i]) * samples[i];
        if (++m_frameFill < frameLength) {
            continue;
        }
        const bool quiet = std::sqrt(m_frameEnergy / frameLength) < QuietLevel;
        m_frameEnergy = 0;
        m_frameFill = 0;
        m_quietSamples = quiet ? m_quietSamples + frameLength : 0;
        m_heardSpeech = m_heardSpeech || !quiet;
        const qint64 length = m_utteranceSamples + (i + 1 - start);
        if ((m_heardSpeech && m_quietSamples >= pauseLength) || length >= maxLength) {
            if (!m_decoder->process(samples + start, i + 1 - start, error) || !endUtterance(error)
                || !m_decoder->begin(m_grammarFile, error)) {
                return false;
            }
            m_fedSamples += i + 1 - start;
            start = i + 1;
        }
    }
    if (start < count) {
        if (!m_decoder->process(samples + start, count - start, error)) {
            return false;
        }
        m_utteranceSamples += count - start;
        m_fedSamples += count - start;
    }
    return true;
}

QString Transcriber::partialResult()
{
    QStringList words = m_words;
    const QString current = m_decoder->partialResult().simplified();
    if (!current.isEmpty()) {
        words.append(current);
    }
    return words.join(QLatin1Char(' '));
}

std::optional<QString> Transcriber::finish(QString *error)
{
    if (!endUtterance(error)) {
        return std::nullopt;
    }
    return m_words.join(QLatin1Char(' '));
}

} // namespace Cadenza
