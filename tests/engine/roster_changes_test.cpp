// Roster change processing: hand-made application-roster reports as the conference service
// lays them out, including enroll data that no honest participant would send.
#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <tuple>
#include <vector>

#include "pdu/xml_limits.h"
#include "tests/engine/chat_room.h"
#include "tests/engine/menu_harness.h"
#include "tests/support/german_host.h"
#include "tests/support/trace_capture.h"

using namespace menutest;

namespace {

constexpr const char* kPrivilegeReapplied =
    "Enter CChatClient::OnPrivilegeChanged , in_dwPrivilege = 65615";

}  // namespace

TEST(ApeRosterChanged, WalksOnlyRecordsOfTheOwnSessionAndSkipsKnownUsersAndTheRecorder) {
    MenuHarness h({1});
    h.Seed("All Attendees 8");
    h.Commands();
    RosterReport report;
    report.Record(kSession + 1, {EntryFor({201, "other"})})
        .Record(kSession, {EntryFor({202, "bob"}), EntryFor({203, "amy"})})
        .Record(kSession, {EntryFor({204, "cy"}), EntryFor({202, "bob"}),
                           EntryFor({205, "KVO_SSR_987_RECORDER-654"}),
                           EntryFor({206, "Kvo_Ssr_987_Recorder-654"})});
    EXPECT_EQ(h.engine.ApeRosterChanged(1, 0, 3, 0, 0, report.Records()), 0);
    EXPECT_EQ(h.engine.UserList().GetCount(), 3u);  // bob, amy and cy
    EXPECT_EQ(h.Menu(), "All Attendees|amy|bob|cy");
    EXPECT_EQ(h.Seen(), "insert -1 bob|insert 1 amy|insert -1 cy");
    EXPECT_EQ(h.engine.ApeRosterChanged(1, 0, 1, 1, 1, nullptr), 0);
}

TEST(ApeRosterChanged, AddsThenDeletesThenModifiesInOneCallback) {
    MenuHarness h({1});
    h.Seed("All Attendees 8");
    h.Enroll({{201, "ann"}});
    h.Commands();
    RosterReport report;
    report.Record(kSession, {EntryFor({202, "bob"})})
        .Record(kSession, {EntryFor({999, "ghost"}), EntryFor({201, "ann"})})  // ghost: unknown
        .Record(kSession, {EntryFor({202, "bob", ROLE_PANELIST})});
    h.engine.ApeRosterChanged(1, 0, 1, 1, 1, report.Records());
    EXPECT_EQ(h.engine.UserList().GetCount(), 1u);
    const UserItem* bob = h.engine.UserList().GetUserItemFromNodeId(202);
    ASSERT_NE(bob, nullptr);
    EXPECT_EQ(bob->dwRoles, ROLE_PANELIST);
    // bob's new panelist role re-applies the privilege: his entry is re-created as a panelist's.
    EXPECT_EQ(h.Menu(), "*All Attendees|bob");
    EXPECT_EQ(h.Seen(),
              "insert -1 bob|remove 1|remove 1|insert -1 bob|remove 1|insert -1 bob|select "
              "0|msg_EnableUserList|input 1|msg_CloseAttendeeWarning|msg_CloseAttendeeDialog");
    EXPECT_TRUE(h.engine.Menu()[1].bPanelist);
}

TEST(ProcessAddEnrollInfo, PrivateChatPrivilegeOrHostGivesEntries) {
    // Each case: meeting type, privilege word, local participant hosts; the menu.
    const std::tuple<const char*, std::int32_t, std::uint32_t, bool, const char*> cases[] = {
        {"type 1 attendee without private chat", 1, 0x1, false, "All Attendees"},
        {"type 1 attendee with private chat", 1, 0x8, false, "All Attendees|ann"},
        {"type 1 host whatever the privilege", 1, 0, true, "All Attendees|ann"},
        {"type 2 host whatever the privilege", 2, 0, true, "All Attendees|ann"},
    };
    for (const auto& [scenario, meetingType, privilege, host, menu] : cases) {
        SCOPED_TRACE(scenario);
        MenuHarness h({meetingType});
        if (host) h.engine.OnHostChanged(kMyNode);
        h.engine.OnPrivilegeChanged(privilege, 0);
        h.Seed("All Attendees 8");
        h.Enroll({{201, "ann"}});
        EXPECT_EQ(h.Menu(), menu);
    }
}

