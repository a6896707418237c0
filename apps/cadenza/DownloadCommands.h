// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_APPS_DOWNLOADCOMMANDS_H
#define CADENZA_APPS_DOWNLOADCOMMANDS_H

#include <QStringList>

/// "cadenza downloadables", "cadenza remove", "cadenza upgrade" and "cadenza power".
class DownloadCommands
{
public:
    static int downloadables(const QStringList &arguments);
    static int remove(const QStringList &arguments);
    static int upgrade(const QStringList &arguments);
    static int power(const QStringList &arguments);
};

#endif
