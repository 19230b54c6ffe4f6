// Shared-data caches and named handles: one cache per send-to group plus the user-info,
// status and customer caches; who initialises them, who subscribes to which, and the
// memory handles every write and read goes through.
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include "engine/chat_client.h"
#include "engine/chat_recovery_mgr.h"
#include "pdu/chat_user_info_pdu.h"
#include "pdu/group_info_pdu.h"
#include "pdu/xml_limits.h"
#include "platform/func_trace.h"
#include "platform/trace.h"

namespace {

// Flags passed with the writes of this file.
constexpr std::uint32_t kStatusCacheFlags = 0x1000000;
constexpr std::uint32_t kCacheFlags = 0x2000000;
constexpr std::uint32_t kRecordFlags = 0x90;
// Every retrieval and subscription asks for up to this many items.
constexpr std::uint32_t kMaxItems = 255;
// Group ids above this are not group cache names (a customer id, for instance).
constexpr std::uint32_t kMaxCacheGroupId = 4096;
// The group id GetCacheHandleFromGroupId never matches.
constexpr std::uint32_t kReservedGroupId = 4096;

// A cache is initialised with two zero bytes; the status cache is marked with "1" and its NUL.
const std::string kEmptyCacheBytes(2, '\0');
const std::string kStatusMarkBytes("1", 2);

// Copies name into a NameHandle, cut at 64 bytes and NUL-padded.
void SetHandleName(NameHandle& handle, const std::string& name) {
    std::memset(handle.name, 0, sizeof handle.name);
    std::memcpy(handle.name, name.data(), std::min(name.size(), sizeof handle.name));
}

// True when the 64-byte name equals the handle's name (compared over at most 64 bytes).
bool SameHandleName(const NameHandle& handle, const char* name) {
    return std::strncmp(handle.name, name, sizeof handle.name) == 0;
}

// A name as it stands in a NameHandle: at most 64 bytes, not necessarily terminated.
std::string HandleName(const NameHandle& handle) {
    return std::string(handle.name, strnlen(handle.name, sizeof handle.name));
}

bool IsCacheGroup(const CUsersGroup* group) {
    return group && group->GetGroupType() != 2;
}

}  // namespace

// ---- Named handles ----

int CChatClient::AllocAllNeededCacheHandle() {
    CFuncTrace trace("CChatClient::AllocAllNeededCacheHandle");
    if (!m_pArmClient || !m_pRecoveryMgr || m_GroupList.GetGroupsCount() == 0) return 0;

    const std::string prefix = std::to_string(m_dwSessionValue);
    std::vector<const CUsersGroup*> cacheGroups;
    for (std::int32_t i = 0; i < m_GroupList.GetGroupsCount(); ++i) {
        const CUsersGroup* group = m_GroupList.GetGroupByIndex(i);
        if (IsCacheGroup(group)) cacheGroups.push_back(group);
    }
    if (cacheGroups.empty()) return 0;
    const std::uint32_t customerId = m_pRecoveryMgr->GetCustomerId();

    std::vector<NameHandle> entries(cacheGroups.size() + 2 + (customerId != 0 ? 1 : 0));
    std::size_t n = 0;
    for (const CUsersGroup* group : cacheGroups)
        SetHandleName(entries[n++], prefix + "_chat_cache_" + std::to_string(group->GetGroupId()));
    // The engine keeps the bookkeeping names to recognise their handles in the answer; the
    // request carries the names only, never a handle known from an earlier answer.
    const auto addBookkeeping = [&entries, &n](NameHandle& field, const std::string& name) {
        SetHandleName(field, name);
        SetHandleName(entries[n++], name);
    };
    addBookkeeping(m_UserInfoCacheHandle, prefix + "_Chat_User_Info");
    if (customerId != 0)
        addBookkeeping(m_CustomerCacheHandle, "switch_cache_" + std::to_string(customerId));
    addBookkeeping(m_ChatStatusCacheHandle, prefix + "_chat_status");

    m_pArmClient->AllocNameHandle(m_dwApeHandle, static_cast<std::uint32_t>(entries.size()),
                                  entries.data(), this);
    return 1;
}

