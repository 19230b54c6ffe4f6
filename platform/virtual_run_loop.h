// A run loop on a virtual clock for tests: nothing happens until the test runs the loop or
// moves the clock, so "the ninth tick" or "an answer after the request returned" is exact.
#pragma once

#include <cstddef>
#include <cstdint>

#include "platform/loop_queue.h"
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

    // The calendar time at virtual second 0: stamps are the origin plus Now(), in no time
    // zone, so they are the same on every machine. False (nothing changed) for an invalid
    // time. The origin starts at 2009-03-05 09:00:00.
    bool SetCalendarOrigin(const CalendarTime& origin);
    CalendarTime CalendarNow() const override;

    // Posted tasks not yet run.
    std::size_t PendingTasks() const { return m_queue.PostedCount(); }

    void Post(Task task) override;
    TimerId AddTimer(double firstDelay, double interval, Task task) override;
    void CancelTimer(TimerId id) override;

private:
    using Ticks = LoopQueue::Ticks;  // virtual nanoseconds

    // The instant of a repeating timer's next firing after one at due, or -1 when the
    // timer is done.
    Ticks NextDue(TimerId id, Ticks due, Ticks interval, std::size_t fired) const;

    // The calendar time of virtual second 0, as seconds since 1970.
    std::int64_t m_calendarOrigin = 1236243600;

    // The clock, and the instant the running AdvanceBy moves it to.
    Ticks m_now = 0;
    Ticks m_advanceTarget = 0;
    LoopQueue m_queue;
};
