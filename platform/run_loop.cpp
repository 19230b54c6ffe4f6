#include "platform/run_loop.h"

#include <cmath>
#include <utility>

namespace {

thread_local RunLoop* t_current = nullptr;

std::function<RunLoop*()>& ToolkitLoopFinder() {
    static std::function<RunLoop*()> finder;
    return finder;
}

}  // namespace

RunLoop* RunLoop::Current() {
    return t_current;
}

void RunLoop::SetCurrent(RunLoop* loop) {
    t_current = loop;
}

RunLoop* RunLoop::FindCurrent() {
    if (!t_current && ToolkitLoopFinder()) t_current = ToolkitLoopFinder()();
    return t_current;
}

void RunLoop::SetToolkitLoopFinder(std::function<RunLoop*()> finder) {
    ToolkitLoopFinder() = std::move(finder);
}

std::int64_t RunLoop::DelayToNanoseconds(double seconds) {
    if (!(seconds > 0)) return 0;  // negative and NaN alike
    if (seconds > kMaxDelaySeconds) seconds = kMaxDelaySeconds;
    const std::int64_t nanoseconds = std::llround(seconds * 1e9);
    return nanoseconds > 0 ? nanoseconds : 1;
}
