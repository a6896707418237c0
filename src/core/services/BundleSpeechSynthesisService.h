// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_BUNDLESPEECHSYNTHESISSERVICE_H
#define CADENZA_PLATFORM_BUNDLESPEECHSYNTHESISSERVICE_H

#include "SpeechSynthesisService.h"
#include "core/formats/WaveFile.h"

#include <QHash>
#include <QMutex>
#include <QPointer>

#include <memory>

class QAudioSink;
class QBuffer;

namespace Cadenza::Platform {

class VoiceIndex;

/**
 * The Linux speech synthesis service: voices are the ".SpeechVoice" bundles of the voice folders
 * (user, local, system; the first folder holding an identifier wins), each spoken by the engine
 * plugin its bundle names (see SpeechEngines).
 *
 * A folder is scanned again only when its modification time changes, which an installation's final
 * rename always does. A scan parses only the bundles the voice index (see VoiceIndex) does not hold
 * with their Info.plist's present stamp, and writes the index back when it learnt something. Speech is
 * rendered on a worker thread and played on the default audio output; with no audio output, a request
 * finishes as soon as it is rendered.
 */
class CADENZACORE_EXPORT BundleSpeechSynthesisService final : public SpeechSynthesisService
{
    Q_OBJECT
public:
    explicit BundleSpeechSynthesisService(QObject *parent = nullptr);
    ~BundleSpeechSynthesisService() override;

    QList<VoiceDescription> installedVoices() override;
    quint64 voicesGeneration() const override;
    std::optional<QString> speechLanguageLocale() override;
    quint64 startSpeaking(const SpeechRequest &request) override;
    void stopSpeaking() override;
    bool isSpeaking() const override { return m_currentRequest != 0; }
    void setSpeakingVolume(double volume) override;
    bool renderToFile(const SpeechRequest &request, const QString &wavPath, QString *error) override;

    /// Reads one bundle; nothing, with one log line naming it, when its Info.plist is unreadable.
    [[nodiscard]] static std::optional<VoiceDescription> readBundle(const QString &bundlePath);

    /// Where the voice index is kept (VoiceIndex::defaultPath() unless set); empty: no index. Takes
    /// effect at the next scan.
    void setVoiceIndexPath(const QString &path);

private:
    struct FolderScan
    {
        qint64 modifiedNs = -1;
        quint64 inode = 0;
        QList<VoiceDescription> voices;
    };

    QList<VoiceDescription> scanFolder(const QString &folder);
    static std::optional<VoiceDescription> parseBundle(const QString &bundlePath, QString *error);
    std::optional<VoiceDescription> voiceForRequest(const SpeechRequest &request);
    void renderFinished(quint64 requestId, const std::optional<PcmAudio> &audio, const QString &error);
    void finishCurrent(bool completed);

    mutable QMutex m_scanMutex;
    QHash<QString, FolderScan> m_folders;
    QList<VoiceDescription> m_merged;
    QStringList m_mergedKey;
    quint64 m_generation = 0;
    std::optional<QString> m_indexPath;
    std::unique_ptr<VoiceIndex> m_index; ///< loaded at the first scan

    quint64 m_nextRequest = 1;
    quint64 m_currentRequest = 0;
    QString m_currentEngine; ///< the engine rendering the current request
    QPointer<QAudioSink> m_sink;
    QBuffer *m_buffer = nullptr;
    double m_renderedVolume = 1.0; ///< the loudness the playing samples were rendered at
};

} // namespace Cadenza::Platform

#endif
