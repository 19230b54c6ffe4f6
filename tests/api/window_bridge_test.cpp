// The window bridge: what it traces, how it treats a missing window, and which protocol
// ids have names.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

#include "api/ui_protocol.h"
#include "api/window_bridge.h"
#include "tests/support/trace_capture.h"

namespace {

std::string Hex(const void* address) {
    char text[32];
    std::snprintf(text, sizeof text, "0x%x",
                  static_cast<unsigned>(reinterpret_cast<std::uintptr_t>(address)));
    return text;
}

std::vector<std::string> Scoped(const std::string& text) {
    return {"Enter " + text, "Leave " + text};
}

// A window that remembers what the bridge gave it and whether it still has a sink.
class ProbeWindow final : public IChatWindow {
public:
    explicit ProbeWindow(bool* sinkClearedBeforeEnd) : m_cleared(sinkClearedBeforeEnd) {}
    ~ProbeWindow() override { *m_cleared = m_sink == nullptr; }
    void SetSuperView(void* view) override { superView = view; }
    void SetSink(IChatCommSinkForChatUI* sink) override { m_sink = sink; }
    int HandleCommand(int command, void*, void*) override { return command == 2101 ? 0 : 7; }
    IChatCommSinkForChatUI* Sink() const { return m_sink; }
    void* superView = nullptr;

private:
    IChatCommSinkForChatUI* m_sink = nullptr;
    bool* m_cleared;
};

class NullSink final : public IChatCommSinkForChatUI {
public:
    int HandleUIMessage(int, void*, void*) override { return 0; }
};

TEST(WindowBridge, EachBridgeCallOpensAScopedTrace) {
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
}

TEST(WindowBridge, AMissingWindowAnswersThreeAndNothingHappens) {
    TraceCapture capture;
    EXPECT_EQ(NotifyCocoaUI(nullptr, msg_FocusInput, nullptr, nullptr), 3);
    EXPECT_TRUE(capture.Lines().empty());
    EXPECT_EQ(DestoryUI(nullptr), 3);
    EXPECT_EQ(capture.Texts(), Scoped("DestoryUI, control = 0x0"));
}

TEST(WindowBridge, TheWindowGetsViewAndSinkAndLosesTheSinkBeforeItEnds) {
    bool sinkClearedBeforeEnd = false;
    ProbeWindow* made = nullptr;
    SetChatWindowFactory([&] { return made = new ProbeWindow(&sinkClearedBeforeEnd); });
    ChatUIHandle handle = nullptr;
    int view = 0;
    NullSink sink;
    ASSERT_EQ(CreateUI(&handle, &view, &sink), 0);
    SetChatWindowFactory(nullptr);
    ASSERT_NE(made, nullptr);
    EXPECT_EQ(handle, made);
    EXPECT_EQ(made->superView, &view);
    EXPECT_EQ(made->Sink(), &sink);
    // Whatever the window answers is the bridge's answer.
    EXPECT_EQ(NotifyCocoaUI(handle, msg_SendDone, nullptr, nullptr), 0);
    EXPECT_EQ(NotifyCocoaUI(handle, msg_ShowChat, nullptr, nullptr), 7);

    TraceCapture capture;
    EXPECT_EQ(DestoryUI(handle), 0);
    EXPECT_TRUE(sinkClearedBeforeEnd);
    EXPECT_EQ(capture.Texts(), Scoped("DestoryUI, control = " + Hex(handle)));
}

TEST(UiProtocol, OnlyKnownIdsHaveNames) {
    EXPECT_STREQ(ChatUIMessageName(msg_SelectMenuItemAndAllowInput),
                 "msg_SelectMenuItemAndAllowInput");
    EXPECT_STREQ(ChatUIMessageName(5003), "msg_AttendeeSelected");
    for (const int unknown : {0, 999, 1001, 2102, 2300, 2311, 2502, 2607, 4999, 5004})
        EXPECT_EQ(ChatUIMessageName(unknown), nullptr) << unknown;
}

}  // namespace
