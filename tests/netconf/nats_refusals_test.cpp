// What the server enforces for a conference: a raw client with credentials of its own cannot
// speak for another participant, listen to another's private data, take another's user id or
// change a granted handle, and a participant whose process dies leaves everybody's roster
// within ten seconds.
#include <nats/nats.h>

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <string>
#include <vector>

#include "netconf/conference_subjects.h"
#include "tests/netconf/child_process.h"
#include "tests/netconf/nats_harness.h"

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
        std::unique_lock<std::mutex> lock(m_mutex);
        m_changed.wait_for(lock, std::chrono::seconds(10), [&] { return m_refusals >= count; });
        return m_refusals;
    }

private:
    static void OnError(natsConnection*, natsSubscription*, natsStatus status, void* closure) {
        auto* self = static_cast<RawClient*>(closure);
        {
            const std::lock_guard<std::mutex> lock(self->m_mutex);
            if (status == NATS_NOT_PERMITTED) ++self->m_refusals;
        }
        self->m_changed.notify_all();
    }

    natsStatus m_status = NATS_ERR;
    natsConnection* m_connection = nullptr;
    std::vector<natsSubscription*> m_subs;
    std::mutex m_mutex;
    std::condition_variable m_changed;
    int m_refusals = 0;
};

class NatsRefusalsTest : public testing::Test, protected ConferenceDriver {
protected:
    using ConferenceDriver::Run;  // not the test's own Run
    void SetUp() override { m_harness = std::make_unique<NatsHarness>(); }
    NatsServer& Server() { return static_cast<NatsHarness&>(*m_harness).Server(); }
};

std::vector<std::string> Rosters(const ContractParticipant& p) {
    std::vector<std::string> changes;
    for (const ArmEvent& event : p.sink->Named("ApeRosterChanged"))
        changes.push_back(DescribeRoster(event.roster));
    return changes;
}

}  // namespace

TEST_F(NatsRefusalsTest, AHostileClientCanNeitherSpeakForOthersNorListenToThem) {
    ContractParticipant& a = Attached(11);
    ContractParticipant& b = Attached(12);
    ASSERT_EQ(0, Enroll(a, "alpha"));
    ASSERT_EQ(0, Enroll(b, "beta"));
    const std::uint32_t cache = Handle(b, "1_chat_cache_15");
    ASSERT_EQ(0, Request(b, cache, CACHE_REQUEST_SUBSCRIBE));
    Run();
    b.sink->Clear();

    RawClient mallory(Server(), "mallory");
    ASSERT_TRUE(mallory.Connected());
    const ConferenceSubjects subjects(kNatsConference);
    const std::vector<std::pair<const char*, const char*>> action = {{"Qc-Action", "1"},
                                                                     {"Qc-Flags", "0"}};
    // Speaking for p11: a cache line, private data, a farewell, a consumer on p12's mailbox.
    mallory.Publish(subjects.CacheAction(cache, "p11"), "forged line", action);
    mallory.Publish(subjects.Private("p12", "p11"), "forged private");
    mallory.Publish(subjects.Presence("p11"), "", {{"Qc-State", "left"}});
    mallory.Publish("$JS.API.CONSUMER.CREATE." + subjects.MailboxStream("p12"), "{}", {},
                    "_INBOX_mallory.x");
    // Listening to p12's private data and replies.
    mallory.Listen(subjects.Mailbox("p12"));
    mallory.Listen(ConferenceSubjects::InboxPrefix("p12") + ".>");
    // Under its own name it may send, and is known by its own id whatever the text says.
    mallory.Publish(subjects.Private("p12", "mallory"), "I am p11");
    EXPECT_EQ(6, mallory.WaitForRefusals(6));

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
    EXPECT_TRUE(Rosters(b).empty());
}

TEST_F(NatsRefusalsTest, AHostileClientCanNeitherTakeAnotherUsersIdNorChangeAGrantedHandle) {
    ContractParticipant& a = Attached(11);
    const std::uint32_t cache = Handle(a, "1_chat_cache_15");
    ASSERT_NE(0u, cache);

    RawClient mallory(Server(), "mallory");
    ASSERT_TRUE(mallory.Connected());
    const ConferenceSubjects subjects(kNatsConference);
    // p13's user id claimed first under mallory's name, and the handle's name claimed again.
    mallory.Publish(subjects.UserIdClaim(ConferenceUserId("p13")), "mallory");
    mallory.Publish(subjects.NameNumber("1_chat_cache_15"), "name");
    EXPECT_EQ(1, mallory.WaitForRefusals(1));

    ContractParticipant& c = Attached(13);
    EXPECT_EQ(ConferenceUserId("p13"), c.userId);
    EXPECT_EQ(cache, Handle(c, "1_chat_cache_15"));
}

TEST_F(NatsRefusalsTest, AParticipantWhoseProcessDiesLeavesTheRosterWithinTenSeconds) {
    ContractParticipant& a = Attached(11);
    ASSERT_EQ(0, Enroll(a, "alpha"));
    Run();
    a.sink->Clear();

    // A participant of the load run that is never told to send only stays enrolled.
    const std::string user = FixtureUser(20);
    ChildProcess child({QC_NETCONF_LOAD_PARTICIPANT, Server().Url(), user, FixturePassword(user),
                        "20", "0", "p11", "p11"});
    const std::string entry = "[20:" + std::to_string(ConferenceUserId(user)) + ":p20]";
    const auto seen = [&a](const std::string& change) {
        for (const std::string& roster : Rosters(a)) {
            if (roster == change) return true;
        }
        return false;
    };
    const auto waitFor = [this, &seen](const std::string& change, std::chrono::seconds limit) {
        const auto start = std::chrono::steady_clock::now();
        while (!seen(change) && std::chrono::steady_clock::now() - start < limit)
            Run();
        return std::chrono::steady_clock::now() - start;
    };
    waitFor("+7" + entry, std::chrono::seconds(10));
    ASSERT_TRUE(seen("+7" + entry)) << child.Output();

    child.Wait(SIGKILL);
    const auto took = waitFor("-7" + entry, std::chrono::seconds(12));
    EXPECT_TRUE(seen("-7" + entry));
    EXPECT_LT(took, std::chrono::seconds(10));
}
