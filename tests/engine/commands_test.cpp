// The host's tuning commands (feature word, recording status, configuration XML, sound) and
// the events the chat window raises, on an engine behind a recording window.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <string>
#include <vector>

#include "engine/chat_client.h"
#include "engine/chat_recovery_mgr.h"
#include "platform/telemetry.h"
#include "tests/engine/menu_harness.h"
#include "tests/support/trace_capture.h"

namespace {

using menutest::MenuHarness;

// Reported telemetry actions, collected while the object lives.
struct TelemetryCapture {
    TelemetryCapture() {
        SetTelemetrySink([this](int id) { actions.push_back(id); });
    }
    ~TelemetryCapture() { SetTelemetrySink(nullptr); }
    std::vector<int> actions;
};

std::vector<int> SelectedIndexes(const CChatClient& engine) {
    std::vector<int> selected;
    for (std::size_t i = 0; i < engine.Menu().size(); ++i)
        if (engine.Menu()[i].bSelected) selected.push_back(static_cast<int>(i));
    return selected;
}

// A menu with two group entries around a separator.
void SeedGroups(MenuHarness& h) {
    h.Seed({{"All Participants", GROUP_EVERYONE}, {"---", 0}, {"All Attendees", GROUP_ATTENDEES}});
}

TEST(Commands, SelectionChangedMarksExactlyTheReportedEntry) {
    MenuHarness h;
    SeedGroups(h);
    const int everyone = h.engine.GetIndexOfMenuByGroup(GROUP_EVERYONE);
    const int attendees = h.engine.GetIndexOfMenuByGroup(GROUP_ATTENDEES);
    const int size = static_cast<int>(h.engine.Menu().size());

    const struct {
        std::int32_t index;
        std::vector<int> selected;
        std::vector<int> telemetry;
    } cases[] = {
        {everyone, {everyone}, {902}},
        {attendees, {attendees}, {}},
        // While a selected user has left the window reports -1; beyond the menu nothing
        // is selected either, and the previous choice is gone.
        {-1, {}, {}},
        {size, {}, {}},
    };
    for (const auto& c : cases) {
        std::int32_t before = c.index == attendees ? everyone : attendees;
        ASSERT_EQ(h.engine.HandleUIMessage(msg_SelectionChanged, &before, nullptr), 0);
        TelemetryCapture telemetry;
        std::int32_t index = c.index;
        EXPECT_EQ(h.engine.HandleUIMessage(msg_SelectionChanged, &index, nullptr), 0) << c.index;
        EXPECT_EQ(SelectedIndexes(h.engine), c.selected) << c.index;
        EXPECT_EQ(telemetry.actions, c.telemetry) << c.index;
    }
}

TEST(Commands, ShowAttendeeListNamesOnlyPlainAttendees) {
    MenuHarness h({3});
    h.Enroll(
        {{201, "ann", 0}, {202, "bob", ROLE_PANELIST}, {203, "cy", 0}, {204, "dee", ROLE_HOST}});
    h.Commands();
    std::int32_t created = 1;
    EXPECT_EQ(h.engine.HandleUIMessage(msg_ShowAttendeeList, &created, nullptr), 0);
    std::vector<std::string> listed;
    for (const RecordedCommand& c : h.window->Commands()) {
        ASSERT_EQ(c.id, msg_AddAttendee);
        listed.push_back(c.attendee.strName + "@" + std::to_string(c.attendee.dwNodeID));
    }
    EXPECT_EQ(listed, (std::vector<std::string>{"ann@201", "cy@203"}));
}

TEST(Commands, AttendeeSelectedWithoutChoiceReselectsTheSelectedEntry) {
    MenuHarness h;
    SeedGroups(h);
    std::int32_t attendees = h.engine.GetIndexOfMenuByGroup(GROUP_ATTENDEES);
    h.engine.HandleUIMessage(msg_SelectionChanged, &attendees, nullptr);
    h.Commands();
    std::uint32_t none = 0;
    EXPECT_EQ(h.engine.HandleUIMessage(msg_AttendeeSelected, &none, nullptr), 1);
    EXPECT_EQ(h.Commands(), std::vector<std::string>{"select " + std::to_string(attendees)});

    // Nothing selected: nothing to re-send.
    std::int32_t outside = -1;
    h.engine.HandleUIMessage(msg_SelectionChanged, &outside, nullptr);
    h.Commands();
    EXPECT_EQ(h.engine.HandleUIMessage(msg_AttendeeSelected, &none, nullptr), 1);
    EXPECT_TRUE(h.Commands().empty());
}

TEST(Commands, AttendeeSelectedGivesThePickedUserAnEntryOutsidePanelMeetings) {
    // With the attendee selector an attendee gets an entry only when picked.
    MenuHarness h({1, true});
    h.Enroll({{201, "ann", 0}});
    ASSERT_EQ(h.engine.GetIndexOfMenuByNodeID(201), -1);
    std::uint32_t picked = 201;
    EXPECT_EQ(h.engine.HandleUIMessage(msg_AttendeeSelected, &picked, nullptr), 1);
    EXPECT_GE(h.engine.GetIndexOfMenuByNodeID(201), 0);
    // Nobody outside the roster gets an entry.
    std::uint32_t stranger = 999;
    EXPECT_EQ(h.engine.HandleUIMessage(msg_AttendeeSelected, &stranger, nullptr), 1);
    EXPECT_EQ(h.engine.GetIndexOfMenuByNodeID(999), -1);
}

TEST(Commands, FeatureWordSetsModesAndTellsTheRecoveryManager) {
    const struct {
        std::uint32_t features;
        bool meetingTypeAgain;
        bool noSendToItems;
        bool qm;
        bool groupRecovery;
    } cases[] = {
        {0, false, false, false, false},
        {FEATURE_QM_MODE | FEATURE_GROUP_MSG_RECOVERY, true, false, true, true},
        {FEATURE_EVERYONE_ONLY, false, true, false, false},
        {FEATURE_SAVE_FOR_REPORT | FEATURE_ALWAYS_RECORD, false, false, false, false},
    };
    for (const auto& c : cases) {
        MenuHarness h({1});
        h.Commands();
        TraceCapture capture;
        EXPECT_EQ(h.engine.SelectFeature(c.features, 0, 0, 0, 0, nullptr), 0);
        // The meeting type adds its own bit when it runs again.
        EXPECT_EQ(h.engine.Features() & ~FEATURE_GROUPS, c.features);
        EXPECT_EQ(capture.Has("Enter CChatClient::SetMeetingType = 1"), c.meetingTypeAgain)
            << c.features;
        EXPECT_EQ(h.engine.GetHideSendToCombox(), c.noSendToItems) << c.features;
        const std::vector<std::string> commands = h.Commands();
        EXPECT_EQ(std::count(commands.begin(), commands.end(), "msg_NoSendToItems"),
                  c.noSendToItems ? 1 : 0)
            << c.features;
        ASSERT_NE(h.engine.RecoveryMgr(), nullptr);
        EXPECT_EQ(h.engine.RecoveryMgr()->GetQMFlag(), c.qm) << c.features;
        EXPECT_EQ(h.engine.RecoveryMgr()->GetGroupMsgRecovery(), c.groupRecovery) << c.features;
        // Leaving QM mode does not run the meeting type again.
        TraceCapture leaving;
        h.engine.SelectFeature(0, 0, 0, 0, 0, nullptr);
        EXPECT_FALSE(leaving.Has("Enter CChatClient::SetMeetingType = 1")) << c.features;
        EXPECT_FALSE(h.engine.RecoveryMgr()->GetQMFlag()) << c.features;
    }
}

TEST(Commands, RecordingStatusesZeroAndThreeOweEveryGroupItsDescription) {
    for (const std::uint32_t status : {0u, 1u, 2u, 3u, 4u}) {
        MenuHarness h({3});
        h.engine.SetAllCacheSendGroupInfoStatus(0);
        EXPECT_EQ(h.engine.SetNBRStatus(status, 5, 6), 0);
        const bool marked = status == 0 || status == 3;
        for (const std::uint32_t group :
             {GROUP_HOST, GROUP_PRESENTER, GROUP_ATTENDEES, GROUP_EVERYONE}) {
            EXPECT_EQ(h.engine.GetNeedSendGroupInfoStatus(group), marked)
                << "status " << status << ", group " << group;
        }
    }
}

// The customer id and the FAQ fields as the next roster record carries them.
std::string RosterRecord(CChatClient& engine) {
    CRosterInfoPDU pdu;
    engine.MakeRosterInfoPDU(&pdu);
    return pdu.ToWireText();
}

TEST(Commands, ConfigurationKindsAndTheirRefusals) {
    const std::string customer =
        "<chat ver=\"1.0\"><mtype>11</mtype><customerid>555</customerid></chat>";
    const std::string faq = "<chat ver=\"1.0\"><mtype>8</mtype><lname>Lee</lname></chat>";
    const struct {
        std::uint32_t type;
        std::string xml;
        std::uint32_t customerId;
        bool lastName;
    } cases[] = {
        {3, customer, 555, false},
        {2, faq, 77, true},
        {3, "<chat ver=\"1.0\"><mtype>11</mtype></chat>", 77, false},
        {3, "not xml", 77, false},
        {3, faq, 77, false},
        {2, customer, 77, false},
        {7, customer, 77, false},
        {7, faq, 77, false},
    };
    for (const auto& c : cases) {
        MenuHarness h({1});
        h.engine.RecoveryMgr()->SetCustomerId(77);
        EXPECT_EQ(h.engine.SetConfig(c.type, c.xml.c_str()), 0);
        EXPECT_EQ(h.engine.RecoveryMgr()->GetCustomerId(), c.customerId) << c.type << c.xml;
        EXPECT_EQ(RosterRecord(h.engine).find("<LName>") != std::string::npos, c.lastName)
            << c.type << c.xml;
    }
}

TEST(Commands, ConfigurationHandlersReportWhetherTheyTookTheText) {
    MenuHarness h({1});
    EXPECT_EQ(h.engine.HandleCustomerIdConfig(
                  "<chat ver=\"1.0\"><mtype>11</mtype><customerid>0</customerid></chat>"),
              1);
    EXPECT_EQ(h.engine.RecoveryMgr()->GetCustomerId(), 0u);
    EXPECT_EQ(h.engine.HandleCustomerIdConfig(nullptr), 0);
    EXPECT_EQ(h.engine.HandleFAQMacroInfoConfig("<chat ver=\"1.0\"><mtype>8</mtype></chat>"), 1);
    EXPECT_EQ(h.engine.HandleFAQMacroInfoConfig("<chat ver=\"1.0\"><mtype>11</mtype></chat>"), 0);
    EXPECT_EQ(h.engine.HandleFAQMacroInfoConfig(nullptr), 0);
    // After the tear-down there is nothing to configure.
    h.engine.Cleanup();
    EXPECT_EQ(h.engine.HandleCustomerIdConfig(
                  "<chat ver=\"1.0\"><mtype>11</mtype><customerid>5</customerid></chat>"),
              0);
    EXPECT_EQ(h.engine.HandleFAQMacroInfoConfig("<chat ver=\"1.0\"><mtype>8</mtype></chat>"), 0);
    EXPECT_EQ(h.engine.SetConfig(3, "<chat ver=\"1.0\"><mtype>11</mtype></chat>"), 0);
}

TEST(Commands, WithoutAWarningThePickerClosesAtOnce) {
    MenuHarness h({3});
    h.Commands();
    h.engine.CloseSeltAttDlg();
    EXPECT_EQ(h.Commands(),
              (std::vector<std::string>{"msg_CloseAttendeeWarning", "msg_CloseAttendeeDialog"}));
    h.engine.CloseAllDlg();
    EXPECT_EQ(h.Commands(), std::vector<std::string>{"msg_CloseAllDialogs"});
}

}  // namespace
