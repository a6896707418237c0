// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "DictationService.h"

#include "cadenza_dictation_logging.h"
#include "core/dictation/Transcriber.h"
#include "core/files/Paths.h"
#include "core/formats/AudioFileReader.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/RecognitionService.h"
#include "core/services/Services.h"
#include "protocol/InstallerProtocol.h"

#include <QCoreApplication>
#include <QDBusConnection>
#include <QDBusConnectionInterface>
#include <QDBusMessage>
#include <QDir>

#include <map>

namespace Cadenza {

const QString DictationService::ServiceName = QStringLiteral("org.cadenza.Dictation");
const QString DictationService::ObjectPath = QStringLiteral("/org/cadenza/Dictation");
const QString DictationService::PreHeatNotification
    = QStringLiteral("DictationIMNotificationRecognizerDidPreHeat");
const QString DictationService::WillStartListeningNotification
    = QStringLiteral("DictationIMNotificationWillStartListening");

namespace {
const QString ErrorName = QStringLiteral("org.cadenza.Dictation.Error.Failed");
const QString LocaleKey = QStringLiteral("LocaleIdentifier");
constexpr qsizetype BlockSamples = 4096;
} // namespace

/// The loaded models by locale; touched only on the worker thread.
struct DictationService::Models
{
    std::map<QString, std::unique_ptr<Transcriber>> byLocale;

