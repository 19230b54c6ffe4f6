// The send-to menu model: where participant and recent entries go, how they come out, and
// whom the local participant can select. Each scenario checks the menu and the exact
// commands the window saw.
#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <tuple>
#include <vector>

#include "engine/menu_model.h"
#include "tests/engine/menu_harness.h"
#include "tests/support/trace_capture.h"

using namespace menutest;

namespace {

constexpr std::uint32_t kQM = FEATURE_QM_MODE;
constexpr const char* kDoubledSeparator =
    "CChatClient::InsertRecentUserName : add sep indexStart+2 != indexEnd";
constexpr const char* kPanelTail = "---|All Participants 15|---|Select an Attendee... 16";

}  // namespace

TEST(InsertChatUserName, PlacesAttendeesByMeetingTypeAndRules) {
    // Each case: meeting type, features, the seeded groups, the names inserted in order as nodes
    // 201, 202, ..., and the menu and commands then.
    const std::tuple<const char*, std::int32_t, std::uint32_t, const char*, const char*,
                     const char*, const char*>
        cases[] = {
            {"type 1: below All Attendees, case-insensitive, equal titles above", 1, 0,
             "Host 1|All Attendees 8|All Panelists 4", "bob|Alice|carol|BOB",
             "Host|All Attendees|Alice|BOB|bob|carol|All Panelists",
             "insert 2 bob|insert 2 Alice|insert 4 carol|insert 3 BOB"},
            {"type 2 without All Attendees: appended", 2, 0, "Host 1", "bob|Alice",
             "Host|bob|Alice", "insert -1 bob|insert -1 Alice"},
            {"QM: a separator opens the participant section under Everyone", 1, kQM, "",
             "bob|Alice", "Everyone|---|Alice|bob", "insert -1 ---|insert -1 bob|insert 2 Alice"},
            {"type 3: attendees fenced between All Participants and the picker", 3, 0, kPanelTail,
             "bob|Alice",
             "Host|Presenter|Host & Presenter|---|All Panelists|---|All "
             "Participants|---|Alice|bob|---|Select an Attendee...",
             "insert 7 ---|insert 8 bob|insert 8 Alice"},
            {"type 3 without everyone or attendees entry: appended, no separator", 3, 0, "", "bob",
             "Host|Presenter|Host & Presenter|---|All Panelists|bob", "insert -1 bob"},
        };
    for (const auto& [scenario, meetingType, features, seed, names, menu, commands] : cases) {
        SCOPED_TRACE(scenario);
        MenuHarness h({meetingType, false, 0, features});
        h.Seed(seed);
        h.Commands();
        std::uint32_t node = 201;
        for (const std::string& name : Split(names))
            h.engine.InsertChatUserName(name.c_str(), node++, 0);
        EXPECT_EQ(h.Menu(), menu);
        EXPECT_EQ(h.Seen(), commands);
    }
}

TEST(InsertChatUserName, AnAttendeeInPracticeGetsNoEntries) {
    MenuHarness h({1});
    h.Seed("All Attendees 8");
    h.engine.SetPracticeStatus(1);
    h.Commands();
    h.engine.InsertChatUserName("bob", 201, 0);
    EXPECT_EQ(h.Menu(), "*All Attendees");
    EXPECT_EQ(h.Seen(), "");
}

TEST(InsertChatUserName, SecondInsertOnlySelectsInThePanelMeeting) {
    MenuHarness h({3});
    h.Seed(kPanelTail);
    h.engine.InsertChatUserName("bob", 201, 0);
    h.Commands();
    h.engine.InsertChatUserName("bob", 201, 1);
    EXPECT_EQ(h.Seen(), "select 8");
}

TEST(InsertChatUserName, PrivateOnlyAttendeeInputFollowsParticipantEntries) {
    MenuHarness h({1});
    h.engine.OnHostChanged(300);  // once a host is in, private chat alone is allowed
    h.Enroll({{300, "hank", ROLE_HOST}});
    h.engine.OnPrivilegeChanged(0x8, 0);
    h.Seed("All Attendees 8");
    h.Commands();
    h.engine.InsertChatUserName("bob", 201, 0);
    EXPECT_EQ(h.Seen(), "insert -1 bob|input 1");
    h.engine.RemoveChatUserName("bob", 201, 1);
    EXPECT_EQ(h.Seen(), "remove 1|input 0|msg_ClearInput");
}

