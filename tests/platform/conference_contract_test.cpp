// The conference-service contract, driven the way several chat participants drive it.
#include "tests/platform/conference_contract.h"

#include <algorithm>
#include <cstring>
#include <set>
#include <tuple>

namespace {

constexpr const char* kSessionResource = "c_session_id";

std::string Entry(const ContractParticipant& p, const std::string& payload) {
    return "[" + std::to_string(p.nodeId) + ":" + std::to_string(p.userId) + ":" + payload + "]";
}

std::vector<std::string> Rosters(const ContractParticipant& p) {
    std::vector<std::string> changes;
    for (const ArmEvent& event : p.sink->Named("ApeRosterChanged"))
        changes.push_back(DescribeRoster(event.roster));
    return changes;
}

std::string Text(const std::vector<std::uint8_t>& bytes) {
    return std::string(bytes.begin(), bytes.end());
}

// What a confirmation or delivery says, compared in one check: ape handle, cache, sender,
// action, result and bytes.
using Seen =
    std::tuple<std::uint32_t, std::uint32_t, std::uint32_t, tagCacheAction, short, std::string>;
Seen Fields(const ArmEvent& e) {
    return Seen(e.apeHandle, e.entityId, e.userId, e.action, e.result, Text(e.data));
}

}  // namespace

std::vector<std::uint8_t> ContractBytes(const std::string& text) {
    return std::vector<std::uint8_t>(text.begin(), text.end());
}

std::string DescribeRoster(const RosterChange& change) {
    std::string text;
    const auto add = [&text](char sign, const std::vector<RosterRecord>& records) {
        for (const RosterRecord& record : records) {
            if (!text.empty()) text += ' ';
            text += sign + std::to_string(record.sessionId);
            for (const RosterUserEntry& user : record.users) {
                text += "[" + std::to_string(user.nodeId) + ":" + std::to_string(user.userId) +
                        ":" + std::string(user.enrollInfo.begin(), user.enrollInfo.end()) + "]";
            }
        }
    };
    add('+', change.added);
    add('-', change.deleted);
    add('~', change.modified);
    return text;
}

ContractParticipant& ConferenceDriver::Fresh(std::uint32_t nodeId) {
    ContractParticipant& p = m_participants.emplace_back();
    p.nodeId = nodeId;
    p.client = m_harness->NewClient(nodeId);
    p.sink = std::make_unique<ArmRecorder>(p.client);
    return p;
}

ContractParticipant& ConferenceDriver::Attached(std::uint32_t nodeId) {
    ContractParticipant& p = Fresh(nodeId);
    EXPECT_TRUE(ConnectAccepted(p.client->Connect(p.sink.get(), "user", 0, 0, 0)));
    Run();
    EXPECT_EQ(0, p.client->ConferenceJoin(0, m_harness->ConferenceId(), p.sink.get(), 3));
    Run();
    EXPECT_EQ(0, p.client->ApeAttach(p.sink.get(), 0, m_harness->ConferenceId(), &p.ape));
    Run();
    const std::vector<ArmEvent> attach = p.sink->Named("ApeAttachConfirm");
    if (!attach.empty()) p.userId = attach.back().userId;
    p.sink->Clear();
    return p;
}

int ConferenceDriver::Enroll(ContractParticipant& p, const std::string& payload,
                             std::uint32_t session) {
    ARMSessionResource resource{1, kSessionResource, 1, 0, 0};
    return p.client->ApeEnroll(p.ape, 1, session, 0, 1, &resource, payload.data(),
                               static_cast<std::uint32_t>(payload.size()), 3);
}

std::uint32_t ConferenceDriver::Handle(ContractParticipant& p, const std::string& name) {
    NameHandle entry{};
    std::memcpy(entry.name, name.data(), std::min(name.size(), sizeof entry.name));
    EXPECT_EQ(0, p.client->AllocNameHandle(p.ape, 1, &entry, p.sink.get()));
    Run();
    const std::vector<ArmEvent> confirms = p.sink->Named("AllocNameHandleConfirm");
    p.sink->Clear();
    if (confirms.empty() || confirms.back().handles.size() != 1) return 0;
    return confirms.back().handles[0].handle_value;
}

