// Privilege and role policy: the host's privilege word and the flags split from it, which
// decide the audiences an attendee may choose. Hosts and presenters are never restricted.
// The QM rules live in privilege_qm.cpp; the attendee menu of the panel meeting here.
#include <cstdint>

#include "engine/chat_client.h"
#include "engine/menu_entries.h"
#include "engine/privilege_bits.h"
#include "platform/func_trace.h"
#include "platform/string_table.h"

namespace {

// The bits whose change makes the normal rules rebuild the attendee menu.
constexpr std::uint32_t kNormalRuleBits = 0x47;

}  // namespace

void CChatClient::OnPrivilegeChanged(std::uint32_t privilege, int bForce) {
    if (m_bQMMode) {
        OnPrivilegeChangedInQM(privilege, bForce);
        return;
    }
    CFuncTrace trace("CChatClient::OnPrivilegeChanged , in_dwPrivilege = %d", privilege);
    const std::optional<MenuStatus> selected = SelectedMenuEntry();
    const std::uint32_t old = m_dwPrivilege;
    StorePrivilege(privilege, false);
    const bool hostOrPresenter = IsHostOrPresenter();
    if (m_dwMeetingType == 3 && (((old ^ privilege) & kNormalRuleBits) != 0 || bForce) &&
        !hostOrPresenter)
        OnAttendeePrivilegeChange();

    const bool beforeHost = ApplyBeforeHost(hostOrPresenter);
    EnableGroupEntries(beforeHost);
    ReapplyParticipantEntries();

    const int everyone = GetIndexOfMenuByGroup(GROUP_EVERYONE);
    if (everyone != -1 && m_MenuStatus[everyone].bEnabled) {
        SelectMenuItemByIndex(everyone);
    } else {
        SelectMenuItemByIndex(FirstSelectableIndex(m_MenuStatus));
    }
    ApplyInputRules();

    const bool startupWindow = m_nStartupTicks >= 1 && m_nStartupTicks <= 19;
    const bool countdown = m_nPrivilegeCountdown != 0 && m_bPrivilegePending;
    const int everyoneNow = GetIndexOfMenuByGroup(GROUP_EVERYONE);
    // The start-up leans towards everyone only until the user has chosen an audience: a
    // private question asked in the first seconds must not go to all participants.
    if (((bForce && startupWindow) || countdown) && !m_bAudienceChosen && everyoneNow != -1 &&
        m_MenuStatus[everyoneNow].bEnabled) {
        SelectMenuItemByIndex(everyoneNow);
        if (bForce && startupWindow) m_nStartupTicks = 0;
    } else if (selected && !selected->bSeparator) {
        const int again = IndexOfEqualEntry(m_MenuStatus, *selected);
        if (again != -1) {
            SelectMenuItemByIndex(again);
        } else {
            NotifyUI(msg_ClearInput);
        }
    }
    if (GetIndexOfMenuByGroup(GROUP_SELECT_ATTENDEE) == -1) CloseSeltAttDlg();
}

bool CChatClient::ApplyBeforeHost(bool hostOrPresenter) {
    const bool beforeHost = IsBeforeHost();
    if (beforeHost) {
        m_bChatAttendees = 1;
        // With the picker in use a plain attendee waits for the host before reaching others.
        if (m_bUseAttendeeSelector && !hostOrPresenter && !(m_dwMyRosters & ROLE_PANELIST))
            m_bChatAttendees = 0;
    }
    return beforeHost;
}

void CChatClient::OnBeforeHostChange(int) {
    OnPrivilegeChanged(m_dwPrivilege, 0);
}

