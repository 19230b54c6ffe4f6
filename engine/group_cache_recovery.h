// GroupCacheRecovery: collects what a late joiner reads back from the everyone group's cache
// (and what that cache receives live meanwhile), puts it in cache-id order without what was
// already shown, and shows it in one go when the retrieval ends.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "engine/recovery_group_message.h"
#include "platform/arm_service.h"

class IChatDataCmdProcess;
class IChatRecoveryMediator;
class RecoveredMessageFilter;

class GroupCacheRecovery {
public:
    explicit GroupCacheRecovery(std::uint32_t groupId) : m_dwGroupId(groupId) {}
    virtual ~GroupCacheRecovery() = default;
    GroupCacheRecovery(const GroupCacheRecovery&) = delete;
    GroupCacheRecovery& operator=(const GroupCacheRecovery&) = delete;

    void InitParameters(IChatDataCmdProcess* sink, IChatRecoveryMediator* mediator) {
        m_pCmdSink = sink;
        m_pMediator = mediator;
    }
    // Where lines already shown are remembered; not owned.
    void SetFilter(RecoveredMessageFilter* filter) { m_pFilter = filter; }

    std::uint32_t GetGroupId() const { return m_dwGroupId; }

    // Takes one delivery of the group's cache into the sequence: a retrieved item (actions
    // 4 to 6) or a live one (set or append). Skipped: other actions, empty or unparsable
    // text, a message the customer cache already showed (cache id up to its last one, or the
    // same cache id), one already collected, and one the service says another participant
    // wrote (senderId not 0 and not the PDU's send id). 1 when taken.
    int RecoverGroupMessages(std::uint32_t cacheId, std::uint32_t entityId, const std::string& text,
                             short result, tagCacheAction action, std::uint32_t senderId);
    // Shows the collected messages in cache-id order, each backed up into the customer cache
    // when there is one, then forgets them.
    void ParseAndShowGroupRecoveryMessages();
    // Appends a copy of the message (send id, group id, cache id, text) to the customer cache.
    void BackupMsg2CustomerCache(const CRecoveryGroupMessage& message);

private:
    // True when a message with this cache id is collected already.
    bool IsCollected(std::uint32_t cacheId) const;

    std::uint32_t m_dwGroupId;
    IChatDataCmdProcess* m_pCmdSink = nullptr;     // the engine; not owned
    IChatRecoveryMediator* m_pMediator = nullptr;  // the owning mediator
    // Collected messages in cache-id order.
    std::vector<std::unique_ptr<CRecoveryGroupMessage>> m_Messages;
    RecoveredMessageFilter* m_pFilter = nullptr;
};
