#include "engine/user_list_manager.h"

#include <algorithm>

namespace {

constexpr std::uint32_t kHostBit = 0x1;
constexpr std::uint32_t kPrivilegedBits = 0x7;  // host, presenter, panelist

std::uint64_t PairKey(std::uint32_t userId, std::uint32_t nodeId) {
    return (static_cast<std::uint64_t>(userId) << 32) | nodeId;
}

}  // namespace

CUserListManager::~CUserListManager() {
    for (std::int32_t i = m_Items.GetCount() - 1; i >= 0; --i)
        delete At(i);
    m_Items.RemoveAll();
}

int CUserListManager::AddItem(std::unique_ptr<UserItem> item) {
    if (!item) return 0;
    if (!m_Items.Add(item.get())) return 0;
    m_Arrival[item.get()] = m_nNextArrival++;
    Index(item.release());
    return 1;
}

int CUserListManager::RemoveItem(std::uint32_t nodeId) {
    UserItem* item = FirstOfNode(nodeId);
    if (!item) return kNotFound;
    Unindex(item);
    m_Arrival.erase(item);
    m_Items.Remove(item);
    delete item;
    return 1;
}

std::uint32_t CUserListManager::JudgeRosters(std::uint32_t nodeId, std::uint32_t mask,
                                             UserItem* out) const {
    const UserItem* item = FirstOfNode(nodeId);
    if (!item) return kNotFound;
    if (out) {
        out->dwRoles = item->dwRoles;
        out->dwNodeID = item->dwNodeID;
        out->dwUserID = item->dwUserID;
        out->strName.CopyFrom(item->strName);
    }
    return item->dwRoles & mask;
}

std::uint32_t CUserListManager::IsHost(std::uint32_t nodeId, UserItem* out) const {
    return JudgeRosters(nodeId, 0x1, out);
}

std::uint32_t CUserListManager::IsPresenter(std::uint32_t nodeId, UserItem* out) const {
    return JudgeRosters(nodeId, 0x2, out);
}

std::uint32_t CUserListManager::IsAttendee(std::uint32_t nodeId, UserItem* out) const {
    return JudgeRosters(nodeId, 0, out);
}

std::uint32_t CUserListManager::IsPanelist(std::uint32_t nodeId, bool bStrict,
                                           UserItem* out) const {
    const std::uint32_t result = JudgeRosters(nodeId, 0x4, out);
    if (bStrict) return result;
    return (result != 0 || IsHost(nodeId) != 0 || IsPresenter(nodeId) != 0) ? 1 : 0;
}

int CUserListManager::SetRosters(std::uint32_t nodeId, std::uint32_t roles) {
    UserItem* item = FirstOfNode(nodeId);
    if (!item) return kNotFound;
    Unindex(item);
    item->dwRoles = roles;
    Index(item);
    return 1;
}

int CUserListManager::UpdateItem(std::uint32_t nodeId, const UserItem& from, bool bWithReserved16) {
    UserItem* item = FirstOfNode(nodeId);
    if (!item) return kNotFound;
    Unindex(item);
    item->dwUserID = from.dwUserID;
    item->strName = from.strName;
    item->dwNodeID = from.dwNodeID;
    item->dwRoles = from.dwRoles;
    item->dwUserType = from.dwUserType;
    item->bVisible = from.bVisible;
    item->dwExternalTag = from.dwExternalTag;
    item->dwReserved1 = from.dwReserved1;
    if (bWithReserved16) item->wReserved = from.wReserved;
    Index(item);
    return 1;
}

int CUserListManager::ModifyItemName(std::uint32_t nodeId, const char* name) {
    if (!name) return 0;
    UserItem* item = FirstOfNode(nodeId);
    if (!item) return kNotFound;
    item->strName.CopyFrom(name);
    return 1;
}

int CUserListManager::ModifyItemGrp(std::uint32_t nodeId, std::uint32_t /*groupId*/,
                                    const char* name, const char* label) const {
    if (!name || !label) return 0;
    return FirstOfNode(nodeId) ? 1 : kNotFound;
}

const UserItem* CUserListManager::GetUserItemFromNodeId(std::uint32_t nodeId) const {
    return FirstOfNode(nodeId);
}

const UserItem* CUserListManager::GetUserItemFromUserId(std::uint32_t userId) const {
    const auto found = m_ByUser.find(userId);
    return found == m_ByUser.end() ? nullptr : found->second.front();
}

bool CUserListManager::HasUserOnNode(std::uint32_t userId, std::uint32_t nodeId) const {
    return m_ByUserNode.count(PairKey(userId, nodeId)) != 0;
}

int CUserListManager::GetNodeIdFromUserId(std::uint32_t userId, std::uint32_t& nodeId) const {
    const UserItem* item = GetUserItemFromUserId(userId);
    if (!item) return 0;
    nodeId = item->dwNodeID;
    return 1;
}

int CUserListManager::GetUserIdFromNodeId(std::uint32_t nodeId, std::uint32_t& userId) const {
    const UserItem* item = FirstOfNode(nodeId);
    if (!item) return 0;
    userId = item->dwUserID;
    return 1;
}

const UserItem* CUserListManager::GetHosUser() const {
    if (m_nHosts == 0) return nullptr;
    for (std::int32_t i = 0; i < m_Items.GetCount(); ++i) {
        if (At(i)->dwRoles & kHostBit) return At(i);
    }
    return nullptr;
}

const UserItem* CUserListManager::GetUserItemByIndex(std::uint32_t index) const {
    return index < GetCount() ? At(static_cast<std::int32_t>(index)) : nullptr;
}

UserItem* CUserListManager::FirstOfNode(std::uint32_t nodeId) const {
    const auto found = m_ByNode.find(nodeId);
    return found == m_ByNode.end() ? nullptr : found->second.front();
}

void CUserListManager::Index(UserItem* item) {
    Enter(m_ByNode, item->dwNodeID, item);
    Enter(m_ByUser, item->dwUserID, item);
    Enter(m_ByUserNode, PairKey(item->dwUserID, item->dwNodeID), item);
    if (item->dwRoles & kHostBit) ++m_nHosts;
    if (item->dwRoles & kPrivilegedBits) ++m_nPrivileged;
}

void CUserListManager::Unindex(UserItem* item) {
    Leave(m_ByNode, item->dwNodeID, item);
    Leave(m_ByUser, item->dwUserID, item);
    Leave(m_ByUserNode, PairKey(item->dwUserID, item->dwNodeID), item);
    if (item->dwRoles & kHostBit) --m_nHosts;
    if (item->dwRoles & kPrivilegedBits) --m_nPrivileged;
}

void CUserListManager::Enter(KeyIndex& index, std::uint64_t key, UserItem* item) {
    // Items sharing a key are few; keep them in arrival order so the first stays the answer.
    ItemList& items = index[key];
    const std::uint64_t arrival = m_Arrival.at(item);
    const auto later = std::find_if(items.begin(), items.end(), [&](const UserItem* other) {
        return m_Arrival.at(other) > arrival;
    });
    items.insert(later, item);
}

void CUserListManager::Leave(KeyIndex& index, std::uint64_t key, const UserItem* item) {
    const auto found = index.find(key);
    if (found == index.end()) return;
    ItemList& items = found->second;
    items.erase(std::remove(items.begin(), items.end(), item), items.end());
    if (items.empty()) index.erase(found);
}
