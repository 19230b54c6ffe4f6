// A chat window that logs, as text a test compares, what is done to it: "view <address>",
// "sink <address>" (0x0 when it is taken away), each command's protocol name, and "end".
#pragma once

#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

#include "api/window_bridge.h"

// An address as the traces print it.
inline std::string Hex(const void* address) {
    char text[32];
    std::snprintf(text, sizeof text, "0x%x",
                  static_cast<unsigned>(reinterpret_cast<std::uintptr_t>(address)));
    return text;
}

class LoggingWindow final : public IChatWindow {
public:
    explicit LoggingWindow(std::vector<std::string>* log) : m_log(log) {}
    ~LoggingWindow() override { m_log->push_back("end"); }
    void SetSuperView(void* view) override { m_log->push_back("view " + Hex(view)); }
    void SetSink(IChatCommSinkForChatUI* sink) override { m_log->push_back("sink " + Hex(sink)); }
    // Answers 7 to msg_ShowChat and 0 to the rest, so that a test sees which answer comes back.
    int HandleCommand(int command, void*, void*) override {
        const char* name = ChatUIMessageName(command);
        m_log->push_back(name ? name : std::to_string(command));
        return command == msg_ShowChat ? 7 : 0;
    }

private:
    std::vector<std::string>* m_log;
};
