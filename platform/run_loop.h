// The host's main run loop as the component sees it: work posted for later, repeating
// timers, and the loop that belongs to the calling thread. Everything runs on one thread;
// only Post may be called from other threads too.
#pragma once

#include <cstdint>
#include <functional>

#include "platform/calendar.h"
#include "platform/host_kit.h"

class QC_HOST_KIT RunLoop {
public:
    using Task = std::function<void()>;
    using TimerId = std::uint64_t;  // 0 is never a valid timer

    virtual ~RunLoop() = default;

    // Runs the task later on this loop, after the work already queued; never inside Post.
    // Safe from any thread: a loop waiting for its next timer wakes up for the task.
    virtual void Post(Task task) = 0;

    // Calls the task first after firstDelay seconds, then every interval seconds
    // (interval 0: once). Returns the id that CancelTimer takes.
    virtual TimerId AddTimer(double firstDelay, double interval, Task task) = 0;

    // Stops a timer; an unknown or already cancelled id does nothing. Safe inside the
    // timer's own task.
    virtual void CancelTimer(TimerId id) = 0;

    // The calendar time now, as chat lines are stamped with it. A real loop answers the
    // system clock in local time; a virtual one its own clock from a chosen origin.
    virtual CalendarTime CalendarNow() const { return LocalCalendarNow(); }

    // The loop the calling thread runs, or null when none was made current.
    static RunLoop* Current();
    // Makes loop the calling thread's current loop (null clears it).
    static void SetCurrent(RunLoop* loop);
    // The calling thread's loop; when none is current, the loop of the host's toolkit (a Qt
    // application's, in the shared library) is made current and returned. Null when neither.
    static RunLoop* FindCurrent();
    // Installs how FindCurrent finds the toolkit's loop; an empty finder finds none.
    static void SetToolkitLoopFinder(std::function<RunLoop*()> finder);

protected:
    // Longest delay or interval a loop keeps apart (about 31 years); longer ones are cut.
    static constexpr double kMaxDelaySeconds = 1e9;

    // A delay in whole nanoseconds: negative or NaN counts as 0, huge values are capped
    // at kMaxDelaySeconds, and anything above 0 is at least 1 ns.
    static std::int64_t DelayToNanoseconds(double seconds);
};

// Makes a loop current for a scope and restores the previous one afterwards.
class ScopedCurrentRunLoop {
public:
    explicit ScopedCurrentRunLoop(RunLoop* loop) : m_pPrevious(RunLoop::Current()) {
        RunLoop::SetCurrent(loop);
    }
    ~ScopedCurrentRunLoop() { RunLoop::SetCurrent(m_pPrevious); }
    ScopedCurrentRunLoop(const ScopedCurrentRunLoop&) = delete;
    ScopedCurrentRunLoop& operator=(const ScopedCurrentRunLoop&) = delete;

private:
    RunLoop* m_pPrevious;
};
