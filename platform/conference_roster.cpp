#include "platform/conference_roster.h"

RosterBatch::RosterBatch(const RosterChange& change) : m_change(change) {
    m_users.reserve(change.added.size() + change.deleted.size() + change.modified.size());
    AddRecords(change.added);
    AddRecords(change.deleted);
    AddRecords(change.modified);
}

int RosterBatch::DeliverTo(IArmApeSink& sink, std::uint32_t serviceId, std::uint16_t value) {
    return sink.ApeRosterChanged(serviceId, value,
                                 static_cast<std::uint32_t>(m_change.added.size()),
                                 static_cast<std::uint32_t>(m_change.deleted.size()),
                                 static_cast<std::uint32_t>(m_change.modified.size()),
                                 m_records.empty() ? nullptr : m_records.data());
}

void RosterBatch::AddRecords(const std::vector<RosterRecord>& records) {
    for (const RosterRecord& record : records) {
        std::vector<ARMApeUser>& users = m_users.emplace_back();
        for (const RosterUserEntry& entry : record.users) {
            users.push_back({entry.nodeId, entry.userId,
                             entry.enrollInfo.empty() ? nullptr : entry.enrollInfo.data(),
                             static_cast<std::int32_t>(entry.enrollInfo.size())});
        }
        ARMApeRoster roster{};
        roster.dwSessionID = record.sessionId;
        roster.wUserCount = static_cast<std::uint16_t>(users.size());
        roster.pUsers = users.empty() ? nullptr : users.data();
        m_records.push_back(roster);
    }
}
