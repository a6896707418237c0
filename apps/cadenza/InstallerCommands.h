// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_APPS_INSTALLERCOMMANDS_H
#define CADENZA_APPS_INSTALLERCOMMANDS_H

#include <QStringList>

/// "cadenza status", "cadenza install" and "cadenza cancel": the installer daemon from the command line.
class InstallerCommands
{
public:
    static int status(const QStringList &arguments);
    static int install(const QStringList &arguments);
    static int cancel(const QStringList &arguments);
};

#endif
