#include "netconf/serial_worker.h"

#include <utility>

SerialWorker::SerialWorker(std::chrono::milliseconds interval, Task tick)
    : m_interval(interval), m_tick(std::move(tick)), m_thread([this] { Run(); }) {}

SerialWorker::~SerialWorker() {
    Stop();
}

void SerialWorker::Enqueue(Task task) {
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        if (m_stopping) return;
        m_tasks.push_back(std::move(task));
    }
    m_changed.notify_all();
}

void SerialWorker::WaitIdle() {
    std::unique_lock<std::mutex> lock(m_mutex);
    m_changed.wait(lock, [this] { return m_tasks.empty() && !m_busy; });
}

void SerialWorker::Stop() {
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        if (m_stopping) return;
        m_stopping = true;
    }
    m_changed.notify_all();
    m_thread.join();
}

std::uint64_t SerialWorker::TasksRun() const {
    const std::lock_guard<std::mutex> lock(m_mutex);
    return m_tasksRun;
}

void SerialWorker::Run() {
    auto nextTick = std::chrono::steady_clock::now() + m_interval;
    std::unique_lock<std::mutex> lock(m_mutex);
    for (;;) {
        m_changed.wait_until(lock, nextTick, [this] { return !m_tasks.empty() || m_stopping; });
        if (!m_tasks.empty()) {
            Task task = std::move(m_tasks.front());
            m_tasks.pop_front();
            m_busy = true;
            lock.unlock();
            task();
            lock.lock();
            m_busy = false;
            ++m_tasksRun;
            m_changed.notify_all();
            continue;
        }
        if (m_stopping) break;
        if (std::chrono::steady_clock::now() >= nextTick) {
            nextTick = std::chrono::steady_clock::now() + m_interval;
            lock.unlock();
            if (m_tick) m_tick();
            lock.lock();
        }
    }
}
