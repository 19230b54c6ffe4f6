#include "newutil/macutil/debug_output.h"

#include <cstdio>
#include <utility>

namespace {

// The one installed sink; empty means "discard".
DebugOutputSink& CurrentSink() {
    static DebugOutputSink sink;
    return sink;
}

}  // namespace

int GetTraceLevel() {
    return 1;
}

void OutputDebugString(const char* text) {
    const DebugOutputSink& sink = CurrentSink();
    if (text != nullptr && sink) sink(text);
}

void SetDebugOutputSink(DebugOutputSink sink) {
    CurrentSink() = std::move(sink);
}

void ReportAssertion(const char* expression, const char* function, const char* module) {
    if (GetTraceLevel() < 1) return;
    char text[512] = {};
    // snprintf cuts an over-long message and always terminates it.
    std::snprintf(text, sizeof(text), "Assert -- %s in %s of %s\n", expression ? expression : "",
                  function ? function : "", module ? module : "");
    OutputDebugString(text);
}
