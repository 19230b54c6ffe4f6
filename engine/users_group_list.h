// The send-to groups in menu order, separators included. The list owns its groups and keeps
// their rows in the two-level list (one header row per group plus one row per member).
#pragma once

#include <cstdint>
#include <memory>

#include "engine/users_group.h"
#include "kyutil/ky_vector.h"

class CUsersGroupList {
public:
    CUsersGroupList() = default;
    // Deletes every group.
    ~CUsersGroupList() { CleanUp(); }
    CUsersGroupList(const CUsersGroupList&) = delete;
    CUsersGroupList& operator=(const CUsersGroupList&) = delete;

    // First scheme: inserts the group before position; a position past the end appends.
    // 1 when inserted; -1 for a null group; 0 when the list cannot grow (the group is deleted).
    int InsertGroup(std::uint32_t position, std::unique_ptr<CUsersGroup> group);
    // Second scheme: inserts the group right after the group whose sequence number is key (at
    // the front when none has it) and records the position and the new count in the group.
    // 1 when inserted, -1 otherwise (a group that could not be inserted is deleted).
    int InsertGroup2(std::uint32_t key, std::unique_ptr<CUsersGroup> group);
    // The position after the group whose sequence number is key, or -1.
    std::int32_t GetInsertIndex(std::uint32_t key) const;

    // Appends a copy of the group: 1, or 0 when the list cannot grow.
    int AddGroup(const CUsersGroup& group);
    // Overwrites the first group with the same id: 1, or 0 when there is none.
    int ModifyGroup(const CUsersGroup& group);
    // Deletes the first group with the same id / the group at index: 1, or 0 when there is none.
    int DeleteGroup(const CUsersGroup& group);
    int DeleteGroupbyIndex(std::int32_t index);

    // The first group with that id / exactly that name / that member, or null.
    CUsersGroup* FindGroupFromGrpId(std::uint32_t groupId) const;
    CUsersGroup* FindGroupFromGrpNames(const char* name) const;
    CUsersGroup* FindGroupFromSpecificNodeId(std::uint32_t nodeId) const;
    // The first group of that type and id. With a name, that group must carry the name (any
    // case) or nothing is found. outPosition (optional) receives the position, -1 when none.
    CUsersGroup* GetGroupInfo(std::uint32_t type, std::uint32_t groupId, const char* name,
                              std::int32_t* outPosition = nullptr) const;
    // As GetGroupInfo with a name; without one, the first matching group that has no name,
    // else the last matching group.
    CUsersGroup* GetGroupInfo2(std::uint32_t type, std::uint32_t groupId, const char* name,
                               std::int32_t* outPosition = nullptr) const;

    // Number of groups, and the group at index (null outside the list).
    std::int32_t GetGroupsCount() const { return m_Groups.GetCount(); }
    CUsersGroup* GetGroupByIndex(std::int32_t index) const {
        return static_cast<CUsersGroup*>(m_Groups[index]);
    }
    // True when some group has the id 4 (all panelists).
    bool HasPanelistGroup() const { return FindGroupFromGrpId(4) != nullptr; }

    // A copy of the label of the first group with that id that has one, or null.
    std::unique_ptr<char[]> GetSpecificRoleGroupLabel_M(std::uint32_t groupId) const;
    std::unique_ptr<char[]> GetHostRoleGrpLabel_M() const { return GetSpecificRoleGroupLabel_M(1); }
    std::unique_ptr<char[]> GetPresenterRoleGrpLabel_M() const {
        return GetSpecificRoleGroupLabel_M(2);
    }
    std::unique_ptr<char[]> GetHostPresenterRoleLabel_M() const {
        return GetSpecificRoleGroupLabel_M(3);
    }
    std::unique_ptr<char[]> GetHostPresenterPanelistRoleLabel_M() const {
        return GetSpecificRoleGroupLabel_M(7);
    }
    std::unique_ptr<char[]> GetAllPanelistsRoleLabel_M() const {
        return GetSpecificRoleGroupLabel_M(4);
    }
    std::unique_ptr<char[]> GetAllAttendeesRoleLabel_M() const {
        return GetSpecificRoleGroupLabel_M(8);
    }

    // Numbers the header rows: each group's first row is the sum of (members + 1) of the groups
    // before it. The second form numbers and counts only listed groups.
    void ReArrangeGroupIndex();
    void ReArrangeGroupIndex2();
    // Sum of (members + 1) over the first min(n, count) groups; -1 for an empty list.
    std::int32_t GetInsertPosition(std::int32_t n) const;
    // True when some group holds the node as a member at exactly that row.
    bool IsUserInSameSel(std::uint32_t nodeId, std::int32_t row) const;
    // The first group at or after position from whose value B and reserved area are set.
    CUsersGroup* GetDefautGroup(std::int32_t from) const;

    // Deletes every group and empties the list.
    void CleanUp();

private:
    // Position of the first group with that id, or -1.
    std::int32_t IndexOfId(std::uint32_t groupId) const;

    // Owned CUsersGroup pointers in menu order.
    CKyVector m_Groups;
};