int CChatClient::AllocNameHandleConfirm(std::uint32_t apeHandle, std::uint32_t count,
                                        NameHandle* handles, short result, std::uint32_t) {
    CFuncTrace trace(
        "CChatClient::AllocNameHandleConfirm ape_handle = 0x%x, handle_count = %d, result = %d "
        "----/",
        apeHandle, count, result);
    if (count == 0 || !handles) return 0;
    for (std::uint32_t i = 0; i < count; ++i) {
        const NameHandle& entry = handles[i];
        const std::string name = HandleName(entry);
        const std::uint32_t groupId = GetGroupIdFormCacheName(name.c_str());
        // A short customer id makes the customer cache's name read like a group cache's: the
        // name the engine asked for decides first.
        if (m_CustomerCacheHandle.name[0] != '\0' &&
            SameHandleName(m_CustomerCacheHandle, name.c_str())) {
            m_CustomerCacheHandle.handle_value = entry.handle_value;
        } else if (groupId != 0) {
            for (std::int32_t g = 0; g < m_GroupList.GetGroupsCount(); ++g) {
                CUsersGroup* group = m_GroupList.GetGroupByIndex(g);
                if (!IsCacheGroup(group) || group->GetGroupId() != groupId) continue;
                group->SetCacheName(name.c_str());
                group->SetCacheHandle(entry.handle_value);
                break;
            }
        } else if (SameHandleName(m_UserInfoCacheHandle, name.c_str())) {
            m_UserInfoCacheHandle.handle_value = entry.handle_value;
        } else if (SameHandleName(m_ChatStatusCacheHandle, name.c_str())) {
            m_ChatStatusCacheHandle.handle_value = entry.handle_value;
        }
    }
    if (m_ChatStatusCacheHandle.handle_value != 0) CheckChatStatus();
    return 1;
}

void CChatClient::CheckChatStatus() {
    CFuncTrace trace("CChatClient::CheckChatStatus");
    if (!m_pArmClient) return;
    m_pArmClient->ApeRequestSharedDataEx(m_dwApeHandle, m_ChatStatusCacheHandle.handle_value, 0,
                                         CACHE_REQUEST_RETRIEVE, kMaxItems, this);
}

// ---- Initialising and marking the caches ----

void CChatClient::OnChatStatusCacheAnswer(std::uint32_t memHandle, short result,
                                          tagCacheAction action) {
    MacInfoTrace2(kChatTag, "CChatClient::SharedDataReceivedEx chat status cache ----/");
    if (action != CACHE_REPLY_LAST) return;
    if (result == kArmRetry) {
        MacWarnTrace2(kChatTag,
                      "CChatClient::SharedDataReceivedEx:entity_id == "
                      "m_ChatStatusCacheHandle.handle_value,result =%d",
                      result);
    } else if (result != kArmOk) {
        return;
    } else {
        std::string status;
        if (memHandle != 0 && AllocStringForMemoryHandle(memHandle, status) && !status.empty()) {
            // Somebody initialised the caches already: only join them.
            SetAllGroupCacheSetFlag();
            // The customer cache is not set here: it holds everybody's history, which a set
            // would wipe just before recovery reads it. Recovery sets it when it finds that
            // nobody ever did.
            if (m_pRecoveryMgr &&
                m_pRecoveryMgr->CheckUpdate4CustomRecovery(m_UserInfoCacheHandle.handle_value,
                                                           m_CustomerCacheHandle.handle_value))
                MacInfoTrace2(kChatTag, "Start recovery customer cache data......");
            SendOwnUserInfoToCache();
            SubscribeAllGroupCaches();
            return;
        }
    }
    m_bInitCaches = 1;
    SetAllCaches();
}

void CChatClient::SetAllCaches() {
    CFuncTrace trace("CChatClient::SetAllCaches");
    // One block of two zero bytes serves every cache, and is freed only after the customer
    // cache (which takes a block of its own) is set too.
    std::uint32_t size = static_cast<std::uint32_t>(kEmptyCacheBytes.size());
    const std::uint32_t mem = GetATMemHandle(size, kEmptyCacheBytes.data());
    if (mem != 0) {
        const auto set = [this, mem](std::uint32_t cacheHandle) {
            if (cacheHandle == 0) return;
            m_pArmClient->ApeSharedDataActionEx(m_dwApeHandle, cacheHandle, 0, 0, CACHE_SET,
                                                kCacheFlags, mem, 0, 1);
        };
        set(m_UserInfoCacheHandle.handle_value);
        for (std::int32_t i = 0; i < m_GroupList.GetGroupsCount(); ++i) {
            const CUsersGroup* group = m_GroupList.GetGroupByIndex(i);
            if (IsCacheGroup(group)) set(group->GetCacheHandle());
        }
    }
    if (m_pRecoveryMgr && m_pRecoveryMgr->GetCustomerId() != 0) SetCustomerCache();
    m_bInitCaches = 0;
    if (mem != 0) m_pArmClient->FreeMemHandle(mem);
}

