// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RecognitionEngines.h"

#include "Logging.h"
#include "RecognitionEngine.h"
#include "SpeechEngines.h"
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

namespace {

const QString PluginSubfolder = QStringLiteral("cadenza/recognition-engines");

struct Registry
{
    QMutex mutex;
    bool scanned = false;
    QHash<QString, QString> pluginFiles; ///< engine name → plugin file
    QHash<QString, RecognitionEngine *> engines; ///< loaded engines; they live until exit
    QHash<QString, QString> failures; ///< engine name → why it could not load
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
    for (const QString &folder : RecognitionEngines::pluginFolders()) {
        const QFileInfoList files
            = QDir(folder).entryInfoList({QStringLiteral("*.so")}, QDir::Files, QDir::Name);
        for (const QFileInfo &file : files) {
            QPluginLoader loader(file.absoluteFilePath());
            const QJsonObject meta = loader.metaData();
            if (meta.value(QStringLiteral("IID")).toString() != QLatin1String(CadenzaRecognitionEngine_iid)) {
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

} // namespace

QStringList RecognitionEngines::pluginFolders()
{
    if (!qEnvironmentVariableIsEmpty(SpeechEngines::PluginPathVariable)) {
        return SpeechEngines::pluginFolders();
    }
    QStringList folders;
    const QString beside = libraryFolder();
    if (!beside.isEmpty()) {
        folders.append(beside + QLatin1Char('/') + PluginSubfolder);
    }
    const QString installed = QStringLiteral(CADENZA_RECOGNITION_PLUGINDIR);
    if (!folders.contains(installed)) {
        folders.append(installed);
    }
    return folders;
}

QStringList RecognitionEngines::availableEngines()
{
    Registry &r = registry();
    QMutexLocker locker(&r.mutex);
    scan(r);
    QStringList names = r.pluginFiles.keys();
    names.sort();
    return names;
}

RecognitionEngine *RecognitionEngines::engine(const QString &name, QString *error)
{
    Registry &r = registry();
    QMutexLocker locker(&r.mutex);
    if (RecognitionEngine *loaded = r.engines.value(name)) {
        return loaded;
    }
    const auto fail = [&](const QString &reason) -> RecognitionEngine * {
        if (error) {
            *error = reason;
        }
        return nullptr;
    };
    if (r.failures.contains(name)) {
        return fail(r.failures.value(name));
    }
    scan(r);
    const QString file = r.pluginFiles.value(name);
    if (file.isEmpty()) {
        return fail(QStringLiteral("the recognition engine '%1' is not installed (no plugin for it in %2)")
                        .arg(name, pluginFolders().join(QStringLiteral(", "))));
    }
    QPluginLoader loader(file);
    QObject *instance = loader.instance();
    auto *engine = qobject_cast<RecognitionEngine *>(instance);
    if (!engine) {
        const QString reason = QStringLiteral("the recognition engine '%1' could not be loaded from %2: %3")
                                   .arg(name, file, loader.errorString());
        r.failures.insert(name, reason);
        qCWarning(lcInstallation, "%s", qPrintable(reason));
        return fail(reason);
    }
    // The plugin object outlives the thread that happened to load it.
    if (QCoreApplication::instance() && instance->thread() != QCoreApplication::instance()->thread()) {
        instance->moveToThread(QCoreApplication::instance()->thread());
    }
    r.engines.insert(name, engine);
    return engine;
}

} // namespace Cadenza::Platform
