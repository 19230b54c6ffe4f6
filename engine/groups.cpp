// Send-to groups: the default groups of each meeting type, the groups the host adds, and the
// menu entries that come with them.
#include <memory>
#include <string>

#include "api/ui_protocol.h"
#include "engine/chat_client.h"
#include "platform/func_trace.h"
#include "platform/string_table.h"
#include "platform/trace.h"

namespace {

// Group types.
constexpr std::uint32_t kRoleGroup = 1;
constexpr std::uint32_t kSeparator = 2;
constexpr std::uint32_t kIdGroup = 3;

// One group a meeting type brings; key is the label's English key, null for a separator.
struct DefaultGroup {
    std::uint32_t dwIndex;
    std::uint32_t dwGroupType;
    std::uint32_t dwGroupId;
    const char* key;
    std::uint8_t flags[3];
    bool bIntoMenu;
};

// Meeting type 3 (attendees, panelists, the attendee picker). Only the host's, presenter's and
// panelists' entries start in the menu; the role rules add the others.
constexpr DefaultGroup kPanelMeetingGroups[] = {
    {0, kRoleGroup, GROUP_HOST, "Host", {0, 0, 0}, true},
    {1, kRoleGroup, GROUP_PRESENTER, "Presenter", {0, 0, 0}, true},
    {2, kRoleGroup, GROUP_HOST_PRESENTER, "Host & Presenter", {0, 0, 0}, true},
    {3, kSeparator, 0, nullptr, {0, 0, 0}, true},
    {4, kRoleGroup, GROUP_ATTENDEES, "All Attendees", {1, 0, 0}, false},
    {5, kRoleGroup, GROUP_PANELISTS, "All Panelists", {1, 0, 0}, true},
    {6, kSeparator, 0, nullptr, {0, 0, 0}, false},
    {7, kRoleGroup, GROUP_EVERYONE, "All Participants", {0, 1, 0}, false},
    {8, kSeparator, 0, nullptr, {0, 0, 0}, false},
    {9, kRoleGroup, GROUP_SELECT_ATTENDEE, "Select an Attendee...", {0, 1, 0}, false},
};

// Meeting type 1 in QM mode.
constexpr DefaultGroup kQMEveryoneGroups[] = {
    {0, kRoleGroup, GROUP_EVERYONE, "Everyone", {0, 1, 0}, true}};

// True when every role group of the set is in the list already: the set was added before
// (QM mode turning on runs the meeting type again), and adding it again would double it.
template <std::size_t N>
bool HasDefaultGroups(const CUsersGroupList& list, const DefaultGroup (&groups)[N]) {
    for (const DefaultGroup& group : groups) {
        if (group.dwGroupType == kSeparator) continue;
        const std::string label = GetLocalizedString(group.key);
        if (!list.GetGroupInfo(group.dwGroupType, group.dwGroupId, label.c_str())) return false;
    }
    return true;
}

void AddDefaultGroup(CChatClient& client, const DefaultGroup& group) {
    const std::string label = group.key ? GetLocalizedString(group.key) : std::string();
    _tagChatGroupInfo info{};
    info.dwIndex = group.dwIndex;
    info.dwGroupType = group.dwGroupType;
    info.dwGroupId = group.dwGroupId;
    info.cszGroupName = group.key ? label.c_str() : nullptr;
    info.bFlag1 = group.flags[0];
    info.bFlag2 = group.flags[1];
    info.bFlag3 = group.flags[2];
    client.AddGroup(&info, group.bIntoMenu ? 1 : 0);
}

// Sets every value the add operations give a group; bPacked selects the second flag scheme.
void FillGroup(CUsersGroup& group, const CChatClient::GroupValues& values, bool bPacked) {
    group.SetGroupType(values.dwGroupType);
    group.SetGroupId(values.dwGroupId);
    group.SetGrpName(values.lpszGroupName);
    group.SetGrpLabel(values.lpszGroupLabel);
    group.SetFlags(values.dwFlags, bPacked);
    group.SetValueA(values.dwValueA);
    group.SetGroupMembers(values.dwMemberCount, values.pMembers);
    group.SetValueB(values.dwValueB);
}

}  // namespace

void CChatClient::AddGroup(const _tagChatGroupInfo* info, int bAddToMenu) {
    if (!info) return;
    CFuncTrace trace(
        "CChatClient::AddGroup, pChatGroupInfo->dwGroupType = %d, pChatGroupInfo->dwGroupId = "
        "%d, pChatGroupInfo->cszGroupName = %s",
        info->dwGroupType, info->dwGroupId, info->cszGroupName ? info->cszGroupName : "");
    m_dwFeatures |= FEATURE_GROUPS;

    if (bAddToMenu) {
        MenuStatus entry;
        if (info->dwGroupType == kSeparator) {
            entry.bSeparator = true;
        } else {
            if (info->cszGroupName) {
                entry.strTitle = info->cszGroupName;
            } else {
                MacErrorTrace2(kChatTag,
                               "CChatClient::AddGroup( ChatGroupInfo* pChatGroupInfo), "
                               "pChatGroupInfo->cszGroupName == NULL");
            }
            entry.nGroupID = static_cast<std::int32_t>(info->dwGroupId);
        }
        // The index is compared as it is: adding 1 to it would wrap at the top of the range.
        if (info->dwIndex < m_MenuStatus.size()) {
            m_MenuStatus.Insert(info->dwIndex, entry);
        } else {
            m_MenuStatus.PushBack(entry);
        }
    }

    GroupValues values;
    values.dwIndex = info->dwIndex;
    values.dwGroupType = info->dwGroupType;
    values.dwGroupId = info->dwGroupId;
    values.lpszGroupName = info->cszGroupName;
    AddGroup(values);
    AnnounceRebuiltMenu();
}

