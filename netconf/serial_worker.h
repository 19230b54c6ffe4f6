// A thread of its own that runs one participant's network requests one after the other, so
// that a request waiting for the server never holds up the run loop, and that wakes every
// tick for the periodic work (announcements, noticing silent participants).
#pragma once

#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <deque>
#include <functional>
#include <mutex>
#include <thread>

class SerialWorker {
public:
    using Task = std::function<void()>;

    // Starts the thread; tick runs about every interval while no task is running.
    SerialWorker(std::chrono::milliseconds interval, Task tick);
    // Runs what is queued, then ends the thread.
    ~SerialWorker();
    SerialWorker(const SerialWorker&) = delete;
    SerialWorker& operator=(const SerialWorker&) = delete;

    // Queues task after the ones queued before; safe from any thread. After Stop it is dropped.
    void Enqueue(Task task);
    // Returns once every task queued so far has run.
    void WaitIdle();
    // Runs what is queued and ends the thread; later tasks are dropped. Not from a task.
    void Stop();
    // Tasks run so far.
    std::uint64_t TasksRun() const;

private:
    void Run();

    const std::chrono::milliseconds m_interval;
    const Task m_tick;
    mutable std::mutex m_mutex;
    std::condition_variable m_changed;
    std::deque<Task> m_tasks;
    bool m_busy = false;
    bool m_stopping = false;
    std::uint64_t m_tasksRun = 0;
    std::thread m_thread;  // last: starts once everything above is ready
};
