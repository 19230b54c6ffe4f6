#include "engine/private_cache_recovery.h"

#include <algorithm>

#include "engine/chat_data_cmd_process.h"
#include "engine/recovered_message_filter.h"
#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"

namespace {

constexpr std::uint32_t kEveryoneGroupId = 15;

// The type of a text that begins the way this component prints its chat lines, without
// parsing it; 0 for any other text. The parse that follows still checks everything.
int SniffPDUType(const std::string& text) {
    static const std::string kPrivateStart = "<chat ver=\"1.0\"><mtype>2</mtype>";
    static const std::string kGroupStart = "<chat ver=\"1.0\"><mtype>3</mtype>";
    if (text.compare(0, kPrivateStart.size(), kPrivateStart) == 0) return XMLPDU_PRIVATE_MESSAGE;
    if (text.compare(0, kGroupStart.size(), kGroupStart) == 0) return XMLPDU_GROUP_MESSAGE;
    return 0;
}

}  // namespace

int PrivateCacheRecovery::RecoverPrivateMessages(const std::string& text) {
    if (text.empty() || !m_pCmdSink) return 0;
    switch (SniffPDUType(text)) {
        case XMLPDU_PRIVATE_MESSAGE:
            return ShowPrivateMessage(text);
        case XMLPDU_GROUP_MESSAGE: {
            CGroupMessagePDU group;
            return group.ParseXMLPDU(text) ? ShowGroupMessage(group) : 0;
        }
        default:
            return RecoverUnsniffedMessage(text);
    }
}

int PrivateCacheRecovery::RecoverUnsniffedMessage(const std::string& text) {
    // A text of another kind fails the group message's type check, which leaves the type the
    // text names in the PDU: no entry is parsed only to learn its type.
    CGroupMessagePDU group;
    if (group.ParseXMLPDU(text)) return ShowGroupMessage(group);
    return group.GetMainType_Int() == XMLPDU_PRIVATE_MESSAGE ? ShowPrivateMessage(text) : 0;
}

int PrivateCacheRecovery::ShowPrivateMessage(const std::string& text) {
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
