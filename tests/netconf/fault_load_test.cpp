// Faults and load: three servers in a cluster keeping every stream in three copies, three
// participants in processes of their own exchanging 3,000 group and private lines, and one
// server killed while they send and started again. Every participant must get every line
// meant for it exactly once and in its sender's order.
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <thread>

#include "tests/netconf/nats_harness.h"

namespace {

constexpr int kLinesPerParticipant = 1000;  // half group, half private: 3,000 in all

}  // namespace

TEST(NatsFaultAndLoad, EveryLineArrivesOnceAndInOrderWhileAServerRestarts) {
    signal(SIGPIPE, SIG_IGN);  // a participant that died must fail the test, not end it
    const int clusterPorts[3] = {FreeLoopbackPort(), FreeLoopbackPort(), FreeLoopbackPort()};
    std::vector<std::unique_ptr<NatsServer>> servers;
    std::string urls;
    for (int i = 0; i < 3; ++i) {
        ConferenceServerOptions options = FixtureServerOptions();
        options.serverName = "s" + std::to_string(i + 1);
        options.clusterName = "quintara";
        options.clusterPort = clusterPorts[i];
        // Each server is given all three routes; the one to itself it ignores.
        for (const int port : clusterPorts)
            options.routes.push_back("nats-route://127.0.0.1:" + std::to_string(port));
        servers.push_back(std::make_unique<NatsServer>(options));
        urls += (urls.empty() ? "" : ",") + servers.back()->Url();
    }
    for (auto& server : servers)
        ASSERT_TRUE(server->Start()) << server->Log();
    // The cluster can place streams once one of the servers leads it.
    const auto leads = [](const std::unique_ptr<NatsServer>& server) {
        return server->WaitForLog("Self is new JetStream cluster metadata leader", 0.1);
    };
    for (int wait = 0; wait < 100 && std::none_of(servers.begin(), servers.end(), leads); ++wait)
        continue;
    ASSERT_TRUE(std::any_of(servers.begin(), servers.end(), leads)) << servers[0]->Log();

    // Each sends its private lines to the next and has the other two as peers.
    const std::vector<std::string> users = {"p21", "p22", "p23"};
    std::vector<std::unique_ptr<ChildProcess>> participants;
    for (std::size_t i = 0; i < 3; ++i) {
        const std::string& next = users[(i + 1) % 3];
        participants.push_back(std::make_unique<ChildProcess>(std::vector<std::string>{
            QC_NETCONF_LOAD_PARTICIPANT, urls, users[i], FixturePassword(users[i]),
            std::to_string(21 + i), std::to_string(kLinesPerParticipant), next, next,
            users[(i + 2) % 3]}));
    }
    for (auto& participant : participants)
        ASSERT_TRUE(participant->WaitFor("ready", 30)) << participant->Output();

    for (auto& participant : participants)
        participant->Say("go\n");
    // Half-way through the sending, the second server dies; a second later it is back.
    std::this_thread::sleep_for(std::chrono::milliseconds(kLinesPerParticipant));
    servers[1]->Kill();
    std::this_thread::sleep_for(std::chrono::seconds(1));
    ASSERT_TRUE(servers[1]->Start()) << servers[1]->Log();

    for (std::size_t i = 0; i < participants.size(); ++i) {
        const int status = participants[i]->Wait();
        const std::string output = participants[i]->Output();
        std::printf("%s: %s", users[i].c_str(), output.c_str());
        EXPECT_EQ(0, status) << output;
    }
}