TEST(ProcessAddEnrollInfo, OwnRecordReappliesThePrivilege) {
    for (const bool scheme2 : {false, true}) {
        SCOPED_TRACE(scheme2);
        MenuHarness h({1, false, 0, scheme2 ? FEATURE_GROUP_SCHEME2 : 0u});
        TraceCapture trace;
        h.Enroll({{kMyNode, "me"}});
        EXPECT_EQ(trace.Has(kPrivilegeReapplied), !scheme2);
        EXPECT_EQ(h.engine.GetIndexOfMenuByNodeID(kMyNode), -1);
    }
}

TEST(ProcessAddEnrollInfo, QMHostReturnsToEveryoneForEachArrivalAfterItsOwnRecord) {
    const Person own{kMyNode, "me", ROLE_HOST};
    const Person bob{201, "bob"};
    // The own record re-applies the privilege: everyone stays selected, and an attendee's entry
    // is re-created below the separator that opens the participant section.
    const std::string reapplied =
        "|select 0|msg_EnableUserList|input 1|select 0|msg_CloseAttendeeWarning|"
        "msg_CloseAttendeeDialog";
    const std::string bobAgain = "|remove 2|remove 1|insert -1 ---|insert -1 bob";
    // Each case: the people of the report, in order, and the commands.
    const std::tuple<const char*, std::vector<Person>, std::string> cases[] = {
        {"own record alone", {own}, "select+input 0" + reapplied},
        {"an arrival after the own record",
         {own, bob},
         "select+input 0|insert -1 ---|insert -1 bob|select+input 0" + bobAgain + reapplied},
        {"an arrival before the own record",
         {bob, own},
         "insert -1 ---|insert -1 bob|select+input 0" + bobAgain + reapplied},
    };
    for (const auto& [scenario, people, commands] : cases) {
        SCOPED_TRACE(scenario);
        MenuHarness h({1, false, 0, FEATURE_QM_MODE});
        h.engine.OnHostChanged(kMyNode);
        h.Commands();
        h.Enroll(people);
        EXPECT_EQ(h.Seen(), commands);
        EXPECT_EQ(h.Titles()[0], "*Everyone");
    }
}

TEST(RosterChanges, BeforeHostChangeReappliesThePrivilegeWithForce) {
    // Each case: meeting type, a modify (else an add), the force flags of the re-applications in
    // order, and who is reported.
    const std::tuple<const char*, std::int32_t, bool, const char*, Person> cases[] = {
        {"type 3: the host's arrival ends before-host", 3, false, "1", {300, "hank", ROLE_HOST}},
        {"type 3: an attendee's arrival changes nothing", 3, false, "", {201, "ann"}},
        {"type 1: the host's arrival re-applies nothing", 1, false, "", {300, "hank", ROLE_HOST}},
        {"modify to host", 1, true, "1", {201, "ann", ROLE_HOST}},
        {"modify keeping the before-host state", 1, true, "0", {201, "anne"}},
    };
    for (const auto& [scenario, meetingType, modify, forces, person] : cases) {
        SCOPED_TRACE(scenario);
        MenuHarness h({meetingType, false, 0, FEATURE_QM_MODE});
        if (modify) h.Enroll({{201, "ann"}});
        TraceCapture trace;
        modify ? h.Modify(person) : h.Enroll({person});
        // The QM trace shows the force flag of each re-application.
        EXPECT_EQ(Traced(trace, std::string(kPrivilegeReapplied) + ", bDefault = "), forces);
    }
}

TEST(ProcessAddEnrollInfo, QMPresenterEntryIsRetitled) {
    MenuHarness h({2, false, 0, FEATURE_QM_MODE});
    h.engine.OnPresenterChanged(301);  // brings the role entry, titled once pia is in
    h.Commands();
    h.Enroll({{301, "pia", ROLE_PRESENTER}});
    EXPECT_EQ(h.Seen(), "rename 0 pia (Presenter)");
    EXPECT_EQ(h.Menu(), "pia (Presenter)");
}

