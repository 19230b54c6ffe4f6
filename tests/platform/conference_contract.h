// What every conference service must do, as a test suite over a harness: an implementation
// provides a ConferenceHarnessFactory and instantiates the ConferenceContract suite with it.
#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <ostream>
#include <string>
#include <vector>

#include "platform/arm_service.h"
#include "tests/support/arm_recorder.h"

// One conference of the implementation under test, and the loops its participants run on.
class ConferenceHarness {
public:
    virtual ~ConferenceHarness() = default;
    // A new participant's service object for nodeId, answering on a loop the harness drives.
    virtual IArmClient* NewClient(std::uint32_t nodeId) = 0;
    // The conference id participants join.
    virtual std::uint16_t ConferenceId() const = 0;
    // Runs every participant's pending work until none is left.
    virtual void RunUntilIdle() = 0;
};

struct ConferenceHarnessFactory {
    std::string name;  // names the instantiation's tests
    std::function<std::unique_ptr<ConferenceHarness>()> make;
};

// Failure messages name the implementation instead of dumping the factory's bytes.
inline void PrintTo(const ConferenceHarnessFactory& factory, std::ostream* out) {
    *out << factory.name;
}

// One participant: its service object (null once released), the recorder that stands in for
// the component, and what attach granted.
struct ContractParticipant {
    IArmClient* client = nullptr;
    std::unique_ptr<ArmRecorder> sink;
    std::uint32_t nodeId = 0;
    std::uint32_t ape = 0;
    std::uint32_t userId = 0;
};

// Drives the participants of one harness's conference: the contract suite and an
// implementation's own tests share it.
class ConferenceDriver {
protected:
    static constexpr std::uint32_t kSession = 7;

    void Run() { m_harness->RunUntilIdle(); }

    // A participant's service object that has not connected yet.
    ContractParticipant& Fresh(std::uint32_t nodeId);
    // A participant that connected, joined and attached.
    ContractParticipant& Attached(std::uint32_t nodeId);
    // Enrolls p in session with payload; returns the ApeEnroll result.
    int Enroll(ContractParticipant& p, const std::string& payload,
               std::uint32_t session = kSession);
    // The handle the conference gives name, through p.
    std::uint32_t Handle(ContractParticipant& p, const std::string& name);
    // Writes bytes (none: memory handle 0) to the cache with action; the action's result.
    int Write(ContractParticipant& p, std::uint32_t cache, tagCacheAction action,
              const std::vector<std::uint8_t>* bytes);
    // ApeRequestSharedDataEx with p's recorder as sink; its result.
    int Request(ContractParticipant& p, std::uint32_t cache, tagCacheRequestType type) {
        return p.client->ApeRequestSharedDataEx(p.ape, cache, 0, type, 255, p.sink.get());
    }
    // Releases p's service object.
    void Release(ContractParticipant& p) {
        EXPECT_EQ(0, p.client->Release());
        p.client = nullptr;
    }

    std::unique_ptr<ConferenceHarness> m_harness;
    std::deque<ContractParticipant> m_participants;
};

class ConferenceContract : public testing::TestWithParam<ConferenceHarnessFactory>,
                           protected ConferenceDriver {
protected:
    using ConferenceDriver::Run;  // not the test's own Run
    void SetUp() override { m_harness = GetParam().make(); }
};

// Connect accepts with 0 or with 1202; either way ConnectConfirm follows.
inline bool ConnectAccepted(int result) {
    return result == kArmOk || result == kArmConnectPending;
}

std::vector<std::uint8_t> ContractBytes(const std::string& text);
// "+7[11:1001:alpha] -7[...] ~7[...]": a roster change in one line.
std::string DescribeRoster(const RosterChange& change);
