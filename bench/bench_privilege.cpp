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

#include "bench/roster_crowd.h"
#include "engine/chat_client.h"
#include "platform/trace.h"

namespace {

constexpr std::uint32_t kSession = 77;
constexpr std::uint32_t kMyNode = 1;
constexpr std::uint32_t kFirstNode = 1000;
constexpr int kParticipants = 10000;
constexpr int kWindow = 200;  // arrivals averaged at each checkpoint
constexpr int kSmall = 1000;

using Clock = std::chrono::steady_clock;

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
    AddMenuGroup(engine, "Host", 1);
    AddMenuGroup(engine, "All Panelists", 4);
    AddMenuGroup(engine, "All Attendees", 8);
    engine.OnPrivilegeChanged(0x4F, 0);

    // Every tenth participant is a panelist.
    const std::vector<CrowdMember> people = MakeCrowd(kParticipants, kFirstNode, 10);
    std::vector<double> arrivals;
    double reapplySmall = 0;
    bool lookupsMatch = true;
    for (int i = 0; i < kParticipants; ++i) {
        arrivals.push_back(ReportMember(engine, kSession, people[i], true));
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