void CChatClient::StorePrivilege(std::uint32_t privilege, bool bWithEveryone) {
    m_dwPrivilege = privilege;
    m_bChatAttendees = (privilege & kPrivilegeAttendees) != 0;
    m_bChatHost = (privilege & kPrivilegeHost) != 0;
    m_bChatPresenter = (privilege & kPrivilegePresenter) != 0;
    m_bChatPrivately = (privilege & kPrivilegePrivately) != 0;
    m_bChatPanelists = (privilege & kPrivilegePanelists) != 0;
    if (bWithEveryone) m_bChatEveryone = (privilege & kPrivilegeEveryone) != 0;
}

void CChatClient::EnableGroupEntries(bool beforeHost) {
    if (IsHostOrPresenter()) {
        if (!beforeHost) {
            for (std::uint32_t id : {GROUP_HOST, GROUP_PRESENTER, GROUP_HOST_PRESENTER_PANELISTS,
                                     GROUP_HOST_PRESENTER, GROUP_EVERYONE, GROUP_ATTENDEES})
                SetGroupMenuEnable(id, true);
            return;
        }
        for (std::uint32_t id :
             {GROUP_HOST, GROUP_PRESENTER, GROUP_HOST_PRESENTER, GROUP_HOST_PRESENTER_PANELISTS})
            SetGroupMenuEnable(id, false);
        SetGroupMenuEnable(GROUP_PANELISTS, m_bChatPanelists != 0);
        if (m_bChatAttendees) SetGroupMenuEnable(GROUP_ATTENDEES, true);
        return;
    }
    const bool host = m_bChatHost && !beforeHost;
    const bool presenter = m_bChatPresenter && !beforeHost;
    // Under QM rules one node holding both roles is reached through the combined entry by
    // either privilege.
    const bool combinedHolder = m_bQMMode && m_dwHostID != 0 && m_dwHostID == m_dwPresenterID &&
                                (m_bChatHost || m_bChatPresenter);
    SetGroupMenuEnable(GROUP_HOST, host);
    SetGroupMenuEnable(GROUP_PRESENTER, presenter);
    SetGroupMenuEnable(GROUP_HOST_PRESENTER, (host && presenter) || combinedHolder);
    SetGroupMenuEnable(GROUP_HOST_PRESENTER_PANELISTS, m_bChatPanelists && host && presenter);
    SetGroupMenuEnable(GROUP_PANELISTS, m_bChatPanelists && PanelistsPresent());
    SetGroupMenuEnable(GROUP_ATTENDEES, m_bChatAttendees != 0);
    SetGroupMenuEnable(GROUP_SELECT_ATTENDEE, m_bChatAttendees != 0);
    const bool everyone = m_bChatAttendees && host && presenter &&
                          (m_bChatPanelists || GetIndexOfMenuByGroup(GROUP_PANELISTS) == -1);
    SetGroupMenuEnable(GROUP_EVERYONE, (m_bQMMode && m_bChatEveryone) || everyone);
}

void CChatClient::ApplyInputRules() {
    const bool panelistBit = (m_dwMyRosters & ROLE_PANELIST) != 0;
    const bool anyGroup = m_bChatAttendees || m_bChatHost || m_bChatPresenter || m_bChatPanelists;
    bool openToGroups;
    if (IsHostOrPresenter()) {
        openToGroups = true;
    } else if (m_dwMeetingType == 3) {
        openToGroups = (anyGroup || panelistBit) && m_bChatPrivately;
    } else if (m_dwMeetingType == 2) {
        openToGroups = anyGroup || panelistBit;
    } else {
        openToGroups = anyGroup;
    }
    if (openToGroups) {
        NotifyUI(msg_EnableUserList);
        AllowUserInput(true);
    } else {
        AllowUserInput(m_bChatPrivately && HasParticipantEntry());
        if (m_bChatPrivately) {
            NotifyUI(msg_EnableUserList);
        } else {
            NotifyUI(msg_DisableUserList);
            NotifyUI(msg_ClearInput);
        }
    }
    if (m_bPractice && !IsHostOrPresenter() && !panelistBit && !m_bChatAttendees) {
        NotifyUI(msg_DisableUserList);
        AllowUserInput(false);
    }
}

