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
    // Most entries are copies of group lines: read as one first. A text of another kind fails
    // the type check, which leaves the type the text names in the PDU, so no entry is parsed
    // more than twice and none only to learn its type.
    CGroupMessagePDU group;
    if (group.ParseXMLPDU(text)) return ShowGroupMessage(group);
    if (group.GetMainType_Int() != XMLPDU_PRIVATE_MESSAGE) return 0;
    CPrivateMessagePDU pdu;
    if (!pdu.ParseXMLPDU(text)) return 0;
    if (m_pFilter && !m_pFilter->FirstShowOfPrivateMessage(
                         pdu.GetSendID_DWORD(), pdu.GetReveID_DWORD(), pdu.GetMessageContent()))
        return 0;
    m_pCmdSink->ParseAndShowPrivateMessages(&pdu, 0);
    return 1;
}

int PrivateCacheRecovery::ShowGroupMessage(CGroupMessagePDU& pdu) {
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
