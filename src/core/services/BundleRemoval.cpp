// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "BundleRemoval.h"

#include "core/files/Paths.h"

#include <QDir>
#include <QFile>

#include <cerrno>
#include <cstring>
#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace Cadenza::Platform {

namespace {

QString systemError()
{
    return QString::fromLocal8Bit(std::strerror(errno));
}

// Empties the folder open as @p fd, never following a link; closes @p fd.
bool removeContents(int fd, QString *error, int depth)
{
    if (depth > 64) {
        *error = QStringLiteral("the bundle is nested too deeply");
        ::close(fd);
        return false;
    }
    DIR *dir = ::fdopendir(fd);
    if (!dir) {
        *error = systemError();
        ::close(fd);
        return false;
    }
    bool ok = true;
    while (dirent *entry = ::readdir(dir)) {
        const char *name = entry->d_name;
        if (std::strcmp(name, ".") == 0 || std::strcmp(name, "..") == 0) {
            continue;
        }
        struct stat st
        {
        };
        if (::fstatat(::dirfd(dir), name, &st, AT_SYMLINK_NOFOLLOW) != 0) {
            *error = systemError();
            ok = false;
            break;
        }
        if (S_ISDIR(st.st_mode)) {
            const int child = ::openat(::dirfd(dir), name, O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
            if (child < 0 || !removeContents(child, error, depth + 1)) {
                if (child < 0) {
                    *error = systemError();
                }
                ok = false;
                break;
            }
            if (::unlinkat(::dirfd(dir), name, AT_REMOVEDIR) != 0) {
                *error = systemError();
                ok = false;
                break;
            }
        } else if (::unlinkat(::dirfd(dir), name, 0) != 0) { // a link is removed, never followed
            *error = systemError();
            ok = false;
            break;
        }
    }
    ::closedir(dir);
    return ok;
}

} // namespace

QStringList BundleRemoval::knownFolders()
{
    return Paths::voiceFolders() + Paths::recognizerFolders();
}

QString BundleRemoval::refusal(const QString &path, const QStringList &folders)
{
    if (path.isEmpty() || !path.startsWith(QLatin1Char('/'))) {
        return QStringLiteral("not an absolute path");
    }
    for (const QChar c : path) {
        if (c.unicode() < 32 || c.unicode() == 127) {
            return QStringLiteral("the path holds control characters");
        }
    }
    if (path.split(QLatin1Char('/')).contains(QStringLiteral(".."))) {
        return QStringLiteral("the path climbs with \"..\"");
    }
    const QString clean = QDir::cleanPath(path);
    const QString name = clean.section(QLatin1Char('/'), -1);
    const QString parent = clean.section(QLatin1Char('/'), 0, -2);
    if (!(name.endsWith(QLatin1String(".SpeechVoice")) && name.size() > 12)
        && !(name.endsWith(QLatin1String(".SpeechRecognition")) && name.size() > 18)) {
        return QStringLiteral("'%1' is not a voice or recognizer bundle").arg(name.left(200));
    }
    if (name.startsWith(QLatin1Char('.'))) {
        return QStringLiteral("hidden folders are not bundles");
    }
    bool known = false;
    for (const QString &folder : folders) {
        known = known || QDir::cleanPath(folder) == parent;
    }
    if (!known) {
        return QStringLiteral("%1 is not a voice or recognizer folder").arg(parent.left(200));
    }
    // The folder itself must be reached without links, so that the check above means what it says.
    const QString real = QFileInfo(parent).canonicalFilePath();
    if (real.isEmpty() || real != parent) {
        return QStringLiteral("%1 is reached through a symbolic link").arg(parent.left(200));
    }
    struct stat st
    {
    };
    if (::lstat(QFile::encodeName(clean).constData(), &st) != 0) {
        return QStringLiteral("%1: %2").arg(clean.left(200), systemError());
    }
    if (S_ISLNK(st.st_mode)) {
        return QStringLiteral("%1 is a symbolic link").arg(clean.left(200));
    }
    if (!S_ISDIR(st.st_mode)) {
        return QStringLiteral("%1 is not a folder").arg(clean.left(200));
    }
    return {};
}

bool BundleRemoval::remove(const QString &path, QString *error, const QStringList &folders)
{
    const QString why = refusal(path, folders);
    if (!why.isEmpty()) {
        *error = why;
        return false;
    }
    const QString clean = QDir::cleanPath(path);
    const QByteArray parent = QFile::encodeName(clean.section(QLatin1Char('/'), 0, -2));
    const QByteArray name = QFile::encodeName(clean.section(QLatin1Char('/'), -1));
    const int parentFd = ::open(parent.constData(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
    if (parentFd < 0) {
        *error = systemError();
        return false;
    }
    const int bundleFd
        = ::openat(parentFd, name.constData(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
    if (bundleFd < 0) {
        *error = QStringLiteral("%1: %2").arg(clean.left(200), systemError());
        ::close(parentFd);
        return false;
    }
    bool ok = removeContents(bundleFd, error, 0);
    if (ok && ::unlinkat(parentFd, name.constData(), AT_REMOVEDIR) != 0) {
        *error = systemError();
        ok = false;
    }
    ::close(parentFd);
    return ok;
}

} // namespace Cadenza::Platform