int ConferenceDriver::Write(ContractParticipant& p, std::uint32_t cache, tagCacheAction action,
                            const std::vector<std::uint8_t>* bytes) {
    std::uint32_t mem = 0;
    if (bytes != nullptr) {
        std::uint32_t size = static_cast<std::uint32_t>(bytes->size());
        EXPECT_EQ(0, p.client->AllocMemHandle(size, &mem));
        EXPECT_EQ(0, p.client->WriteMemHandle(mem, 0, bytes->data(), &size));
    }
    const int result =
        p.client->ApeSharedDataActionEx(p.ape, cache, 0, 0, action, 0x2000000, mem, 0, 1);
    if (mem != 0) {
        EXPECT_EQ(0, p.client->FreeMemHandle(mem));
    }
    return result;
}

TEST_P(ConferenceContract, ConnectJoinAndAttachAnswerLaterAndRepeatsAnswerTheSame) {
    ContractParticipant& p = Fresh(11);
    const std::uint16_t conference = m_harness->ConferenceId();
    ASSERT_TRUE(ConnectAccepted(p.client->Connect(p.sink.get(), "Ann", 0, 0, 0)));
    EXPECT_TRUE(p.sink->Events().empty()) << "answered from inside the request";
    Run();
    EXPECT_EQ(kArmAlreadyConnected, p.client->Connect(p.sink.get(), "Ann", 0, 0, 0));
    ASSERT_EQ(0, p.client->ConferenceJoin(0, conference, p.sink.get(), 3));
    Run();
    EXPECT_EQ(kArmAlreadyJoined, p.client->ConferenceJoin(0, conference, p.sink.get(), 3));
    std::uint32_t ape = 0, again = 0;
    ASSERT_EQ(0, p.client->ApeAttach(p.sink.get(), 0, conference, &ape));
    EXPECT_NE(0u, ape);
    Run();
    ASSERT_EQ(0, p.client->ApeAttach(p.sink.get(), 0, conference, &again));
    EXPECT_EQ(ape, again);
    Run();

    // The refused repeats answer nothing; a repeated attach confirms the same handle and id.
    ASSERT_EQ(std::vector<std::string>({"ConnectConfirm", "ConferenceJoinConfirm",
                                        "ApeAttachConfirm", "ApeAttachConfirm"}),
              p.sink->Names());
    for (const ArmEvent& event : p.sink->Events())
        EXPECT_EQ(0, event.result) << event.name;
    const std::vector<ArmEvent> attach = p.sink->Named("ApeAttachConfirm");
    EXPECT_EQ(ape, attach[0].apeHandle);
    EXPECT_EQ(ape, attach[1].apeHandle);
    EXPECT_NE(0u, attach[0].userId);
    EXPECT_EQ(attach[0].userId, attach[1].userId);
}

