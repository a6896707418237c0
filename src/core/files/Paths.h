// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_PATHS_H
#define CADENZA_PLATFORM_PATHS_H

#include "cadenzacore_export.h"

#include <QString>
#include <QStringList>

namespace Cadenza::Platform {

/**
 * The folders Cadenza reads and writes.
 *
 * System-level folders are prefixed with $CADENZA_ROOT when it is set, so tests and sandboxes never
 * touch the real system; the user's folders follow the XDG variables.
 */
class CADENZACORE_EXPORT Paths
{
public:
    /// $CADENZA_ROOT without a trailing slash, or empty.
    static QString root();

    /// <root><datadir>/cadenza/voices, shipped with the system.
    static QString systemVoicesFolder();
    /// <root>/usr/local/share/cadenza/voices, installed for every user of this machine.
    static QString localVoicesFolder();
    /// $XDG_DATA_HOME/cadenza/voices, installed for the user alone.
    static QString userVoicesFolder();
    /// The three voice folders in lookup order: user, local, system.
    static QStringList voiceFolders();

    static QString systemRecognizersFolder();
    static QString localRecognizersFolder();
    static QString userRecognizersFolder();
    static QStringList recognizerFolders();

    /// $XDG_CONFIG_HOME/cadenza, home of the preference domains.
    static QString configFolder();
    /// $XDG_RUNTIME_DIR/cadenza, home of the message-port sockets.
    static QString runtimeFolder();
    /// $XDG_CACHE_HOME/cadenza.
    static QString cacheFolder();

    /// $XDG_DATA_HOME (default ~/.local/share).
    static QString userDataHome();
};

} // namespace Cadenza::Platform

#endif
