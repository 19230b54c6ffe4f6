// The host panel on real components of the in-process conference: its controls reach every
// component through the exported functions, as the send-to lists show.
#include <gtest/gtest.h>

#include <QCheckBox>
#include <QComboBox>
#include <QSpinBox>

#include "api/window_bridge.h"
#include "engine/chat_client.h"
#include "hostpanel/host_panel.h"
#include "platform/inproc_conference.h"
#include "platform/virtual_run_loop.h"
#include "tests/engine/chat_room.h"
#include "tests/engine/menu_harness.h"

namespace {

constexpr std::uint32_t kHana = 11;
constexpr std::uint32_t kAmy = 22;

class HostPanelTest : public testing::Test {
protected:
    HostPanelTest() {
        SetChatWindowFactory(nullptr);
        Join("Hana Host", kHana, ROLE_HOST);
        Join("Amy Attendee", kAmy, 0);
        for (int tick = 0; tick < 20; ++tick) {
            loop.AdvanceBy(0.5);
            loop.RunUntilIdle();
        }
        HostPanel::Hooks hooks;
        hooks.members = [this] { return people; };
        hooks.act = [this](const HostPanel::Member& member, const std::function<void()>& fn) {
            acted.push_back(member.name);
            fn();
            loop.RunUntilIdle();
        };
        panel = std::make_unique<HostPanel>(hooks);
    }
    ~HostPanelTest() override {
        panel.reset();
        for (const HostPanel::Member& p : people)
            ChDeleteInstance(p.handle);
        loop.RunUntilIdle();
    }

    void Join(const char* name, std::uint32_t node, std::uint32_t roles) {
        ChatHandle handle = ChNewInstance();
        const _tagChatData data = chatroom::StartRecord(
            conference.CreateClient(loop, node), conference.ConferenceId(), 1, name, node, 3);
        ChInitialize(handle, &data);
        ChSetRosters(handle, roles);
        ChSetHost(handle, kHana);
        people.push_back({name, handle, node});
        loop.RunUntilIdle();
    }

    static CChatClient& Engine(const HostPanel::Member& p) {
        return *static_cast<CChatClient*>(p.handle);
    }
    static std::vector<std::string> Menu(const HostPanel::Member& p) {
        return menutest::Titles(Engine(p));
    }

    VirtualRunLoop loop;
    ScopedCurrentRunLoop current{&loop};
    InProcessConference conference;
    std::vector<HostPanel::Member> people;
    std::vector<std::string> acted;
    std::unique_ptr<HostPanel> panel;
};

TEST_F(HostPanelTest, PrivilegeBoxesNarrowAnAttendeeToTheHost) {
    const HostPanel::Member& amy = people[1];
    ASSERT_GT(Menu(amy).size(), 1u);
    for (const std::uint32_t bit : {0x1u, 0x4u, 0x40u, 0x10000u})
        panel->privilegeBox(bit)->setChecked(false);
    EXPECT_EQ(Menu(amy), std::vector<std::string>{"*Host"});
    // Every box change reached every member, each on its own behalf.
    EXPECT_EQ(acted.size(), 8u);
    EXPECT_EQ(acted.back(), "Amy Attendee");
}

TEST_F(HostPanelTest, PracticeLeavesAttendeesOnlyTheirOwnGroupUntilItEnds) {
    const HostPanel::Member& amy = people[1];
    const std::vector<std::string> before = Menu(amy);
    panel->practiceBox()->setChecked(true);
    EXPECT_EQ(Menu(amy), std::vector<std::string>{"*All Attendees"});
    panel->practiceBox()->setChecked(false);
    EXPECT_NE(Menu(amy), std::vector<std::string>{"*All Attendees"});
    EXPECT_EQ(Menu(amy).size(), before.size());
}

TEST_F(HostPanelTest, RolesGoToTheChosenParticipantAndTheOthersSeeThem) {
    panel->participantList()->setCurrentIndex(1);
    EXPECT_EQ(panel->nodeField()->value(), static_cast<int>(kAmy));
    panel->roleBox(ROLE_PANELIST)->setChecked(true);
    panel->applyRoles();
    const UserItem* amySeenByHana = Engine(people[0]).UserList().GetUserItemFromNodeId(kAmy);
    ASSERT_NE(amySeenByHana, nullptr);
    EXPECT_EQ(amySeenByHana->dwRoles, ROLE_PANELIST);
    EXPECT_EQ(acted, std::vector<std::string>{"Amy Attendee"});
}

}  // namespace
