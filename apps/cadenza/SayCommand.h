// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_APPS_SAYCOMMAND_H
#define CADENZA_APPS_SAYCOMMAND_H

#include <QStringList>

/// "cadenza say": speaks a text with a voice, or writes the speech to a WAV file.
class SayCommand
{
public:
    static int run(const QStringList &arguments);
};

#endif