TEST(SetGroupMenuEnable, TellsOnlyOfChangesAndAnInsertReplacesADisabledSelection) {
    MenuHarness h({1});
    h.Seed("Host 1|All Attendees 8");
    h.Commands();
    h.engine.SelectMenuItemByIndex(1);
    h.engine.SelectMenuItemByIndex(5);  // indices outside the menu are ignored
    h.engine.SelectMenuItemByIndex(-1);
    EXPECT_EQ(h.Seen(), "select 1");
    h.engine.SetGroupMenuEnable(8, false);
    h.engine.SetGroupMenuEnable(8, false);
    h.engine.SetGroupMenuEnable(4, false);  // no such entry
    EXPECT_EQ(h.Seen(), "update 1 off");
    h.engine.InsertChatUserName("bob", 201, 0);  // the first enabled entry takes the selection
    EXPECT_EQ(h.Menu(), "*Host|All Attendees|bob");
    EXPECT_EQ(h.Seen(), "insert -1 bob|select 0");
    h.engine.SetGroupMenuEnable(8, true);
    EXPECT_EQ(h.Seen(), "update 1 on");
}

TEST(RemoveChatUserName, TidiesSeparatorsAndFallsBack) {
    // Each case: the attendee picker, the seeded groups, everyone disabled; the menu and the
    // commands once bob, selected, is gone.
    const std::tuple<const char*, bool, const char*, bool, const char*, const char*> cases[] = {
        {"selected entry gone: the everyone entry takes over", false,
         "All Participants 15|All Attendees 8", false, "*All Participants|All Attendees",
         "remove 2|select 0"},
        {"everyone disabled: the first enabled entry takes over", false,
         "All Participants 15|All Attendees 8", true, "All Participants|*All Attendees",
         "remove 2|select 1"},
        {"the trailing separator goes", false, "All Attendees 8|---", false, "*All Attendees",
         "remove 1|remove 1|select 0"},
        {"with the attendee picker the trailing separator stays", true, "All Attendees 8|---",
         false, "*All Attendees|---", "remove 1|select 0"},
    };
    for (const auto& [scenario, selector, seed, disableEveryone, menu, commands] : cases) {
        SCOPED_TRACE(scenario);
        MenuHarness h({1, selector});
        h.Seed(seed);
        h.engine.InsertChatUserName("bob", 201, 0);
        if (disableEveryone) h.engine.SetGroupMenuEnable(15, false);
        h.engine.SelectMenuItemByIndex(h.engine.GetIndexOfMenuByNodeID(201));
        h.Commands();
        h.engine.RemoveChatUserName("bob", 201, 0);
        EXPECT_EQ(h.Menu(), menu);
        EXPECT_EQ(h.Seen(), commands);
    }
}

TEST(RemoveChatUserNameInQM, SelectedEntryLeavesAsDepartedAudience) {
    MenuHarness h({1, false, 0, kQM});
    h.engine.InsertChatUserName("bob", 201, 0);
    h.engine.InsertChatUserName("carl", 202, 0);
    h.engine.SelectMenuItemByIndexInQM(2);
    h.Commands();
    h.engine.RemoveChatUserNameInQM("carl", 202);
    EXPECT_EQ(h.Seen(), "remove 3");
    h.engine.RemoveChatUserNameInQM("bob", 201);
    EXPECT_EQ(h.Seen(), "left 2|input 0|remove 1");
    EXPECT_EQ(h.Menu(), "Everyone");
}

