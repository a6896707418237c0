// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "IsolatedRun.h"

#include <QByteArray>
#include <QElapsedTimer>

#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>

#include <fcntl.h>
#include <poll.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

namespace Cadenza::Platform {

namespace {
/// The copy's end of the report pipe; -1 in the original process.
int reportDescriptor = -1;
/// A report is one record: its length, then its bytes. The parent keeps the last.
constexpr size_t MaximumReport = 1024;
constexpr rlim_t MaximumGrowthBytes = rlim_t(4) << 30;

/// The process's data segment and private mappings now (VmData), in bytes; 0 when unknown.
rlim_t dataSegmentSize()
{
    const int fd = ::open("/proc/self/status", O_RDONLY | O_CLOEXEC);
    if (fd < 0) {
        return 0;
    }
    char text[8192];
    const ssize_t count = ::read(fd, text, sizeof text - 1);
    ::close(fd);
    if (count <= 0) {
        return 0;
    }
    text[count] = 0;
    const char *line = std::strstr(text, "VmData:");
    return line ? rlim_t(std::strtoull(line + 7, nullptr, 10)) * 1024 : 0;
}
} // namespace

bool IsolatedRun::inCopy()
{
    return reportDescriptor >= 0;
}

void IsolatedRun::report(const char *message)
{
    if (reportDescriptor < 0) {
        return;
    }
    const quint32 length = quint32(std::min(std::strlen(message), MaximumReport));
    // Single small writes to a pipe are atomic; a failed write only loses the reason.
    char record[sizeof length + MaximumReport];
    std::memcpy(record, &length, sizeof length);
    std::memcpy(record + sizeof length, message, length);
    [[maybe_unused]] const ssize_t written = ::write(reportDescriptor, record, sizeof length + length);
}

IsolatedRun::Outcome IsolatedRun::run(const std::function<bool()> &work, int timeoutMilliseconds)
{
    int fds[2];
    if (::pipe2(fds, O_CLOEXEC) != 0) {
        return {false,
            QStringLiteral("no pipe for the check: %1").arg(QString::fromLocal8Bit(std::strerror(errno)))};
    }
    const rlim_t dataInUse = dataSegmentSize();
    const pid_t child = ::fork();
    if (child < 0) {
        ::close(fds[0]);
        ::close(fds[1]);
        return {false,
            QStringLiteral("the check cannot start: %1").arg(QString::fromLocal8Bit(std::strerror(errno)))};
    }
    if (child == 0) {
        ::close(fds[0]);
        reportDescriptor = fds[1];
        // A damaged size field must not let the copy take the machine's memory: it may grow by a
        // bounded amount beyond what the process already had.
        const rlim_t limit = dataInUse + MaximumGrowthBytes;
        const rlimit data {limit, limit};
        ::setrlimit(RLIMIT_DATA, &data);
        const bool ok = work();
        // No destructors, no atexit handlers of the parent's libraries: only the verdict.
        ::_exit(ok ? 0 : 1);
    }
    ::close(fds[1]);
    QByteArray received;
    QElapsedTimer elapsed;
    elapsed.start();
    bool timedOut = false;
    for (;;) {
        const qint64 left = timeoutMilliseconds - elapsed.elapsed();
        if (left <= 0) {
            timedOut = true;
            break;
        }
        pollfd descriptor {fds[0], POLLIN, 0};
        const int ready = ::poll(&descriptor, 1, int(left));
        if (ready < 0 && errno == EINTR) {
            continue;
        }
        if (ready <= 0) {
            timedOut = ready == 0;
            break;
        }
        char buffer[4096];
        const ssize_t count = ::read(fds[0], buffer, sizeof buffer);
        if (count < 0 && errno == EINTR) {
            continue;
        }
        if (count <= 0) {
            break; // the copy ended
        }
        received.append(buffer, count);
    }
    ::close(fds[0]);
    if (timedOut) {
        ::kill(child, SIGKILL);
    }
    int status = 0;
    while (::waitpid(child, &status, 0) < 0 && errno == EINTR) { }

    QString last;
    for (qsizetype at = 0; at + qsizetype(sizeof(quint32)) <= received.size();) {
        quint32 length = 0;
        std::memcpy(&length, received.constData() + at, sizeof length);
        at += sizeof length;
        if (at + qsizetype(length) > received.size()) {
            break;
        }
        last = QString::fromUtf8(received.constData() + at, length).trimmed();
        at += length;
    }
    Outcome outcome;
    if (timedOut) {
        outcome.reason = QStringLiteral("it took longer than %1 s").arg(timeoutMilliseconds / 1000);
    } else if (WIFEXITED(status) && WEXITSTATUS(status) == 0) {
        outcome.succeeded = true;
    } else if (!last.isEmpty()) {
        outcome.reason = last;
    } else if (WIFSIGNALED(status)) {
        outcome.reason
            = QStringLiteral("it crashed (%1)").arg(QString::fromLocal8Bit(strsignal(WTERMSIG(status))));
    } else {
        outcome.reason = QStringLiteral("it ended with status %1").arg(WEXITSTATUS(status));
    }
    return outcome;
}

} // namespace Cadenza::Platform
