// The window bridge: what it traces, how it treats a missing window, and the protocol ids
// and names engine and window agree on.
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

TEST(UiProtocol, IdsAndNamesBothSidesAgreeOn) {
    const struct {
        int id;
        const char* name;
    } table[] = {
        {1000, "msg_ClearChat"},
        {2000, "msg_FocusInput"},
        {2100, "msg_ShowChat"},
        {2101, "msg_SendDone"},
        {2103, "msg_AllowUserInput"},
        {2104, "msg_HideUserList"},
        {2200, "msg_ShowText"},
        {2201, "msg_ShowTitle"},
        {2301, "msg_InsertMenuItem"},
        {2302, "msg_RemoveMenuItem"},
        {2303, "msg_SelectedUserLeft"},
        {2304, "msg_RenameMenuItem"},
        {2305, "msg_SelectMenuItem"},
        {2306, "msg_SelectMenuItemAndAllowInput"},
        {2307, "msg_UpdateMenuItem"},
        {2308, "msg_EnableUserList"},
        {2309, "msg_DisableUserList"},
        {2310, "msg_NoSendToItems"},
        {2400, "msg_RebuildMenu"},
        {2401, "msg_PanelStatusChanged"},
        {2402, "msg_CloseAllDialogs"},
        {2500, "msg_GetInputText"},
        {2501, "msg_ClearInput"},
        {2600, "msg_SaveChatPanel"},
        {2601, "msg_OpenChatPanel"},
        {2602, "msg_WriteTextFile"},
        {2603, "msg_ReadTextFile"},
        {2604, "msg_AddAttendee"},
        {2605, "msg_CloseAttendeeDialog"},
        {2606, "msg_CloseAttendeeWarning"},
        {5000, "msg_SendChat"},
        {5001, "msg_SelectionChanged"},
        {5002, "msg_ShowAttendeeList"},
        {5003, "msg_AttendeeSelected"},
    };
    for (const auto& entry : table) {
        const char* name = ChatUIMessageName(entry.id);
        ASSERT_NE(name, nullptr) << entry.id;
        EXPECT_STREQ(name, entry.name) << entry.id;
    }
    for (const int unknown : {0, 999, 1001, 2102, 2300, 2311, 2502, 2607, 4999, 5004})
        EXPECT_EQ(ChatUIMessageName(unknown), nullptr) << unknown;
}

}  // namespace
