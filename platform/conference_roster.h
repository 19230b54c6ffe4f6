// Application-roster changes as plain values, and the record layout one ApeRosterChanged
// callback hands out, built from them for the duration of that callback.
#pragma once

#include <cstdint>
#include <vector>

#include "platform/arm_service.h"

// One enrolled participant: node id, user id and the enroll payload exactly as given.
struct RosterUserEntry {
    std::uint32_t nodeId = 0;
    std::uint32_t userId = 0;
    std::vector<std::uint8_t> enrollInfo;
};

// The participants of one application session that a record reports.
struct RosterRecord {
    std::uint32_t sessionId = 0;
    std::vector<RosterUserEntry> users;
};

// One roster callback's worth: records added, deleted and modified.
struct RosterChange {
    std::vector<RosterRecord> added;
    std::vector<RosterRecord> deleted;
    std::vector<RosterRecord> modified;
};

// Lays out a RosterChange as back-to-back ARMApeRoster records (added, deleted, modified)
// whose user entries point into the change; the change must outlive the batch. An empty
// enroll payload is handed out as a null pointer with length 0.
class RosterBatch {
public:
    explicit RosterBatch(const RosterChange& change);
    RosterBatch(const RosterBatch&) = delete;
    RosterBatch& operator=(const RosterBatch&) = delete;

    // Delivers the batch to sink with the given service id and value.
    int DeliverTo(IArmApeSink& sink, std::uint32_t serviceId, std::uint16_t value);

private:
    void AddRecords(const std::vector<RosterRecord>& records);

    const RosterChange& m_change;
    std::vector<std::vector<ARMApeUser>> m_users;  // one vector per record
    std::vector<ARMApeRoster> m_records;
};
