// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "Paths.h"

#include "cadenza-config.h"

#include <QDir>

namespace Cadenza::Platform {

namespace {

QString environment(const char *name)
{
    return QString::fromLocal8Bit(qgetenv(name));
}

// An XDG variable counts only when it holds an absolute path.
QString xdgFolder(const char *variable, const QString &fallbackBelowHome)
{
    const QString value = environment(variable);
    if (!value.isEmpty() && QDir::isAbsolutePath(value)) {
        return QDir::cleanPath(value);
    }
    return QDir::cleanPath(QDir::homePath() + QLatin1Char('/') + fallbackBelowHome);
}

QString underRoot(const QString &absolute)
{
    return QDir::cleanPath(Paths::root() + absolute);
}

} // namespace

QString Paths::root()
{
    QString r = environment("CADENZA_ROOT");
    while (r.endsWith(QLatin1Char('/'))) {
        r.chop(1);
    }
    return r;
}

QString Paths::systemVoicesFolder()
{
    return underRoot(QStringLiteral(CADENZA_SYSTEM_DATADIR "/cadenza/voices"));
}

QString Paths::localVoicesFolder()
{
    return underRoot(QStringLiteral("/usr/local/share/cadenza/voices"));
}

QString Paths::userVoicesFolder()
{
    return userDataHome() + QStringLiteral("/cadenza/voices");
}

QStringList Paths::voiceFolders()
{
    return {userVoicesFolder(), localVoicesFolder(), systemVoicesFolder()};
}

QString Paths::systemRecognizersFolder()
{
    return underRoot(QStringLiteral(CADENZA_SYSTEM_DATADIR "/cadenza/recognizers"));
}

QString Paths::localRecognizersFolder()
{
    return underRoot(QStringLiteral("/usr/local/share/cadenza/recognizers"));
}

QString Paths::userRecognizersFolder()
{
    return userDataHome() + QStringLiteral("/cadenza/recognizers");
}

QStringList Paths::recognizerFolders()
{
    return {userRecognizersFolder(), localRecognizersFolder(), systemRecognizersFolder()};
}

QString Paths::configFolder()
{
    return xdgFolder("XDG_CONFIG_HOME", QStringLiteral(".config")) + QStringLiteral("/cadenza");
}

QString Paths::runtimeFolder()
{
    const QString value = environment("XDG_RUNTIME_DIR");
    if (!value.isEmpty() && QDir::isAbsolutePath(value)) {
        return QDir::cleanPath(value) + QStringLiteral("/cadenza");
    }
    // Without a runtime folder the sockets go below the cache; still private to the user.
    return cacheFolder() + QStringLiteral("/runtime");
}

QString Paths::cacheFolder()
{
    return xdgFolder("XDG_CACHE_HOME", QStringLiteral(".cache")) + QStringLiteral("/cadenza");
}

QString Paths::userDataHome()
{
    return xdgFolder("XDG_DATA_HOME", QStringLiteral(".local/share"));
}

} // namespace Cadenza::Platform