void CChatClient::SetMeetingType(std::int32_t meetingType) {
    CFuncTrace trace("CChatClient::SetMeetingType = %d", meetingType);
    m_dwMeetingType = meetingType;
    switch (meetingType) {
        case 3:
            m_dwFeatures |= FEATURE_GROUPS;
            if (HasDefaultGroups(m_GroupList, kPanelMeetingGroups)) break;
            for (const DefaultGroup& group : kPanelMeetingGroups)
                AddDefaultGroup(*this, group);
            break;
        case 2:
            m_dwFeatures |= FEATURE_GROUPS;
            break;
        case 1:
            m_dwFeatures |= FEATURE_GROUPS;
            if (m_bQMMode && !HasDefaultGroups(m_GroupList, kQMEveryoneGroups))
                AddDefaultGroup(*this, kQMEveryoneGroups[0]);
            break;
        default:
            break;
    }
}

int CChatClient::AddGroup(const GroupValues& values) {
    CFuncTrace trace("CChatClient::AddGroup");
    const bool bScheme2 = (m_dwFeatures & FEATURE_GROUP_SCHEME2) != 0;
    int result = -1;
    switch (values.dwGroupType) {
        case kIdGroup:
            result = bScheme2 ? AddIDGroup2(values) : AddIDGroup(values);
            break;
        case kRoleGroup:
        case kSeparator:
            result = bScheme2 ? AddRoleGroup2(values) : AddRoleGroup(values);
            break;
        default:
            break;
    }
    m_GroupList.ReArrangeGroupIndex();
    return result;
}

int CChatClient::AddRoleGroup(const GroupValues& values) {
    CUsersGroup* group = nullptr;
    if (values.dwGroupType != kSeparator) {
        group =
            m_GroupList.GetGroupInfo(values.dwGroupType, values.dwGroupId, values.lpszGroupName);
    }
    std::unique_ptr<CUsersGroup> created;
    if (group) {
        MacInfoTrace2(kChatTag, "/---- CMainChatDlg::AddRoleGroup Existed Group ----/");
    } else {
        created.reset(new CUsersGroup);
        group = created.get();
        MacInfoTrace2(kChatTag, "/---- CMainChatDlg::AddRoleGroup New Group ----/");
    }
    FillGroup(*group, values, false);
    // While the session is recorded the group's description must reach its cache.
    if (m_dwNBRStatus == 0 || m_dwNBRStatus == 3) group->SetNeedSendGroupInfo(1);

    const bool bInserted =
        !created || m_GroupList.InsertGroup(values.dwIndex, std::move(created)) == 1;
    const int index = static_cast<int>(values.dwIndex);
    if (!m_bEnrolled) {
        const int result = bInserted ? index : -1;
        MacInfoTrace2(kChatTag, "/==== CMainChatDlg::AddRoleGroup exit: nInsertIndex = %d ====/",
                      result);
        return result;
    }
    return index;
}

int CChatClient::AddRoleGroup2(const GroupValues& values) {
    CUsersGroup* group = nullptr;
    if (values.dwGroupType != kSeparator) {
        group =
            m_GroupList.GetGroupInfo2(values.dwGroupType, values.dwGroupId, values.lpszGroupName);
    }
    if (group) {
        MacInfoTrace2(kChatTag, "/---- CMainChatDlg::AddRoleGroup Existed Group ----/");
        FillGroup(*group, values, true);
        return static_cast<int>(group->GetSequence());
    }
    MacInfoTrace2(kChatTag, "/---- CMainChatDlg::AddRoleGroup New Group ----/");
    std::unique_ptr<CUsersGroup> created(new CUsersGroup);
    FillGroup(*created, values, true);
    const CUsersGroup* inserted = created.get();
    if (m_GroupList.InsertGroup2(values.dwIndex, std::move(created)) != 1) return -1;
    return static_cast<int>(inserted->GetSequence());
}

int CChatClient::AddIDGroup(const GroupValues& values) {
    std::unique_ptr<CUsersGroup> group(new CUsersGroup);
    FillGroup(*group, values, false);
    return m_GroupList.InsertGroup(values.dwIndex, std::move(group));
}

int CChatClient::AddIDGroup2(const GroupValues& values) {
    std::unique_ptr<CUsersGroup> group(new CUsersGroup);
    FillGroup(*group, values, true);
    return m_GroupList.InsertGroup2(values.dwIndex, std::move(group));
}

int CChatClient::AddCacheGroup(std::uint32_t dwIndex, std::uint32_t dwGroupType,
                               std::uint32_t dwGroupId, const char* lpszGroupName) {
    GroupValues values;
    values.dwIndex = dwIndex;
    values.dwGroupType = dwGroupType;
    values.dwGroupId = dwGroupId;
    values.lpszGroupName = lpszGroupName;
    AddRoleGroup(values);
    return 1;
}
