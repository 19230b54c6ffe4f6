// The engine's roster and group operations: own roles and enrolment, the default groups of each
// meeting type, host-added groups and the menu entries they bring.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "api/ui_protocol.h"
#include "engine/chat_client.h"
#include "pdu/roster_info_pdu.h"
#include "platform/virtual_run_loop.h"
#include "tests/support/recording_window.h"
#include "tests/support/trace_capture.h"

namespace {

constexpr std::uint32_t kSession = 55;
constexpr std::uint32_t kMyNode = 100;
constexpr const char* kEnrollTrace = "Enter CChatClient::Enroll";

using Strings = std::vector<std::string>;

// Groups as "type:id:name" ("-" for no name), in list order.
Strings Groups(const CUsersGroupList& list) {
    Strings rows;
    for (std::int32_t i = 0; i < list.GetGroupsCount(); ++i) {
        const CUsersGroup* g = list.GetGroupByIndex(i);
        rows.push_back(std::to_string(g->GetGroupType()) + ":" + std::to_string(g->GetGroupId()) +
                       ":" + (g->GetGrpName() ? g->GetGrpName() : "-"));
    }
    return rows;
}

// Menu entries as "title/group id", separators as "---".
Strings Entries(const MenuStatusList& menu) {
    Strings entries;
    for (const MenuStatus& e : menu) {
        entries.push_back(e.bSeparator ? "---" : e.strTitle + "/" + std::to_string(e.nGroupID));
    }
    return entries;
}

class RosterOps : public ::testing::Test {
protected:
    void SetUp() override { RecordingWindow::Install(); }
    void TearDown() override { RecordingWindow::Uninstall(); }

    // Starts the engine without a conference service.
    void Start(std::int32_t meetingType) {
        _tagChatData data{};
        data.hParentView = &m_parentView;
        data.dwSessionID = kSession;
        data.lpszUserName = "Me";
        data.dwNodeID = kMyNode;
        data.lMeetingType = meetingType;
        engine.Initialize(data);
        window = RecordingWindow::Latest();
        ASSERT_NE(window, nullptr);
        window->Clear();
    }

    // The service grants the enrolment.
    void Enrolled() {
        ARMSessionResource resource{};
        resource.dwValue = 9;
        engine.ApeEnrollConfirm(1, 0, 1, &resource);
    }

    // Participants enroll in the chat session: node, name and roles; user id = node + 1000.
    void Arrive(std::uint32_t node, const char* name, std::uint32_t roles) {
        CRosterInfoPDU pdu;
        pdu.SetNodeID(node);
        pdu.SetUserName(name);
        pdu.SetRoleSet(roles);
        pdu.GenerateXMLPDU();
        const std::string bytes = pdu.ToWireText();
        ARMApeUser user{node, node + 1000, reinterpret_cast<const std::uint8_t*>(bytes.data()),
                        static_cast<std::int32_t>(bytes.size())};
        ARMApeRoster record{};
        record.dwSessionID = kSession;
        record.wUserCount = 1;
        record.pUsers = &user;
        engine.ApeRosterChanged(1, 0, 1, 0, 0, &record);
        ASSERT_NE(engine.UserList().GetUserItemFromNodeId(node), nullptr);
    }

    void AddGroup(std::uint32_t index, std::uint32_t type, std::uint32_t id, const char* name,
                  int bIntoMenu = 1) {
        _tagChatGroupInfo info{};
        info.dwIndex = index;
        info.dwGroupType = type;
        info.dwGroupId = id;
        info.cszGroupName = name;
        engine.AddGroup(&info, bIntoMenu);
    }

    VirtualRunLoop loop;
    ScopedCurrentRunLoop current{&loop};
    CChatClient engine;
    RecordingWindow* window = nullptr;

private:
    int m_parentView = 0;
};

}  // namespace