void CChatClient::SetChatStatusCache() {
    WriteToCache(m_ChatStatusCacheHandle.handle_value, CACHE_SET, kStatusMarkBytes,
                 kStatusCacheFlags);
}

void CChatClient::SetCustomerCache() {
    if (m_dwApeHandle == 0) return;
    WriteToCache(m_CustomerCacheHandle.handle_value, CACHE_SET, kEmptyCacheBytes, kCacheFlags);
}

int CChatClient::SendOwnUserInfoToCache() {
    if (!m_pArmClient || m_dwApeHandle == 0 || m_UserInfoCacheHandle.handle_value == 0 ||
        m_dwMyUserID == 0 || m_strMyName.empty())
        return 0;
    CChatUserInfoPDU pdu;
    pdu.SetUserID(m_dwMyUserID);
    pdu.SetUserName(m_strMyName);
    pdu.SetUserExternalTag(m_dwUserExternalTag);
    pdu.GenerateXMLPDU();
    return WriteToCache(m_UserInfoCacheHandle.handle_value, CACHE_APPEND, pdu.ToWireText(),
                        kCacheFlags)
               ? 1
               : 0;
}

bool CChatClient::WriteToCache(std::uint32_t cacheHandle, tagCacheAction action,
                               const std::string& bytes, std::uint32_t flags) {
    if (!m_pArmClient || cacheHandle == 0) return false;
    std::uint32_t size = static_cast<std::uint32_t>(bytes.size());
    const std::uint32_t mem = GetATMemHandle(size, bytes.data());
    if (mem == 0) return false;
    m_pArmClient->ApeSharedDataActionEx(m_dwApeHandle, cacheHandle, 0, 0, action, flags, mem, 0, 1);
    m_pArmClient->FreeMemHandle(mem);
    return true;
}

void CChatClient::SetAllGroupCacheSetFlag() {
    MacInfoTrace2(kChatTag, "CChatClient::SetAllGroupCacheSetFlag()");
    for (std::int32_t i = 0; i < m_GroupList.GetGroupsCount(); ++i) {
        CUsersGroup* group = m_GroupList.GetGroupByIndex(i);
        if (IsCacheGroup(group)) group->SetCacheSet(1);
    }
}

void CChatClient::SendCopyToCustomerCache(CKvoChatXMLPDU* pdu) {
    if (!pdu || m_CustomerCacheHandle.handle_value == 0 || !m_pArmClient || m_dwApeHandle == 0)
        return;
    WriteToCache(m_CustomerCacheHandle.handle_value, CACHE_APPEND, pdu->ToWireText(), kCacheFlags);
}

int CChatClient::ApeCacheActionConfirmEx(std::uint32_t apeHandle, std::uint32_t entityId,
                                         tagCacheAction action, std::uint32_t requestIdx,
                                         std::uint32_t cacheId, short result) {
    CFuncTrace trace(
        "CChatClient::ApeCacheActionConfirmEx,ape_handle = %d, entity_id = %d, cache_action = "
        "%d, request_idx = %d, cache_id = %d, result = %d",
        apeHandle, entityId, action, requestIdx, cacheId, result);
    if (apeHandle == 0 || entityId == 0 || action != CACHE_SET || result != kArmOk) return 0;
    const bool recovering = m_pRecoveryMgr && m_pRecoveryMgr->NeedRecoverMsgs();
    if (entityId == m_UserInfoCacheHandle.handle_value) {
        SetChatStatusCache();
        SendOwnUserInfoToCache();
        if (recovering) {
            SubscribeGroupCache(GROUP_EVERYONE, CACHE_REQUEST_SUBSCRIBE);
        } else {
            SubscribeAllGroupCaches();
            ReSubscribeGroupCaches();
        }
    } else if (entityId == m_ChatStatusCacheHandle.handle_value) {
        SetAllGroupCacheSetFlag();
        if (recovering) {
            SubscribeGroupCache(GROUP_EVERYONE, CACHE_REQUEST_SUBSCRIBE);
        } else {
            SubscribeAllGroupCaches();
        }
    }
    return 0;
}

