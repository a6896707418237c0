// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "EnginePlugins_p.h"

#include "SpeechEngines.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QJsonObject>
#include <QPluginLoader>

#include <dlfcn.h>

namespace Cadenza::Platform {

namespace {

/// The folder of libcadenzacore itself, so a build tree and an installation each find their own plugins.
QString libraryFolder()
{
    Dl_info info {};
    if (dladdr(reinterpret_cast<const void *>(&libraryFolder), &info) == 0 || !info.dli_fname) {
        return {};
    }
    return QFileInfo(QFile::decodeName(info.dli_fname)).canonicalPath();
}

} // namespace

EnginePlugins::EnginePlugins(Kind kind)
    : m_kind(std::move(kind))
{ }

QStringList EnginePlugins::pluginFolders() const
{
    const QByteArray variable = qgetenv(SpeechEngines::PluginPathVariable);
    if (!variable.isEmpty()) {
        return QFile::decodeName(variable).split(QLatin1Char(':'), Qt::SkipEmptyParts);
    }
    QStringList folders;
    const QString beside = libraryFolder();
    if (!beside.isEmpty()) {
        folders.append(beside + QLatin1Char('/') + m_kind.subfolder);
    }
    if (!folders.contains(m_kind.installedFolder)) {
        folders.append(m_kind.installedFolder);
    }
    return folders;
}

void EnginePlugins::scanLocked()
{
    if (m_scanned) {
        return;
    }
    m_scanned = true;
    for (const QString &folder : pluginFolders()) {
        const QFileInfoList files
            = QDir(folder).entryInfoList({QStringLiteral("*.so")}, QDir::Files, QDir::Name);
        for (const QFileInfo &file : files) {
            // Reading the metadata does not load the library.
            QPluginLoader loader(file.absoluteFilePath());
            const QJsonObject meta = loader.metaData();
            const QString iid = meta.value(QStringLiteral("IID")).toString();
            if (iid != QLatin1String(m_kind.interfaceId)) {
                // A plugin of this kind built against another version of the interface would crash
                // when called: refuse it, and say so, as it is usually a leftover of an older install.
                const QString wanted = QLatin1String(m_kind.interfaceId);
                const QString family = wanted.left(wanted.lastIndexOf(QLatin1Char('/')) + 1);
                if (iid.startsWith(family)) {
                    qCWarning(m_kind.category,
                        "Skipping the %s plugin %s: it was built for %s, this library needs %s",
                        qPrintable(m_kind.noun), qPrintable(file.absoluteFilePath()), qPrintable(iid),
                        qPrintable(wanted));
                }
                continue;
            }
            const QString name = meta.value(QStringLiteral("MetaData"))
                                     .toObject()
                                     .value(QStringLiteral("Engine"))
                                     .toString();
            if (!name.isEmpty() && !m_pluginFiles.contains(name)) {
                m_pluginFiles.insert(name, file.absoluteFilePath());
            }
        }
    }
}

QString EnginePlugins::missingReason(const QString &name) const
{
    return QStringLiteral("the %1 '%2' is not installed (no plugin for it in %3)")
        .arg(m_kind.noun, name, pluginFolders().join(QStringLiteral(", ")));
}

QStringList EnginePlugins::availableEngines()
{
    QMutexLocker locker(&m_mutex);
    scanLocked();
    QStringList names = m_pluginFiles.keys();
    names.sort();
    return names;
}

bool EnginePlugins::isAvailable(const QString &name, QString *reason)
{
    QMutexLocker locker(&m_mutex);
    scanLocked();
    if (m_pluginFiles.contains(name)) {
        return true;
    }
    if (reason) {
        *reason = missingReason(name);
    }
    return false;
}

QObject *EnginePlugins::engine(const QString &name, QString *error)
{
    QMutexLocker locker(&m_mutex);
    if (QObject *loaded = m_engines.value(name)) {
        return loaded;
    }
    const auto fail = [&](const QString &reason) -> QObject * {
        if (!m_failures.contains(name)) {
            m_failures.insert(name, reason);
            qCWarning(m_kind.category, "%s", qPrintable(reason));
        }
        if (error) {
            *error = reason;
        }
        return nullptr;
    };
    if (m_failures.contains(name)) {
        return fail(m_failures.value(name));
    }
    scanLocked();
    const QString file = m_pluginFiles.value(name);
    if (file.isEmpty()) {
        // Not logged here: the lists of voices and languages already say which cannot be used.
        if (error) {
            *error = missingReason(name);
        }
        return nullptr;
    }
    QPluginLoader loader(file);
    QObject *instance = loader.instance();
    if (!instance || !m_kind.implements(instance)) {
        return fail(QStringLiteral("the %1 '%2' could not be loaded from %3: %4")
                        .arg(m_kind.noun, name, file, loader.errorString()));
    }
    // The plugin object outlives the thread that happened to load it.
    if (QCoreApplication::instance() && instance->thread() != QCoreApplication::instance()->thread()) {
        instance->moveToThread(QCoreApplication::instance()->thread());
    }
    m_engines.insert(name, instance);
    return instance;
}

} // namespace Cadenza::Platform
