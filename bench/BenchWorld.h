// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_BENCH_BENCHWORLD_H
#define CADENZA_BENCH_BENCHWORLD_H

// A private world for a benchmark that starts the daemon: every XDG folder and CADENZA_ROOT inside
// one temporary folder, the runtime folder private as the message ports want it.

#include "core/formats/PropertyList.h"

#include <QDir>
#include <QFile>
#include <QProcess>
#include <QTemporaryDir>
#include <QUrl>

#include <sys/stat.h>

namespace CadenzaBench {

inline void enterPrivateWorld(const QTemporaryDir &world)
{
    for (const char *name :
        {"XDG_DATA_HOME", "XDG_CONFIG_HOME", "XDG_CACHE_HOME", "XDG_RUNTIME_DIR", "CADENZA_ROOT"}) {
        const QString folder = world.filePath(QString::fromLatin1(name));
        QDir().mkpath(folder);
        qputenv(name, QFile::encodeName(folder));
    }
    ::chmod(QFile::encodeName(world.filePath(QStringLiteral("XDG_RUNTIME_DIR"))).constData(), 0700);
}

/// Writes a catalogue holding @p packages into the world and starts quillond on it, quietly, serving
/// @p repository.
inline void startDaemon(
    QProcess &daemon, const QTemporaryDir &world, const QVariantMap &packages, const QString &repository)
{
    const QString catalogue = world.filePath(QStringLiteral("catalogue.plist"));
    QFile file(catalogue);
    if (!file.open(QIODevice::WriteOnly)) {
        qFatal("cannot write %s", qPrintable(catalogue));
    }
    file.write(
        Cadenza::Platform::PropertyList::serialize(QVariantMap {{QStringLiteral("Packages"), packages}}));
    file.close();
    qputenv("QT_LOGGING_RULES", "quillond*=false");
    daemon.setProcessChannelMode(QProcess::ForwardedErrorChannel);
    daemon.start(QStringLiteral(QUILLOND_PATH),
        {QStringLiteral("--catalogue"), catalogue, QStringLiteral("--repository"),
            QUrl::fromLocalFile(repository).toString()});
    daemon.waitForStarted();
}

} // namespace CadenzaBench

#endif
