// The window bridge: what it traces, how it treats a missing window, and which protocol
// ids have names.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "api/ui_protocol.h"
#include "api/window_bridge.h"
#include "tests/api/logging_window.h"
#include "tests/support/trace_capture.h"

namespace {

std::vector<std::string> Scoped(const std::string& text) {
    return {"Enter " + text, "Leave " + text};
}

class NullSink final : public IChatCommSinkForChatUI {
public:
    int HandleUIMessage(int, void*, void*) override { return 0; }
};

TEST(WindowBridge, WithoutAWindowEachCallTracesAndCommandsAnswerThree) {
    SetChatWindowFactory(nullptr);
    ChatUIHandle handle = nullptr;
    int view = 0;
    NullSink sink;
    IChatCommSinkForChatUI* face = &sink;

    TraceCapture capture;
    EXPECT_EQ(CreateUI(&handle, &view, face), 0);
    EXPECT_EQ(handle, nullptr);
    EXPECT_EQ(capture.Texts(), Scoped("CreateUI, retData = " + Hex(&handle) +
                                      ", data = " + Hex(&view) + ", pSink = " + Hex(face)));
    capture.Clear();
    InstallCallback();
    EXPECT_EQ(capture.Texts(), Scoped("InstallCallback"));
    capture.Clear();
    EXPECT_EQ(NotifyCocoaUI(nullptr, msg_FocusInput, nullptr, nullptr), 3);
    EXPECT_TRUE(capture.Lines().empty());
    EXPECT_EQ(DestoryUI(nullptr), 3);
    EXPECT_EQ(capture.Texts(), Scoped("DestoryUI, control = 0x0"));
}

TEST(WindowBridge, TheWindowGetsViewAndSinkAndLosesTheSinkBeforeItEnds) {
    std::vector<std::string> log;
    SetChatWindowFactory([&log] { return new LoggingWindow(&log); });
    ChatUIHandle handle = nullptr;
    int view = 0;
    NullSink sink;
    IChatCommSinkForChatUI* face = &sink;
    ASSERT_EQ(CreateUI(&handle, &view, face), 0);
    SetChatWindowFactory(nullptr);
    ASSERT_NE(handle, nullptr);
    // Whatever the window answers is the bridge's answer.
    EXPECT_EQ(NotifyCocoaUI(handle, msg_SendDone, nullptr, nullptr), 0);
    EXPECT_EQ(NotifyCocoaUI(handle, msg_ShowChat, nullptr, nullptr), 7);

    TraceCapture capture;
    EXPECT_EQ(DestoryUI(handle), 0);
    EXPECT_EQ(capture.Texts(), Scoped("DestoryUI, control = " + Hex(handle)));
    EXPECT_EQ(log, (std::vector<std::string>{"view " + Hex(&view), "sink " + Hex(face),
                                             "msg_SendDone", "msg_ShowChat", "sink 0x0", "end"}));
}

TEST(UiProtocol, OnlyKnownIdsHaveNames) {
    EXPECT_STREQ(ChatUIMessageName(msg_SelectMenuItemAndAllowInput),
                 "msg_SelectMenuItemAndAllowInput");
    EXPECT_STREQ(ChatUIMessageName(5003), "msg_AttendeeSelected");
    for (const int unknown : {0, 999, 1001, 2102, 2300, 2311, 2502, 2607, 4999, 5004})
        EXPECT_EQ(ChatUIMessageName(unknown), nullptr) << unknown;
}

}  // namespace