// ---- Subscriptions ----

int CChatClient::SubscribeGroupCache(std::uint32_t groupId, tagCacheRequestType type) {
    CFuncTrace trace("CChatClient::SubscribeGroupCache , dwGroupID = %d, enumRequestType = %d",
                     groupId, type);
    if (m_dwApeHandle == 0 || !m_pArmClient) return 0;
    CUsersGroup* group = FindCacheGroup(groupId);
    const std::uint32_t handle = group ? group->GetCacheHandle() : 0;
    if (handle == 0) return 0;
    if (!group->IsCacheSet() ||
        (group->IsSubscribed() && group->GetRequestType() == static_cast<int>(type))) {
        MacWarnTrace2(kChatTag,
                      "CChatClient::SubscribeGroupCache , dwGroupID=%d, dwGroupCacheHandle = %d, "
                      "bSubscribed = %d, bCacheSet = %d",
                      groupId, handle, group->IsSubscribed(), group->IsCacheSet());
        return 0;
    }
    if (m_pArmClient->ApeRequestSharedDataEx(m_dwApeHandle, handle, 0, type, kMaxItems, this) !=
        kArmOk) {
        MacWarnTrace2(kChatTag,
                      "CChatClient::SubscribeGroupCache ApeRequestSharedDataEx return !0");
    } else {
        group->SetSubscribed(1);
        group->SetRequestType(type);
    }
    return 1;
}

int CChatClient::UnSubscribeGroupCache(std::uint32_t groupId) {
    CFuncTrace trace("CChatClient::UnSubscribeGroupCache , dwGroupID = %d", groupId);
    if (m_dwApeHandle == 0 || !m_pArmClient) return 0;
    CUsersGroup* group = FindCacheGroup(groupId);
    const std::uint32_t handle = group ? group->GetCacheHandle() : 0;
    if (handle == 0) return 0;
    if (!group->IsSubscribed() || !group->IsCacheSet()) {
        MacWarnTrace2(kChatTag,
                      "CChatClient::UnSubscribeGroupCache , dwGroupID=%d, dwGroupCacheHandle = "
                      "%d, bSubscribed = %d, bCacheSet = %d",
                      groupId, handle, group->IsSubscribed(), group->IsCacheSet());
        return 0;
    }
    if (m_pArmClient->ApeRequestSharedDataEx(m_dwApeHandle, handle, 0, CACHE_REQUEST_UNSUBSCRIBE,
                                             kMaxItems, this) != kArmOk) {
        MacWarnTrace2(kChatTag,
                      "CChatClient::UnSubscribeGroupCache ApeRequestSharedDataEx return !0");
    } else {
        group->SetSubscribed(0);
        group->SetRequestType(CACHE_REQUEST_UNSUBSCRIBE);
    }
    return 1;
}

