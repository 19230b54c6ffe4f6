// CRecoveryGroupMessage: a group message read back from the everyone group's cache while chat
// history is restored, together with the cache id it had there.
#pragma once

#include <cstdint>

#include "pdu/group_message_pdu.h"

class CRecoveryGroupMessage : public CGroupMessagePDU {
public:
    std::uint32_t GetCacheId() const { return m_dwCacheId; }
    // Stores the cache id here and as the PDU's group cache id.
    void SetCacheId(std::uint32_t cacheId) {
        m_dwCacheId = cacheId;
        SetGroupCacheId(cacheId);
    }

private:
    std::uint32_t m_dwCacheId = 0;  // position in the group's cache
};