    /// The loaded model of @p locale, loading it first when needed; nullptr with an @p error that
    /// names the language.
    Transcriber *get(const QString &locale, bool reload, QString *canonical, QString *error)
    {
        QString reason;
        const auto model = Platform::Services::recognition().modelForLocale(locale, &reason);
        if (!model) {
            *error = QStringLiteral("The recognition language %1 is unusable: %2").arg(locale, reason);
            return nullptr;
        }
        *canonical = model->localeIdentifier.isEmpty() ? locale : model->localeIdentifier;
        if (reload) {
            byLocale.erase(*canonical);
        }
        if (const auto loaded = byLocale.find(*canonical); loaded != byLocale.end()) {
            return loaded->second.get();
        }
        auto transcriber = Transcriber::load(*model, &reason);
        if (!transcriber) {
            *error = QStringLiteral("The recognition language %1 is unusable: %2").arg(*canonical, reason);
            return nullptr;
        }
        Transcriber *result = transcriber.get();
        byLocale.emplace(*canonical, std::move(transcriber));
        return result;
    }
};

DictationService::DictationService(int idleExitSeconds, QObject *parent)
    : QObject(parent)
    , m_idleExitSeconds(idleExitSeconds)
    , m_models(std::make_shared<Models>())
{
    m_worker.setMaxThreadCount(1);
    m_worker.setExpiryTimeout(-1); // the thread holds no model state, but restarting it is pointless
    connect(&Platform::Services::notifications(),
        &Platform::DistributedNotificationCenter::notificationPosted, this,
        [this](const QString &name, const QString &, const QVariantMap &userInfo) {
            notificationPosted(name, userInfo);
        });

    // New bundles in a recognizer folder (copied by hand or by an administrator) are loaded when
    // they appear; the scan waits for the copy to settle.
    QDir().mkpath(Platform::Paths::userRecognizersFolder());
    for (const QString &folder : Platform::Paths::recognizerFolders()) {
        if (QDir(folder).exists()) {
            m_watcher.addPath(folder);
        }
    }
    m_scanTimer.setSingleShot(true);
    m_scanTimer.setInterval(1000);
    connect(&m_watcher, &QFileSystemWatcher::directoryChanged, &m_scanTimer, qOverload<>(&QTimer::start));
    connect(&m_scanTimer, &QTimer::timeout, this, &DictationService::scanRecognizerFolders);
    // Languages installed before the engine started are loaded when first asked for.
    const QStringList installed
        = Platform::Services::recognition().installedLanguages().value_or(QStringList());
    m_seenLanguages = QSet<QString>(installed.cbegin(), installed.cend());

    m_idleTimer.setSingleShot(true);
    connect(&m_idleTimer, &QTimer::timeout, this, [this] {
        if (m_worker.activeThreadCount() > 0) {
            touch(); // still loading or transcribing
            return;
        }
        qCInfo(lcDictationService, "cadenza-dictation: idle for %d s, quitting", m_idleExitSeconds);
        QCoreApplication::quit();
    });
    touch();
}

DictationService::~DictationService()
{
    m_worker.waitForDone();
}

bool DictationService::publish(QString *error)
{
    QDBusConnection bus = QDBusConnection::sessionBus();
    if (!bus.isConnected()) {
        *error = QStringLiteral("no session bus");
        return false;
    }
    if (!bus.registerObject(ObjectPath, this, QDBusConnection::ExportScriptableSlots)) {
        *error = bus.lastError().message();
        return false;
    }
    if (!bus.registerService(ServiceName)) {
        *error = QStringLiteral("the name %1 is taken: %2").arg(ServiceName, bus.lastError().message());
        return false;
    }
    return true;
}

void DictationService::touch()
{
    if (m_idleExitSeconds > 0) {
        m_idleTimer.start(m_idleExitSeconds * 1000);
    }
}

void DictationService::notificationPosted(const QString &name, const QVariantMap &userInfo)
{
    if (name != InstallerProtocol::FinishedInstallationNotification) {
        return;
    }
    // Recognizer languages are installed under their locale; other items (voices) have no model and
    // are passed over quietly.
    const QString object = userInfo.value(InstallerProtocol::ObjectIDKey).toString();
    QString reason;
    if (object.isEmpty() || !Platform::Services::recognition().modelForLocale(object, &reason)) {
        return;
    }
    m_seenLanguages.insert(object);
    preHeatInBackground(object, true);
}

void DictationService::scanRecognizerFolders()
{
    for (const QString &folder : Platform::Paths::recognizerFolders()) {
        if (QDir(folder).exists() && !m_watcher.directories().contains(folder)) {
            m_watcher.addPath(folder);
        }
    }
    const QStringList installed
        = Platform::Services::recognition().installedLanguages().value_or(QStringList());
    for (const QString &locale : installed) {
        if (!m_seenLanguages.contains(locale)) {
            m_seenLanguages.insert(locale);
            preHeatInBackground(locale, false);
        }
    }
}

void DictationService::post(const QString &name, const QString &locale)
{
    Platform::Services::notifications().postNotification(name, locale, {{LocaleKey, locale}});
}

void DictationService::preHeatInBackground(const QString &locale, bool reload)
{
    touch();
    m_worker.start([this, models = m_models, locale, reload] {
        QString canonical;
        QString error;
        if (!models->get(locale, reload, &canonical, &error)) {
            qCWarning(lcDictationService, "cadenza-dictation: %s", qPrintable(error));
            return;
        }
        QMetaObject::invokeMethod(this, [this, canonical] { post(PreHeatNotification, canonical); });
    });
}

void DictationService::PreHeat(const QString &locale)
{
    touch();
    setDelayedReply(true);
    const QDBusMessage request = message();
    m_worker.start([this, models = m_models, locale, request] {
        QString canonical;
        QString error;
        if (!models->get(locale, false, &canonical, &error)) {
            QDBusConnection::sessionBus().send(request.createErrorReply(ErrorName, error));
            return;
        }
        QMetaObject::invokeMethod(this, [this, canonical] { post(PreHeatNotification, canonical); });
        QDBusConnection::sessionBus().send(request.createReply());
    });
}

QString DictationService::TranscribeFile(const QString &path, const QString &locale)
{
    transcribe(path, locale, QString());
    return {};
}

QString DictationService::TranscribeFileWithGrammar(
    const QString &path, const QString &locale, const QString &grammarPath)
{
    transcribe(path, locale, grammarPath);
    return {};
}

void DictationService::transcribe(const QString &path, const QString &locale, const QString &grammarPath)
{
    touch();
    setDelayedReply(true);
    const QDBusMessage request = message();
    m_worker.start([this, models = m_models, path, locale, grammarPath, request] {
        const auto fail = [&request](const QString &error) {
            QDBusConnection::sessionBus().send(request.createErrorReply(ErrorName, error));
        };
        QString canonical;
        QString error;
        Transcriber *transcriber = models->get(locale, false, &canonical, &error);
        if (!transcriber) {
            return fail(error);
        }
        bool announced = false;
        Platform::AudioFileReader reader(transcriber->sampleRate());
        if (!reader.open(path, &error) || !transcriber->begin(grammarPath, &error)) {
            return fail(error);
        }
        while (true) {
            const auto block = reader.read(BlockSamples, &error);
            if (!block) {
                (void)transcriber->finish(&error);
                return fail(error);
            }
            if (block->empty()) {
                break;
            }
            if (!announced) {
                announced = true;
                QMetaObject::invokeMethod(
                    this, [this, canonical] { post(WillStartListeningNotification, canonical); });
            }
            if (!transcriber->feed(block->data(), qsizetype(block->size()), &error)) {
                (void)transcriber->finish(&error);
                return fail(error);
            }
        }
        const auto text = transcriber->finish(&error);
        if (!text) {
            return fail(error);
        }
        QDBusConnection::sessionBus().send(request.createReply(*text));
    });
}

} // namespace Cadenza
