#include "engine/private_cache_recovery.h"

#include <algorithm>

#include "engine/chat_data_cmd_process.h"
#include "engine/recovered_message_filter.h"
#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"

namespace {
constexpr std::uint32_t kEveryoneGroupId = 15;
}  // namespace

int PrivateCacheRecovery::RecoverPrivateMessages(const std::string& text) {
    if (text.empty() || !m_pCmdSink) return 0;
    switch (CKvoChatXMLPDU().GetPDUType(text)) {
        case XMLPDU_PRIVATE_MESSAGE:
            return RecoverPrivateMessage(text);
        case XMLPDU_GROUP_MESSAGE:
            return RecoverGroupMessage(text);
        default:
            return 0;
    }
}

int PrivateCacheRecovery::RecoverPrivateMessage(const std::string& text) {
    CPrivateMessagePDU pdu;
    if (!pdu.ParseXMLPDU(text)) return 0;
    if (m_pFilter && !m_pFilter->FirstShowOfPrivateMessage(
                         pdu.GetSendID_DWORD(), pdu.GetReveID_DWORD(), pdu.GetMessageContent()))
        return 0;
    m_pCmdSink->ParseAndShowPrivateMessages(&pdu, 0);
    return 1;
}

int PrivateCacheRecovery::RecoverGroupMessage(const std::string& text) {
    CGroupMessagePDU pdu;
    if (!pdu.ParseXMLPDU(text)) return 0;
    const std::uint32_t groupId = pdu.GetGroupID_DWORD();
    const std::uint32_t cacheId = pdu.GetGroupCacheId_DWORD();
    // Cache ids count per cache: only the everyone group's tell how far its own cache, read
    // next, has been shown already.
    if (groupId == kEveryoneGroupId) m_dwLastGroupCacheId = std::max(m_dwLastGroupCacheId, cacheId);
    if (m_pFilter && !m_pFilter->FirstShowOfGroupMessage(groupId, cacheId)) return 0;
    // Cache handle 0: the PDU's own group id decides the title.
    m_pCmdSink->ParseAndShowGroupMessages(&pdu, 0);
    return 1;
}
