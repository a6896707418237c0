// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "OutputFile.h"

#include <QFile>
#include <QFileInfo>
#include <QSaveFile>

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace Cadenza::Platform {

namespace {

void setReason(QString *out, const QString &text)
{
    if (out) {
        *out = text;
    }
}

} // namespace

OutputFile::Kind OutputFile::kindOf(const QString &path, QString *reason)
{
    if (path.isEmpty()) {
        setReason(reason, QStringLiteral("no file name given"));
        return Kind::Refused;
    }
    struct stat st
    {
    };
    // stat() follows symbolic links: what matters is the thing that would be written.
    if (::stat(QFile::encodeName(path).constData(), &st) != 0) {
        if (errno == ENOENT) {
            return Kind::Replaceable;
        }
        setReason(reason, QStringLiteral("%1: %2").arg(path, QString::fromLocal8Bit(std::strerror(errno))));
        return Kind::Refused;
    }
    if (S_ISREG(st.st_mode)) {
        return Kind::Replaceable;
    }
    if (S_ISCHR(st.st_mode) || S_ISFIFO(st.st_mode)) {
        return Kind::Stream;
    }
    if (S_ISDIR(st.st_mode)) {
        setReason(reason, QStringLiteral("%1 is a folder; give a file name").arg(path));
    } else if (S_ISBLK(st.st_mode)) {
        setReason(reason, QStringLiteral("%1 is a block device; it is not written to").arg(path));
    } else {
        setReason(reason, QStringLiteral("%1 is not a file that can be written").arg(path));
    }
    return Kind::Refused;
}

bool OutputFile::write(const QString &path, const QByteArray &bytes, QString *error)
{
    QString reason;
    switch (kindOf(path, &reason)) {
    case Kind::Refused:
        setReason(error, reason);
        return false;
    case Kind::Stream: {
        // No O_CREAT, no O_TRUNC: the device or FIFO stays what it is. Opened without waiting, so a
        // FIFO that nobody reads is an error rather than a wait without end; written with waiting.
        const int fd
            = ::open(QFile::encodeName(path).constData(), O_WRONLY | O_CLOEXEC | O_NOCTTY | O_NONBLOCK);
        if (fd < 0) {
            setReason(error,
                errno == ENXIO ? QStringLiteral("nobody reads from the FIFO %1").arg(path)
                               : QStringLiteral("cannot open %1: %2")
                                     .arg(path, QString::fromLocal8Bit(std::strerror(errno))));
            return false;
        }
        const int flags = ::fcntl(fd, F_GETFL);
        if (flags >= 0) {
            (void)::fcntl(fd, F_SETFL, flags & ~O_NONBLOCK);
        }
        qsizetype written = 0;
        while (written < bytes.size()) {
            const ssize_t n = ::write(fd, bytes.constData() + written, size_t(bytes.size() - written));
            if (n < 0 && errno == EINTR) {
                continue;
            }
            if (n <= 0) {
                setReason(error,
                    QStringLiteral("cannot write %1: %2")
                        .arg(path, QString::fromLocal8Bit(std::strerror(n < 0 ? errno : EIO))));
                ::close(fd);
                return false;
            }
            written += n;
        }
        ::close(fd);
        return true;
    }
    case Kind::Replaceable:
        break;
    }
    // QSaveFile writes beside the target of a symbolic link and keeps the old file's permissions.
    QSaveFile file(path);
    file.setDirectWriteFallback(false);
    if (!file.open(QIODevice::WriteOnly) || file.write(bytes) != bytes.size() || !file.commit()) {
        setReason(error, QStringLiteral("cannot write %1: %2").arg(path, file.errorString()));
        return false;
    }
    return true;
}

} // namespace Cadenza::Platform
