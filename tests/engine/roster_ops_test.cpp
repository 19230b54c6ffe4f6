// The engine's roster and group operations: own roles and enrolment, the default groups of each
// meeting type, host-added groups and the menu entries they bring.
#include <gtest/gtest.h>

#include <string>
#include <tuple>
#include <vector>

#include "tests/engine/menu_harness.h"
#include "tests/support/trace_capture.h"

using namespace menutest;

namespace {

constexpr const char* kEnrollTrace = "Enter CChatClient::Enroll";

// Groups as "type:id:name" ("-" for no name), in list order, joined with "|".
std::string Groups(const CUsersGroupList& list) {
    std::vector<std::string> rows;
    for (std::int32_t i = 0; i < list.GetGroupsCount(); ++i) {
        const CUsersGroup* g = list.GetGroupByIndex(i);
        rows.push_back(std::to_string(g->GetGroupType()) + ":" + std::to_string(g->GetGroupId()) +
                       ":" + (g->GetGrpName() ? g->GetGrpName() : "-"));
    }
    return Join(rows);
}

// Menu entries as "title/group id", separators as "---", joined with "|".
std::string Entries(const MenuStatusList& menu) {
    std::vector<std::string> entries;
    for (const MenuStatus& e : menu)
        entries.push_back(e.bSeparator ? "---" : e.strTitle + "/" + std::to_string(e.nGroupID));
    return Join(entries);
}

}  // namespace

TEST(RosterOps, DefaultGroupsByMeetingTypeAndQMMode) {
    // Each case: meeting type, features; the group list and the menu.
    const std::tuple<std::int32_t, std::uint32_t, const char*, const char*> cases[] = {
        {3, 0,
         "1:1:Host|1:2:Presenter|1:3:Host & Presenter|2:0:-|1:8:All Attendees|1:4:All "
         "Panelists|2:0:-|1:15:All Participants|2:0:-|1:16:Select an Attendee...",
         "Host/1|Presenter/2|Host & Presenter/3|---|All Panelists/4"},
        {1, 0, "", ""},
        {1, FEATURE_QM_MODE, "1:15:Everyone", "Everyone/15"},
        {2, FEATURE_QM_MODE, "", ""},
    };
    for (const auto& [meetingType, features, groups, menu] : cases) {
        SCOPED_TRACE(std::to_string(meetingType) + (features ? " QM" : ""));
        MenuHarness h({meetingType, false, 0, features});
        EXPECT_EQ(Groups(h.engine.GroupList()), groups);
        EXPECT_EQ(Entries(h.engine.Menu()), menu);
    }
}

TEST(RosterOps, MatchingRoleGroupIsUpdatedButGetsASecondMenuEntry) {
    MenuHarness h({3});
    TraceCapture capture;
    AddGroup(h.engine, 1, 1, 1, "HOST");
    EXPECT_TRUE(capture.Has("/---- CMainChatDlg::AddRoleGroup Existed Group ----/"));
    EXPECT_EQ(h.engine.GroupList().GetGroupsCount(), 10);  // no new group
    EXPECT_STREQ(h.engine.GroupList().GetGroupByIndex(0)->GetGrpName(), "HOST");
    EXPECT_EQ(Entries(h.engine.Menu()),
              "Host/1|HOST/1|Presenter/2|Host & Presenter/3|---|All Panelists/4");

    // A separator is never matched: it always becomes a new group.
    capture.Clear();
    AddGroup(h.engine, 3, 2, 0, nullptr, 0);
    EXPECT_TRUE(capture.Has("/---- CMainChatDlg::AddRoleGroup New Group ----/"));
    EXPECT_TRUE(capture.Has("/==== CMainChatDlg::AddRoleGroup exit: nInsertIndex = 3 ====/"));
    EXPECT_EQ(h.engine.GroupList().GetGroupsCount(), 11);
    EXPECT_EQ(h.engine.GroupList().GetGroupByIndex(3)->GetGroupType(), 2u);
}

