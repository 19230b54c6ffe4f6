// A scoped trace: logs "Enter <text>" when made and "Leave <text>" when it goes out of
// scope, through the info channel with the component tag. Every entry point opens one.
#pragma once

class CFuncTrace {
public:
    CFuncTrace(const char* format, ...) __attribute__((format(printf, 2, 3)));
    virtual ~CFuncTrace();
    CFuncTrace(const CFuncTrace&) = delete;
    CFuncTrace& operator=(const CFuncTrace&) = delete;

    // The formatted text (at most 1023 characters).
    const char* Text() const { return m_szText; }

private:
    char m_szText[1024];
};

// The module tag of every log line the component writes.
constexpr const char* kChatTag = "Chat";
