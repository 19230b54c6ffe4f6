// A stand-in for the component on the conference service: implements all five sinks and
// records every callback in order, with copies of whatever lives only during the callback
// (data, delivered memory-handle contents, roster records, name handles, session resources).
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "platform/arm_service.h"
#include "platform/conference_roster.h"

// A session resource as a confirmation filled it (unpacked, so tests can compare its fields).
struct RecordedResource {
    std::string name;
    std::uint16_t type = 0;
    std::uint32_t count = 0;
    std::uint32_t value = 0;
    std::uint16_t status = 0;
};

// One recorded callback. Fields a callback does not have keep their defaults.
struct ArmEvent {
    std::string name;  // the callback, e.g. "ApeAttachConfirm"; the conference sink's roster
                       // callback is "ConferenceApeRosterChanged"
    std::uint32_t apeHandle = 0;
    short result = 0;
    std::uint32_t userId = 0;  // attach: the granted id; data and deliveries: the sender id
    std::uint32_t value = 0;
    std::uint16_t flags = 0;
    std::uint32_t cacheId = 0;
    std::uint32_t entityId = 0;
    std::uint32_t memHandle = 0;
    std::uint32_t requestIdx = 0;
    tagCacheAction action = CACHE_SET;
    std::vector<std::uint8_t> data;  // private data, or the delivered memory handle's bytes
    bool memReadable = false;        // the delivered memory handle could be read
    std::vector<NameHandle> handles;
    std::vector<RecordedResource> resources;
    RosterChange roster;
};

class ArmRecorder final : public IArmNodeControllerSink,
                          public IArmConferenceSink,
                          public IArmApeSink,
                          public IArmSharedDataSink,
                          public IArmAllocHandleSink {
public:
    // client (may be null, or set later) is asked for the contents of delivered memory handles.
    explicit ArmRecorder(IArmClient* client = nullptr) : m_pClient(client) {}
    ArmRecorder(const ArmRecorder&) = delete;
    ArmRecorder& operator=(const ArmRecorder&) = delete;

    void SetClient(IArmClient* client) { m_pClient = client; }
    // Runs inside every callback, right after it was recorded (for re-entry and release).
    void SetHook(std::function<void(const ArmEvent&)> hook) { m_hook = std::move(hook); }

    const std::vector<ArmEvent>& Events() const { return m_events; }
    // The callback names in order.
    std::vector<std::string> Names() const;
    // The events of one callback, in order.
    std::vector<ArmEvent> Named(const std::string& name) const;
    std::size_t Count(const std::string& name) const { return Named(name).size(); }
    void Clear() { m_events.clear(); }

    int ConnectConfirm(short result, std::uint32_t value) override;
    // Callbacks the services never make are recorded by name only.
    int DisconnectIndication(short) override { return Other("DisconnectIndication"); }
    int TransportStatusIndication(std::uint32_t) override { return Other("TransportStatus"); }
    int DisconnectConfirm(short) override { return Other("DisconnectConfirm"); }

    int ConferenceJoinConfirm(std::uint16_t conferenceId, const char* conferenceName, short result,
                              std::uint32_t value) override;
    int ConferenceLeaveIndication(std::uint16_t, short) override {
        return Other("LeaveIndication");
    }
    int ConferenceRosterConfirm(std::uint16_t, short) override { return Other("RosterConfirm"); }
    int ConferenceRosterChanged(std::uint16_t, std::uint32_t) override { return Other("Roster"); }
    int ApeRosterConfirm(std::uint16_t, short) override { return Other("ApeRosterConfirm"); }
    int ApeRosterChanged(std::uint16_t, std::uint32_t) override {
        return Other("ConferenceApeRosterChanged");
    }

    int ApeAttachConfirm(std::uint32_t apeHandle, short result, std::uint32_t userId) override;
    int ApeEnrollConfirm(std::uint32_t apeHandle, short result, short resourceNumber,
                         ARMSessionResource* resources) override;
    int ApeDataIndication(std::uint32_t apeHandle, std::uint32_t senderId, std::uint32_t value,
                          std::uint16_t flags, const void* data, std::uint32_t length) override;
    int ApeBufferFullIndication(std::uint32_t) override { return Other("BufferFull"); }
    int TokenGrabConfirm(std::uint32_t, std::uint32_t, short) override { return Other("Token"); }
    int TokenInhibitConfirm(std::uint32_t, std::uint32_t, short) override { return Other("Token"); }
    int TokenGiveIndication(std::uint32_t, std::uint32_t, std::uint32_t) override {
        return Other("Token");
    }
    int TokenGiveConfirm(std::uint32_t, std::uint32_t, short) override { return Other("Token"); }
    int TokenPleaseIndication(std::uint32_t, std::uint32_t, std::uint32_t) override {
        return Other("Token");
    }
    int TokenReleaseConfirm(std::uint32_t, std::uint32_t, short) override { return Other("Token"); }
    int TokenTestConfirm(std::uint32_t, std::uint32_t, std::uint32_t) override {
        return Other("Token");
    }
    int ApeRosterInquireConfirm(std::uint32_t, short) override { return Other("RosterInquire"); }
    int ApeRosterRefreshConfirm(std::uint32_t, short) override { return Other("RosterRefresh"); }
    int ApeRosterReportIndication(std::uint32_t, std::uint32_t) override {
        return Other("RosterReport");
    }
    int ApeRosterChanged(std::uint32_t serviceId, std::uint16_t value, std::uint32_t addedCount,
                         std::uint32_t deletedCount, std::uint32_t modifiedCount,
                         ARMApeRoster* records) override;
    int ApeDetachIndication(std::uint32_t, short) override { return Other("DetachIndication"); }
    int ApeDataIndicationEx(std::uint32_t, std::uint32_t, const void*, std::uint32_t) override {
        return Other("ApeDataIndicationEx");
    }
    int ApeCacheActionConfirmEx(std::uint32_t apeHandle, std::uint32_t entityId,
                                tagCacheAction action, std::uint32_t requestIdx,
                                std::uint32_t cacheId, short result) override;

    int SharedDataReceived(std::uint32_t, std::uint32_t, std::uint32_t, short) override {
        return Other("SharedDataReceived");
    }
    int SharedDataReceivedEx(std::uint32_t apeHandle, std::uint32_t cacheId, std::uint32_t entityId,
                             std::uint32_t memHandle, short result, tagCacheAction action,
                             std::uint32_t senderId, std::uint32_t value,
                             std::uint16_t flags) override;

    int AllocHandleConfirm(std::uint32_t, std::uint32_t, short) override {
        return Other("AllocHandleConfirm");
    }
    int AllocNameHandleConfirm(std::uint32_t apeHandle, std::uint32_t count, NameHandle* handles,
                               short result, std::uint32_t reserved) override;

private:
    // Stores event, runs the hook; returns 0 (what the callbacks answer).
    int Record(ArmEvent event);
    int Other(const char* name);
    // Reads a delivered memory handle into event.
    void ReadMemory(ArmEvent& event) const;

    IArmClient* m_pClient;
    std::function<void(const ArmEvent&)> m_hook;
    std::vector<ArmEvent> m_events;
};
