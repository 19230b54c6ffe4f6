// The engine's view of the roster: who exists, who may chat as panelist, whether the meeting
// still waits for its host, the local participant's own roles and the picked attendees.
#include <algorithm>

#include "engine/chat_client.h"
#include "platform/func_trace.h"

bool CChatClient::IsUserExist(const UserItem* item) const {
    CFuncTrace trace("CChatClient::IsuserExist");
    return item && m_UserList.HasUserOnNode(item->dwUserID, item->dwNodeID);
}

std::uint32_t CChatClient::GetPanelistCount() const {
    return m_UserList.GetPrivilegedCount();
}

bool CChatClient::IsBeforeHost() const {
    if (m_UserList.GetHostCount() != 0) return false;
    if (m_bQMMode) return m_dwHostID == 0 && m_dwPresenterID == 0;
    return m_dwHostID != m_dwMyNodeID && !(m_dwMyRosters & ROLE_HOST);
}

int CChatClient::SetRosters(std::uint32_t dwRoster, int bForce) {
    CFuncTrace trace("CChatClient::SetRosters, dwRoster = %d, bForce = %d", dwRoster, bForce);
    // Outside meeting type 1 the host and the presenter sit among the panelists.
    if (m_dwMeetingType != 1 && (dwRoster & (ROLE_HOST | ROLE_PRESENTER))) {
        dwRoster |= ROLE_PANELIST;
    }
    if (bForce) {
        m_dwMyRosters = dwRoster;
        return 1;
    }
    const std::uint32_t previous = m_dwMyRosters;
    m_dwMyRosters = dwRoster;
    int result = 0;
    if (m_bEnrolled) {
        result = previous != dwRoster ? Enroll() : 1;
        m_bRostersPending = 0;
    } else {
        // The enrolment (or the tick after it) carries the new roles.
        m_bRostersPending = 1;
    }
    SubscribeAllGroupCaches();
    return result;
}

int CChatClient::SetAttendee(std::uint32_t dwNodeId) {
    CFuncTrace trace("CChatClient::SetAttendee, dwNodeId = %d", dwNodeId);
    const int result = m_UserList.SetAttendee(dwNodeId, 1);
    if (result != 0 && result != static_cast<int>(CUserListManager::kNotFound)) Enroll();
    return result == 1 ? 0 : -1;
}

bool CChatClient::IsUserSelectedUser(std::uint32_t nodeId) const {
    if (!m_UserList.GetUserItemFromNodeId(nodeId)) return false;
    return std::find(m_SelectedUsers.begin(), m_SelectedUsers.end(), nodeId) !=
           m_SelectedUsers.end();
}

void CChatClient::AddUserByUserSelected(std::uint32_t nodeId) {
    if (!m_UserList.GetUserItemFromNodeId(nodeId) || IsUserSelectedUser(nodeId)) return;
    m_SelectedUsers.push_back(nodeId);
}

void CChatClient::RemoveUserByUserID(std::uint32_t nodeId) {
    if (!IsUserSelectedUser(nodeId)) return;
    m_SelectedUsers.erase(std::remove(m_SelectedUsers.begin(), m_SelectedUsers.end(), nodeId),
                          m_SelectedUsers.end());
}

bool CChatClient::IsPrivileged() const {
    return (m_dwMyRosters & ROLE_PANELIST) != 0 || IsHostOrPresenter();
}

bool CChatClient::IsHostOrPresenter() const {
    return m_dwMyNodeID == m_dwHostID || m_dwMyNodeID == m_dwPresenterID;
}
