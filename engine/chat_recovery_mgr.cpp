#include "engine/chat_recovery_mgr.h"

#include "engine/chat_data_cmd_process.h"
#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"
#include "platform/func_trace.h"
#include "platform/string_table.h"
#include "platform/trace.h"

namespace {
constexpr std::uint32_t kFeatureGroupMsgRecovery = 0x400;
constexpr std::uint32_t kFeatureWebChatHistoryRecovery = 0x10000;
constexpr std::uint32_t kFeatureQMMode = 0x200000;
// Every retrieval asks for up to this many items.
constexpr short kMaxItems = 255;
}  // namespace

void ChatRecoveryMgr::InitParameters(IChatDataCmdProcess* sink, std::uint32_t features) {
    m_pCmdSink = sink;
    m_bGroupMsgRecovery = (features & kFeatureGroupMsgRecovery) != 0;
    m_bWebChatHistoryRecovery = (features & kFeatureWebChatHistoryRecovery) != 0;
    m_bQMFlag = (features & kFeatureQMMode) != 0;
    m_Mediator.InitParameters(sink);
}

// ---- Starting ----

bool ChatRecoveryMgr::CheckUpdate4CustomRecovery(std::uint32_t userInfoCacheHandle,
                                                 std::uint32_t customerCacheHandle) {
    CFuncTrace trace(
        "ChatRecoveryMgr::CheckUpdate4CustomRecovery, userInfoCache = %u, customerCache = %u",
        userInfoCacheHandle, customerCacheHandle);
    if (!NeedRecoverMsgs() || m_bRecoveryStarted || !m_pCmdSink) return false;
    SetChatRecoveryRequestProcessed(true);
    m_Mediator.SetCustomerCacheValue(customerCacheHandle);

    const int rosterResult = RequestHistoryUserRoster(userInfoCacheHandle);
    if (userInfoCacheHandle == 0 || rosterResult != kArmOk) {
        MacWarnTrace2(kChatTag,
                      "ChatRecoveryMgr: user info cache %u not read (result %d); senders who "
                      "have left stay unnamed",
                      userInfoCacheHandle, rosterResult);
    }
    const int customerResult = RequestCustomerRecovery(customerCacheHandle);
    if (customerCacheHandle == 0 || customerResult != kArmOk) {
        MacWarnTrace2(kChatTag,
                      "ChatRecoveryMgr: customer cache %u not read (result %d); restoring the "
                      "everyone group only",
                      customerCacheHandle, customerResult);
        StartGroupRecovery();
    }
    return true;
}

int ChatRecoveryMgr::RequestHistoryUserRoster(std::uint32_t cacheHandle) {
    if (!m_pCmdSink || cacheHandle == 0) return 0;
    return m_pCmdSink->ChatRequestSharedDataEx(cacheHandle, CACHE_REQUEST_RETRIEVE, kMaxItems);
}

int ChatRecoveryMgr::RequestCustomerRecovery(std::uint32_t cacheHandle) {
    if (!m_pCmdSink || cacheHandle == 0) return 0;
    return m_pCmdSink->ChatRequestSharedDataEx(cacheHandle, CACHE_REQUEST_RETRIEVE, kMaxItems);
}

void ChatRecoveryMgr::StartGroupRecovery() {
    SetIsRestoringCustomerCache(false);
    const std::uint32_t groupId = m_Mediator.GetGroupId();
    const std::uint32_t cacheHandle = m_pCmdSink->GetCacheHandleFormGroupId(groupId);
    const int result = cacheHandle == 0 ? 0
                                        : m_pCmdSink->ChatRequestSharedDataEx(
                                              cacheHandle, CACHE_REQUEST_RETRIEVE, kMaxItems);
    if (cacheHandle == 0 || result != kArmOk) {
        // Without this retrieval no end would ever come; the everyone group goes live now.
        MacWarnTrace2(kChatTag,
                      "ChatRecoveryMgr: cache of group %u (handle %u) not read (result %d); "
                      "recovery ends",
                      groupId, cacheHandle, result);
        EndRecovery();
        return;
    }
    SetIsInGroupCacheRecovery(true);
}

