// Late joiners on the in-process conference, in QM mode with group-message recovery: what
// history they see, with which titles and names, once each and in order, what they leave in
// the customer cache for the next one, and how they fare when the service refuses a read.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <functional>
#include <set>
#include <string>
#include <tuple>
#include <vector>

#include "api/ui_protocol.h"
#include "engine/chat_recovery_mgr.h"
#include "pdu/private_message_pdu.h"
#include "platform/trace.h"
#include "tests/engine/chat_room.h"

using namespace chatroom;

namespace {

using Strings = std::vector<std::string>;

constexpr std::uint32_t kRecover = FEATURE_QM_MODE | FEATURE_GROUP_MSG_RECOVERY;
constexpr std::uint32_t kCustomerId = 770001;
const Person kAnn{"Ann", 11, 0};
const Person kBob{"Bob", 12, 0};
const Person kCy{"Cy", 13, 0};
const Person kDee{"Dee", 14, 0};
constexpr const char* kStarted = "Start recovery customer cache data......";

// Configures a participant with the customer id before it starts.
const auto kWithCustomerId = [](CChatClient& e) { e.RecoveryMgr()->SetCustomerId(kCustomerId); };

// The participant leaves: its engine is destroyed and the conference runs on.
void Leave(ChatRoom& room, const Member& member) {
    room.members.erase(std::find_if(room.members.begin(), room.members.end(),
                                    [&member](const auto& m) { return m.get() == &member; }));
    room.Run();
}

// Makes the service of the participant who joined last refuse its next retrieval.
void RefuseNext(ChatRoom& room) {
    room.members.back()->client->FailNext(ArmOperation::ApeRequestSharedDataEx, 1104);
}

// At the nth retrieval the participant now joining asks for (1 user info, 2 customer cache,
// 3 the everyone group's cache) runs action. Keeps the texts logged meanwhile, warnings
// marked "W:".
class AtNthRetrieval {
public:
    AtNthRetrieval(int nth, std::function<void()> action) {
        SetTraceSink([nth, action, this](TraceLevel level, const char*, const char* text) {
            logged.insert((level == TraceLevel::Warn ? "W:" : "") + std::string(text));
            if (std::string(text) == "Enter CChatClient::ChatRequestSharedDataEx" &&
                ++m_seen == nth)
                action();
        });
    }
    ~AtNthRetrieval() {
        SetTraceSink([](TraceLevel, const char*, const char*) {});
    }

    std::set<std::string> logged;

private:
    int m_seen = 0;
};

}  // namespace

TEST(LateJoiner, SeesPrivateAndEveryoneHistoryOnceInOrderNamedAlsoForThoseWhoLeft) {
    ChatRoom room(1, kRecover);
    room.beforeStart = kWithCustomerId;
    Member& ann = room.Join(kAnn);
    Member& bob = room.Join(kBob);
    room.Say(ann, "hi Bob", -1, kBob.node);
    room.Say(bob, "one", GROUP_EVERYONE);
    room.Say(ann, "two", GROUP_EVERYONE);
    Leave(room, bob);

    // Ann says one more line to everyone just before Cy asks for the everyone group's cache.
    AtNthRetrieval during(3, [&room, &ann] {
        room.Select(ann, GROUP_EVERYONE);
        ann.window->inputText = "during";
        ann.engine.HandleUIMessage(msg_SendChat, nullptr, nullptr);
    });
    Member& cy = room.Join(kCy);
    EXPECT_TRUE(during.logged.count(kStarted));
    // Every copy of a line (sender's, receivers', a late joiner's backup) is in the customer
    // cache, and a line sent while restoring is also in the everyone group's: each shows once.
    const Strings history{"from Ann to Bob (privately)|hi Bob", "from Bob to Everyone|one",
                          "from Ann to Everyone|two", "from Ann to Everyone|during"};
    EXPECT_EQ(ChatRoom::Transcript(cy), history);
    EXPECT_EQ(ChatRoom::Transcript(room.Join(kDee)), history);

    // Recovery never runs twice in one engine.
    during.logged.clear();
    cy.engine.CheckChatStatus();
    room.Run();
    EXPECT_FALSE(during.logged.count(kStarted));
    room.Say(ann, "three", GROUP_EVERYONE);
    EXPECT_EQ(ChatRoom::Transcript(cy).size(), history.size() + 1);
}

