// The shared-data caches and memory handles of one participant's service object.
#include <utility>

#include "platform/conference_arguments.h"
#include "platform/conference_results.h"
#include "platform/inproc_conference.h"
#include "platform/inproc_conference_client.h"

int InProcessArmClient::ApeSharedDataActionEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                              std::uint32_t, std::uint32_t, tagCacheAction action,
                                              std::uint32_t flags, std::uint32_t memHandle,
                                              std::uint32_t, int confirm) {
    if (const auto fault = Fault(ArmOperation::ApeSharedDataActionEx)) return *fault;
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    ConferenceCache* const cache = m_conference.FindCache(cacheHandle);
    if (cache == nullptr) return kArmUnknownHandle;
    Bytes data;
    if (const int refusal = CacheActionBytes(action, memHandle, m_memory, &data)) return refusal;

    const short result = ConfirmResult(ArmConfirmation::ApeCacheActionConfirmEx);
    const std::uint32_t requestIdx = ++m_lastRequestIdx;
    std::uint32_t cacheId = 0;
    if (result == 0) {
        cacheId = action == CACHE_SET ? cache->Set(m_userId, flags, data)
                                      : cache->Append(m_userId, flags, data);
    }
    if (confirm != 0) {
        IArmApeSink* const sink = m_pApeSink;
        const std::uint32_t ape = m_apeHandle;
        Post(Stage::Ape, [sink, ape, cacheHandle, action, requestIdx, cacheId, result] {
            sink->ApeCacheActionConfirmEx(ape, cacheHandle, action, requestIdx, cacheId, result);
        });
    }
    if (result != 0) return 0;
    ArmCacheDelivery delivery;
    delivery.cacheId = cacheId;
    delivery.entityId = cacheHandle;
    delivery.action = action;
    delivery.senderId = m_userId;
    delivery.value = flags;
    for (const ConferenceCacheSubscriber& subscriber : cache->Subscribers()) {
        subscriber.client->DeliverShared(subscriber.sink, delivery, data);
    }
    return 0;
}

int InProcessArmClient::ApeRequestSharedDataEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                               std::uint32_t, tagCacheRequestType type,
                                               std::uint32_t, IArmSharedDataSink* sink) {
    if (const auto fault = Fault(ArmOperation::ApeRequestSharedDataEx)) return *fault;
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    ConferenceCache* const cache = m_conference.FindCache(cacheHandle);
    if (cache == nullptr) return kArmUnknownHandle;
    IArmSharedDataSink* const target = sink != nullptr ? sink : m_pSharedSink;
    if (type == CACHE_REQUEST_UNSUBSCRIBE) {
        cache->Unsubscribe(this);
        return 0;
    }
    if (target == nullptr) return kArmInvalidArgument;
    if (type == CACHE_REQUEST_SUBSCRIBE) {
        cache->Subscribe(this, target);
        return 0;
    }
    if (type != CACHE_REQUEST_RETRIEVE) return kArmInvalidArgument;

    ArmCacheDelivery delivery;
    delivery.entityId = cacheHandle;
    delivery.action = CACHE_REPLY_LAST;
    const std::vector<ConferenceCacheItem>& items = cache->Items();
    if (items.empty()) {
        delivery.result = cache->IsSet() ? 0 : kArmRetry;
        DeliverShared(target, delivery, nullptr);
        return 0;
    }
    for (std::size_t i = 0; i < items.size(); ++i) {
        delivery.cacheId = items[i].cacheId;
        delivery.senderId = items[i].senderId;
        delivery.value = items[i].flags;
        delivery.action = i + 1 < items.size() ? CACHE_REPLY_ITEM : CACHE_REPLY_LAST;
        DeliverShared(target, delivery, items[i].bytes);
    }
    return 0;
}

int InProcessArmClient::AllocMemHandle(std::uint32_t size, std::uint32_t* handle) {
    if (const auto fault = Fault(ArmOperation::AllocMemHandle)) return *fault;
    if (handle == nullptr) return kArmInvalidArgument;
    const std::uint32_t number = m_conference.NewMemHandle();
    const int result = m_memory.Allocate(number, size);
    if (result == 0) *handle = number;
    return result;
}

int InProcessArmClient::FreeMemHandle(std::uint32_t handle) {
    if (const auto fault = Fault(ArmOperation::FreeMemHandle)) return *fault;
    return m_memory.Free(handle);
}

int InProcessArmClient::GetMemHandleSize(std::uint32_t handle, std::uint32_t* size) {
    if (const auto fault = Fault(ArmOperation::GetMemHandleSize)) return *fault;
    return m_memory.GetSize(handle, size);
}

int InProcessArmClient::WriteMemHandle(std::uint32_t handle, std::uint32_t offset, const void* data,
                                       std::uint32_t* size) {
    if (const auto fault = Fault(ArmOperation::WriteMemHandle)) return *fault;
    return m_memory.Write(handle, offset, data, size);
}

int InProcessArmClient::ReadMemHandle(std::uint32_t handle, std::uint32_t offset, void* buffer,
                                      std::uint32_t* size) {
    if (const auto fault = Fault(ArmOperation::ReadMemHandle)) return *fault;
    return m_memory.Read(handle, offset, buffer, size);
}

void InProcessArmClient::DeliverShared(IArmSharedDataSink* sink, const ArmCacheDelivery& delivery,
                                       Bytes data) {
    const std::uint32_t ape = m_apeHandle;
    std::weak_ptr<Liveness> token = m_liveness;
    Post(Stage::Ape, [this, token = std::move(token), sink, ape, delivery, data = std::move(data)] {
        // The receiver reads the item through a handle of its own, valid for this call.
        std::uint32_t memHandle = 0;
        if (data) {
            memHandle = m_conference.NewMemHandle();
            m_memory.Adopt(memHandle, *data);
        }
        sink->SharedDataReceivedEx(ape, delivery.cacheId, delivery.entityId, memHandle,
                                   delivery.result, delivery.action, delivery.senderId,
                                   delivery.value, delivery.flags);
        // The callback may have released this object (and with it the handle) or freed it.
        if (memHandle != 0 && !token.expired()) m_memory.Free(memHandle);
    });
}
