// Host and presenter changes: who holds the roles, what the local participant held before
// and after, the roster's role bits, enrolment and cache subscriptions that follow an own role
// change, and the menu rebuilt from the groups for a privileged participant.
#include <cstdint>

#include "engine/chat_client.h"
#include "engine/menu_entries.h"
#include "platform/func_trace.h"
#include "platform/trace.h"

namespace {

// Bits of m_dwMyRole and m_dwPrevMyRole.
constexpr std::uint32_t kMyRolePresenter = 0x1;
constexpr std::uint32_t kMyRoleHost = 0x2;

}  // namespace

void CChatClient::OnHostChanged(std::uint32_t hostId) {
    CFuncTrace trace("CChatClient::OnHostChanged, inHostID = %d", hostId);
    const bool wasHost = m_dwHostID == m_dwMyNodeID;
    const bool isHost = hostId == m_dwMyNodeID;
    const bool amPresenter = m_dwPresenterID == m_dwMyNodeID;
    m_dwPrevMyRole = (amPresenter ? kMyRolePresenter : 0) | (wasHost ? kMyRoleHost : 0);
    m_dwMyRole = m_dwPrevMyRole;
    if (wasHost && !isHost) m_dwMyRole &= ~kMyRoleHost;

    m_dwPrevHostID = m_dwHostID;
    m_dwHostID = hostId;

    if (isHost) {
        m_dwMyRosters |= ROLE_HOST;
    } else {
        m_dwMyRosters &= ~ROLE_HOST;
    }
    if (isHost || amPresenter) m_dwMyRosters |= ROLE_PANELIST;
    // The previous holder no longer counts as host, even before its own roster record says so.
    if (m_dwPrevHostID != hostId) ClearRosterRole(m_dwPrevHostID, ROLE_HOST);

    if (m_bQMMode && m_bChatHost) ArrangeRoleEntriesInQM(true);

    if (hostId == 0 || !m_UserList.GetUserItemFromNodeId(hostId)) {
        if (m_bQMMode && wasHost && !isHost && !amPresenter &&
            !(m_bChatHost && m_bChatPresenter && m_bChatEveryone))
            OnAttendeePrivilegeChangeInQM(m_dwPrivilege & 0x10047, 1);
        EraseTrailingSeparator();
        CheckMenuStateForTPSupport(0);
        return;
    }
    CheckMenuSpelineWhenTPIsPresenterHost();
    m_UserList.SetHost(hostId);
    if (isHost) {
        m_dwMyRole |= kMyRoleHost;
        Enroll();
        SubscribeAllGroupCaches();
    }
    if (m_dwPrevMyRole & kMyRoleHost) {
        Enroll();
        SubscribeAllGroupCaches();
    }
    if (wasHost && !isHost) {
        OnPrivilegeChanged(m_dwPrivilege, 1);
    } else if (!wasHost && isHost) {
        const UserItem* firstHost = m_UserList.GetHosUser();
        if (firstHost && firstHost->dwNodeID == hostId) {
            if (m_dwMeetingType == 3) OnRosterChange(0);
            OnPrivilegeChanged(m_dwPrivilege, 0);
        }
    } else if (!wasHost && !isHost && m_bQMMode && !m_bChatHost && !amPresenter) {
        OnPrivilegeChanged(m_dwPrivilege, 1);
    }
    EraseTrailingSeparator();
}

void CChatClient::OnPresenterChanged(std::uint32_t presenterId) {
    CFuncTrace trace("CChatClient::OnPresenterChanged, inPresenterID -= %d", presenterId);
    const bool wasPresenter = m_dwPresenterID == m_dwMyNodeID;
    const bool isPresenter = presenterId == m_dwMyNodeID;
    const bool amHost = m_dwHostID == m_dwMyNodeID;
    m_dwPrevMyRole = (wasPresenter ? kMyRolePresenter : 0) | (amHost ? kMyRoleHost : 0);
    m_dwMyRole = m_dwPrevMyRole;
    if (wasPresenter && !isPresenter) m_dwMyRole &= ~kMyRolePresenter;

    m_dwPrevPresenterID = m_dwPresenterID;
    m_dwPresenterID = presenterId;

    if (isPresenter) {
        m_dwMyRosters |= ROLE_PRESENTER;
    } else {
        m_dwMyRosters &= ~ROLE_PRESENTER;
    }
    if (isPresenter || amHost) m_dwMyRosters |= ROLE_PANELIST;
    if (m_dwPrevPresenterID != presenterId) ClearRosterRole(m_dwPrevPresenterID, ROLE_PRESENTER);

    if (m_bQMMode) ArrangeRoleEntriesInQM(false);

    if (presenterId == 0 || !m_UserList.GetUserItemFromNodeId(presenterId)) {
        CheckMenuStateForTPSupport(1);
        return;
    }
    CheckMenuSpelineWhenTPIsPresenterHost();
    // A host who also presents stays host in the roster.
    if (presenterId != m_dwHostID) m_UserList.SetPresenter(presenterId);
    if (isPresenter) {
        m_dwMyRosters |= ROLE_PRESENTER | ROLE_PANELIST;
        if (amHost) m_dwMyRosters |= ROLE_HOST;
        Enroll();
        m_dwMyRole |= kMyRolePresenter;
        SubscribeAllGroupCaches();
    }
    if (m_dwPrevMyRole & kMyRolePresenter) {
        if (amHost) m_dwMyRosters |= ROLE_HOST | ROLE_PANELIST;
        if (isPresenter) m_dwMyRosters |= ROLE_PRESENTER | ROLE_PANELIST;
        Enroll();
        SubscribeAllGroupCaches();
    }
    if (wasPresenter && !isPresenter) {
        OnPrivilegeChanged(m_dwPrivilege, 1);
    } else if (m_bQMMode && !m_bChatPresenter && !IsHostOrPresenter()) {
        OnPrivilegeChanged(m_dwPrivilege, 1);
    }
    EraseTrailingSeparator();
}