TEST(RemoveChatUserNameInQM, RoleEntryGoesOnlyWhenSelectedAndTakesItsSeparatorAlong) {
    const std::string logged = "CChatClient::RemoveChatUserNameInQM,";
    // Each case: meeting type (1 brings the everyone entry, 2 does not), host and presenter
    // nodes, the index selected before hank leaves, the logged selected status and index of his
    // entry / index of the separator removed with it, the seeded groups, the menu and commands.
    const std::tuple<const char*, std::int32_t, std::uint32_t, std::uint32_t, int, const char*,
                     const char*, const char*, const char*>
        cases[] = {
            {"host entry selected, the local participant presents: separator above goes", 1, 300,
             kMyNode, 2, "1,its index is 2/1", "---|Host 1|Presenter 2", "Everyone|Presenter",
             "left 2|input 0|remove 1"},
            {"host entry not selected: it stays", 1, 300, kMyNode, 0, "0,its index is 2/",
             "---|Host 1|Presenter 2", "*Everyone|---|hank (Host)|Presenter", ""},
            {"host entry selected, the presenter is someone else: separator stays", 1, 300, 301, 2,
             "1,its index is 2/", "---|Host 1|Presenter 2", "Everyone|---|Presenter",
             "left 2|input 0"},
            {"presenter entry selected with no host known", 1, 0, 300, 2, "1,its index is 2/1",
             "---|Presenter 2", "Everyone", "left 2|input 0|remove 1"},
            {"combined entry at the top: the separator now at the top goes", 2, 300, 300, 0,
             "1,its index is 0/0", "Host & Presenter 3|---|All Attendees 8", "All Attendees",
             "left 0|input 0|remove 0"},
        };
    for (const auto& [scenario, type, host, presenter, selected, log, seed, menu, commands] :
         cases) {
        SCOPED_TRACE(scenario);
        // The holders are set before QM mode starts, so the seeded role entries are the only
        // ones (under QM rules a role change brings its own).
        MenuHarness h({type});
        h.engine.OnHostChanged(host);
        h.engine.OnPresenterChanged(presenter);
        h.engine.SelectFeature(kQM, 0, 0, 0, 0, nullptr);
        h.Seed(seed);
        h.Enroll({{300, "hank", ROLE_HOST}});
        h.engine.SelectMenuItemByIndexInQM(selected);
        h.Commands();
        TraceCapture trace;
        h.Leave({300, "hank", ROLE_HOST});
        EXPECT_EQ(h.Menu(), menu);
        EXPECT_EQ(h.Seen(), commands);
        EXPECT_EQ(Traced(trace, logged + "user[node is 300] selected status ") + "/" +
                      Traced(trace, logged + "remove spe line,its index is "),
                  log);
    }
}

TEST(RecentEntries, PickerKeepsTwentyNewestFirst) {
    MenuHarness h({1, true});
    h.engine.OnHostChanged(kMyNode);
    h.Seed("All Attendees 8");
    std::vector<Person> people;
    for (std::uint32_t i = 1; i <= 21; ++i)
        people.push_back({200 + i, "u" + std::to_string(i)});
    h.Enroll(people);
    EXPECT_EQ(h.Menu(), "All Attendees");  // picked attendees only

    for (std::uint32_t i = 1; i <= 20; ++i)
        EXPECT_TRUE(h.engine.SelectUserByNodeID(200 + i, false, true));
    h.Commands();
    EXPECT_TRUE(h.engine.SelectUserByNodeID(221, false, true));
    EXPECT_EQ(h.Seen(), "remove 20|insert 1 u21|select 1");
    std::string menu = "All Attendees|*u21";
    for (int i = 20; i >= 2; --i)
        menu += "|u" + std::to_string(i);
    EXPECT_EQ(h.Menu(), menu);

    // Picking again moves the entry to the top.
    EXPECT_TRUE(h.engine.SelectUserByNodeID(205, false, true));
    EXPECT_EQ(h.Seen(), "remove 17|insert 1 u5|select 1");
}

TEST(RecentEntries, GoBelowTheSeparatorsUnderAllAttendees) {
    for (const std::int32_t meetingType : {1, 2}) {
        SCOPED_TRACE(meetingType);
        MenuHarness h({meetingType, true});
        h.engine.OnHostChanged(kMyNode);
        h.Seed("All Attendees 8|---|Host 1");
        h.Enroll({{201, "ann"}});
        h.Commands();
        EXPECT_TRUE(h.engine.SelectUserByNodeID(201, false, true));
        EXPECT_EQ(h.Seen(), "insert 2 ann|select 2");
    }
}

TEST(RecentEntries, PanelMeetingWithoutEveryoneWalksDownFromAllAttendees) {
    const std::string below = "item below'all attendee'";
    for (const bool attendees : {false, true}) {
        SCOPED_TRACE(attendees);
        MenuHarness h({3});
        h.engine.SetRosters(ROLE_PANELIST, 1);
        if (attendees) h.Seed("All Attendees 8|Select an Attendee... 16");
        h.Enroll({{201, ""}, {202, "bo"}});
        h.Commands();
        TraceCapture trace;
        h.engine.SelectUserByNodeID(201, false, true);
        h.engine.SelectUserByNodeID(202, false, true);
        // Every entry passed is logged, an untitled one with the short form.
        EXPECT_EQ(Traced(trace, "CChatClient::InsertRecentUserName "),
                  attendees ? below + ", Select an Attendee...|" + below + " |" + below +
                                  ", Select an Attendee..."
                            : "indexStart== -1|indexStart== -1");
        EXPECT_EQ(h.Seen(), attendees ? "insert 6 |select 6|insert 7 bo|select 7" : "");
    }
}

