// The host panel over the simulator's conference once a --gui script has ended: it acts on
// every participant still in, each on its own behalf, and joins and leaves as the script would.
#include <algorithm>

#include "sim/simulator.h"

HostPanel::Hooks Simulator::PanelHooks() {
    HostPanel::Hooks hooks;
    hooks.members = [this] {
        std::vector<HostPanel::Member> members;
        for (const auto& p : m_participants)
            if (!p->left) members.push_back({p->name, p->handle, p->nodeId});
        return members;
    };
    hooks.act = [this](const HostPanel::Member& member, const std::function<void()>& fn) {
        for (const auto& p : m_participants) {
            if (p->left || p->handle != member.handle) continue;
            {
                ActingScope acting(*p->loop);
                fn();
            }
            Settle();
        }
    };
    // A newcomer is a guest on the next free node, with the conference's QM setting.
    hooks.join = [this] {
        std::uint32_t node = 0;
        for (const auto& p : m_participants)
            node = std::max(node, p->nodeId);
        const std::string number = std::to_string(m_participants.size() + 1);
        ScenarioCommand join;
        join.verb = "join";
        join.args = {{"", "guest" + number, false},
                     {"node", std::to_string(node + 1), false},
                     {"name", "Guest " + number, true}};
        Execute(join);
    };
    hooks.leave = [this](const HostPanel::Member& member) {
        ScenarioCommand leave;
        leave.verb = "leave";
        leave.args = {{"", member.name, false}};
        Execute(leave);
    };
    return hooks;
}
