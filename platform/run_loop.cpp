#include "platform/run_loop.h"

#include <cmath>

namespace {
thread_local RunLoop* t_current = nullptr;
}

RunLoop* RunLoop::Current() {
    return t_current;
}

void RunLoop::SetCurrent(RunLoop* loop) {
    t_current = loop;
}

std::int64_t RunLoop::DelayToNanoseconds(double seconds) {
    if (!(seconds > 0)) return 0;  // negative and NaN alike
    if (seconds > kMaxDelaySeconds) seconds = kMaxDelaySeconds;
    const std::int64_t nanoseconds = std::llround(seconds * 1e9);
    return nanoseconds > 0 ? nanoseconds : 1;
}
