// The posted work and timers of a single-threaded run loop, on a clock counted in whole
// nanoseconds. Both loops keep their work here; each decides what "now" is and how to wait.
// Posting is safe from any thread (network services answer from their own threads); timers
// belong to the loop's thread.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <limits>
#include <map>
#include <mutex>
#include <set>
#include <utility>

#include "platform/run_loop.h"

class LoopQueue {
public:
    using Ticks = std::int64_t;
    static constexpr Ticks kEndOfTime = std::numeric_limits<Ticks>::max();

    // t + delay, stopping at the end of the clock instead of wrapping.
    static Ticks Later(Ticks t, Ticks delay) {
        return t > kEndOfTime - delay ? kEndOfTime : t + delay;
    }

    void Post(RunLoop::Task task);
    // A timer first due at due, then every interval ticks (0: once).
    RunLoop::TimerId AddTimer(Ticks due, Ticks interval, RunLoop::Task task);
    // Unknown or already cancelled ids do nothing; safe inside the timer's own task.
    void CancelTimer(RunLoop::TimerId id);

    // Runs the oldest posted task; false when none is queued.
    bool RunOnePosted();

    // How a repeating timer goes on after a firing due at due: the instant of its next
    // firing, or a negative value to end it. fired counts its firings since the last
    // ResetFiringCounts, this one included.
    using NextDue =
        std::function<Ticks(RunLoop::TimerId id, Ticks due, Ticks interval, std::size_t fired)>;
    // Fires the earliest timer due at or before now; false when none is due.
    bool FireOneDueTimer(Ticks now, const NextDue& next);
    void ResetFiringCounts();

    std::size_t PostedCount() const;
    bool HasTimers() const { return !m_schedule.empty(); }
    // The instant the earliest waiting timer is due; only when HasTimers().
    Ticks EarliestDue() const { return m_schedule.begin()->first; }

private:
    struct Timer {
        Ticks due;
        Ticks interval;      // 0: fires once
        RunLoop::Task task;  // empty while its own firing runs
        std::size_t fired;   // since ResetFiringCounts
    };

    // Posted tasks in order, guarded by m_postedMutex; timers by id (ids grow, so id order is the
    // order added) and the timers waiting to fire ordered by (due, id). A timer whose firing runs
    // is in m_timers only.
    mutable std::mutex m_postedMutex;
    std::deque<RunLoop::Task> m_posted;
    std::map<RunLoop::TimerId, Timer> m_timers;
    std::set<std::pair<Ticks, RunLoop::TimerId>> m_schedule;
    RunLoop::TimerId m_nextId = 1;
};
