// The networked conference under the contract suite: a nats-server of its own, participants
// on virtual loops, and "run until idle" meaning every request answered, a flush round trip
// on every connection and everything delivered handed to the loops, until all is quiet.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "netconf/nats_arm_client.h"
#include "platform/virtual_run_loop.h"
#include "tests/netconf/nats_server.h"
#include "tests/platform/conference_contract.h"

constexpr std::uint16_t kNatsConference = 5;

// Participant n connects as "p<n>"; the fixture's server also knows "mallory".
std::string FixtureUser(std::uint32_t nodeId);
std::string FixturePassword(const std::string& user);
ConferenceServerOptions FixtureServerOptions();
// Options of participant nodeId for the conference on server.
NatsConferenceOptions FixtureOptions(const NatsServer& server, std::uint32_t nodeId);

class NatsHarness final : public ConferenceHarness {
public:
    NatsHarness();
    // Releases the participants still there, then stops the server.
    ~NatsHarness() override;

    IArmClient* NewClient(std::uint32_t nodeId) override;
    std::uint16_t ConferenceId() const override { return kNatsConference; }
    void RunUntilIdle() override;

    NatsServer& Server() { return m_server; }
    bool Started() const { return m_bStarted; }

private:
    NatsServer m_server;
    bool m_bStarted = false;
    std::vector<std::unique_ptr<VirtualRunLoop>> m_loops;
    std::vector<std::pair<NatsArmClient*, std::weak_ptr<const void>>> m_clients;
};
