// Roster growth under the privilege rules: a meeting-type-1 attendee allowed private chat
// watches 10,000 participants arrive. Prints the cost of one arrival near 1,000 and near
// 10,000 participants and their ratio (target: at most 3), the cost of one full privilege
// re-application at 1,000 and at 10,000 participants and its growth (target: at most 200 ms
// at 10,000), and checks that every roster answer the rules use (by node id, by user id, by
// user and node, the first host, the host and privileged counts) equals a plain walk of the
// roster, so the menu commands are those the straightforward scan gives.
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

#include "engine/chat_client.h"
#include "pdu/roster_info_pdu.h"
#include "platform/trace.h"

namespace {

constexpr std::uint32_t kSession = 77;
constexpr std::uint32_t kMyNode = 1;
constexpr std::uint32_t kFirstNode = 1000;
constexpr int kParticipants = 10000;
constexpr int kWindow = 200;  // arrivals averaged at each checkpoint
constexpr int kSmall = 1000;

using Clock = std::chrono::steady_clock;

struct Participant {
    std::uint32_t node;
    std::string enroll;
};

// Every tenth participant is a panelist; names in a scrambled order.
std::vector<Participant> MakeParticipants() {
    std::vector<Participant> people;
    std::uint32_t state = 12345;
    for (int i = 0; i < kParticipants; ++i) {
        state = state * 1103515245u + 12345u;
        const std::uint32_t node = kFirstNode + static_cast<std::uint32_t>(i);
        CRosterInfoPDU pdu;
        pdu.SetNodeID(node);
        pdu.SetUserName("user " + std::to_string(state % 1000003u));
        pdu.SetRoleSet(i % 10 == 0 ? ROLE_PANELIST : 0u);
        pdu.SetVisible(1);
        pdu.SetUserType(1u);
        pdu.GenerateXMLPDU();
        people.push_back({node, pdu.ToWireText()});
    }
    return people;
}

double Arrive(CChatClient& engine, const Participant& person) {
    ARMApeUser user{person.node, person.node + 100000,
                    reinterpret_cast<const std::uint8_t*>(person.enroll.data()),
                    static_cast<std::int32_t>(person.enroll.size())};
    ARMApeRoster record{};
    record.dwSessionID = kSession;
    record.wUserCount = 1;
    record.pUsers = &user;
    const Clock::time_point start = Clock::now();
    engine.ApeRosterChanged(1, 0, 1, 0, 0, &record);
    return std::chrono::duration<double, std::micro>(Clock::now() - start).count();
}

double Reapply(CChatClient& engine) {
    const Clock::time_point start = Clock::now();
    engine.OnPrivilegeChanged(engine.Privilege(), 1);
    return std::chrono::duration<double, std::milli>(Clock::now() - start).count();
}

// True when the roster's indexed answers equal a walk over its items.
bool LookupsMatchTheWalk(const CUserListManager& roster) {
    std::uint32_t hosts = 0, privileged = 0;
    const UserItem* firstHost = nullptr;
    for (std::uint32_t i = 0; i < roster.GetCount(); ++i) {
        const UserItem* item = roster.GetUserItemByIndex(i);
        if (item->dwRoles & ROLE_HOST) {
            ++hosts;
            if (!firstHost) firstHost = item;
        }
        if (item->dwRoles & (ROLE_HOST | ROLE_PRESENTER | ROLE_PANELIST)) ++privileged;
        const UserItem* byNode = nullptr;
        const UserItem* byUser = nullptr;
        for (std::uint32_t j = 0; j <= i && (!byNode || !byUser); ++j) {
            const UserItem* other = roster.GetUserItemByIndex(j);
            if (!byNode && other->dwNodeID == item->dwNodeID) byNode = other;
            if (!byUser && other->dwUserID == item->dwUserID) byUser = other;
        }
        if (roster.GetUserItemFromNodeId(item->dwNodeID) != byNode ||
            roster.GetUserItemFromUserId(item->dwUserID) != byUser ||
            !roster.HasUserOnNode(item->dwUserID, item->dwNodeID))
            return false;
    }
    return roster.GetHostCount() == hosts && roster.GetPrivilegedCount() == privileged &&
           roster.GetHosUser() == firstHost;
}

}  // namespace

int main() {
    SetTraceSink([](TraceLevel, const char*, const char*) {});
    CChatClient engine;
    ChatData data{};
    data.dwSessionID = kSession;
    data.lpszUserName = "me";
    data.dwNodeID = kMyNode;
    data.lMeetingType = 1;
    engine.Initialize(data);
    for (int i = 0; i < 20; ++i)
        engine.OnTick();
    for (const auto& group : {std::make_pair("Host", 1u), std::make_pair("All Panelists", 4u),
                              std::make_pair("All Attendees", 8u)}) {
        _tagChatGroupInfo info{};
        info.dwIndex = 1000;
        info.dwGroupType = 1;
        info.dwGroupId = group.second;
        info.cszGroupName = group.first;
        engine.AddGroup(&info, 1);
    }
    engine.OnPrivilegeChanged(0x4F, 0);

    const std::vector<Participant> people = MakeParticipants();
    std::vector<double> arrivals;
    double reapplySmall = 0;
    bool lookupsMatch = true;
    for (int i = 0; i < kParticipants; ++i) {
        arrivals.push_back(Arrive(engine, people[i]));
        if (i + 1 == kSmall) {
            reapplySmall = Reapply(engine);
            lookupsMatch = lookupsMatch && LookupsMatchTheWalk(engine.UserList());
        }
    }
    const double reapplyLarge = Reapply(engine);
    lookupsMatch = lookupsMatch && LookupsMatchTheWalk(engine.UserList());

    double small = 0, large = 0;
    for (int i = 0; i < kWindow; ++i) {
        small += arrivals[kSmall - 1 - i];
        large += arrivals[kParticipants - 1 - i];
    }
    small /= kWindow;
    large /= kWindow;
    std::printf("participants %u, menu entries %zu\n", engine.UserList().GetCount(),
                engine.Menu().size());
    std::printf("arrival at %5d: %8.2f us\n", kSmall, small);
    std::printf("arrival at %5d: %8.2f us  (x%.2f; target at most x3: %s)\n", kParticipants, large,
                large / small, large / small <= 3.0 ? "met" : "MISSED");
    std::printf("privilege re-application at %5d: %8.2f ms\n", kSmall, reapplySmall);
    std::printf(
        "privilege re-application at %5d: %8.2f ms  (x%.2f for x10 participants; "
        "target at most 200 ms: %s)\n",
        kParticipants, reapplyLarge, reapplyLarge / reapplySmall,
        reapplyLarge <= 200.0 ? "met" : "MISSED");
    std::printf("roster answers equal to the plain walk: %s\n", lookupsMatch ? "yes" : "NO");
    return lookupsMatch ? 0 : 1;
}
