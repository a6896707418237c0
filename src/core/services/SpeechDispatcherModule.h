// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_SPEECHDISPATCHERMODULE_H
#define CADENZA_PLATFORM_SPEECHDISPATCHERMODULE_H

#include "cadenzacore_export.h"

#include <QString>

namespace Cadenza::Platform {

/**
 * speech-dispatcher's output module for the Cadenza voices, installed for the current user.
 *
 * speech-dispatcher loads every "sd_<name>" program of the per-user module folder, which lies beside
 * $XDG_DATA_HOME in ../libexec/speech-dispatcher-modules (~/.local/libexec/speech-dispatcher-modules),
 * without any change to its configuration. Installing puts a symbolic link "sd_cadenza" there that
 * points at the installed module, so an upgrade of Cadenza upgrades the module too. Nothing else in
 * that folder, and none of speech-dispatcher's configuration, is ever touched.
 */
class CADENZACORE_EXPORT SpeechDispatcherModule
{
public:
    static const QString ModuleFileName; ///< "sd_cadenza"

    /// The per-user module folder.
    [[nodiscard]] static QString userModuleFolder();
    /// Where the per-user module goes.
    [[nodiscard]] static QString userModulePath();
    /**
     * The module program this installation of Cadenza ships: $CADENZA_SPEECHD_MODULE when set, else
     * the module folder under the prefix @p binaryFolder belongs to (the program asking lives in its
     * bin folder), else the build tree's module next to @p binaryFolder. Empty when none exists.
     */
    [[nodiscard]] static QString shippedModule(const QString &binaryFolder);

    /// Whether the per-user module is there and leads to a module program.
    [[nodiscard]] static bool isInstalledForUser();
    /// Links the per-user module to @p module; refuses to replace a file that is not such a link.
    [[nodiscard]] static bool installForUser(const QString &module, QString *error);
    /// Removes the per-user module link; refuses to remove a file that is not such a link.
    [[nodiscard]] static bool removeForUser(QString *error);
};

} // namespace Cadenza::Platform

#endif
