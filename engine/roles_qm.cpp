// Under QM rules the role entries of the send-to menu carry their holders' names. After a host
// or presenter change they are created, erased, merged into the combined entry or split from
// it, and the audience selected before the change is found again.
#include <cstdint>
#include <string>

#include "engine/chat_client.h"
#include "engine/menu_entries.h"
#include "platform/string_table.h"

namespace {

// The role of one side of a change: its group, title key and holder.
struct Role {
    std::int32_t group;
    const char* word;
    std::uint32_t holder;
};

}  // namespace

void CChatClient::ArrangeRoleEntriesInQM(bool bHost) {
    const std::optional<MenuStatus> selected = SelectedMenuEntry();
    // The audience the selected entry named before the change.
    const std::uint32_t hostBefore = bHost ? m_dwPrevHostID : m_dwHostID;
    const std::uint32_t presenterBefore = bHost ? m_dwPresenterID : m_dwPrevPresenterID;
    std::uint32_t audience = 0;
    if (selected) {
        if (selected->nGroupID == std::int32_t(GROUP_HOST) ||
            selected->nGroupID == std::int32_t(GROUP_HOST_PRESENTER)) {
            audience = hostBefore;
        } else if (selected->nGroupID == std::int32_t(GROUP_PRESENTER)) {
            audience = presenterBefore;
        } else if (selected->nGroupID == -1) {
            audience = selected->dwNodeID;
        }
    }

    const Role changed = bHost ? Role{GROUP_HOST, "Host", m_dwHostID}
                               : Role{GROUP_PRESENTER, "Presenter", m_dwPresenterID};
    const Role other = bHost ? Role{GROUP_PRESENTER, "Presenter", m_dwPresenterID}
                             : Role{GROUP_HOST, "Host", m_dwHostID};
    const bool mine = changed.holder == m_dwMyNodeID;
    const int first = GetIndexOfMenuByGroup(GROUP_EVERYONE) != -1 ? 2 : 0;

    if (changed.holder != 0 && m_dwHostID == m_dwPresenterID) {
        if (GetIndexOfMenuByGroup(GROUP_HOST) == -1 &&
            GetIndexOfMenuByGroup(GROUP_PRESENTER) == -1 &&
            GetIndexOfMenuByGroup(GROUP_HOST_PRESENTER) == -1)
            InsertMenuEntry(SeparatorEntry(), first == 2 ? 1 : 0);
        for (const std::int32_t group : {changed.group, other.group}) {
            const int index = GetIndexOfMenuByGroup(group);
            if (index == -1) continue;
            EraseMenuEntry(index);
            if (mine && index < static_cast<int>(m_MenuStatus.size()) &&
                m_MenuStatus[index].bSeparator)
                EraseMenuEntry(index);
        }
        const int combined = GetIndexOfMenuByGroup(GROUP_HOST_PRESENTER);
        if (combined == -1 && !mine) {
            MenuStatus entry =
                GroupEntry(GetLocalizedString("Host & Presenter"), GROUP_HOST_PRESENTER);
            entry.dwExternalTag = GetUserExternalInternalTag(m_dwHostID);
            InsertMenuEntry(entry, first);
        } else if (combined != -1 && mine) {
            EraseMenuEntry(combined);
            if (combined < static_cast<int>(m_MenuStatus.size()) &&
                m_MenuStatus[combined].bSeparator)
                EraseMenuEntry(combined);
        }
        const int now = GetIndexOfMenuByGroup(GROUP_HOST_PRESENTER);
        const UserItem* holder = m_UserList.GetUserItemFromNodeId(changed.holder);
        if (now != -1 && holder && holder->strName.GetData())
            RetitleRoleEntry(now, holder->strName.GetData(), changed.holder, "Host & Presenter");
    } else {
        const int combined = GetIndexOfMenuByGroup(GROUP_HOST_PRESENTER);
        if (combined != -1) EraseMenuEntry(combined);
        int index = GetIndexOfMenuByGroup(changed.group);
        if (mine && index != -1) {
            EraseMenuEntry(index);
        } else if (!mine && index == -1 && changed.holder != 0) {
            MenuStatus entry = GroupEntry(GetLocalizedString(changed.word), changed.group);
            entry.dwExternalTag = GetUserExternalInternalTag(changed.holder);
            InsertMenuEntry(entry, first);
        }
        index = GetIndexOfMenuByGroup(changed.group);
        const bool otherAllowed = bHost ? m_bChatPresenter != 0 : m_bChatHost != 0;
        if (GetIndexOfMenuByGroup(other.group) == -1 && other.holder != 0 &&
            other.holder != m_dwMyNodeID && otherAllowed) {
            const UserItem* holder = m_UserList.GetUserItemFromNodeId(other.holder);
            MenuStatus entry = GroupEntry(GetLocalizedString(other.word), other.group);
            entry.dwExternalTag = GetUserExternalInternalTag(other.holder);
            const int at = InsertMenuEntry(entry, index == -1 ? first : index + 1);
            if (holder && holder->strName.GetData())
                RetitleRoleEntry(at, holder->strName.GetData(), other.holder, other.word);
        }
        index = GetIndexOfMenuByGroup(changed.group);
        const UserItem* holder = m_UserList.GetUserItemFromNodeId(changed.holder);
        if (index != -1 && holder && holder->strName.GetData())
            RetitleRoleEntry(index, holder->strName.GetData(), changed.holder, changed.word);
    }
    if (selected) SelectAudienceAfterRoleChange(audience, bHost);
}

void CChatClient::SelectAudienceAfterRoleChange(std::uint32_t audience, bool bHost) {
    int target = -1;
    if (audience != 0 && audience == m_dwHostID && audience == m_dwPresenterID) {
        target = GetIndexOfMenuByGroup(GROUP_HOST_PRESENTER);
    } else if (audience != 0 && audience == m_dwHostID) {
        target = GetIndexOfMenuByGroup(GROUP_HOST);
    } else if (audience != 0 && audience == m_dwPresenterID) {
        target = GetIndexOfMenuByGroup(GROUP_PRESENTER);
    } else if (audience != 0) {
        target = GetIndexOfMenuByNodeID(audience);
        const UserItem* user = m_UserList.GetUserItemFromNodeId(audience);
        if (target == -1 && bHost && audience == m_dwPrevHostID && user) {
            // The previous host is an attendee again: chat goes on privately.
            InsertExternalInternalChatUserName(user->strName.GetData(), audience,
                                               GetUserExternalInternalTag(audience));
            target = GetIndexOfMenuByNodeID(audience);
        }
    }
    if (target != -1 && m_MenuStatus[target].bEnabled) {
        if (!m_MenuStatus[target].bSelected) SelectMenuItemByIndex(target);
        return;
    }
    std::int32_t none = -1;
    NotifyUI(msg_SelectedUserLeft, &none);
    if (m_MenuStatus.empty()) NotifyUI(msg_DisableUserList);
}

void CChatClient::RetitleRoleEntry(int index, const std::string& name, std::uint32_t nodeId,
                                   const char* role) {
    std::string title = name + " (" + role +
                        GetUserExternalInternalString(GetUserExternalInternalTag(nodeId), 1) + ")";
    m_MenuStatus.SetTitle(index, title);
    NotifyUI(msg_RenameMenuItem, &title,
             reinterpret_cast<void*>(static_cast<std::intptr_t>(index)));
}
