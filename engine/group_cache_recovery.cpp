#include "engine/group_cache_recovery.h"

#include <algorithm>

#include "engine/chat_data_cmd_process.h"
#include "engine/chat_recovery_mediator.h"
#include "engine/recovered_message_filter.h"
#include "platform/func_trace.h"
#include "platform/trace.h"

namespace {

bool IsLiveAction(tagCacheAction action) {
    return action == CACHE_SET || action == CACHE_APPEND;
}

bool IsRetrievedAction(tagCacheAction action) {
    return action == CACHE_REPLY || action == CACHE_REPLY_ITEM || action == CACHE_REPLY_LAST;
}

bool CacheIdBefore(std::uint32_t cacheId, const std::unique_ptr<CRecoveryGroupMessage>& message) {
    return cacheId < message->GetCacheId();
}

}  // namespace

bool GroupCacheRecovery::IsCollected(std::uint32_t cacheId) const {
    const auto next =
        std::upper_bound(m_Messages.begin(), m_Messages.end(), cacheId, CacheIdBefore);
    return next != m_Messages.begin() && (*(next - 1))->GetCacheId() == cacheId;
}

int GroupCacheRecovery::RecoverGroupMessages(std::uint32_t cacheId, std::uint32_t,
                                             const std::string& text, short, tagCacheAction action,
                                             std::uint32_t senderId) {
    if (!IsLiveAction(action) && !IsRetrievedAction(action)) return 0;
    if (text.empty()) return 0;
    if (m_pMediator && cacheId <= m_pMediator->GetLastGroupCacheId()) return 0;
    if (m_pFilter && m_pFilter->WasGroupMessageShown(m_dwGroupId, cacheId)) return 0;
    if (IsCollected(cacheId)) return 0;

    auto message = std::make_unique<CRecoveryGroupMessage>();
    if (!message->ParseXMLPDU(text)) return 0;
    if (senderId != 0 && senderId != message->GetSendID_DWORD()) {
        if (IsLiveAction(action)) {
            MacWarnTrace2(kChatTag,
                          "CChatClient::SharedDataReceivedEx,CACHE_APPEND or CACHE_SET,Detect "
                          "faked group message, senderId:%ld, senderId in PDU:%ld",
                          static_cast<long>(senderId),
                          static_cast<long>(message->GetSendID_DWORD()));
        } else {
            MacWarnTrace2(kChatTag,
                          "CChatClient::SharedDataReceivedEx,Detect faked group message, "
                          "senderId:%ld, PUD senderId:%ld",
                          static_cast<long>(senderId),
                          static_cast<long>(message->GetSendID_DWORD()));
        }
        return 0;
    }
    message->SetCacheId(cacheId);
    message->Clear();  // the fields are all that is shown later; the document is not kept
    // Before the first message with a greater cache id; equal ids keep their arrival order.
    const auto next =
        std::upper_bound(m_Messages.begin(), m_Messages.end(), cacheId, CacheIdBefore);
    m_Messages.insert(next, std::move(message));
    return 1;
}

void GroupCacheRecovery::ParseAndShowGroupRecoveryMessages() {
    CFuncTrace trace("GroupCacheRecovery::ParseAndShowGroupRecoveryMessages, count = %zu",
                     m_Messages.size());
    for (const auto& message : m_Messages) {
        if (!m_pCmdSink) break;
        if (m_pFilter && !m_pFilter->FirstShowOfGroupMessage(m_dwGroupId, message->GetCacheId()))
            continue;
        // Cache handle 0: the PDU's own group id decides the title.
        m_pCmdSink->ParseAndShowGroupMessages(message.get(), 0);
        if (m_pMediator && m_pMediator->GetCustomerCacheValue() != 0)
            BackupMsg2CustomerCache(*message);
    }
    m_Messages.clear();
}

void GroupCacheRecovery::BackupMsg2CustomerCache(const CRecoveryGroupMessage& message) {
    if (!m_pCmdSink) return;
    CGroupMessagePDU copy;
    copy.SetSendID(message.GetSendID());
    copy.SetGroupID(message.GetGroupID());
    copy.SetGroupCacheId(message.GetCacheId());
    copy.SetMessageContent(message.GetMessageContent());
    copy.GenerateXMLPDU();
    m_pCmdSink->SendCopyToCustomerCache(&copy);
}
