// The exported functions: the null-handle guard, their trace texts, and a whole life
// from ChNewInstance to ChDeleteInstance through them.
#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <string>
#include <vector>

#include "api/quintarachat.h"
#include "engine/chat_client.h"
#include "platform/inproc_conference.h"
#include "platform/virtual_run_loop.h"
#include "tests/api/logging_window.h"
#include "tests/engine/chat_room.h"
#include "tests/support/trace_capture.h"

namespace {

struct NullCase {
    const char* trace;  // none: the call leaves no trace
    std::function<int()> call;
    int expected = -1;  // what a call that needs an instance answers
};

TEST(Exports, NullHandleIsRefusedWithOnlyTheTraceLines) {
    FSRef sound{};
    _tagChatGroupInfo group{};
    const _tagChatData data{};
    const std::vector<NullCase> cases = {
        {"ChDeleteInstalnce, hComponent = 0x0", [] { return ChDeleteInstance(nullptr); }},
        {"Chinitlize, hComponent = 0x0", [&] { return ChInitialize(nullptr, &data); }},
        {"ChSetRosterStatus, hComponent = 0x0, inNeedRosterInfo = 1, inBroadcastRosterInfo = 0",
         [] { return ChSetRosterStatus(nullptr, 1, 0); }},
        {"ChSetRosters, hComponent = 0x0, lRosters = 3", [] { return ChSetRosters(nullptr, 3); }},
        {"ChSetPrivilege, hComponent = 0x0, inValue = 8",
         [] { return ChSetPrivilege(nullptr, 8); }},
        {"ChSetHost, hComponent = 0x0, inHostID =5", [] { return ChSetHost(nullptr, 5); }},
        {"ChSetPresenter, hComponent = 0x0, inpresenterID= 6",
         [] { return ChSetPresenter(nullptr, 6); }},
        {"ChSetBeforeHostStatus, hComponent = 0x0",
         [] { return ChSetBeforeHostStatus(nullptr, 1); }},
        {"ChSetPanelStatus, hComponent = 0x0", [] { return ChSetPanelStatus(nullptr, 32); }},
        {"ChSetPracticeStatus, hComponent = 0x0", [] { return ChSetPracticeStatus(nullptr, 1); }},
        {"ChAddGroup, hComponent = 0x0", [&] { return ChAddGroup(nullptr, &group); }},
        {"ChSelectuserByNodeId, hComponent = 0x0", [] { return ChSelectUserByNodeId(nullptr, 4); }},
        {"ChSwitchTarget, hComponent = 0x0", [] { return ChSwitchTarget(nullptr); }},
        {"ChCloseAllDlg, hComponent = 0x0", [] { return ChCloseAllDlg(nullptr); }},
        {"ChFileOpen, hComponent = 0x0", [] { return ChFileOpen(nullptr); }},
        {"ChFileSave, hComponent = 0x0", [] { return ChFileSave(nullptr); }},
        {"ChFileSaveAs, hComponent = 0x0", [] { return ChFileSaveAs(nullptr); }},
        {"ChSaveFileToFolder, hComponent = 0x0",
         [] { return ChSaveFileToFolder(nullptr, "/tmp"); }},
        {"ChGetFileSaveState, hComponent = 0x0", [] { return ChGetFileSaveState(nullptr); }, 0},
        {"ChHasContent, hComponent = 0x0", [] { return ChHasContent(nullptr); }, 0},
        {"ChIsModified, hComponent = 0x0", [] { return ChIsModified(nullptr); }, 0},
        {"ChSetSoundMode, hComponent = 0x0,inBSoundWork = 2",
         [] { return ChSetSoundMode(nullptr, 2); }},
        {"ChSetSoundFile, hComponent = 0x0", [&] { return ChSetSoundFile(nullptr, sound); }},
        {"ChSelectFeature, hComponent = 0x0",
         [] { return ChSelectFeature(nullptr, 0x200000, 0, 0, 0, 0, nullptr); }},
        {"SetNBR2Status, hComponent = 0x0, dwStatus = 3, dwOption = 1, dwReserved = 0 ",
         [] { return SetNBR2Status(nullptr, 3, 1, 0); }},
        {"ChSetConfig, hComponent = 0x0", [] { return ChSetConfig(nullptr, 3, "<chat/>"); }},
        {nullptr, [] { return ChCanChatWith(nullptr, 5, 1); }, 0},
        {nullptr, [] { return ChAllowUserInput(nullptr, 1); }, 0},
        {nullptr, [] { return ChShowUserList(nullptr, 1); }, 0},
    };
    for (const NullCase& c : cases) {
        SCOPED_TRACE(c.trace ? c.trace : "untraced query");
        TraceCapture capture;
        EXPECT_EQ(c.call(), c.expected);
        if (!c.trace) {
            EXPECT_TRUE(capture.Lines().empty());
            continue;
        }
        EXPECT_EQ(capture.Texts(), (std::vector<std::string>{std::string("Enter ") + c.trace,
                                                             std::string("Leave ") + c.trace}));
    }
}

TEST(Exports, WholeLifeThroughTheExportedFunctions) {
    VirtualRunLoop loop;
    ScopedCurrentRunLoop current(&loop);
    InProcessConference conference;
    std::vector<std::string> log;
    SetChatWindowFactory([&log] { return new LoggingWindow(&log); });

    ChatHandle handle = ChNewInstance();
    EXPECT_EQ(ChInitialize(handle, nullptr), -1);  // without a record nothing starts
    EXPECT_EQ(static_cast<CChatClient*>(handle)->State(), kStateIdle);
    _tagChatData data = chatroom::StartRecord(conference.CreateClient(loop, 7),
                                              conference.ConferenceId(), 3, "Alice", 7, 3);
    EXPECT_EQ(ChInitialize(handle, &data), 0);
    loop.RunUntilIdle();
    EXPECT_EQ(static_cast<CChatClient*>(handle)->State(), kStateEnrolled);
    EXPECT_EQ(ChSelectFeature(handle, 0x8000, 0, 0, 0, 0, nullptr), 0);
    EXPECT_EQ(SetNBR2Status(handle, 1, 1, 0), 0);
    EXPECT_EQ(ChSetConfig(handle, 7, "anything"), 0);

    // A second start keeps the window and moves it into the view the new record names.
    int otherView = 0;
    data.hParentView = &otherView;
    log.clear();
    EXPECT_EQ(ChInitialize(handle, &data), 0);
    loop.RunUntilIdle();
    const auto command = [](const std::string& entry) { return entry.rfind("msg_", 0) == 0; };
    log.erase(std::remove_if(log.begin(), log.end(), command), log.end());
    EXPECT_EQ(log, std::vector<std::string>{"view " + Hex(&otherView)});
    log.clear();
    EXPECT_EQ(ChSwitchTarget(handle), 0);
    EXPECT_EQ(ChCloseAllDlg(handle), 0);
    EXPECT_EQ(ChSelectUserByNodeId(handle, 99), 0);
    EXPECT_EQ(ChDeleteInstance(handle), 0);
    // The picker closes before the selection and the input takes the focus after it; a deleted
    // component clears its window while it still exists, takes the sink away, then ends it.
    EXPECT_EQ(log, (std::vector<std::string>{"msg_FocusInput", "msg_CloseAllDialogs",
                                             "msg_CloseAttendeeDialog", "msg_FocusInput",
                                             "msg_ClearChat", "sink 0x0", "end"}));
    loop.AdvanceBy(5.0);
    EXPECT_EQ(conference.ClientCount(), 0u);
    SetChatWindowFactory(nullptr);
}

}  // namespace
