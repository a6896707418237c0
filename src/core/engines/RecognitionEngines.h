// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_RECOGNITIONENGINES_H
#define CADENZA_PLATFORM_RECOGNITIONENGINES_H

#include "cadenzacore_export.h"

#include <QString>
#include <QStringList>

namespace Cadenza::Platform {

class RecognitionEngine;

/**
 * The speech recognition engine plugins of this process, found at run time the way the speech
 * engines are: in "cadenza/recognition-engines" next to libcadenzacore, then in the installed
 * plugin folder; CADENZA_PLUGIN_PATH (folders separated by ':') replaces that list for both kinds
 * of plugin, each plugin saying by its interface which kind it is. Each plugin names its engine in
 * its metadata ("Engine"); the first folder holding an engine wins.
 */
class CADENZACORE_EXPORT RecognitionEngines
{
public:
    /// The folders searched for plugins, in order.
    [[nodiscard]] static QStringList pluginFolders();
    /// The names of the engines whose plugins were found.
    [[nodiscard]] static QStringList availableEngines();
    /**
     * The engine called @p name, loaded on first use; nullptr with a readable @p error when no plugin
     * provides it or it cannot load.
     */
    [[nodiscard]] static RecognitionEngine *engine(const QString &name, QString *error);
};

} // namespace Cadenza::Platform

#endif
