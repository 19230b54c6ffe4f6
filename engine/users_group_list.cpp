#include "engine/users_group_list.h"

#include <strings.h>

#include <cstring>

namespace {

// True when the group has a name equal to name, ignoring case. A group without a name never
// matches one.
bool NameMatches(const CUsersGroup& group, const char* name) {
    return group.GetGrpName() && strcasecmp(group.GetGrpName(), name) == 0;
}

}  // namespace

int CUsersGroupList::InsertGroup(std::uint32_t position, std::unique_ptr<CUsersGroup> group) {
    if (!group) return -1;
    const std::int32_t count = m_Groups.GetCount();
    // A position outside the list appends: refusing would leave the caller's menu entry
    // without its group.
    const std::int32_t at =
        position < static_cast<std::uint32_t>(count) ? static_cast<std::int32_t>(position) : count;
    if (!m_Groups.InsertAt(at, group.get())) return 0;
    group.release();
    return 1;
}

int CUsersGroupList::InsertGroup2(std::uint32_t key, std::unique_ptr<CUsersGroup> group) {
    if (!group) return -1;
    const std::int32_t found = GetInsertIndex(key);
    const std::int32_t at = found < 0 ? 0 : found;
    if (!m_Groups.InsertAt(at, group.get())) return -1;
    CUsersGroup* inserted = group.release();
    inserted->SetInsertPosition(at);
    inserted->SetSequence(static_cast<std::uint32_t>(m_Groups.GetCount()));
    return 1;
}

std::int32_t CUsersGroupList::GetInsertIndex(std::uint32_t key) const {
    for (std::int32_t i = 0; i < m_Groups.GetCount(); ++i) {
        if (GetGroupByIndex(i)->GetSequence() == key) return i + 1;
    }
    return -1;
}

int CUsersGroupList::AddGroup(const CUsersGroup& group) {
    std::unique_ptr<CUsersGroup> copy(new CUsersGroup(group));
    if (!m_Groups.Add(copy.get())) return 0;
    copy.release();
    return 1;
}

int CUsersGroupList::ModifyGroup(const CUsersGroup& group) {
    CUsersGroup* target = GetGroupByIndex(IndexOfId(group.GetGroupId()));
    if (!target) return 0;
    *target = group;
    return 1;
}

int CUsersGroupList::DeleteGroup(const CUsersGroup& group) {
    return DeleteGroupbyIndex(IndexOfId(group.GetGroupId()));
}

int CUsersGroupList::DeleteGroupbyIndex(std::int32_t index) {
    CUsersGroup* group = GetGroupByIndex(index);
    if (!group) return 0;
    m_Groups.RemoveAt(index);
    delete group;
    return 1;
}

CUsersGroup* CUsersGroupList::FindGroupFromGrpId(std::uint32_t groupId) const {
    return GetGroupByIndex(IndexOfId(groupId));
}

CUsersGroup* CUsersGroupList::FindGroupFromGrpNames(const char* name) const {
    if (!name) return nullptr;
    for (std::int32_t i = 0; i < m_Groups.GetCount(); ++i) {
        CUsersGroup* group = GetGroupByIndex(i);
        if (group->GetGrpName() && std::strcmp(group->GetGrpName(), name) == 0) return group;
    }
    return nullptr;
}

CUsersGroup* CUsersGroupList::FindGroupFromSpecificNodeId(std::uint32_t nodeId) const {
    for (std::int32_t i = 0; i < m_Groups.GetCount(); ++i) {
        CUsersGroup* group = GetGroupByIndex(i);
        if (group->IsUserInTheGroup(nodeId) >= 0) return group;
    }
    return nullptr;
}

CUsersGroup* CUsersGroupList::GetGroupInfo(std::uint32_t type, std::uint32_t groupId,
                                           const char* name, std::int32_t* outPosition) const {
    if (outPosition) *outPosition = -1;
    for (std::int32_t i = 0; i < m_Groups.GetCount(); ++i) {
        CUsersGroup* group = GetGroupByIndex(i);
        if (group->GetGroupType() != type || group->GetGroupId() != groupId) continue;
        // Only the first group of that type and id is considered.
        if (name && !NameMatches(*group, name)) return nullptr;
        if (outPosition) *outPosition = i;
        return group;
    }
    return nullptr;
}

