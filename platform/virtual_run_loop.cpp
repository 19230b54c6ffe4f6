#include "platform/virtual_run_loop.h"

#include "platform/trace.h"

namespace {

constexpr double kTicksPerSecond = 1e9;

}  // namespace

double VirtualRunLoop::Now() const {
    return static_cast<double>(m_now) / kTicksPerSecond;
}

bool VirtualRunLoop::SetCalendarOrigin(const CalendarTime& origin) {
    return UnixSecondsFromCalendar(origin, &m_calendarOrigin);
}

CalendarTime VirtualRunLoop::CalendarNow() const {
    return CalendarFromUnixSeconds(m_calendarOrigin + m_now / static_cast<Ticks>(kTicksPerSecond));
}

void VirtualRunLoop::Post(Task task) {
    m_queue.Post(std::move(task));
}

RunLoop::TimerId VirtualRunLoop::AddTimer(double firstDelay, double interval, Task task) {
    return m_queue.AddTimer(LoopQueue::Later(m_now, DelayToNanoseconds(firstDelay)),
                            DelayToNanoseconds(interval), std::move(task));
}

void VirtualRunLoop::CancelTimer(TimerId id) {
    m_queue.CancelTimer(id);
}

std::size_t VirtualRunLoop::RunUntilIdle() {
    ScopedCurrentRunLoop current(this);
    const auto next = [this](TimerId id, Ticks due, Ticks interval, std::size_t fired) {
        return NextDue(id, due, interval, fired);
    };
    std::size_t ran = 0;
    while (m_queue.RunOnePosted() || m_queue.FireOneDueTimer(m_now, next))
        ++ran;
    return ran;
}

void VirtualRunLoop::AdvanceBy(double seconds) {
    ScopedCurrentRunLoop current(this);
    const Ticks target = LoopQueue::Later(m_now, DelayToNanoseconds(seconds));
    const Ticks outerTarget = m_advanceTarget;  // an AdvanceBy inside a callback nests
    m_advanceTarget = target;
    m_queue.ResetFiringCounts();

    RunUntilIdle();
    while (m_queue.HasTimers() && m_queue.EarliestDue() <= target) {
        m_now = m_queue.EarliestDue();
        RunUntilIdle();
    }
    // A nested AdvanceBy may have gone further; the clock never runs backwards.
    if (m_now < target) m_now = target;
    m_advanceTarget = outerTarget;
}

VirtualRunLoop::Ticks VirtualRunLoop::NextDue(TimerId id, Ticks due, Ticks interval,
                                              std::size_t fired) const {
    const Ticks next = LoopQueue::Later(due, interval);
    if (next == LoopQueue::kEndOfTime) return -1;
    if (fired < kMaxTimerCatchUp || next > m_advanceTarget) return next;
    // Too far behind: drop the firings up to the target and keep the timer's phase.
    const Ticks skipped = (m_advanceTarget - next) / interval + 1;
    MacWarnTrace2("Chat", "VirtualRunLoop: timer %llu skips %lld firings",
                  static_cast<unsigned long long>(id), static_cast<long long>(skipped));
    return LoopQueue::Later(LoopQueue::Later(next, (skipped - 1) * interval), interval);
}