TEST(RecentEntries, PanelMeetingSectionAndDepartures) {
    MenuHarness h({3});
    h.engine.SetRosters(ROLE_PANELIST, 1);
    h.Seed(kPanelTail);
    h.Enroll({{201, "a1"}, {202, "a2"}});
    h.Commands();
    TraceCapture trace;
    EXPECT_TRUE(h.engine.SelectUserByNodeID(201, false, true));
    // A separator already stood above the picker: the new one doubles it.
    EXPECT_TRUE(trace.Has(TraceLevel::Warn, kDoubledSeparator));
    EXPECT_TRUE(h.engine.SelectUserByNodeID(202, false, true));
    EXPECT_EQ(h.Seen(), "insert 7 ---|insert 8 a1|select 8|insert 8 a2|select 8");
    h.Leave({201, "a1"});
    EXPECT_EQ(h.Seen(), "remove 9");
    h.Leave({202, "a2"});
    EXPECT_EQ(h.Seen(), "remove 8|remove 8|select 6");
    EXPECT_EQ(h.Menu(),
              "Host|Presenter|Host & Presenter|---|All Panelists|---|*All "
              "Participants|---|Select an Attendee...");
}

TEST(RecentEntries, PanelMeetingSeparatorGoesBetweenEveryoneAndThePickerBelowIt) {
    MenuHarness h({3});
    h.engine.SetRosters(ROLE_PANELIST, 1);
    h.Seed("---|All Participants 15|Select an Attendee... 16|---");
    h.Enroll({{201, "a1"}});
    h.Commands();
    TraceCapture trace;
    EXPECT_TRUE(h.engine.SelectUserByNodeID(201, false, true));
    EXPECT_EQ(h.Menu(),
              "Host|Presenter|Host & Presenter|---|All Panelists|---|All "
              "Participants|---|*a1|Select an Attendee...|---");
    EXPECT_EQ(h.Seen(), "insert 7 ---|insert 8 a1|select 8");
    EXPECT_TRUE(trace.Has("CChatClient::InsertRecentUserName : add sep"));
    EXPECT_FALSE(trace.Has(TraceLevel::Warn, kDoubledSeparator));
}

TEST(SelectUserByNodeID, FollowsRolesEntriesAndTestOnly) {
    MenuHarness h({1});
    h.engine.OnHostChanged(300);
    h.engine.OnPresenterChanged(301);
    h.Seed("Host 1|Presenter 2|All Attendees 8");
    h.Enroll({{300, "hank", ROLE_HOST}, {301, "pia", ROLE_PRESENTER}, {201, "ann"}, {202, "bea"}});
    h.engine.RemoveChatUserName("bea", 202, 0);
    ASSERT_EQ(h.Menu(), "Host|Presenter|All Attendees|ann");
    h.Commands();

    // Each case: node, test only, select; the result and the commands.
    const std::tuple<std::uint32_t, bool, bool, bool, const char*> cases[] = {
        {300, false, true, true, "select 0"}, {301, false, true, true, "select 1"},
        {201, false, true, true, "select 3"}, {201, false, true, true, ""},
        {300, true, true, true, ""},          {201, false, false, false, ""},
        {202, true, true, false, ""},         {999, false, true, false, ""},
    };
    for (const auto& [node, testOnly, select, result, commands] : cases) {
        SCOPED_TRACE(node);
        EXPECT_EQ(h.engine.SelectUserByNodeID(node, testOnly, select), result);
        EXPECT_EQ(h.Seen(), commands);
    }
    EXPECT_TRUE(h.engine.CanChatWith(301, false));
    h.engine.SetGroupMenuEnable(2, false);
    EXPECT_FALSE(h.engine.CanChatWith(301, false));
}

