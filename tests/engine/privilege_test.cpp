// Privilege and role policy: what the send-to menu, the input and the send-to list look like
// for each meeting type, rule set, own role and privilege word; host and presenter handovers;
// practice sessions.
#include <gtest/gtest.h>

#include <string>
#include <tuple>
#include <vector>

#include "tests/engine/menu_harness.h"
#include "tests/support/trace_capture.h"

using namespace menutest;

namespace {

using Strings = std::vector<std::string>;
constexpr std::uint32_t kQM = FEATURE_QM_MODE;

constexpr std::uint32_t kHost = 300;
enum Own { kAttendee, kPanelist, kPresenter, kHostRole };
// How the meeting stands when the word comes.
constexpr unsigned kQMRules = 1, kHostKnown = 2, kPicker = 4, kPractice = 8;

// The menu as titles joined with "|": "*" marks the selected entry, "~" a disabled one.
std::string Marked(const CChatClient& engine) {
    Strings titles;
    for (const MenuStatus& e : engine.Menu())
        titles.push_back(std::string(e.bSelected ? "*" : "") + (e.bEnabled ? "" : "~") +
                         (e.bSeparator ? "---" : e.strTitle));
    return Join(titles);
}

// The last input and send-to list states the commands carried ("1 on", "0 off"; "-" for none).
std::string Outcome(const Strings& commands) {
    std::string input = "-", list = "-";
    for (const std::string& c : commands) {
        if (c.rfind("input ", 0) == 0) input = c.substr(6);
        if (c == "msg_EnableUserList") list = "on";
        if (c == "msg_DisableUserList") list = "off";
    }
    return input + " " + list;
}

// Starts a participant past its start-up ticks, in a meeting with attendee ann (201), panelist
// pat (202) and, when known, host hank; then applies the word.
Strings Apply(MenuHarness& h, std::int32_t type, Own own, unsigned setup, std::uint32_t word) {
    for (int i = 0; i < 20; ++i)
        h.engine.OnTick();
    if (type != 3) {
        h.Seed("Host 1|Presenter 2|Host & Presenter 3|All Panelists 4|All Attendees 8");
        if (!(setup & kQMRules)) h.Seed("All Participants 15");
    }
    const std::uint32_t kRoles[] = {0, ROLE_PANELIST, ROLE_PRESENTER | ROLE_PANELIST,
                                    ROLE_HOST | ROLE_PANELIST};  // by Own
    const std::uint32_t ownRoles = kRoles[own];
    if (own == kPresenter) h.engine.OnPresenterChanged(kMyNode);
    if (own == kHostRole) h.engine.OnHostChanged(kMyNode);
    h.engine.SetRosters(ownRoles, 1);
    std::vector<Person> people = {
        {kMyNode, "me", ownRoles}, {201, "ann"}, {202, "pat", ROLE_PANELIST}};
    if (setup & kHostKnown) {
        h.engine.OnHostChanged(kHost);
        people.push_back({kHost, "hank", ROLE_HOST});
    }
    h.Enroll(people);
    if (setup & kPractice) h.engine.SetPracticeStatus(1);
    h.Commands();
    h.engine.OnPrivilegeChanged(word, 0);
    return h.Commands();
}

}  // namespace