void CChatClient::SubscribeAllGroupCaches() {
    CFuncTrace trace("CChatClient::SubscribeAllGroupCaches");
    const bool host = m_dwMyNodeID == m_dwHostID;
    const bool presenter = m_dwMyNodeID == m_dwPresenterID;
    const bool panelist = (m_dwMyRosters & ROLE_PANELIST) != 0;
    SubscribeGroupCache(GROUP_EVERYONE, CACHE_REQUEST_SUBSCRIBE);
    for (std::uint32_t id : {GROUP_HOST_PRESENTER, GROUP_PANELISTS, GROUP_HOST_PRESENTER_PANELISTS,
                             GROUP_ATTENDEES, GROUP_HOST, GROUP_PRESENTER})
        UnSubscribeGroupCache(id);
    if (!presenter && !host && !panelist)
        SubscribeGroupCache(GROUP_ATTENDEES, CACHE_REQUEST_SUBSCRIBE);
    if (host) {
        for (std::uint32_t id :
             {GROUP_HOST, GROUP_PANELISTS, GROUP_HOST_PRESENTER, GROUP_HOST_PRESENTER_PANELISTS})
            SubscribeGroupCache(id, CACHE_REQUEST_SUBSCRIBE);
    }
    if (presenter) {
        SubscribeGroupCache(GROUP_PRESENTER, CACHE_REQUEST_SUBSCRIBE);
        SubscribeGroupCache(GROUP_PANELISTS, CACHE_REQUEST_SUBSCRIBE);
        if (!host) {
            SubscribeGroupCache(GROUP_HOST_PRESENTER, CACHE_REQUEST_SUBSCRIBE);
            SubscribeGroupCache(GROUP_HOST_PRESENTER_PANELISTS, CACHE_REQUEST_SUBSCRIBE);
        }
    }
    if (panelist || presenter || host) {
        SubscribeGroupCache(GROUP_PANELISTS, CACHE_REQUEST_SUBSCRIBE);
        SubscribeGroupCache(GROUP_HOST_PRESENTER_PANELISTS, CACHE_REQUEST_SUBSCRIBE);
    }
}

void CChatClient::ReSubscribeGroupCaches() {
    CFuncTrace trace("CChatClient::ReSubscribeGroupCaches");
    const bool wasPresenter = (m_dwPrevMyRole & 0x1) != 0;
    const bool wasHost = (m_dwPrevMyRole & 0x2) != 0;
    const bool host = m_dwMyNodeID == m_dwHostID;
    const bool presenter = m_dwMyNodeID == m_dwPresenterID;
    bool subscribedBoth = false;

    SubscribeGroupCache(GROUP_EVERYONE, CACHE_REQUEST_SUBSCRIBE);
    if (!host && !presenter && (wasPresenter || wasHost))
        SubscribeGroupCache(GROUP_ATTENDEES, CACHE_REQUEST_SUBSCRIBE);
    if ((host || presenter) && !wasPresenter && !wasHost) UnSubscribeGroupCache(GROUP_ATTENDEES);
    if (host && !wasHost) {
        SubscribeGroupCache(GROUP_HOST, CACHE_REQUEST_SUBSCRIBE);
        if (!wasPresenter) {
            SubscribeGroupCache(GROUP_HOST_PRESENTER, CACHE_REQUEST_SUBSCRIBE);
            subscribedBoth = true;
        }
    }
    if (!host && wasHost) {
        UnSubscribeGroupCache(GROUP_HOST);
        if (wasPresenter && !presenter) UnSubscribeGroupCache(GROUP_HOST_PRESENTER);
    }
    if (presenter && !wasPresenter) {
        SubscribeGroupCache(GROUP_PRESENTER, CACHE_REQUEST_SUBSCRIBE);
        if (!subscribedBoth && !wasHost)
            SubscribeGroupCache(GROUP_HOST_PRESENTER, CACHE_REQUEST_SUBSCRIBE);
    }
    if (!presenter && wasPresenter) UnSubscribeGroupCache(GROUP_PRESENTER);
}

void CChatClient::SubscribeAndRetriveGroupAllUsersGroupCache() {
    SubscribeGroupCache(GROUP_EVERYONE, CACHE_REQUEST_SUBSCRIBE);
}

bool CChatClient::GetGroupCacheStatus(std::uint32_t groupId, int& subscribed, int& requestType,
                                      int& cacheSet) {
    const CUsersGroup* group = FindCacheGroup(groupId);
    if (!group) return false;
    subscribed = group->IsSubscribed();
    requestType = group->GetRequestType();
    cacheSet = group->IsCacheSet();
    return true;
}

void CChatClient::SetGroupCacheStatus(std::uint32_t groupId, int subscribed, int requestType) {
    if (CUsersGroup* group = FindCacheGroup(groupId)) {
        group->SetSubscribed(subscribed);
        group->SetRequestType(requestType);
    }
}

// ---- Group info ----

void CChatClient::SetNeedSendGroupInfoStatus(std::uint32_t groupId, int status) {
    CFuncTrace trace("CChatClient::SetNeedSendGroupInfoStatus , dwGroupId = %d, bStatus = %d",
                     groupId, status);
    if (CUsersGroup* group = FindCacheGroup(groupId)) group->SetNeedSendGroupInfo(status);
}

