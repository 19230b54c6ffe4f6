#include "engine/chat_content_storage.h"

#include <algorithm>
#include <cstring>
#include <utility>

namespace {

void CopyTo(char* out, std::string_view text) {
    if (!text.empty()) std::memcpy(out, text.data(), text.size());
}

}  // namespace

void CChatContentStorage::InsertNewLine(std::string_view header) {
    char* const line = Take(header.size() + 1);
    CopyTo(line, header);
    line[header.size()] = '\t';
    m_lines.emplace_back(line, header.size() + 1);
    m_bLatestAtFree = true;
}

void CChatContentStorage::ModifyLatestLineByAdd(std::string_view text) {
    if (m_lines.empty() || text.empty()) return;
    if (!m_bLatestAtFree || text.size() > m_nFree) {
        MoveLatestLineAndAdd(text);
        return;
    }
    // The free bytes follow the line directly, so the line grows where it stands.
    CopyTo(Take(text.size()), text);
    std::string_view& line = m_lines.back();
    line = std::string_view(line.data(), line.size() + text.size());
}

void CChatContentStorage::MoveLatestLineAndAdd(std::string_view text) {
    // The old bytes stay where they are, so text may be a view into this store.
    std::string_view& line = m_lines.back();
    char* const moved = Take(line.size() + text.size());
    CopyTo(moved, line);
    CopyTo(moved + line.size(), text);
    line = std::string_view(moved, line.size() + text.size());
    m_bLatestAtFree = true;
}

void CChatContentStorage::InsertTime(const DateTimeRec& time) {
    m_times.push_back(time);
}

void CChatContentStorage::AppendEntries(ContentBlock&& block) {
    const std::size_t count = std::min(block.times.size(), block.lines.size());
    if (count == 0) return;
    block.times.resize(count);
    block.lines.resize(count);
    if (m_times.empty() && m_lines.empty()) {
        m_times = std::move(block.times);
        m_lines = std::move(block.lines);
    } else {
        m_times.insert(m_times.end(), block.times.begin(), block.times.end());
        m_lines.insert(m_lines.end(), block.lines.begin(), block.lines.end());
    }
    if (block.text) m_blocks.push_back(std::move(block.text));
    m_bLatestAtFree = false;
}

char* CChatContentStorage::Take(std::size_t size) {
    if (size > m_nFree) {
        // Twice what is asked for, so a line that keeps growing moves only now and then.
        const std::size_t blockSize = std::max(kBlockBytes, 2 * size);
        m_blocks.emplace_back(new char[blockSize]);
        m_pFree = m_blocks.back().get();
        m_nFree = blockSize;
    }
    char* const taken = m_pFree;
    m_pFree += size;
    m_nFree -= size;
    return taken;
}

void CChatContentStorage::Clear() {
    m_times.clear();
    m_lines.clear();
    m_blocks.clear();
    m_pFree = nullptr;
    m_nFree = 0;
    m_bLatestAtFree = false;
}
