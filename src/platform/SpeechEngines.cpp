// SPDX-License-Identifier: LGPL-2.1-or-later
#include "SpeechEngines.h"

#include "Logging.h"
#include "SpeechEngine.h"
#include "cadenza-config.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QHash>
#include <QJsonObject>
#include <QMutex>
#include <QPluginLoader>

#include <dlfcn.h>

namespace Cadenza::Platform {

const QString SpeechEngines::DefaultEngine = QStringLiteral("espeak-ng");
const char SpeechEngines::PluginPathVariable[] = "CADENZA_PLUGIN_PATH";

namespace {

const QString PluginSubfolder = QStringLiteral("cadenza/speech-engines");

struct Registry
{
    QMutex mutex;
    bool scanned = false;
    QHash<QString, QString> pluginFiles; ///< engine name → plugin file
    QHash<QString, SpeechEngine *> engines; ///< loaded engines; they live until exit
    QHash<QString, QString> failures; ///< engine name → the error already logged
};

Registry &registry()
{
    static Registry instance;
    return instance;
}

/// The folder of libcadenzacore itself, so a build tree and an installation each find their own plugins.
QString libraryFolder()
{
    Dl_info info {};
    if (dladdr(reinterpret_cast<const void *>(&libraryFolder), &info) == 0 || !info.dli_fname) {
        return {};
    }
    return QFileInfo(QFile::decodeName(info.dli_fname)).canonicalPath();
}

void scan(Registry &r)
{
    if (r.scanned) {
        return;
    }
    r.scanned = true;
    for (const QString &folder : SpeechEngines::pluginFolders()) {
        const QFileInfoList files
            = QDir(folder).entryInfoList({QStringLiteral("*.so")}, QDir::Files, QDir::Name);
        for (const QFileInfo &file : files) {
            QPluginLoader loader(file.absoluteFilePath());
            const QJsonObject meta = loader.metaData();
            if (meta.value(QStringLiteral("IID")).toString() != QLatin1String(CadenzaSpeechEngine_iid)) {
                continue;
            }
            const QString name = meta.value(QStringLiteral("MetaData"))
                                     .toObject()
                                     .value(QStringLiteral("Engine"))
                                     .toString();
            if (!name.isEmpty() && !r.pluginFiles.contains(name)) {
                r.pluginFiles.insert(name, file.absoluteFilePath());
            }
        }
    }
}

QString missingReason(const QString &name)
{
    return QStringLiteral("the speech engine '%1' is not installed (no plugin for it in %2)")
        .arg(name, SpeechEngines::pluginFolders().join(QStringLiteral(", ")));
}

/// Logs @p reason the first time @p name fails, and hands it on.
QString noteFailure(Registry &r, const QString &name, const QString &reason, QString *error)
{
    if (!r.failures.contains(name)) {
        r.failures.insert(name, reason);
        qCWarning(lcSpeech, "%s", qPrintable(reason));
    }
    if (error) {
        *error = r.failures.value(name);
    }
    return r.failures.value(name);
}

} // namespace

QStringList SpeechEngines::pluginFolders()
{
    const QByteArray variable = qgetenv(PluginPathVariable);
    if (!variable.isEmpty()) {
        return QFile::decodeName(variable).split(QLatin1Char(':'), Qt::SkipEmptyParts);
    }
    QStringList folders;
    const QString beside = libraryFolder();
    if (!beside.isEmpty()) {
        folders.append(beside + QLatin1Char('/') + PluginSubfolder);
    }
    const QString installed = QStringLiteral(CADENZA_PLUGINDIR);
    if (!folders.contains(installed)) {
        folders.append(installed);
    }
    return folders;
}

QStringList SpeechEngines::availableEngines()
{
    Registry &r = registry();
    QMutexLocker locker(&r.mutex);
    scan(r);
    QStringList names = r.pluginFiles.keys();
    names.sort();
    return names;
}

bool SpeechEngines::isAvailable(const QString &name, QString *reason)
{
    Registry &r = registry();
    QMutexLocker locker(&r.mutex);
    scan(r);
    if (r.pluginFiles.contains(name)) {
        return true;
    }
    if (reason) {
        *reason = missingReason(name);
    }
    return false;
}

SpeechEngine *SpeechEngines::engine(const QString &name, QString *error)
{
    Registry &r = registry();
    QMutexLocker locker(&r.mutex);
    if (SpeechEngine *loaded = r.engines.value(name)) {
        return loaded;
    }
    const auto fail = [&](const QString &reason) -> SpeechEngine * {
        noteFailure(r, name, reason, error);
        return nullptr;
    };
    if (r.failures.contains(name)) {
        return fail(r.failures.value(name));
    }
    scan(r);
    const QString file = r.pluginFiles.value(name);
    if (file.isEmpty()) {
        // Not logged here: listing the voices already said which cannot speak.
        if (error) {
            *error = missingReason(name);
        }
        return nullptr;
    }
    QPluginLoader loader(file);
    QObject *instance = loader.instance();
    auto *engine = qobject_cast<SpeechEngine *>(instance);
    if (!engine) {
        return fail(QStringLiteral("the speech engine '%1' could not be loaded from %2: %3")
                        .arg(name, file, loader.errorString()));
    }
    // The plugin object outlives the thread that happened to load it.
    if (QCoreApplication::instance() && instance->thread() != QCoreApplication::instance()->thread()) {
        instance->moveToThread(QCoreApplication::instance()->thread());
    }
    r.engines.insert(name, engine);
    return engine;
}

} // namespace Cadenza::Platform
