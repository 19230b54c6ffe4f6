// ChatRecoveryMgr: restores, for a participant who joins late, the chat posted before they
// joined: the customer cache first, then the everyone group's cache, senders named from the
// history roster. It runs in QM mode with group-message recovery on, once per engine.
#pragma once

#include <cstdint>
#include <string>

#include "engine/chat_recovery_mediator.h"
#include "platform/arm_service.h"

class IChatDataCmdProcess;
class CGroupMessagePDU;
class CPrivateMessagePDU;

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
    // True for the delivery that carries the last item of a retrieval.
    static bool IsEndofRetrievedData(tagCacheAction action) { return action == CACHE_REPLY_LAST; }

    std::uint32_t GetCustomerId() const { return m_Mediator.GetCustomerId(); }
    void SetCustomerId(std::uint32_t customerId) { m_Mediator.SetCustomerId(customerId); }

    // ---- Starting (the status cache was found filled) ----
    // Starts recovery unless it is off or has run: asks for the user-info and the customer
    // cache. True when started. A customer cache that is missing or refused leaves the
    // everyone group's cache to read; a refused request is logged.
    bool CheckUpdate4CustomRecovery(std::uint32_t userInfoCacheHandle,
                                    std::uint32_t customerCacheHandle);
    // Each asks the service for one retrieval of the cache; the service's result.
    int RequestHistoryUserRoster(std::uint32_t cacheHandle);
    int RequestCustomerRecovery(std::uint32_t cacheHandle);

    // ---- Deliveries, in the order the engine offers them; 1 when consumed ----
    // A user-info record joins the history roster (1 when one did).
    int HandleHistoryUserRoster(std::uint32_t memHandle);
    // A customer-cache entry is shown; its end starts the everyone group's retrieval.
    int HandleCustomerRecovery(std::uint32_t cacheId, std::uint32_t entityId,
                               std::uint32_t memHandle, short result, tagCacheAction action);
    // True while the everyone group's deliveries belong to recovery: from the start until
    // its retrieval has ended, live appends included, so that they show in cache-id order.
    bool CheckUpdate4GroupRecovery(std::uint32_t entityId);
    // An everyone-group delivery is collected; the retrieval's end shows them all and ends
    // recovery. senderId: who the service says wrote it (0: unknown, not checked).
    int HandleGroupRecovery(std::uint32_t cacheId, std::uint32_t entityId, std::uint32_t memHandle,
                            short result, tagCacheAction action, std::uint32_t senderId = 0);
    // The engine showed a group message live; while recovery runs its copies are not shown.
    void NoteLiveGroupMessage(std::uint32_t groupId, std::uint32_t cacheId);

    // ---- Names for the show operations ----
    // While restoring: the sender's name, also of a participant who has left. False otherwise.
    bool ParseGroupSenderName(const CGroupMessagePDU* pdu, std::string& outName);
    // While restoring the customer cache: the title of a private line between two other
    // participants, both named. 1 with the title, else 0 (the line is not shown).
    int ParsePrivateMsgTitle(const CPrivateMessagePDU* pdu, std::string& outTitle);

    std::uint32_t GetGroupIdFormCacheHandle(std::uint32_t cacheHandle);
    bool GetUserNameFromId(std::uint32_t userId, std::string& out) const {
        return m_Mediator.GetUserNameFromId(userId, out);
    }

    // ---- State ----
    bool GetWebChatHistoryRecovery() const { return m_bWebChatHistoryRecovery; }
    bool GetGroupMsgRecovery() const { return m_bGroupMsgRecovery; }
    bool GetQMFlag() const { return m_bQMFlag; }
    void SetIsInGroupCacheRecovery(bool b) { m_bInGroupCacheRecovery = b; }
    bool IsInGroupCacheRecoveryProgress() const { return m_bInGroupCacheRecovery; }
    void SetIsRestoringCustomerCache(bool b) { m_bRestoringCustomerCache = b; }
    bool IsRestoringCustomerCache() const { return m_bRestoringCustomerCache; }
    void SetChatRecoveryRequestProcessed(bool b) { m_bRecoveryStarted = b; }
    bool IsChatRecoveryRequestProcessed() const { return m_bRecoveryStarted; }
    // Started and not yet ended.
    bool IsRecoveryRunning() const { return m_bRecoveryStarted && !m_bRecoveryEnded; }

private:
    // Asks for the everyone group's cache; when it cannot be read, recovery ends.
    void StartGroupRecovery();
    // Shows what was collected and leaves recovery for good.
    void EndRecovery();

    // Feature switches.
    bool m_bWebChatHistoryRecovery = false;  // 0x10000, kept only
    bool m_bGroupMsgRecovery = false;        // 0x400
    bool m_bQMFlag = false;                  // 0x200000

    // Progress.
    bool m_bInGroupCacheRecovery = false;    // the everyone group's cache is being read
    bool m_bRestoringCustomerCache = false;  // customer-cache entries are being shown
    bool m_bRecoveryStarted = false;         // never starts twice
    bool m_bRecoveryEnded = false;

    ChatRecoveryMediator m_Mediator;
    IChatDataCmdProcess* m_pCmdSink = nullptr;  // the engine; not owned
};
