#include "platform/loop_queue.h"

RunLoop::TimerId LoopQueue::AddTimer(Ticks due, Ticks interval, RunLoop::Task task) {
    const RunLoop::TimerId id = m_nextId++;
    m_timers.emplace(id, Timer{due, interval, std::move(task), 0});
    m_schedule.emplace(due, id);
    return id;
}

void LoopQueue::CancelTimer(RunLoop::TimerId id) {
    const auto it = m_timers.find(id);
    if (it == m_timers.end()) return;
    m_schedule.erase({it->second.due, id});  // absent while the timer's own firing runs
    m_timers.erase(it);
}

void LoopQueue::Post(RunLoop::Task task) {
    const std::lock_guard<std::mutex> lock(m_postedMutex);
    m_posted.push_back(std::move(task));
}

std::size_t LoopQueue::PostedCount() const {
    const std::lock_guard<std::mutex> lock(m_postedMutex);
    return m_posted.size();
}

bool LoopQueue::RunOnePosted() {
    RunLoop::Task task;
    {
        const std::lock_guard<std::mutex> lock(m_postedMutex);
        if (m_posted.empty()) return false;
        task = std::move(m_posted.front());
        m_posted.pop_front();
    }
    task();
    return true;
}

bool LoopQueue::FireOneDueTimer(Ticks now, const NextDue& next) {
    if (m_schedule.empty() || m_schedule.begin()->first > now) return false;
    const auto [due, id] = *m_schedule.begin();
    m_schedule.erase(m_schedule.begin());
    Timer& timer = m_timers.at(id);

    if (timer.interval == 0) {
        // Gone before its task runs, so cancelling itself inside is a harmless no-op.
        const RunLoop::Task task = std::move(timer.task);
        m_timers.erase(id);
        task();
        return true;
    }
    // The task stays out of the table while it runs: it may cancel its own timer.
    RunLoop::Task task = std::move(timer.task);
    task();
    const auto it = m_timers.find(id);
    if (it == m_timers.end()) return true;  // cancelled inside
    Timer& kept = it->second;
    const Ticks nextDue = next(id, due, kept.interval, ++kept.fired);
    if (nextDue < 0) {
        m_timers.erase(it);
        return true;
    }
    kept.task = std::move(task);
    kept.due = nextDue;
    m_schedule.emplace(nextDue, id);
    return true;
}

void LoopQueue::ResetFiringCounts() {
    for (auto& entry : m_timers)
        entry.second.fired = 0;
}