TEST(RosterOps, HostGroupsWithOddValuesStillLandInListAndMenu) {
    MenuHarness h({1});
    h.Commands();
    TraceCapture capture;
    h.engine.AddGroup(nullptr, 1);  // nothing, not even a rebuild (counted below)
    EXPECT_TRUE(capture.Lines().empty());

    AddGroup(h.engine, 0, 3, 30, nullptr);  // id group without a name
    EXPECT_TRUE(capture.Has(TraceLevel::Error,
                            "CChatClient::AddGroup( ChatGroupInfo* pChatGroupInfo), "
                            "pChatGroupInfo->cszGroupName == NULL"));
    EXPECT_TRUE(
        capture.Has("Enter CChatClient::AddGroup, pChatGroupInfo->dwGroupType = 3, "
                    "pChatGroupInfo->dwGroupId = 30, pChatGroupInfo->cszGroupName = "));
    // An index at the top of the range, or past the end, appends entry and group alike.
    AddGroup(h.engine, 0xFFFFFFFFu, 1, 8, "All Attendees");
    AddGroup(h.engine, 40, 1, 4, "All Panelists");
    AddGroup(h.engine, 0, 9, 99, "unknown type");
    EXPECT_EQ(Entries(h.engine.Menu()), "unknown type/99|/30|All Attendees/8|All Panelists/4");
    EXPECT_EQ(Groups(h.engine.GroupList()), "3:30:-|1:8:All Attendees|1:4:All Panelists");
    // Every add, even one the list refuses, has the window rebuild its menu.
    ASSERT_EQ(h.window->Ids(), std::vector<int>(4, msg_RebuildMenu));
    EXPECT_EQ(Entries(h.window->Commands()[3].menu), Entries(h.engine.Menu()));
}

TEST(RosterOps, GroupSchemesPlaceGroupsAndMarkThemForTheRecording) {
    // Each case: features; the group list and each group's mark, in list order.
    const std::tuple<const char*, std::uint32_t, const char*, const char*> cases[] = {
        // At the index; an index past the end appends.
        {"first scheme", 0, "1:1:HOST|1:8:All Attendees|3:30:ids", "110"},
        // After the group whose sequence number is the index; an unknown one goes to the front.
        {"second scheme", FEATURE_GROUP_SCHEME2, "3:30:ids|1:1:HOST|1:8:All Attendees", "000"},
    };
    for (const auto& [scheme, features, groups, marks] : cases) {
        SCOPED_TRACE(scheme);
        CChatClient other;
        other.SelectFeature(features, 0, 0, 0, 0, nullptr);
        other.SetNBRStatus(0, 1, 0);  // recorded: new role groups owe their cache a description
        AddGroup(other, 0, 1, 1, "Host", 0);
        AddGroup(other, 1, 1, 8, "All Attendees", 0);
        AddGroup(other, 7, 3, 30, "ids", 0);
        AddGroup(other, 2, 1, 1, "HOST", 0);  // matches the host group, which is updated
        EXPECT_EQ(Groups(other.GroupList()), groups);
        std::string sendGroupInfo;
        for (std::int32_t i = 0; i < other.GroupList().GetGroupsCount(); ++i)
            sendGroupInfo +=
                std::to_string(other.GroupList().GetGroupByIndex(i)->GetNeedSendGroupInfo());
        EXPECT_EQ(sendGroupInfo, marks);
    }
}

TEST(RosterOps, OwnRolesGainThePanelistBitOutsideMeetingTypeOne) {
    // Each case: meeting type, the roles given and the roles stored.
    const std::tuple<std::int32_t, std::uint32_t, std::uint32_t> cases[] = {
        {3, ROLE_PRESENTER, 6}, {3, ROLE_HOST, 5},      {3, 0, 0}, {3, ROLE_PANELIST, 4},
        {2, ROLE_HOST, 5},      {1, ROLE_PRESENTER, 2}, {1, 3, 3}};
    for (const auto& [meetingType, roster, stored] : cases) {
        SCOPED_TRACE(std::to_string(meetingType) + "/" + std::to_string(roster));
        CChatClient other;
        other.SetMeetingType(meetingType);
        EXPECT_EQ(other.SetRosters(roster, 0), 0);  // not enrolled yet
        EXPECT_EQ(other.GetMyRosters(), stored);
        EXPECT_EQ(other.SetRosters(roster, 1), 1);
        EXPECT_EQ(other.GetMyRosters(), stored);
    }
}

