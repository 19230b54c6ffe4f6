// The roster: one UserItem per participant enrolled in the chat session, keyed by node id, with
// user id, display name and role bits. The list owns its items.
#pragma once

#include <cstdint>
#include <memory>
#include <unordered_map>
#include <vector>

#include "kyutil/ky_string2.h"
#include "kyutil/ky_vector.h"

// One participant of the roster.
struct UserItem {
    std::uint32_t dwReserved1 = 100;  // carried unchanged
    std::uint32_t dwReserved2 = 0;    // carried unchanged
    std::uint32_t dwUserType = 0;     // user type from the roster record
    std::int32_t bVisible = 1;        // visibility flag from the roster record
    std::uint32_t dwReserved3 = 1;    // carried unchanged
    std::uint32_t dwExternalTag = 0;  // 1 internal, 2 external, 0 untagged
    std::uint32_t dwRoles = 0;        // ROLE_HOST | ROLE_PRESENTER | ROLE_PANELIST; 0 attendee
    std::uint16_t wReserved = 0;      // copied only with the second group scheme
    std::uint32_t dwUserID = 0;       // sender id of the participant's chat
    std::uint32_t dwNodeID = 0;       // conference node id: the roster's key
    CKyString2 strName;               // display name
    char szSpare[32] = {};            // zero-filled, unused
};

class CUserListManager {
public:
    // Result of the lookups and setters when the node is not in the roster. Role queries give
    // it too, so callers that test for non-zero treat an unknown node as having the role.
    static constexpr std::uint32_t kNotFound = 2;

    CUserListManager() = default;
    // Deletes the items from the last to the first.
    ~CUserListManager();
    CUserListManager(const CUserListManager&) = delete;
    CUserListManager& operator=(const CUserListManager&) = delete;

    // Appends the item and takes it over (duplicates allowed). 0 for a null item, else 1;
    // when the roster cannot grow the item is deleted and 0 returned.
    int AddItem(std::unique_ptr<UserItem> item);
    // Deletes the first item of the node: 1, or 2 when there is none.
    int RemoveItem(std::uint32_t nodeId);

    // The node's roles AND mask, or 2 when the node is unknown. With out given, roles, node id,
    // user id and name of the found item are copied into it.
    std::uint32_t JudgeRosters(std::uint32_t nodeId, std::uint32_t mask,
                               UserItem* out = nullptr) const;
    // JudgeRosters with mask 1, 2 and 0: the bit value, 0, or 2 for an unknown node.
    std::uint32_t IsHost(std::uint32_t nodeId, UserItem* out = nullptr) const;
    std::uint32_t IsPresenter(std::uint32_t nodeId, UserItem* out = nullptr) const;
    std::uint32_t IsAttendee(std::uint32_t nodeId, UserItem* out = nullptr) const;
    // Strict: JudgeRosters with mask 4. Otherwise 1 when the node is panelist, host or
    // presenter (or unknown), else 0.
    std::uint32_t IsPanelist(std::uint32_t nodeId, bool bStrict, UserItem* out = nullptr) const;

    // Replaces the node's roles: 1, or 2 when the node is unknown.
    int SetRosters(std::uint32_t nodeId, std::uint32_t roles);
    // Copies what an enroll record says (ids, name, roles, user type, visibility, tag, first
    // reserved value; the 16-bit value only when asked) onto the node's item: 1, or 2.
    int UpdateItem(std::uint32_t nodeId, const UserItem& from, bool bWithReserved16);
    // Roles become exactly host / presenter.
    int SetHost(std::uint32_t nodeId) { return SetRosters(nodeId, 0x1); }
    int SetPresenter(std::uint32_t nodeId) { return SetRosters(nodeId, 0x2); }
    // Roles become panelist (b set) or none; SetAttendee is the reverse.
    int SetPanelist(std::uint32_t nodeId, int b) { return SetRosters(nodeId, b ? 0x4 : 0); }
    int SetAttendee(std::uint32_t nodeId, int b) { return SetRosters(nodeId, b ? 0 : 0x4); }

    // Copies the display name: 1; 0 for a null name; 2 when the node is unknown.
    int ModifyItemName(std::uint32_t nodeId, const char* name);
    // Changes nothing: 0 for a null name or label, else 1 when the node is known, 2 when not.
    int ModifyItemGrp(std::uint32_t nodeId, std::uint32_t groupId, const char* name,
                      const char* label) const;

    // The first item with that node id / user id, or null. Items change only through the
    // setters above, which keep the lookups right.
    const UserItem* GetUserItemFromNodeId(std::uint32_t nodeId) const;
    const UserItem* GetUserItemFromUserId(std::uint32_t userId) const;
    // True when some item has both the user id and the node id.
    bool HasUserOnNode(std::uint32_t userId, std::uint32_t nodeId) const;
    // 1 with the node id of the user / the user id of the node stored in out; 0 when unknown.
    int GetNodeIdFromUserId(std::uint32_t userId, std::uint32_t& nodeId) const;
    int GetUserIdFromNodeId(std::uint32_t nodeId, std::uint32_t& userId) const;
    // The first item with the host bit, or null.
    const UserItem* GetHosUser() const;
    // Number of items with the host bit / with any of host, presenter and panelist.
    std::uint32_t GetHostCount() const { return m_nHosts; }
    std::uint32_t GetPrivilegedCount() const { return m_nPrivileged; }
    // The item at position index, or null past the last item.
    const UserItem* GetUserItemByIndex(std::uint32_t index) const;
    // Number of items.
    std::uint32_t GetCount() const { return static_cast<std::uint32_t>(m_Items.GetCount()); }

private:
    // Items sharing one key, in roster order; the first is the one lookups answer with.
    using ItemList = std::vector<UserItem*>;
    using KeyIndex = std::unordered_map<std::uint64_t, ItemList>;

    UserItem* At(std::int32_t index) const { return static_cast<UserItem*>(m_Items[index]); }
    UserItem* FirstOfNode(std::uint32_t nodeId) const;
    // Enter the item into (or take it out of) the key indexes and the role counts.
    void Index(UserItem* item);
    void Unindex(UserItem* item);
    void Enter(KeyIndex& index, std::uint64_t key, UserItem* item);
    static void Leave(KeyIndex& index, std::uint64_t key, const UserItem* item);

    // Owned UserItem pointers in arrival order.
    CKyVector m_Items;
    // Lookups by node id, by user id and by (user id, node id), and each item's arrival number,
    // which orders items that share a key.
    KeyIndex m_ByNode;
    KeyIndex m_ByUser;
    KeyIndex m_ByUserNode;
    std::unordered_map<const UserItem*, std::uint64_t> m_Arrival;
    std::uint64_t m_nNextArrival = 0;
    // Items with the host bit, and with any of host, presenter and panelist.
    std::uint32_t m_nHosts = 0;
    std::uint32_t m_nPrivileged = 0;
};