CUsersGroup* CUsersGroupList::GetGroupInfo2(std::uint32_t type, std::uint32_t groupId,
                                            const char* name, std::int32_t* outPosition) const {
    if (name) return GetGroupInfo(type, groupId, name, outPosition);
    CUsersGroup* last = nullptr;
    std::int32_t lastPosition = -1;
    for (std::int32_t i = 0; i < m_Groups.GetCount(); ++i) {
        CUsersGroup* group = GetGroupByIndex(i);
        if (group->GetGroupType() != type || group->GetGroupId() != groupId) continue;
        last = group;
        lastPosition = i;
        if (!group->GetGrpName()) break;
    }
    if (outPosition) *outPosition = lastPosition;
    return last;
}

std::unique_ptr<char[]> CUsersGroupList::GetSpecificRoleGroupLabel_M(std::uint32_t groupId) const {
    for (std::int32_t i = 0; i < m_Groups.GetCount(); ++i) {
        const CUsersGroup* group = GetGroupByIndex(i);
        const char* label = group->GetGrpLabel();
        if (group->GetGroupId() != groupId || !label) continue;
        const std::size_t size = std::strlen(label) + 1;
        std::unique_ptr<char[]> copy(new char[size]);
        std::memcpy(copy.get(), label, size);
        return copy;
    }
    return nullptr;
}

void CUsersGroupList::ReArrangeGroupIndex() {
    std::int32_t row = 0;
    for (std::int32_t i = 0; i < m_Groups.GetCount(); ++i) {
        CUsersGroup* group = GetGroupByIndex(i);
        group->SetFirstRow(row);
        row += group->GetMemberCount() + 1;
    }
}

void CUsersGroupList::ReArrangeGroupIndex2() {
    std::int32_t row = 0;
    for (std::int32_t i = 0; i < m_Groups.GetCount(); ++i) {
        CUsersGroup* group = GetGroupByIndex(i);
        if (!group->IsListed()) continue;
        group->SetFirstRow(row);
        row += group->GetMemberCount() + 1;
    }
}

std::int32_t CUsersGroupList::GetInsertPosition(std::int32_t n) const {
    const std::int32_t count = m_Groups.GetCount();
    if (count == 0) return -1;
    const std::int32_t limit = n < count ? n : count;
    std::int32_t rows = 0;
    for (std::int32_t i = 0; i < limit; ++i)
        rows += GetGroupByIndex(i)->GetMemberCount() + 1;
    return rows;
}

bool CUsersGroupList::IsUserInSameSel(std::uint32_t nodeId, std::int32_t row) const {
    for (std::int32_t i = 0; i < m_Groups.GetCount(); ++i) {
        const CUsersGroup* group = GetGroupByIndex(i);
        const std::int32_t position = group->IsUserInTheGroup(nodeId);
        if (position >= 0 && group->GetFirstRow() + 1 + position == row) return true;
    }
    return false;
}

CUsersGroup* CUsersGroupList::GetDefautGroup(std::int32_t from) const {
    for (std::int32_t i = from < 0 ? 0 : from; i < m_Groups.GetCount(); ++i) {
        CUsersGroup* group = GetGroupByIndex(i);
        if (group->GetValueB() != 0 && group->HasReservedArea()) return group;
    }
    return nullptr;
}

void CUsersGroupList::CleanUp() {
    for (std::int32_t i = m_Groups.GetCount() - 1; i >= 0; --i)
        delete GetGroupByIndex(i);
    m_Groups.RemoveAll();
}

std::int32_t CUsersGroupList::IndexOfId(std::uint32_t groupId) const {
    for (std::int32_t i = 0; i < m_Groups.GetCount(); ++i) {
        if (GetGroupByIndex(i)->GetGroupId() == groupId) return i;
    }
    return -1;
}
