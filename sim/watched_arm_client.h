// A participant's service object as the simulator hands it to the component: every request
// goes to the real service object, counted, and the flags of the newest cache write are
// remembered.
#pragma once

#include <cstdint>
#include <optional>

#include "platform/arm_service.h"

class WatchedArmClient final : public IArmClient {
public:
    explicit WatchedArmClient(IArmClient* inner) : m_pInner(inner) {}
    ~WatchedArmClient() = default;
    WatchedArmClient(const WatchedArmClient&) = delete;
    WatchedArmClient& operator=(const WatchedArmClient&) = delete;

    // The flags of the newest set or append to a cache; nullopt before the first.
    std::optional<std::uint32_t> LastCacheWriteFlags() const { return m_lastFlags; }
    // Requests made so far; a conference that nobody asked anything of has nothing on its way.
    std::uint64_t Calls() const { return m_calls; }

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
    IArmClient& Inner() {
        ++m_calls;
        return *m_pInner;
    }

    IArmClient* m_pInner;
    std::uint64_t m_calls = 0;
    std::optional<std::uint32_t> m_lastFlags;
};
