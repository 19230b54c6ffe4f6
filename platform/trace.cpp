#include "platform/trace.h"

#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <memory>
#include <utility>

namespace {

const char* LevelName(TraceLevel level) {
    switch (level) {
        case TraceLevel::Info: return "INFO";
        case TraceLevel::Warn: return "WARN";
        case TraceLevel::Error: return "ERROR";
    }
    return "?";
}

// Opened once, on the first line, when QUINTARA_CHAT_LOG names a file.
FILE* LogFile() {
    static const std::unique_ptr<FILE, int (*)(FILE*)> file(
        [] {
            const char* path = std::getenv("QUINTARA_CHAT_LOG");
            return (path && *path) ? std::fopen(path, "a") : nullptr;
        }(),
        [](FILE* f) { return f ? std::fclose(f) : 0; });
    return file.get();
}

void DefaultSink(TraceLevel level, const char* tag, const char* text) {
    char stamp[32];
    const std::time_t now = std::time(nullptr);
    std::tm local{};
    localtime_r(&now, &local);
    std::strftime(stamp, sizeof stamp, "%Y-%m-%d %H:%M:%S", &local);
    if (level != TraceLevel::Info) std::fprintf(stderr, "%s %s %s %s\n", stamp, LevelName(level), tag, text);
    if (FILE* file = LogFile()) {
        std::fprintf(file, "%s %s %s %s\n", stamp, LevelName(level), tag, text);
        std::fflush(file);
    }
}

TraceSink& CurrentSink() {
    static TraceSink sink = DefaultSink;
    return sink;
}

void Emit(TraceLevel level, const char* tag, const char* format, va_list args) {
    char text[kMaxTraceText + 1];
    if (!format) format = "";
    std::vsnprintf(text, sizeof text, format, args);
    CurrentSink()(level, tag ? tag : "", text);
}

}  // namespace

void SetTraceSink(TraceSink sink) { CurrentSink() = sink ? std::move(sink) : TraceSink(DefaultSink); }

void MacInfoTrace2(const char* tag, const char* format, ...) {
    va_list args;
    va_start(args, format);
    Emit(TraceLevel::Info, tag, format, args);
    va_end(args);
}

void MacWarnTrace2(const char* tag, const char* format, ...) {
    va_list args;
    va_start(args, format);
    Emit(TraceLevel::Warn, tag, format, args);
    va_end(args);
}

void MacErrorTrace2(const char* tag, const char* format, ...) {
    va_list args;
    va_start(args, format);
    Emit(TraceLevel::Error, tag, format, args);
    va_end(args);
}
