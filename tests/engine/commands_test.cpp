// The host's tuning commands (feature word, QM and everyone-only modes, recording status,
// configuration XML) and the events the chat window raises, on an engine behind a recording window.
#include <gtest/gtest.h>

#include <algorithm>
#include <tuple>

#include "engine/chat_recovery_mgr.h"
#include "tests/engine/chat_room.h"
#include "tests/engine/menu_harness.h"
#include "tests/support/trace_capture.h"

namespace {

using chatroom::ChatRoom;
using chatroom::Member;
using menutest::MenuHarness;
using Strings = std::vector<std::string>;

std::vector<int> SelectedIndexes(const CChatClient& engine) {
    std::vector<int> selected;
    for (std::size_t i = 0; i < engine.Menu().size(); ++i)
        if (engine.Menu()[i].bSelected) selected.push_back(static_cast<int>(i));
    return selected;
}

TEST(Commands, SelectionChangedMarksExactlyTheReportedEntry) {
    MenuHarness h;
    h.Seed({{"All Participants", GROUP_EVERYONE}, {"---", 0}, {"All Attendees", GROUP_ATTENDEES}});
    const int everyone = h.engine.GetIndexOfMenuByGroup(GROUP_EVERYONE);
    const int attendees = h.engine.GetIndexOfMenuByGroup(GROUP_ATTENDEES);
    const int size = static_cast<int>(h.engine.Menu().size());
    // While a selected user has left the window reports -1; beyond the menu nothing is
    // selected either, and the previous choice is gone.
    // Each report: the index, the entries then selected and the telemetry told.
    const std::tuple<std::int32_t, std::vector<int>, std::vector<int>> cases[] = {
        {everyone, {everyone}, {902}}, {attendees, {attendees}, {}}, {-1, {}, {}}, {size, {}, {}}};
    for (auto [index, selected, actions] : cases) {
        std::int32_t before = index == attendees ? everyone : attendees;
        ASSERT_EQ(h.engine.HandleUIMessage(msg_SelectionChanged, &before, nullptr), 0);
        chatroom::TelemetryCapture telemetry;
        EXPECT_EQ(h.engine.HandleUIMessage(msg_SelectionChanged, &index, nullptr), 0) << index;
        EXPECT_EQ(SelectedIndexes(h.engine), selected) << index;
        EXPECT_EQ(telemetry.actions, actions) << index;
    }
}

TEST(Commands, WindowEventsListPlainAttendeesAndThoseNoWindowSendsChangeNothing) {
    MenuHarness h({3});
    h.Enroll(
        {{201, "ann", 0}, {202, "bob", ROLE_PANELIST}, {203, "cy", 0}, {204, "dee", ROLE_HOST}});
    const Strings titles = h.Titles();
    h.Commands();
    std::int32_t created = 1;
    EXPECT_EQ(h.engine.HandleUIMessage(msg_ShowAttendeeList, &created, nullptr), 0);
    Strings listed;
    for (const RecordedCommand& c : h.window->Commands()) {
        ASSERT_EQ(c.id, msg_AddAttendee);
        listed.push_back(c.attendee.strName + "@" + std::to_string(c.attendee.dwNodeID));
    }
    EXPECT_EQ(listed, (Strings{"ann@201", "cy@203"}));
    h.Commands();
    for (const int message : {0, 2000, 4999, 5004, 6000}) {
        std::int32_t value = 0;
        EXPECT_EQ(h.engine.HandleUIMessage(message, &value, &value), 1) << message;
    }
    EXPECT_EQ(h.Titles(), titles);
    EXPECT_TRUE(h.Commands().empty());
    // Sending with nothing typed asks the window for the text and does nothing more.
    EXPECT_EQ(h.engine.HandleUIMessage(msg_SendChat, nullptr, nullptr), 0);
    EXPECT_EQ(h.Commands(), Strings{"msg_GetInputText"});
}

TEST(Commands, AttendeeSelectedGivesThePickedUserAnEntryOrReselectsTheSelectedOne) {
    // With the attendee selector an attendee gets an entry only when picked.
    MenuHarness h({1, true});
    h.Seed({{"All Participants", GROUP_EVERYONE}, {"---", 0}, {"All Attendees", GROUP_ATTENDEES}});
    h.Enroll({{201, "ann", 0}});
    ASSERT_EQ(h.engine.GetIndexOfMenuByNodeID(201), -1);
    std::int32_t attendees = h.engine.GetIndexOfMenuByGroup(GROUP_ATTENDEES);
    h.engine.HandleUIMessage(msg_SelectionChanged, &attendees, nullptr);
    const auto pick = [&h](std::uint32_t node) {
        h.Commands();
        EXPECT_EQ(h.engine.HandleUIMessage(msg_AttendeeSelected, &node, nullptr), 1) << node;
        return h.Commands();
    };
    // No choice re-sends the selection; a participant who left between the pick and the
    // event gets nothing.
    EXPECT_EQ(pick(0), Strings{"select " + std::to_string(attendees)});
    EXPECT_TRUE(pick(299).empty());
    EXPECT_EQ(h.engine.GetIndexOfMenuByNodeID(299), -1);
    pick(201);
    EXPECT_GE(h.engine.GetIndexOfMenuByNodeID(201), 0);
    // Nothing selected: nothing to re-send.
    std::int32_t outside = -1;
    h.engine.HandleUIMessage(msg_SelectionChanged, &outside, nullptr);
    EXPECT_TRUE(pick(0).empty());
}

TEST(Commands, FeatureWordSetsModesAndTellsTheRecoveryManager) {
    // Each feature word: whether the meeting type runs again, the window is told there are no
    // send-to items, and the recovery manager learns of QM mode and of group recovery.
    const std::tuple<std::uint32_t, bool, bool, bool, bool> cases[] = {
        {0, false, false, false, false},
        {FEATURE_QM_MODE | FEATURE_GROUP_MSG_RECOVERY, true, false, true, true},
        {FEATURE_EVERYONE_ONLY, false, true, false, false},
        {FEATURE_SAVE_FOR_REPORT | FEATURE_ALWAYS_RECORD, false, false, false, false},
    };
    for (const auto& [features, meetingTypeAgain, noSendToItems, qm, groupRecovery] : cases) {
        SCOPED_TRACE(features);
        MenuHarness h({1});
        h.Commands();
        TraceCapture capture;
        EXPECT_EQ(h.engine.SelectFeature(features, 0, 0, 0, 0, nullptr), 0);
        EXPECT_EQ(capture.Has("Enter CChatClient::SetMeetingType = 1"), meetingTypeAgain);
        const Strings commands = h.Commands();
        EXPECT_EQ(std::count(commands.begin(), commands.end(), "msg_NoSendToItems"),
                  noSendToItems ? 1 : 0);
        EXPECT_EQ(h.engine.RecoveryMgr()->GetQMFlag(), qm);
        EXPECT_EQ(h.engine.RecoveryMgr()->GetGroupMsgRecovery(), groupRecovery);
        // Leaving QM mode does not run the meeting type again.
        TraceCapture leaving;
        h.engine.SelectFeature(0, 0, 0, 0, 0, nullptr);
        EXPECT_FALSE(leaving.Has("Enter CChatClient::SetMeetingType = 1"));
        EXPECT_FALSE(h.engine.RecoveryMgr()->GetQMFlag());
    }
}

TEST(Commands, QMModeAddsOnlyTheGroupsItLacksAndNeverTwice) {
    for (const std::int32_t type : {1, 3}) {
        MenuHarness h({type});
        const std::size_t groups = h.engine.GroupList().GetGroupsCount();
        Strings expected = h.Titles();
        for (const std::uint32_t features : {FEATURE_QM_MODE, 0u, FEATURE_QM_MODE})
            h.engine.SelectFeature(features, 0, 0, 0, 0, nullptr);
        // Meeting type 1 gains its everyone group once; type 3 has all it needs.
        if (type == 1) expected.insert(expected.begin(), "Everyone");
        EXPECT_EQ(h.Titles(), expected) << type;
        EXPECT_EQ(static_cast<std::size_t>(h.engine.GroupList().GetGroupsCount()),
                  groups + (type == 1 ? 1 : 0));
    }
}

TEST(Commands, EveryoneOnlyHidesTheListAndSendsToEveryoneWhateverTheWindowReports) {
    // The host sets the mode before the start: the window still learns of it.
    ChatRoom room(3, FEATURE_EVERYONE_ONLY);
    Member& hana = room.Join({"Hana", 101, ROLE_HOST});
    Member& ann = room.Join({"Ann", 104, 0});
    room.SetHostAndPresenter(101, 0);
    const std::vector<int> ids = ann.window->Ids();
    EXPECT_NE(std::find(ids.begin(), ids.end(), msg_NoSendToItems), ids.end());

    ASSERT_TRUE(room.Select(ann, GROUP_EVERYONE));
    ASSERT_NE(ann.engine.GetIndexOfMenuByGroup(GROUP_EVERYONE), 0);  // entry 0 is "Host"
    std::int32_t reported = 0;
    EXPECT_EQ(ann.engine.HandleUIMessage(msg_SelectionChanged, &reported, nullptr), 0);
    ann.window->inputText = "hello";
    EXPECT_EQ(ann.engine.HandleUIMessage(msg_SendChat, nullptr, nullptr), 0);
    room.Run();
    EXPECT_EQ(room.Holders("from Ann to All Participants|hello"), (Strings{"Hana", "Ann"}));

    // A selection made before the mode came is not sent to: the host's menu, rebuilt from the
    // groups, has the everyone entry, and that is where the line goes.
    ASSERT_TRUE(room.Select(hana, GROUP_HOST));
    hana.engine.SelectFeature(FEATURE_EVERYONE_ONLY, 0, 0, 0, 0, nullptr);
    hana.window->inputText = "to host";
    hana.engine.HandleUIMessage(msg_SendChat, nullptr, nullptr);
    room.Run();
    EXPECT_EQ(room.Holders("from Hana to All Participants|to host"), (Strings{"Hana", "Ann"}));
}

TEST(Commands, ConfigurationKindsAndTheirRefusals) {
    const char* customer = "<chat ver=\"1.0\"><mtype>11</mtype><customerid>555</customerid></chat>";
    const char* faq = "<chat ver=\"1.0\"><mtype>8</mtype><lname>Lee</lname></chat>";
    // Each text: its kind, then the customer id (77 before) and whether the FAQ last name
    // reaches the roster record.
    const std::tuple<std::uint32_t, const char*, std::uint32_t, bool> cases[] = {
        {3, customer, 555, false},
        {3, "<chat ver=\"1.0\"><mtype>11</mtype><customerid>0</customerid></chat>", 0, false},
        {2, faq, 77, true},
        {3, "<chat ver=\"1.0\"><mtype>11</mtype></chat>", 77, false},
        {3, "not xml", 77, false},
        {3, nullptr, 77, false},
        {2, nullptr, 77, false},
        {3, faq, 77, false},
        {2, customer, 77, false},
        {7, customer, 77, false},
        {7, faq, 77, false},
    };
    for (const auto& [type, xml, customerId, lastName] : cases) {
        SCOPED_TRACE(std::to_string(type) + (xml ? xml : "null"));
        MenuHarness h({1});
        h.engine.RecoveryMgr()->SetCustomerId(77);
        EXPECT_EQ(h.engine.SetConfig(type, xml), 0);
        EXPECT_EQ(h.engine.RecoveryMgr()->GetCustomerId(), customerId);
        // The FAQ fields as the next roster record carries them.
        CRosterInfoPDU pdu;
        h.engine.MakeRosterInfoPDU(&pdu);
        EXPECT_EQ(pdu.ToWireText().find("<LName>") != std::string::npos, lastName);
    }
    // After the tear-down there is nothing to configure.
    MenuHarness h({1});
    h.engine.Cleanup();
    EXPECT_EQ(h.engine.SetConfig(3, customer), 0);
    EXPECT_EQ(h.engine.SetConfig(2, faq), 0);
}

}  // namespace
