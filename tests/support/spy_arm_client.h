// Wraps a service object and records every request the component makes, its name and its
// arguments, then forwards it. Tests read the requests in order, the enroll payloads, the
// handle requests and the registered sinks.
#pragma once

#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "platform/arm_service.h"

class SpyArmClient final : public IArmClient {
    using Arm = IArmClient;

public:
    explicit SpyArmClient(IArmClient* inner) : m_pInner(inner) {}
    SpyArmClient(const SpyArmClient&) = delete;
    SpyArmClient& operator=(const SpyArmClient&) = delete;

    // The names of the calls, in order.
    std::vector<std::string> Calls() const;
    // Each call with its plain arguments, e.g. "ConferenceJoin(0, 5, 3)"; sinks, buffers and
    // other pointers are left out, ApeEnroll's session resources written out.
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
    bool Released() const { return Count("Release") > 0; }
    void ClearCalls() { m_details.clear(); }

    int Release() override { return Call("Release", &Arm::Release); }
    int Connect(IArmNodeControllerSink* sink, const char* userName, std::uint32_t a,
                std::uint32_t b, std::uint32_t c) override {
        return Call("Connect", &Arm::Connect, sink, userName, a, b, c);
    }
    int Destroy(IArmNodeControllerSink* sink, int flag) override {
        return Call("Destroy", &Arm::Destroy, sink, flag);
    }
    int SetSendOption(int option, const ARMSendOption* value) override {
        return Call("SetSendOption", &Arm::SetSendOption, option, value);
    }
    int ConferenceJoin(std::uint32_t reserved, std::uint16_t conferenceId, IArmConferenceSink* sink,
                       int mode) override {
        return Call("ConferenceJoin", &Arm::ConferenceJoin, reserved, conferenceId, sink, mode);
    }
    int ConferenceLeave(std::uint32_t reserved, std::uint16_t conferenceId,
                        IArmConferenceSink* sink) override {
        return Call("ConferenceLeave", &Arm::ConferenceLeave, reserved, conferenceId, sink);
    }
    int ApeAttach(IArmApeSink* sink, std::uint32_t reserved, std::uint16_t conferenceId,
                  std::uint32_t* apeHandle) override {
        const int result =
            Call("ApeAttach", &Arm::ApeAttach, sink, reserved, conferenceId, apeHandle);
        if (apeHandle) m_apeHandle = *apeHandle;
        return result;
    }
    int ApeEnroll(std::uint32_t apeHandle, int enroll, std::uint32_t sessionId,
                  std::uint32_t reserved, int resourceCount, ARMSessionResource* resources,
                  const void* enrollInfo, std::uint32_t enrollInfoLength, int mode) override {
        m_enrollPayloads.emplace_back(static_cast<const char*>(enrollInfo), enrollInfoLength);
        return Call("ApeEnroll", &Arm::ApeEnroll, apeHandle, enroll, sessionId, reserved,
                    resourceCount, Resources{resources, resourceCount}, enrollInfo,
                    enrollInfoLength, mode);
    }
    int ApeSendData(std::uint32_t apeHandle, std::uint32_t destUserId, int priority,
                    const void* data, std::uint32_t length, int reliable, int segment) override {
        return Call("ApeSendData", &Arm::ApeSendData, apeHandle, destUserId, priority, data, length,
                    reliable, segment);
    }
    int ApeDetach(std::uint32_t apeHandle) override {
        return Call("ApeDetach", &Arm::ApeDetach, apeHandle);
    }
    int RegisterSharedDataSink(std::uint32_t apeHandle, IArmSharedDataSink* sink) override {
        m_pRegisteredSink = sink;
        return Call("RegisterSharedDataSink", &Arm::RegisterSharedDataSink, apeHandle, sink);
    }
    int AllocNameHandle(std::uint32_t apeHandle, std::uint32_t count, NameHandle* entries,
                        IArmAllocHandleSink* sink) override {
        m_handleRequests.emplace_back(entries, entries + count);
        m_handleNames.clear();
        for (std::uint32_t i = 0; i < count; ++i)
            m_handleNames.emplace_back(entries[i].name,
                                       strnlen(entries[i].name, sizeof entries[i].name));
        return Call("AllocNameHandle", &Arm::AllocNameHandle, apeHandle, count, entries, sink);
    }
    int ApeSharedDataActionEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                              std::uint32_t reserved1, std::uint32_t reserved2,
                              tagCacheAction action, std::uint32_t flags, std::uint32_t memHandle,
                              std::uint32_t reserved3, int confirm) override {
        return Call("ApeSharedDataActionEx", &Arm::ApeSharedDataActionEx, apeHandle, cacheHandle,
                    reserved1, reserved2, action, flags, memHandle, reserved3, confirm);
    }
    int ApeRequestSharedDataEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                               std::uint32_t reserved, tagCacheRequestType type,
                               std::uint32_t maxItems, IArmSharedDataSink* sink) override {
        return Call("ApeRequestSharedDataEx", &Arm::ApeRequestSharedDataEx, apeHandle, cacheHandle,
                    reserved, type, maxItems, sink);
    }
    int AllocMemHandle(std::uint32_t size, std::uint32_t* handle) override {
        return Call("AllocMemHandle", &Arm::AllocMemHandle, size, handle);
    }
    int FreeMemHandle(std::uint32_t handle) override {
        return Call("FreeMemHandle", &Arm::FreeMemHandle, handle);
    }
    int GetMemHandleSize(std::uint32_t handle, std::uint32_t* size) override {
        return Call("GetMemHandleSize", &Arm::GetMemHandleSize, handle, size);
    }
    int WriteMemHandle(std::uint32_t handle, std::uint32_t offset, const void* data,
                       std::uint32_t* size) override {
        return Call("WriteMemHandle", &Arm::WriteMemHandle, handle, offset, data, size);
    }
    int ReadMemHandle(std::uint32_t handle, std::uint32_t offset, void* buffer,
                      std::uint32_t* size) override {
        return Call("ReadMemHandle", &Arm::ReadMemHandle, handle, offset, buffer, size);
    }

private:
    // Records name with the arguments that are plain values, then forwards the call.
    template <typename... P, typename... A>
    int Call(const char* name, int (Arm::*method)(P...), A... args) {
        std::string text;
        (Put(text, args), ...);
        m_details.push_back(std::string(name) + "(" + text + ")");
        return (m_pInner->*method)(args...);
    }
    // ApeEnroll's session resources, written out as {type, name, count} each.
    struct Resources {
        ARMSessionResource* list;
        int count;
        operator ARMSessionResource*() const { return list; }
    };
    static void Put(std::string& out, std::int64_t value) {
        Put(out, std::to_string(value).c_str());
    }
    static void Put(std::string& out, const Resources& resources);
    static void Put(std::string& out, const char* text) {
        out += (out.empty() ? "" : ", ") + std::string(text ? text : "null");
    }
    template <typename T>
    static void Put(std::string&, T*) {}  // sinks, buffers and out-values

    IArmClient* m_pInner;
    std::vector<std::string> m_details;
    std::vector<std::string> m_enrollPayloads;
    std::vector<std::string> m_handleNames;
    std::vector<std::vector<NameHandle>> m_handleRequests;
    IArmSharedDataSink* m_pRegisteredSink = nullptr;
    std::uint32_t m_apeHandle = 0;
};
