#include "ui/qt_run_loop.h"

#include <QThread>
#include <climits>

QtRunLoop::QtRunLoop(QThread* thread) : m_context(std::make_unique<QObject>()) {
    if (thread) m_context->moveToThread(thread);
}

QtRunLoop::~QtRunLoop() {
    // Timers belong to the loop's thread; they are stopped by their destruction here.
    m_timers.clear();
}

void QtRunLoop::Post(Task task) {
    QMetaObject::invokeMethod(m_context.get(), std::move(task), Qt::QueuedConnection);
}

int QtRunLoop::ToMilliseconds(double seconds) {
    const std::int64_t nanoseconds = DelayToNanoseconds(seconds);
    const std::int64_t milliseconds = (nanoseconds + 999999) / 1000000;
    return milliseconds > INT_MAX ? INT_MAX : static_cast<int>(milliseconds);
}

RunLoop::TimerId QtRunLoop::AddTimer(double firstDelay, double interval, Task task) {
    const TimerId id = m_nextTimer++;
    Timer& timer = m_timers[id];
    timer.qtimer = std::make_unique<QTimer>();
    timer.qtimer->setTimerType(Qt::PreciseTimer);
    timer.qtimer->setSingleShot(true);
    timer.intervalMs = interval > 0 ? std::max(1, ToMilliseconds(interval)) : 0;
    timer.task = std::move(task);
    QObject::connect(timer.qtimer.get(), &QTimer::timeout, m_context.get(),
                     [this, id] { Fire(id); });
    timer.qtimer->start(ToMilliseconds(firstDelay));
    return id;
}

void QtRunLoop::CancelTimer(TimerId id) {
    const auto it = m_timers.find(id);
    if (it == m_timers.end()) return;
    // The timer may be the one whose signal is running: let Qt delete it afterwards.
    it->second.qtimer->stop();
    it->second.qtimer.release()->deleteLater();
    m_timers.erase(it);
}

void QtRunLoop::Fire(TimerId id) {
    auto it = m_timers.find(id);
    if (it == m_timers.end()) return;
    if (it->second.intervalMs > 0) {
        it->second.qtimer->setSingleShot(false);
        if (!it->second.qtimer->isActive() ||
            it->second.qtimer->interval() != it->second.intervalMs)
            it->second.qtimer->start(it->second.intervalMs);
    }
    // A copy: the task may cancel its own timer.
    const Task task = it->second.task;
    if (it->second.intervalMs == 0) CancelTimer(id);
    task();
}
