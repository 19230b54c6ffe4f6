// The exported functions: the null-handle guard, their trace texts, and a whole life
// from ChNewInstance to ChDeleteInstance through them.
#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "api/quintarachat.h"
#include "engine/chat_client.h"
#include "platform/inproc_conference.h"
#include "platform/virtual_run_loop.h"
#include "tests/support/recording_window.h"
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
    RecordingWindow::Install();

    ChatHandle handle = ChNewInstance();
    EXPECT_EQ(ChInitialize(handle, nullptr), -1);  // without a record nothing starts
    EXPECT_EQ(static_cast<CChatClient*>(handle)->State(), kStateIdle);
    _tagChatData data{};
    data.pArmClient = conference.CreateClient(loop, 7);
    data.wConferenceID = conference.ConferenceId();
    data.dwSessionID = 3;
    data.lpszUserName = "Alice";
    data.dwNodeID = 7;
    data.lMeetingType = 3;
    EXPECT_EQ(ChInitialize(handle, &data), 0);
    loop.RunUntilIdle();
    EXPECT_EQ(static_cast<CChatClient*>(handle)->State(), kStateEnrolled);
    EXPECT_EQ(ChHasContent(handle), 0);
    EXPECT_EQ(ChIsModified(handle), 0);
    EXPECT_EQ(ChSelectFeature(handle, 0x8000, 0, 0, 0, 0, nullptr), 0);
    EXPECT_EQ(SetNBR2Status(handle, 1, 1, 0), 0);
    EXPECT_EQ(ChSetConfig(handle, 7, "anything"), 0);

    RecordingWindow* window = RecordingWindow::Latest();
    ASSERT_NE(window, nullptr);
    // A second start keeps the window and moves it into the view the new record names.
    int otherView = 0;
    data.hParentView = &otherView;
    EXPECT_EQ(ChInitialize(handle, &data), 0);
    loop.RunUntilIdle();
    EXPECT_EQ(RecordingWindow::Latest(), window);
    EXPECT_EQ(window->SuperView(), &otherView);
    window->Clear();
    EXPECT_EQ(ChSwitchTarget(handle), 0);
    EXPECT_EQ(ChCloseAllDlg(handle), 0);
    // The picker closes before the selection and the input takes the focus after it.
    EXPECT_EQ(ChSelectUserByNodeId(handle, 99), 0);
    EXPECT_EQ(window->Ids(), (std::vector<int>{msg_FocusInput, msg_CloseAllDialogs,
                                               msg_CloseAttendeeDialog, msg_FocusInput}));

    EXPECT_EQ(ChDeleteInstance(handle), 0);
    EXPECT_EQ(RecordingWindow::Latest(), nullptr);
    loop.AdvanceBy(5.0);
    EXPECT_EQ(conference.ClientCount(), 0u);
    RecordingWindow::Uninstall();
}

// A window that logs command ids and its own end into a list the test keeps.
class LoggingWindow final : public IChatWindow {
public:
    explicit LoggingWindow(std::vector<int>* log) : m_log(log) {}
    ~LoggingWindow() override { m_log->push_back(-1); }
    void SetSuperView(void*) override {}
    void SetSink(IChatCommSinkForChatUI* sink) override {
        if (!sink) m_log->push_back(0);
    }
    int HandleCommand(int command, void*, void*) override {
        m_log->push_back(command);
        return 0;
    }

private:
    std::vector<int>* m_log;
};

TEST(Exports, DeleteClearsTheWindowBeforeTheEngineGoes) {
    std::vector<int> log;
    SetChatWindowFactory([&log] { return new LoggingWindow(&log); });
    ChatHandle handle = ChNewInstance();
    _tagChatData data{};
    data.lMeetingType = 1;
    ChInitialize(handle, &data);
    log.clear();
    EXPECT_EQ(ChDeleteInstance(handle), 0);
    // Clear, then the sink is taken away, then the window is destroyed.
    EXPECT_EQ(log, (std::vector<int>{msg_ClearChat, 0, -1}));
    SetChatWindowFactory(nullptr);
}

}  // namespace
