// The send-to menu model: lookups, selection, enabling group entries, and where participant
// and recent entries go in and come out. Every change is made in m_MenuStatus first and then
// announced to the window with the entry and its index.
#include <strings.h>

#include <algorithm>
#include <cstdint>
#include <string>

#include "engine/chat_client.h"
#include "engine/menu_entries.h"
#include "platform/func_trace.h"
#include "platform/trace.h"

namespace {

// The attendee picker keeps at most this many recent entries.
constexpr std::size_t kMaxRecentUsers = 20;

// Where an entry is appended rather than inserted.
constexpr int kAppend = -1;

const char* TextOrEmpty(const char* text) {
    return text ? text : "";
}

}  // namespace

int CChatClient::GetIndexOfMenuByGroup(std::int32_t groupId) const {
    return m_MenuStatus.IndexOfGroup(groupId);
}

const MenuStatus* CChatClient::GetMenuByGroupID(std::int32_t groupId) const {
    const int index = GetIndexOfMenuByGroup(groupId);
    return index == -1 ? nullptr : &m_MenuStatus[index];
}

int CChatClient::GetIndexOfMenuByNodeID(std::uint32_t nodeId) const {
    return m_MenuStatus.IndexOfNode(nodeId);
}

void CChatClient::SelectMenuItemByIndex(int index) {
    if (!MarkMenuItemSelected(index)) return;
    std::int32_t payload = index;
    NotifyUI(msg_SelectMenuItem, &payload);
}

void CChatClient::SelectMenuItemByIndexInQM(int index) {
    if (!MarkMenuItemSelected(index)) return;
    std::int32_t payload = index;
    NotifyUI(msg_SelectMenuItemAndAllowInput, &payload);
}

bool CChatClient::MarkMenuItemSelected(int& index) {
    if (m_bEveryoneOnly) index = GetIndexOfMenuByGroup(GROUP_EVERYONE);
    if (index < 0 || index >= static_cast<int>(m_MenuStatus.size())) return false;
    for (std::size_t i = 0; i < m_MenuStatus.size(); ++i)
        m_MenuStatus.SetSelected(i, static_cast<int>(i) == index);
    return true;
}

void CChatClient::SetGroupMenuEnable(std::int32_t groupId, bool bEnable) {
    const int index = GetIndexOfMenuByGroup(groupId);
    if (index == -1 || m_MenuStatus[index].bEnabled == bEnable) return;
    m_MenuStatus.SetEnabled(index, bEnable);
    MacInfoTrace2(kChatTag, "SetGroupMenuEnable inGroupID:%d, bEnable:%d.", groupId, bEnable);
    AnnounceUpdatedEntry(index);
}

void CChatClient::InsertExternalInternalChatUserName(const char* name, std::uint32_t nodeId,
                                                     std::uint32_t tag) {
    std::string title = TextOrEmpty(name);
    if (m_lExternalTagMode != 0 && !IsNodePresenter(nodeId) && !IsNodeHost(nodeId))
        title += GetUserExternalInternalString(tag, 2);
    InsertChatUserName(title.c_str(), nodeId, 0);
}

