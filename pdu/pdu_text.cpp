#include "pdu/pdu_text.h"

#include <cctype>

std::string DwordText(uint32_t value) {
    return std::to_string(value);
}

std::string IntText(int value) {
    return std::to_string(value);
}

uint32_t DwordValue(const std::string& text) {
    size_t i = 0;
    while (i < text.size() && std::isspace(static_cast<unsigned char>(text[i])))
        ++i;
    bool negative = false;
    if (i < text.size() && (text[i] == '+' || text[i] == '-')) negative = text[i++] == '-';
    // Unsigned arithmetic wraps, which is exactly "keep the low 32 bits" of any length of digits.
    uint32_t value = 0;
    for (; i < text.size() && text[i] >= '0' && text[i] <= '9'; ++i) {
        value = value * 10u + static_cast<uint32_t>(text[i] - '0');
    }
    return negative ? 0u - value : value;
}

std::string ReplaceCdataEndMarkers(const std::string& text) {
    static const std::string kMarker = "]]>";
    size_t found = text.find(kMarker);
    if (found == std::string::npos) return text;
    // Built in one pass: inserting in place would move the rest of a long text once per marker.
    std::string out;
    out.reserve(text.size() + text.size() / 8 + 1);
    size_t from = 0;
    for (; found != std::string::npos; found = text.find(kMarker, from)) {
        out.append(text, from, found - from);
        out += "]] >";
        from = found + kMarker.size();
    }
    out.append(text, from, std::string::npos);
    return out;
}
