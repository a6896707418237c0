// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_APPS_DICTATECOMMAND_H
#define CADENZA_APPS_DICTATECOMMAND_H

#include <QStringList>

/// "cadenza dictate": turns the speech of a sound file into text with an installed recognizer.
class DictateCommand
{
public:
    static int run(const QStringList &arguments);
};

#endif
