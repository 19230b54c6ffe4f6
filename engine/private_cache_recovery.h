// PrivateCacheRecovery: shows the chat a late joiner reads back from the customer cache, the
// private lines and the group lines its clients copied there, and remembers how far the
// everyone group's history has been shown from it.
#pragma once

#include <cstdint>
#include <string>

class CGroupMessagePDU;
class IChatDataCmdProcess;
class RecoveredMessageFilter;

class PrivateCacheRecovery {
public:
    PrivateCacheRecovery() = default;
    virtual ~PrivateCacheRecovery() = default;
    PrivateCacheRecovery(const PrivateCacheRecovery&) = delete;
    PrivateCacheRecovery& operator=(const PrivateCacheRecovery&) = delete;

    void InitParameters(IChatDataCmdProcess* sink) { m_pCmdSink = sink; }
    // Where lines already shown are remembered; not owned.
    void SetFilter(RecoveredMessageFilter* filter) { m_pFilter = filter; }

    std::uint32_t GetCustomerId() const { return m_dwCustomerId; }
    void SetCustomerId(std::uint32_t customerId) { m_dwCustomerId = customerId; }
    // The customer cache handle; 0 while there is none.
    std::uint32_t GetCustomerCacheValue() const { return m_dwCustomerCacheValue; }
    void SetCustomerCacheValue(std::uint32_t value) { m_dwCustomerCacheValue = value; }
    // The largest everyone-group cache id among the group lines read from the customer cache.
    std::uint32_t GetLastGroupCacheId() const { return m_dwLastGroupCacheId; }

    // Shows one customer-cache entry: a private or a group message, unless it is a copy of a
    // line already shown. 1 when it was handed to the engine to show, else 0.
    int RecoverPrivateMessages(const std::string& text);

private:
    // An entry that does not begin as this component prints chat lines.
    int RecoverUnsniffedMessage(const std::string& text);
    // Each shows a line read from the customer cache unless it was shown before; 1 when shown.
    int ShowPrivateMessage(const std::string& text);
    int ShowGroupMessage(CGroupMessagePDU& pdu);

    std::uint32_t m_dwCustomerId = 0;           // names the customer cache; 0 = none
    std::uint32_t m_dwCustomerCacheValue = 0;   // the customer cache handle
    IChatDataCmdProcess* m_pCmdSink = nullptr;  // the engine; not owned
    std::uint32_t m_dwLastGroupCacheId = 0;
    RecoveredMessageFilter* m_pFilter = nullptr;
};
