#include "platform/virtual_run_loop.h"

#include <limits>

#include "platform/trace.h"

namespace {

using Ticks = std::int64_t;
constexpr Ticks kEndOfTime = std::numeric_limits<Ticks>::max();
constexpr double kTicksPerSecond = 1e9;

// t + delay, stopping at the end of the clock instead of wrapping.
Ticks Later(Ticks t, Ticks delay) {
    return t > kEndOfTime - delay ? kEndOfTime : t + delay;
}

}  // namespace

double VirtualRunLoop::Now() const {
    return static_cast<double>(m_now) / kTicksPerSecond;
}

void VirtualRunLoop::Post(Task task) {
    m_posted.push_back(std::move(task));
}

RunLoop::TimerId VirtualRunLoop::AddTimer(double firstDelay, double interval, Task task) {
    const TimerId id = m_nextId++;
    const Ticks due = Later(m_now, DelayToNanoseconds(firstDelay));
    m_timers.emplace(id, Timer{due, DelayToNanoseconds(interval), std::move(task), 0});
    m_schedule.emplace(due, id);
    return id;
}

void VirtualRunLoop::CancelTimer(TimerId id) {
    const auto it = m_timers.find(id);
    if (it == m_timers.end()) return;
    m_schedule.erase({it->second.due, id});  // absent while the timer's own firing runs
    m_timers.erase(it);
}

std::size_t VirtualRunLoop::RunUntilIdle() {
    ScopedCurrentRunLoop current(this);
    std::size_t ran = 0;
    while (RunOnePosted() || FireOneDueTimer())
        ++ran;
    return ran;
}

void VirtualRunLoop::AdvanceBy(double seconds) {
    ScopedCurrentRunLoop current(this);
    const Ticks target = Later(m_now, DelayToNanoseconds(seconds));
    const Ticks outerTarget = m_advanceTarget;  // an AdvanceBy inside a callback nests
    m_advanceTarget = target;
    for (auto& entry : m_timers)
        entry.second.firedInAdvance = 0;

    RunUntilIdle();
    while (!m_schedule.empty() && m_schedule.begin()->first <= target) {
        m_now = m_schedule.begin()->first;
        RunUntilIdle();
    }
    // A nested AdvanceBy may have gone further; the clock never runs backwards.
    if (m_now < target) m_now = target;
    m_advanceTarget = outerTarget;
}

bool VirtualRunLoop::RunOnePosted() {
    if (m_posted.empty()) return false;
    const Task task = std::move(m_posted.front());
    m_posted.pop_front();
    task();
    return true;
}

bool VirtualRunLoop::FireOneDueTimer() {
    if (m_schedule.empty() || m_schedule.begin()->first > m_now) return false;
    const auto [due, id] = *m_schedule.begin();
    m_schedule.erase(m_schedule.begin());
    Timer& timer = m_timers.at(id);

    if (timer.interval == 0) {
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
    const Ticks next = NextDue(id, it->second, due);
    if (next < 0) {
        m_timers.erase(it);
        return true;
    }
    it->second.task = std::move(task);
    it->second.due = next;
    m_schedule.emplace(next, id);
    return true;
}

VirtualRunLoop::Ticks VirtualRunLoop::NextDue(TimerId id, Timer& timer, Ticks due) const {
    const Ticks next = Later(due, timer.interval);
    if (next == kEndOfTime) return -1;
    if (++timer.firedInAdvance < kMaxTimerCatchUp || next > m_advanceTarget) return next;
    // Too far behind: drop the firings up to the target and keep the timer's phase.
    const Ticks skipped = (m_advanceTarget - next) / timer.interval + 1;
    MacWarnTrace2("Chat", "VirtualRunLoop: timer %llu skips %lld firings",
                  static_cast<unsigned long long>(id), static_cast<long long>(skipped));
    return Later(Later(next, (skipped - 1) * timer.interval), timer.interval);
}