void CChatClient::InsertChatUserName(const char* name, std::uint32_t nodeId, int bSelect) {
    // A copy: the name may live in an entry that the insertion moves.
    const std::string title = TextOrEmpty(name);
    const char* text = title.c_str();
    CFuncTrace trace("CChatClient::InsertChatUserName : %s", text);
    const bool privileged = IsPrivileged();
    if (nodeId == m_dwMyNodeID) {
        if (privileged) OnPrivilegeChanged(m_dwPrivilege, 0);
        return;
    }
    // Node 0 is no participant: no lookup would find its entry again to take it out.
    if (nodeId == 0) return;
    if (!privileged && m_bPractice) return;

    const int existing = GetIndexOfMenuByNodeID(nodeId);
    if (existing != -1 && !m_MenuStatus[existing].bRecent) {
        if (m_dwMeetingType == 3 && bSelect) SelectMenuItemByIndex(existing);
        MacInfoTrace2(kChatTag, "CChatClient::InsertChatUserName : %s all ready in list", text);
        return;
    }
    const bool selectedWasDisabled = m_MenuStatus.HasSelectedDisabledEntry();

    MenuStatus entry;
    entry.strTitle = title;
    entry.dwNodeID = nodeId;
    entry.dwExternalTag = GetUserExternalInternalTag(nodeId);

    if (!IsRosterPrivileged(nodeId)) {
        MacInfoTrace2(kChatTag, "CChatClient::InsertChatUserName : !bPanelist");
        const int position =
            m_dwMeetingType == 3 ? PanelAttendeeInsertPosition(text) : AttendeeInsertPosition(text);
        AnnounceInsertedUser(entry, position, bSelect, selectedWasDisabled);
    } else if (!m_bQMMode && (privileged || m_bChatPanelists)) {
        // An attendee reaches panelists, presenters and hosts by name only with the panelist
        // privilege: the privilege re-application erases such entries without it, so one must
        // not appear just because its holder joined later.
        MacInfoTrace2(kChatTag, "CChatClient::InsertChatUserName : bPanelist");
        entry.bPanelist = true;
        const int panelists = GetIndexOfMenuByGroup(GROUP_PANELISTS);
        const int position =
            panelists == -1
                ? kAppend
                : m_MenuStatus.EndOfSortedRun(panelists + 1, text, MenuModel::Section::kPanelist);
        AnnounceInsertedUser(entry, position, bSelect, selectedWasDisabled);
    }

    if (OnlyChatPrivately() && !privileged) {
        std::int32_t allow = HasParticipantEntry() ? 1 : 0;
        NotifyUI(msg_AllowUserInput, &allow);
    }
}

void CChatClient::AnnounceInsertedUser(const MenuStatus& entry, int position, int bSelect,
                                       bool selectedWasDisabled) {
    const int index = InsertMenuEntry(entry, position);
    if (m_dwMeetingType == 3 && bSelect) {
        SelectMenuItemByIndex(index);
    } else if (selectedWasDisabled && entry.bEnabled) {
        SelectMenuItemByIndex(FirstSelectableIndex(m_MenuStatus));
    }
}

int CChatClient::AttendeeInsertPosition(const char* name) {
    // Outside QM rules attendees follow "All Attendees" up to the next non-attendee entry;
    // under them they join the participant entries wherever those stand.
    if (!m_bQMMode) {
        const int start = GetIndexOfMenuByGroup(GROUP_ATTENDEES);
        if (start == -1) return kAppend;
        const int end = m_MenuStatus.EndOfSortedRun(start + 1, name, MenuModel::Section::kPlain);
        return end == static_cast<int>(m_MenuStatus.size()) ? kAppend : end;
    }
    bool passedParticipant = false;
    for (int i = 0; i < static_cast<int>(m_MenuStatus.size()); ++i) {
        const MenuStatus& entry = m_MenuStatus[i];
        if (entry.IsPlainParticipantEntry()) {
            if (!MenuModel::TitleBelow(entry, name)) return i;
            passedParticipant = true;
        }
    }
    if (!passedParticipant && !m_MenuStatus.empty() && !m_MenuStatus.back().bSeparator)
        InsertMenuEntry(SeparatorEntry(), kAppend);
    return kAppend;
}

int CChatClient::PanelAttendeeInsertPosition(const char* name) {
    // In the panel meeting attendees sit between the everyone (or "All Attendees") entry and
    // the last two entries, fenced off by a separator.
    int group = GetIndexOfMenuByGroup(GROUP_EVERYONE);
    if (group == -1) group = GetIndexOfMenuByGroup(GROUP_ATTENDEES);
    if (group == -1) return kAppend;
    const int lastTwo = static_cast<int>(m_MenuStatus.size()) - 2;
    if (group < lastTwo &&
        (group + 1 >= lastTwo || !m_MenuStatus[group + 2].IsPlainParticipantEntry())) {
        InsertMenuEntry(SeparatorEntry(), lastTwo);
        MacInfoTrace2(kChatTag, "CChatClient::InsertChatUserName : add sep");
    }
    const int position = m_MenuStatus.EndOfSortedRun(group + 2, name, MenuModel::Section::kPlain);
    MacInfoTrace2(kChatTag, "CChatClient::InsertChatUserName at i=%d, index=%d", position, group);
    return position;
}

