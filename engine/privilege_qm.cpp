// Privilege rules under QM mode: an everyone privilege of its own, role entries edited in place
// and titled with their holders, and a selection that follows the audience it named.
#include <cstdint>

#include "engine/chat_client.h"
#include "engine/menu_entries.h"
#include "engine/privilege_bits.h"
#include "platform/func_trace.h"
#include "platform/string_table.h"

namespace {

// The bits whose change makes the QM rules edit the attendee menu.
constexpr std::uint32_t kQMRuleBits = 0x10047;

}  // namespace

void CChatClient::OnPrivilegeChangedInQM(std::uint32_t privilege, int bForce) {
    CFuncTrace trace("CChatClient::OnPrivilegeChanged , in_dwPrivilege = %d, bDefault = %d",
                     privilege, bForce);
    const std::optional<MenuStatus> selected = SelectedMenuEntry();
    const std::uint32_t old = m_dwPrivilege;
    StorePrivilege(privilege, true);
    const bool hostOrPresenter = IsHostOrPresenter();
    const bool changed = ((old ^ privilege) & kQMRuleBits) != 0;

    // The holder the selected role entry named, to find the audience again afterwards.
    std::uint32_t notedHolder = 0;
    if (!changed && !hostOrPresenter && selected) {
        if (selected->nGroupID == static_cast<std::int32_t>(GROUP_HOST)) {
            notedHolder = m_dwHostID;
        } else if (selected->nGroupID == static_cast<std::int32_t>(GROUP_PRESENTER)) {
            notedHolder = m_dwPresenterID;
        } else if (selected->nGroupID == static_cast<std::int32_t>(GROUP_HOST_PRESENTER)) {
            if (m_bChatHost && !m_bChatPresenter) notedHolder = m_dwHostID;
            if (m_bChatPresenter && !m_bChatHost) notedHolder = m_dwPresenterID;
        }
    }
    if ((changed || bForce) && !hostOrPresenter)
        OnAttendeePrivilegeChangeInQM(old & kQMRuleBits, bForce);

    const bool beforeHost = ApplyBeforeHost(hostOrPresenter);
    EnableGroupEntries(beforeHost);
    if (beforeHost && m_UserList.GetCount() != 0 && m_nPrivilegeCountdown != 0)
        SetGroupMenuEnable(GROUP_EVERYONE, true);
    ReapplyParticipantEntries();

    // Provisional audience: everyone for the host or while no host is known, else the host.
    std::int32_t target = GROUP_EVERYONE;
    if (m_dwHostID != 0 && m_dwHostID != m_dwMyNodeID)
        target = m_dwHostID == m_dwPresenterID ? GROUP_HOST_PRESENTER : GROUP_HOST;
    const int provisional = GetIndexOfMenuByGroup(target);
    if (provisional != -1 && m_MenuStatus[provisional].bEnabled) {
        SelectMenuItemByIndex(provisional);
    } else {
        SelectMenuItemByIndex(FirstSelectableIndex(m_MenuStatus));
    }

    if (hostOrPresenter || m_bChatEveryone || m_bChatAttendees || m_bChatHost || m_bChatPresenter) {
        NotifyUI(msg_EnableUserList);
        AllowUserInput(true);
    } else {
        const bool participants = HasParticipantEntry();
        AllowUserInput(m_bChatPrivately && participants);
        if (participants) {
            NotifyUI(msg_EnableUserList);
        } else {
            std::int32_t none = -1;
            NotifyUI(msg_SelectedUserLeft, &none);
            NotifyUI(msg_DisableUserList);
        }
    }

    const auto noAudience = [this] {
        std::int32_t none = -1;
        NotifyUI(msg_SelectedUserLeft, &none);
        AllowUserInput(false);
    };
    if (selected && !selected->bSeparator) {
        int again = IndexOfEqualEntry(m_MenuStatus, *selected);
        if (again == -1 && notedHolder != 0) {
            const bool both = notedHolder == m_dwHostID && notedHolder == m_dwPresenterID;
            const std::int32_t group = both                        ? GROUP_HOST_PRESENTER
                                       : notedHolder == m_dwHostID ? GROUP_HOST
                                                                   : GROUP_PRESENTER;
            const int index = GetIndexOfMenuByGroup(group);
            if (index != -1 && m_MenuStatus[index].bEnabled) again = index;
        }
        if (again != -1) {
            SelectMenuItemByIndex(again);
        } else if (!SelectedMenuEntry() || !SelectedMenuEntry()->bEnabled) {
            // Only when the provisional choice found nothing either: an enabled audience
            // stays usable.
            noAudience();
        }
    } else if (!selected && m_nPrivilegeCountdown != 0) {
        const bool iAmPresenter = m_dwMyNodeID == m_dwPresenterID;
        const bool hostUnreachable =
            !m_bChatHost && (m_dwHostID != m_dwPresenterID || !m_bChatPresenter);
        if ((iAmPresenter && m_dwHostID == 0) || (!hostOrPresenter && hostUnreachable))
            noAudience();
    }
    EraseTrailingSeparator();
    if (GetIndexOfMenuByGroup(GROUP_SELECT_ATTENDEE) == -1) CloseSeltAttDlg();
}

