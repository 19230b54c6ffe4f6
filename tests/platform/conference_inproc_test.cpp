// The in-process conference: the contract suite on the virtual clock, and the fault
// injection, refusals and choices that belong to this implementation.
#include <tuple>

#include "platform/conference_results.h"
#include "platform/inproc_conference.h"
#include "platform/virtual_run_loop.h"
#include "tests/platform/conference_contract.h"

namespace {

constexpr std::uint16_t kConference = 5;

// Every participant on a virtual loop of its own.
class InProcessHarness final : public ConferenceHarness {
public:
    IArmClient* NewClient(std::uint32_t nodeId) override {
        m_loops.push_back(std::make_unique<VirtualRunLoop>());
        return m_conference.CreateClient(*m_loops.back(), nodeId);
    }
    std::uint16_t ConferenceId() const override { return m_conference.ConferenceId(); }
    void RunUntilIdle() override {
        std::size_t ran = 0;
        do {
            ran = 0;
            for (const auto& loop : m_loops)
                ran += loop->RunUntilIdle();
        } while (ran > 0);
    }

private:
    InProcessConference m_conference{kConference};
    std::vector<std::unique_ptr<VirtualRunLoop>> m_loops;
};

INSTANTIATE_TEST_SUITE_P(
    InProcess, ConferenceContract,
    testing::Values(ConferenceHarnessFactory{"OnVirtualClock",
                                             [] { return std::make_unique<InProcessHarness>(); }}),
    [](const testing::TestParamInfo<ConferenceHarnessFactory>& info) { return info.param.name; });

// The contract's participants, with the in-process object's own controls at hand.
class InProcessConferenceTest : public testing::Test, protected ConferenceDriver {
protected:
    using ConferenceDriver::Run;  // not the test's own Run
    void SetUp() override { m_harness = std::make_unique<InProcessHarness>(); }
    static InProcessArmClient* Ctl(const ContractParticipant& p) {
        return static_cast<InProcessArmClient*>(p.client);
    }
    ContractParticipant& Connected(std::uint32_t nodeId) {
        ContractParticipant& p = Fresh(nodeId);
        EXPECT_EQ(0, p.client->Connect(p.sink.get(), "user", 0, 0, 0));
        Run();
        return p;
    }
};

// The results the sink's events of one callback carried, in order.
std::vector<short> Results(const ArmRecorder& sink, const std::string& name) {
    std::vector<short> results;
    for (const ArmEvent& event : sink.Named(name))
        results.push_back(event.result);
    return results;
}

}  // namespace

// Chosen failures and refusals report what they were told to and change nothing.
TEST_F(InProcessConferenceTest, FailedCallsAndRefusedConfirmationsTakeNoEffect) {
    ContractParticipant& a = Attached(11);
    ContractParticipant& b = Attached(12);
    Ctl(a)->FailNext(ArmOperation::ApeEnroll, 1);
    EXPECT_EQ(1, Enroll(a, "x"));
    std::uint32_t mem = 0;
    Ctl(a)->FailNext(ArmOperation::AllocMemHandle, 7, 2);
    EXPECT_EQ(7, a.client->AllocMemHandle(4, &mem));
    EXPECT_EQ(7, a.client->AllocMemHandle(4, &mem));
    EXPECT_EQ(0u, Ctl(a)->MemHandleCount());
    EXPECT_EQ(0, a.client->AllocMemHandle(4, &mem));
    ASSERT_EQ(0, Enroll(b, "b"));
    Run();
    b.sink->Clear();

    Ctl(a)->ConfirmNextWith(ArmConfirmation::ApeEnrollConfirm, 5);
    ASSERT_EQ(0, Enroll(a, "a"));
    Ctl(a)->ConfirmNextWith(ArmConfirmation::EnrollResourceStatus, 3);
    ASSERT_EQ(0, Enroll(a, "a"));
    Run();
    ASSERT_EQ(std::vector<short>({5, 0}), Results(*a.sink, "ApeEnrollConfirm"));
    const std::vector<ArmEvent> enrolls = a.sink->Named("ApeEnrollConfirm");
    ASSERT_EQ(1u, enrolls[1].resources.size());
    EXPECT_EQ(3, enrolls[1].resources[0].status);
    EXPECT_EQ(0u, enrolls[1].resources[0].value);
    EXPECT_EQ(0u, a.sink->Count("ApeRosterChanged"));
    EXPECT_TRUE(b.sink->Events().empty());

    const std::uint32_t cache = Handle(a, "70001_chat_status");
    ASSERT_EQ(0, Request(b, cache, CACHE_REQUEST_SUBSCRIBE));
    Ctl(a)->ConfirmNextWith(ArmConfirmation::ApeCacheActionConfirmEx, 7);
    const std::vector<std::uint8_t> one = ContractBytes("1");
    ASSERT_EQ(0, Write(a, cache, CACHE_APPEND, &one));
    ASSERT_EQ(0, Request(b, cache, CACHE_REQUEST_RETRIEVE));
    Run();
    EXPECT_EQ(std::vector<short>{7}, Results(*a.sink, "ApeCacheActionConfirmEx"));
    // The refused append left the cache never set: the subscriber saw nothing of it.
    EXPECT_EQ(std::vector<short>{kArmRetry}, Results(*b.sink, "SharedDataReceivedEx"));

    // A result of 0 claims success, but no answer ever comes.
    ContractParticipant& c = Fresh(13);
    Ctl(c)->FailNext(ArmOperation::Connect, 0);
    EXPECT_EQ(0, c.client->Connect(c.sink.get(), "c", 0, 0, 0));
    Run();
    EXPECT_TRUE(c.sink->Events().empty());
}

