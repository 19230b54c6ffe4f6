// Host commands around chat: the everyone-only mode from the window's first command to the
// send, QM mode turning on after the start, and events or configuration that name nothing
// or that no window sends.
#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

#include "engine/chat_client.h"
#include "engine/chat_recovery_mgr.h"
#include "tests/engine/chat_room.h"
#include "tests/engine/menu_harness.h"

namespace {

using chatroom::ChatRoom;
using chatroom::Member;
using menutest::MenuHarness;

TEST(HostCommands, EveryoneOnlyHidesTheListAndSendsToEveryoneWhateverTheWindowReports) {
    // The host sets the mode before the start: the window still learns of it.
    ChatRoom room(3, FEATURE_EVERYONE_ONLY);
    Member& hana = room.Join({"Hana", 101, ROLE_HOST});
    Member& ann = room.Join({"Ann", 104, 0});
    room.SetHostAndPresenter(101, 0);
    const std::vector<int> ids = ann.window->Ids();
    EXPECT_NE(std::find(ids.begin(), ids.end(), msg_NoSendToItems), ids.end());

    ASSERT_TRUE(room.Select(ann, GROUP_EVERYONE));
    const int everyone = ann.engine.GetIndexOfMenuByGroup(GROUP_EVERYONE);
    ASSERT_NE(everyone, 0);  // entry 0 is "Host"
    std::int32_t reported = 0;
    EXPECT_EQ(ann.engine.HandleUIMessage(msg_SelectionChanged, &reported, nullptr), 0);
    EXPECT_TRUE(ann.engine.Menu()[everyone].bSelected);
    EXPECT_FALSE(ann.engine.Menu()[0].bSelected);
    ann.window->inputText = "hello";
    EXPECT_EQ(ann.engine.HandleUIMessage(msg_SendChat, nullptr, nullptr), 0);
    room.Run();
    EXPECT_EQ(room.Holders("from Ann to All Participants|hello"),
              (std::vector<std::string>{"Hana", "Ann"}));

    // A selection made before the mode came is not sent to: the host's menu, rebuilt from the
    // groups, has the everyone entry, and that is where the line goes.
    ASSERT_TRUE(room.Select(hana, GROUP_HOST));
    hana.engine.SelectFeature(FEATURE_EVERYONE_ONLY, 0, 0, 0, 0, nullptr);
    hana.window->inputText = "to host";
    hana.engine.HandleUIMessage(msg_SendChat, nullptr, nullptr);
    room.Run();
    EXPECT_EQ(ChatRoom::Transcript(hana).back(), "from Hana to All Participants|to host");
    EXPECT_EQ(ChatRoom::Transcript(ann).back(), "from Hana to All Participants|to host");
}

TEST(HostCommands, QMModeAddsOnlyTheGroupsItLacksAndNeverTwice) {
    for (const std::int32_t type : {1, 3}) {
        SCOPED_TRACE(type);
        menutest::Options options;
        options.meetingType = type;
        MenuHarness h(options);
        const std::size_t groups = h.engine.GroupList().GetGroupsCount();
        const std::vector<std::string> before = h.Titles();
        for (const std::uint32_t features : {FEATURE_QM_MODE, 0u, FEATURE_QM_MODE})
            h.engine.SelectFeature(features, 0, 0, 0, 0, nullptr);
        // Meeting type 1 gains its everyone group once; type 3 has all it needs.
        std::vector<std::string> expected = before;
        if (type == 1) expected.insert(expected.begin(), "Everyone");
        EXPECT_EQ(h.Titles(), expected);
        EXPECT_EQ(static_cast<std::size_t>(h.engine.GroupList().GetGroupsCount()),
                  groups + (type == 1 ? 1 : 0));
    }
}

TEST(HostCommands, EventsAndConfigurationThatNameNothingChangeNothing) {
    for (const std::int32_t type : {1, 3}) {
        menutest::Options options;
        options.meetingType = type;
        MenuHarness h(options);
        h.Enroll({{201, "ann", 0}});
        h.engine.RecoveryMgr()->SetCustomerId(42);
        const std::vector<std::string> titles = h.Titles();
        h.Commands();
        // A participant who left between the pick and the event.
        std::uint32_t gone = 299;
        EXPECT_EQ(h.engine.HandleUIMessage(msg_AttendeeSelected, &gone, nullptr), 1);
        // Events no window sends are refused.
        for (const int message : {0, 2000, 4999, 5004, 6000}) {
            std::int32_t value = 0;
            EXPECT_EQ(h.engine.HandleUIMessage(message, &value, &value), 1) << message;
        }
        EXPECT_EQ(h.engine.SetConfig(2, nullptr), 0);
        EXPECT_EQ(h.engine.SetConfig(3, nullptr), 0);
        EXPECT_EQ(h.Titles(), titles) << type;
        EXPECT_TRUE(h.Commands().empty()) << type;
        EXPECT_EQ(h.engine.RecoveryMgr()->GetCustomerId(), 42u);
        // Sending with nothing typed asks the window for the text and does nothing more.
        EXPECT_EQ(h.engine.HandleUIMessage(msg_SendChat, nullptr, nullptr), 0);
        EXPECT_EQ(h.Commands(), std::vector<std::string>{"msg_GetInputText"});
    }
}

}  // namespace