// The component's table translates "Host" for a German host.
TEST_F(GermanHost, QMHostEntryTitleIsTranslatedButTheRoleWordIsNot) {
    MenuHarness h({1, false, 1, FEATURE_QM_MODE});
    h.Commands();
    h.engine.OnHostChanged(300);  // the role entry comes with the role, titled once known
    EXPECT_EQ(h.Seen(), "insert -1 Gastgeber");
    h.Enroll({{300, "Hank", ROLE_HOST, 1}});
    EXPECT_EQ(h.Seen(), "rename 1 Hank (Host, internal)");
    EXPECT_EQ(h.Menu(), "Everyone|Hank (Host, internal)");
}

TEST(ProcessAddEnrollInfo, QMPrivateOnlyOpensAndClosesTheUserList) {
    MenuHarness h({2, false, 0, FEATURE_QM_MODE});
    h.engine.OnHostChanged(300);  // once a host is known, private chat alone is allowed
    h.engine.OnPrivilegeChanged(0x8, 0);
    h.Commands();
    h.Enroll({{201, "bob"}});
    EXPECT_EQ(h.Seen(), "insert -1 bob|input 1|msg_EnableUserList");
    h.Leave({201, "bob"});
    EXPECT_EQ(h.Seen(), "remove 0|input 0|msg_DisableUserList");
    EXPECT_EQ(h.engine.UserList().GetCount(), 0u);
}

TEST(ExtractEnrollInfo, HostileEnrollDataCannotHurt) {
    const std::string valid = EnrollBytes({201, "ann", ROLE_PANELIST, 2});
    const auto size = static_cast<std::int32_t>(valid.size());
    const std::string wide(200, 'x');
    std::string accents;
    for (int i = 0; i < 200; ++i)
        accents += "\xC3\xA9";  // 400 bytes of two-byte characters
    // Each case: the result; the name and roles read; the bytes, the length the service gives
    // (-2: the bytes' own) and whether it gives the bytes at all.
    const std::tuple<const char*, int, std::string, std::uint32_t, std::string, std::int32_t, bool>
        cases[] = {
            {"a roster record", 0, "ann", ROLE_PANELIST, valid, -2, true},
            {"not a record", 0, "", 0, "hello", -2, true},
            {"cut short by the given length", 0, "", 0, valid, size - 9, true},
            {"trailing bytes past the given length", 0, "ann", ROLE_PANELIST, valid + "<<garbage",
             size, true},
            {"no data", -1, "", 0, valid, -2, false},
            {"negative length", -1, "", 0, valid, -1, true},
            {"longer than any document: not copied", 0, "", 0, valid,
             static_cast<std::int32_t>(kMaxXmlBytes + 1), true},
            {"control characters", 0, "ev il name ", 0, EnrollBytes({201, "ev\til\x01name\x7f"}),
             -2, true},
            {"a huge name", 0, std::string(255, 'x'), 0, EnrollBytes({201, wide + wide + wide}), -2,
             true},
            {"a huge name of two-byte characters", 0, accents.substr(0, 254), 0,
             EnrollBytes({201, accents}), -2, true},
        };
    for (const auto& [scenario, result, name, roles, bytes, length, withData] : cases) {
        SCOPED_TRACE(scenario);
        MenuHarness h({1});
        RosterReport report;
        report.Record(kSession, {{201, 1201, bytes}});
        ARMApeRoster* records = report.Records();
        if (length != -2) records[0].pUsers[0].nEnrollInfoLen = length;
        if (!withData) records[0].pUsers[0].pEnrollInfo = nullptr;
        UserItem item;
        EXPECT_EQ(h.engine.ExtractEnrollInfoAndReturnLen(0, &item, records), result);
        EXPECT_EQ(item.dwNodeID, 201u);
        EXPECT_EQ(item.dwUserID, 1201u);
        EXPECT_EQ(std::string(item.strName.GetData() ? item.strName.GetData() : ""), name);
        EXPECT_EQ(item.dwRoles, roles);

        h.engine.ApeRosterChanged(1, 0, 1, 0, 0, records);
        EXPECT_EQ(h.engine.UserList().GetCount(), result == 0 ? 1u : 0u);
    }
}

