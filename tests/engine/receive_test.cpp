// Receiving chat in a panel meeting of host, presenter, panelist and attendee: who sees a
// message to each audience and with which title, forged senders, cache items that are no
// chat line, and what a shown line leaves in window, transcript and host.
#include <gtest/gtest.h>

#include <cstdio>
#include <optional>
#include <string>
#include <vector>

#include "engine/chat_client.h"
#include "pdu/group_info_pdu.h"
#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"
#include "platform/calendar.h"
#include "platform/sound.h"
#include "tests/engine/chat_room.h"
#include "tests/support/trace_capture.h"

namespace {

using chatroom::ChatRoom;
using chatroom::Member;
using Names = std::vector<std::string>;

constexpr std::uint32_t kHost = 101, kPresenter = 102, kPanelist = 103, kAttendee = 104;

std::vector<std::uint8_t> Bytes(const std::string& text) {
    return std::vector<std::uint8_t>(text.begin(), text.end());
}

std::string GroupMessage(std::uint32_t sendId, const std::string& name, std::uint32_t groupId,
                         const std::string& text) {
    CGroupMessagePDU pdu;
    pdu.SetSenderName(name);
    pdu.SetSendID(sendId);
    pdu.SetGroupID(groupId);
    pdu.SetMessageContent(text);
    pdu.GenerateXMLPDU();
    return pdu.ToWireText();
}

std::string PrivateMessage(std::uint32_t sendId, const std::string& name, std::uint32_t recId,
                           const std::string& text) {
    CPrivateMessagePDU pdu;
    pdu.SetSenderName(name);
    pdu.SetSendID(sendId);
    pdu.SetReveID(recId);
    pdu.SetMessageContent(text);
    pdu.GenerateXMLPDU();
    return pdu.ToWireText();
}

class Receiving : public ::testing::Test {
protected:
    void SetUp() override {
        room.Join({"Hana", kHost, ROLE_HOST});
        room.Join({"Pia", kPresenter, ROLE_PRESENTER});
        room.Join({"Paul", kPanelist, ROLE_PANELIST});
        room.Join({"Ann", kAttendee, 0});
        room.SetHostAndPresenter(kHost, kPresenter);
    }
    Member& Ann() { return *room.members[3]; }
    // Delivers bytes to every member as an append to the group's cache (handle 0: none).
    void DeliverToGroup(std::uint32_t groupId, const std::string& bytes, std::uint32_t senderId,
                        bool withHandle = true) {
        for (auto& m : room.members) {
            ArmCacheDelivery delivery;
            delivery.entityId = withHandle ? m->engine.GetCacheHandleFormGroupId(groupId) : 0;
            delivery.senderId = senderId;
            ASSERT_TRUE(m->client->InjectCacheDelivery(delivery, Bytes(bytes)));
        }
        room.Run();
    }
    void DeliverPrivately(const std::string& bytes, std::uint32_t senderId) {
        for (auto& m : room.members)
            ASSERT_TRUE(m->client->InjectPrivateData(senderId, Bytes(bytes)));
        room.Run();
    }
    ChatRoom room{3};
};

TEST_F(Receiving, AGroupMessageReachesItsAudienceWithItsTitle) {
    const std::uint32_t ann = Ann().client->UserId();
    const struct {
        std::uint32_t groupId;
        const char* title;
        Names holders;
    } rows[] = {
        // The attendees' chat is kept from host and presenter, not from panelists.
        {GROUP_ATTENDEES, "from Ann to All Attendees", {"Paul", "Ann"}},
        {GROUP_HOST, "from Ann to Host (privately)", {"Hana", "Ann"}},
        {GROUP_PRESENTER, "from Ann to Presenter (privately)", {"Pia", "Ann"}},
        {GROUP_HOST_PRESENTER, "from Ann to Host & Presenter", {"Hana", "Pia", "Ann"}},
        {GROUP_PANELISTS, "from Ann to All Panelists", {"Hana", "Pia", "Paul", "Ann"}},
        {GROUP_HOST_PRESENTER_PANELISTS,
         "from Ann to Host, Presenter & Panelists",
         {"Hana", "Pia", "Paul", "Ann"}},
        {GROUP_EVERYONE, "from Ann to All Participants", {"Hana", "Pia", "Paul", "Ann"}},
    };
    int n = 0;
    for (const auto& row : rows) {
        const std::string text = "line " + std::to_string(++n);
        DeliverToGroup(row.groupId, GroupMessage(ann, "Ann", row.groupId, text), ann);
        EXPECT_EQ(room.Holders(std::string(row.title) + "|" + text), row.holders) << row.title;
    }
    // Without a cache handle the message's own group id decides; an unknown one shows only
    // to its sender, untitled.
    DeliverToGroup(99, GroupMessage(ann, "Ann", 99, "odd"), ann, false);
    EXPECT_EQ(room.Holders("|odd"), Names{"Ann"});
}

TEST_F(Receiving, PanelGroupsFromOthersAreShownToPrivilegedParticipantsOnly) {
    // An attendee's stale subscription or a restored copy brings a panel message along.
    const std::uint32_t hana = room.members[0]->client->UserId();
    DeliverToGroup(GROUP_PANELISTS, GroupMessage(hana, "Hana", GROUP_PANELISTS, "p"), hana);
    EXPECT_EQ(room.Holders("from Hana to All Panelists|p"), (Names{"Hana", "Pia", "Paul"}));
    DeliverToGroup(GROUP_HOST_PRESENTER_PANELISTS,
                   GroupMessage(hana, "Hana", GROUP_HOST_PRESENTER_PANELISTS, "q"), hana);
    EXPECT_EQ(room.Holders("from Hana to Host, Presenter & Panelists|q"),
              (Names{"Hana", "Pia", "Paul"}));
    EXPECT_TRUE(ChatRoom::Transcript(Ann()).empty());
}

TEST_F(Receiving, APrivateMessageIsShownByItsReceiveId) {
    const std::uint32_t ann = Ann().client->UserId();
    const std::uint32_t hana = room.members[0]->client->UserId();
    const struct {
        std::uint32_t recId;
        const char* title;
        Names holders;
    } rows[] = {
        {static_cast<std::uint32_t>(-1), "from Ann to Host (privately)", {"Hana", "Ann"}},
        {static_cast<std::uint32_t>(-3), "from Ann to Presenter (privately)", {"Pia", "Ann"}},
        {static_cast<std::uint32_t>(-2), "from Ann to Host & Presenter", {"Hana", "Pia", "Ann"}},
        {static_cast<std::uint32_t>(-6), "from Ann to All Attendees", {"Paul", "Ann"}},
        {0, "from Ann to All Participants", {"Hana", "Pia", "Paul", "Ann"}},
        // Between two people: both see it, nobody else (no history is being restored).
        {hana, "from Ann to Hana (privately)", {"Hana", "Ann"}},
        // Role audiences private chat never uses are shown to nobody but the sender.
        {static_cast<std::uint32_t>(-4), "from Ann to  (privately)", {"Ann"}},
    };
    int n = 0;
    for (const auto& row : rows) {
        const std::string text = "private " + std::to_string(++n);
        DeliverPrivately(PrivateMessage(ann, "Ann", row.recId, text), ann);
        EXPECT_EQ(room.Holders(std::string(row.title) + "|" + text), row.holders) << row.title;
    }
}

TEST_F(Receiving, ForgedSendersAreDroppedWithAWarning) {
    const std::uint32_t ann = Ann().client->UserId();
    const std::uint32_t paul = room.members[2]->client->UserId();
    const std::string pdu = std::to_string(ann);
    const struct {
        std::uint32_t senderId;
        bool shown;
    } rows[] = {{paul, false}, {0, true}, {ann, true}};
    for (const auto& row : rows) {
        SCOPED_TRACE(row.senderId);
        TraceCapture capture;
        const std::string said = std::to_string(row.senderId);
        const std::size_t before = ChatRoom::Transcript(Ann()).size();
        DeliverToGroup(GROUP_EVERYONE, GroupMessage(ann, "Ann", 15, "g" + said), row.senderId);
        DeliverPrivately(PrivateMessage(ann, "Ann", 0, "p" + said), row.senderId);
        EXPECT_EQ(room.Holders("from Ann to All Participants|p" + said).size(),
                  row.shown ? 4u : 0u);
        EXPECT_EQ(ChatRoom::Transcript(Ann()).size() - before, row.shown ? 2u : 0u);
        const std::string ids = "senderId:" + said + ", senderId in PDU:" + pdu;
        EXPECT_EQ(capture.Has(TraceLevel::Warn,
                              "CChatClient::SharedDataReceivedEx,CACHE_APPEND or CACHE_SET,Detect "
                              "faked group message, " +
                                  ids),
                  !row.shown);
        EXPECT_EQ(
            capture.Has(TraceLevel::Warn,
                        "CChatClient::ApeDataIndication,Detect faked private message, " + ids),
            !row.shown);
        EXPECT_EQ(capture.Has(
                      TraceLevel::Info,
                      "CChatClient::ApeDataIndication,Didn't detect fake private message, " + ids),
                  row.shown);
    }
    // What a retrieval delivers is checked the same way, with its own texts.
    Member& hana = *room.members[0];
    ArmCacheDelivery read;
    read.entityId = hana.engine.GetCacheHandleFormGroupId(GROUP_EVERYONE);
    read.action = CACHE_REPLY_LAST;
    read.senderId = paul;
    TraceCapture capture;
    ASSERT_TRUE(hana.client->InjectCacheDelivery(read, Bytes(GroupMessage(ann, "Ann", 15, "old"))));
    room.Run();
    EXPECT_TRUE(capture.Has(TraceLevel::Warn,
                            "CChatClient::SharedDataReceivedEx,Detect faked group message, "
                            "senderId:" +
                                std::to_string(paul) + ", PUD senderId:" + pdu));
}

TEST_F(Receiving, CacheItemsThatAreNoChatLineAreTakenQuietlyOrDropped) {
    Member& hana = *room.members[0];
    const std::uint32_t cache = hana.engine.GetCacheHandleFormGroupId(GROUP_EVERYONE);
    CGroupInfoPDU info;
    info.SetGroupHandle(cache);
    info.SetGroupName("All Participants");
    info.GenerateXMLPDU();
    const struct {
        const char* item;
        std::optional<std::string> bytes;
        int result;
    } rows[] = {
        {"group description", info.ToWireText(), 1},
        {"not xml", std::string("<chat ver=\"1.0\"><mtype>3"), 0},
        {"empty item", std::string(), 0},
        {"no memory", std::nullopt, 0},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.item);
        std::uint32_t mem = 0;
        if (row.bytes) {
            ASSERT_EQ(hana.client->AllocMemHandle(row.bytes->size(), &mem), 0);
            std::uint32_t size = row.bytes->size();
            hana.client->WriteMemHandle(mem, 0, row.bytes->data(), &size);
        }
        TraceCapture capture;
        EXPECT_EQ(hana.engine.SharedDataReceivedEx(hana.client->ApeHandle(), 3, cache, mem, 0,
                                                   CACHE_APPEND, 0, 0, 0),
                  row.result);
        EXPECT_TRUE(ChatRoom::Transcript(hana).empty());
        for (const std::string& text : capture.Texts())
            EXPECT_EQ(text.find("faked"), std::string::npos) << text;
        if (mem != 0) hana.client->FreeMemHandle(mem);
    }
}

