// A scoped trace: logs "Enter <text>" when made and "Leave <text>" when it goes out of
// scope, through the info channel with the component tag. Every entry point of the
// component opens one, in the engine and in the window bridge alike.
#pragma once

#include <cstdarg>
#include <cstdio>

#include "platform/trace.h"

// The module tag of every log line the component writes.
constexpr const char* kChatTag = "Chat";

class CFuncTrace {
public:
    CFuncTrace(const char* format, ...) __attribute__((format(printf, 2, 3)));
    virtual ~CFuncTrace() { MacInfoTrace2(kChatTag, "%s%s", "Leave ", m_szText); }
    CFuncTrace(const CFuncTrace&) = delete;
    CFuncTrace& operator=(const CFuncTrace&) = delete;

    // The formatted text (at most 1023 characters).
    const char* Text() const { return m_szText; }

private:
    char m_szText[1024];
};

inline CFuncTrace::CFuncTrace(const char* format, ...) : m_szText{} {
    if (format) {
        va_list args;
        va_start(args, format);
        std::vsnprintf(m_szText, sizeof m_szText, format, args);
        va_end(args);
    }
    MacInfoTrace2(kChatTag, "%s%s", "Enter ", m_szText);
}