TEST(RosterOps, AfterEnrolmentOnlyChangedRolesEnrollAgain) {
    MenuHarness h({3});
    EXPECT_EQ(h.engine.SetRosters(ROLE_PRESENTER, 0), 0);
    EXPECT_TRUE(h.engine.IsRostersPending());
    ARMSessionResource resource{};  // the service grants the enrolment
    resource.dwValue = 9;
    h.engine.ApeEnrollConfirm(1, 0, 1, &resource);

    TraceCapture capture;
    EXPECT_EQ(h.engine.SetRosters(ROLE_PRESENTER, 0), 1);
    EXPECT_FALSE(h.engine.IsRostersPending());
    EXPECT_FALSE(capture.Has(kEnrollTrace));
    EXPECT_TRUE(capture.Has("Enter CChatClient::SubscribeAllGroupCaches"));

    h.engine.SetRosters(ROLE_HOST, 0);
    EXPECT_EQ(h.engine.GetMyRosters(), 5u);
    EXPECT_TRUE(capture.Has(kEnrollTrace));

    capture.Clear();
    EXPECT_EQ(h.engine.SetRosters(ROLE_PANELIST, 1), 1);
    EXPECT_FALSE(capture.Has(kEnrollTrace));
    EXPECT_FALSE(capture.Has("Enter CChatClient::SubscribeAllGroupCaches"));
}

TEST(RosterOps, RosterCountsRoleChangesBeforeHostAndPickedAttendees) {
    MenuHarness h({3});
    EXPECT_TRUE(h.engine.IsBeforeHost());
    h.engine.SetRosters(ROLE_HOST, 1);
    EXPECT_FALSE(h.engine.IsBeforeHost());
    h.engine.SetRosters(0, 1);
    h.Enroll({{201, "ann", 0},
              {202, "bob", ROLE_PANELIST},
              {203, "cy", ROLE_HOST | ROLE_PANELIST},
              {204, "di", ROLE_PRESENTER}});
    ASSERT_EQ(h.engine.UserList().GetCount(), 4u);
    EXPECT_FALSE(h.engine.IsBeforeHost());  // cy is host
    EXPECT_EQ(h.engine.GetPanelistCount(), 3u);

    // A known user id under another node is somebody else (the same node and id is the
    // duplicate arrival the own-session walk skips).
    UserItem moved;
    moved.dwNodeID = 299;
    moved.dwUserID = 1202;
    EXPECT_FALSE(h.engine.IsUserExist(&moved));
    EXPECT_FALSE(h.engine.IsUserExist(nullptr));

    TraceCapture capture;
    EXPECT_EQ(h.engine.SetAttendee(202), 0);
    EXPECT_EQ(h.engine.UserList().GetUserItemFromNodeId(202)->dwRoles, 0u);
    EXPECT_TRUE(capture.Has(kEnrollTrace));
    EXPECT_EQ(h.engine.GetPanelistCount(), 2u);
    capture.Clear();
    EXPECT_EQ(h.engine.SetAttendee(999), -1);
    EXPECT_FALSE(capture.Has(kEnrollTrace));

    // Picked attendees are roster members.
    for (const std::uint32_t node : {201u, 999u, 202u})
        h.engine.AddUserByUserSelected(node);
    h.engine.RemoveUserByUserID(201);
    EXPECT_FALSE(h.engine.IsUserSelectedUser(201));
    EXPECT_TRUE(h.engine.IsUserSelectedUser(202));
    EXPECT_FALSE(h.engine.IsUserSelectedUser(999));
}
