// Sending chat among five participants: every audience of the send table reaches exactly its
// participants with its title, the flags the service is given for each record condition, and
// what happens when the service, the group or the selected entry cannot take the line.
#include <gtest/gtest.h>

#include <algorithm>
#include <tuple>
#include <utility>

#include "engine/line_ends.h"
#include "tests/engine/chat_room.h"
#include "tests/support/arm_recorder.h"
#include "tests/support/trace_capture.h"

namespace {

using chatroom::ChatRoom;
using chatroom::Member;
using Names = std::vector<std::string>;

constexpr std::uint32_t kHana = 101, kPia = 102, kPaul = 103, kAnn = 104, kAl = 105;
constexpr std::int32_t kPerson = -1;

// A panel meeting (type 3) of host, presenter, panelist and two attendees.
void JoinPanel(ChatRoom& room) {
    room.Join({"Hana", kHana, ROLE_HOST});
    room.Join({"Pia", kPia, ROLE_PRESENTER});
    room.Join({"Paul", kPaul, ROLE_PANELIST});
    room.Join({"Ann", kAnn, 0});
    room.Join({"Al", kAl, 0});
    room.SetHostAndPresenter(kHana, kPia);
}

Member& ByName(ChatRoom& room, const std::string& name) {
    for (auto& m : room.members)
        if (name == m->person.name) return *m;
    return *room.members.front();
}

// Window commands after position first that clear the input.
std::size_t Clears(const Member& m, std::size_t first) {
    const std::vector<int> ids = m.window->IdsSince(first);
    return static_cast<std::size_t>(std::count(ids.begin(), ids.end(), msg_ClearInput));
}

// Everything the group's cache holds, as the service delivers it on a retrieval.
std::vector<ArmEvent> CacheItems(ChatRoom& room, Member& m, std::uint32_t groupId) {
    ArmRecorder recorder(m.client);
    m.client->ApeRequestSharedDataEx(m.client->ApeHandle(),
                                     m.engine.GetCacheHandleFormGroupId(groupId), 0,
                                     CACHE_REQUEST_RETRIEVE, 255, &recorder);
    room.Run();
    return recorder.Named("SharedDataReceivedEx");
}

TEST(Sending, EveryAudienceOfAPanelMeetingReachesExactlyItsParticipants) {
    ChatRoom room(3);
    JoinPanel(room);
    const Names everybody{"Hana", "Pia", "Paul", "Ann", "Al"};
    // Each line: who says it to which group (or to the node's entry), its title, who shows it.
    const std::tuple<const char*, std::int32_t, std::uint32_t, const char*, Names> rows[] = {
        {"Ann", GROUP_ATTENDEES, 0, "from Ann to All Attendees", {"Ann", "Al"}},
        // An attendee does not read these caches: its own line is shown at once.
        {"Ann", GROUP_HOST, 0, "from Ann to Host (privately)", {"Hana", "Ann"}},
        {"Ann", GROUP_PRESENTER, 0, "from Ann to Presenter (privately)", {"Pia", "Ann"}},
        {"Ann", GROUP_HOST_PRESENTER, 0, "from Ann to Host & Presenter", {"Hana", "Pia", "Ann"}},
        {"Ann", GROUP_PANELISTS, 0, "from Ann to All Panelists", {"Hana", "Pia", "Paul", "Ann"}},
        {"Ann", GROUP_EVERYONE, 0, "from Ann to All Participants", everybody},
        {"Paul", GROUP_ATTENDEES, 0, "from Paul to All Attendees", {"Paul", "Ann", "Al"}},
        {"Hana", GROUP_PANELISTS, 0, "from Hana to All Panelists", {"Hana", "Pia", "Paul"}},
        {"Ann", kPerson, kHana, "from Ann to Hana (privately)", {"Hana", "Ann"}},
        {"Hana", kPerson, kAl, "from Hana to Al (privately)", {"Hana", "Al"}},
    };
    int n = 0;
    for (const auto& [from, groupId, node, title, holders] : rows) {
        const std::string text = "line " + std::to_string(++n);
        room.Say(ByName(room, from), text, groupId, node);
        EXPECT_EQ(room.Holders(std::string(title) + "|" + text), holders) << title;
    }
    // Each line was shown once by each holder, and saved transcripts are marked modified.
    EXPECT_EQ(ChatRoom::Transcript(ByName(room, "Ann")).size(), 8u);
    EXPECT_EQ(ByName(room, "Al").engine.FileNeedSave(), 1);
}

TEST(Sending, QMRulesSendToEveryoneOrPrivatelyToTheRoleHolder) {
    ChatRoom room(1, FEATURE_QM_MODE);
    JoinPanel(room);
    chatroom::TelemetryCapture telemetry;
    // Each line Ann says: to which group (or node), its title, who shows it, the action told.
    const std::tuple<std::int32_t, std::uint32_t, const char*, Names, int> rows[] = {
        {GROUP_EVERYONE, 0, "from Ann to Everyone", {"Hana", "Pia", "Paul", "Ann", "Al"}, 908},
        {GROUP_HOST, 0, "from Ann to Hana (privately)", {"Hana", "Ann"}, 904},
        {GROUP_HOST_PRESENTER, 0, "from Ann to Hana (privately)", {"Hana", "Ann"}, 905},
        {GROUP_PRESENTER, 0, "from Ann to Pia (privately)", {"Pia", "Ann"}, 903},
        {kPerson, kAl, "from Ann to Al (privately)", {"Ann", "Al"}, 909},
    };
    int n = 0;
    for (const auto& [groupId, node, title, holders, action] : rows) {
        const std::string text = "qm " + std::to_string(++n);
        room.Say(ByName(room, "Ann"), text, groupId, node);
        EXPECT_EQ(room.Holders(std::string(title) + "|" + text), holders) << title;
        EXPECT_EQ(telemetry.actions.back(), action) << title;
    }
}

TEST(Sending, TheServiceIsGivenTheFlagsOfTheRecordCondition) {
    // Each condition: recording status and option, features, save-for-report; then the flags
    // of an everyone line, of a host line and of the option a QM send gets.
    const std::tuple<const char*, std::uint32_t, std::uint32_t, std::uint32_t, int, std::uint32_t,
                     std::uint32_t, std::uint32_t>
        rows[] = {
            {"not recorded", 1, 1, 0, 0, 0x1000000, 0x1000000, 0x1000000},
            {"not recorded, for report", 1, 1, 0, 1, 0x1000000, 0x1000000, 0x1000100},
            {"recording", 0, 1, 0, 0, 0x1000090, 0x1000090, 0x1000090},
            {"paused", 2, 1, 0, 0, 0x1000000, 0x1000000, 0x1000000},
            {"recording without option", 3, 0, 0, 0, 0x1000090, 0x1000092, 0x1000090},
            {"always recorded", 1, 0, FEATURE_ALWAYS_RECORD, 1, 0x1000090, 0x1000092, 0x1000290},
            {"always recorded, paused", 2, 1, FEATURE_ALWAYS_RECORD, 0, 0x1000090, 0x1000090,
             0x1000090},
        };
    for (const auto& [condition, status, option, features, saveForReport, toAll, toHost, qm] :
         rows) {
        SCOPED_TRACE(condition);
        ChatRoom room(3, features);
        Member& hana = room.Join({"Hana", kHana, ROLE_HOST});
        room.SetHostAndPresenter(kHana, 0);
        hana.engine.SetNBRStatus(status, option, 0);
        hana.engine.SetSaveForReportFlag(saveForReport);
        EXPECT_EQ(hana.engine.GetGroupSendPDUOption(), qm);
        room.Say(hana, "to all", GROUP_EVERYONE);
        room.Say(hana, "to me", GROUP_HOST);
        // After the cache's initial set, a recorded session gets the everyone group's
        // description before its first line.
        const std::vector<ArmEvent> everyone = CacheItems(room, hana, GROUP_EVERYONE);
        const bool described = status == 0 || status == 3;
        ASSERT_EQ(everyone.size(), described ? 3u : 2u);
        EXPECT_EQ(everyone.back().value, toAll);
        EXPECT_EQ(CacheItems(room, hana, GROUP_HOST).back().value, toHost);
        EXPECT_EQ(everyone[everyone.size() - 2].value, described ? 0x2000090u : 0x2000000u);
    }
}

TEST(Sending, ALineTheServiceRefusesStaysTypedAndIsNotShown) {
    ChatRoom room(3);
    JoinPanel(room);
    Member& ann = ByName(room, "Ann");
    const std::uint32_t everyone = ann.engine.GetCacheHandleFormGroupId(GROUP_EVERYONE);
    // Each send: the refused call, the group (or node) and the warning.
    const std::tuple<const char*, ArmOperation, std::int32_t, std::uint32_t, std::string> rows[] = {
        {"group", ArmOperation::ApeSharedDataActionEx, GROUP_EVERYONE, 0,
         "CChatClient::SendChat:ApeSharedDataActionEx dwCacheHandle=" + std::to_string(everyone) +
             ",error =9"},
        {"private", ArmOperation::ApeSendData, kPerson, kHana,
         "CChatClient::SendChat:ApeSendData error =9"},
    };
    for (const auto& [send, op, groupId, node, warning] : rows) {
        SCOPED_TRACE(send);
        const std::size_t before = ann.window->Commands().size();
        const std::size_t lines = ChatRoom::Transcript(ann).size();
        ann.engine.SetFileNeedSave(0);
        ann.client->FailNext(op, 9);
        TraceCapture capture;
        room.Say(ann, "again", groupId, node);
        EXPECT_TRUE(capture.Has(TraceLevel::Warn, warning));
        EXPECT_EQ(Clears(ann, before), 0u);
        EXPECT_EQ(ChatRoom::Transcript(ann).size(), lines);
        EXPECT_EQ(ann.engine.FileNeedSave(), 0);
        // The text is still there: sending again works.
        ann.engine.HandleUIMessage(msg_SendChat, nullptr, nullptr);
        room.Run();
        EXPECT_EQ(Clears(ann, before), 1u);
        EXPECT_EQ(ChatRoom::Transcript(ann).size(), lines + 1);
    }
}

TEST(Sending, NothingLeavesForAnEntryThatCannotTakeTheLine) {
    ChatRoom room(1);
    Member& ann = room.Join({"Ann", kAnn, 0});
    // Meeting type 1 brings no group; one added after the start has no cache.
    TraceCapture capture;
    room.Say(ann, "lost?", GROUP_EVERYONE);
    EXPECT_TRUE(capture.Has(TraceLevel::Warn,
                            "CChatClient::SendChat, group 15 has no cache, nothing sent"));
    // A disabled entry, and anything but everyone under the everyone-only mode, are refused.
    ann.engine.SetGroupMenuEnable(GROUP_EVERYONE, false);
    room.Say(ann, "disabled", GROUP_EVERYONE);
    EXPECT_TRUE(
        capture.Has(TraceLevel::Warn, "CChatClient::SendChat, send-to entry 0 cannot be chosen"));
    // Neither line left or cleared the input.
    EXPECT_EQ(ann.client->MemHandleCount(), 0u);
    EXPECT_EQ(Clears(ann, 0), 0u);
}

TEST(Sending, LineEndsLeaveAsCarriageReturnLineFeed) {
    const std::pair<const char*, const char*> rows[] = {{"a\nb", "a\nb"},
                                                        {"a\n\nb", "a\r\nb"},
                                                        {"\n\n\n", "\r\r\n"},
                                                        {"a\rb", "a\r\nb"},
                                                        {"a\r\nb", "a\r\nb"},
                                                        {"a\n\rb", "a\r\nb"},
                                                        {"a\xE2\x80\xA8z", "a\r\nz"},
                                                        {"\r\r", "\r\r\r\n"}};
    for (const auto& [typed, sent] : rows)
        EXPECT_EQ(NormaliseLineEnds(typed), sent) << typed;
    EXPECT_EQ(replace_all("aaa", "a", "aa"), "aaaaaa");
    EXPECT_EQ(replace_all("abab", "", "x"), "abab");
}

TEST(Sending, PrivateAndChannelIdsByAudience) {
    CChatClient engine;
    for (std::int32_t id : {0, -2, -4, -5, -6})
        EXPECT_FALSE(engine.IsPrivateChat(static_cast<std::uint32_t>(id))) << id;
    for (std::int32_t id : {-1, -3, 1001})
        EXPECT_TRUE(engine.IsPrivateChat(static_cast<std::uint32_t>(id))) << id;

    ChatRoom room(3);
    Member& hana = room.Join({"Hana", kHana, ROLE_HOST});
    Member& ann = room.Join({"Ann", kAnn, 0});
    room.SetHostAndPresenter(kHana, 0);
    // Each entry (group, or node) and its channel (1: Ann's user id).
    const std::tuple<std::int32_t, std::uint32_t, std::int32_t> rows[] = {
        {GROUP_ATTENDEES, 0, 0},       {GROUP_HOST, 0, -1},    {GROUP_PRESENTER, 0, -3},
        {GROUP_HOST_PRESENTER, 0, -2}, {GROUP_EVERYONE, 0, 0}, {kPerson, kAnn, 1}};
    for (const auto& [groupId, node, channel] : rows) {
        ASSERT_TRUE(room.Select(hana, groupId, node));
        EXPECT_EQ(hana.engine.GetSendUserChanelID(),
                  channel == 1 ? ann.client->UserId() : static_cast<std::uint32_t>(channel))
            << groupId;
    }
    std::int32_t none = -1;
    hana.engine.HandleUIMessage(msg_SelectionChanged, &none, nullptr);
    EXPECT_EQ(hana.engine.GetSendUserChanelID(), static_cast<std::uint32_t>(-6));
}

}  // namespace
