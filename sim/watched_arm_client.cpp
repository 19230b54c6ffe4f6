#include "sim/watched_arm_client.h"

int WatchedArmClient::Release() {
    return m_pInner->Release();
}

int WatchedArmClient::Connect(IArmNodeControllerSink* sink, const char* userName, std::uint32_t a,
                              std::uint32_t b, std::uint32_t c) {
    return m_pInner->Connect(sink, userName, a, b, c);
}

int WatchedArmClient::Destroy(IArmNodeControllerSink* sink, int flag) {
    return m_pInner->Destroy(sink, flag);
}

int WatchedArmClient::SetSendOption(int option, const ARMSendOption* value) {
    return m_pInner->SetSendOption(option, value);
}

int WatchedArmClient::ConferenceJoin(std::uint32_t reserved, std::uint16_t conferenceId,
                                     IArmConferenceSink* sink, int mode) {
    return m_pInner->ConferenceJoin(reserved, conferenceId, sink, mode);
}

int WatchedArmClient::ConferenceLeave(std::uint32_t reserved, std::uint16_t conferenceId,
                                      IArmConferenceSink* sink) {
    return m_pInner->ConferenceLeave(reserved, conferenceId, sink);
}

int WatchedArmClient::ApeAttach(IArmApeSink* sink, std::uint32_t reserved,
                                std::uint16_t conferenceId, std::uint32_t* apeHandle) {
    return m_pInner->ApeAttach(sink, reserved, conferenceId, apeHandle);
}

int WatchedArmClient::ApeEnroll(std::uint32_t apeHandle, int enroll, std::uint32_t sessionId,
                                std::uint32_t reserved, int resourceCount,
                                ARMSessionResource* resources, const void* enrollInfo,
                                std::uint32_t enrollInfoLength, int mode) {
    return m_pInner->ApeEnroll(apeHandle, enroll, sessionId, reserved, resourceCount, resources,
                               enrollInfo, enrollInfoLength, mode);
}

int WatchedArmClient::ApeSendData(std::uint32_t apeHandle, std::uint32_t destUserId, int priority,
                                  const void* data, std::uint32_t length, int reliable,
                                  int segment) {
    return m_pInner->ApeSendData(apeHandle, destUserId, priority, data, length, reliable, segment);
}

int WatchedArmClient::ApeDetach(std::uint32_t apeHandle) {
    return m_pInner->ApeDetach(apeHandle);
}

int WatchedArmClient::RegisterSharedDataSink(std::uint32_t apeHandle, IArmSharedDataSink* sink) {
    return m_pInner->RegisterSharedDataSink(apeHandle, sink);
}

int WatchedArmClient::AllocNameHandle(std::uint32_t apeHandle, std::uint32_t count,
                                      NameHandle* entries, IArmAllocHandleSink* sink) {
    return m_pInner->AllocNameHandle(apeHandle, count, entries, sink);
}

int WatchedArmClient::ApeSharedDataActionEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                            std::uint32_t reserved1, std::uint32_t reserved2,
                                            tagCacheAction action, std::uint32_t flags,
                                            std::uint32_t memHandle, std::uint32_t reserved3,
                                            int confirm) {
    if (action == CACHE_SET || action == CACHE_APPEND) m_lastFlags = flags;
    return m_pInner->ApeSharedDataActionEx(apeHandle, cacheHandle, reserved1, reserved2, action,
                                           flags, memHandle, reserved3, confirm);
}

int WatchedArmClient::ApeRequestSharedDataEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                             std::uint32_t reserved, tagCacheRequestType type,
                                             std::uint32_t maxItems, IArmSharedDataSink* sink) {
    return m_pInner->ApeRequestSharedDataEx(apeHandle, cacheHandle, reserved, type, maxItems, sink);
}

int WatchedArmClient::AllocMemHandle(std::uint32_t size, std::uint32_t* handle) {
    return m_pInner->AllocMemHandle(size, handle);
}

int WatchedArmClient::FreeMemHandle(std::uint32_t handle) {
    return m_pInner->FreeMemHandle(handle);
}

int WatchedArmClient::GetMemHandleSize(std::uint32_t handle, std::uint32_t* size) {
    return m_pInner->GetMemHandleSize(handle, size);
}

int WatchedArmClient::WriteMemHandle(std::uint32_t handle, std::uint32_t offset, const void* data,
                                     std::uint32_t* size) {
    return m_pInner->WriteMemHandle(handle, offset, data, size);
}

int WatchedArmClient::ReadMemHandle(std::uint32_t handle, std::uint32_t offset, void* buffer,
                                    std::uint32_t* size) {
    return m_pInner->ReadMemHandle(handle, offset, buffer, size);
}
