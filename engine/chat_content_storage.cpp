#include "engine/chat_content_storage.h"

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

void CChatContentStorage::AppendEntries(std::vector<ChatEntry>&& entries) {
    for (ChatEntry& entry : entries) {
        m_times.push_back(entry.time);
        m_lines.push_back(std::move(entry.line));
    }
}

DateTimeRec CChatContentStorage::GetTimeAt(std::size_t index) const {
    if (index >= m_times.size()) return DateTimeRec{};
    return m_times[index];
}

const std::string& CChatContentStorage::GetLineAtIndex(std::size_t index) const {
    static const std::string kNoLine;
    if (index >= m_lines.size()) return kNoLine;
    return m_lines[index];
}

void CChatContentStorage::Clear() {
    m_times.clear();
    m_lines.clear();
}