// What the host hears, in order.
struct HostRecorder final : IHostChatSink {
    void OnIncomingChat(const char* sender, const char* message, uint32_t nodeId) override {
        calls.push_back(std::string(sender) + ": " + message + " @" + std::to_string(nodeId));
    }
    void OnChatShown() override { calls.push_back("shown"); }
    void OnChatModified(bool b) override { calls.push_back(b ? "modified" : "saved"); }
    void OnChatContentChanged(bool b) override { calls.push_back(b ? "content" : "reset"); }
    std::vector<std::string> calls;
};

std::string Stamp(const DateTimeRec& t) {
    char text[64];
    std::snprintf(text, sizeof text, "%04d-%02d-%02d %02d:%02d:%02d/%d", t.year, t.month, t.day,
                  t.hour, t.minute, t.second, t.valid);
    return text;
}

TEST(Showing, ALineGoesToWindowTranscriptAndHostWithTheClocksTimeAndOneSound) {
    std::vector<std::string> played;
    SetSoundPlayer([&played](const char* path) { played.push_back(path); });
    HostRecorder host;
    ChatRoom room(3);
    Member& hana = room.Join({"Hana", kHost, ROLE_HOST}, &host);
    Member& ann = room.Join({"Ann", kAttendee, 0});
    Member& paul = room.Join({"Paul", kPanelist, ROLE_PANELIST});
    room.SetHostAndPresenter(kHost, kPresenter);
    hana.engine.SetSoundIncomingChat(2);
    FSRef sound{};
    std::snprintf(sound.path, sizeof sound.path, "/sounds/ding.aiff");
    hana.engine.SetSoundFSSpec(sound);
    // A stamp one second before the new year, whatever the clock shows now.
    std::int64_t eve = 0;
    ASSERT_TRUE(UnixSecondsFromCalendar({2021, 12, 31, 23, 59, 59, true}, &eve));
    room.loop.SetCalendarOrigin(CalendarFromUnixSeconds(eve - static_cast<int>(room.loop.Now())));
    hana.window->Clear();
    host.calls.clear();

    const std::uint32_t annId = ann.client->UserId();
    ASSERT_TRUE(hana.client->InjectPrivateData(
        annId, Bytes(PrivateMessage(annId, "Ann", hana.client->UserId(), "hi"))));
    room.Run();
    const std::vector<RecordedCommand>& shown = hana.window->Commands();
    ASSERT_GE(shown.size(), 2u);
    EXPECT_EQ(shown[0].id, msg_ShowTitle);
    EXPECT_EQ(shown[0].text, "from Ann to Hana (privately):\r");
    EXPECT_EQ(shown[1].id, msg_ShowText);
    EXPECT_EQ(shown[1].text, "hi");
    EXPECT_EQ(std::string(hana.engine.ChatContent().GetLineAtIndex(0)),
              "from Ann to Hana (privately):\r\thi");
    EXPECT_EQ(Stamp(hana.engine.ChatContent().GetTimeAt(0)), "2021-12-31 23:59:59/1");
    EXPECT_EQ(host.calls,
              (std::vector<std::string>{"Ann: hi @104", "shown", "content", "modified"}));
    // The host answers the one who wrote to it: the sender is picked as a recent partner.
    EXPECT_TRUE(hana.engine.IsUserSelectedUser(kAttendee));

    // The first-line sound does not play again; a new line carries the new time.
    room.loop.AdvanceBy(1.0);
    room.Say(paul, "later", GROUP_EVERYONE);
    EXPECT_EQ(ChatRoom::Transcript(hana).back(), "from Paul to All Participants|later");
    EXPECT_EQ(Stamp(hana.engine.ChatContent().GetTimeAt(1)), "2022-01-01 00:00:00/1");
    EXPECT_EQ(played, std::vector<std::string>{"/sounds/ding.aiff"});
    // A panelist answers group chat the same way; an attendee does not.
    room.Say(hana, "to all", GROUP_EVERYONE);
    EXPECT_TRUE(paul.engine.IsUserSelectedUser(kHost));
    EXPECT_FALSE(ann.engine.IsUserSelectedUser(kHost));
    SetSoundPlayer(nullptr);
}

TEST(Showing, TheSoundModeDecidesWhichLinesPlay) {
    const struct {
        PlaySoundMode mode;
        std::uint32_t panel;
        const char* file;
        std::size_t plays;  // of three lines
    } rows[] = {
        {0, 1, "/s", 0}, {1, 0, "/s", 0}, {1, 1, "/s", 3},
        {2, 0, "/s", 1}, {3, 0, "/s", 3}, {3, 1, "", 0},
    };
    for (const auto& row : rows) {
        std::size_t played = 0;
        SetSoundPlayer([&played](const char*) { ++played; });
        CChatClient engine;
        engine.SetSoundIncomingChat(row.mode);
        FSRef file{};
        std::snprintf(file.path, sizeof file.path, "%s", row.file);
        engine.SetSoundFSSpec(file);
        engine.SetPanelStatus(row.panel);
        for (int i = 0; i < 3; ++i)
            engine.PlaySoundIfNeed();
        EXPECT_EQ(played, row.plays) << row.mode << "/" << row.panel << row.file;
    }
    SetSoundPlayer(nullptr);
}

}  // namespace
