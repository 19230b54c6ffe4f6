#include "tests/support/arm_recorder.h"

#include <utility>

namespace {

ArmEvent Event(const char* name, std::uint32_t apeHandle = 0, short result = 0) {
    ArmEvent event;
    event.name = name;
    event.apeHandle = apeHandle;
    event.result = result;
    return event;
}

std::vector<std::uint8_t> Bytes(const void* data, std::int64_t length) {
    if (data == nullptr || length <= 0) return {};
    const auto* bytes = static_cast<const std::uint8_t*>(data);
    return std::vector<std::uint8_t>(bytes, bytes + length);
}

// Copies count records starting at records[first].
std::vector<RosterRecord> CopyRecords(const ARMApeRoster* records, std::uint32_t first,
                                      std::uint32_t count) {
    std::vector<RosterRecord> copies;
    for (std::uint32_t i = first; i < first + count; ++i) {
        const ARMApeRoster record = records[i];
        RosterRecord copy;
        copy.sessionId = record.dwSessionID;
        for (std::uint16_t u = 0; u < record.wUserCount && record.pUsers != nullptr; ++u) {
            const ARMApeUser user = record.pUsers[u];
            copy.users.push_back(
                {user.dwNodeID, user.dwUserID, Bytes(user.pEnrollInfo, user.nEnrollInfoLen)});
        }
        copies.push_back(std::move(copy));
    }
    return copies;
}

}  // namespace

std::vector<std::string> ArmRecorder::Names() const {
    std::vector<std::string> names;
    for (const ArmEvent& event : m_events)
        names.push_back(event.name);
    return names;
}

std::vector<ArmEvent> ArmRecorder::Named(const std::string& name) const {
    std::vector<ArmEvent> found;
    for (const ArmEvent& event : m_events)
        if (event.name == name) found.push_back(event);
    return found;
}

int ArmRecorder::ConnectConfirm(short result, std::uint32_t value) {
    ArmEvent event = Event("ConnectConfirm", 0, result);
    event.value = value;
    return Record(std::move(event));
}

int ArmRecorder::ConferenceJoinConfirm(std::uint16_t conferenceId, const char*, short result,
                                       std::uint32_t value) {
    ArmEvent event = Event("ConferenceJoinConfirm", 0, result);
    event.entityId = conferenceId;
    event.value = value;
    return Record(std::move(event));
}

int ArmRecorder::ApeAttachConfirm(std::uint32_t apeHandle, short result, std::uint32_t userId) {
    ArmEvent event = Event("ApeAttachConfirm", apeHandle, result);
    event.userId = userId;
    return Record(std::move(event));
}

int ArmRecorder::ApeEnrollConfirm(std::uint32_t apeHandle, short result, short resourceNumber,
                                  ARMSessionResource* resources) {
    ArmEvent event = Event("ApeEnrollConfirm", apeHandle, result);
    event.value = static_cast<std::uint32_t>(resourceNumber);
    for (short i = 0; i < resourceNumber && resources != nullptr; ++i) {
        const ARMSessionResource resource = resources[i];
        event.resources.push_back({resource.pszName == nullptr ? "" : resource.pszName,
                                   resource.wResourceType, resource.dwCount, resource.dwValue,
                                   resource.wStatus});
    }
    return Record(std::move(event));
}

int ArmRecorder::ApeDataIndication(std::uint32_t apeHandle, std::uint32_t senderId,
                                   std::uint32_t value, std::uint16_t flags, const void* data,
                                   std::uint32_t length) {
    ArmEvent event = Event("ApeDataIndication", apeHandle);
    event.userId = senderId;
    event.value = value;
    event.flags = flags;
    event.data = Bytes(data, length);
    return Record(std::move(event));
}

int ArmRecorder::ApeRosterChanged(std::uint32_t serviceId, std::uint16_t value,
                                  std::uint32_t addedCount, std::uint32_t deletedCount,
                                  std::uint32_t modifiedCount, ARMApeRoster* records) {
    ArmEvent event = Event("ApeRosterChanged", serviceId);
    event.flags = value;
    if (records != nullptr) {
        event.roster.added = CopyRecords(records, 0, addedCount);
        event.roster.deleted = CopyRecords(records, addedCount, deletedCount);
        event.roster.modified = CopyRecords(records, addedCount + deletedCount, modifiedCount);
    }
    return Record(std::move(event));
}

int ArmRecorder::ApeCacheActionConfirmEx(std::uint32_t apeHandle, std::uint32_t entityId,
                                         tagCacheAction action, std::uint32_t requestIdx,
                                         std::uint32_t cacheId, short result) {
    ArmEvent event = Event("ApeCacheActionConfirmEx", apeHandle, result);
    event.entityId = entityId;
    event.action = action;
    event.requestIdx = requestIdx;
    event.cacheId = cacheId;
    return Record(std::move(event));
}

int ArmRecorder::SharedDataReceivedEx(std::uint32_t apeHandle, std::uint32_t cacheId,
                                      std::uint32_t entityId, std::uint32_t memHandle, short result,
                                      tagCacheAction action, std::uint32_t senderId,
                                      std::uint32_t value, std::uint16_t flags) {
    ArmEvent event = Event("SharedDataReceivedEx", apeHandle, result);
    event.cacheId = cacheId;
    event.entityId = entityId;
    event.memHandle = memHandle;
    event.action = action;
    event.userId = senderId;
    event.value = value;
    event.flags = flags;
    ReadMemory(event);
    return Record(std::move(event));
}

int ArmRecorder::AllocNameHandleConfirm(std::uint32_t apeHandle, std::uint32_t count,
                                        NameHandle* handles, short result, std::uint32_t reserved) {
    ArmEvent event = Event("AllocNameHandleConfirm", apeHandle, result);
    event.value = reserved;
    if (handles != nullptr) event.handles.assign(handles, handles + count);
    return Record(std::move(event));
}

int ArmRecorder::Other(const char* name) {
    return Record(Event(name));
}

int ArmRecorder::Record(ArmEvent event) {
    m_events.push_back(event);
    // The hook gets its own copy: it may clear the recorder.
    if (m_hook) m_hook(event);
    return 0;
}

void ArmRecorder::ReadMemory(ArmEvent& event) const {
    std::uint32_t size = 0;
    if (m_pClient == nullptr || event.memHandle == 0 ||
        m_pClient->GetMemHandleSize(event.memHandle, &size) != 0) {
        return;
    }
    event.data.resize(size);
    if (m_pClient->ReadMemHandle(event.memHandle, 0, event.data.data(), &size) != 0) {
        event.data.clear();
        return;
    }
    event.data.resize(size);
    event.memReadable = true;
}
