// What arrives from the conference service: private data and cache deliveries. A message is
// checked against the sender the service names before it is shown; live group messages are
// also copied into the customer cache.
#include <string>

#include "engine/chat_client.h"
#include "engine/chat_recovery_mgr.h"
#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"
#include "pdu/xml_limits.h"
#include "platform/func_trace.h"
#include "platform/trace.h"

namespace {

// A sender id of 0 means the service does not say who sent the data.
bool IsForged(std::uint32_t senderId, std::uint32_t pduSendId) {
    return senderId != 0 && senderId != pduSendId;
}

}  // namespace

int CChatClient::ApeDataIndication(std::uint32_t, std::uint32_t senderId, std::uint32_t,
                                   std::uint16_t, const void* data, std::uint32_t length) {
    CFuncTrace trace("CChatClient::ApeDataIndication");
    MacInfoTrace2(kChatTag, "CChatClient::ApeDataIndication");
    if (!data || length == 0) return 0;
    const char* bytes = static_cast<const char*>(data);
    CPrivateMessagePDU pdu;
    // One parse serves the usual case; only what fails is asked for its type.
    if (!pdu.ParseXMLPDU(bytes, length)) {
        if (pdu.GetPDUType(bytes, length) != XMLPDU_PRIVATE_MESSAGE)
            return OnChatDataIndication(senderId, data, length);
        return 0;
    }
    const std::uint32_t pduSendId = pdu.GetSendID_DWORD();
    if (IsForged(senderId, pduSendId)) {
        MacWarnTrace2(kChatTag,
                      "CChatClient::ApeDataIndication,Detect faked private message, senderId:%ld, "
                      "senderId in PDU:%ld",
                      static_cast<long>(senderId), static_cast<long>(pduSendId));
        return 0;
    }
    MacInfoTrace2(
        kChatTag,
        "CChatClient::ApeDataIndication,Didn't detect fake private message, senderId:%ld, "
        "senderId in PDU:%ld",
        static_cast<long>(senderId), static_cast<long>(pduSendId));
    const int shown = ParseAndShowPrivateMessages(&pdu, 0);
    SendCopyToCustomerCache(&pdu);
    return shown;
}

int CChatClient::OnChatDataIndication(std::uint32_t, const void*, std::uint32_t) {
    return 0;
}

int CChatClient::SharedDataReceived(std::uint32_t, std::uint32_t, std::uint32_t, short) {
    CFuncTrace trace("CChatClient%260sDataReceived", "");
    return 0;
}

int CChatClient::SharedDataReceivedEx(std::uint32_t apeHandle, std::uint32_t cacheId,
                                      std::uint32_t entityId, std::uint32_t memHandle, short result,
                                      tagCacheAction action, std::uint32_t senderId, std::uint32_t,
                                      std::uint16_t) {
    if (apeHandle == 0) {
        MacWarnTrace2(kChatTag, "CChatClient::SharedDataReceivedEx,ape_handle = NULL");
        return 0;
    }
    MacInfoTrace2(kChatTag,
                  "CChatClient::SharedDataReceivedEx ape_handle = %x, cache_id = %d, entity_id = "
                  "%d,mem_handle = %x, result = %d, cache_action= %d----/",
                  apeHandle, cacheId, entityId, memHandle, result, action);
    if (entityId != 0 && entityId == m_ChatStatusCacheHandle.handle_value) {
        OnChatStatusCacheAnswer(memHandle, result, action);
        return 1;
    }
    if (m_pRecoveryMgr && m_pRecoveryMgr->NeedRecoverMsgs()) {
        if (entityId != 0 && entityId == m_UserInfoCacheHandle.handle_value)
            return m_pRecoveryMgr->HandleHistoryUserRoster(memHandle);
        if (entityId != 0 && entityId == m_CustomerCacheHandle.handle_value)
            return m_pRecoveryMgr->HandleCustomerRecovery(cacheId, entityId, memHandle, result,
                                                          action);
        if (m_pRecoveryMgr->CheckUpdate4GroupRecovery(entityId))
            return m_pRecoveryMgr->HandleGroupRecovery(cacheId, entityId, memHandle, result, action,
                                                       senderId);
    }
    switch (action) {
        case CACHE_SET:
        case CACHE_APPEND:
            return OnGroupDelivery(cacheId, entityId, memHandle, senderId, true);
        case CACHE_REPLY:
        case CACHE_REPLY_ITEM:
        case CACHE_REPLY_LAST:
            return OnGroupDelivery(cacheId, entityId, memHandle, senderId, false);
        default:
            MacWarnTrace2(kChatTag, "CChatClient::SharedDataReceivedEx,!bParseData");
            return 1;
    }
}

