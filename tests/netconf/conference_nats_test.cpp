// The networked conference: the contract suite against a real server, and what belongs to
// this service alone: what the server refuses a raw client with credentials of its own, an
// unreachable server, unusable options, and participants whose process dies or that are
// released while they reconnect.
#include <nats/nats.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <string>
#include <thread>
#include <vector>

#include "netconf/conference_subjects.h"
#include "netconf/netconf_results.h"
#include "platform/conference_results.h"
#include "tests/netconf/child_process.h"
#include "tests/netconf/nats_harness.h"
#include "tests/support/trace_capture.h"

INSTANTIATE_TEST_SUITE_P(Nats, ConferenceContract,
                         testing::Values(ConferenceHarnessFactory{
                             "OnNatsServer", [] { return std::make_unique<NatsHarness>(); }}),
                         [](const testing::TestParamInfo<ConferenceHarnessFactory>& info) {
                             return info.param.name;
                         });

namespace {

// A client that speaks NATS directly, counting the refusals the server sends it.
class RawClient {
public:
    RawClient(const NatsServer& server, const std::string& user) {
        natsOptions* options = nullptr;
        natsOptions_Create(&options);
        natsOptions_SetURL(options, server.Url().c_str());
        natsOptions_SetUserInfo(options, user.c_str(), FixturePassword(user).c_str());
        natsOptions_SetErrorHandler(options, &RawClient::OnError, this);
        m_status = natsConnection_Connect(&m_connection, options);
        natsOptions_Destroy(options);
    }
    ~RawClient() {
        for (natsSubscription* sub : m_subs)
            natsSubscription_Destroy(sub);
        natsConnection_Destroy(m_connection);
    }
    bool Connected() const { return m_status == NATS_OK; }

    void Publish(const std::string& subject, const std::string& data,
                 const std::vector<std::pair<const char*, const char*>>& headers = {},
                 const char* reply = nullptr) {
        natsMsg* msg = nullptr;
        natsMsg_Create(&msg, subject.c_str(), reply, data.data(), static_cast<int>(data.size()));
        for (const auto& [key, value] : headers)
            natsMsgHeader_Set(msg, key, value);
        natsConnection_PublishMsg(m_connection, msg);
        natsMsg_Destroy(msg);
    }
    void Listen(const std::string& subject) {
        natsSubscription* sub = nullptr;
        if (natsConnection_SubscribeSync(&sub, m_connection, subject.c_str()) == NATS_OK) {
            m_subs.push_back(sub);
        }
    }
    // Messages that reached the subscriptions after a flush round trip.
    int Received() {
        natsConnection_FlushTimeout(m_connection, 5000);
        int total = 0;
        for (natsSubscription* sub : m_subs) {
            int msgs = 0, bytes = 0;
            if (natsSubscription_GetPending(sub, &msgs, &bytes) == NATS_OK) total += msgs;
        }
        return total;
    }
    // Waits until the server refused count requests; the refusals counted by then.
    int WaitForRefusals(int count) {
        natsConnection_FlushTimeout(m_connection, 5000);
        for (int wait = 0; wait < 1000 && m_refusals < count; ++wait)
            std::this_thread::sleep_for(std::chrono::milliseconds(10));
        return m_refusals;
    }

private:
    static void OnError(natsConnection*, natsSubscription*, natsStatus status, void* closure) {
        if (status == NATS_NOT_PERMITTED) ++static_cast<RawClient*>(closure)->m_refusals;
    }

    natsStatus m_status = NATS_ERR;
    natsConnection* m_connection = nullptr;
    std::vector<natsSubscription*> m_subs;
    std::atomic<int> m_refusals{0};
};

class NatsConferenceTest : public testing::Test, protected ConferenceDriver {
protected:
    using ConferenceDriver::Run;  // not the test's own Run
    void SetUp() override { m_harness = std::make_unique<NatsHarness>(); }
    NatsHarness& Harness() { return static_cast<NatsHarness&>(*m_harness); }
};

}  // namespace

