// The run loop of a window host: the Qt event loop of one thread behind the component's loop
// operations. Timers are Qt timers; Post may be called from any thread.
#pragma once

#include <QObject>
#include <QPointer>
#include <QTimer>
#include <map>
#include <memory>

#include "platform/run_loop.h"

class QtRunLoop final : public RunLoop {
public:
    // A loop on the thread that owns thread (the calling thread when null). Timers must be
    // added and cancelled on that thread.
    explicit QtRunLoop(QThread* thread = nullptr);
    ~QtRunLoop() override;
    QtRunLoop(const QtRunLoop&) = delete;
    QtRunLoop& operator=(const QtRunLoop&) = delete;

    void Post(Task task) override;
    TimerId AddTimer(double firstDelay, double interval, Task task) override;
    void CancelTimer(TimerId id) override;

    // Timers added and not yet cancelled or finished.
    std::size_t TimerCount() const { return m_timers.size(); }

private:
    struct Timer {
        std::unique_ptr<QTimer> qtimer;
        int intervalMs = 0;  // 0: fires once
        Task task;
    };

    // Milliseconds Qt can wait for seconds, rounded up and held within an int.
    static int ToMilliseconds(double seconds);
    void Fire(TimerId id);

    // Lives on the loop's thread; posted work is queued to it, and dropped once it is gone.
    std::unique_ptr<QObject> m_context;
    std::map<TimerId, Timer> m_timers;
    TimerId m_nextTimer = 1;
};