TEST_F(InProcessConferenceTest, InjectedDeliveriesArriveExactlyAsCrafted) {
    ContractParticipant& m = Attached(11);
    ASSERT_EQ(0, Ctl(m)->RegisterSharedDataSink(m.ape, m.sink.get()));
    const std::vector<std::uint8_t> notAPdu = {0xde, 0xad, 0x00, 0xbe};
    EXPECT_TRUE(Ctl(m)->InjectPrivateData(4242, notAPdu));

    const ArmCacheDelivery delivery{9, 50123, kArmRetry, CACHE_REPLY_LAST, 4242, 0x90, 3};
    EXPECT_TRUE(Ctl(m)->InjectCacheDelivery(delivery, notAPdu));
    EXPECT_TRUE(Ctl(m)->InjectCacheDelivery(delivery, std::nullopt));

    EXPECT_TRUE(m.sink->Events().empty());
    Run();

    ASSERT_EQ(std::vector<std::string>(
                  {"ApeDataIndication", "SharedDataReceivedEx", "SharedDataReceivedEx"}),
              m.sink->Names());
    const std::vector<ArmEvent>& events = m.sink->Events();
    EXPECT_EQ(4242u, events[0].userId);
    EXPECT_EQ(notAPdu, events[0].data);
    for (int i : {1, 2}) {
        const ArmEvent& e = events[i];
        EXPECT_EQ(std::make_tuple(m.ape, 9u, 50123u, kArmRetry, CACHE_REPLY_LAST, 4242u, 0x90u, 3),
                  std::make_tuple(e.apeHandle, e.cacheId, e.entityId, e.result, e.action, e.userId,
                                  e.value, e.flags));
    }
    EXPECT_EQ(notAPdu, events[1].data);
    EXPECT_EQ(0u, events[2].memHandle);
    EXPECT_EQ(0u, Ctl(m)->MemHandleCount());

    InProcessArmClient* detached = Ctl(Connected(12));
    EXPECT_FALSE(detached->InjectPrivateData(1, notAPdu));
    EXPECT_FALSE(detached->InjectCacheDelivery(delivery, notAPdu));
}

TEST_F(InProcessConferenceTest, RequestsOutsideTheirStateAreRefused) {
    ContractParticipant& fresh = Fresh(10);
    EXPECT_EQ(kArmNotConnected, fresh.client->ConferenceJoin(0, kConference, fresh.sink.get(), 3));
    ContractParticipant& a = Connected(11);
    EXPECT_EQ(kArmNoSuchConference, a.client->ConferenceJoin(0, 99, a.sink.get(), 3));
    EXPECT_EQ(kArmNotJoined, a.client->ConferenceLeave(0, kConference, a.sink.get()));
    ContractParticipant& b = Attached(12);
    const std::uint32_t cache = Handle(b, "70001_chat_cache_15");
    std::uint32_t mem = 0;
    ASSERT_EQ(0, a.client->AllocMemHandle(2, &mem));
    // Enroll with another ape handle, and with its resources missing.
    EXPECT_EQ(kArmBadApeHandle,
              b.client->ApeEnroll(b.ape + 1, 1, kSession, 0, 0, nullptr, nullptr, 0, 3));
    EXPECT_EQ(kArmInvalidArgument,
              b.client->ApeEnroll(b.ape, 1, kSession, 0, 1, nullptr, nullptr, 0, 3));
    EXPECT_EQ(kArmBadApeHandle, b.client->ApeSendData(b.ape + 1, 1001, 1, "x", 1, 1, 1));
    // Writes to an unknown cache, without bytes, with another object's memory handle, and an
    // action that is an answer.
    EXPECT_EQ(kArmUnknownHandle,
              b.client->ApeSharedDataActionEx(b.ape, cache + 1000, 0, 0, CACHE_SET, 0, 0, 0, 1));
    EXPECT_EQ(kArmInvalidArgument,
              b.client->ApeSharedDataActionEx(b.ape, cache, 0, 0, CACHE_APPEND, 0, 0, 0, 1));
    EXPECT_EQ(kArmUnknownHandle,
              b.client->ApeSharedDataActionEx(b.ape, cache, 0, 0, CACHE_SET, 0, mem, 0, 1));
    EXPECT_EQ(kArmInvalidArgument,
              b.client->ApeSharedDataActionEx(b.ape, cache, 0, 0, CACHE_REPLY_LAST, 0, 0, 0, 1));
    // Request type 3, and a retrieval without any sink.
    EXPECT_EQ(kArmInvalidArgument,
              b.client->ApeRequestSharedDataEx(b.ape, cache, 0, static_cast<tagCacheRequestType>(3),
                                               255, b.sink.get()));
    EXPECT_EQ(kArmInvalidArgument, b.client->ApeRequestSharedDataEx(
                                       b.ape, cache, 0, CACHE_REQUEST_RETRIEVE, 255, nullptr));
    const ARMSendOption option{b.ape + 1, 0x90};  // another ape's
    EXPECT_EQ(kArmBadApeHandle, b.client->SetSendOption(-200, &option));
    EXPECT_EQ(kArmTooLarge, b.client->AllocMemHandle(kArmMaxDataLength + 1, &mem));
}