TEST_F(NatsConferenceTest, AHostileClientCanNeitherSpeakForOthersListenToThemNorTakeIdsOrHandles) {
    ContractParticipant& a = Attached(11);
    ContractParticipant& b = Attached(12);
    ASSERT_EQ(0, Enroll(a, "alpha"));
    ASSERT_EQ(0, Enroll(b, "beta"));
    const std::uint32_t cache = Handle(b, "1_chat_cache_15");
    ASSERT_EQ(0, Request(b, cache, CACHE_REQUEST_SUBSCRIBE));
    Run();
    b.sink->Clear();

    RawClient mallory(Harness().Server(), "mallory");
    ASSERT_TRUE(mallory.Connected());
    const ConferenceSubjects subjects(kNatsConference);
    // Speaking for p11: a cache line, private data, a farewell, a consumer on p12's mailbox.
    mallory.Publish(subjects.CacheAction(cache, "p11"), "forged line",
                    {{"Qc-Action", "1"}, {"Qc-Flags", "0"}});
    mallory.Publish(subjects.Private("p12", "p11"), "forged private");
    mallory.Publish(subjects.Presence("p11"), "", {{"Qc-State", "left"}});
    mallory.Publish("$JS.API.CONSUMER.CREATE." + subjects.MailboxStream("p12"), "{}", {},
                    "_INBOX_mallory.x");
    // Listening to p12's private data and replies.
    mallory.Listen(subjects.Mailbox("p12"));
    mallory.Listen(ConferenceSubjects::InboxPrefix("p12") + ".>");
    // Under its own name it may send, and is known by its own id whatever the text says.
    mallory.Publish(subjects.Private("p12", "mallory"), "I am p11");
    // p13's user id claimed first under mallory's name, and the handle's name claimed again.
    mallory.Publish(subjects.UserIdClaim(ConferenceUserId("p13")), "mallory");
    mallory.Publish(subjects.NameNumber("1_chat_cache_15"), "name");
    EXPECT_EQ(7, mallory.WaitForRefusals(7));

    ASSERT_EQ(0, a.client->ApeSendData(a.ape, b.userId, 1, "hello", 5, 1, 1));
    const std::vector<std::uint8_t> line = ContractBytes("true line");
    ASSERT_EQ(0, Write(a, cache, CACHE_APPEND, &line));
    Run();
    EXPECT_EQ(0, mallory.Received());

    const std::vector<ArmEvent> privates = b.sink->Named("ApeDataIndication");
    ASSERT_EQ(2u, privates.size());
    EXPECT_EQ(ConferenceUserId("mallory"), privates[0].userId);
    EXPECT_EQ(ContractBytes("I am p11"), privates[0].data);
    EXPECT_EQ(a.userId, privates[1].userId);
    EXPECT_EQ(ContractBytes("hello"), privates[1].data);
    const std::vector<ArmEvent> lines = b.sink->Named("SharedDataReceivedEx");
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ(a.userId, lines[0].userId);
    EXPECT_EQ(line, lines[0].data);
    EXPECT_TRUE(b.sink->Named("ApeRosterChanged").empty());

    ContractParticipant& c = Attached(13);
    EXPECT_EQ(ConferenceUserId("p13"), c.userId);
    EXPECT_EQ(cache, Handle(c, "1_chat_cache_15"));
}

TEST_F(NatsConferenceTest, AParticipantWhoseProcessDiesLeavesTheRosterWithinTenSeconds) {
    ContractParticipant& a = Attached(11);
    ASSERT_EQ(0, Enroll(a, "alpha"));
    Run();
    // A participant of the load run that is never told to send only stays enrolled.
    const std::string user = FixtureUser(20);
    ChildProcess child({QC_NETCONF_LOAD_PARTICIPANT, Harness().Server().Url(), user,
                        FixturePassword(user), "20", "0", "p11", "p11"});
    const std::string entry = "[20:" + std::to_string(ConferenceUserId(user)) + ":p20]";
    // How long until a's roster changes show change; more than limit when they do not.
    const auto waitFor = [&](const std::string& change, std::chrono::seconds limit) {
        const auto start = std::chrono::steady_clock::now();
        for (;;) {
            const auto took = std::chrono::steady_clock::now() - start;
            std::vector<std::string> seen;
            for (const ArmEvent& event : a.sink->Named("ApeRosterChanged"))
                seen.push_back(DescribeRoster(event.roster));
            if (std::count(seen.begin(), seen.end(), change) > 0 || took > limit) return took;
            Run();
        }
    };
    ASSERT_LT(waitFor("+7" + entry, std::chrono::seconds(10)), std::chrono::seconds(10))
        << child.Output();
    child.Wait(SIGKILL);
    EXPECT_LT(waitFor("-7" + entry, std::chrono::seconds(12)), std::chrono::seconds(10));
}

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
    // User ids: in range and apart for names that differ by one character.
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