TEST(ProcessDeleteEnrollInfo, ParticipantWithoutANodeIdLeavesTheMenuAsItWas) {
    // A report entry for node 0 comes and goes; entry lookups never match node 0 (separators
    // carry it), so it must not get an entry that could not be taken out again.
    // Each case: features, the host (the local participant picks node 0 in the attendee picker),
    // and the menu.
    const std::tuple<const char*, std::uint32_t, std::uint32_t, const char*> cases[] = {
        {"normal rules", 0, 300, "All Attendees|---|Host"},
        {"QM rules: the role entries come with the roles", FEATURE_QM_MODE, 300,
         "Everyone|Host|Presenter|All Attendees|---|Host"},
        {"picked by the host", 0, kMyNode, "All Attendees|---|Host"},
    };
    for (const auto& [scenario, features, host, menu] : cases) {
        SCOPED_TRACE(scenario);
        MenuHarness h({1, host == kMyNode, 0, features});
        h.engine.OnHostChanged(host);
        h.engine.OnPresenterChanged(301);
        h.Seed("All Attendees 8|---|Host 1");
        h.Commands();
        h.Enroll({{0, "ghost"}});
        if (host == kMyNode) {
            EXPECT_FALSE(h.engine.SelectUserByNodeID(0, false, true));
        }
        EXPECT_EQ(h.engine.UserList().GetCount(), 1u);
        EXPECT_EQ(h.Menu(), menu);
        EXPECT_EQ(h.Seen(), "");
        h.Leave({0, "ghost"});
        EXPECT_EQ(h.engine.UserList().GetCount(), 0u);
        EXPECT_EQ(h.Menu(), menu);
    }
}

TEST(ProcessModifyEnrollInfo, UpdatesTheItemButNotTheTitle) {
    MenuHarness h({1});
    h.Seed("All Attendees 8");
    h.Enroll({{201, "ann"}});
    TraceCapture trace;
    h.Modify({201, "anne", ROLE_PANELIST, 2});
    const UserItem* ann = h.engine.UserList().GetUserItemFromNodeId(201);
    ASSERT_NE(ann, nullptr);
    EXPECT_STREQ(ann->strName.GetData(), "anne");
    EXPECT_EQ(ann->dwRoles, ROLE_PANELIST);
    EXPECT_EQ(ann->dwExternalTag, 2u);
    // The modify keeps the title, but the privilege it re-applies re-creates the entry, now a
    // panelist's, from the roster's name.
    EXPECT_EQ(h.Menu(), "*All Attendees|anne");
    EXPECT_TRUE(trace.Has(kPrivilegeReapplied));

    trace.Clear();
    h.Modify({999, "ghost"});
    EXPECT_FALSE(trace.Has(kPrivilegeReapplied));
}

// Participants on one in-process conference, each an engine with its own service object.
TEST(ConferenceRoster, PrivateChatEntriesFollowArrivalsAndDepartures) {
    chatroom::ChatRoom room(1);
    // The host allows private chat once each participant is in.
    CChatClient& alice = room.Join({"Alice", 7, 0}).engine;
    alice.OnPrivilegeChanged(0x4F, 0);
    CChatClient& bob = room.Join({"Bob", 9, 0}).engine;
    bob.OnPrivilegeChanged(0x4F, 0);
    room.Join({"Carl", 11, 0}).engine.OnPrivilegeChanged(0x4F, 0);
    room.Join({kRecorderName, 13, 0});
    EXPECT_EQ(alice.UserList().GetCount(), 3u);
    EXPECT_EQ(Join(Titles(alice)), "Bob|Carl");
    // The own record's privilege re-application selects the first entry there is.
    EXPECT_EQ(Join(Titles(bob)), "*Alice|Carl");
    EXPECT_EQ(Join(Titles(room.members[2]->engine)), "*Alice|Bob");

    room.members.erase(room.members.begin() + 2);  // Carl leaves
    room.Run();
    EXPECT_EQ(Join(Titles(alice)), "Bob");
    EXPECT_EQ(Join(Titles(bob)), "*Alice");
    EXPECT_EQ(alice.UserList().GetUserItemFromNodeId(11), nullptr);
}