TEST_F(RosterOps, PanelMeetingStartsWithTenGroupsAndFiveMenuEntries) {
    TraceCapture capture;
    Start(3);
    EXPECT_EQ(Groups(engine.GroupList()),
              Strings({"1:1:Host", "1:2:Presenter", "1:3:Host & Presenter", "2:0:-",
                       "1:8:All Attendees", "1:4:All Panelists", "2:0:-", "1:15:All Participants",
                       "2:0:-", "1:16:Select an Attendee..."}));
    EXPECT_EQ(Entries(engine.Menu()),
              Strings({"Host/1", "Presenter/2", "Host & Presenter/3", "---", "All Panelists/4"}));
    EXPECT_TRUE(capture.Has("Enter CChatClient::SetMeetingType = 3"));
}

TEST_F(RosterOps, OtherMeetingTypesBringGroupsOnlyInQMMode) {
    struct Case {
        std::int32_t meetingType;
        std::uint32_t features;
        Strings groups;
        Strings menu;
    };
    const Case cases[] = {
        {1, 0, {}, {}},
        {1, FEATURE_QM_MODE, {"1:15:Everyone"}, {"Everyone/15"}},
        {2, FEATURE_QM_MODE, {}, {}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(std::to_string(c.meetingType) + (c.features ? " QM" : ""));
        CChatClient other;
        other.SetMeetingType(c.meetingType);
        other.SelectFeature(c.features, 0, 0, 0, 0, nullptr);
        EXPECT_EQ(Groups(other.GroupList()), c.groups);
        EXPECT_EQ(Entries(other.Menu()), c.menu);
    }
}

TEST_F(RosterOps, MatchingRoleGroupIsUpdatedButGetsASecondMenuEntry) {
    Start(3);
    TraceCapture capture;
    AddGroup(1, 1, 1, "HOST");
    EXPECT_TRUE(capture.Has("/---- CMainChatDlg::AddRoleGroup Existed Group ----/"));
    EXPECT_FALSE(capture.Has("/---- CMainChatDlg::AddRoleGroup New Group ----/"));
    EXPECT_EQ(engine.GroupList().GetGroupsCount(), 10);
    EXPECT_STREQ(engine.GroupList().GetGroupByIndex(0)->GetGrpName(), "HOST");
    EXPECT_EQ(Entries(engine.Menu()), Strings({"Host/1", "HOST/1", "Presenter/2",
                                               "Host & Presenter/3", "---", "All Panelists/4"}));

    // A separator is never matched: it always becomes a new group.
    capture.Clear();
    AddGroup(3, 2, 0, nullptr, 0);
    EXPECT_TRUE(capture.Has("/---- CMainChatDlg::AddRoleGroup New Group ----/"));
    EXPECT_TRUE(capture.Has("/==== CMainChatDlg::AddRoleGroup exit: nInsertIndex = 3 ====/"));
    EXPECT_EQ(engine.GroupList().GetGroupsCount(), 11);
    EXPECT_EQ(engine.GroupList().GetGroupByIndex(3)->GetGroupType(), 2u);
}

TEST_F(RosterOps, HostGroupsWithOddValuesStillLandInListAndMenu) {
    Start(1);
    TraceCapture capture;
    engine.AddGroup(nullptr, 1);
    EXPECT_TRUE(window->Ids().empty());
    EXPECT_TRUE(capture.Lines().empty());

    AddGroup(0, 3, 30, nullptr);  // id group without a name
    EXPECT_TRUE(capture.Has(TraceLevel::Error,
                            "CChatClient::AddGroup( ChatGroupInfo* pChatGroupInfo), "
                            "pChatGroupInfo->cszGroupName == NULL"));
    EXPECT_TRUE(
        capture.Has("Enter CChatClient::AddGroup, pChatGroupInfo->dwGroupType = 3, "
                    "pChatGroupInfo->dwGroupId = 30, pChatGroupInfo->cszGroupName = "));
    // An index at the top of the range, or past the end, appends entry and group alike.
    AddGroup(0xFFFFFFFFu, 1, 8, "All Attendees");
    AddGroup(40, 1, 4, "All Panelists");
    AddGroup(0, 9, 99, "unknown type");
    EXPECT_EQ(Entries(engine.Menu()),
              Strings({"unknown type/99", "/30", "All Attendees/8", "All Panelists/4"}));
    EXPECT_EQ(Groups(engine.GroupList()),
              Strings({"3:30:-", "1:8:All Attendees", "1:4:All Panelists"}));
    // Every add, even one the list refuses, has the window rebuild its menu.
    ASSERT_EQ(window->Ids(), std::vector<int>(4, msg_RebuildMenu));
    EXPECT_EQ(Entries(window->Commands()[3].menu), Entries(engine.Menu()));
}

TEST_F(RosterOps, GroupSchemesPlaceGroupsAndMarkThemForTheRecording) {
    struct Case {
        const char* what;
        std::uint32_t features;
        Strings groups;
        std::vector<int> sendGroupInfo;
    };
    const Case cases[] = {
        // At the index; an index past the end appends.
        {"first scheme", 0, {"1:1:HOST", "1:8:All Attendees", "3:30:ids"}, {1, 1, 0}},
        // After the group whose sequence number is the index; an unknown one goes to the front.
        {"second scheme",
         FEATURE_GROUP_SCHEME2,
         {"3:30:ids", "1:1:HOST", "1:8:All Attendees"},
         {0, 0, 0}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        CChatClient other;
        other.SelectFeature(c.features, 0, 0, 0, 0, nullptr);
        other.SetNBRStatus(0, 1, 0);  // recorded: new role groups owe their cache a description
        const auto add = [&other](std::uint32_t index, std::uint32_t type, std::uint32_t id,
                                  const char* name) {
            _tagChatGroupInfo info{};
            info.dwIndex = index;
            info.dwGroupType = type;
            info.dwGroupId = id;
            info.cszGroupName = name;
            other.AddGroup(&info, 0);
        };
        add(0, 1, 1, "Host");
        add(1, 1, 8, "All Attendees");
        add(7, 3, 30, "ids");
        add(2, 1, 1, "HOST");  // matches the host group, which is updated
        EXPECT_EQ(Groups(other.GroupList()), c.groups);
        std::vector<int> sendGroupInfo;
        for (std::int32_t i = 0; i < other.GroupList().GetGroupsCount(); ++i)
            sendGroupInfo.push_back(other.GroupList().GetGroupByIndex(i)->GetNeedSendGroupInfo());
        EXPECT_EQ(sendGroupInfo, c.sendGroupInfo);
    }
}

TEST_F(RosterOps, OwnRolesGainThePanelistBitOutsideMeetingTypeOne) {
    struct Case {
        std::int32_t meetingType;
        std::uint32_t roster;
        std::uint32_t stored;
    };
    const Case cases[] = {
        {3, ROLE_PRESENTER, 6}, {3, ROLE_HOST, 5},      {3, 0, 0}, {3, ROLE_PANELIST, 4},
        {2, ROLE_HOST, 5},      {1, ROLE_PRESENTER, 2}, {1, 3, 3}};
    for (const Case& c : cases) {
        SCOPED_TRACE(std::to_string(c.meetingType) + "/" + std::to_string(c.roster));
        CChatClient other;
        other.SetMeetingType(c.meetingType);
        EXPECT_EQ(other.SetRosters(c.roster, 0), 0);  // not enrolled yet
        EXPECT_EQ(other.GetMyRosters(), c.stored);
        EXPECT_TRUE(other.IsRostersPending());
        EXPECT_EQ(other.SetRosters(c.roster, 1), 1);
        EXPECT_EQ(other.GetMyRosters(), c.stored);
    }
}

TEST_F(RosterOps, AfterEnrolmentOnlyChangedRolesEnrollAgain) {
    Start(3);
    EXPECT_EQ(engine.SetRosters(ROLE_PRESENTER, 0), 0);
    EXPECT_TRUE(engine.IsRostersPending());
    Enrolled();

    TraceCapture capture;
    EXPECT_EQ(engine.SetRosters(ROLE_PRESENTER, 0), 1);
    EXPECT_FALSE(engine.IsRostersPending());
    EXPECT_FALSE(capture.Has(kEnrollTrace));
    EXPECT_TRUE(capture.Has("Enter CChatClient::SubscribeAllGroupCaches"));

    engine.SetRosters(ROLE_HOST, 0);
    EXPECT_EQ(engine.GetMyRosters(), 5u);
    EXPECT_TRUE(capture.Has(kEnrollTrace));
    EXPECT_TRUE(capture.Has("Enter CChatClient::SetRosters, dwRoster = 1, bForce = 0"));

    capture.Clear();
    EXPECT_EQ(engine.SetRosters(ROLE_PANELIST, 1), 1);
    EXPECT_FALSE(capture.Has(kEnrollTrace));
    EXPECT_FALSE(capture.Has("Enter CChatClient::SubscribeAllGroupCaches"));
}

TEST_F(RosterOps, BeforeHostUntilSomebodyIsHost) {
    Start(1);
    EXPECT_TRUE(engine.IsBeforeHost());
    engine.SetRosters(ROLE_HOST, 1);
    EXPECT_FALSE(engine.IsBeforeHost());
    engine.SetRosters(0, 1);
    Arrive(201, "ann", ROLE_HOST);
    EXPECT_FALSE(engine.IsBeforeHost());
}

TEST_F(RosterOps, RosterCountsAndRoleChanges) {
    Start(3);
    Arrive(201, "ann", 0);
    Arrive(202, "bob", ROLE_PANELIST);
    Arrive(203, "cy", ROLE_HOST | ROLE_PANELIST);
    Arrive(204, "di", ROLE_PRESENTER);
    EXPECT_EQ(engine.GetPanelistCount(), 3u);

    UserItem same;
    same.dwNodeID = 202;
    same.dwUserID = 1202;
    EXPECT_TRUE(engine.IsUserExist(&same));
    UserItem moved = same;
    moved.dwNodeID = 299;  // a known user id under another node
    EXPECT_FALSE(engine.IsUserExist(&moved));
    EXPECT_FALSE(engine.IsUserExist(nullptr));

    TraceCapture capture;
    EXPECT_EQ(engine.SetAttendee(202), 0);
    EXPECT_EQ(engine.UserList().GetUserItemFromNodeId(202)->dwRoles, 0u);
    EXPECT_TRUE(capture.Has(kEnrollTrace));
    EXPECT_TRUE(capture.Has("Enter CChatClient::SetAttendee, dwNodeId = 202"));
    EXPECT_EQ(engine.GetPanelistCount(), 2u);
    capture.Clear();
    EXPECT_EQ(engine.SetAttendee(999), -1);
    EXPECT_FALSE(capture.Has(kEnrollTrace));
}

TEST_F(RosterOps, SelectedUsersAreRosterMembers) {
    Start(3);
    Arrive(201, "ann", 0);
    Arrive(202, "bob", 0);
    engine.AddUserByUserSelected(201);
    engine.AddUserByUserSelected(999);  // not in the roster
    engine.AddUserByUserSelected(202);
    EXPECT_TRUE(engine.IsUserSelectedUser(201));
    EXPECT_TRUE(engine.IsUserSelectedUser(202));
    EXPECT_FALSE(engine.IsUserSelectedUser(999));

    engine.RemoveUserByUserID(201);
    EXPECT_FALSE(engine.IsUserSelectedUser(201));
    EXPECT_TRUE(engine.IsUserSelectedUser(202));
}
