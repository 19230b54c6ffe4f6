// Wraps a service object and records every request the component makes, its name and its
// arguments, then forwards it. Tests read the requests in order, the enroll payloads, the
// handle requests and the registered sinks.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "platform/arm_service.h"

class SpyArmClient final : public IArmClient {
public:
    explicit SpyArmClient(IArmClient* inner) : m_pInner(inner) {}
    ~SpyArmClient() = default;
    SpyArmClient(const SpyArmClient&) = delete;
    SpyArmClient& operator=(const SpyArmClient&) = delete;

    const std::vector<std::string>& Calls() const { return m_calls; }
    // Each call with its plain arguments, e.g. "ConferenceJoin(0, 5, 3)"; sinks are left out,
    // handles and pointers written out only where they are constants.
    const std::vector<std::string>& CallsWithArguments() const { return m_details; }
    std::size_t Count(const std::string& name) const;
    // The payload of every ApeEnroll, in order.
    const std::vector<std::string>& EnrollPayloads() const { return m_enrollPayloads; }
    // The names asked for in the last AllocNameHandle.
    const std::vector<std::string>& HandleNames() const { return m_handleNames; }
    // The entries of every AllocNameHandle, in order, as they were handed over.
    const std::vector<std::vector<NameHandle>>& HandleRequests() const { return m_handleRequests; }
    // The ape handle the service wrote at the last ApeAttach.
    std::uint32_t ApeHandle() const { return m_apeHandle; }
    IArmSharedDataSink* RegisteredSink() const { return m_pRegisteredSink; }
    bool Released() const { return m_bReleased; }
    void ClearCalls() {
        m_calls.clear();
        m_details.clear();
    }

    int Release() override;
    int Connect(IArmNodeControllerSink* sink, const char* userName, std::uint32_t a,
                std::uint32_t b, std::uint32_t c) override;
    int Destroy(IArmNodeControllerSink* sink, int flag) override;
    int SetSendOption(int option, const ARMSendOption* value) override;
    int ConferenceJoin(std::uint32_t reserved, std::uint16_t conferenceId, IArmConferenceSink* sink,
                       int mode) override;
    int ConferenceLeave(std::uint32_t reserved, std::uint16_t conferenceId,
                        IArmConferenceSink* sink) override;
    int ApeAttach(IArmApeSink* sink, std::uint32_t reserved, std::uint16_t conferenceId,
                  std::uint32_t* apeHandle) override;
    int ApeEnroll(std::uint32_t apeHandle, int enroll, std::uint32_t sessionId,
                  std::uint32_t reserved, int resourceCount, ARMSessionResource* resources,
                  const void* enrollInfo, std::uint32_t enrollInfoLength, int mode) override;
    int ApeSendData(std::uint32_t apeHandle, std::uint32_t destUserId, int priority,
                    const void* data, std::uint32_t length, int reliable, int segment) override;
    int ApeDetach(std::uint32_t apeHandle) override;
    int RegisterSharedDataSink(std::uint32_t apeHandle, IArmSharedDataSink* sink) override;
    int AllocNameHandle(std::uint32_t apeHandle, std::uint32_t count, NameHandle* entries,
                        IArmAllocHandleSink* sink) override;
    int ApeSharedDataActionEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                              std::uint32_t reserved1, std::uint32_t reserved2,
                              tagCacheAction action, std::uint32_t flags, std::uint32_t memHandle,
                              std::uint32_t reserved3, int confirm) override;
    int ApeRequestSharedDataEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                               std::uint32_t reserved, tagCacheRequestType type,
                               std::uint32_t maxItems, IArmSharedDataSink* sink) override;
    int AllocMemHandle(std::uint32_t size, std::uint32_t* handle) override;
    int FreeMemHandle(std::uint32_t handle) override;
    int GetMemHandleSize(std::uint32_t handle, std::uint32_t* size) override;
    int WriteMemHandle(std::uint32_t handle, std::uint32_t offset, const void* data,
                       std::uint32_t* size) override;
    int ReadMemHandle(std::uint32_t handle, std::uint32_t offset, void* buffer,
                      std::uint32_t* size) override;

private:
    void Record(const std::string& name, const std::string& arguments);

    IArmClient* m_pInner;
    std::vector<std::string> m_calls;
    std::vector<std::string> m_details;
    std::vector<std::string> m_enrollPayloads;
    std::vector<std::string> m_handleNames;
    std::vector<std::vector<NameHandle>> m_handleRequests;
    IArmSharedDataSink* m_pRegisteredSink = nullptr;
    std::uint32_t m_apeHandle = 0;
    bool m_bReleased = false;
};