void ChatRecoveryMgr::EndRecovery() {
    // The flags stay as they are while the collected lines are shown, so that their senders
    // are still named from the history roster.
    m_Mediator.ParseAndShowGroupRecoveryMessages();
    SetIsInGroupCacheRecovery(false);
    SetIsRestoringCustomerCache(false);
    m_bRecoveryEnded = true;
    m_Mediator.ForgetShownMessages();
    MacInfoTrace2(kChatTag, "ChatRecoveryMgr: recovery ended");
}

// ---- Deliveries ----

int ChatRecoveryMgr::HandleHistoryUserRoster(std::uint32_t memHandle) {
    std::string text;
    if (!m_pCmdSink || !m_pCmdSink->AllocStringForMemoryHandle(memHandle, text)) return 0;
    return m_Mediator.AddRosterInfoString(text) ? 1 : 0;
}

int ChatRecoveryMgr::HandleCustomerRecovery(std::uint32_t, std::uint32_t, std::uint32_t memHandle,
                                            short result, tagCacheAction action) {
    // Nothing but the retrieval reads this cache; anything after its end is stale.
    if (!IsRecoveryRunning() || m_bInGroupCacheRecovery || !m_pCmdSink) return 1;
    SetIsRestoringCustomerCache(true);
    if (memHandle != 0 && result != kArmRetry) {
        std::string text;
        if (m_pCmdSink->AllocStringForMemoryHandle(memHandle, text))
            m_Mediator.RecoverPrivateMessages(text);
    }
    // Nobody set this customer's cache before: set it now, once, so that it keeps copies.
    if (result == kArmRetry) m_pCmdSink->SetCustomerCache();
    if (IsEndofRetrievedData(action)) StartGroupRecovery();
    return 1;
}

bool ChatRecoveryMgr::CheckUpdate4GroupRecovery(std::uint32_t entityId) {
    if (!IsRecoveryRunning() || !m_pCmdSink || entityId == 0) return false;
    return entityId == m_pCmdSink->GetCacheHandleFormGroupId(m_Mediator.GetGroupId());
}

int ChatRecoveryMgr::HandleGroupRecovery(std::uint32_t cacheId, std::uint32_t entityId,
                                         std::uint32_t memHandle, short result,
                                         tagCacheAction action, std::uint32_t senderId) {
    if (!IsRecoveryRunning() || !m_pCmdSink) return 0;
    std::string text;
    if (memHandle != 0) m_pCmdSink->AllocStringForMemoryHandle(memHandle, text);
    m_Mediator.RecoverGroupMessages(cacheId, entityId, text, result, action, senderId);
    if (m_bInGroupCacheRecovery && IsEndofRetrievedData(action)) EndRecovery();
    return 1;
}

void ChatRecoveryMgr::NoteLiveGroupMessage(std::uint32_t groupId, std::uint32_t cacheId) {
    if (IsRecoveryRunning()) m_Mediator.FirstShowOfGroupMessage(groupId, cacheId);
}

// ---- Names ----

bool ChatRecoveryMgr::ParseGroupSenderName(const CGroupMessagePDU* pdu, std::string& outName) {
    if (!pdu || !NeedRecoverMsgs() || !IsRecoveryRunning()) return false;
    return m_Mediator.GetUserNameFromId(pdu->GetSendID_DWORD(), outName);
}

int ChatRecoveryMgr::ParsePrivateMsgTitle(const CPrivateMessagePDU* pdu, std::string& outTitle) {
    if (!pdu || !NeedRecoverMsgs() || !m_bRestoringCustomerCache) return 0;
    std::string sender;
    std::string receiver;
    m_Mediator.GetUserNameFromId(pdu->GetSendID_DWORD(), sender);
    m_Mediator.GetUserNameFromId(pdu->GetReveID_DWORD(), receiver);
    FormatStringWith2Parameters(GetLocalizedString("from %@ to %@ (privately)"), sender, receiver,
                                outTitle);
    return 1;
}

std::uint32_t ChatRecoveryMgr::GetGroupIdFormCacheHandle(std::uint32_t cacheHandle) {
    return m_pCmdSink ? m_pCmdSink->GetGroupIdFormCacheHandle(cacheHandle) : 0;
}
