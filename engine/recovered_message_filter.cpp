#include "engine/recovered_message_filter.h"

#include <algorithm>

bool RecoveredMessageFilter::FirstShowOfGroupMessage(std::uint32_t groupId, std::uint32_t cacheId) {
    if (cacheId == 0) return true;
    return m_ShownGroupMessages.emplace(groupId, cacheId).second;
}

bool RecoveredMessageFilter::WasGroupMessageShown(std::uint32_t groupId,
                                                  std::uint32_t cacheId) const {
    return cacheId != 0 && m_ShownGroupMessages.count({groupId, cacheId}) != 0;
}

bool RecoveredMessageFilter::FirstShowOfPrivateMessage(std::uint32_t sendId,
                                                       std::uint32_t receiveId,
                                                       const std::string& text) {
    const auto copy = std::find_if(
        m_RecentPrivateLines.begin(), m_RecentPrivateLines.end(), [&](const PrivateLine& line) {
            return line.sendId == sendId && line.receiveId == receiveId && line.text == text;
        });
    if (copy != m_RecentPrivateLines.end()) {
        m_RecentPrivateLines.erase(copy);
        return false;
    }
    if (m_RecentPrivateLines.size() == kPrivateWindow) m_RecentPrivateLines.pop_front();
    m_RecentPrivateLines.push_back({sendId, receiveId, text});
    return true;
}

void RecoveredMessageFilter::Clear() {
    m_ShownGroupMessages.clear();
    m_RecentPrivateLines.clear();
}
