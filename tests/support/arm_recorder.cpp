#include "tests/support/arm_recorder.h"

namespace {

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
        RosterRecord& copy = copies.emplace_back();
        copy.sessionId = records[i].dwSessionID;
        for (std::uint16_t u = 0; u < records[i].wUserCount && records[i].pUsers != nullptr; ++u) {
            const ARMApeUser& user = records[i].pUsers[u];
            copy.users.push_back(
                {user.dwNodeID, user.dwUserID, Bytes(user.pEnrollInfo, user.nEnrollInfoLen)});
        }
    }
    return copies;
}

}  // namespace

int ArmRecorder::ApeDataIndication(std::uint32_t apeHandle, std::uint32_t senderId, std::uint32_t,
                                   std::uint16_t flags, const void* data, std::uint32_t length) {
    ArmEvent event("ApeDataIndication", apeHandle, 0, senderId);
    event.flags = flags;
    event.data = Bytes(data, length);
    return Record(std::move(event));
}

int ArmRecorder::ApeRosterChanged(std::uint32_t serviceId, std::uint16_t, std::uint32_t addedCount,
                                  std::uint32_t deletedCount, std::uint32_t modifiedCount,
                                  ARMApeRoster* records) {
    ArmEvent event("ApeRosterChanged", serviceId);
    if (records != nullptr) {
        event.roster.added = CopyRecords(records, 0, addedCount);
        event.roster.deleted = CopyRecords(records, addedCount, deletedCount);
        event.roster.modified = CopyRecords(records, addedCount + deletedCount, modifiedCount);
    }
    return Record(std::move(event));
}

int ArmRecorder::SharedDataReceivedEx(std::uint32_t apeHandle, std::uint32_t cacheId,
                                      std::uint32_t entityId, std::uint32_t memHandle, short result,
                                      tagCacheAction action, std::uint32_t senderId,
                                      std::uint32_t value, std::uint16_t flags) {
    ArmEvent event("SharedDataReceivedEx", apeHandle, result, senderId);
    event.value = value;
    event.flags = flags;
    event.cacheId = cacheId;
    event.entityId = entityId;
    event.memHandle = memHandle;
    event.action = action;
    // The delivered memory handle lives for this callback only: keep a copy of its bytes.
    std::uint32_t size = 0;
    if (m_pClient != nullptr && memHandle != 0 &&
        m_pClient->GetMemHandleSize(memHandle, &size) == 0) {
        event.data.resize(size);
        if (m_pClient->ReadMemHandle(memHandle, 0, event.data.data(), &size) != 0) size = 0;
        event.data.resize(size);
    }
    return Record(std::move(event));
}
