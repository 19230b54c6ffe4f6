#include "engine/func_trace.h"

#include <cstdarg>
#include <cstdio>

#include "platform/trace.h"

CFuncTrace::CFuncTrace(const char* format, ...) : m_szText{} {
    if (format) {
        va_list args;
        va_start(args, format);
        std::vsnprintf(m_szText, sizeof m_szText, format, args);
        va_end(args);
    }
    MacInfoTrace2(kChatTag, "%s%s", "Enter ", m_szText);
}

CFuncTrace::~CFuncTrace() {
    MacInfoTrace2(kChatTag, "%s%s", "Leave ", m_szText);
}
