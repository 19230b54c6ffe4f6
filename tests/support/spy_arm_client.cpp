#include "tests/support/spy_arm_client.h"

#include <algorithm>
#include <cstring>

std::size_t SpyArmClient::Count(const std::string& name) const {
    return static_cast<std::size_t>(std::count(m_calls.begin(), m_calls.end(), name));
}

int SpyArmClient::Release() {
    m_calls.push_back("Release");
    m_bReleased = true;
    return m_pInner->Release();
}

int SpyArmClient::Connect(IArmNodeControllerSink* sink, const char* userName, std::uint32_t a,
                          std::uint32_t b, std::uint32_t c) {
    m_calls.push_back("Connect");
    return m_pInner->Connect(sink, userName, a, b, c);
}

int SpyArmClient::Destroy(IArmNodeControllerSink* sink, int flag) {
    m_calls.push_back("Destroy");
    return m_pInner->Destroy(sink, flag);
}

int SpyArmClient::SetSendOption(int option, const ARMSendOption* value) {
    m_calls.push_back("SetSendOption");
    return m_pInner->SetSendOption(option, value);
}

int SpyArmClient::ConferenceJoin(std::uint32_t reserved, std::uint16_t conferenceId,
                                 IArmConferenceSink* sink, int mode) {
    m_calls.push_back("ConferenceJoin");
    return m_pInner->ConferenceJoin(reserved, conferenceId, sink, mode);
}

int SpyArmClient::ConferenceLeave(std::uint32_t reserved, std::uint16_t conferenceId,
                                  IArmConferenceSink* sink) {
    m_calls.push_back("ConferenceLeave");
    return m_pInner->ConferenceLeave(reserved, conferenceId, sink);
}

int SpyArmClient::ApeAttach(IArmApeSink* sink, std::uint32_t reserved, std::uint16_t conferenceId,
                            std::uint32_t* apeHandle) {
    m_calls.push_back("ApeAttach");
    return m_pInner->ApeAttach(sink, reserved, conferenceId, apeHandle);
}

int SpyArmClient::ApeEnroll(std::uint32_t apeHandle, int enroll, std::uint32_t sessionId,
                            std::uint32_t reserved, int resourceCount,
                            ARMSessionResource* resources, const void* enrollInfo,
                            std::uint32_t enrollInfoLength, int mode) {
    m_calls.push_back("ApeEnroll");
    m_enrollPayloads.emplace_back(static_cast<const char*>(enrollInfo), enrollInfoLength);
    return m_pInner->ApeEnroll(apeHandle, enroll, sessionId, reserved, resourceCount, resources,
                               enrollInfo, enrollInfoLength, mode);
}

int SpyArmClient::ApeSendData(std::uint32_t apeHandle, std::uint32_t destUserId, int priority,
                              const void* data, std::uint32_t length, int reliable, int segment) {
    m_calls.push_back("ApeSendData");
    return m_pInner->ApeSendData(apeHandle, destUserId, priority, data, length, reliable, segment);
}

int SpyArmClient::ApeDetach(std::uint32_t apeHandle) {
    m_calls.push_back("ApeDetach");
    return m_pInner->ApeDetach(apeHandle);
}

int SpyArmClient::RegisterSharedDataSink(std::uint32_t apeHandle, IArmSharedDataSink* sink) {
    m_calls.push_back("RegisterSharedDataSink");
    m_pRegisteredSink = sink;
    return m_pInner->RegisterSharedDataSink(apeHandle, sink);
}

int SpyArmClient::AllocNameHandle(std::uint32_t apeHandle, std::uint32_t count, NameHandle* entries,
                                  IArmAllocHandleSink* sink) {
    m_calls.push_back("AllocNameHandle");
    m_handleRequests.emplace_back(entries, entries + count);
    m_handleNames.clear();
    for (std::uint32_t i = 0; i < count; ++i)
        m_handleNames.emplace_back(entries[i].name,
                                   strnlen(entries[i].name, sizeof entries[i].name));
    return m_pInner->AllocNameHandle(apeHandle, count, entries, sink);
}

int SpyArmClient::ApeSharedDataActionEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                        std::uint32_t reserved1, std::uint32_t reserved2,
                                        tagCacheAction action, std::uint32_t flags,
                                        std::uint32_t memHandle, std::uint32_t reserved3,
                                        int confirm) {
    m_calls.push_back("ApeSharedDataActionEx");
    return m_pInner->ApeSharedDataActionEx(apeHandle, cacheHandle, reserved1, reserved2, action,
                                           flags, memHandle, reserved3, confirm);
}

int SpyArmClient::ApeRequestSharedDataEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                         std::uint32_t reserved, tagCacheRequestType type,
                                         std::uint32_t maxItems, IArmSharedDataSink* sink) {
    m_calls.push_back("ApeRequestSharedDataEx");
    return m_pInner->ApeRequestSharedDataEx(apeHandle, cacheHandle, reserved, type, maxItems, sink);
}

int SpyArmClient::AllocMemHandle(std::uint32_t size, std::uint32_t* handle) {
    m_calls.push_back("AllocMemHandle");
    return m_pInner->AllocMemHandle(size, handle);
}

int SpyArmClient::FreeMemHandle(std::uint32_t handle) {
    m_calls.push_back("FreeMemHandle");
    return m_pInner->FreeMemHandle(handle);
}

int SpyArmClient::GetMemHandleSize(std::uint32_t handle, std::uint32_t* size) {
    m_calls.push_back("GetMemHandleSize");
    return m_pInner->GetMemHandleSize(handle, size);
}

int SpyArmClient::WriteMemHandle(std::uint32_t handle, std::uint32_t offset, const void* data,
                                 std::uint32_t* size) {
    m_calls.push_back("WriteMemHandle");
    return m_pInner->WriteMemHandle(handle, offset, data, size);
}

int SpyArmClient::ReadMemHandle(std::uint32_t handle, std::uint32_t offset, void* buffer,
                                std::uint32_t* size) {
    m_calls.push_back("ReadMemHandle");
    return m_pInner->ReadMemHandle(handle, offset, buffer, size);
}
