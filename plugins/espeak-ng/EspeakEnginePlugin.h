// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_PLUGINS_ESPEAKENGINEPLUGIN_H
#define CADENZA_PLUGINS_ESPEAKENGINEPLUGIN_H

#include "core/engines/SpeechEngine.h"

#include <QMutex>
#include <QObject>

#include <atomic>

namespace Cadenza::Engines {

/**
 * The espeak-ng engine: the compact voices of every language.
 *
 * espeak-ng keeps one global synthesiser, so renders are serialised. Audio comes in blocks of
 * BlockMilliseconds as espeak-ng synthesises it. A bundle's "Voice" is an
 * espeak-ng voice name or a language, "Variant" an espeak-ng variant ("f2", "whisper").
 */
class EspeakEnginePlugin final : public QObject, public Platform::SpeechEngine
{
    Q_OBJECT
    Q_PLUGIN_METADATA(IID CadenzaSpeechEngine_iid FILE "espeak-ng.json")
    Q_INTERFACES(Cadenza::Platform::SpeechEngine)
public:
    /// The length of the audio blocks espeak-ng hands out; the first block waits for this much speech.
    static constexpr int BlockMilliseconds = 60;

    QString engineName() const override { return QStringLiteral("espeak-ng"); }
    bool renderBlocks(const Platform::VoiceDescription &voice, const QString &text,
        const Platform::SynthesisParameters &parameters, const Platform::AudioBlockSink &sink,
        QString *error) override;
    void cancel() override { m_cancelled = true; }

private:
    bool initialise(QString *error);

    QMutex m_mutex;
    int m_sampleRate = 0;
    bool m_initialised = false;
    QString m_currentVoice; ///< what the synthesiser was last set to; empty when unknown
    std::atomic<bool> m_cancelled {false};
};

} // namespace Cadenza::Engines

#endif