TEST(SelectUserByNodeID, QMCombinedHolderSelectsItsRoleEntry) {
    MenuHarness h({1, false, 0, kQM});
    h.engine.OnHostChanged(300);
    h.engine.OnPresenterChanged(300);  // the combined role entry takes the place of "Host"
    h.Enroll({{300, "hank", ROLE_HOST}});
    EXPECT_EQ(h.Menu(), "Everyone|hank (Host & Presenter)");
    h.Commands();
    EXPECT_TRUE(h.engine.SelectUserByNodeID(300, false, true));
    EXPECT_EQ(h.Seen(), "select+input 1");
}

TEST(CanChatWith, PanelMeetingMenuOnlyPracticeAndAttendeeTest) {
    MenuHarness h({3});
    h.engine.OnHostChanged(kMyNode);
    h.engine.OnPresenterChanged(301);
    h.Seed(kPanelTail);
    h.Enroll(
        {{301, "pia", ROLE_PRESENTER | ROLE_PANELIST}, {302, "pat", ROLE_PANELIST}, {201, "ann"}});
    TraceCapture trace;
    EXPECT_TRUE(h.engine.CanChatWith(302, true));   // own entry
    EXPECT_TRUE(h.engine.CanChatWith(301, true));   // presenter entry
    EXPECT_FALSE(h.engine.CanChatWith(201, true));  // no entry, menu only
    EXPECT_TRUE(h.engine.CanChatWith(201, false));  // may pick attendees
    EXPECT_TRUE(trace.Has("CChatClient::SelectUserByNodeID, Only Test attendee"));
    h.engine.SetPracticeStatus(1);  // only panelists reach each other
    EXPECT_FALSE(h.engine.SelectUserByNodeID(201, true, true));
    EXPECT_TRUE(h.engine.SelectUserByNodeID(302, true, true));
    h.engine.SetPracticeStatus(0);
    h.engine.OnPrivilegeChanged(0, 0);
    EXPECT_FALSE(h.engine.CanChatWith(201, false));
}

TEST(EveryoneOnly, SelectionAlwaysLandsOnEveryone) {
    MenuHarness h({3, false, 0, FEATURE_EVERYONE_ONLY});
    h.Seed(kPanelTail);
    h.engine.InsertChatUserName("bob", 201, 0);
    h.Commands();
    h.engine.SelectMenuItemByIndex(0);
    h.engine.SelectMenuItemByIndex(8);
    EXPECT_EQ(h.Seen(), "select 6|select 6");
    EXPECT_FALSE(h.engine.CanChatWith(201, false));
    EXPECT_FALSE(h.engine.CanChatWith(201, true));
}

TEST(ExternalInternalTags, MarkFollowsTheTaggingMode) {
    // Each case: tagging mode, tag; ann's title and the mark's text.
    const std::tuple<std::int32_t, std::uint32_t, const char*, const char*> cases[] = {
        {0, 1, "ann", ""},
        {1, 1, "ann (internal)", ", internal"},
        {1, 2, "ann", ""},
        {2, 2, "ann (external)", ", external"},
        {2, 1, "ann", ""}};
    for (const auto& [mode, tag, title, mark] : cases) {
        SCOPED_TRACE(title);
        MenuHarness h({1, false, mode});
        h.engine.OnHostChanged(300);
        h.Seed("All Attendees 8");
        h.Enroll({{201, "ann", 0, tag}, {300, "hank", ROLE_HOST, tag}});
        h.engine.InsertExternalInternalChatUserName("hank", 300, tag);  // hosts go unmarked
        EXPECT_EQ(h.Menu(), "All Attendees|" + std::string(title) + "|hank");
        EXPECT_EQ(h.engine.GetUserExternalInternalString(tag, 1), mark);
    }
}

TEST(WindowReentry, SelectionReportsFromInsideCommandsEndOnTheRightEntry) {
    // A real window reports the selection (5001) from inside SetSink, before any menu
    // exists, and from inside 2303, 2305 and 2306; the engine takes each report in mid-command.
    MenuHarness h({1, false, 0, 0, true});
    h.Seed("All Participants 15|All Attendees 8");
    EXPECT_EQ(h.Commands().front(), "report 0");
    h.Enroll({{201, "bob"}});
    h.Commands();
    EXPECT_TRUE(h.engine.SelectUserByNodeID(201, false, true));
    h.Leave({201, "bob"});  // the fallback selection is reported back too
    EXPECT_EQ(h.Seen(), "select 2|report 2|remove 2|select 0|report 0");
    EXPECT_EQ(h.Menu(), "*All Participants|All Attendees");

    MenuHarness q({1, false, 0, kQM, true});
    q.Enroll({{201, "bob"}, {202, "carl"}});
    q.Commands();
    EXPECT_TRUE(q.engine.SelectUserByNodeID(202, false, true));
    q.Leave({202, "carl"});  // the window shows the departed audience and reports -1
    EXPECT_EQ(q.Menu(), "Everyone|---|bob");
    EXPECT_TRUE(q.engine.SelectUserByNodeID(201, false, true));
    EXPECT_EQ(q.Seen(), "select+input 3|report 3|left 3|report -1|input 0|select+input 2|report 2");
    EXPECT_EQ(q.Menu(), "Everyone|---|*bob");
}