void CChatClient::InsertRecentUserName(const char* name, std::uint32_t nodeId) {
    const std::string title = TextOrEmpty(name);
    const char* text = title.c_str();
    CFuncTrace trace("CChatClient::InsertRecentUserName : %s", text);
    if (nodeId == m_dwMyNodeID) {
        if (IsPrivileged()) OnPrivilegeChanged(m_dwPrivilege, 0);
        return;
    }
    if (nodeId == 0 || m_bPractice) return;
    const std::uint32_t roles = RosterRoles(nodeId);
    const bool host = (roles & ROLE_HOST) != 0;
    const bool presenter = (roles & ROLE_PRESENTER) != 0;
    if (m_dwMeetingType == 3 &&
        ((presenter && !m_bChatPresenter) || (host && !m_bChatHost) ||
         ((roles & ROLE_PANELIST) && !host && !presenter && !m_bChatPanelists)))
        return;

    MenuStatus entry;
    entry.strTitle = title;
    entry.dwNodeID = nodeId;
    entry.bRecent = true;

    int position = kAppend;
    if (m_dwMeetingType == 3) {
        position = PanelRecentInsertPosition();
        if (position == -1) return;
    } else {
        const int attendees = GetIndexOfMenuByGroup(GROUP_ATTENDEES);
        if (attendees != -1) {
            position = attendees + 1;
            while (position < static_cast<int>(m_MenuStatus.size()) &&
                   m_MenuStatus[position].bSeparator)
                ++position;
        }
    }
    InsertMenuEntry(entry, position);
}

int CChatClient::PanelRecentInsertPosition() {
    int start = GetIndexOfMenuByGroup(GROUP_EVERYONE);
    if (start == -1) {
        start = GetIndexOfMenuByGroup(GROUP_ATTENDEES);
        while (start != -1 && start + 1 < static_cast<int>(m_MenuStatus.size()) &&
               !m_MenuStatus[start + 1].bSeparator) {
            ++start;
            const std::string& title = m_MenuStatus[start].strTitle;
            if (title.empty()) {
                MacInfoTrace2(kChatTag,
                              "CChatClient::InsertRecentUserName item below'all attendee' ");
            } else {
                MacInfoTrace2(kChatTag,
                              "CChatClient::InsertRecentUserName item below'all attendee', %s",
                              title.c_str());
            }
        }
    }
    if (start == -1) {
        MacInfoTrace2(kChatTag, "CChatClient::InsertRecentUserName indexStart== -1");
        return -1;
    }
    const int lastTwo = static_cast<int>(m_MenuStatus.size()) - 2;
    if (start < lastTwo && !m_MenuStatus[start + 2].IsPlainParticipantEntry()) {
        InsertMenuEntry(SeparatorEntry(), lastTwo);
        MacInfoTrace2(kChatTag, "CChatClient::InsertRecentUserName : add sep");
        // The new separator should sit right between the section's start and the picker.
        if (start + 2 != GetIndexOfMenuByGroup(GROUP_SELECT_ATTENDEE))
            MacWarnTrace2(kChatTag,
                          "CChatClient::InsertRecentUserName : add sep indexStart+2 != indexEnd");
    }
    const bool separatorBelow =
        start + 1 < static_cast<int>(m_MenuStatus.size()) && m_MenuStatus[start + 1].bSeparator;
    return separatorBelow ? start + 2 : start;
}

