// Roster change processing: the conference service's application-roster reports become roster
// items, send-to menu entries and privilege re-evaluations. Enroll data is written by other
// participants, so it is parsed within the length the service reports and its names are
// cleaned before they reach the roster, the menu or the window.
#include <strings.h>

#include <cstdint>
#include <memory>
#include <string>

#include "engine/chat_client.h"
#include "pdu/roster_info_pdu.h"
#include "pdu/xml_limits.h"
#include "platform/func_trace.h"
#include "platform/string_table.h"
#include "platform/trace.h"

namespace {

// Longest display name taken from enroll data, in bytes; longer names are cut.
constexpr std::size_t kMaxEnrolledNameBytes = 255;

// A display name fit for one menu line and one log line: control characters become spaces and
// an overlong name is cut before a UTF-8 lead byte, so no character is split.
std::string CleanDisplayName(std::string name) {
    if (name.size() > kMaxEnrolledNameBytes) {
        std::size_t cut = kMaxEnrolledNameBytes;
        while (cut > 0 && (static_cast<unsigned char>(name[cut]) & 0xC0) == 0x80)
            --cut;
        name.resize(cut);
    }
    for (char& c : name) {
        const unsigned char byte = static_cast<unsigned char>(c);
        if (byte < 0x20 || byte == 0x7F) c = ' ';
    }
    return name;
}

bool IsPrivilegedRoles(std::uint32_t roles) {
    return (roles & (ROLE_HOST | ROLE_PRESENTER | ROLE_PANELIST)) != 0;
}

// Calls visit(record, entry index) for every user entry of the records of this session.
template <typename Visit>
void ForEachSessionUser(std::uint32_t count, const ARMApeRoster* first, std::uint32_t sessionId,
                        Visit visit) {
    for (std::uint32_t i = 0; i < count; ++i) {
        const ARMApeRoster& record = first[i];
        if (record.dwSessionID != sessionId || !record.pUsers) continue;
        const std::uint16_t users = record.wUserCount;
        for (std::uint32_t j = 0; j < users; ++j)
            visit(record, j);
    }
}

}  // namespace

int CChatClient::ApeRosterChanged(std::uint32_t, std::uint16_t, std::uint32_t addedCount,
                                  std::uint32_t deletedCount, std::uint32_t modifiedCount,
                                  ARMApeRoster* records) {
    if (!records) return 0;
    if (addedCount > 0) ProcessAddEnrollInfo(addedCount, records);
    if (deletedCount > 0) ProcessDeleteEnrollInfo(deletedCount, records + addedCount);
    if (modifiedCount > 0)
        ProcessModifyEnrollInfo(modifiedCount, records + addedCount + deletedCount);
    return 0;
}

int CChatClient::ExtractEnrollInfoAndReturnLen(std::uint32_t index, UserItem* item,
                                               const ARMApeRoster* record) {
    CFuncTrace trace("CChatClient::ExtractEnrollInfoAndReturnLen");
    if (!item || !record || !record->pUsers || index >= record->wUserCount) return -1;
    const ARMApeUser& user = record->pUsers[index];
    item->dwUserID = user.dwUserID;
    item->dwNodeID = user.dwNodeID;
    const std::int32_t length = user.nEnrollInfoLen;
    if (length < 0 || !user.pEnrollInfo) return -1;
    // A length beyond any document the parser takes is not copied: it says nothing about the
    // participant and may say more than the service holds.
    if (static_cast<std::size_t>(length) > kMaxXmlBytes) return 0;

    auto pdu = std::make_unique<CRosterInfoPDU>();
    const std::string text(reinterpret_cast<const char*>(user.pEnrollInfo),
                           static_cast<std::size_t>(length));
    if (pdu->ParseXMLPDU(text)) {
        item->strName = CleanDisplayName(pdu->GetUserNameW()).c_str();
        item->dwRoles = pdu->GetRoleSet_DWORD();
        item->bVisible = pdu->GetVisible_BOOL();
        item->dwUserType = pdu->GetUserType_DWORD();
        item->dwExternalTag = pdu->GetUserExternalTag_DWORD();
    }
    return 0;
}

