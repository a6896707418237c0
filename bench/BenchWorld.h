#ifndef CADENZA_BENCH_BENCHWORLD_H
#define CADENZA_BENCH_BENCHWORLD_H

// A private world for a benchmark that starts the daemon: every XDG folder and CADENZA_ROOT inside
// one temporary folder, the runtime folder private as the message ports want it.

#include <QDir>
#include <QFile>
#include <QTemporaryDir>

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

} // namespace CadenzaBench

#endif
