// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLUGINS_FLITEENGINEPLUGIN_H
#define CADENZA_PLUGINS_FLITEENGINEPLUGIN_H

#include "core/engines/SpeechEngine.h"

#include <QHash>
#include <QMutex>
#include <QObject>

#include <atomic>

struct cst_voice_struct;

namespace Cadenza::Engines {

/**
 * The flite engine: voices whose data is a ".flitevox" file in the bundle's Resources.
 *
 * A bundle's "Voice" names that file; "VoiceFileSize" and "VoiceFileSHA256" describe it, and the file
 * is checked against them (and its header read) before flite sees it. A voice is loaded once and kept
 * while its file stays the same. Audio is handed out while flite synthesises the waveform, after
 * it has analysed the whole text. flite's voices are not safe to share between threads, so renders are
 * serialised.
 */
class FliteEnginePlugin final : public QObject, public Platform::SpeechEngine
{
    Q_OBJECT
    Q_PLUGIN_METADATA(IID CadenzaSpeechEngine_iid FILE "flite.json")
    Q_INTERFACES(Cadenza::Platform::SpeechEngine)
public:
    QString engineName() const override { return QStringLiteral("flite"); }
    /// The size of the audio blocks handed out, in samples.
    static constexpr int StreamSamples = 2048;

    bool renderBlocks(const Platform::VoiceDescription &voice, const QString &text,
        const Platform::SynthesisParameters &parameters, const Platform::AudioBlockSink &sink,
        QString *error) override;
    void cancel() override { m_cancelled = true; }

private:
    struct LoadedVoice
    {
        cst_voice_struct *voice = nullptr;
        QByteArray fileStamp; ///< size, modification time and inode of the file it came from
    };
    cst_voice_struct *loadVoice(const Platform::VoiceDescription &voice, QString *error);

    QMutex m_mutex;
    bool m_initialised = false;
    QHash<QString, LoadedVoice> m_voices;
    std::atomic<bool> m_cancelled {false};
};

} // namespace Cadenza::Engines

#endif