TEST_P(ConferenceContract, EnrollGrantsOneSessionValuePerSessionAndTellsEveryMemberOfEachChange) {
    ContractParticipant& a = Attached(11);
    ContractParticipant& b = Attached(12);
    ContractParticipant& c = Attached(13);
    EXPECT_EQ(3u, std::set<std::uint32_t>({a.userId, b.userId, c.userId}).size());
    EXPECT_NE(a.ape, b.ape);
    const std::string payloadA("<roster>a\0b</roster>", 20);  // bytes pass unchanged
    ASSERT_EQ(0, Enroll(a, payloadA));
    EXPECT_TRUE(a.sink->Events().empty());
    Run();
    ASSERT_EQ(0, Enroll(b, "beta"));
    ASSERT_EQ(0, Enroll(c, "gamma", kSession + 1));
    Run();

    std::vector<std::uint32_t> values;
    for (ContractParticipant* p : {&a, &b, &c}) {
        const std::vector<ArmEvent> confirms = p->sink->Named("ApeEnrollConfirm");
        ASSERT_EQ(1u, confirms.size());
        ASSERT_EQ(1u, confirms[0].resources.size());
        const RecordedResource& granted = confirms[0].resources[0];
        EXPECT_EQ(std::make_tuple(p->ape, 0, std::string(kSessionResource), 0),
                  std::make_tuple(confirms[0].apeHandle, confirms[0].result, granted.name,
                                  granted.status));
        values.push_back(granted.value);
        // The confirmation comes before any roster change.
        EXPECT_EQ("ApeEnrollConfirm", p->sink->Names().front());
    }
    EXPECT_EQ(values[0], values[1]);
    EXPECT_EQ(3u, std::set<std::uint32_t>({0, values[0], values[2]}).size());  // never 0

    const std::string s = std::to_string(kSession);
    const std::vector<std::string> both = {"+" + s + Entry(a, payloadA),
                                           "+" + s + Entry(b, "beta")};
    EXPECT_EQ(both, Rosters(a));
    // The newcomer first learns who is there, then sees its own arrival.
    EXPECT_EQ(both, Rosters(b));
    EXPECT_EQ(std::vector<std::string>({"+" + std::to_string(kSession + 1) + Entry(c, "gamma")}),
              Rosters(c));

    // Enrolling again is a modification, told to everyone in the session.
    a.sink->Clear();
    b.sink->Clear();
    ASSERT_EQ(0, Enroll(b, "beta, now presenter"));
    Run();
    const std::string modified = "~" + s + Entry(b, "beta, now presenter");
    EXPECT_EQ(std::vector<std::string>({modified}), Rosters(a));
    EXPECT_EQ(std::vector<std::string>({"ApeEnrollConfirm", "ApeRosterChanged"}), b.sink->Names());
    EXPECT_EQ(std::vector<std::string>({modified}), Rosters(b));

    // Detaching drops the answers already on their way to a; b still learns of both changes.
    a.sink->Clear();
    b.sink->Clear();
    ASSERT_EQ(0, Enroll(a, "away"));
    ASSERT_EQ(0, a.client->ApeDetach(a.ape));
    Run();
    EXPECT_TRUE(a.sink->Events().empty());
    EXPECT_EQ(std::vector<std::string>({"~" + s + Entry(a, "away"), "-" + s + Entry(a, "away")}),
              Rosters(b));
}