void CChatClient::RemoveChatUserName(const char* name, std::uint32_t nodeId, int bNotify) {
    MacInfoTrace2(kChatTag, "CChatClient::RemoveChatUserName, userName = %s, node_id = %d",
                  TextOrEmpty(name), nodeId);
    const int index = IndexOfParticipantEntry(nodeId, false);
    if (index != -1) EraseParticipantEntry(index, !m_bUseAttendeeSelector);

    if (OnlyChatPrivately() && !IsPrivileged() && !HasParticipantEntry()) {
        std::int32_t allow = 0;
        NotifyUI(msg_AllowUserInput, &allow);
        if (bNotify) NotifyUI(msg_ClearInput);
    }
}

void CChatClient::RemoveRecentUserName(const char* name, std::uint32_t nodeId) {
    MacInfoTrace2(kChatTag, "CChatClient::RemoveRecentUserName, userName = %s, node_id = %d",
                  TextOrEmpty(name), nodeId);
    const int index = IndexOfParticipantEntry(nodeId, true);
    if (index != -1) EraseParticipantEntry(index, true);
    if (m_bUseAttendeeSelector || m_dwMeetingType == 3) RemoveUserByUserID(nodeId);
}

void CChatClient::RemoveChatUserNameInQM(const char* name, std::uint32_t nodeId) {
    MacInfoTrace2(kChatTag, "CChatClient::RemoveChatUserNameInQM, userName = %s, node_id = %d",
                  TextOrEmpty(name), nodeId);
    const bool host = IsNodeHost(nodeId);
    const bool presenter = IsNodePresenter(nodeId);
    if (!host && !presenter) {
        const int index = GetIndexOfMenuByNodeID(nodeId);
        if (index != -1) {
            EraseSelectedAware(index);
            if (!m_MenuStatus.empty() && m_MenuStatus.back().bSeparator)
                EraseMenuEntry(static_cast<int>(m_MenuStatus.size()) - 1);
        }
    } else {
        const std::int32_t group = host && presenter ? GROUP_HOST_PRESENTER
                                   : presenter       ? GROUP_PRESENTER
                                                     : GROUP_HOST;
        const int index = GetIndexOfMenuByGroup(group);
        if (index != -1) {
            const bool selected = m_MenuStatus[index].bSelected;
            MacInfoTrace2(kChatTag,
                          "CChatClient::RemoveChatUserNameInQM,user[node is %d] selected status "
                          "%d,its index is %d",
                          nodeId, selected, index);
            if (selected) {
                EraseSelectedAware(index);
                // The role entry's separator goes with it when no other role entry is left.
                const bool iHoldOtherRole =
                    host ? m_dwMyNodeID == m_dwPresenterID : m_dwMyNodeID == m_dwHostID;
                if (m_dwHostID == m_dwPresenterID || iHoldOtherRole ||
                    (m_dwHostID == 0 && presenter)) {
                    const int separator = index == 0 ? 0 : 1;
                    if (separator < static_cast<int>(m_MenuStatus.size()) &&
                        m_MenuStatus[separator].bSeparator) {
                        MacInfoTrace2(kChatTag,
                                      "CChatClient::RemoveChatUserNameInQM,remove spe line,its "
                                      "index is %d",
                                      separator);
                        EraseMenuEntry(separator);
                    }
                }
            }
        }
    }
    if (presenter) m_dwLastPresenterID = nodeId;
    if (host) m_dwLastHostID = nodeId;
}

void CChatClient::ModifyChatUserName(const char*, std::uint32_t) {
    // A renamed participant keeps the title the menu gave them on arrival.
}

