// Collects the support library's assertion messages while it lives.
#pragma once

#include <string>
#include <vector>

#include "newutil/macutil/debug_output.h"

class DebugOutputCapture {
public:
    DebugOutputCapture() {
        SetDebugOutputSink([this](const char* text) { m_texts.push_back(text); });
    }
    ~DebugOutputCapture() { SetDebugOutputSink({}); }
    DebugOutputCapture(const DebugOutputCapture&) = delete;
    DebugOutputCapture& operator=(const DebugOutputCapture&) = delete;

    const std::vector<std::string>& Texts() const { return m_texts; }

private:
    std::vector<std::string> m_texts;
};

// The message the byte stream reports for a failed check at a line.
inline std::string StreamAssertText(int line) {
    return "Assert --  at file kyutil/bstream.cpp, line " + std::to_string(line) + "\n";
}
