// Send-to menu growth: a meeting-type-1 participant allowed private chat watches 10,000
// participants enroll and then leave. Each arrival looks up its place in the menu, so the
// cost of one arrival may grow with the menu's size, but no faster; this prints the cost per
// arrival and per departure near 1,000, 5,000 and 10,000 entries and how it grew.
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
// Each reported cost is the mean over this many operations ending at the checkpoint.
constexpr int kWindow = 500;
const int kCheckpoints[] = {1000, 5000, 10000};

// Mean cost (microseconds) of the kWindow operations ending at each checkpoint.
std::vector<double> WindowMeans(const std::vector<double>& costs, bool fromEnd) {
    std::vector<double> means;
    for (const int checkpoint : kCheckpoints) {
        double sum = 0;
        for (int i = checkpoint - kWindow; i < checkpoint; ++i)
            sum += costs[fromEnd ? costs.size() - 1 - i : i];
        means.push_back(sum / kWindow);
    }
    return means;
}

// Prints the costs and their growth against the growth of the menu; true when some cost
// grew more than twice as fast as the menu did.
bool PrintGrowth(const char* what, const std::vector<double>& means) {
    bool faster = false;
    std::printf("%s\n", what);
    for (std::size_t i = 0; i < means.size(); ++i) {
        const double sizeRatio = static_cast<double>(kCheckpoints[i]) / kCheckpoints[0];
        const double costRatio = means[i] / means[0];
        std::printf("  %6d entries: %8.2f us each, cost x%5.2f for menu x%5.2f\n", kCheckpoints[i],
                    means[i], costRatio, sizeRatio);
        if (costRatio > 2.0 * sizeRatio) faster = true;
    }
    return faster;
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
    engine.OnPrivilegeChanged(0x8, 0);
    AddMenuGroup(engine, "Host", 1);
    AddMenuGroup(engine, "Presenter", 2);
    AddMenuGroup(engine, "Host & Presenter", 3);
    AddMenuGroup(engine, "All Attendees", 8);

    const std::vector<CrowdMember> people = MakeCrowd(kParticipants, kFirstNode, 0);
    std::vector<double> inserts;
    for (const CrowdMember& person : people)
        inserts.push_back(ReportMember(engine, kSession, person, true));
    const std::size_t entries = engine.Menu().size();
    // Leave in arrival order; the n-th departure from the end sees about n entries.
    std::vector<double> removals;
    for (const CrowdMember& person : people)
        removals.push_back(ReportMember(engine, kSession, person, false));

    std::printf("menu entries after %d arrivals: %zu, after the departures: %zu\n", kParticipants,
                entries, engine.Menu().size());
    const bool fasterIn = PrintGrowth("arrival (enroll report):", WindowMeans(inserts, false));
    const bool fasterOut = PrintGrowth("departure (delete report):", WindowMeans(removals, true));
    if (fasterIn || fasterOut)
        std::printf("GROWS FASTER THAN THE MENU: %s%s\n", fasterIn ? "arrival " : "",
                    fasterOut ? "departure" : "");
    else
        std::printf("cost per operation grows no faster than the menu\n");
    return 0;
}