bool CChatClient::SelectUserByNodeID(std::uint32_t nodeId, bool bTestOnly, bool bSelect) {
    const UserItem* user = m_UserList.GetUserItemFromNodeId(nodeId);
    if (!user) return false;
    const bool privileged = IsPrivileged();
    const bool participantPrivileged = IsNodePrivileged(nodeId);
    if (m_dwMeetingType == 3 && m_bPractice && !(participantPrivileged && privileged)) return false;

    const bool pickerInUse = m_bUseAttendeeSelector || m_dwMeetingType == 3;
    if ((m_dwMyRosters & (ROLE_HOST | ROLE_PRESENTER | ROLE_PANELIST)) != 0 && !bTestOnly &&
        !m_bPractice && pickerInUse)
        RememberRecentUser(nodeId, TextOrEmpty(user->strName.GetData()));

    if (!bSelect) return false;

    int index;
    if (IsNodeHost(nodeId)) {
        index = GetIndexOfMenuByGroup(IsNodePresenter(nodeId) && m_bQMMode ? GROUP_HOST_PRESENTER
                                                                           : GROUP_HOST);
    } else if (IsNodePresenter(nodeId)) {
        index = GetIndexOfMenuByGroup(GROUP_PRESENTER);
    } else {
        index = GetIndexOfMenuByNodeID(nodeId);
    }
    if (index != -1 && m_MenuStatus[index].bEnabled) {
        if (!bTestOnly && !m_MenuStatus[index].bSelected) {
            if (m_bQMMode) {
                SelectMenuItemByIndexInQM(index);
            } else {
                SelectMenuItemByIndex(index);
            }
        }
        return true;
    }
    if (index == -1 && bTestOnly && !participantPrivileged && privileged && !m_bPractice &&
        pickerInUse) {
        MacInfoTrace2(kChatTag, "CChatClient::SelectUserByNodeID, Only Test attendee");
        return m_bChatAttendees != 0;
    }
    MacInfoTrace2(kChatTag, "SelectUserByNodeID:");
    return false;
}

void CChatClient::RememberRecentUser(std::uint32_t nodeId, const char* name) {
    if (IsUserSelectedUser(nodeId)) {
        RemoveRecentUserName(name, nodeId);
    } else if (m_SelectedUsers.size() >= kMaxRecentUsers) {
        const std::uint32_t oldest = m_SelectedUsers.front();
        const UserItem* oldestUser = m_UserList.GetUserItemFromNodeId(oldest);
        RemoveRecentUserName(oldestUser ? oldestUser->strName.GetData() : "", oldest);
        // Keep the cap even when the oldest pick had no entry left to take it along.
        if (!m_SelectedUsers.empty() && m_SelectedUsers.front() == oldest)
            m_SelectedUsers.erase(m_SelectedUsers.begin());
    }
    AddUserByUserSelected(nodeId);
    InsertRecentUserName(name, nodeId);
}

bool CChatClient::CanChatWith(std::uint32_t nodeId, bool bMenuOnly) {
    if (m_bEveryoneOnly) return false;
    if (m_dwMeetingType == 3 && bMenuOnly) {
        if (GetIndexOfMenuByNodeID(nodeId) != -1) return true;
        if (IsNodeHost(nodeId) && GetIndexOfMenuByGroup(GROUP_HOST) != -1) return true;
        return IsNodePresenter(nodeId) && GetIndexOfMenuByGroup(GROUP_PRESENTER) != -1;
    }
    return SelectUserByNodeID(nodeId, true, true);
}

std::uint32_t CChatClient::GetUserExternalInternalTag(std::uint32_t nodeId) {
    const UserItem* user = m_UserList.GetUserItemFromNodeId(nodeId);
    if (!user) return 0;
    if (m_lExternalTagMode == 2) return user->dwExternalTag == 2 ? 2 : 0;
    if (m_lExternalTagMode == 1) return user->dwExternalTag == 1 ? 1 : 0;
    return 0;
}

std::string CChatClient::GetUserExternalInternalString(std::uint32_t tag, int form) const {
    std::string word;
    if (m_lExternalTagMode == 1 && tag == 1) word = "internal";
    if (m_lExternalTagMode == 2 && tag == 2) word = "external";
    if (word.empty()) return word;
    if (form == 2) return " (" + word + ")";
    if (form == 1) return ", " + word;
    return word;
}

