#include "platform/run_loop.h"

namespace {
thread_local RunLoop* t_current = nullptr;
}

RunLoop* RunLoop::Current() { return t_current; }

void RunLoop::SetCurrent(RunLoop* loop) { t_current = loop; }
