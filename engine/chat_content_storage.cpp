#include "engine/chat_content_storage.h"

#include <iterator>
#include <utility>

void CChatContentStorage::InsertNewLine(std::string_view header) {
    std::string& line = m_lines.emplace_back(header);
    line += '\t';
}

void CChatContentStorage::ModifyLatestLineByAdd(std::string_view text) {
    if (m_lines.empty()) return;
    m_lines.back() += text;
}

void CChatContentStorage::InsertTime(const DateTimeRec& time) {
    m_times.push_back(time);
}

void CChatContentStorage::AppendEntries(CChatContentStorage&& other) {
    if (m_times.empty() && m_lines.empty()) {
        m_times = std::move(other.m_times);
        m_lines = std::move(other.m_lines);
    } else {
        m_times.insert(m_times.end(), other.m_times.begin(), other.m_times.end());
        m_lines.insert(m_lines.end(), std::make_move_iterator(other.m_lines.begin()),
                       std::make_move_iterator(other.m_lines.end()));
    }
    other.Clear();
}

void CChatContentStorage::Clear() {
    m_times.clear();
    m_lines.clear();
}
