#include "sim/watched_arm_client.h"

int WatchedArmClient::Release() {
    return Inner().Release();
}

int WatchedArmClient::Connect(IArmNodeControllerSink* sink, const char* userName, std::uint32_t a,
                              std::uint32_t b, std::uint32_t c) {
    return Inner().Connect(sink, userName, a, b, c);
}

int WatchedArmClient::Destroy(IArmNodeControllerSink* sink, int flag) {
    return Inner().Destroy(sink, flag);
}

int WatchedArmClient::SetSendOption(int option, const ARMSendOption* value) {
    return Inner().SetSendOption(option, value);
}

int WatchedArmClient::ConferenceJoin(std::uint32_t reserved, std::uint16_t conferenceId,
                                     IArmConferenceSink* sink, int mode) {
    return Inner().ConferenceJoin(reserved, conferenceId, sink, mode);
}

int WatchedArmClient::ConferenceLeave(std::uint32_t reserved, std::uint16_t conferenceId,
                                      IArmConferenceSink* sink) {
    return Inner().ConferenceLeave(reserved, conferenceId, sink);
}

int WatchedArmClient::ApeAttach(IArmApeSink* sink, std::uint32_t reserved,
                                std::uint16_t conferenceId, std::uint32_t* apeHandle) {
    return Inner().ApeAttach(sink, reserved, conferenceId, apeHandle);
}

int WatchedArmClient::ApeEnroll(std::uint32_t apeHandle, int enroll, std::uint32_t sessionId,
                                std::uint32_t reserved, int resourceCount,
                                ARMSessionResource* resources, const void* enrollInfo,
                                std::uint32_t enrollInfoLength, int mode) {
    return Inner().ApeEnroll(apeHandle, enroll, sessionId, reserved, resourceCount, resources,
                             enrollInfo, enrollInfoLength, mode);
}

int WatchedArmClient::ApeSendData(std::uint32_t apeHandle, std::uint32_t destUserId, int priority,
                                  const void* data, std::uint32_t length, int reliable,
                                  int segment) {
    return Inner().ApeSendData(apeHandle, destUserId, priority, data, length, reliable, segment);
}

int WatchedArmClient::ApeDetach(std::uint32_t apeHandle) {
    return Inner().ApeDetach(apeHandle);
}

int WatchedArmClient::RegisterSharedDataSink(std::uint32_t apeHandle, IArmSharedDataSink* sink) {
    return Inner().RegisterSharedDataSink(apeHandle, sink);
}

int WatchedArmClient::AllocNameHandle(std::uint32_t apeHandle, std::uint32_t count,
                                      NameHandle* entries, IArmAllocHandleSink* sink) {
    return Inner().AllocNameHandle(apeHandle, count, entries, sink);
}

int WatchedArmClient::ApeSharedDataActionEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                            std::uint32_t reserved1, std::uint32_t reserved2,
                                            tagCacheAction action, std::uint32_t flags,
                                            std::uint32_t memHandle, std::uint32_t reserved3,
                                            int confirm) {
    if (action == CACHE_SET || action == CACHE_APPEND) m_lastFlags = flags;
    return Inner().ApeSharedDataActionEx(apeHandle, cacheHandle, reserved1, reserved2, action,
                                         flags, memHandle, reserved3, confirm);
}

int WatchedArmClient::ApeRequestSharedDataEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                             std::uint32_t reserved, tagCacheRequestType type,
                                             std::uint32_t maxItems, IArmSharedDataSink* sink) {
    return Inner().ApeRequestSharedDataEx(apeHandle, cacheHandle, reserved, type, maxItems, sink);
}

int WatchedArmClient::AllocMemHandle(std::uint32_t size, std::uint32_t* handle) {
    return Inner().AllocMemHandle(size, handle);
}

int WatchedArmClient::FreeMemHandle(std::uint32_t handle) {
    return Inner().FreeMemHandle(handle);
}

int WatchedArmClient::GetMemHandleSize(std::uint32_t handle, std::uint32_t* size) {
    return Inner().GetMemHandleSize(handle, size);
}

int WatchedArmClient::WriteMemHandle(std::uint32_t handle, std::uint32_t offset, const void* data,
                                     std::uint32_t* size) {
    return Inner().WriteMemHandle(handle, offset, data, size);
}

int WatchedArmClient::ReadMemHandle(std::uint32_t handle, std::uint32_t offset, void* buffer,
                                    std::uint32_t* size) {
    return Inner().ReadMemHandle(handle, offset, buffer, size);
}
