// Collects every trace line while it lives, so a test can assert on exact log texts.
#pragma once

#include <algorithm>
#include <string>
#include <vector>

#include "platform/trace.h"

struct TraceLine {
    TraceLevel level;
    std::string tag;
    std::string text;
};

class TraceCapture {
public:
    TraceCapture() {
        SetTraceSink([this](TraceLevel level, const char* tag, const char* text) {
            m_lines.push_back({level, tag, text});
        });
    }
    // Tests that look at no log line keep the trace silent again.
    ~TraceCapture() {
        SetTraceSink([](TraceLevel, const char*, const char*) {});
    }
    TraceCapture(const TraceCapture&) = delete;
    TraceCapture& operator=(const TraceCapture&) = delete;

    const std::vector<TraceLine>& Lines() const { return m_lines; }
    // True when some line has exactly this text (any level and tag).
    bool Has(const std::string& text) const { return Has(text, nullptr); }
    // True when some line of this level has exactly this text.
    bool Has(TraceLevel level, const std::string& text) const { return Has(text, &level); }
    // The texts alone, in order.
    std::vector<std::string> Texts() const {
        std::vector<std::string> texts;
        for (const TraceLine& line : m_lines)
            texts.push_back(line.text);
        return texts;
    }
    void Clear() { m_lines.clear(); }

private:
    bool Has(const std::string& text, const TraceLevel* level) const {
        return std::any_of(m_lines.begin(), m_lines.end(), [&](const TraceLine& line) {
            return line.text == text && (level == nullptr || line.level == *level);
        });
    }

    std::vector<TraceLine> m_lines;
};
