#include "netconf/presence_table.h"

#include <algorithm>

RosterChange PresenceTable::Apply(const PresenceState& state, Millis now, std::uint32_t mySession) {
    RosterChange change;
    const auto found = m_known.find(state.user);
    if (found != m_known.end()) {
        Known& known = found->second;
        const bool sameObject = known.state.instance == state.instance;
        if (sameObject && state.version < known.state.version) return change;  // overtaken
        known.heard = now;
        if (sameObject && state.version == known.state.version) return change;  // heartbeat
    }
    const bool wasIn = found != m_known.end() && IsIn(found->second.state, mySession);
    const bool isIn = IsIn(state, mySession);
    if (mySession != 0) {
        if (!wasIn && isIn) change.added.push_back({mySession, {Entry(state)}});
        if (wasIn && !isIn) change.deleted.push_back({mySession, {Entry(found->second.state)}});
        if (wasIn && isIn && found->second.state.enrollEpoch != state.enrollEpoch) {
            change.modified.push_back({mySession, {Entry(state)}});
        }
    }
    if (!state.attached) {
        if (found != m_known.end()) m_known.erase(found);
        return change;
    }
    Known& known = m_known[state.user];
    if (known.state.sessionId != state.sessionId || known.enrolledOrder == 0) {
        known.enrolledOrder = m_nextOrder++;
    }
    known.state = state;
    known.heard = now;
    return change;
}

RosterChange PresenceTable::Expire(Millis now, std::uint32_t mySession) {
    RosterChange change;
    for (auto it = m_known.begin(); it != m_known.end();) {
        if (now - it->second.heard < kSilenceLimit) {
            ++it;
            continue;
        }
        if (mySession != 0 && IsIn(it->second.state, mySession)) {
            change.deleted.push_back({mySession, {Entry(it->second.state)}});
        }
        it = m_known.erase(it);
    }
    return change;
}

std::optional<std::string> PresenceTable::UserOf(std::uint32_t userId) const {
    for (const auto& entry : m_known) {
        if (entry.second.state.userId == userId) return entry.first;
    }
    return std::nullopt;
}

std::vector<RosterUserEntry> PresenceTable::Members(std::uint32_t sessionId) const {
    std::vector<const Known*> members;
    for (const auto& entry : m_known) {
        if (IsIn(entry.second.state, sessionId)) members.push_back(&entry.second);
    }
    std::sort(members.begin(), members.end(),
              [](const Known* a, const Known* b) { return a->enrolledOrder < b->enrolledOrder; });
    std::vector<RosterUserEntry> entries;
    for (const Known* known : members)
        entries.push_back(Entry(known->state));
    return entries;
}

bool PresenceTable::IsIn(const PresenceState& state, std::uint32_t sessionId) {
    return sessionId != 0 && state.attached && state.sessionId == sessionId;
}

RosterUserEntry PresenceTable::Entry(const PresenceState& state) {
    return {state.nodeId, state.userId, state.enrollInfo};
}
