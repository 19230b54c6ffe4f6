// One send-to group: a role group, an id group with explicit members, or a separator. It owns
// its name, label, cache record and member list, and keeps its shared-data cache status.
#pragma once

#include <cstdint>
#include <memory>

#include "kyutil/ky_vector.h"

class CUsersGroup {
public:
    // Longest cache name the group's cache record holds.
    static constexpr std::uint32_t kCacheNameLength = 64;

    CUsersGroup();
    ~CUsersGroup();
    // Deep copies: strings, cache record and members are duplicated.
    CUsersGroup(const CUsersGroup& other);
    CUsersGroup& operator=(const CUsersGroup& other);

    // Replace the name / label with a copy; a null text keeps the old one and returns null,
    // otherwise the stored copy is returned.
    const char* SetGrpName(const char* name);
    const char* SetGrpLabel(const char* label);
    // Frees the private chat label, then copies text when it is not null and the group has a
    // label; returns the stored copy or null.
    const char* SetPrivateChatLabel(const char* text);
    // Each non-null argument replaces its string.
    void SetGroupNameLabel(const char* name, const char* label);
    // Builds text + "(|(" + group name + ")|)" (a null piece counts as empty) and returns it.
    const char* SetFactName(const char* text);

    // Copies at most 64 characters into the cache record; nothing once the record is gone.
    void SetCacheName(const char* name);
    // Stores the cache handle; nothing once the record is gone.
    void SetCacheHandle(std::uint32_t handle);
    // The cache name, or null once the record is gone (it is always terminated).
    const char* GetCacheName() const;
    // The cache handle, or 0 once the record is gone.
    std::uint32_t GetCacheHandle() const;

    // Appends a member; 1 when added, 0 when memory runs out.
    int AddAMember(std::uint32_t nodeId);
    // Inserts a member before position; 1 when inserted, 0 for a position outside 0..count.
    int InsertAMember(std::uint32_t nodeId, std::int32_t position);
    // Removes the first matching member: 1, or 0 when absent.
    int RemoveAMember(std::uint32_t nodeId);
    // The member's position, or -1.
    std::int32_t IsUserInTheGroup(std::uint32_t nodeId) const;
    // Appends *members[i] for each non-null pointer; nothing when count is 0, the array is null
    // or its first pointer is null.
    void SetGroupMembers(std::uint32_t count, const std::uint32_t* const* members);
    // Number of members and the member at position (0 past the end).
    std::int32_t GetMemberCount() const { return m_Members.GetCount(); }
    std::uint32_t GetMember(std::int32_t position) const;

    // Frees cache record, fact name, name, label and private chat label and deletes every
    // member; returns 1.
    int DeleteMembers();
    // Clears the group as DeleteMembers does, then reads a serialized group from the size bytes
    // at data. 1 on success; 0 for missing name or label, no members, or data that ends early
    // or promises more members than it holds (nothing beyond size is read).
    int SetGroup(const unsigned char* data, std::uint32_t size);

    // Stores the flag value: whole (first scheme), or unpacked into flags (bit 0), flag bits
    // 1 to 3 and listed (bit 4) with bPacked (second scheme).
    void SetFlags(std::uint32_t flags, bool bPacked);
    std::uint32_t GetFlags() const { return m_dwFlags; }
    std::uint32_t GetFlagBit1() const { return m_dwFlagBit1; }
    std::uint32_t GetFlagBit2() const { return m_dwFlagBit2; }
    std::uint32_t GetFlagBit3() const { return m_dwFlagBit3; }
    bool IsListed() const { return m_bListed != 0; }

    std::uint32_t GetGroupType() const { return m_dwGroupType; }
    void SetGroupType(std::uint32_t type) { m_dwGroupType = type; }
    std::uint32_t GetGroupId() const { return m_dwGroupId; }
    void SetGroupId(std::uint32_t id) { m_dwGroupId = id; }
    // Owned strings, each null when not set.
    const char* GetGrpName() const { return m_pszName.get(); }
    const char* GetGrpLabel() const { return m_pszLabel.get(); }
    const char* GetFactName() const { return m_pszFactName.get(); }
    const char* GetPrivateChatLabel() const { return m_pszPrivateChatLabel.get(); }
    std::uint32_t GetValueA() const { return m_dwValueA; }
    void SetValueA(std::uint32_t value) { m_dwValueA = value; }
    std::uint32_t GetValueB() const { return m_dwValueB; }
    void SetValueB(std::uint32_t value) { m_dwValueB = value; }
    // True when some byte of the reserved area is set.
    bool HasReservedArea() const;

    // Row of the group's header in the two-level list (-1 until numbered).
    std::int32_t GetFirstRow() const { return m_nFirstRow; }
    void SetFirstRow(std::int32_t row) { m_nFirstRow = row; }
    // Second scheme: the group count right after insertion, and the position inserted at.
    std::uint32_t GetSequence() const { return m_dwSequence; }
    void SetSequence(std::uint32_t sequence) { m_dwSequence = sequence; }
    std::int32_t GetInsertPosition() const { return m_nInsertPosition; }
    void SetInsertPosition(std::int32_t position) { m_nInsertPosition = position; }

    // Shared-data cache status kept by the cache code.
    int GetNeedSendGroupInfo() const { return m_bNeedSendGroupInfo; }
    void SetNeedSendGroupInfo(int status) { m_bNeedSendGroupInfo = status; }
    int IsSubscribed() const { return m_bSubscribed; }
    void SetSubscribed(int subscribed) { m_bSubscribed = subscribed; }
    int GetRequestType() const { return m_nRequestType; }
    void SetRequestType(int type) { m_nRequestType = type; }
    int IsCacheSet() const { return m_bCacheSet; }
    void SetCacheSet(int set) { m_bCacheSet = set; }

private:
    // The group's shared-data cache: name (64 characters plus a terminator that stays 0) and
    // handle.
    struct CacheRecord {
        char szName[kCacheNameLength + 1] = {};
        std::uint32_t dwHandle = 0;
    };

    // Frees every owned string, the cache record and the members.
    void Clear();
    // Deletes the owned members.
    void DeleteAllMembers();

    std::int32_t m_nFirstRow = -1;
    std::uint32_t m_dwGroupType = 0;
    std::uint32_t m_dwGroupId = 0;
    // Owned strings.
    std::unique_ptr<char[]> m_pszName;
    std::unique_ptr<char[]> m_pszLabel;
    std::unique_ptr<char[]> m_pszFactName;
    std::unique_ptr<char[]> m_pszPrivateChatLabel;
    // Flag value and the values the add operations pass through.
    std::uint32_t m_dwFlags = 0;
    std::uint32_t m_dwValueA = 0;
    std::uint32_t m_dwValueB = 0;
    // Second flag scheme.
    std::uint32_t m_dwFlagBit1 = 0;
    std::uint32_t m_dwFlagBit2 = 1;
    std::uint32_t m_dwFlagBit3 = 0;
    std::uint32_t m_bListed = 1;
    std::uint32_t m_dwReserved1 = 0;
    // Second insertion scheme.
    std::uint32_t m_dwSequence = 0;
    std::int32_t m_nInsertPosition = -1;
    std::uint32_t m_dwReserved2 = 20;
    // Cache record and status.
    std::unique_ptr<CacheRecord> m_pCache;
    int m_bNeedSendGroupInfo = 0;
    int m_bSubscribed = 0;
    int m_nRequestType = 0;
    int m_bCacheSet = 0;
    // Owned new'd node ids.
    CKyVector m_Members;
    unsigned char m_Reserved[32] = {};
};