void CChatClient::ReapplyParticipantEntries() {
    const bool plainAttendee = !IsHostOrPresenter() && !(m_dwMyRosters & ROLE_PANELIST);
    if (plainAttendee && !m_bChatPrivately) {
        EraseParticipantEntries(false);
        if (m_bChatPanelists) ReinsertPanelists();
        return;
    }
    if (m_bQMMode || m_dwMeetingType != 3) {
        ReinsertRosterMembers();
        EraseParticipantEntries(true);
    }
    // Hosts and presenters keep the panelists' entries whatever the word says.
    if (m_bChatPanelists || IsHostOrPresenter()) ReinsertPanelists();
    // A separator pair right above the picker entry closes up.
    const int picker = GetIndexOfMenuByGroup(GROUP_SELECT_ATTENDEE);
    if (picker >= 3 && m_MenuStatus[picker - 1].bSeparator && m_MenuStatus[picker - 2].bSeparator)
        EraseMenuEntry(picker - 1);
}

void CChatClient::ReinsertRosterMembers() {
    for (std::uint32_t i = 0; i < m_UserList.GetCount(); ++i) {
        const UserItem* user = m_UserList.GetUserItemByIndex(i);
        const std::uint32_t node = user->dwNodeID;
        const std::uint32_t roles = user->dwRoles;
        if (node == m_dwMyNodeID || (roles & (ROLE_HOST | ROLE_PRESENTER))) continue;
        const std::string name = user->strName.GetData() ? user->strName.GetData() : "";
        const bool privileged = (roles & ROLE_PANELIST) != 0;
        // With the picker in use attendees come back only as picked (QM rules) or not at all.
        const bool reinsert =
            !m_bUseAttendeeSelector || privileged || (m_bQMMode && IsUserSelectedUser(node));
        RemoveChatUserName(name.c_str(), node, 0);
        if (!reinsert) continue;
        if (m_bUseAttendeeSelector) {
            InsertChatUserName(name.c_str(), node, 0);
        } else {
            InsertExternalInternalChatUserName(name.c_str(), node,
                                               GetUserExternalInternalTag(node));
        }
    }
}

void CChatClient::ReinsertPanelists() {
    for (std::uint32_t i = 0; i < m_UserList.GetCount(); ++i) {
        const UserItem* user = m_UserList.GetUserItemByIndex(i);
        const std::uint32_t node = user->dwNodeID;
        if (node == m_dwMyNodeID) continue;
        const std::string name = user->strName.GetData() ? user->strName.GetData() : "";
        const int index = IndexOfParticipantEntry(node, false);
        if (user->dwRoles & (ROLE_HOST | ROLE_PRESENTER | ROLE_PANELIST)) {
            if (index != -1) RemoveChatUserName(name.c_str(), node, 1);
            InsertChatUserName(name.c_str(), node, 0);
        } else if (index != -1 && m_MenuStatus[index].bPanelist) {
            RemoveChatUserName(name.c_str(), node, 1);
        }
    }
}

void CChatClient::EraseParticipantEntries(bool bPrivilegedOnly) {
    for (int i = 0; i < static_cast<int>(m_MenuStatus.size());) {
        const MenuStatus& entry = m_MenuStatus[i];
        const bool erase =
            entry.IsParticipantEntry() &&
            (!bPrivilegedOnly || (!entry.bRecent && IsRosterPrivileged(entry.dwNodeID)));
        if (erase) {
            EraseMenuEntry(i);
        } else {
            ++i;
        }
    }
}

