// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "BundleSpeechSynthesisService.h"

#include "PreferencesStore.h"
#include "Services.h"
#include "cadenzacore_logging.h"
#include "core/SpeechNames.h"
#include "core/engines/SpeechEngine.h"
#include "core/engines/SpeechEngines.h"
#include "core/files/Paths.h"
#include "core/formats/Locale.h"
#include "core/formats/PropertyList.h"
#include "core/formats/VoiceIndex.h"

#include <QAudioDevice>
#include <QAudioFormat>
#include <QAudioSink>
#include <QBuffer>
#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QMediaDevices>
#include <QThreadPool>
#include <QtConcurrent/QtConcurrentMap>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>

namespace Cadenza::Platform {

namespace {

const QString BundleSuffix = QStringLiteral(".SpeechVoice");
// An Info.plist changed this recently may change again within the same tick of the file system's
// clock, unseen by its stamp: such a bundle is parsed but not kept in the voice index.
constexpr qint64 UnsettledNs = 2'000'000'000;

qint64 nowNs()
{
    timespec now {};
    ::clock_gettime(CLOCK_REALTIME, &now);
    return qint64(now.tv_sec) * 1'000'000'000 + now.tv_nsec;
}

QString stampKey(const QString &folder, qint64 modifiedNs, quint64 inode)
{
    return folder + QLatin1Char('|') + QString::number(modifiedNs) + QLatin1Char('|')
        + QString::number(inode);
}

/// The request's figures resolved against the voice, the same for every engine.
SynthesisParameters parametersFor(const VoiceDescription &voice, const SpeechRequest &request)
{
    SynthesisParameters parameters;
    parameters.normalWordsPerMinute = voice.engineRate;
    parameters.wordsPerMinute
        = qBound(80.0, request.wordsPerMinute > 0 ? request.wordsPerMinute : double(voice.engineRate), 450.0);
    parameters.normalPitch = voice.enginePitch;
    parameters.pitch = qBound(0.0, request.pitch > 0 ? request.pitch : double(voice.enginePitch), 100.0);
    parameters.volume = qBound(0.0, request.volume, 1.0);
    return parameters;
}

/// Renders with the engine the voice names; a missing engine or a voice it refuses is a readable error.
std::optional<PcmAudio> render(const VoiceDescription &voice, const SpeechRequest &request, QString *error)
{
    QString reason;
    std::optional<PcmAudio> audio;
    if (SpeechEngine *engine = SpeechEngines::engine(voice.engineName, &reason)) {
        audio = engine->render(voice, request.text, parametersFor(voice, request), &reason);
    }
    if (!audio && error) {
        *error = QStringLiteral("the voice '%1' cannot speak: %2")
                     .arg(voice.attributes.value(VoiceAttribute::Name).toString(), reason);
    }
    return audio;
}

void cancelEngine(const QString &name)
{
    if (SpeechEngines::isAvailable(name)) {
        if (SpeechEngine *engine = SpeechEngines::engine(name, nullptr)) {
            engine->cancel();
        }
    }
}

/// Says once per process and engine that voices are listed which cannot speak.
void reportMissingEngines(const QList<VoiceDescription> &voices)
{
    static QMutex mutex;
    static QSet<QString> reported;
    QHash<QString, QStringList> missing;
    for (const auto &voice : voices) {
        if (!SpeechEngines::isAvailable(voice.engineName)) {
            missing[voice.engineName].append(voice.attributes.value(VoiceAttribute::Name).toString());
        }
    }
    QMutexLocker locker(&mutex);
    for (auto it = missing.cbegin(); it != missing.cend(); ++it) {
        if (!reported.contains(it.key())) {
            reported.insert(it.key());
            QString reason;
            (void)SpeechEngines::isAvailable(it.key(), &reason);
            qCWarning(lcVoices, "Listing %s, which cannot speak: %s",
                qPrintable(it.value().join(QStringLiteral(", "))), qPrintable(reason));
        }
    }
}

} // namespace

BundleSpeechSynthesisService::BundleSpeechSynthesisService(QObject *parent)
    : SpeechSynthesisService(parent)
{ }

BundleSpeechSynthesisService::~BundleSpeechSynthesisService()
{
    if (m_currentRequest) {
        cancelEngine(m_currentEngine);
    }
    delete m_sink;
    delete m_buffer;
}

std::optional<VoiceDescription> BundleSpeechSynthesisService::parseBundle(
    const QString &bundlePath, QString *error)
{
    const auto info = PropertyList::readFile(bundlePath + QStringLiteral("/Info.plist"), error);
    if (!info || info->typeId() != QMetaType::QVariantMap) {
        *error = QStringLiteral("unreadable Info.plist (%1)")
                     .arg(info ? QStringLiteral("not a dictionary") : *error);
        return std::nullopt;
    }
    auto voice = VoiceDescription::fromInfo(info->toMap(), error);
    if (voice) {
        voice->bundlePath = bundlePath;
    }
    return voice;
}

std::optional<VoiceDescription> BundleSpeechSynthesisService::readBundle(const QString &bundlePath)
{
    QString error;
    auto voice = parseBundle(bundlePath, &error);
    if (!voice) {
        qCWarning(lcVoices, "Skipping voice bundle %s: %s", qPrintable(bundlePath), qPrintable(error));
    }
    return voice;
}

void BundleSpeechSynthesisService::setVoiceIndexPath(const QString &path)
{
    QMutexLocker locker(&m_scanMutex);
    m_indexPath = path;
    m_index.reset();
}

QList<VoiceDescription> BundleSpeechSynthesisService::scanFolder(const QString &folder)
{
    struct Slot
    {
        QString path;
        std::optional<VoiceIndex::Stamp> stamp; ///< nothing when the Info.plist could not be found
        std::optional<VoiceDescription> voice;
        QString error;
        bool parse = false;
    };
    QList<Slot> slots;
    QSet<QString> present;
    const QByteArray suffix = BundleSuffix.toLatin1();
    const QString prefix = folder + QLatin1Char('/');
    if (DIR *dir = ::opendir(QFile::encodeName(folder).constData())) {
        const int fd = ::dirfd(dir);
        while (const dirent *entry = ::readdir(dir)) {
            const QByteArrayView name(entry->d_name);
            // Hidden folders are an installation's staging folders, not bundles.
            if (!name.endsWith(suffix) || name.startsWith('.')) {
                continue;
            }
            Slot slot;
            slot.path = prefix + QFile::decodeName(entry->d_name);
            struct stat st
            {
            };
            if (::fstatat(fd, QByteArray(name.toByteArray() + "/Info.plist").constData(), &st, 0) == 0) {
                slot.stamp
                    = VoiceIndex::Stamp {qint64(st.st_mtim.tv_sec) * 1'000'000'000 + st.st_mtim.tv_nsec,
                        qint64(st.st_size), quint64(st.st_ino)};
                present.insert(slot.path);
            } else if (::fstatat(fd, entry->d_name, &st, 0) != 0 || !S_ISDIR(st.st_mode)) {
                continue; // not a bundle folder
            }
            const VoiceIndex::Entry *known
                = m_index && slot.stamp ? m_index->find(slot.path, *slot.stamp) : nullptr;
            if (known) {
                slot.voice = known->voice;
                slot.error = known->error;
            } else {
                slot.parse = true;
            }
            slots.append(std::move(slot));
        }
        ::closedir(dir);
    }

    // Bundles are independent: parse the ones the index does not know on every core.
    QList<Slot *> toParse;
    for (Slot &slot : slots) {
        if (slot.parse) {
            toParse.append(&slot);
        }
    }
    QtConcurrent::blockingMap(
        toParse, [](Slot *slot) { slot->voice = parseBundle(slot->path, &slot->error); });

    const qint64 settled = nowNs() - UnsettledNs;
    QList<VoiceDescription> voices;
    voices.reserve(slots.size());
    for (const Slot &slot : std::as_const(slots)) {
        if (slot.voice) {
            voices.append(*slot.voice);
        } else {
            qCWarning(
                lcVoices, "Skipping voice bundle %s: %s", qPrintable(slot.path), qPrintable(slot.error));
        }
        if (m_index && slot.parse && slot.stamp && slot.stamp->modifiedNs < settled) {
            m_index->insert(slot.path, {*slot.stamp, slot.voice, slot.error});
        }
    }
    if (m_index) {
        m_index->retainInFolder(folder, present);
    }
    return voices;
}

QList<VoiceDescription> BundleSpeechSynthesisService::installedVoices()
{
    QMutexLocker locker(&m_scanMutex);
    const QStringList folders = Paths::voiceFolders();
    QStringList key;
    bool changed = false;
    if (!m_index && !(m_indexPath && m_indexPath->isEmpty())) {
        m_index = std::make_unique<VoiceIndex>(m_indexPath.value_or(VoiceIndex::defaultPath()));
        QString why;
        if (!m_index->load(&why)) {
            qCDebug(lcVoices, "Not using the voice index: %s", qPrintable(why));
        }
    }
    for (const QString &folder : folders) {
        struct stat st
        {
        };
        const bool exists = ::stat(QFile::encodeName(folder).constData(), &st) == 0 && S_ISDIR(st.st_mode);
        const qint64 modified = exists ? qint64(st.st_mtim.tv_sec) * 1000000000 + st.st_mtim.tv_nsec : -1;
        const quint64 inode = exists ? quint64(st.st_ino) : 0;
        key.append(stampKey(folder, modified, inode));
        FolderScan &scan = m_folders[folder];
        if (scan.modifiedNs != modified || scan.inode != inode) {
            // A missing folder is no error: it simply holds no voices.
            scan = {modified, inode, exists ? scanFolder(folder) : QList<VoiceDescription>()};
            changed = true;
        }
    }
    if (m_index) {
        QString error;
        if (!m_index->saveIfChanged(&error)) {
            qCDebug(lcVoices, "Cannot write the voice index: %s", qPrintable(error));
        }
    }
    if (!changed && key == m_mergedKey) {
        return m_merged;
    }

    QList<VoiceDescription> merged;
    QSet<QString> seen;
    for (const QString &folder : folders) {
        for (const auto &voice : std::as_const(m_folders[folder].voices)) {
            if (!seen.contains(voice.identifier)) {
                seen.insert(voice.identifier);
                merged.append(voice);
            }
        }
    }
    std::sort(merged.begin(), merged.end(),
        [](const VoiceDescription &a, const VoiceDescription &b) { return a.identifier < b.identifier; });
    reportMissingEngines(merged);
    m_merged = merged;
    m_mergedKey = key;
    ++m_generation;
    return m_merged;
}

quint64 BundleSpeechSynthesisService::voicesGeneration() const
{
    QMutexLocker locker(&m_scanMutex);
    return m_generation;
}

std::optional<QString> BundleSpeechSynthesisService::speechLanguageLocale()
{
    // value() reads the domain again when its file changed.
    const QVariant stored
        = Services::preferences().value(SpeechLanguageKey, SpeechNames::VoicePreferencesDomain);
    if (stored.typeId() != QMetaType::QString) {
        return std::nullopt;
    }
    const QString canonical = Locale::canonicalLocaleIdentifier(stored.toString());
    if (canonical.isEmpty()) {
        return std::nullopt;
    }
    return canonical;
}

std::optional<VoiceDescription> BundleSpeechSynthesisService::voiceForRequest(const SpeechRequest &request)
{
    const QString identifier = request.voiceIdentifier.isEmpty() ? defaultVoice() : request.voiceIdentifier;
    auto found = voice(identifier);
    if (!found) {
        qCWarning(lcSpeech, "No installed voice '%s' to speak with", qPrintable(identifier));
    }
    return found;
}

bool BundleSpeechSynthesisService::renderToFile(
    const SpeechRequest &request, const QString &wavPath, QString *error)
{
    const auto voice = voiceForRequest(request);
    if (!voice) {
        if (error) {
            *error = QStringLiteral("no installed voice '%1'").arg(request.voiceIdentifier);
        }
        return false;
    }
    const auto audio = render(*voice, request, error);
    return audio && WaveFile::write(wavPath, *audio, error);
}

quint64 BundleSpeechSynthesisService::startSpeaking(const SpeechRequest &request)
{
    const auto voice = voiceForRequest(request);
    if (!voice) {
        return 0;
    }
    stopSpeaking();
    const quint64 requestId = m_nextRequest++;
    m_currentRequest = requestId;
    m_currentEngine = voice->engineName;
    m_renderedVolume = request.volume;
    QPointer<BundleSpeechSynthesisService> self(this);
    QThreadPool::globalInstance()->start([self, requestId, voice = *voice, request] {
        QString error;
        auto audio = render(voice, request, &error);
        if (!self) {
            return;
        }
        QMetaObject::invokeMethod(
            self.data(),
            [self, requestId, audio = std::move(audio), error] {
                if (self) {
                    self->renderFinished(requestId, audio, error);
                }
            },
            Qt::QueuedConnection);
    });
    return requestId;
}

void BundleSpeechSynthesisService::renderFinished(
    quint64 requestId, const std::optional<PcmAudio> &audio, const QString &error)
{
    if (requestId != m_currentRequest) {
        return; // stopped meanwhile; its finish was already reported
    }
    if (!audio) {
        qCWarning(lcSpeech, "Speaking failed: %s", qPrintable(error));
        finishCurrent(false);
        return;
    }
    const QAudioDevice device = QMediaDevices::defaultAudioOutput();
    if (device.isNull()) {
        finishCurrent(true);
        return;
    }
    QAudioFormat format;
    format.setSampleRate(audio->sampleRate);
    format.setChannelCount(1);
    format.setSampleFormat(QAudioFormat::Int16);
    if (!device.isFormatSupported(format)) {
        qCWarning(lcSpeech, "The audio output cannot play 16-bit mono at %d Hz", audio->sampleRate);
        finishCurrent(false);
        return;
    }
    m_buffer = new QBuffer;
    m_buffer->setData(reinterpret_cast<const char *>(audio->samples.data()),
        qsizetype(audio->samples.size() * sizeof(qint16)));
    m_buffer->open(QIODevice::ReadOnly);
    m_sink = new QAudioSink(device, format);
    connect(m_sink, &QAudioSink::stateChanged, this, [this, requestId](QAudio::State state) {
        if (requestId != m_currentRequest) {
            return;
        }
        if (state == QAudio::IdleState) {
            finishCurrent(true);
        } else if (state == QAudio::StoppedState && m_sink && m_sink->error() != QAudio::NoError) {
            finishCurrent(false);
        }
    });
    m_sink->start(m_buffer);
}

void BundleSpeechSynthesisService::finishCurrent(bool completed)
{
    const quint64 finished = m_currentRequest;
    m_currentRequest = 0;
    if (m_sink) {
        m_sink->disconnect(this);
        m_sink->stop();
        m_sink->deleteLater();
        m_sink = nullptr;
    }
    if (m_buffer) {
        m_buffer->deleteLater();
        m_buffer = nullptr;
    }
    if (finished) {
        Q_EMIT speakingFinished(finished, completed);
    }
}

void BundleSpeechSynthesisService::setSpeakingVolume(double volume)
{
    if (!m_sink) {
        return;
    }
    // The samples already carry the volume they were rendered at; the sink can only attenuate.
    const double scale = m_renderedVolume > 0 ? volume / m_renderedVolume : 0.0;
    m_sink->setVolume(qBound(0.0, scale, 1.0));
}

void BundleSpeechSynthesisService::stopSpeaking()
{
    if (m_currentRequest) {
        cancelEngine(m_currentEngine);
        finishCurrent(false);
    }
}

} // namespace Cadenza::Platform
