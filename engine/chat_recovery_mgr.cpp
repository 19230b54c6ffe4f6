#include "engine/chat_recovery_mgr.h"

namespace {
constexpr std::uint32_t kFeatureGroupMsgRecovery = 0x400;
constexpr std::uint32_t kFeatureWebChatHistoryRecovery = 0x10000;
constexpr std::uint32_t kFeatureQMMode = 0x200000;
}  // namespace

void ChatRecoveryMgr::InitParameters(IChatDataCmdProcess* sink, std::uint32_t features) {
    m_pCmdSink = sink;
    m_bGroupMsgRecovery = (features & kFeatureGroupMsgRecovery) != 0;
    m_bWebChatHistoryRecovery = (features & kFeatureWebChatHistoryRecovery) != 0;
    m_bQMFlag = (features & kFeatureQMMode) != 0;
}