int CChatClient::InsertMenuEntry(const MenuStatus& entry, int position) {
    const int count = static_cast<int>(m_MenuStatus.size());
    if (position > count) position = kAppend;
    const int index = position < 0 ? count : position;
    m_MenuStatus.Insert(index, entry);
    // The window gets its own copy: the model's entries are not the window's to touch.
    MenuStatus copy = entry;
    std::int32_t payload = position < 0 ? kAppend : index;
    NotifyUI(msg_InsertMenuItem, &copy, &payload);
    return index;
}

void CChatClient::EraseMenuEntry(int index) {
    if (index < 0 || index >= static_cast<int>(m_MenuStatus.size())) return;
    m_MenuStatus.Erase(index);
    std::int32_t payload = index;
    NotifyUI(msg_RemoveMenuItem, &payload);
}

void CChatClient::EraseSelectedAware(int index) {
    if (index < 0 || index >= static_cast<int>(m_MenuStatus.size())) return;
    if (!m_MenuStatus[index].bSelected) {
        EraseMenuEntry(index);
        return;
    }
    m_MenuStatus.Erase(index);
    std::int32_t payload = index;
    NotifyUI(msg_SelectedUserLeft, &payload);
    std::int32_t allow = 0;
    NotifyUI(msg_AllowUserInput, &allow);
}

void CChatClient::EraseParticipantEntry(int index, bool bTrailingSeparator) {
    const bool wasSelected = m_MenuStatus[index].bSelected;
    EraseMenuEntry(index);
    if (index > 0 && index < static_cast<int>(m_MenuStatus.size()) &&
        m_MenuStatus[index].bSeparator && m_MenuStatus[index - 1].bSeparator)
        EraseMenuEntry(index);
    if (bTrailingSeparator && !m_MenuStatus.empty() && m_MenuStatus.back().bSeparator)
        EraseMenuEntry(static_cast<int>(m_MenuStatus.size()) - 1);
    if (wasSelected) SelectFallbackMenuItem();
}

void CChatClient::SelectFallbackMenuItem() {
    int index = GetIndexOfMenuByGroup(GROUP_EVERYONE);
    if (index == -1 || !m_MenuStatus[index].bEnabled) index = FirstSelectableIndex(m_MenuStatus);
    SelectMenuItemByIndex(index);
}

int CChatClient::IndexOfParticipantEntry(std::uint32_t nodeId, bool bRecent) const {
    return m_MenuStatus.IndexOfParticipant(nodeId, bRecent);
}

bool CChatClient::HasParticipantEntry() const {
    return m_MenuStatus.HasParticipantEntry();
}

void CChatClient::AnnounceUpdatedEntry(int index) {
    MenuStatus copy = m_MenuStatus[index];
    NotifyUI(msg_UpdateMenuItem, &copy, reinterpret_cast<void*>(static_cast<std::intptr_t>(index)));
}

void CChatClient::AnnounceRebuiltMenu() {
    MenuStatusList entries = m_MenuStatus.ToList();
    NotifyUI(msg_RebuildMenu, &entries);
}

bool CChatClient::OnlyChatPrivately() const {
    const bool everyone = m_bQMMode && m_bChatEveryone;
    return m_bChatPrivately && !m_bChatAttendees && !m_bChatHost && !m_bChatPresenter &&
           !m_bChatPanelists && !everyone;
}

bool CChatClient::IsNodeHost(std::uint32_t nodeId) const {
    return nodeId != 0 && nodeId == m_dwHostID;
}

bool CChatClient::IsNodePresenter(std::uint32_t nodeId) const {
    return nodeId != 0 && nodeId == m_dwPresenterID;
}

bool CChatClient::IsNodePanelist(std::uint32_t nodeId) const {
    const UserItem* user = m_UserList.GetUserItemFromNodeId(nodeId);
    return user && (user->dwRoles & ROLE_PANELIST) != 0;
}

bool CChatClient::IsNodePrivileged(std::uint32_t nodeId) const {
    return IsNodePanelist(nodeId) || IsNodePresenter(nodeId) || IsNodeHost(nodeId);
}
