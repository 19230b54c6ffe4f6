// The networked conference: the contract suite against a real server, and what belongs to
// this service alone: refusals at the server, an unreachable server.
#include <nats/nats.h>

#include <chrono>
#include <cstring>
#include <thread>

#include "netconf/conference_subjects.h"
#include "netconf/netconf_results.h"
#include "platform/conference_results.h"
#include "tests/netconf/nats_harness.h"
#include "tests/support/trace_capture.h"

INSTANTIATE_TEST_SUITE_P(Nats, ConferenceContract,
                         testing::Values(ConferenceHarnessFactory{
                             "OnNatsServer", [] { return std::make_unique<NatsHarness>(); }}),
                         [](const testing::TestParamInfo<ConferenceHarnessFactory>& info) {
                             return info.param.name;
                         });

namespace {

class NatsConferenceTest : public testing::Test, protected ConferenceDriver {
protected:
    using ConferenceDriver::Run;  // not the test's own Run
    void SetUp() override { m_harness = std::make_unique<NatsHarness>(); }
    NatsHarness& Harness() { return static_cast<NatsHarness&>(*m_harness); }
};

}  // namespace

TEST_F(NatsConferenceTest, AnUnreachableServerGivesAFinalConnectResultAndLogsWhy) {
    TraceCapture trace;
    VirtualRunLoop loop;
    NatsConferenceOptions options = FixtureOptions(Harness().Server(), 11);
    options.serverUrls = {"nats://127.0.0.1:" + std::to_string(FreeLoopbackPort())};
    auto* client = static_cast<NatsArmClient*>(CreateNatsArmClient(options, loop));
    ASSERT_NE(nullptr, client);
    ArmRecorder sink(client);
    EXPECT_EQ(kArmConnectPending, client->Connect(&sink, "u", 0, 0, 0));
    client->Settle();
    loop.RunUntilIdle();
    const std::vector<ArmEvent> confirms = sink.Named("ConnectConfirm");
    ASSERT_EQ(1u, confirms.size());
    EXPECT_EQ(kArmServerUnreachable, confirms[0].result);
    std::string log;
    for (const std::string& line : trace.Texts())
        log += line + "\n";
    EXPECT_NE(std::string::npos, log.find(options.serverUrls[0])) << log;
    // Not connected: nothing else can start, and a new attempt is allowed.
    EXPECT_EQ(kArmNotConnected, client->ConferenceJoin(0, kNatsConference, &sink, 3));
    EXPECT_EQ(kArmConnectPending, client->Connect(&sink, "u", 0, 0, 0));
    EXPECT_EQ(0, client->Release());
}

TEST(NatsConferenceOptions, UnusableOptionsMakeNoObject) {
    VirtualRunLoop loop;
    NatsConferenceOptions good;
    good.serverUrls = {"nats://127.0.0.1:4222"};
    good.user = "ann_1";
    const struct {
        const char* what;
        void (*spoil)(NatsConferenceOptions&);
    } cases[] = {
        {"no server", [](NatsConferenceOptions& o) { o.serverUrls.clear(); }},
        {"empty user", [](NatsConferenceOptions& o) { o.user.clear(); }},
        {"dot in user", [](NatsConferenceOptions& o) { o.user = "ann.b"; }},
        {"wildcard user", [](NatsConferenceOptions& o) { o.user = "*"; }},
        {"long user", [](NatsConferenceOptions& o) { o.user = std::string(33, 'a'); }},
        {"no replicas", [](NatsConferenceOptions& o) { o.replicas = 0; }},
    };
    for (const auto& c : cases) {
        NatsConferenceOptions options = good;
        c.spoil(options);
        EXPECT_EQ(nullptr, CreateNatsArmClient(options, loop)) << c.what;
    }
    IArmClient* client = CreateNatsArmClient(good, loop);
    ASSERT_NE(nullptr, client);
    EXPECT_EQ(0, client->Release());
    // User ids: stable, in range and apart for names that differ by one character.
    EXPECT_EQ(ConferenceUserId("p11"), ConferenceUserId("p11"));
    EXPECT_NE(ConferenceUserId("p11"), ConferenceUserId("p12"));
    for (const char* user : {"a", "p11", "mallory", "zzzzzzzzzzzzzzzzzzzzzzzzzzzzzzzz"}) {
        EXPECT_NE(0u, ConferenceUserId(user));
        EXPECT_LT(ConferenceUserId(user), 0x80000000u);
    }
}

TEST_F(NatsConferenceTest, ParticipantsReleasedWhileTheyReconnectGetNothingMore) {
    ContractParticipant& a = Attached(11);
    ASSERT_EQ(0, Enroll(a, "alpha"));
    const std::uint32_t cache = Handle(a, "1_chat_cache_15");
    std::vector<ContractParticipant*> leaving;
    for (std::uint32_t node = 12; node <= 15; ++node) {
        ContractParticipant& p = Attached(node);
        ASSERT_EQ(0, Enroll(p, "p"));
        ASSERT_EQ(0, Request(p, cache, CACHE_REQUEST_SUBSCRIBE));
        leaving.push_back(&p);
    }
    Run();

    // The server goes and comes back; each participant is released at another moment of
    // its reconnection (its callbacks, the consumers being recreated).
    Harness().Server().Kill();
    ASSERT_TRUE(Harness().Server().Start()) << Harness().Server().Log();
    for (ContractParticipant* p : leaving) {
        p->sink->Clear();
        Release(*p);
        std::this_thread::sleep_for(std::chrono::milliseconds(150));
    }
    a.sink->Clear();
    const std::vector<std::uint8_t> line = ContractBytes("after release");
    ASSERT_EQ(0, Write(a, cache, CACHE_APPEND, &line));
    Run();
    for (ContractParticipant* p : leaving)
        EXPECT_TRUE(p->sink->Events().empty()) << p->sink->Events().front().name;
    EXPECT_EQ(1u, a.sink->Named("ApeCacheActionConfirmEx").size());
}
