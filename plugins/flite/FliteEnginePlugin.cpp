// SPDX-FileCopyrightText: 2026 The Cadenza developers
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
#include <vector>

extern "C" {
// The English front end and lexicon of flite's own voices; their headers are not installed.
void usenglish_init(cst_voice *voice);
cst_lexicon *cmu_lex_init(void);
}

namespace Cadenza::Engines {

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

/// Where flite's streaming callback hands its audio.
struct StreamTarget
{
    const Platform::AudioBlockSink *sink = nullptr;
    const std::atomic<bool> *cancelled = nullptr;
    double volume = 1.0;
    int sent = 0; ///< samples of the wave handed out so far
    bool stopped = false;
    std::vector<qint16> block;

    /// Hands out the wave's samples [sent, end); false once the render is to stop.
    bool pass(const cst_wave *wave, int end)
    {
        if (stopped || cancelled->load()) {
            stopped = true;
            return false;
        }
        const int channels = qMax(1, wave->num_channels);
        end = qMin(end, wave->num_samples);
        if (end <= sent) {
            return true;
        }
        // Volume: flite has no loudness of its own, so the samples are scaled.
        block.resize(size_t(end - sent));
        for (int i = sent; i < end; ++i) {
            const double sample = wave->samples[qsizetype(i) * channels] * volume;
            block[size_t(i - sent)] = qint16(qBound(-32768.0, sample, 32767.0));
        }
        sent = end;
        if (!(*sink)(block.data(), qsizetype(block.size()), wave->sample_rate)) {
            stopped = true;
        }
        return !stopped;
    }
};

int streamChunk(const cst_wave *wave, int start, int size, int, cst_audio_streaming_info *info)
{
    auto *target = static_cast<StreamTarget *>(info->userdata);
    return target->pass(wave, start + size) ? CST_AUDIO_STREAM_CONT : CST_AUDIO_STREAM_STOP;
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

bool FliteEnginePlugin::renderBlocks(const VoiceDescription &voice, const QString &text,
    const SynthesisParameters &parameters, const Platform::AudioBlockSink &sink, QString *error)
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
        return false;
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
    // The voice's waveform synthesis hands out its samples as it goes (clustergen voices do; others
    // give the whole wave at the end, which is then handed out below).
    StreamTarget target {&sink, &m_cancelled, parameters.volume};
    cst_audio_streaming_info *streaming = new_audio_streaming_info();
    streaming->min_buffsize = StreamSamples;
    streaming->asc = streamChunk;
    streaming->userdata = &target;
    flite_feat_set(engineVoice->features, "streaming_info", audio_streaming_info_val(streaming));
    cst_wave *wave = guardedTextToWave(text.toUtf8().constData(), engineVoice);
    flite_feat_remove(engineVoice->features, "streaming_info"); // frees the streaming info
    if (model) {
        model->spamf0 = ownContour;
    }
    if (!wave) {
        if (target.stopped) {
            return true;
        }
        if (error) {
            *error = QStringLiteral("flite could not speak the text");
        }
        return false;
    }
    for (int end = target.sent + StreamSamples; target.sent < wave->num_samples; end += StreamSamples) {
        if (!target.pass(wave, end)) {
            break;
        }
    }
    delete_wave(wave);
    return true;
}

} // namespace Cadenza::Engines
