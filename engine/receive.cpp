// What arrives from the conference service: private data and cache deliveries.
// So far the engine acts on the status-cache answer; chat lines are not shown yet.
#include "engine/chat_client.h"
#include "platform/func_trace.h"
#include "platform/trace.h"

int CChatClient::ApeDataIndication(std::uint32_t, std::uint32_t, std::uint32_t, std::uint16_t,
                                   const void*, std::uint32_t) {
    CFuncTrace trace("CChatClient::ApeDataIndication");
    MacInfoTrace2(kChatTag, "CChatClient::ApeDataIndication");
    return 0;
}

int CChatClient::SharedDataReceived(std::uint32_t, std::uint32_t, std::uint32_t, short) {
    CFuncTrace trace("CChatClient%260sDataReceived", "");
    return 0;
}

int CChatClient::SharedDataReceivedEx(std::uint32_t apeHandle, std::uint32_t cacheId,
                                      std::uint32_t entityId, std::uint32_t memHandle, short result,
                                      tagCacheAction action, std::uint32_t, std::uint32_t,
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
    return 0;
}

void CChatClient::ParseAndShowGroupMessages(CGroupMessagePDU*, std::uint32_t) {}

int CChatClient::ParseAndShowPrivateMessages(CPrivateMessagePDU* pdu, int) {
    return pdu ? -1 : 0;
}