int CChatClient::OnGroupDelivery(std::uint32_t cacheId, std::uint32_t entityId,
                                 std::uint32_t memHandle, std::uint32_t senderId, bool bLive) {
    std::uint32_t size = 0;
    if (memHandle == 0 || !m_pArmClient ||
        m_pArmClient->GetMemHandleSize(memHandle, &size) != kArmOk || size == 0)
        return 0;
    // No chat document is longer; a larger item is not read at all.
    if (size > kMaxXmlBytes) {
        MacWarnTrace2(kChatTag, "CChatClient::SharedDataReceivedEx, item of %u bytes dropped",
                      size);
        return 0;
    }
    std::string bytes(size, '\0');
    if (!ParseATMemHandle(memHandle, &bytes[0], &size)) return 0;
    bytes.resize(size);

    CGroupMessagePDU pdu;
    if (!pdu.ParseXMLPDU(bytes)) {
        // A group cache also holds the group's description: that is no message and no fault.
        if (pdu.GetPDUType(bytes) == XMLPDU_GROUP_INFO) return 1;
        MacWarnTrace2(kChatTag,
                      "CChatClient::SharedDataReceivedEx, unreadable item dropped, cache_id = %d",
                      cacheId);
        return 0;
    }
    const std::uint32_t pduSendId = pdu.GetSendID_DWORD();
    const long sender = static_cast<long>(senderId);
    const long inPdu = static_cast<long>(pduSendId);
    const bool forged = IsForged(senderId, pduSendId);
    if (bLive && forged) {
        MacWarnTrace2(kChatTag,
                      "CChatClient::SharedDataReceivedEx,CACHE_APPEND or CACHE_SET,Detect faked "
                      "group message, senderId:%ld, senderId in PDU:%ld",
                      sender, inPdu);
    } else if (bLive) {
        MacInfoTrace2(kChatTag,
                      "CChatClient::SharedDataReceivedEx,CACHE_APPEND or CACHE_SET,Didn't detect "
                      "fake group message, senderId:%ld, senderId in PDU:%ld",
                      sender, inPdu);
    } else if (forged) {
        MacWarnTrace2(kChatTag,
                      "CChatClient::SharedDataReceivedEx,Detect faked group message, "
                      "senderId:%ld, PUD senderId:%ld",
                      sender, inPdu);
    } else {
        MacInfoTrace2(kChatTag,
                      "CChatClient::SharedDataReceivedEx,Didn't detect fake group message, "
                      "senderId:%ld, PUD senderId:%ld",
                      sender, inPdu);
    }
    if (forged) return 0;
    ParseAndShowGroupMessages(&pdu, entityId);
    if (!bLive) return 1;
    CacheGroupMsg2CustomerCache(&pdu, cacheId);
    // A restored copy of this line must not show it a second time.
    if (m_pRecoveryMgr && m_pRecoveryMgr->IsRecoveryRunning()) {
        const std::uint32_t groupId =
            entityId != 0 ? GetGroupIdFormCacheHandle(entityId) : pdu.GetGroupID_DWORD();
        m_pRecoveryMgr->NoteLiveGroupMessage(groupId, cacheId);
    }
    return 1;
}

void CChatClient::CacheGroupMsg2CustomerCache(const CGroupMessagePDU* pdu, std::uint32_t cacheId) {
    if (!pdu || m_CustomerCacheHandle.handle_value == 0) return;
    CGroupMessagePDU copy;
    copy.SetSendID(pdu->GetSendID());
    copy.SetSenderName(pdu->GetSenderName());
    copy.SetGroupID(pdu->GetGroupID());
    copy.SetReceiverName(pdu->GetReceiverName());
    copy.SetMessageContent(pdu->GetMessageContent());
    copy.SetGroupCacheId(cacheId);
    copy.GenerateXMLPDU();
    SendCopyToCustomerCache(&copy);
}
