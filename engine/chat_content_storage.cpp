#include "engine/chat_content_storage.h"

#include <algorithm>
#include <utility>

void CChatContentStorage::InsertNewLine(const std::string& header) {
    m_lines.push_back(header);
    m_lines.back().push_back('\t');
}

void CChatContentStorage::ModifyLatestLineByAdd(const std::string& text) {
    if (m_lines.empty()) return;
    m_lines.back().append(text);
}

void CChatContentStorage::InsertTime(const DateTimeRec& time) {
    m_times.push_back(time);
}

void CChatContentStorage::AppendEntries(std::vector<DateTimeRec>&& times,
                                        std::vector<std::string>&& lines) {
    const std::size_t count = std::min(times.size(), lines.size());
    times.resize(count);
    lines.resize(count);
    if (m_times.empty() && m_lines.empty()) {
        m_times = std::move(times);
        m_lines = std::move(lines);
        return;
    }
    // Room for the whole batch at once, still growing geometrically over many batches.
    if (m_lines.size() + count > m_lines.capacity()) {
        m_lines.reserve(std::max(m_lines.size() + count, 2 * m_lines.capacity()));
    }
    m_times.insert(m_times.end(), times.begin(), times.end());
    for (std::string& line : lines)
        m_lines.push_back(std::move(line));
}

const std::string& CChatContentStorage::NoLine() {
    static const std::string kNoLine;
    return kNoLine;
}

void CChatContentStorage::Clear() {
    m_times.clear();
    m_lines.clear();
}
