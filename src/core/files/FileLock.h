// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_FILELOCK_H
#define CADENZA_PLATFORM_FILELOCK_H

#include "cadenzacore_export.h"

#include <QString>

namespace Cadenza::Platform {

/**
 * An exclusive lock between processes on a lock file, held from lock() until destruction.
 *
 * The kernel queues the waiters and drops the lock of a process that dies, so there are no stale lock
 * files to judge and no waiter is starved by others that keep taking the lock (a polling lock with
 * back-off lost writers under load). Whoever holds it must only do bounded work.
 */
class CADENZACORE_EXPORT FileLock
{
public:
    explicit FileLock(const QString &path);
    ~FileLock();
    FileLock(const FileLock &) = delete;
    FileLock &operator=(const FileLock &) = delete;

    /// Waits for the lock; false (with errorString()) when the lock file cannot be opened or locked.
    [[nodiscard]] bool lock();
    [[nodiscard]] QString errorString() const { return m_error; }

private:
    QString m_path;
    int m_fd = -1;
    QString m_error;
};

} // namespace Cadenza::Platform

#endif
