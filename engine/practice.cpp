// Practice session and panelists: while the host rehearses with panelists, presenter and host,
// attendees may at most chat with all attendees and panelists see only the audiences among
// themselves. Also the panel status the host reports.
#include <cstdint>

#include "engine/chat_client.h"
#include "engine/menu_entries.h"
#include "platform/string_table.h"

namespace {

// Panel states that close the attendee picker.
constexpr std::uint32_t kPanelStatusClosesPickerA = 32;
constexpr std::uint32_t kPanelStatusClosesPickerB = 64;

// Groups of the panel meeting that practice leaves out: the last separator and the picker.
constexpr std::uint32_t kGroupsOutOfPractice = 2;

}  // namespace

void CChatClient::SetPracticeStatus(std::int8_t value) {
    if (value == m_bPractice) return;
    m_bPractice = value;
    if (!IsPrivileged()) {
        if (m_bPractice) {
            RebuildAttendeeMenuInPractice(0);
        } else {
            OnAttendeePrivilegeChange();
            OnPrivilegeChanged(m_dwPrivilege, 0);
        }
        return;
    }
    if (m_bPractice) CloseSeltAttDlg();
    RebuildPanelistMenuInPractice();
}

void CChatClient::RebuildAttendeeMenuInPractice(std::int8_t bFlag) {
    if (bFlag) {
        OnAttendeePrivilegeChange();
        return;
    }
    if (!m_bChatAttendees) {
        m_MenuStatus.Clear();
        AnnounceRebuiltMenu();
        NotifyUI(msg_ClearInput);
        NotifyUI(msg_DisableUserList);
        AllowUserInput(false);
        return;
    }
    bool kept = false;
    for (int i = 0; i < static_cast<int>(m_MenuStatus.size());) {
        if (m_MenuStatus[i].IsGroupEntry() &&
            m_MenuStatus[i].nGroupID == static_cast<std::int32_t>(GROUP_ATTENDEES)) {
            m_MenuStatus.SetSelected(i, true);
            std::int32_t index = i;
            NotifyUI(msg_SelectMenuItem, &index);
            kept = true;
            ++i;
        } else {
            EraseMenuEntry(i);
        }
    }
    if (!kept) {
        MenuStatus entry = GroupEntry(GetLocalizedString("All Attendees"), GROUP_ATTENDEES);
        entry.bSelected = true;
        m_MenuStatus.PushBack(entry);
    }
    AnnounceRebuiltMenu();
}

void CChatClient::RebuildPanelistMenuInPractice() {
    const std::optional<MenuStatus> selected = SelectedMenuEntry();
    const bool hostOrPresenter = IsHostOrPresenter();
    const auto reselect = [&] {
        if (!selected || selected->bSeparator) return;
        const int again = IndexOfEqualEntry(m_MenuStatus, *selected);
        if (again != -1) SelectMenuItemByIndex(again);
    };
    if (!m_bPractice) {
        if (hostOrPresenter) {
            m_MenuStatus.PushBack(SeparatorEntry());
            m_MenuStatus.PushBack(
                GroupEntry(GetLocalizedString("Select an Attendee..."), GROUP_SELECT_ATTENDEE));
            AnnounceRebuiltMenu();
            reselect();
        } else {
            OnAttendeePrivilegeChange();
            OnPrivilegeChanged(m_dwPrivilege, 0);
        }
        return;
    }
    m_MenuStatus.Clear();
    if (hostOrPresenter) {
        AppendGroupEntries(kGroupsOutOfPractice);
    } else {
        AppendAttendeeAudiences(true);
    }
    AnnounceRebuiltMenu();
    if (m_bChatPanelists) {
        for (std::uint32_t i = 0; i < m_UserList.GetCount(); ++i) {
            const UserItem* user = m_UserList.GetUserItemByIndex(i);
            if (user->dwNodeID != m_dwMyNodeID && (user->dwRoles & ROLE_PANELIST))
                InsertChatUserName(user->strName.GetData(), user->dwNodeID, 0);
        }
    }
    reselect();
    if (m_bChatPrivately) {
        NotifyUI(msg_EnableUserList);
        AllowUserInput(true);
    } else {
        NotifyUI(msg_DisableUserList);
        AllowUserInput(false);
    }
}

void CChatClient::SetPanelStatus(std::uint32_t status) {
    m_dwPanelStatus = status;
    if (status != 0) NotifyUI(msg_PanelStatusChanged);
    if (status == kPanelStatusClosesPickerA || status == kPanelStatusClosesPickerB)
        CloseSeltAttDlg();
}
