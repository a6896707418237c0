// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_APPS_VOICESCOMMAND_H
#define CADENZA_APPS_VOICESCOMMAND_H

#include <QStringList>

/// "cadenza voices": lists the installed voices with their names in the user's language.
class VoicesCommand
{
public:
    static int run(const QStringList &arguments);
};

#endif
