#include "platform/poll_run_loop.h"

#include <algorithm>
#include <chrono>

PollRunLoop::Ticks PollRunLoop::Now() {
    return std::chrono::duration_cast<std::chrono::nanoseconds>(
               std::chrono::steady_clock::now().time_since_epoch())
        .count();
}

void PollRunLoop::Run() {
    RunUntil(LoopQueue::kEndOfTime);
}

bool PollRunLoop::RunFor(double seconds) {
    return RunUntil(LoopQueue::Later(Now(), DelayToNanoseconds(seconds)));
}

void PollRunLoop::Quit() {
    if (m_runDepth > 0) m_quit = true;
}

void PollRunLoop::Post(Task task) {
    m_queue.Post(std::move(task));
    // Taking the lock orders this wake-up after a waiter's check of the queue.
    { const std::lock_guard<std::mutex> lock(m_wakeMutex); }
    m_wake.notify_all();
}

RunLoop::TimerId PollRunLoop::AddTimer(double firstDelay, double interval, Task task) {
    return m_queue.AddTimer(LoopQueue::Later(Now(), DelayToNanoseconds(firstDelay)),
                            DelayToNanoseconds(interval), std::move(task));
}

void PollRunLoop::CancelTimer(TimerId id) {
    m_queue.CancelTimer(id);
}

std::size_t PollRunLoop::RunUntilIdle() {
    ScopedCurrentRunLoop current(this);
    const Ticks now = Now();
    std::size_t ran = 0;
    while (m_queue.RunOnePosted() || FireOneDueTimer(now))
        ++ran;
    return ran;
}

bool PollRunLoop::RunUntil(Ticks deadline) {
    ScopedCurrentRunLoop current(this);
    const bool outerQuit = m_quit;
    m_quit = false;
    ++m_runDepth;
    for (;;) {
        const Ticks now = Now();
        // Only the work queued before this pass: a task that keeps posting itself must not
        // starve the timers or Quit.
        for (std::size_t queued = m_queue.PostedCount(); queued > 0 && !m_quit; --queued) {
            m_queue.RunOnePosted();
        }
        while (!m_quit && FireOneDueTimer(now)) {
        }
        if (m_quit || now >= deadline) break;
        if (m_queue.PostedCount() > 0) continue;
        if (!m_queue.HasTimers()) break;  // nothing left that could run, or call Quit
        WaitUntil(std::min(m_queue.EarliestDue(), deadline));
    }
    const bool quit = m_quit;
    --m_runDepth;
    m_quit = outerQuit;
    return quit;
}

bool PollRunLoop::FireOneDueTimer(Ticks now) {
    // A loop that was held up fires a late timer once and drops the firings it missed,
    // keeping the timer's phase.
    return m_queue.FireOneDueTimer(now, [now](TimerId, Ticks due, Ticks interval, std::size_t) {
        Ticks next = LoopQueue::Later(due, interval);
        if (next <= now) next = LoopQueue::Later(next, ((now - next) / interval + 1) * interval);
        return next;
    });
}

void PollRunLoop::WaitUntil(Ticks wake) {
    const std::chrono::steady_clock::time_point until{std::chrono::nanoseconds(wake)};
    std::unique_lock<std::mutex> lock(m_wakeMutex);
    m_wake.wait_until(lock, until, [this] { return m_queue.PostedCount() > 0; });
}
