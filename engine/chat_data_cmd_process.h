// The services the engine offers to the chat-history recovery classes.
#pragma once

#include <cstdint>
#include <string>

#include "platform/arm_service.h"

class CKvoChatXMLPDU;
class CGroupMessagePDU;
class CPrivateMessagePDU;

class IChatDataCmdProcess {
public:
    // Copies a memory handle's bytes into buffer; 1 with *size set, 0 on failure.
    virtual int ParseATMemHandle(std::uint32_t memHandle, char* buffer, std::uint32_t* size) = 0;
    // Starts a cache request; the service's result, 0 when it cannot be asked.
    virtual int ChatRequestSharedDataEx(std::uint32_t cacheHandle, tagCacheRequestType type,
                                        short maxItems) = 0;
    // Appends a copy of the PDU to the customer cache, when there is one.
    virtual void SendCopyToCustomerCache(CKvoChatXMLPDU* pdu) = 0;
    // Initialises the customer cache, when there is one.
    virtual void SetCustomerCache() = 0;
    virtual void ParseAndShowGroupMessages(CGroupMessagePDU* pdu, std::uint32_t cacheHandle) = 0;
    // 0 when shown (or null), -1 when the local participant may not see it.
    virtual int ParseAndShowPrivateMessages(CPrivateMessagePDU* pdu, int reserved) = 0;
    // Reads a memory handle into out; false when it holds nothing.
    virtual bool AllocStringForMemoryHandle(std::uint32_t memHandle, std::string& out) = 0;
    virtual std::uint32_t GetGroupIdFormCacheName(const char* cacheName) = 0;
    virtual std::uint32_t GetGroupIdFormCacheHandle(std::uint32_t cacheHandle) = 0;
    virtual std::uint32_t GetCacheHandleFormGroupId(std::uint32_t groupId) = 0;
    // The group's name, or null.
    virtual const char* GetGroupNameFromGroupCacheHandle(std::uint32_t cacheHandle) = 0;
    // 1 with out filled when somebody has that user id, else 0 (out unchanged).
    virtual int GetUserNameFromId(std::uint32_t userId, std::string& out) = 0;

protected:
    ~IChatDataCmdProcess() = default;
};
