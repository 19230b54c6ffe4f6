#include "engine/chat_recovery_mediator.h"

namespace {
constexpr std::uint32_t kEveryoneGroupId = 15;
}  // namespace

ChatRecoveryMediator::ChatRecoveryMediator() : m_GroupRecovery(kEveryoneGroupId) {
    m_GroupRecovery.SetFilter(&m_Filter);
    m_PrivateRecovery.SetFilter(&m_Filter);
}

void ChatRecoveryMediator::InitParameters(IChatDataCmdProcess* sink) {
    m_GroupRecovery.InitParameters(sink, this);
    m_PrivateRecovery.InitParameters(sink);
    m_HistoryRoster.InitParameters(sink);
}