void CChatClient::OnAttendeePrivilegeChangeInQM(std::uint32_t oldPrivilege, int bForce) {
    if (IsBeforeHost() && m_dwHostID == 0 && m_dwPresenterID == 0) return;
    const bool hadEveryone = (oldPrivilege & kPrivilegeEveryone) != 0;
    const bool hadHost = (oldPrivilege & kPrivilegeHost) != 0;
    const bool hadPresenter = (oldPrivilege & kPrivilegePresenter) != 0;

    if (hadEveryone != (m_bChatEveryone != 0) || bForce) {
        const int everyone = GetIndexOfMenuByGroup(GROUP_EVERYONE);
        if (!m_bChatEveryone) {
            EraseEntryAndSeparator(everyone);
        } else if (everyone == -1) {
            InsertMenuEntry(GroupEntry(GetLocalizedString("Everyone"), GROUP_EVERYONE), 0);
            if (m_MenuStatus.size() > 1) InsertMenuEntry(SeparatorEntry(), 1);
        }
    }
    if (m_dwHostID != 0 && m_dwHostID == m_dwPresenterID) {
        const bool combined = m_bChatHost || m_bChatPresenter;
        if (combined == (hadHost || hadPresenter) && !bForce) return;
        if (!combined) {
            for (std::uint32_t id : {GROUP_HOST_PRESENTER, GROUP_PRESENTER, GROUP_HOST})
                EraseEntryAndSeparator(GetIndexOfMenuByGroup(id));
            return;
        }
        if (m_MenuStatus.size() == 1 && m_MenuStatus[0].nGroupID == std::int32_t(GROUP_EVERYONE))
            InsertMenuEntry(SeparatorEntry(), -1);
        if (m_bChatHost) OnHostChanged(m_dwHostID);
        return;
    }
    if (hadHost != (m_bChatHost != 0) || bForce) {
        if (!m_bChatHost) {
            EraseEntryAndSeparator(GetIndexOfMenuByGroup(GROUP_HOST));
        } else {
            OnHostChanged(m_dwHostID);
        }
    }
    if (hadPresenter != (m_bChatPresenter != 0) || bForce) {
        if (!m_bChatPresenter) {
            EraseEntryAndSeparator(GetIndexOfMenuByGroup(GROUP_PRESENTER));
        } else {
            OnPresenterChanged(m_dwPresenterID);
        }
    }
}

void CChatClient::EraseEntryAndSeparator(int index) {
    if (index < 0 || index >= static_cast<int>(m_MenuStatus.size())) return;
    if (m_MenuStatus[index].bSelected) {
        m_MenuStatus.Erase(index);
        std::int32_t payload = index;
        NotifyUI(msg_SelectedUserLeft, &payload);
    } else {
        EraseMenuEntry(index);
    }
    if (index < static_cast<int>(m_MenuStatus.size()) && m_MenuStatus[index].bSeparator)
        EraseMenuEntry(index);
}

void CChatClient::EraseTrailingSeparator() {
    if (!m_MenuStatus.empty() && m_MenuStatus.back().bSeparator)
        EraseMenuEntry(static_cast<int>(m_MenuStatus.size()) - 1);
}
