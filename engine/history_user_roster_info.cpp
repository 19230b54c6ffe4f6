#include "engine/history_user_roster_info.h"

#include "engine/chat_data_cmd_process.h"

bool HistoryUserRosterInfo::AddRosterInfoString(const std::string& text) {
    auto pdu = std::make_unique<CChatUserInfoPDU>();
    if (text.empty() || !pdu->ParseXMLPDU(text)) return false;
    pdu->Clear();  // the fields are all that is read later; the document is not kept
    m_FirstByUserId.emplace(pdu->GetUserID_DWORD(), m_Users.size());
    m_Users.push_back(std::move(pdu));
    return true;
}

bool HistoryUserRosterInfo::GetUserNameFromId(std::uint32_t userId, std::string& out) const {
    if (m_pCmdSink && m_pCmdSink->GetUserNameFromId(userId, out)) return true;
    const auto found = m_FirstByUserId.find(userId);
    if (found == m_FirstByUserId.end()) return false;
    out = m_Users[found->second]->GetUserName();
    return true;
}
