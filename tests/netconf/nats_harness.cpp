#include "tests/netconf/nats_harness.h"

std::string FixtureUser(std::uint32_t nodeId) {
    return "p" + std::to_string(nodeId);
}

std::string FixturePassword(const std::string& user) {
    return "pw-" + user;
}

ConferenceServerOptions FixtureServerOptions() {
    ConferenceServerOptions options;
    options.conferenceId = kNatsConference;
    options.port = 0;
    for (std::uint32_t node = 10; node <= 40; ++node) {
        const std::string user = FixtureUser(node);
        options.participants.push_back({user, FixturePassword(user)});
    }
    options.participants.push_back({"mallory", FixturePassword("mallory")});
    return options;
}

NatsConferenceOptions FixtureOptions(const NatsServer& server, std::uint32_t nodeId) {
    NatsConferenceOptions options;
    options.serverUrls = {server.Url()};
    options.conferenceId = kNatsConference;
    options.nodeId = nodeId;
    options.user = FixtureUser(nodeId);
    options.password = FixturePassword(options.user);
    return options;
}

NatsHarness::NatsHarness() : m_server(FixtureServerOptions()) {
    m_bStarted = m_server.Start();
    EXPECT_TRUE(m_bStarted) << m_server.Log();
}

NatsHarness::~NatsHarness() {
    for (auto& [client, lifetime] : m_clients) {
        if (!lifetime.expired()) client->Release();
    }
}

IArmClient* NatsHarness::NewClient(std::uint32_t nodeId) {
    m_loops.push_back(std::make_unique<VirtualRunLoop>());
    auto* client = static_cast<NatsArmClient*>(
        CreateNatsArmClient(FixtureOptions(m_server, nodeId), *m_loops.back()));
    m_clients.emplace_back(client, client->Lifetime());
    return client;
}

void NatsHarness::RunUntilIdle() {
    for (;;) {
        std::uint64_t activity = 0;
        for (auto& [client, lifetime] : m_clients) {
            if (!lifetime.expired()) activity += client->Settle();
        }
        std::size_t ran = 0;
        for (const auto& loop : m_loops)
            ran += loop->RunUntilIdle();
        if (activity == 0 && ran == 0) return;
    }
}
