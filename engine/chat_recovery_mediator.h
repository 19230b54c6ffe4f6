// IChatRecoveryMediator and ChatRecoveryMediator: the hub between the recovery manager and
// the three parts that hold restored data (private and customer cache, everyone group's
// cache, history roster); each operation goes to the part that holds the data.
#pragma once

#include <cstdint>
#include <string>

#include "engine/group_cache_recovery.h"
#include "engine/history_user_roster_info.h"
#include "engine/private_cache_recovery.h"
#include "engine/recovered_message_filter.h"
#include "platform/arm_service.h"

class IChatDataCmdProcess;

class IChatRecoveryMediator {
public:
    virtual void InitParameters(IChatDataCmdProcess* sink) = 0;
    virtual std::uint32_t GetLastGroupCacheId() const = 0;
    virtual std::uint32_t GetCustomerCacheValue() const = 0;
    virtual void SetCustomerCacheValue(std::uint32_t value) = 0;
    // True when text was a user-info record and joined the history roster.
    virtual bool AddRosterInfoString(const std::string& text) = 0;
    // Shows one customer-cache entry; 1 when handed to the engine to show.
    virtual int RecoverPrivateMessages(const std::string& text) = 0;
    virtual std::uint32_t GetGroupId() const = 0;
    // Collects one delivery of the everyone group's cache; 1 when it joined the sequence.
    // senderId: who the service says wrote it (0: unknown).
    virtual int RecoverGroupMessages(std::uint32_t cacheId, std::uint32_t entityId,
                                     const std::string& text, short result, tagCacheAction action,
                                     std::uint32_t senderId) = 0;
    // Shows the collected group messages in cache-id order and forgets them.
    virtual void ParseAndShowGroupRecoveryMessages() = 0;
    virtual std::uint32_t GetCustomerId() const = 0;
    virtual void SetCustomerId(std::uint32_t customerId) = 0;
    // The live name first, else the history roster's; false when neither knows the id.
    virtual bool GetUserNameFromId(std::uint32_t userId, std::string& out) const = 0;
    // Records a group message shown outside recovery; false when it was shown before.
    virtual bool FirstShowOfGroupMessage(std::uint32_t groupId, std::uint32_t cacheId) = 0;
    // Forgets which lines were shown (recovery is over).
    virtual void ForgetShownMessages() = 0;
    virtual ~IChatRecoveryMediator() = default;
};

class ChatRecoveryMediator final : public IChatRecoveryMediator {
public:
    ChatRecoveryMediator();
    ChatRecoveryMediator(const ChatRecoveryMediator&) = delete;
    ChatRecoveryMediator& operator=(const ChatRecoveryMediator&) = delete;

    void InitParameters(IChatDataCmdProcess* sink) override;
    std::uint32_t GetLastGroupCacheId() const override {
        return m_PrivateRecovery.GetLastGroupCacheId();
    }
    std::uint32_t GetCustomerCacheValue() const override {
        return m_PrivateRecovery.GetCustomerCacheValue();
    }
    void SetCustomerCacheValue(std::uint32_t value) override {
        m_PrivateRecovery.SetCustomerCacheValue(value);
    }
    bool AddRosterInfoString(const std::string& text) override {
        return m_HistoryRoster.AddRosterInfoString(text);
    }
    int RecoverPrivateMessages(const std::string& text) override {
        return m_PrivateRecovery.RecoverPrivateMessages(text);
    }
    std::uint32_t GetGroupId() const override { return m_GroupRecovery.GetGroupId(); }
    int RecoverGroupMessages(std::uint32_t cacheId, std::uint32_t entityId, const std::string& text,
                             short result, tagCacheAction action, std::uint32_t senderId) override {
        return m_GroupRecovery.RecoverGroupMessages(cacheId, entityId, text, result, action,
                                                    senderId);
    }
    void ParseAndShowGroupRecoveryMessages() override {
        m_GroupRecovery.ParseAndShowGroupRecoveryMessages();
    }
    std::uint32_t GetCustomerId() const override { return m_PrivateRecovery.GetCustomerId(); }
    void SetCustomerId(std::uint32_t customerId) override {
        m_PrivateRecovery.SetCustomerId(customerId);
    }
    bool GetUserNameFromId(std::uint32_t userId, std::string& out) const override {
        return m_HistoryRoster.GetUserNameFromId(userId, out);
    }
    bool FirstShowOfGroupMessage(std::uint32_t groupId, std::uint32_t cacheId) override {
        return m_Filter.FirstShowOfGroupMessage(groupId, cacheId);
    }
    void ForgetShownMessages() override { m_Filter.Clear(); }

private:
    RecoveredMessageFilter m_Filter;  // shared by the two message parts
    GroupCacheRecovery m_GroupRecovery;
    PrivateCacheRecovery m_PrivateRecovery;
    HistoryUserRosterInfo m_HistoryRoster;
};
