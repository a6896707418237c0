// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_APPS_POSTCOMMAND_H
#define CADENZA_APPS_POSTCOMMAND_H

#include <QStringList>

/// "cadenza post": posts a distributed notification to every process of the session.
class PostCommand
{
public:
    static int run(const QStringList &arguments);
};

#endif
