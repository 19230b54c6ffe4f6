// Restores, for a participant who joins late, the chat posted before they joined.
// Holds the customer id and the recovery switches taken from the feature word.
#pragma once

#include <cstdint>

class IChatDataCmdProcess;

class ChatRecoveryMgr {
public:
    ChatRecoveryMgr() = default;
    virtual ~ChatRecoveryMgr() = default;
    ChatRecoveryMgr(const ChatRecoveryMgr&) = delete;
    ChatRecoveryMgr& operator=(const ChatRecoveryMgr&) = delete;

    // Takes the engine's services and the switches of the feature word.
    void InitParameters(IChatDataCmdProcess* sink, std::uint32_t features);

    // True when group-message recovery and QM mode are both on.
    bool NeedRecoverMsgs() const { return m_bGroupMsgRecovery && m_bQMFlag; }

    std::uint32_t GetCustomerId() const { return m_dwCustomerId; }
    void SetCustomerId(std::uint32_t customerId) { m_dwCustomerId = customerId; }

    bool GetWebChatHistoryRecovery() const { return m_bWebChatHistoryRecovery; }
    bool GetGroupMsgRecovery() const { return m_bGroupMsgRecovery; }
    bool GetQMFlag() const { return m_bQMFlag; }

private:
    // Feature switches.
    bool m_bWebChatHistoryRecovery = false;  // 0x10000
    bool m_bGroupMsgRecovery = false;        // 0x400
    bool m_bQMFlag = false;                  // 0x200000

    std::uint32_t m_dwCustomerId = 0;           // names the customer cache; 0 = none
    IChatDataCmdProcess* m_pCmdSink = nullptr;  // the engine; not owned
};
