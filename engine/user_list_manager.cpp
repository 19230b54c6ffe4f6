#include "engine/user_list_manager.h"

CUserListManager::~CUserListManager() {
    for (std::int32_t i = m_Items.GetCount() - 1; i >= 0; --i)
        delete At(i);
    m_Items.RemoveAll();
}

int CUserListManager::AddItem(std::unique_ptr<UserItem> item) {
    if (!item) return 0;
    if (!m_Items.Add(item.get())) return 0;
    item.release();
    return 1;
}

int CUserListManager::RemoveItem(std::uint32_t nodeId) {
    const std::int32_t index = IndexOfNode(nodeId);
    if (index < 0) return kNotFound;
    delete At(index);
    m_Items.RemoveAt(index);
    return 1;
}

std::uint32_t CUserListManager::JudgeRosters(std::uint32_t nodeId, std::uint32_t mask,
                                             UserItem* out) const {
    const UserItem* item = GetUserItemFromNodeId(nodeId);
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
    UserItem* item = GetUserItemFromNodeId(nodeId);
    if (!item) return kNotFound;
    item->dwRoles = roles;
    return 1;
}

int CUserListManager::ModifyItemName(std::uint32_t nodeId, const char* name) {
    if (!name) return 0;
    UserItem* item = GetUserItemFromNodeId(nodeId);
    if (!item) return kNotFound;
    item->strName.CopyFrom(name);
    return 1;
}

int CUserListManager::ModifyItemGrp(std::uint32_t nodeId, std::uint32_t /*groupId*/,
                                    const char* name, const char* label) const {
    if (!name || !label) return 0;
    return IndexOfNode(nodeId) >= 0 ? 1 : kNotFound;
}

UserItem* CUserListManager::GetUserItemFromNodeId(std::uint32_t nodeId) {
    return At(IndexOfNode(nodeId));
}

const UserItem* CUserListManager::GetUserItemFromNodeId(std::uint32_t nodeId) const {
    return At(IndexOfNode(nodeId));
}

UserItem* CUserListManager::GetUserItemFromUserId(std::uint32_t userId) {
    return At(IndexOfUser(userId));
}

const UserItem* CUserListManager::GetUserItemFromUserId(std::uint32_t userId) const {
    return At(IndexOfUser(userId));
}

int CUserListManager::GetNodeIdFromUserId(std::uint32_t userId, std::uint32_t& nodeId) const {
    const UserItem* item = GetUserItemFromUserId(userId);
    if (!item) return 0;
    nodeId = item->dwNodeID;
    return 1;
}

int CUserListManager::GetUserIdFromNodeId(std::uint32_t nodeId, std::uint32_t& userId) const {
    const UserItem* item = GetUserItemFromNodeId(nodeId);
    if (!item) return 0;
    userId = item->dwUserID;
    return 1;
}

const UserItem* CUserListManager::GetHosUser() const {
    for (std::int32_t i = 0; i < m_Items.GetCount(); ++i) {
        if (At(i)->dwRoles & 0x1) return At(i);
    }
    return nullptr;
}

UserItem* CUserListManager::GetUserItemByIndex(std::uint32_t index) {
    return index < GetCount() ? At(static_cast<std::int32_t>(index)) : nullptr;
}

const UserItem* CUserListManager::GetUserItemByIndex(std::uint32_t index) const {
    return index < GetCount() ? At(static_cast<std::int32_t>(index)) : nullptr;
}

std::int32_t CUserListManager::IndexOfNode(std::uint32_t nodeId) const {
    for (std::int32_t i = 0; i < m_Items.GetCount(); ++i) {
        if (At(i)->dwNodeID == nodeId) return i;
    }
    return -1;
}

std::int32_t CUserListManager::IndexOfUser(std::uint32_t userId) const {
    for (std::int32_t i = 0; i < m_Items.GetCount(); ++i) {
        if (At(i)->dwUserID == userId) return i;
    }
    return -1;
}
