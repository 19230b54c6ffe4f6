#include "platform/poll_run_loop.h"

#include <algorithm>
#include <thread>

void PollRunLoop::Run() {
    RunUntil(Clock::time_point::max());
}

bool PollRunLoop::RunFor(double seconds) {
    return RunUntil(Clock::now() + std::chrono::nanoseconds(DelayToNanoseconds(seconds)));
}

void PollRunLoop::Quit() {
    if (m_runDepth > 0) m_quit = true;
}

void PollRunLoop::Post(Task task) {
    m_posted.push_back(std::move(task));
}

RunLoop::TimerId PollRunLoop::AddTimer(double firstDelay, double interval, Task task) {
    const TimerId id = m_nextId++;
    const Clock::time_point due =
        Clock::now() + std::chrono::nanoseconds(DelayToNanoseconds(firstDelay));
    const Clock::duration every = std::chrono::nanoseconds(DelayToNanoseconds(interval));
    m_timers.emplace(id, Timer{due, every, std::move(task)});
    m_schedule.emplace(due, id);
    return id;
}

void PollRunLoop::CancelTimer(TimerId id) {
    const auto it = m_timers.find(id);
    if (it == m_timers.end()) return;
    m_schedule.erase({it->second.due, id});  // absent while the timer's own firing runs
    m_timers.erase(it);
}

std::size_t PollRunLoop::RunUntilIdle() {
    ScopedCurrentRunLoop current(this);
    const Clock::time_point now = Clock::now();
    std::size_t ran = 0;
    while (RunOnePosted() || FireOneDueTimer(now))
        ++ran;
    return ran;
}

bool PollRunLoop::RunUntil(Clock::time_point deadline) {
    ScopedCurrentRunLoop current(this);
    const bool outerQuit = m_quit;
    m_quit = false;
    ++m_runDepth;
    for (;;) {
        const Clock::time_point now = Clock::now();
        // Only the work queued before this pass: a task that keeps posting itself must not
        // starve the timers or Quit.
        for (std::size_t queued = m_posted.size(); queued > 0 && !m_quit; --queued) {
            RunOnePosted();
        }
        while (!m_quit && FireOneDueTimer(now)) {
        }
        if (m_quit || now >= deadline) break;
        if (!m_posted.empty()) continue;
        if (m_schedule.empty()) break;  // nothing left that could run, or call Quit
        std::this_thread::sleep_until(std::min(m_schedule.begin()->first, deadline));
    }
    const bool quit = m_quit;
    --m_runDepth;
    m_quit = outerQuit;
    return quit;
}

bool PollRunLoop::RunOnePosted() {
    if (m_posted.empty()) return false;
    const Task task = std::move(m_posted.front());
    m_posted.pop_front();
    task();
    return true;
}

bool PollRunLoop::FireOneDueTimer(Clock::time_point now) {
    if (m_schedule.empty() || m_schedule.begin()->first > now) return false;
    const auto [due, id] = *m_schedule.begin();
    m_schedule.erase(m_schedule.begin());
    Timer& timer = m_timers.at(id);

    if (timer.interval == Clock::duration::zero()) {
        // Gone before its task runs, so cancelling itself inside is a harmless no-op.
        const Task task = std::move(timer.task);
        m_timers.erase(id);
        task();
        return true;
    }
    // The task stays out of the table while it runs: it may cancel its own timer.
    Task task = std::move(timer.task);
    task();
    const auto it = m_timers.find(id);
    if (it == m_timers.end()) return true;  // cancelled inside
    Timer& kept = it->second;
    // A loop that was held up fires a late timer once and drops the firings it missed,
    // keeping the timer's phase.
    Clock::time_point next = due + kept.interval;
    if (next <= now) next += ((now - next) / kept.interval + 1) * kept.interval;
    kept.task = std::move(task);
    kept.due = next;
    m_schedule.emplace(next, id);
    return true;
}
