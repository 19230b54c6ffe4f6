// Receiving chat among host, presenter, panelist and attendee: who sees a message to each
// audience and with which title, forged senders, cache items that are no chat line, and what
// a shown line leaves in window, transcript and host.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <tuple>
#include <type_traits>

#include "pdu/group_info_pdu.h"
#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"
#include "platform/calendar.h"
#include "platform/sound.h"
#include "tests/engine/chat_room.h"
#include "tests/engine/menu_harness.h"
#include "tests/support/arm_recorder.h"
#include "tests/support/german_host.h"
#include "tests/support/host_recorder.h"
#include "tests/support/trace_capture.h"

namespace {

using chatroom::ChatRoom;
using chatroom::Member;
using Names = std::vector<std::string>;

constexpr std::uint32_t kHost = 101, kPresenter = 102, kPanelist = 103, kAttendee = 104;

// A group message to group `to`, or a private one with receive id `to`.
template <typename Pdu>
std::vector<std::uint8_t> Line(std::uint32_t sendId, const char* name, std::uint32_t to,
                               const std::string& text) {
    Pdu pdu;
    pdu.SetSenderName(name);
    pdu.SetSendID(sendId);
    if constexpr (std::is_same_v<Pdu, CGroupMessagePDU>) {
        pdu.SetGroupID(to);
    } else {
        pdu.SetReveID(to);
    }
    pdu.SetMessageContent(text);
    pdu.GenerateXMLPDU();
    const std::string wire = pdu.ToWireText();
    return {wire.begin(), wire.end()};
}
const auto GroupLine = Line<CGroupMessagePDU>;
const auto PrivateLine = Line<CPrivateMessagePDU>;

class Receiving : public ::testing::Test {
protected:
    void SetUp() override {
        for (const chatroom::Person& p : {chatroom::Person{"Hana", kHost, ROLE_HOST},
                                          {"Pia", kPresenter, ROLE_PRESENTER},
                                          {"Paul", kPanelist, ROLE_PANELIST},
                                          {"Ann", kAttendee, 0}})
            room.Join(p);
        room.SetHostAndPresenter(kHost, kPresenter);
    }
    std::uint32_t Id(int member) { return room.members[member]->client->UserId(); }
    // Delivers bytes to every member privately, or as an append to the group's cache (group 0:
    // no handle).
    void Deliver(bool privately, std::uint32_t groupId, const std::vector<std::uint8_t>& bytes,
                 std::uint32_t senderId, tagCacheAction action = CACHE_APPEND) {
        for (auto& m : room.members) {
            ArmCacheDelivery delivery;
            delivery.action = action;
            delivery.entityId = m->engine.GetCacheHandleFormGroupId(groupId);
            delivery.senderId = senderId;
            ASSERT_TRUE(privately ? m->client->InjectPrivateData(senderId, bytes)
                                  : m->client->InjectCacheDelivery(delivery, bytes));
        }
        room.Run();
    }
    ChatRoom room{3};
};

TEST_F(Receiving, AMessageReachesItsAudienceWithItsTitle) {
    const Names panel{"Hana", "Pia", "Paul"}, all{"Hana", "Pia", "Paul", "Ann"};
    constexpr bool kGroup = false, kPrivate = true;
    // Each line: its sender (0 Hana, 3 Ann), group or private, the group id or receive id (1:
    // Hana's user id), its title and who shows it.
    const std::tuple<int, bool, std::int32_t, const char*, Names> rows[] = {
        // The attendees' chat is kept from host and presenter, not from panelists.
        {3, kGroup, GROUP_ATTENDEES, "from Ann to All Attendees", {"Paul", "Ann"}},
        {3, kGroup, GROUP_HOST, "from Ann to Host (privately)", {"Hana", "Ann"}},
        {3, kGroup, GROUP_PRESENTER, "from Ann to Presenter (privately)", {"Pia", "Ann"}},
        {3, kGroup, GROUP_HOST_PRESENTER, "from Ann to Host & Presenter", {"Hana", "Pia", "Ann"}},
        {3, kGroup, GROUP_PANELISTS, "from Ann to All Panelists", all},
        {3, kGroup, GROUP_EVERYONE, "from Ann to All Participants", all},
        // However an attendee came by a copy, panel chat is for the privileged.
        {0, kGroup, GROUP_PANELISTS, "from Hana to All Panelists", panel},
        {0, kGroup, GROUP_HOST_PRESENTER_PANELISTS, "from Hana to Host, Presenter & Panelists",
         panel},
        // No cache: the message's own group id decides; an unknown one only its sender sees.
        {3, kGroup, 99, "", {"Ann"}},
        {3, kPrivate, -1, "from Ann to Host (privately)", {"Hana", "Ann"}},
        {3, kPrivate, -3, "from Ann to Presenter (privately)", {"Pia", "Ann"}},
        {3, kPrivate, -2, "from Ann to Host & Presenter", {"Hana", "Pia", "Ann"}},
        {3, kPrivate, -6, "from Ann to All Attendees", {"Paul", "Ann"}},
        {3, kPrivate, 0, "from Ann to All Participants", all},
        // Between two people nobody else sees it while no history is restored.
        {3, kPrivate, 1, "from Ann to Hana (privately)", {"Hana", "Ann"}},
        {3, kPrivate, -4, "from Ann to  (privately)", {"Ann"}},
    };
    int n = 0;
    for (const auto& [from, privately, toId, title, holders] : rows) {
        const std::string text = "line " + std::to_string(++n);
        const char* name = from == 0 ? "Hana" : "Ann";
        const std::uint32_t to = privately && toId == 1 ? Id(0) : static_cast<std::uint32_t>(toId);
        const auto line = privately ? PrivateLine : GroupLine;
        Deliver(privately, to, line(Id(from), name, to, text), Id(from));
        EXPECT_EQ(room.Holders(std::string(title) + "|" + text), holders) << text;
    }
}

TEST_F(Receiving, ForgedSendersAreDroppedWithAWarningAndSenderZeroIsNotChecked) {
    const std::string inPdu = std::to_string(Id(3));
    for (const std::uint32_t sender : {Id(2), 0u, Id(3)}) {
        const bool forged = sender == Id(2);
        const std::string said = std::to_string(sender);
        const std::size_t before = ChatRoom::Transcript(*room.members[0]).size();
        TraceCapture capture;
        Deliver(false, GROUP_EVERYONE, GroupLine(Id(3), "Ann", 15, "g" + said), sender);
        Deliver(true, 0, PrivateLine(Id(3), "Ann", 0, "p" + said), sender);
        // What a retrieval delivers is checked the same way, with its own text.
        Deliver(false, GROUP_EVERYONE, GroupLine(Id(3), "Ann", 15, "r" + said), sender,
                CACHE_REPLY_LAST);
        EXPECT_EQ(ChatRoom::Transcript(*room.members[0]).size() - before, forged ? 0u : 3u);
        const std::string ids = "senderId:" + said + ", senderId in PDU:" + inPdu;
        EXPECT_EQ(capture.Has(TraceLevel::Warn,
                              "CChatClient::SharedDataReceivedEx,CACHE_APPEND or CACHE_SET,Detect "
                              "faked group message, " +
                                  ids),
                  forged);
        EXPECT_EQ(
            capture.Has(TraceLevel::Warn,
                        "CChatClient::ApeDataIndication,Detect faked private message, " + ids),
            forged);
        EXPECT_EQ(capture.Has(TraceLevel::Warn,
                              "CChatClient::SharedDataReceivedEx,Detect faked group message, "
                              "senderId:" +
                                  said + ", PUD senderId:" + inPdu),
                  forged);
    }
}

TEST_F(Receiving, CacheItemsThatAreNoChatLineAreTakenQuietlyOrDropped) {
    Member& hana = *room.members[0];
    const std::uint32_t cache = hana.engine.GetCacheHandleFormGroupId(GROUP_EVERYONE);
    CGroupInfoPDU info;
    info.SetGroupHandle(cache);
    info.SetGroupName("All Participants");
    info.GenerateXMLPDU();
    // A group's description is consumed; what does not parse is neither shown nor copied; an
    // item larger than any chat document is not even read.
    const std::string huge(3 * 1024 * 1024, 'x');
    for (const std::string& bytes :
         {info.ToWireText(), std::string("<chat ver=\"1.0\"><mtype>3"), huge}) {
        std::uint32_t mem = 0, size = static_cast<std::uint32_t>(bytes.size());
        hana.client->AllocMemHandle(size, &mem);
        hana.client->WriteMemHandle(mem, 0, bytes.data(), &size);
        TraceCapture capture;
        EXPECT_EQ(hana.engine.SharedDataReceivedEx(hana.client->ApeHandle(), 3, cache, mem, 0,
                                                   CACHE_APPEND, 0, 0, 0),
                  bytes == info.ToWireText() ? 1 : 0);
        EXPECT_TRUE(ChatRoom::Transcript(hana).empty());
        for (const std::string& text : capture.Texts())
            EXPECT_EQ(text.find("fake"), std::string::npos);
        EXPECT_EQ(capture.Has(TraceLevel::Warn,
                              "CChatClient::SharedDataReceivedEx, item of 3145728 bytes dropped"),
                  bytes == huge);
    }
    // The string helper the status cache and the recovery read with refuses it as well.
    std::uint32_t mem = 0;
    ASSERT_EQ(hana.client->AllocMemHandle(huge.size(), &mem), 0);
    std::string out;
    EXPECT_FALSE(hana.engine.AllocStringForMemoryHandle(mem, out));
}

TEST(CustomerCache, ReceivedAndQMSentLinesAreCopiedOnlyWhenTheyWereShownOrSent) {
    // A customer id short enough to read like a group id still names the customer cache.
    ChatRoom room(1, FEATURE_QM_MODE);
    room.beforeStart = [](CChatClient& engine) {
        engine.SetConfig(3,
                         "<chat ver=\"1.0\"><mtype>11</mtype><customerid>555</customerid></chat>");
    };
    Member& hana = room.Join({"Hana", kHost, ROLE_HOST});
    Member& ann = room.Join({"Ann", kAttendee, 0});
    room.Join({"Cy", kAttendee + 1, 0});
    room.SetHostAndPresenter(kHost, 0);
    // Under QM rules the host is reached through its role entry, a group; the private lines
    // go to another attendee.
    ann.client->FailNext(ArmOperation::ApeSendData, 9);
    room.Say(ann, "refused", -1, kAttendee + 1);
    room.Say(ann, "to all", GROUP_EVERYONE);
    room.Say(ann, "to you", -1, kAttendee + 1);
    ArmRecorder copies(hana.client);
    hana.client->ApeRequestSharedDataEx(hana.client->ApeHandle(),
                                        hana.engine.CustomerCacheHandle().handle_value, 0,
                                        CACHE_REQUEST_RETRIEVE, 255, &copies);
    room.Run();
    Names texts;
    for (const ArmEvent& item : copies.Named("SharedDataReceivedEx")) {
        const std::string text(item.data.begin(), item.data.end());
        const std::size_t at = text.find("<message><![CDATA[");
        if (at == std::string::npos) continue;  // the cache's initial set
        texts.push_back(text.substr(at + 18, text.find("]]>", at) - at - 18) +
                        (text.find("<GroupCacheId>") != std::string::npos ? " #" : ""));
    }
    // Every receiver copies the group line with its cache id; the private line is copied by its
    // sender (QM) and its receiver; the refused one by nobody.
    std::sort(texts.begin(), texts.end());
    EXPECT_EQ(texts, (Names{"to all #", "to all #", "to all #", "to you", "to you"}));
}

std::string Stamp(const DateTimeRec& t) {
    char text[64];
    std::snprintf(text, sizeof text, "%04d-%02d-%02d %02d:%02d:%02d/%d", t.year, t.month, t.day,
                  t.hour, t.minute, t.second, t.valid);
    return text;
}

TEST(Showing, ALineGoesToWindowTranscriptAndHostWithTheClocksTime) {
    HostRecorder host;
    ChatRoom room(3);
    Member& hana = room.Join({"Hana", kHost, ROLE_HOST}, &host);
    Member& ann = room.Join({"Ann", kAttendee, 0});
    Member& paul = room.Join({"Paul", kPanelist, ROLE_PANELIST});
    room.SetHostAndPresenter(kHost, kPresenter);
    // A stamp one second before the new year, whatever the clock shows now.
    std::int64_t eve = 0;
    ASSERT_TRUE(UnixSecondsFromCalendar({2021, 12, 31, 23, 59, 59, true}, &eve));
    room.loop.SetCalendarOrigin(CalendarFromUnixSeconds(eve - static_cast<int>(room.loop.Now())));
    hana.window->Clear();
    host.events.clear();

    const std::uint32_t annId = ann.client->UserId();
    hana.client->InjectPrivateData(annId, PrivateLine(annId, "Ann", hana.client->UserId(), "hi"));
    room.Run();
    const std::vector<RecordedCommand>& shown = hana.window->Commands();
    ASSERT_GE(shown.size(), 2u);
    EXPECT_EQ(shown[0].name + " " + shown[0].text, "msg_ShowTitle from Ann to Hana (privately):\r");
    EXPECT_EQ(shown[1].name + " " + shown[1].text, "msg_ShowText hi");
    EXPECT_EQ(std::string(hana.engine.ChatContent().GetLineAtIndex(0)),
              "from Ann to Hana (privately):\r\thi");
    EXPECT_EQ(Stamp(hana.engine.ChatContent().GetTimeAt(0)), "2021-12-31 23:59:59/1");
    EXPECT_EQ(host.events, (Names{"Ann: hi @104", "shown", "content 1", "modified 1"}));
    // The host answers the one who wrote to it: the sender is picked as a recent partner.
    EXPECT_TRUE(hana.engine.IsUserSelectedUser(kAttendee));

    // A new line carries the new time.
    room.loop.AdvanceBy(1.0);
    room.Say(paul, "later", GROUP_EVERYONE);
    EXPECT_EQ(ChatRoom::Transcript(hana).back(), "from Paul to All Participants|later");
    EXPECT_EQ(Stamp(hana.engine.ChatContent().GetTimeAt(1)), "2022-01-01 00:00:00/1");
    // A panelist answers group chat the same way; an attendee does not.
    room.Say(hana, "to all", GROUP_EVERYONE);
    EXPECT_TRUE(paul.engine.IsUserSelectedUser(kHost));
    EXPECT_FALSE(ann.engine.IsUserSelectedUser(kHost));
}

TEST(Showing, TheSoundModeDecidesWhichLinesPlayTheChosenFile) {
    // Each row: the sound mode, the panel status, the file and how many of three lines play.
    const std::tuple<PlaySoundMode, std::uint32_t, const char*, std::size_t> rows[] = {
        {0, 1, "/s", 0}, {1, 0, "/s", 0}, {1, 1, "/s", 3},
        {2, 0, "/s", 1}, {3, 0, "/s", 3}, {3, 1, "", 0}};
    for (const auto& [mode, panel, file, plays] : rows) {
        Names played;
        SetSoundPlayer([&played](const char* path) { played.push_back(path); });
        CChatClient engine;
        engine.SetSoundIncomingChat(mode);
        FSRef sound{};
        std::snprintf(sound.path, sizeof sound.path, "%s", file);
        engine.SetSoundFSSpec(sound);
        engine.SetPanelStatus(panel);
        for (int i = 0; i < 3; ++i)
            engine.PlaySoundIfNeed();
        EXPECT_EQ(played, Names(plays, file)) << mode << "/" << panel << file;
    }
    SetSoundPlayer(nullptr);
}

// A title's tag word is in the host's language, like the title around it.
TEST_F(GermanHost, ATitleCarriesTheSendersTagWordTranslated) {
    menutest::MenuHarness h({1, false, 1});
    const menutest::Person hank{300, "Hank", 0, 1};
    h.Enroll({hank});
    const std::vector<std::uint8_t> line =
        PrivateLine(hank.user(), "Hank", menutest::kMyUser, "hallo");
    h.engine.ApeDataIndication(1, hank.user(), 0, 0, line.data(), line.size());
    EXPECT_EQ(std::string(h.engine.ChatContent().GetLineAtIndex(0)),
              "von Hank (intern) an me (privat):\r\thallo");
}

}  // namespace
