// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_SPEECHENGINES_H
#define CADENZA_PLATFORM_SPEECHENGINES_H

#include "cadenzacore_export.h"

#include <QString>
#include <QStringList>

namespace Cadenza::Platform {

class SpeechEngine;

/**
 * The speech engine plugins of this process, found at run time.
 *
 * Plugins live in "cadenza/speech-engines" next to libcadenzacore (the installed library's folder and,
 * in a build tree, the build's library folder), then in the installed plugin folder. The
 * CADENZA_PLUGIN_PATH variable (folders separated by ':') replaces that list, which tests use to
 * take an engine away. Each plugin names its engine in its metadata ("Engine"); the first folder
 * holding an engine wins. An engine is loaded when a voice first needs it.
 */
class CADENZACORE_EXPORT SpeechEngines
{
public:
    /// The engine of bundles that name none.
    static const QString DefaultEngine; ///< "espeak-ng"
    static const char PluginPathVariable[]; ///< "CADENZA_PLUGIN_PATH"

    /// The folders searched for plugins, in order.
    [[nodiscard]] static QStringList pluginFolders();
    /// The names of the engines whose plugins were found.
    [[nodiscard]] static QStringList availableEngines();
    /// Whether a plugin provides @p name; when not, @p reason says so readably.
    [[nodiscard]] static bool isAvailable(const QString &name, QString *reason = nullptr);
    /**
     * The engine called @p name, loaded on first use; nullptr with a readable @p error when no plugin
     * provides it or it cannot load. The first failure for an engine is logged once per process.
     */
    [[nodiscard]] static SpeechEngine *engine(const QString &name, QString *error);
};

} // namespace Cadenza::Platform

#endif