int CChatClient::ProcessAddEnrollInfo(std::uint32_t count, const ARMApeRoster* first) {
    CFuncTrace trace("CChatClient::ProcessAddEnrollInfo");
    const bool wasBeforeHost = IsBeforeHost();
    MacInfoTrace2(kChatTag, "CChatClient::ProcessAddEnrollInfo bPreIsBeforeHost = %d,IsHost()=%d",
                  wasBeforeHost, m_dwHostID == m_dwMyNodeID);
    bool ownArrived = false;
    ForEachSessionUser(count, first, m_dwSessionID,
                       [&](const ARMApeRoster& record, std::uint32_t j) {
                           UserItem extracted;
                           if (ExtractEnrollInfoAndReturnLen(j, &extracted, &record) == -1) return;
                           auto user = std::make_unique<UserItem>(extracted);
                           const bool own = user->dwUserID == m_dwMyUserID;
                           if (own) ownArrived = true;
                           AddEnrolledUser(std::move(user), own, ownArrived);
                       });

    const bool beforeHost = IsBeforeHost();
    MacInfoTrace2(kChatTag, "CChatClient::ProcessAddEnrollInfo IsBeforeHost = %d", beforeHost);
    if (m_dwMeetingType == 3 && beforeHost != wasBeforeHost && !IsHostOrPresenter())
        OnPrivilegeChanged(m_dwPrivilege, 1);
    if (ownArrived) {
        if ((m_dwFeatures & FEATURE_GROUP_SCHEME2) == 0) OnPrivilegeChanged(m_dwPrivilege, 0);
        if (m_dwMeetingType == 3 && IsHostOrPresenter()) OnRosterChange(1);
    }
    return 1;
}

void CChatClient::AddEnrolledUser(std::unique_ptr<UserItem> user, bool bOwn, bool bOwnArrived) {
    if (IsUserExist(user.get())) return;
    const char* name = user->strName.GetData();
    if (name && strcasecmp(name, kRecorderName) == 0) return;

    const std::uint32_t nodeId = user->dwNodeID;
    const std::string title = name ? name : "";
    const bool privileged = IsPrivilegedRoles(user->dwRoles);
    if (!m_UserList.AddItem(std::move(user))) return;

    if ((m_bChatPrivately || IsHostOrPresenter()) && nodeId != m_dwHostID &&
        nodeId != m_dwPresenterID) {
        if (!m_bUseAttendeeSelector && m_dwMeetingType != 3) {
            const bool hadUserEntry = HasParticipantEntry();
            InsertExternalInternalChatUserName(title.c_str(), nodeId,
                                               GetUserExternalInternalTag(nodeId));
            if (m_bQMMode && !bOwn && !hadUserEntry && !IsHostOrPresenter() && OnlyChatPrivately())
                NotifyUI(msg_EnableUserList);
        } else if (privileged) {
            InsertChatUserName(title.c_str(), nodeId, 0);
        }
    }
    if (!m_bQMMode) return;
    // Once the host's own record is in, every participant added after it in the same report
    // brings the host back to "Everyone".
    if (bOwnArrived && m_dwMyNodeID == m_dwHostID) {
        const int everyone = GetIndexOfMenuByGroup(GROUP_EVERYONE);
        if (everyone != -1 && m_MenuStatus[everyone].bEnabled) SelectMenuItemByIndexInQM(everyone);
    }
    TitleRoleEntryInQM(nodeId, title);
}

