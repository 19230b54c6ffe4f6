// Collects every trace line while it lives, so a test can assert on exact log texts.
#pragma once

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
    TraceCapture();
    ~TraceCapture();
    TraceCapture(const TraceCapture&) = delete;
    TraceCapture& operator=(const TraceCapture&) = delete;

    const std::vector<TraceLine>& Lines() const { return m_lines; }
    // True when some line has exactly this text (any level and tag).
    bool Has(const std::string& text) const { return Has(text, nullptr); }
    // True when some line of this level has exactly this text.
    bool Has(TraceLevel level, const std::string& text) const { return Has(text, &level); }
    // The texts alone, in order.
    std::vector<std::string> Texts() const;
    void Clear() { m_lines.clear(); }

private:
    bool Has(const std::string& text, const TraceLevel* level) const;

    std::vector<TraceLine> m_lines;
};
