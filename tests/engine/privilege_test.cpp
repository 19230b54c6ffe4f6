// Privilege and role policy: what the send-to menu, the input and the send-to list look like
// for each meeting type, rule set, own role and privilege word; host and presenter handovers;
// practice sessions.
#include <gtest/gtest.h>

#include <algorithm>
#include <set>
#include <string>
#include <vector>

#include "tests/engine/menu_harness.h"
#include "tests/support/trace_capture.h"

using namespace menutest;

namespace {

using Strings = std::vector<std::string>;

constexpr std::uint32_t kHost = 300;
enum Own { kAttendee, kPanelist, kPresenter, kHostRole };

// The menu as titles: "*" marks the selected entry, "~" a disabled one.
Strings Marked(const CChatClient& engine) {
    Strings titles;
    for (const MenuStatus& e : engine.Menu())
        titles.push_back(std::string(e.bSelected ? "*" : "") + (e.bEnabled ? "" : "~") +
                         (e.bSeparator ? "---" : e.strTitle));
    return titles;
}

// The last value a command of the given kind carried: input 1/0, list "on"/"off"; "" when none.
std::string Last(const Strings& commands, const std::string& kind) {
    std::string last;
    for (const std::string& c : commands) {
        if (kind == "input" && c.rfind("input ", 0) == 0) last = c.substr(6);
        if (kind == "list" && c == "msg_EnableUserList") last = "on";
        if (kind == "list" && c == "msg_DisableUserList") last = "off";
    }
    return last;
}

struct PolicyCase {
    const char* scenario;
    std::int32_t type;
    bool qm;
    Own own;
    bool hostKnown;
    std::uint32_t word;
    bool selector;
    bool practice;
    Strings menu;
    std::string input;
    std::string list;
};

// Starts a participant past its start-up ticks, in a meeting with attendee ann (201), panelist
// pat (202) and, when known, host hank; then applies the word.
Strings Apply(MenuHarness& h, const PolicyCase& c) {
    for (int i = 0; i < 20; ++i)
        h.engine.OnTick();
    if (c.type != 3) {
        h.Seed({{"Host", 1},
                {"Presenter", 2},
                {"Host & Presenter", 3},
                {"All Panelists", 4},
                {"All Attendees", 8}});
        if (!c.qm) h.Seed({{"All Participants", 15}});
    }
    std::uint32_t ownRoles = 0;
    if (c.own == kPanelist) ownRoles = ROLE_PANELIST;
    if (c.own == kPresenter) {
        h.engine.OnPresenterChanged(kMyNode);
        ownRoles = ROLE_PRESENTER | ROLE_PANELIST;
    }
    if (c.own == kHostRole) {
        h.engine.OnHostChanged(kMyNode);
        ownRoles = ROLE_HOST | ROLE_PANELIST;
    }
    h.engine.SetRosters(ownRoles, 1);
    std::vector<Person> people = {
        {kMyNode, "me", ownRoles}, {201, "ann"}, {202, "pat", ROLE_PANELIST}};
    if (c.hostKnown) {
        h.engine.OnHostChanged(kHost);
        people.push_back({kHost, "hank", ROLE_HOST});
    }
    h.Enroll(people);
    if (c.practice) h.engine.SetPracticeStatus(1);
    h.Commands();
    h.engine.OnPrivilegeChanged(c.word, 0);
    return h.Commands();
}

}  // namespace

