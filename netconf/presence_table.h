// What one participant knows of the others from their presence announcements: who is attached
// under which user id, who is enrolled in which session with which payload, and the roster
// changes the local participant must see when an announcement arrives or falls silent.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "platform/conference_roster.h"

// One participant's state as it announces it. A newer state of the same object carries a
// larger version; another object of the same user (a restarted process) another instance.
struct PresenceState {
    std::string user;
    std::uint32_t nodeId = 0;
    std::uint32_t userId = 0;
    std::uint64_t instance = 0;
    std::uint64_t version = 0;
    bool attached = false;          // false: the participant left
    std::uint32_t sessionId = 0;    // 0: not enrolled
    std::uint64_t enrollEpoch = 0;  // grows with every enroll, so a re-enroll is a change
    std::vector<std::uint8_t> enrollInfo;
};

class PresenceTable {
public:
    using Millis = std::int64_t;
    // A participant not heard of for this long is taken for gone.
    static constexpr Millis kSilenceLimit = 6000;

    // Takes in an announcement heard at now. Returns what the local participant, enrolled in
    // mySession (0: not enrolled, sees nothing), must be told.
    RosterChange Apply(const PresenceState& state, Millis now, std::uint32_t mySession);
    // Drops everybody not heard of since now - kSilenceLimit, with the change that makes.
    RosterChange Expire(Millis now, std::uint32_t mySession);
    // Forgets everybody, reporting nothing.
    void Clear() { m_known.clear(); }

    // The user name of an attached participant holding userId.
    std::optional<std::string> UserOf(std::uint32_t userId) const;
    // The participants enrolled in sessionId, in the order they enrolled there.
    std::vector<RosterUserEntry> Members(std::uint32_t sessionId) const;

private:
    struct Known {
        PresenceState state;
        Millis heard = 0;
        std::uint64_t enrolledOrder = 0;  // when it entered its current session
    };
    static bool IsIn(const PresenceState& state, std::uint32_t sessionId);
    static RosterUserEntry Entry(const PresenceState& state);

    std::map<std::string, Known> m_known;  // by user name
    std::uint64_t m_nextOrder = 1;
};