// Both services keep their memory blocks the same way; this pins it exactly.
TEST_F(InProcessConferenceTest, MemoryBlocksAreClippedAtTheirEndAndGoneOnceFreed) {
    IArmClient& m = *Connected(11).client;
    std::uint32_t mem = 0, size = 4;
    ASSERT_EQ(0, m.AllocMemHandle(4, &mem));
    ASSERT_EQ(0, m.WriteMemHandle(mem, 0, "abcd", &size));
    size = 10;
    EXPECT_EQ(0, m.WriteMemHandle(mem, 2, "0123456789", &size));
    EXPECT_EQ(2u, size);
    ASSERT_EQ(0, m.GetMemHandleSize(mem, &size));
    EXPECT_EQ(4u, size);
    char buffer[10] = {};
    size = 10;
    EXPECT_EQ(0, m.ReadMemHandle(mem, 1, buffer, &size));
    EXPECT_EQ("b01", std::string(buffer, size));
    size = 1;
    EXPECT_EQ(0, m.ReadMemHandle(mem, 4, buffer, &size));
    EXPECT_EQ(0u, size);
    size = 1;
    EXPECT_EQ(kArmOutOfRange, m.ReadMemHandle(mem, 5, buffer, &size));
    EXPECT_EQ(0u, size);
    EXPECT_EQ(kArmInvalidArgument, m.ReadMemHandle(mem, 0, buffer, nullptr));

    ASSERT_EQ(0, m.FreeMemHandle(mem));
    size = 4;
    EXPECT_EQ(kArmUnknownHandle, m.GetMemHandleSize(mem, &size));
    EXPECT_EQ(kArmUnknownHandle, m.ReadMemHandle(mem, 0, buffer, &size));
    EXPECT_EQ(kArmUnknownHandle, m.WriteMemHandle(mem, 0, "ab", &size));
    EXPECT_EQ(kArmUnknownHandle, m.FreeMemHandle(mem));
    EXPECT_EQ(kArmUnknownHandle, m.FreeMemHandle(0));
}

TEST_F(InProcessConferenceTest, DestroyAndTheConferenceEndingDeliverNothingMore) {
    ContractParticipant& a = Attached(11);
    ContractParticipant& b = Attached(12);
    ASSERT_EQ(0, Enroll(a, "a"));
    ASSERT_EQ(0, Enroll(b, "b"));
    Run();
    b.sink->Clear();
    ASSERT_EQ(0, a.client->ApeSendData(a.ape, a.userId, 1, "x", 1, 1, 1));
    a.sink->Clear();
    ASSERT_EQ(0, a.client->Destroy(a.sink.get(), 1));
    Run();
    EXPECT_TRUE(a.sink->Events().empty());
    EXPECT_EQ(1u, b.sink->Count("ApeRosterChanged"));
    EXPECT_EQ(0u, Ctl(a)->ApeHandle());
    EXPECT_EQ(kArmNotConnected, a.client->ConferenceJoin(0, kConference, a.sink.get(), 3));

    // A conference that ends with answers still posted delivers none of them.
    VirtualRunLoop loop;
    ArmRecorder late;
    {
        InProcessConference gone(kConference);
        InProcessArmClient* client = gone.CreateClient(loop, 13);
        ASSERT_EQ(0, client->Connect(&late, "late", 0, 0, 0));
    }
    EXPECT_GT(loop.RunUntilIdle(), 0u);
    EXPECT_TRUE(late.Events().empty());
}
