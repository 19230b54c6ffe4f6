// The run loop of a command-line host: a real single-threaded loop on the monotonic clock.
// A window host runs its toolkit's existing event loop behind the same operations instead.
#pragma once

#include <condition_variable>
#include <cstddef>
#include <mutex>

#include "platform/loop_queue.h"
#include "platform/run_loop.h"

class PollRunLoop final : public RunLoop {
public:
    PollRunLoop() = default;
    PollRunLoop(const PollRunLoop&) = delete;
    PollRunLoop& operator=(const PollRunLoop&) = delete;

    // Runs posted work and timers as they come due until Quit() is called from inside, or
    // until nothing is left that could run (no posted work and no timer).
    void Run();

    // Like Run, for at most seconds; every timer due within them fires. Returns true when
    // Quit() ended it, false when the time ran out or nothing was left.
    bool RunFor(double seconds);

    // Runs posted tasks (and the ones they post) and the timers due now, without waiting.
    // Returns how many tasks and timer firings ran.
    std::size_t RunUntilIdle();

    // Makes the innermost running Run or RunFor return once the current task is done; the
    // rest stays queued. Does nothing when neither runs.
    void Quit();

    void Post(Task task) override;
    TimerId AddTimer(double firstDelay, double interval, Task task) override;
    void CancelTimer(TimerId id) override;

private:
    using Ticks = LoopQueue::Ticks;  // nanoseconds of the monotonic clock

    static Ticks Now();
    // Runs until Quit() or the deadline; true when Quit() ended it.
    bool RunUntil(Ticks deadline);
    // Fires the earliest timer due at now; false when none is due.
    bool FireOneDueTimer(Ticks now);
    // Waits until wake on the monotonic clock, or until another thread posts work.
    void WaitUntil(Ticks wake);

    LoopQueue m_queue;
    // Lets Post from another thread wake a loop that waits for its next timer.
    std::mutex m_wakeMutex;
    std::condition_variable m_wake;

    // Nesting of Run and RunFor (a modal dialog runs one inside a task), and whether the
    // innermost was asked to return.
    int m_runDepth = 0;
    bool m_quit = false;
};