TEST(LateJoiner, BacksUpTheEveryoneHistoryIntoACustomerCacheNobodySetBefore) {
    ChatRoom room(1, kRecover);
    Member& ann = room.Join(kAnn);  // no customer id: no customer cache, no copies
    room.Say(ann, "kept in the everyone cache only", GROUP_EVERYONE);
    room.beforeStart = kWithCustomerId;
    Member& cy = room.Join(kCy);  // finds the customer cache never set, sets it, backs up
    Leave(room, ann);

    // Dee cannot read the everyone group's cache: the backup, named from the history roster
    // since Ann has left, is all she has, and she chats on.
    AtNthRetrieval refuse(3, [&room] { RefuseNext(room); });
    Member& dee = room.Join(kDee);
    EXPECT_EQ(ChatRoom::Transcript(dee),
              Strings({"from Ann to Everyone|kept in the everyone cache only"}));
    room.Say(cy, "still here", GROUP_EVERYONE);
    EXPECT_EQ(ChatRoom::Transcript(dee).back(), "from Cy to Everyone|still here");
}

TEST(LateJoiner, ARefusedReadLeavesTheRestOfTheHistory) {
    // The retrieval refused, the warning (%u: the cache's handle) and the history still shown.
    const std::tuple<int, const char*, Strings> cases[] = {
        {1,
         "ChatRecoveryMgr: user info cache %u not read (result 1104); senders who have left "
         "stay unnamed",
         {"from Ann to Bob (privately)|hi", "from Ann to Everyone|one"}},
        {2,
         "ChatRecoveryMgr: customer cache %u not read (result 1104); restoring the everyone "
         "group only",
         {"from Ann to Everyone|one"}},
    };
    for (const auto& [nth, format, history] : cases) {
        SCOPED_TRACE(nth);
        ChatRoom room(1, kRecover);
        room.beforeStart = kWithCustomerId;
        Member& ann = room.Join(kAnn);
        room.Join(kBob);
        room.Say(ann, "hi", -1, kBob.node);
        room.Say(ann, "one", GROUP_EVERYONE);
        AtNthRetrieval refuse(nth, [&room] { RefuseNext(room); });
        Member& cy = room.Join(kCy);
        const std::uint32_t handles[] = {cy.engine.UserInfoCacheHandle().handle_value,
                                         cy.engine.CustomerCacheHandle().handle_value};
        char warning[256];
        std::snprintf(warning, sizeof warning, format, handles[nth - 1]);
        EXPECT_TRUE(refuse.logged.count(std::string("W:") + warning));
        EXPECT_EQ(ChatRoom::Transcript(cy), history);
    }
}

TEST(LateJoiner, AnEngineCleanedUpMidwayIgnoresItsCachesAndShowsNoRestoredLine) {
    ChatRoom room(1, kRecover);
    room.beforeStart = kWithCustomerId;
    Member& cy = room.Join(kCy);
    const std::uint32_t customerCache = cy.engine.CustomerCacheHandle().handle_value;
    cy.engine.Cleanup();
    cy.engine.SharedDataReceivedEx(1, 5, customerCache, 0x100001, 0, CACHE_REPLY_LAST, 0, 0, 0);
    CPrivateMessagePDU between;
    between.SetSendID(5u);
    between.SetReveID(6u);
    EXPECT_EQ(cy.engine.ParseAndShowPrivateMessages(&between, 0), -1);
    EXPECT_TRUE(ChatRoom::Transcript(cy).empty());
}
