// The host's trace library: every log line of the component goes through these three
// channels with a module tag. A host or a test may replace where the lines end up.
#pragma once

#include <functional>

enum class TraceLevel { Info, Warn, Error };

// Receives one finished line: level, module tag and the formatted text.
using TraceSink = std::function<void(TraceLevel level, const char* tag, const char* text)>;

// Installs a sink for every later line; an empty sink restores the default one.
// The default writes "time level tag text" lines, warnings and errors to stderr, and
// every line to the file named by the environment variable QUINTARA_CHAT_LOG when set.
void SetTraceSink(TraceSink sink);

// Longest text one call writes; longer texts are cut.
constexpr int kMaxTraceText = 4095;

void MacInfoTrace2(const char* tag, const char* format, ...) __attribute__((format(printf, 2, 3)));
void MacWarnTrace2(const char* tag, const char* format, ...) __attribute__((format(printf, 2, 3)));
void MacErrorTrace2(const char* tag, const char* format, ...) __attribute__((format(printf, 2, 3)));