TEST(PrivilegePolicy, MenuInputAndSendToListFollowRolesAndWord) {
    // Each case: meeting type, own role, set-up flags, word; the last input and send-to list
    // states, and the menu.
    const std::string on = "Host|Presenter|Host & Presenter|";
    const std::string off = "~Host|~Presenter|~Host & Presenter|";
    const std::tuple<const char*, std::int32_t, Own, unsigned, std::uint32_t, const char*,
                     std::string>
        cases[] = {
            {"type 1 host: every group entry on whatever the word", 1, kHostRole, 0, 0, "1 on",
             on + "All Panelists|pat|All Attendees|ann|*All Participants"},
            {"type 1 presenter before any host: role entries off", 1, kPresenter, 0, 0x40, "1 on",
             off + "All Panelists|pat|All Attendees|ann|*All Participants"},
            {"type 1 attendee, host only", 1, kAttendee, kHostKnown, 0x2, "1 on",
             "*Host|~Presenter|~Host & Presenter|~All Panelists|~All Attendees|~All Participants"},
            {"type 1 attendee, private: entries, input by them", 1, kAttendee, kHostKnown, 0x8,
             "1 on", off + "~All Panelists|~All Attendees|*ann|~All Participants"},
            // The audience chosen before stays marked, disabled; the window clears the input.
            {"type 1 attendee, nothing at all", 1, kAttendee, kHostKnown, 0, "0 off",
             off + "~All Panelists|~All Attendees|*~All Participants"},
            {"type 1 attendee before the host: attendees allowed", 1, kAttendee, 0, 0, "1 on",
             off + "~All Panelists|*All Attendees|~All Participants"},
            {"type 1 attendee before the host, picker: no attendees", 1, kAttendee, kPicker, 0,
             "0 off", off + "*~All Panelists|~All Attendees|~All Participants"},
            {"type 1 attendee, all but panelists: everyone off", 1, kAttendee, kHostKnown, 0x7,
             "1 on", "*" + on + "~All Panelists|All Attendees|~All Participants"},
            {"type 1 attendee, all: panelists listed", 1, kAttendee, kHostKnown, 0x4F, "1 on",
             on + "All Panelists|hank|pat|All Attendees|ann|*All Participants"},
            {"type 2 panelist, nothing: its role keeps input", 2, kPanelist, kHostKnown, 0, "1 on",
             off + "~All Panelists|~All Attendees|*ann|~All Participants"},
            {"type 3 attendee, attendees without private chat", 3, kAttendee, kHostKnown, 0x1,
             "0 off", "*All Attendees"},
            {"type 3 panelist, attendees and private: picker", 3, kPanelist, kHostKnown, 0x9,
             "1 on", "*All Attendees|---|Select an Attendee..."},
            {"type 3 attendee in practice, host only: none", 3, kAttendee, kHostKnown | kPractice,
             0x2, "0 off", ""},
            {"QM type 1 attendee, everyone only", 1, kAttendee, kQMRules | kHostKnown, 0x10000,
             "1 on", "*Everyone|~All Panelists|~All Attendees"},
            {"QM type 1 attendee, host only: titled", 1, kAttendee, kQMRules | kHostKnown, 0x2,
             "1 on", "*hank (Host)|~All Panelists|~All Attendees"},
        };
    for (const auto& [scenario, type, own, setup, word, outcome, menu] : cases) {
        SCOPED_TRACE(scenario);
        MenuHarness h({type, (setup & kPicker) != 0, 0, setup & kQMRules ? kQM : 0u});
        const Strings commands = Apply(h, type, own, setup, word);
        EXPECT_EQ(Marked(h.engine), menu);
        EXPECT_EQ(Outcome(commands), outcome);
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
    EXPECT_EQ(Marked(h.engine),
              "Host|Presenter|Host & Presenter|---|All Attendees|*All "
              "Panelists|pat|---|All Participants|---|Select an Attendee...");

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

// The role groups whose caches the participant is subscribed to now.
std::string Subscribed(CChatClient& engine) {
    std::string ids;
    for (std::uint32_t id : {GROUP_HOST, GROUP_PRESENTER, GROUP_HOST_PRESENTER, GROUP_PANELISTS,
                             GROUP_ATTENDEES, GROUP_EVERYONE}) {
        int subscribed = 0, requestType = 0, cacheSet = 0;
        if (engine.GetGroupCacheStatus(id, subscribed, requestType, cacheSet) && subscribed)
            ids += " " + std::to_string(id);
    }
    return ids;
}

TEST(Practice, EachSideSeesItsAudiencesAndKeepsItsCaches) {
    // Each case: own role, the caches subscribed before, during and after practice, and the
    // menus during and after it.
    const std::string roles = "Host|Presenter|Host & Presenter|---|";
    const std::string picker = "|---|Select an Attendee...";
    const std::tuple<const char*, Own, const char*, std::string, std::string> cases[] = {
        {"attendee with attendees: one entry", kAttendee, " 8 15", "*All Attendees",
         roles + "*All Attendees|All Panelists|hank|pat|---|All Participants"},
        {"panelist: the audiences among panelists", kPanelist, " 4 15",
         roles + "All Attendees|*All Panelists|pat|---|All Participants",
         roles + "All Attendees|*All Panelists|hank|pat|---|All Participants" + picker},
        {"presenter: no picker, the audience chosen before kept", kPresenter, " 2 3 4 15",
         "*" + roles + "All Attendees|All Panelists|pat|---|All Participants",
         "*" + roles + "All Attendees|All Panelists|pat|---|All Participants" + picker},
        {"host: the same groups", kHostRole, " 1 3 4 15",
         roles + "All Attendees|All Panelists|pat|---|*All Participants",
         roles + "All Attendees|All Panelists|pat|---|*All Participants" + picker},
    };
    for (const auto& [scenario, own, caches, during, after] : cases) {
        SCOPED_TRACE(scenario);
        MenuHarness h({3, false, 0, 0, false, true});
        Apply(h, 3, own, own != kHostRole ? kHostKnown : 0, 0x4F);
        h.engine.SubscribeAllGroupCaches();
        EXPECT_EQ(Subscribed(h.engine), caches);
        h.engine.SetPracticeStatus(1);
        EXPECT_EQ(Marked(h.engine), during);
        EXPECT_EQ(Subscribed(h.engine), caches);
        h.Commands();
        h.engine.SetPracticeStatus(1);  // repeating the value does nothing
        EXPECT_EQ(h.Commands(), Strings());
        h.engine.SetPracticeStatus(0);
        EXPECT_EQ(Marked(h.engine), after);
        EXPECT_EQ(Subscribed(h.engine), caches);
    }
}
