// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_ISOLATEDRUN_H
#define CADENZA_PLATFORM_ISOLATEDRUN_H

#include "cadenzacore_export.h"

#include <QString>

#include <functional>

namespace Cadenza::Platform {

/**
 * Runs a piece of work in a copy of this process (fork), for libraries that end the process they run
 * in (exit, abort, a crash) when their input is damaged: then only the copy ends, and the caller
 * learns why. The work's effects stay in the copy; only success and a message come back.
 *
 * The calling thread waits for the copy: call this from a worker thread, never from one with an
 * event loop that must stay responsive.
 */
class CADENZACORE_EXPORT IsolatedRun
{
public:
    struct Outcome
    {
        bool succeeded = false;
        /// Why it failed: the last report(), else how the copy ended.
        QString reason;
    };

    /// Runs @p work in a copy of the process; it succeeds when @p work returns true.
    [[nodiscard]] static Outcome run(const std::function<bool()> &work, int timeoutMilliseconds);

    /// Inside run()'s work: whether this is the copy.
    [[nodiscard]] static bool inCopy();
    /// Inside run()'s work: records @p message as the reason given if the copy fails (the last one counts).
    static void report(const char *message);
};

} // namespace Cadenza::Platform

#endif
