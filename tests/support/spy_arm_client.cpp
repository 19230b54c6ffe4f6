#include "tests/support/spy_arm_client.h"

#include <algorithm>
#include <cstring>
#include <initializer_list>

namespace {

std::string Join(std::initializer_list<std::int64_t> values) {
    std::string out;
    for (const std::int64_t v : values)
        out += (out.empty() ? "" : ", ") + std::to_string(v);
    return out;
}

std::string Text(const char* text) {
    return text ? text : "null";
}

// The resources as {type, name, count} each.
std::string Resources(const ARMSessionResource* resources, int count) {
    if (!resources) return "null";
    std::string out;
    for (int i = 0; i < count; ++i)
        out += "{" + Join({resources[i].wResourceType}) + ", " + Text(resources[i].pszName) + ", " +
               Join({resources[i].dwCount}) + "}";
    return out;
}

}  // namespace

void SpyArmClient::Record(const std::string& name, const std::string& arguments) {
    m_calls.push_back(name);
    m_details.push_back(name + "(" + arguments + ")");
}

std::size_t SpyArmClient::Count(const std::string& name) const {
    return static_cast<std::size_t>(std::count(m_calls.begin(), m_calls.end(), name));
}

int SpyArmClient::Release() {
    Record("Release", "");
    m_bReleased = true;
    return m_pInner->Release();
}

int SpyArmClient::Connect(IArmNodeControllerSink* sink, const char* userName, std::uint32_t a,
                          std::uint32_t b, std::uint32_t c) {
    Record("Connect", Text(userName) + ", " + Join({a, b, c}));
    return m_pInner->Connect(sink, userName, a, b, c);
}

int SpyArmClient::Destroy(IArmNodeControllerSink* sink, int flag) {
    Record("Destroy", std::to_string(flag));
    return m_pInner->Destroy(sink, flag);
}

int SpyArmClient::SetSendOption(int option, const ARMSendOption* value) {
    Record("SetSendOption", std::to_string(option) + ", " +
                                (value ? Join({value->dwApeHandle, value->dwOption}) : "null"));
    return m_pInner->SetSendOption(option, value);
}

int SpyArmClient::ConferenceJoin(std::uint32_t reserved, std::uint16_t conferenceId,
                                 IArmConferenceSink* sink, int mode) {
    Record("ConferenceJoin", Join({reserved, conferenceId, mode}));
    return m_pInner->ConferenceJoin(reserved, conferenceId, sink, mode);
}

int SpyArmClient::ConferenceLeave(std::uint32_t reserved, std::uint16_t conferenceId,
                                  IArmConferenceSink* sink) {
    Record("ConferenceLeave", Join({reserved, conferenceId}));
    return m_pInner->ConferenceLeave(reserved, conferenceId, sink);
}

int SpyArmClient::ApeAttach(IArmApeSink* sink, std::uint32_t reserved, std::uint16_t conferenceId,
                            std::uint32_t* apeHandle) {
    Record("ApeAttach", Join({reserved, conferenceId}));
    const int result = m_pInner->ApeAttach(sink, reserved, conferenceId, apeHandle);
    if (apeHandle) m_apeHandle = *apeHandle;
    return result;
}

int SpyArmClient::ApeEnroll(std::uint32_t apeHandle, int enroll, std::uint32_t sessionId,
                            std::uint32_t reserved, int resourceCount,
                            ARMSessionResource* resources, const void* enrollInfo,
                            std::uint32_t enrollInfoLength, int mode) {
    Record("ApeEnroll", Join({apeHandle, enroll, sessionId, reserved, resourceCount}) + ", " +
                            Resources(resources, resourceCount) + ", " +
                            Join({enrollInfoLength, mode}));
    m_enrollPayloads.emplace_back(static_cast<const char*>(enrollInfo), enrollInfoLength);
    return m_pInner->ApeEnroll(apeHandle, enroll, sessionId, reserved, resourceCount, resources,
                               enrollInfo, enrollInfoLength, mode);
}

int SpyArmClient::ApeSendData(std::uint32_t apeHandle, std::uint32_t destUserId, int priority,
                              const void* data, std::uint32_t length, int reliable, int segment) {
    Record("ApeSendData", Join({apeHandle, destUserId, priority, length, reliable, segment}));
    return m_pInner->ApeSendData(apeHandle, destUserId, priority, data, length, reliable, segment);
}

int SpyArmClient::ApeDetach(std::uint32_t apeHandle) {
    Record("ApeDetach", std::to_string(apeHandle));
    return m_pInner->ApeDetach(apeHandle);
}

int SpyArmClient::RegisterSharedDataSink(std::uint32_t apeHandle, IArmSharedDataSink* sink) {
    Record("RegisterSharedDataSink", std::to_string(apeHandle));
    m_pRegisteredSink = sink;
    return m_pInner->RegisterSharedDataSink(apeHandle, sink);
}

int SpyArmClient::AllocNameHandle(std::uint32_t apeHandle, std::uint32_t count, NameHandle* entries,
                                  IArmAllocHandleSink* sink) {
    Record("AllocNameHandle", Join({apeHandle, count}));
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
    Record("ApeSharedDataActionEx",
           Join({apeHandle, cacheHandle, reserved1, reserved2, action, flags, reserved3, confirm}));
    return m_pInner->ApeSharedDataActionEx(apeHandle, cacheHandle, reserved1, reserved2, action,
                                           flags, memHandle, reserved3, confirm);
}

int SpyArmClient::ApeRequestSharedDataEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                         std::uint32_t reserved, tagCacheRequestType type,
                                         std::uint32_t maxItems, IArmSharedDataSink* sink) {
    Record("ApeRequestSharedDataEx", Join({apeHandle, cacheHandle, reserved, type, maxItems}));
    return m_pInner->ApeRequestSharedDataEx(apeHandle, cacheHandle, reserved, type, maxItems, sink);
}

int SpyArmClient::AllocMemHandle(std::uint32_t size, std::uint32_t* handle) {
    Record("AllocMemHandle", std::to_string(size));
    return m_pInner->AllocMemHandle(size, handle);
}

int SpyArmClient::FreeMemHandle(std::uint32_t handle) {
    Record("FreeMemHandle", std::to_string(handle));
    return m_pInner->FreeMemHandle(handle);
}

int SpyArmClient::GetMemHandleSize(std::uint32_t handle, std::uint32_t* size) {
    Record("GetMemHandleSize", std::to_string(handle));
    return m_pInner->GetMemHandleSize(handle, size);
}

int SpyArmClient::WriteMemHandle(std::uint32_t handle, std::uint32_t offset, const void* data,
                                 std::uint32_t* size) {
    Record("WriteMemHandle", Join({handle, offset}));
    return m_pInner->WriteMemHandle(handle, offset, data, size);
}

int SpyArmClient::ReadMemHandle(std::uint32_t handle, std::uint32_t offset, void* buffer,
                                std::uint32_t* size) {
    Record("ReadMemHandle", Join({handle, offset}));
    return m_pInner->ReadMemHandle(handle, offset, buffer, size);
}
