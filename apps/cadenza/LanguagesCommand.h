// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_APPS_LANGUAGESCOMMAND_H
#define CADENZA_APPS_LANGUAGESCOMMAND_H

#include <QStringList>

/// "cadenza languages": the installed and downloadable recognition languages.
class LanguagesCommand
{
public:
    static int run(const QStringList &arguments);
};

#endif