TEST(PrivilegePolicy, MenuInputAndSendToListFollowRolesAndWord) {
    const PolicyCase cases[] = {
        {"type 1 host: every group entry on whatever the word",
         1,
         false,
         kHostRole,
         false,
         0,
         false,
         false,
         {"Host", "Presenter", "Host & Presenter", "All Panelists", "pat", "All Attendees", "ann",
          "*All Participants"},
         "1",
         "on"},
        {"type 1 presenter before any host: role entries off",
         1,
         false,
         kPresenter,
         false,
         0x40,
         false,
         false,
         {"~Host", "~Presenter", "~Host & Presenter", "All Panelists", "pat", "All Attendees",
          "ann", "*All Participants"},
         "1",
         "on"},
        {"type 1 attendee, host only",
         1,
         false,
         kAttendee,
         true,
         0x2,
         false,
         false,
         {"*Host", "~Presenter", "~Host & Presenter", "~All Panelists", "~All Attendees",
          "~All Participants"},
         "1",
         "on"},
        {"type 1 attendee, private only: participant entries, input by them",
         1,
         false,
         kAttendee,
         true,
         0x8,
         false,
         false,
         {"~Host", "~Presenter", "~Host & Presenter", "~All Panelists", "~All Attendees", "*ann",
          "~All Participants"},
         "1",
         "on"},
        // The audience chosen before stays marked, disabled; the window clears the input.
        {"type 1 attendee, nothing at all",
         1,
         false,
         kAttendee,
         true,
         0,
         false,
         false,
         {"~Host", "~Presenter", "~Host & Presenter", "~All Panelists", "~All Attendees",
          "*~All Participants"},
         "0",
         "off"},
        {"type 1 attendee before the host: attendees allowed",
         1,
         false,
         kAttendee,
         false,
         0,
         false,
         false,
         {"~Host", "~Presenter", "~Host & Presenter", "~All Panelists", "*All Attendees",
          "~All Participants"},
         "1",
         "on"},
        {"type 1 attendee before the host with the picker: attendees not allowed",
         1,
         false,
         kAttendee,
         false,
         0,
         true,
         false,
         {"~Host", "~Presenter", "~Host & Presenter", "*~All Panelists", "~All Attendees",
          "~All Participants"},
         "0",
         "off"},
        {"type 1 attendee, all but panelists: no everyone with a panelist entry",
         1,
         false,
         kAttendee,
         true,
         0x7,
         false,
         false,
         {"*Host", "Presenter", "Host & Presenter", "~All Panelists", "All Attendees",
          "~All Participants"},
         "1",
         "on"},
        {"type 1 attendee, all: panelists listed",
         1,
         false,
         kAttendee,
         true,
         0x4F,
         false,
         false,
         {"Host", "Presenter", "Host & Presenter", "All Panelists", "hank", "pat", "All Attendees",
          "ann", "*All Participants"},
         "1",
         "on"},
        {"type 2 panelist, nothing: the panelist bit keeps input",
         2,
         false,
         kPanelist,
         true,
         0,
         false,
         false,
         {"~Host", "~Presenter", "~Host & Presenter", "~All Panelists", "~All Attendees", "*ann",
          "~All Participants"},
         "1",
         "on"},
        {"type 3 attendee, all: the attendee menu",
         3,
         false,
         kAttendee,
         true,
         0x4F,
         false,
         false,
         {"Host", "Presenter", "Host & Presenter", "---", "All Attendees", "All Panelists", "hank",
          "pat", "---", "*All Participants"},
         "1",
         "on"},
        {"type 3 attendee, attendees without private chat",
         3,
         false,
         kAttendee,
         true,
         0x1,
         false,
         false,
         {"*All Attendees"},
         "0",
         "off"},
        {"type 3 panelist, attendees and private: the picker entry",
         3,
         false,
         kPanelist,
         true,
         0x9,
         false,
         false,
         {"*All Attendees", "---", "Select an Attendee..."},
         "1",
         "on"},
        {"type 3 attendee in practice without attendees: nothing left",
         3,
         false,
         kAttendee,
         true,
         0x2,
         false,
         true,
         {},
         "0",
         "off"},
        {"QM type 1 attendee, everyone only",
         1,
         true,
         kAttendee,
         true,
         0x10000,
         false,
         false,
         {"*Everyone", "~All Panelists", "~All Attendees"},
         "1",
         "on"},
        {"QM type 1 attendee, host only: the host's entry, titled",
         1,
         true,
         kAttendee,
         true,
         0x2,
         false,
         false,
         {"*hank (Host)", "~All Panelists", "~All Attendees"},
         "1",
         "on"},
    };
    for (const PolicyCase& c : cases) {
        SCOPED_TRACE(c.scenario);
        MenuHarness h({c.type, c.selector, 0, c.qm ? FEATURE_QM_MODE : 0u});
        const Strings commands = Apply(h, c);
        EXPECT_EQ(Marked(h.engine), c.menu);
        EXPECT_EQ(Last(commands, "input"), c.input);
        EXPECT_EQ(Last(commands, "list"), c.list);
    }
}

TEST(HostHandover, LocalParticipantTakesAndHandsOverTheHostRole) {
    MenuHarness h({3});
    for (int i = 0; i < 20; ++i)
        h.engine.OnTick();
    h.Enroll({{kMyNode, "me"}, {201, "ann"}, {202, "pat", ROLE_PANELIST}, {kHost, "hank"}});
    TraceCapture trace;
    h.engine.OnHostChanged(kMyNode);
    EXPECT_TRUE(trace.Has("Enter CChatClient::Enroll"));
    EXPECT_TRUE(trace.Has("Enter CChatClient::SubscribeAllGroupCaches"));
    EXPECT_EQ(h.engine.MyRosters(), ROLE_HOST | ROLE_PANELIST);
    // All ten default groups, then the panelist entry; the audience chosen before stays.
    EXPECT_EQ(Marked(h.engine), Strings({"Host", "Presenter", "Host & Presenter", "---",
                                         "All Attendees", "*All Panelists", "pat", "---",
                                         "All Participants", "---", "Select an Attendee..."}));

    trace.Clear();
    h.engine.OnHostChanged(kHost);  // hank takes over: the attendee menu, forced
    EXPECT_TRUE(trace.Has("Enter CChatClient::Enroll"));
    EXPECT_TRUE(trace.Has("Enter CChatClient::OnAttendeePrivilegeChange( )"));
    EXPECT_EQ(h.engine.MyRosters(), ROLE_PANELIST);
    EXPECT_EQ(h.engine.UserList().IsHost(kMyNode), 0u);
    EXPECT_EQ(h.engine.UserList().GetUserItemFromNodeId(kHost)->dwRoles, ROLE_HOST);
    EXPECT_FALSE(h.engine.IsBeforeHost());

    // Host and presenter on one node: the roster keeps host alone.
    h.engine.OnPresenterChanged(kHost);
    EXPECT_EQ(h.engine.UserList().GetUserItemFromNodeId(kHost)->dwRoles, ROLE_HOST);

    // The role moves to a node outside the roster: hank no longer counts as host, so the
    // meeting is before its host again for the attendees' rules.
    h.engine.OnHostChanged(999);
    EXPECT_EQ(h.engine.UserList().GetUserItemFromNodeId(kHost)->dwRoles, 0u);
    EXPECT_TRUE(h.engine.IsBeforeHost());
}

