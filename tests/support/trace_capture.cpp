#include "tests/support/trace_capture.h"

#include <algorithm>

TraceCapture::TraceCapture() {
    SetTraceSink([this](TraceLevel level, const char* tag, const char* text) {
        m_lines.push_back({level, tag, text});
    });
}

TraceCapture::~TraceCapture() {
    SetTraceSink([](TraceLevel, const char*, const char*) {});
}

bool TraceCapture::Has(const std::string& text, const TraceLevel* level) const {
    return std::any_of(m_lines.begin(), m_lines.end(), [&](const TraceLine& line) {
        return line.text == text && (level == nullptr || line.level == *level);
    });
}

std::vector<std::string> TraceCapture::Texts() const {
    std::vector<std::string> texts;
    for (const TraceLine& line : m_lines)
        texts.push_back(line.text);
    return texts;
}
