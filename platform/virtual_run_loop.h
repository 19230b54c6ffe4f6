// A run loop on a virtual clock for tests: nothing happens until the test runs the loop or
// moves the clock, so "the ninth tick" or "an answer after the request returned" is exact.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <map>
#include <set>
#include <utility>

#include "platform/run_loop.h"

// Most firings of one repeating timer within one AdvanceBy. A timer that would fire more
// often (a tiny interval, a long advance) skips the rest and resumes at its first slot after
// the new time, the way a real loop drops the firings it missed while blocked.
constexpr std::size_t kMaxTimerCatchUp = 100000;

class VirtualRunLoop final : public RunLoop {
public:
    VirtualRunLoop() = default;
    VirtualRunLoop(const VirtualRunLoop&) = delete;
    VirtualRunLoop& operator=(const VirtualRunLoop&) = delete;

    // Virtual seconds since construction; starts at 0 and moves only in AdvanceBy.
    double Now() const;

    // Runs posted tasks (and the ones they post) and the timers due at Now() until nothing is
    // due. Returns how many tasks and timer firings ran. A repeating timer fires at most once
    // per instant, but a task that posts itself again every time keeps this running.
    std::size_t RunUntilIdle();

    // Moves the clock forward by seconds (negative counts as 0), stopping at each timer's
    // instant to fire it; the posted work runs before the clock moves on.
    void AdvanceBy(double seconds);

    // Posted tasks not yet run.
    std::size_t PendingTasks() const { return m_posted.size(); }

    void Post(Task task) override;
    TimerId AddTimer(double firstDelay, double interval, Task task) override;
    void CancelTimer(TimerId id) override;

private:
    using Ticks = std::int64_t;  // virtual nanoseconds

    struct Timer {
        Ticks due;
        Ticks interval;              // 0: fires once
        Task task;                   // empty while its own firing runs
        std::size_t firedInAdvance;  // firings within the current AdvanceBy
    };

    // Runs the oldest posted task; false when none is queued.
    bool RunOnePosted();
    // Fires the earliest timer due at m_now; false when none is due.
    bool FireOneDueTimer();
    // The instant of the next firing after one at due, or -1 when the timer is done.
    Ticks NextDue(TimerId id, Timer& timer, Ticks due) const;

    // The clock, and the instant the running AdvanceBy moves it to.
    Ticks m_now = 0;
    Ticks m_advanceTarget = 0;

    // Posted tasks in order; timers by id (ids grow, so id order is the order added) and
    // the timers waiting to fire ordered by (due, id). A timer whose firing runs is in
    // m_timers only.
    std::deque<Task> m_posted;
    std::map<TimerId, Timer> m_timers;
    std::set<std::pair<Ticks, TimerId>> m_schedule;
    TimerId m_nextId = 1;
};