bool CChatClient::GetNeedSendGroupInfoStatus(std::uint32_t groupId) {
    const CUsersGroup* group = FindCacheGroup(groupId);
    return group && group->GetNeedSendGroupInfo() != 0;
}

void CChatClient::SetAllCacheSendGroupInfoStatus(int status) {
    CFuncTrace trace("CChatClient::SetAllCacheSendGroupInfoStatus, bStatus = %d", status);
    for (std::int32_t i = 0; i < m_GroupList.GetGroupsCount(); ++i)
        if (CUsersGroup* group = m_GroupList.GetGroupByIndex(i))
            group->SetNeedSendGroupInfo(status);
}

int CChatClient::SendGroupInfoToCache(std::uint32_t groupId) {
    CFuncTrace trace("CChatClient::SendGroupInfoToCache, dwGroupID = %d", groupId);
    const CUsersGroup* group = FindCacheGroup(groupId);
    if (!group || group->GetCacheHandle() == 0 || !group->GetGrpName()) return 1;
    return SendGroupInfoToCache(groupId, group->GetGrpName());
}

int CChatClient::SendGroupInfoToCache(std::uint32_t groupId, const char* groupName) {
    CFuncTrace trace("CChatClient::SendGroupInfoToCache, dwGroupId = %d, lpszGroupName = %s",
                     groupId, groupName ? groupName : "");
    if (!groupName || !m_pArmClient || m_dwApeHandle == 0) return 0;
    const std::uint32_t handle = GetCacheHandleFormGroupId(groupId);
    CGroupInfoPDU pdu;
    pdu.SetGroupHandle(handle);
    pdu.SetGroupName(groupName);
    pdu.GenerateXMLPDU();
    const std::uint32_t flags = kCacheFlags | (IsRecording() ? kRecordFlags : 0);
    return WriteToCache(handle, CACHE_APPEND, pdu.ToWireText(), flags) ? 1 : 0;
}

bool CChatClient::IsRecording() const {
    return (m_dwFeatures & FEATURE_ALWAYS_RECORD) != 0 || m_dwNBRStatus == 0 || m_dwNBRStatus == 3;
}

// ---- Lookups ----

CUsersGroup* CChatClient::FindCacheGroup(std::uint32_t groupId) {
    for (std::int32_t i = 0; i < m_GroupList.GetGroupsCount(); ++i) {
        CUsersGroup* group = m_GroupList.GetGroupByIndex(i);
        if (IsCacheGroup(group) && group->GetGroupId() == groupId) return group;
    }
    return nullptr;
}

std::uint32_t CChatClient::GetGroupIdFormCacheName(const char* cacheName) {
    CFuncTrace trace("CChatClient::GetGroupIdFromCacheName, cacheName = %s",
                     cacheName ? cacheName : "");
    if (!cacheName) return 0;
    const char* underscore = std::strrchr(cacheName, '_');
    if (!underscore) return 0;
    char digits[9] = {};
    std::strncpy(digits, underscore + 1, 8);
    const unsigned long id = std::strtoul(digits, nullptr, 10);
    return id > kMaxCacheGroupId ? 0 : static_cast<std::uint32_t>(id);
}

std::uint32_t CChatClient::GetGroupIdFormCacheHandle(std::uint32_t cacheHandle) {
    CFuncTrace trace("CChatClient::GetGroupIdFromCacheHandle, handle = %d", cacheHandle);
    if (cacheHandle == 0) return 0;
    for (std::int32_t i = 0; i < m_GroupList.GetGroupsCount(); ++i) {
        const CUsersGroup* group = m_GroupList.GetGroupByIndex(i);
        if (IsCacheGroup(group) && group->GetCacheHandle() == cacheHandle)
            return group->GetGroupId();
    }
    return 0;
}

std::uint32_t CChatClient::GetCacheHandleFormGroupId(std::uint32_t groupId) {
    const CUsersGroup* group = FindCacheGroup(groupId);
    return group ? group->GetCacheHandle() : 0;
}

std::uint32_t CChatClient::GetCacheHandleFromGroupId(std::uint32_t groupId) {
    return groupId == kReservedGroupId ? 0 : GetCacheHandleFormGroupId(groupId);
}