TEST(HostHandover, PanelMeetingHostWhoseOwnRecordArrivesGetsTheAttendeeAudiences) {
    MenuHarness h({3});
    h.engine.OnHostChanged(kMyNode);
    h.Enroll({{kMyNode, "me", ROLE_HOST | ROLE_PANELIST}});
    const Strings menu = Marked(h.engine);
    for (const char* title : {"All Attendees", "*All Participants", "Select an Attendee..."})
        EXPECT_NE(std::find(menu.begin(), menu.end(), title), menu.end()) << title;
}

// The role groups whose caches the participant is subscribed to now.
std::set<std::uint32_t> Subscribed(CChatClient& engine) {
    std::set<std::uint32_t> ids;
    for (std::uint32_t id : {GROUP_HOST, GROUP_PRESENTER, GROUP_HOST_PRESENTER, GROUP_PANELISTS,
                             GROUP_ATTENDEES, GROUP_EVERYONE}) {
        int subscribed = 0, requestType = 0, cacheSet = 0;
        if (engine.GetGroupCacheStatus(id, subscribed, requestType, cacheSet) && subscribed)
            ids.insert(id);
    }
    return ids;
}

TEST(Practice, EachSideSeesItsAudiencesAndKeepsItsCaches) {
    struct Case {
        const char* scenario;
        Own own;
        Strings during;
        Strings after;
        std::set<std::uint32_t> caches;  // before, during and after practice
    };
    const Case cases[] = {
        {"attendee with attendees: one entry",
         kAttendee,
         {"*All Attendees"},
         {"Host", "Presenter", "Host & Presenter", "---", "*All Attendees", "All Panelists", "hank",
          "pat", "---", "All Participants"},
         {15, 8}},
        {"panelist: the audiences among panelists",
         kPanelist,
         {"Host", "Presenter", "Host & Presenter", "---", "All Attendees", "*All Panelists", "pat",
          "---", "All Participants"},
         {"Host", "Presenter", "Host & Presenter", "---", "All Attendees", "*All Panelists", "hank",
          "pat", "---", "All Participants", "---", "Select an Attendee..."},
         {15, 4}},
        {"presenter: the groups without the picker, the audience chosen before kept",
         kPresenter,
         {"*Host", "Presenter", "Host & Presenter", "---", "All Attendees", "All Panelists", "pat",
          "---", "All Participants"},
         {"*Host", "Presenter", "Host & Presenter", "---", "All Attendees", "All Panelists", "pat",
          "---", "All Participants", "---", "Select an Attendee..."},
         {15, 2, 4, 3}},
        {"host: the same groups",
         kHostRole,
         {"Host", "Presenter", "Host & Presenter", "---", "All Attendees", "All Panelists", "pat",
          "---", "*All Participants"},
         {"Host", "Presenter", "Host & Presenter", "---", "All Attendees", "All Panelists", "pat",
          "---", "*All Participants", "---", "Select an Attendee..."},
         {15, 1, 4, 3}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.scenario);
        MenuHarness h({3, false, 0, 0, false, true});
        Apply(h, {c.scenario, 3, false, c.own, c.own != kHostRole, 0x4F, false, false, {}, "", ""});
        h.engine.SubscribeAllGroupCaches();
        EXPECT_EQ(Subscribed(h.engine), c.caches);
        h.engine.SetPracticeStatus(1);
        EXPECT_EQ(Marked(h.engine), c.during);
        EXPECT_EQ(Subscribed(h.engine), c.caches);
        h.Commands();
        h.engine.SetPracticeStatus(1);  // repeating the value does nothing
        EXPECT_EQ(h.Commands(), Strings());
        h.engine.SetPracticeStatus(0);
        EXPECT_EQ(Marked(h.engine), c.after);
        EXPECT_EQ(Subscribed(h.engine), c.caches);
    }
}