// Private data reaches its one addressee, cache actions every subscriber; both with the true
// sender and the bytes unchanged.
TEST_P(ConferenceContract, PrivateDataAndCacheActionsReachTheirAddresseesWithTheTrueSender) {
    ContractParticipant& a = Attached(11);
    ContractParticipant& b = Attached(12);
    ContractParticipant& c = Attached(13);
    const std::string bytes("<pdu>\0\xff</pdu>", 13);
    const ARMSendOption option{a.ape, 0x92};  // marks the next send only
    ASSERT_EQ(0, a.client->SetSendOption(-200, &option));
    ASSERT_EQ(0, a.client->ApeSendData(a.ape, b.userId, 1, bytes.data(), 13, 1, 1));
    EXPECT_NE(0, a.client->ApeSendData(a.ape, 999999, 1, bytes.data(), 13, 1, 1));
    ASSERT_EQ(0, a.client->ApeSendData(a.ape, b.userId, 1, "2", 1, 1, 1));
    EXPECT_TRUE(b.sink->Events().empty());
    Run();
    const std::vector<ArmEvent> received = b.sink->Named("ApeDataIndication");
    ASSERT_EQ(2u, received.size());
    EXPECT_EQ(b.ape, received[0].apeHandle);
    EXPECT_EQ(a.userId, received[0].userId);
    EXPECT_EQ(bytes, Text(received[0].data));
    EXPECT_EQ(0x92, received[0].flags);
    EXPECT_EQ(0, received[1].flags);
    EXPECT_TRUE(a.sink->Events().empty());
    EXPECT_TRUE(c.sink->Events().empty());

    const std::uint32_t cache = Handle(a, "70001_chat_cache_15");
    ASSERT_EQ(cache, Handle(b, "70001_chat_cache_15"));
    ASSERT_EQ(0, Request(a, cache, CACHE_REQUEST_SUBSCRIBE));
    ASSERT_EQ(0, Request(b, cache, CACHE_REQUEST_SUBSCRIBE));

    const std::vector<std::uint8_t> zero(2, 0), one = ContractBytes("one"),
                                                two = ContractBytes("two");
    ASSERT_EQ(0, Write(a, cache, CACHE_SET, &zero));
    ASSERT_EQ(0, Write(a, cache, CACHE_APPEND, &one));
    EXPECT_TRUE(a.sink->Events().empty());
    // Actions of different writers are ordered as the conference receives them.
    Run();
    ASSERT_EQ(0, Write(b, cache, CACHE_APPEND, &two));
    Run();

    const std::vector<ArmEvent> confirms = a.sink->Named("ApeCacheActionConfirmEx");
    ASSERT_EQ(2u, confirms.size());
    EXPECT_EQ(Seen(a.ape, cache, 0, CACHE_SET, 0, ""), Fields(confirms[0]));
    EXPECT_EQ(Seen(a.ape, cache, 0, CACHE_APPEND, 0, ""), Fields(confirms[1]));
    EXPECT_LT(confirms[0].cacheId, confirms[1].cacheId);
    // The writer's confirmation comes before its own delivery.
    EXPECT_EQ("ApeCacheActionConfirmEx", a.sink->Names().front());

    for (const ContractParticipant* p : {&a, &b}) {
        const std::vector<ArmEvent> got = p->sink->Named("SharedDataReceivedEx");
        ASSERT_EQ(3u, got.size());
        EXPECT_EQ(Seen(p->ape, cache, a.userId, CACHE_SET, 0, Text(zero)), Fields(got[0]));
        EXPECT_EQ(Seen(p->ape, cache, a.userId, CACHE_APPEND, 0, "one"), Fields(got[1]));
        EXPECT_EQ(Seen(p->ape, cache, b.userId, CACHE_APPEND, 0, "two"), Fields(got[2]));
        EXPECT_EQ(confirms[1].cacheId, got[1].cacheId);
        EXPECT_LT(got[1].cacheId, got[2].cacheId);
        // A delivered memory handle lives for its callback only.
        std::uint32_t size = 0;
        for (const ArmEvent& item : got)
            EXPECT_NE(0, p->client->GetMemHandleSize(item.memHandle, &size));
    }
    EXPECT_TRUE(c.sink->Events().empty());

    // Unsubscribing stops later deliveries to b only.
    ASSERT_EQ(0, Request(b, cache, CACHE_REQUEST_UNSUBSCRIBE));
    ASSERT_EQ(0, Write(a, cache, CACHE_APPEND, &one));
    Run();
    EXPECT_EQ(4u, a.sink->Count("SharedDataReceivedEx"));
    EXPECT_EQ(3u, b.sink->Count("SharedDataReceivedEx"));
}

