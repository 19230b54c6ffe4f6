// Remembers which chat lines recovery has shown, so that a line stored several times (every
// receiver copies what it gets into the customer cache) reaches the transcript once.
#pragma once

#include <cstdint>
#include <deque>
#include <set>
#include <string>
#include <utility>

class RecoveredMessageFilter {
public:
    // True when the group message (group id, cache id in that group's cache) has not been
    // offered before, and records it. A cache id of 0 cannot be told apart: always true.
    bool FirstShowOfGroupMessage(std::uint32_t groupId, std::uint32_t cacheId);
    // True when the group message was offered before.
    bool WasGroupMessageShown(std::uint32_t groupId, std::uint32_t cacheId) const;

    // Private lines carry no cache id. Their sender copies one into the customer cache and
    // their receiver another, close together. So a line whose send id, receive id and text
    // equal one of the last kPrivateWindow lines read is taken as that line's second copy:
    // false, and the earlier line leaves the window (a third equal line shows again, being a
    // new message rather than a copy). Any other line is true and enters the window.
    bool FirstShowOfPrivateMessage(std::uint32_t sendId, std::uint32_t receiveId,
                                   const std::string& text);

    // Forgets everything.
    void Clear();

    static constexpr std::size_t kPrivateWindow = 16;

private:
    struct PrivateLine {
        std::uint32_t sendId;
        std::uint32_t receiveId;
        std::string text;
    };

    std::set<std::pair<std::uint32_t, std::uint32_t>> m_ShownGroupMessages;
    std::deque<PrivateLine> m_RecentPrivateLines;  // newest at the back
};