void CChatClient::OnRosterChange(int bSelectEveryone) {
    const bool privileged = IsPrivileged();
    if (m_bPractice) {
        if (privileged) {
            RebuildPanelistMenuInPractice();
        } else {
            RebuildAttendeeMenuInPractice(0);
        }
        return;
    }
    if (privileged) {
        const std::optional<MenuStatus> selected = SelectedMenuEntry();
        m_MenuStatus.Clear();
        AppendGroupEntries(0);
        AnnounceRebuiltMenu();
        if (!bSelectEveryone && selected && !selected->bSeparator) {
            const int again = IndexOfEqualEntry(m_MenuStatus, *selected);
            if (again != -1) SelectMenuItemByIndex(again);
        }
    }
    if (bSelectEveryone) SelectMenuItemByIndex(GetIndexOfMenuByGroup(GROUP_EVERYONE));
}

void CChatClient::AppendGroupEntries(std::uint32_t dropLast) {
    const std::int32_t count = m_GroupList.GetGroupsCount() - static_cast<std::int32_t>(dropLast);
    for (std::int32_t i = 0; i < count; ++i) {
        const CUsersGroup* group = m_GroupList.GetGroupByIndex(i);
        if (group->GetGroupType() == 2) {
            m_MenuStatus.PushBack(SeparatorEntry());
        } else if (group->GetGrpName()) {
            m_MenuStatus.PushBack(
                GroupEntry(group->GetGrpName(), static_cast<std::int32_t>(group->GetGroupId())));
        }
    }
}

void CChatClient::CheckMenuSpelineWhenTPIsPresenterHost() {
    if (m_dwHostID == 0 || m_dwPresenterID == 0) return;
    if (m_UserList.GetUserItemFromNodeId(m_dwHostID) &&
        m_UserList.GetUserItemFromNodeId(m_dwPresenterID))
        return;
    MacInfoTrace2(kChatTag, "CChatClient::CheckMenuSpelineWhenTPIsPresenterHost delete sepline");
    for (std::size_t i = 1; i < m_MenuStatus.size(); ++i) {
        if (m_MenuStatus[i - 1].bSeparator && m_MenuStatus[i].bSeparator) {
            EraseMenuEntry(static_cast<int>(i));
            return;
        }
    }
}

void CChatClient::CheckMenuStateForTPSupport(int) {
    if (!m_bQMMode) return;
    const bool hostOutside = m_dwPrevHostID != 0 && !m_UserList.GetUserItemFromNodeId(m_dwHostID);
    const bool presenterOutside =
        m_dwPrevPresenterID != 0 && !m_UserList.GetUserItemFromNodeId(m_dwPresenterID);
    if (hostOutside == presenterOutside) return;

    const int combined = GetIndexOfMenuByGroup(GROUP_HOST_PRESENTER);
    if (combined > 0) {
        std::int32_t becomes = -1;
        if (!m_bChatHost && GetIndexOfMenuByGroup(GROUP_PRESENTER) == -1) {
            becomes = GROUP_PRESENTER;
        } else if (!m_bChatPresenter && GetIndexOfMenuByGroup(GROUP_HOST) == -1) {
            becomes = GROUP_HOST;
        }
        if (becomes != -1) {
            m_MenuStatus.SetGroupID(combined, becomes);
            m_MenuStatus.SetEnabled(combined, true);
            AnnounceUpdatedEntry(combined);
        }
    }
    // The role held inside the roster keeps its holder's name in the title.
    const std::uint32_t holder = presenterOutside ? m_dwHostID : m_dwPresenterID;
    const int index = GetIndexOfMenuByGroup(presenterOutside ? GROUP_HOST : GROUP_PRESENTER);
    const UserItem* user = m_UserList.GetUserItemFromNodeId(holder);
    if (index != -1 && user && user->strName.GetData())
        RetitleRoleEntry(index, user->strName.GetData(), holder,
                         presenterOutside ? "Host" : "Presenter");
    MacInfoTrace2(kChatTag, "CChatClient::CheckMenuStateForTPSupport nIndex:%d, userItem:%d, ",
                  index, user ? 1 : 0);
}

std::uint32_t CChatClient::RosterRoles(std::uint32_t nodeId) const {
    const UserItem* user = m_UserList.GetUserItemFromNodeId(nodeId);
    return user ? user->dwRoles & (ROLE_HOST | ROLE_PRESENTER | ROLE_PANELIST) : 0;
}

void CChatClient::ClearRosterRole(std::uint32_t nodeId, std::uint32_t role) {
    const UserItem* user = nodeId != 0 ? m_UserList.GetUserItemFromNodeId(nodeId) : nullptr;
    if (user && (user->dwRoles & role)) m_UserList.SetRosters(nodeId, user->dwRoles & ~role);
}
