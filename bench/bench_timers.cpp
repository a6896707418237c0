// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Memory of a long-lived target that schedules many power-savvy timers: 100,000 one-shot timers that
// fire, and 100,000 repeating ones invalidated after their first firing, beside the same number of
// plain QTimer::singleShot calls (which keep nothing once fired), in the same run. The figure is the
// growth of the heap in use and of the resident size from before the first timer to after the last
// one has fired; flat (within noise) is the goal.

#include "BenchTable.h"

#include "core/services/RunLoopTimer.h"
#include "core/timers/CZPowerSavvyTimer.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QTimer>

#include <malloc.h>
#include <unistd.h>

#include <cstdio>
#include <fstream>

using namespace Cadenza;
using namespace CadenzaBench;

namespace {

class Target : public QObject
{
    Q_OBJECT
public:
    qint64 firings = 0;
    Q_INVOKABLE void tick(Cadenza::Platform::RunLoopTimer *timer)
    {
        ++firings;
        if (timer->repeats()) {
            // The wrapper is the inner timer's parent; stopping through it is what a host does.
            static_cast<CZPowerSavvyTimer *>(timer->parent())->invalidate();
        }
    }
};

struct Memory
{
    double heapBytes;
    double residentBytes;
};

Memory memoryNow()
{
    // Leftovers of the event loop first: deleted objects and freed pages.
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    malloc_trim(0);
    const struct mallinfo2 info = mallinfo2();
    long pages = 0;
    long resident = 0;
    std::ifstream("/proc/self/statm") >> pages >> resident;
    return {double(info.uordblks), double(resident) * double(sysconf(_SC_PAGESIZE))};
}

// Schedules @p count timers in batches and waits until all have fired.
template<typename Schedule>
void fireAll(Target &target, int count, Schedule schedule)
{
    constexpr int Batch = 1000;
    for (int done = 0; done < count; done += Batch) {
        const qint64 expected = target.firings + qMin(Batch, count - done);
        for (int i = 0; i < Batch && done + i < count; ++i) {
            schedule();
        }
        while (target.firings < expected) {
            QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
        }
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    }
}

Memory growthOf(Target &target, int count, const std::function<void()> &schedule)
{
    fireAll(target, 1000, schedule); // warm up whatever the event loop keeps
    const Memory before = memoryNow();
    fireAll(target, count, schedule);
    const Memory after = memoryNow();
    return {after.heapBytes - before.heapBytes, after.residentBytes - before.residentBytes};
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const int count = argc > 1 ? std::atoi(argv[1]) : 100000;
    Target target; // lives as long as the process, like a host's window

    const Memory floor
        = growthOf(target, count, [&] { QTimer::singleShot(1, &target, [&] { ++target.firings; }); });
    const Memory oneShot = growthOf(target, count, [&] {
        (void)CZPowerSavvyTimer::scheduledTimerWithTimeInterval(0.001, &target, "tick", QVariant(), false);
    });
    const Memory invalidated = growthOf(target, count, [&] {
        (void)CZPowerSavvyTimer::scheduledTimerWithTimeInterval(0.001, &target, "tick", QVariant(), true);
    });
    const double mb = 1e6;
    const std::string n = std::to_string(count);
    printTable(("Memory growth of one long-lived target after " + n + " timers have stopped").c_str(),
        {
            {"one-shot timers fired: heap in use", oneShot.heapBytes / mb, "MB",
                "QTimer::singleShot: heap in use", floor.heapBytes / mb},
            {"one-shot timers fired: resident", oneShot.residentBytes / mb, "MB",
                "QTimer::singleShot: resident", floor.residentBytes / mb},
            {"repeating timers invalidated: heap in use", invalidated.heapBytes / mb, "MB",
                "QTimer::singleShot: heap in use", floor.heapBytes / mb},
            {"repeating timers invalidated: resident", invalidated.residentBytes / mb, "MB",
                "QTimer::singleShot: resident", floor.residentBytes / mb},
            {"wrappers left on the target", double(target.findChildren<CZPowerSavvyTimer *>().size()),
                "timers", "none", 0},
        });
    return 0;
}

#include "bench_timers.moc"
