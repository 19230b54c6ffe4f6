// HistoryUserRosterInfo: everybody who has been in the chat, read from the user-info cache,
// so that the senders of restored chat can be named after they have left.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "pdu/chat_user_info_pdu.h"

class IChatDataCmdProcess;

class HistoryUserRosterInfo {
public:
    HistoryUserRosterInfo() = default;
    virtual ~HistoryUserRosterInfo() = default;
    HistoryUserRosterInfo(const HistoryUserRosterInfo&) = delete;
    HistoryUserRosterInfo& operator=(const HistoryUserRosterInfo&) = delete;

    void InitParameters(IChatDataCmdProcess* sink) { m_pCmdSink = sink; }
    // Parses text as a user-info record and keeps it; false (nothing kept) when it is not one.
    bool AddRosterInfoString(const std::string& text);
    // The engine's answer (the local participant or the live roster) first, else the first
    // history record with that user id. False, out unchanged, when neither knows the id.
    bool GetUserNameFromId(std::uint32_t userId, std::string& out) const;

private:
    // Records in arrival order, and the first record of each user id.
    std::vector<std::unique_ptr<CChatUserInfoPDU>> m_Users;
    std::unordered_map<std::uint32_t, std::size_t> m_FirstByUserId;

    IChatDataCmdProcess* m_pCmdSink = nullptr;  // the engine; not owned
};
