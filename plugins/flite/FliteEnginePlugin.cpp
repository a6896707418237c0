// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FliteEnginePlugin.h"

#include "FliteVoiceFile.h"

#include <QFile>
#include <QFileInfo>

#include <flite/flite.h>
extern "C" {
#include <flite/cst_cg.h> // declares its functions without C linkage
}

#include <csetjmp>

extern "C" {
// The English front end and lexicon of flite's own voices; their headers are not installed.
void usenglish_init(cst_voice *voice);
cst_lexicon *cmu_lex_init(void);
}

namespace Cadenza::Engines {

using Platform::PcmAudio;
using Platform::SynthesisParameters;
using Platform::VoiceDescription;

namespace {

/// flite ends the process on an internal error unless cst_errjmp is set: catch it instead. Only C
/// frames lie between setjmp and a longjmp, so no destructor is skipped.
cst_voice *guardedLoad(const char *path)
{
    jmp_buf here;
    jmp_buf *previous = cst_errjmp;
    cst_errjmp = &here;
    cst_voice *volatile voice = nullptr;
    if (setjmp(here) == 0) {
        voice = flite_voice_load(path);
    }
    cst_errjmp = previous;
    return voice;
}

cst_wave *guardedTextToWave(const char *text, cst_voice *voice)
{
    jmp_buf here;
    jmp_buf *previous = cst_errjmp;
    cst_errjmp = &here;
    cst_wave *volatile wave = nullptr;
    if (setjmp(here) == 0) {
        wave = flite_text_to_wave(text, voice);
    }
    cst_errjmp = previous;
    return wave;
}

QByteArray stampOf(const QString &path)
{
    const QFileInfo info(path);
    return QByteArray::number(info.size()) + '|' + QByteArray::number(info.lastModified().toMSecsSinceEpoch())
        + '|' + QFile::encodeName(info.canonicalFilePath());
}

} // namespace

cst_voice *FliteEnginePlugin::loadVoice(const VoiceDescription &voice, QString *error)
{
    const QString fileName = voice.engineVoice;
    if (fileName.isEmpty() || fileName.contains(QLatin1Char('/')) || fileName.startsWith(QLatin1Char('.'))) {
        *error = QStringLiteral("the bundle names no voice file in its Resources (Engine/Voice is '%1')")
                     .arg(fileName);
        return nullptr;
    }
    const QString path = voice.bundlePath + QStringLiteral("/Resources/") + fileName;
    const QByteArray stamp = stampOf(path);
    const auto known = m_voices.constFind(path);
    if (known != m_voices.cend() && known->fileStamp == stamp) {
        return known->voice;
    }
    const QVariant size = voice.engineSettings.value(QStringLiteral("VoiceFileSize"));
    const QVariant sha = voice.engineSettings.value(QStringLiteral("VoiceFileSHA256"));
    const auto header = FliteVoiceFile::check(path,
        size.typeId() == QMetaType::LongLong || size.typeId() == QMetaType::Int ? size.toLongLong() : -1,
        sha.typeId() == QMetaType::QString ? sha.toString().toLatin1() : QByteArray(), error);
    if (!header) {
        return nullptr;
    }
    cst_voice *loaded = guardedLoad(QFile::encodeName(path).constData());
    if (!loaded) {
        *error = QStringLiteral("flite could not load the voice file %1").arg(path);
        return nullptr;
    }
    // A replaced voice is not freed: flite gives no way to free a loaded voice's model data safely.
    m_voices.insert(path, {loaded, stamp});
    return loaded;
}

std::optional<PcmAudio> FliteEnginePlugin::render(
    const VoiceDescription &voice, const QString &text, const SynthesisParameters &parameters, QString *error)
{
    QMutexLocker locker(&m_mutex);
    QString reason;
    if (!m_initialised) {
        m_initialised = true;
        flite_init();
        flite_add_lang("eng", usenglish_init, cmu_lex_init);
        flite_add_lang("usenglish", usenglish_init, cmu_lex_init);
    }
    m_cancelled = false;
    cst_voice *engineVoice = loadVoice(voice, &reason);
    if (!engineVoice) {
        if (error) {
            *error = reason;
        }
        return std::nullopt;
    }

    // Rate: flite stretches durations; the bundle's Rate is the voice's own words per minute.
    flite_feat_set_float(engineVoice->features, "duration_stretch", float(parameters.durationStretch()));
    // Pitch: the voice's own mean pitch, moved as far as the pitch scale says.
    auto *model
        = const_cast<cst_cg_db *>(val_cg_db(flite_get_param_val(engineVoice->features, "cg_db", nullptr)));
    const double factor = parameters.pitchFactor();
    const int ownContour = model ? model->spamf0 : 0;
    if (model && std::abs(factor - 1.0) > 1e-3) {
        flite_feat_set_float(engineVoice->features, "int_f0_target_mean", float(model->f0_mean * factor));
        // Voices with an accent model ignore the target mean; their plain contour follows it.
        model->spamf0 = 0;
    } else {
        flite_feat_remove(engineVoice->features, "int_f0_target_mean");
    }
    cst_wave *wave = guardedTextToWave(text.toUtf8().constData(), engineVoice);
    if (model) {
        model->spamf0 = ownContour;
    }
    if (!wave) {
        if (error) {
            *error = QStringLiteral("flite could not speak the text");
        }
        return std::nullopt;
    }
    PcmAudio audio;
    audio.sampleRate = wave->sample_rate;
    const int channels = qMax(1, wave->num_channels);
    audio.samples.reserve(size_t(wave->num_samples));
    // Volume: flite has no loudness of its own, so the samples are scaled.
    for (int i = 0; i < wave->num_samples && !m_cancelled; ++i) {
        const double sample = wave->samples[qsizetype(i) * channels] * parameters.volume;
        audio.samples.push_back(qint16(qBound(-32768.0, sample, 32767.0)));
    }
    delete_wave(wave);
    return audio;
}

} // namespace Cadenza::Engines