void CChatClient::TitleRoleEntryInQM(std::uint32_t nodeId, const std::string& name) {
    int index = -1;
    const char* role = nullptr;
    if (IsNodeHost(nodeId) && IsNodePresenter(nodeId)) {
        role = "Host & Presenter";
        index = GetIndexOfMenuByGroup(GROUP_HOST_PRESENTER);
    } else if (IsNodeHost(nodeId)) {
        role = "Host";
        index = GetIndexOfMenuByGroup(GROUP_HOST);
        if (index == -1 && nodeId != m_dwMyNodeID) {
            MenuStatus entry;
            entry.strTitle = GetLocalizedString("Host");
            entry.nGroupID = GROUP_HOST;
            entry.dwExternalTag = GetUserExternalInternalTag(nodeId);
            index = InsertMenuEntry(entry, GetIndexOfMenuByGroup(GROUP_EVERYONE) != -1 ? 2 : 0);
            MacInfoTrace2(
                kChatTag,
                "CChatClient::ProcessAddEnrollInfo item \"Host\" is not in menu, add it ");
        }
    } else if (IsNodePresenter(nodeId)) {
        role = "Presenter";
        index = GetIndexOfMenuByGroup(GROUP_PRESENTER);
    }
    if (index == -1 || name.empty()) return;
    RetitleRoleEntry(index, name, nodeId, role);
}

int CChatClient::ProcessDeleteEnrollInfo(std::uint32_t count, const ARMApeRoster* first) {
    CFuncTrace trace("CChatClient::ProcessDeleteEnrollInfo");
    ForEachSessionUser(
        count, first, m_dwSessionID, [&](const ARMApeRoster& record, std::uint32_t j) {
            const std::uint32_t nodeId = record.pUsers[j].dwNodeID;
            const UserItem* user = m_UserList.GetUserItemFromNodeId(nodeId);
            if (!user) return;
            const std::string name = user->strName.GetData() ? user->strName.GetData() : "";
            if (m_bQMMode) {
                RemoveChatUserNameInQM(name.c_str(), nodeId);
                if (m_MenuStatus.empty() && !IsHostOrPresenter() && !m_bChatEveryone &&
                    !m_bChatAttendees && !m_bChatHost && !m_bChatPresenter) {
                    std::int32_t allow = 0;
                    NotifyUI(msg_AllowUserInput, &allow);
                    NotifyUI(msg_DisableUserList);
                }
            } else {
                RemoveChatUserName(name.c_str(), nodeId, 1);
                RemoveRecentUserName(name.c_str(), nodeId);
            }
            m_UserList.RemoveItem(nodeId);
        });
    return 1;
}

int CChatClient::ProcessModifyEnrollInfo(std::uint32_t count, const ARMApeRoster* first) {
    CFuncTrace trace("CChatClient::ProcessModifyEnrollInfo");
    const bool wasBeforeHost = IsBeforeHost();
    bool ownRolesChanged = false;
    ForEachSessionUser(
        count, first, m_dwSessionID, [&](const ARMApeRoster& record, std::uint32_t j) {
            UserItem extracted;
            if (ExtractEnrollInfoAndReturnLen(j, &extracted, &record) == -1) return;
            const UserItem* user = m_UserList.GetUserItemFromNodeId(extracted.dwNodeID);
            if (!user) return;
            const bool wasPrivileged = IsPrivilegedRoles(user->dwRoles);
            const bool own = user->dwUserID == m_dwMyUserID;
            if (own && user->dwRoles != extracted.dwRoles) ownRolesChanged = true;
            m_UserList.UpdateItem(extracted.dwNodeID, extracted,
                                  (m_dwFeatures & FEATURE_GROUP_SCHEME2) != 0);
            const bool privileged = IsPrivilegedRoles(extracted.dwRoles);
            if (own) {
                if (m_dwMeetingType == 3 && ownRolesChanged && wasPrivileged != privileged) {
                    OnRosterChange(0);
                    OnPrivilegeChanged(m_dwPrivilege, 1);
                }
            } else {
                OnPrivilegeChanged(m_dwPrivilege, IsBeforeHost() != wasBeforeHost ? 1 : 0);
            }
        });
    return 1;
}