// The model's indexed answers against a plain walk of its entries, through random insertions
// (out of title order now and then, which must end the halving search), removals and changes.
TEST(MenuModel, IndexedAnswersEqualAPlainWalk) {
    MenuModel model;
    MenuStatusList plain;
    std::uint32_t state = 7;
    const auto next = [&state](std::size_t below) {
        state = state * 1103515245u + 12345u;
        return static_cast<std::uint32_t>((state >> 8) % below);
    };
    const auto first = [&plain](auto wanted) {
        const auto found = std::find_if(plain.begin(), plain.end(), wanted);
        return found == plain.end() ? -1 : static_cast<int>(found - plain.begin());
    };
    for (int step = 0; step < 3000; ++step) {
        const std::uint32_t op = plain.empty() ? 0 : next(10);
        const std::size_t at = next(plain.size() + 1);
        MenuStatus e;
        e.dwNodeID = next(3) == 0 ? 0 : 1 + next(40);
        e.nGroupID = e.dwNodeID == 0 ? static_cast<std::int32_t>(next(4)) - 1 : -1;
        e.bSeparator = e.dwNodeID == 0 && e.nGroupID == -1;
        e.bPanelist = e.dwNodeID != 0 && next(3) == 0;
        e.bRecent = e.dwNodeID != 0 && next(4) == 0;
        e.strTitle = std::string(1, static_cast<char>('a' + next(26)));
        if (op < 4) {
            const std::size_t to = next(8) == 0 ? at : first([&e](const MenuStatus& x) {
                return !MenuModel::TitleBelow(x, e.strTitle.c_str());
            });
            model.Insert(std::min(to, plain.size()), e);
            plain.insert(plain.begin() + std::min(to, plain.size()), e);
        } else if (op < 8) {
            model.Erase(at % plain.size());
            plain.erase(plain.begin() + at % plain.size());
        } else {
            op == 8 ? model.SetSelected(at % plain.size(), e.bPanelist)
                    : model.SetEnabled(at % plain.size(), e.bPanelist);
            (op == 8 ? plain[at % plain.size()].bSelected : plain[at % plain.size()].bEnabled) =
                e.bPanelist;
        }
        const auto node = [&e](const MenuStatus& x) {
            return e.dwNodeID != 0 && x.nGroupID == -1 && x.dwNodeID == e.dwNodeID;
        };
        EXPECT_EQ(model.IndexOfNode(e.dwNodeID), first(node));
        EXPECT_EQ(model.IndexOfParticipant(e.dwNodeID, e.bRecent),
                  first([&](const MenuStatus& x) { return node(x) && x.bRecent == e.bRecent; }));
        EXPECT_EQ(model.IndexOfGroup(e.nGroupID), first([&e](const MenuStatus& x) {
                      return x.nGroupID == e.nGroupID && !x.dwNodeID;
                  }));
        EXPECT_EQ(model.HasParticipantEntry(),
                  first([](const MenuStatus& x) { return x.dwNodeID; }) != -1);
        EXPECT_EQ(model.HasSelectedDisabledEntry(),
                  first([](const MenuStatus& x) { return x.bSelected && !x.bEnabled; }) != -1);
        for (const bool panelist : {false, true}) {
            std::size_t end = std::min<std::size_t>(at, plain.size());
            while (end < plain.size() &&
                   (panelist ? plain[end].bPanelist : plain[end].IsPlainParticipantEntry()) &&
                   MenuModel::TitleBelow(plain[end], e.strTitle.c_str()))
                ++end;
            const auto section =
                panelist ? MenuModel::Section::kPanelist : MenuModel::Section::kPlain;
            EXPECT_EQ(model.EndOfSortedRun(static_cast<int>(at), e.strTitle.c_str(), section),
                      static_cast<int>(end));
        }
    }
}
