#include "engine/line_ends.h"

std::string replace_all(const std::string& text, const std::string& from, const std::string& to) {
    if (from.empty()) return text;
    // Restarting the search from the start after each replacement finds the leftmost match
    // of the new text. Everything before the replaced place held no match, so the text is
    // read once: bytes move to out, and a replacement goes back in front of what is still to
    // read (in reverse on a stack), where it can complete a match with what came before.
    const bool rescan = to.find(from) == std::string::npos;
    std::string out;
    out.reserve(text.size());
    std::string pushedBack;
    std::size_t next = 0;
    while (!pushedBack.empty() || next < text.size()) {
        if (pushedBack.empty()) {
            out.push_back(text[next++]);
        } else {
            out.push_back(pushedBack.back());
            pushedBack.pop_back();
        }
        if (out.size() < from.size() ||
            out.compare(out.size() - from.size(), from.size(), from) != 0)
            continue;
        out.resize(out.size() - from.size());
        if (rescan) {
            pushedBack.append(to.rbegin(), to.rend());
        } else {
            out += to;
        }
    }
    return out;
}

std::string NormaliseLineEnds(const std::string& text) {
    std::string result = replace_all(text, "\r\n", "\r");
    result = replace_all(result, "\n\r", "\r");
    result = replace_all(result, "\r", "\n\n");
    result = replace_all(result, "\n\n", "\r\n");
    return replace_all(result, "\xE2\x80\xA8", "\r\n");
}
