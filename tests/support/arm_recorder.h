// A stand-in for the component on the conference service: records every callback a service
// makes, in order, with copies of whatever lives only during the callback (data, delivered
// memory-handle contents, roster records, name handles, session resources).
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "platform/conference_null_sink.h"
#include "platform/conference_roster.h"

// A session resource as a confirmation filled it (unpacked, so tests can compare its fields).
struct RecordedResource {
    std::string name;
    std::uint32_t value = 0;
    std::uint16_t status = 0;
};

// One recorded callback. Fields a callback does not have keep their defaults.
struct ArmEvent {
    explicit ArmEvent(const char* callback = "", std::uint32_t ape = 0, short answer = 0,
                      std::uint32_t user = 0)
        : name(callback), apeHandle(ape), result(answer), userId(user) {}
    std::string name;  // the callback, e.g. "ApeAttachConfirm"
    std::uint32_t apeHandle = 0;
    short result = 0;
    std::uint32_t userId = 0;  // attach: the granted id; data and deliveries: the sender id
    std::uint32_t value = 0;
    std::uint16_t flags = 0;
    std::uint32_t cacheId = 0;
    std::uint32_t entityId = 0;
    std::uint32_t memHandle = 0;
    tagCacheAction action = CACHE_SET;
    std::vector<std::uint8_t> data;  // private data, or the delivered memory handle's bytes
    std::vector<NameHandle> handles;
    std::vector<RecordedResource> resources;
    RosterChange roster;
};

// The callbacks no service makes (tokens, conference rosters, disconnects) answer 0 unrecorded.
class ArmRecorder final : public ArmNullSink {
public:
    // client (may be null) is asked for the contents of delivered memory handles.
    explicit ArmRecorder(IArmClient* client = nullptr) : m_pClient(client) {}
    ArmRecorder(const ArmRecorder&) = delete;
    ArmRecorder& operator=(const ArmRecorder&) = delete;

    // Runs inside every callback, right after it was recorded (for re-entry and release).
    void SetHook(std::function<void(const ArmEvent&)> hook) { m_hook = std::move(hook); }

    const std::vector<ArmEvent>& Events() const { return m_events; }
    // The callback names in order.
    std::vector<std::string> Names() const {
        std::vector<std::string> names;
        for (const ArmEvent& event : m_events)
            names.push_back(event.name);
        return names;
    }
    // The events of one callback, in order.
    std::vector<ArmEvent> Named(const std::string& name) const {
        std::vector<ArmEvent> found;
        for (const ArmEvent& event : m_events)
            if (event.name == name) found.push_back(event);
        return found;
    }
    std::size_t Count(const std::string& name) const { return Named(name).size(); }
    void Clear() { m_events.clear(); }

    int ConnectConfirm(short result, std::uint32_t) override {
        return Record(ArmEvent("ConnectConfirm", 0, result));
    }
    int ConferenceJoinConfirm(std::uint16_t, const char*, short result, std::uint32_t) override {
        return Record(ArmEvent("ConferenceJoinConfirm", 0, result));
    }
    int ApeAttachConfirm(std::uint32_t apeHandle, short result, std::uint32_t userId) override {
        return Record(ArmEvent("ApeAttachConfirm", apeHandle, result, userId));
    }
    int ApeEnrollConfirm(std::uint32_t apeHandle, short result, short resourceNumber,
                         ARMSessionResource* resources) override {
        ArmEvent event("ApeEnrollConfirm", apeHandle, result);
        for (short i = 0; i < resourceNumber && resources != nullptr; ++i)
            event.resources.push_back({resources[i].pszName == nullptr ? "" : resources[i].pszName,
                                       resources[i].dwValue, resources[i].wStatus});
        return Record(std::move(event));
    }
    int ApeDataIndication(std::uint32_t apeHandle, std::uint32_t senderId, std::uint32_t value,
                          std::uint16_t flags, const void* data, std::uint32_t length) override;
    int ApeRosterChanged(std::uint32_t serviceId, std::uint16_t value, std::uint32_t addedCount,
                         std::uint32_t deletedCount, std::uint32_t modifiedCount,
                         ARMApeRoster* records) override;
    using ArmNullSink::ApeRosterChanged;  // the conference sink's one stays silent
    int ApeCacheActionConfirmEx(std::uint32_t apeHandle, std::uint32_t entityId,
                                tagCacheAction action, std::uint32_t, std::uint32_t cacheId,
                                short result) override {
        ArmEvent event("ApeCacheActionConfirmEx", apeHandle, result);
        event.entityId = entityId;
        event.action = action;
        event.cacheId = cacheId;
        return Record(std::move(event));
    }
    int SharedDataReceivedEx(std::uint32_t apeHandle, std::uint32_t cacheId, std::uint32_t entityId,
                             std::uint32_t memHandle, short result, tagCacheAction action,
                             std::uint32_t senderId, std::uint32_t value,
                             std::uint16_t flags) override;
    int AllocNameHandleConfirm(std::uint32_t apeHandle, std::uint32_t count, NameHandle* handles,
                               short result, std::uint32_t) override {
        ArmEvent event("AllocNameHandleConfirm", apeHandle, result);
        if (handles != nullptr) event.handles.assign(handles, handles + count);
        return Record(std::move(event));
    }

private:
    // Stores event, runs the hook (with its own copy: it may clear the recorder); returns 0,
    // what the callbacks answer.
    int Record(ArmEvent event) {
        m_events.push_back(event);
        if (m_hook) m_hook(event);
        return 0;
    }

    IArmClient* m_pClient;
    std::function<void(const ArmEvent&)> m_hook;
    std::vector<ArmEvent> m_events;
};