void CChatClient::OnAttendeePrivilegeChange() {
    CFuncTrace trace("CChatClient::OnAttendeePrivilegeChange( )");
    const std::optional<MenuStatus> selected = SelectedMenuEntry();
    MenuStatusList recents;
    for (std::size_t i = 0; i < m_MenuStatus.size(); ++i) {
        if (m_MenuStatus[i].bRecent) recents.push_back(m_MenuStatus[i]);
    }
    m_MenuStatus.Clear();
    if (m_bPractice) {
        if (m_dwMyRosters & ROLE_PANELIST) {
            RebuildPanelistMenuInPractice();
        } else {
            RebuildAttendeeMenuInPractice(0);
        }
        return;
    }
    AppendAttendeeAudiences(false);
    if (m_bChatAttendees && (m_dwMyRosters & ROLE_PANELIST)) {
        m_MenuStatus.PushBack(SeparatorEntry());
        m_MenuStatus.PushBack(
            GroupEntry(GetLocalizedString("Select an Attendee..."), GROUP_SELECT_ATTENDEE));
    }
    AnnounceRebuiltMenu();

    if ((m_dwMyRosters & ROLE_PANELIST) && m_bChatAttendees) {
        // Each recent entry goes to the top of its section, so the oldest goes in first and
        // the section keeps its newest-first order.
        for (auto it = recents.rbegin(); it != recents.rend(); ++it) {
            const UserItem* user = m_UserList.GetUserItemFromNodeId(it->dwNodeID);
            if (!user) continue;
            if (IsRosterPrivileged(it->dwNodeID) && !m_bChatPanelists) continue;
            InsertRecentUserName(user->strName.GetData(), it->dwNodeID);
        }
    }
    if (selected) {
        const int again = IndexOfEqualEntry(m_MenuStatus, *selected);
        if (again != -1) SelectMenuItemByIndex(again);
    }
}

void CChatClient::AppendAttendeeAudiences(bool bInPractice) {
    const bool beforeHost = IsBeforeHost();
    const bool host = m_bChatHost && !beforeHost;
    const bool presenter = m_bChatPresenter && !beforeHost;
    const bool panelists = m_bChatPanelists && PanelistsPresent();
    if (host) m_MenuStatus.PushBack(GroupEntry(GetLocalizedString("Host"), GROUP_HOST));
    if (presenter)
        m_MenuStatus.PushBack(GroupEntry(GetLocalizedString("Presenter"), GROUP_PRESENTER));
    if (host && presenter)
        m_MenuStatus.PushBack(
            GroupEntry(GetLocalizedString("Host & Presenter"), GROUP_HOST_PRESENTER));
    if ((host || presenter) && (m_bChatAttendees || panelists))
        m_MenuStatus.PushBack(SeparatorEntry());
    if (m_bChatAttendees)
        m_MenuStatus.PushBack(GroupEntry(GetLocalizedString("All Attendees"), GROUP_ATTENDEES));
    if (panelists)
        m_MenuStatus.PushBack(GroupEntry(GetLocalizedString("All Panelists"), GROUP_PANELISTS));
    // In practice everyone is reachable without the panelists' privilege when no panelist
    // entry stands in the menu.
    const bool panelistsForEveryone =
        m_bChatPanelists || (bInPractice && GetIndexOfMenuByGroup(GROUP_PANELISTS) == -1);
    if (m_bChatAttendees && host && presenter && panelistsForEveryone) {
        m_MenuStatus.PushBack(SeparatorEntry());
        m_MenuStatus.PushBack(GroupEntry(GetLocalizedString("All Participants"), GROUP_EVERYONE));
    }
}

std::optional<MenuStatus> CChatClient::SelectedMenuEntry() const {
    for (std::size_t i = 0; i < m_MenuStatus.size(); ++i) {
        if (m_MenuStatus[i].bSelected) return m_MenuStatus[i];
    }
    return std::nullopt;
}

bool CChatClient::PanelistsPresent() const {
    return GetPanelistCount() >= 1 || (m_dwMyRosters & ROLE_PANELIST) || IsHostOrPresenter();
}

void CChatClient::AllowUserInput(bool bAllow) {
    std::int32_t allow = bAllow ? 1 : 0;
    NotifyUI(msg_AllowUserInput, &allow);
}