// What one retrieval answers, for each state a cache can be in.
TEST_P(ConferenceContract, RetrieveAnswersEveryItemAndMarksTheLast) {
    struct Item {
        tagCacheAction action;
        short result;
        std::string data;  // "" with no memory handle
    };
    struct Case {
        const char* name;
        std::vector<Item> writes;  // results unused
        std::vector<Item> expected;
    };
    const std::string mark("1\0", 2), zero("\0\0", 2);
    const std::vector<Case> cases = {
        {"never set", {}, {{CACHE_REPLY_LAST, kArmRetry, ""}}},
        {"set without bytes", {{CACHE_SET, 0, ""}}, {{CACHE_REPLY_LAST, 0, ""}}},
        {"status mark", {{CACHE_SET, 0, mark}}, {{CACHE_REPLY_LAST, 0, mark}}},
        {"initialised, two lines",
         {{CACHE_SET, 0, zero}, {CACHE_APPEND, 0, "p"}, {CACHE_APPEND, 0, "q"}},
         {{CACHE_REPLY_ITEM, 0, zero}, {CACHE_REPLY_ITEM, 0, "p"}, {CACHE_REPLY_LAST, 0, "q"}}},
        {"set replaces",
         {{CACHE_APPEND, 0, "p"}, {CACHE_SET, 0, mark}},
         {{CACHE_REPLY_LAST, 0, mark}}},
    };
    ContractParticipant& writer = Attached(11);
    ContractParticipant& reader = Attached(12);
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        const std::uint32_t cache = Handle(writer, std::string("cache ") + c.name);
        for (const Item& write : c.writes) {
            const std::vector<std::uint8_t> bytes = ContractBytes(write.data);
            ASSERT_EQ(0, Write(writer, cache, write.action, bytes.empty() ? nullptr : &bytes));
        }
        Run();
        reader.sink->Clear();
        ASSERT_EQ(0, Request(reader, cache, CACHE_REQUEST_RETRIEVE));
        Run();
        const std::vector<ArmEvent> got = reader.sink->Named("SharedDataReceivedEx");
        ASSERT_EQ(c.expected.size(), got.size());
        for (std::size_t i = 0; i < got.size(); ++i) {
            const Item& want = c.expected[i];
            // Items without bytes name no sender the component could rely on.
            const std::uint32_t sender = want.data.empty() ? got[i].userId : writer.userId;
            EXPECT_EQ(Seen(reader.ape, cache, sender, want.action, want.result, want.data),
                      Fields(got[i]));
            EXPECT_EQ(want.data.empty(), got[i].memHandle == 0);
            EXPECT_TRUE(i == 0 || got[i - 1].cacheId < got[i].cacheId) << i;
        }
    }
}

TEST_P(ConferenceContract, NothingReachesAParticipantAfterRelease) {
    ContractParticipant& a = Attached(11);
    ContractParticipant& b = Attached(12);
    ContractParticipant& c = Attached(13);
    ASSERT_EQ(0, Enroll(a, "alpha"));
    ASSERT_EQ(0, Enroll(b, "beta"));
    const std::uint32_t cache = Handle(a, "70001_chat_cache_15");
    ASSERT_EQ(0, Request(b, cache, CACHE_REQUEST_SUBSCRIBE));
    Run();
    b.sink->Clear();
    a.sink->Clear();

    // Answers already on their way to b are dropped with it.
    const std::vector<std::uint8_t> line = ContractBytes("line");
    ASSERT_EQ(0, Write(a, cache, CACHE_APPEND, &line));
    ASSERT_EQ(0, a.client->ApeSendData(a.ape, b.userId, 1, "hi", 2, 1, 1));
    ASSERT_EQ(0, Request(b, cache, CACHE_REQUEST_RETRIEVE));
    Release(b);
    Run();
    EXPECT_TRUE(b.sink->Events().empty());
    EXPECT_EQ(std::vector<std::string>({"-" + std::to_string(kSession) + Entry(b, "beta")}),
              Rosters(a));
    EXPECT_EQ(1u, a.sink->Count("ApeCacheActionConfirmEx"));
    EXPECT_NE(0, a.client->ApeSendData(a.ape, b.userId, 1, "hi", 2, 1, 1));

    // A release inside a callback stops the rest of that answer.
    ASSERT_EQ(0, Write(a, cache, CACHE_APPEND, &line));
    c.sink->SetHook([this, &c](const ArmEvent& event) {
        if (event.name == "SharedDataReceivedEx") Release(c);
    });
    ASSERT_EQ(0, Request(c, cache, CACHE_REQUEST_RETRIEVE));
    Run();
    EXPECT_EQ(1u, c.sink->Count("SharedDataReceivedEx"));
}