const char* CChatClient::GetGroupNameFromGroupCacheHandle(std::uint32_t cacheHandle) {
    CFuncTrace trace("CChatClient::GetGroupNameFromGroupCacheHandle, dwCacheHandle = %d",
                     cacheHandle);
    if (cacheHandle == 0) return nullptr;
    for (std::int32_t i = 0; i < m_GroupList.GetGroupsCount(); ++i) {
        const CUsersGroup* group = m_GroupList.GetGroupByIndex(i);
        if (!IsCacheGroup(group) || group->GetCacheHandle() != cacheHandle) continue;
        MacInfoTrace2(kChatTag, "GroupName is %s", group->GetGrpName() ? group->GetGrpName() : "");
        return group->GetGrpName();
    }
    return nullptr;
}

int CChatClient::GetUserNameFromId(std::uint32_t userId, std::string& out) {
    int found = 0;
    if (userId == m_dwMyUserID) {
        out = m_strMyName;
        found = 1;
    } else if (const UserItem* user = m_UserList.GetUserItemFromUserId(userId)) {
        out = user->strName.GetData() ? user->strName.GetData() : "";
        found = 1;
    }
    CFuncTrace trace("CChatClient::GetUserNameFromId, userId = %d, outName = %s", userId,
                     out.c_str());
    return found;
}

// ---- Memory handles ----

std::uint32_t CChatClient::GetATMemHandle(std::uint32_t& size, const void* data) {
    if (!m_pArmClient) return 0;
    std::uint32_t handle = 0;
    if (m_pArmClient->AllocMemHandle(size, &handle) != kArmOk || handle == 0) return 0;
    if (m_pArmClient->WriteMemHandle(handle, 0, data, &size) != kArmOk) {
        m_pArmClient->FreeMemHandle(handle);
        return 0;
    }
    return handle;
}

int CChatClient::ParseATMemHandle(std::uint32_t memHandle, char* buffer, std::uint32_t* size) {
    if (memHandle == 0 || !m_pArmClient || !buffer || !size) return 0;
    std::uint32_t available = 0;
    if (m_pArmClient->GetMemHandleSize(memHandle, &available) != kArmOk) return 0;
    // Never more than the caller's buffer holds, nor more than the handle has.
    std::uint32_t toRead = std::min(available, *size);
    if (m_pArmClient->ReadMemHandle(memHandle, 0, buffer, &toRead) != kArmOk) return 0;
    *size = toRead;
    return 1;
}

std::uint32_t CChatClient::AllocAsciiStringForMemoryHandle(std::uint32_t memHandle, char*& out) {
    out = nullptr;
    if (!m_pArmClient) return 0;
    std::uint32_t size = 0;
    if (m_pArmClient->GetMemHandleSize(memHandle, &size) != kArmOk || size == 0) return 0;
    // Nothing the engine stores in a cache is longer than a chat document: a larger size is
    // not allocated.
    if (size > kMaxXmlBytes) {
        MacWarnTrace2(kChatTag, "CChatClient::AllocAsciiStringForMemoryHandle, %u bytes refused",
                      size);
        return 0;
    }
    std::unique_ptr<char[]> buffer(new char[size + 1]());
    std::uint32_t read = size;
    if (m_pArmClient->ReadMemHandle(memHandle, 0, buffer.get(), &read) != kArmOk) return 0;
    out = buffer.release();
    return std::min(read, size);
}

bool CChatClient::AllocStringForMemoryHandle(std::uint32_t memHandle, std::string& out) {
    char* buffer = nullptr;
    const std::uint32_t size = AllocAsciiStringForMemoryHandle(memHandle, buffer);
    const std::unique_ptr<char[]> owned(buffer);
    if (size == 0) return false;
    out.assign(buffer, size);
    return true;
}

int CChatClient::ChatRequestSharedDataEx(std::uint32_t cacheHandle, tagCacheRequestType type,
                                         short) {
    CFuncTrace trace("CChatClient::ChatRequestSharedDataEx");
    if (m_ChatStatusCacheHandle.handle_value == 0 || !m_pArmClient || m_dwApeHandle == 0) return 0;
    return m_pArmClient->ApeRequestSharedDataEx(m_dwApeHandle, cacheHandle, 0, type, kMaxItems,
                                                this);
}
