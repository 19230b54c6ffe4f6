// A crowd of participants for the roster benchmarks: their enroll records, reported to an
// engine one at a time, and the group entries the send-to menu is built around.
#pragma once

#include <chrono>
#include <cstdint>
#include <string>
#include <vector>

#include "engine/chat_client.h"
#include "pdu/roster_info_pdu.h"

struct CrowdMember {
    std::uint32_t node;
    std::string enroll;
};

// count participants on nodes from firstNode on, named in a scrambled order so that arrivals
// land all over the menu; every panelistEvery-th one a panelist (0: none).
inline std::vector<CrowdMember> MakeCrowd(int count, std::uint32_t firstNode, int panelistEvery) {
    std::vector<CrowdMember> people;
    std::uint32_t state = 12345;
    for (int i = 0; i < count; ++i) {
        state = state * 1103515245u + 12345u;
        const std::uint32_t node = firstNode + static_cast<std::uint32_t>(i);
        CRosterInfoPDU pdu;
        pdu.SetNodeID(node);
        pdu.SetUserName("user " + std::to_string(state % 1000003u));
        pdu.SetRoleSet(panelistEvery != 0 && i % panelistEvery == 0 ? ROLE_PANELIST : 0u);
        pdu.SetVisible(1);
        pdu.SetUserType(1u);
        pdu.GenerateXMLPDU();
        people.push_back({node, pdu.ToWireText()});
    }
    return people;
}

// Reports one member added (or gone) in session; returns the microseconds it took.
inline double ReportMember(CChatClient& engine, std::uint32_t session, const CrowdMember& person,
                           bool added) {
    ARMApeUser user{person.node, person.node + 100000,
                    reinterpret_cast<const std::uint8_t*>(person.enroll.data()),
                    static_cast<std::int32_t>(person.enroll.size())};
    ARMApeRoster record{};
    record.dwSessionID = session;
    record.wUserCount = 1;
    record.pUsers = &user;
    const auto start = std::chrono::steady_clock::now();
    engine.ApeRosterChanged(1, 0, added ? 1 : 0, added ? 0 : 1, 0, &record);
    return std::chrono::duration<double, std::micro>(std::chrono::steady_clock::now() - start)
        .count();
}

// Adds one group entry to the send-to menu, as the host client does.
inline void AddMenuGroup(CChatClient& engine, const char* name, std::uint32_t id) {
    _tagChatGroupInfo info{};
    info.dwIndex = 1000;
    info.dwGroupType = 1;
    info.dwGroupId = id;
    info.cszGroupName = name;
    engine.AddGroup(&info, 1);
}
