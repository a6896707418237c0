// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_ENGINEPLUGINS_P_H
#define CADENZA_PLATFORM_ENGINEPLUGINS_P_H

#include <QHash>
#include <QLoggingCategory>
#include <QMutex>
#include <QString>
#include <QStringList>

#include <functional>

class QObject;

namespace Cadenza::Platform {

/**
 * The plugins of one kind of engine (speech, recognition), found at run time.
 *
 * Plugins live in @c subfolder next to libcadenzacore (the installed library's folder and, in a build
 * tree, the build's library folder), then in @c installedFolder. The CADENZA_PLUGIN_PATH variable
 * (folders separated by ':') replaces that list for every kind. A plugin belongs to the kind whose
 * interface it implements and names its engine in its metadata ("Engine"); the first folder holding
 * an engine wins. An engine is loaded when first asked for and lives until the process exits; the
 * first failure to load it is logged once.
 */
class EnginePlugins
{
public:
    struct Kind
    {
        const char *interfaceId; ///< the plugins' interface, as Q_DECLARE_INTERFACE names it
        QString subfolder; ///< e.g. "cadenza/speech-engines"
        QString installedFolder; ///< the configured plugin folder of an installation
        QString noun; ///< "speech engine", for messages
        const QLoggingCategory &(*category)();
        std::function<bool(QObject *)> implements; ///< whether a loaded object is such an engine
    };

    explicit EnginePlugins(Kind kind);

    [[nodiscard]] QStringList pluginFolders() const;
    [[nodiscard]] QStringList availableEngines();
    [[nodiscard]] bool isAvailable(const QString &name, QString *reason);
    /// The plugin object of @p name, loaded on first use; nullptr with a readable @p error.
    [[nodiscard]] QObject *engine(const QString &name, QString *error);

private:
    void scanLocked();
    [[nodiscard]] QString missingReason(const QString &name) const;

    const Kind m_kind;
    QMutex m_mutex;
    bool m_scanned = false;
    QHash<QString, QString> m_pluginFiles; ///< engine name → plugin file
    QHash<QString, QObject *> m_engines; ///< loaded engines; they live until exit
    QHash<QString, QString> m_failures; ///< engine name → the error already logged
};

} // namespace Cadenza::Platform

#endif
