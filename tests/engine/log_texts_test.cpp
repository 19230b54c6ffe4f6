// The exact log lines of the engine's session walk and of the host's tuning commands: hosts
// and support staff search their logs for these texts.
#include <gtest/gtest.h>

#include <tuple>

#include "tests/engine/chat_room.h"
#include "tests/support/trace_capture.h"

namespace {

using Strings = std::vector<std::string>;
using Engine = std::unique_ptr<CChatClient>;

// Enter and Leave lines of one scoped trace around the given inner lines.
Strings Scoped(const std::string& text, Strings inner = {}) {
    inner.insert(inner.begin(), "Enter " + text);
    inner.push_back("Leave " + text);
    return inner;
}

constexpr const char* kCustomerId =
    "<chat ver=\"1.0\"><mtype>11</mtype><customerid>5</customerid></chat>";
constexpr const char* kFaqMacros = "<chat ver=\"1.0\"><mtype>8</mtype><fname>Ann</fname></chat>";

const Strings kCleanup =
    Scoped("CChatClient::Cleanup", {"CChatClient::ape detach", "CChatClient::conference leave",
                                    "CChatClient::destroy", "CChatClient::after destroy"});

// The lines of the capture that are the expected ones, each on the info channel with the
// component's tag, kept in the order they were logged.
Strings Matching(const TraceCapture& capture, const Strings& expected) {
    Strings found;
    std::size_t next = 0;
    for (const TraceLine& line : capture.Lines()) {
        if (next == expected.size()) break;
        if (line.text != expected[next]) continue;
        EXPECT_EQ(line.tag, "Chat") << line.text;
        EXPECT_EQ(line.level, TraceLevel::Info) << line.text;
        found.push_back(line.text);
        ++next;
    }
    return found;
}

}  // namespace

TEST(LogTexts, SessionWalkAndHostCommands) {
    VirtualRunLoop loop;
    ScopedCurrentRunLoop current{&loop};
    InProcessConference conference;
    // Each step: whether the engine was started on a conference before the capture begins,
    // what it does, and the lines it logs.
    const std::tuple<const char*, bool, std::function<void(Engine&)>, Strings> steps[] = {
        {"Initialize", false,
         [](Engine& e) { e->Initialize(chatroom::StartRecord(nullptr, 0, 0, "Alice", 0, 0)); },
         Scoped("CChatClient::Initialize", {"Enter CChatClient::ShowChatUI, bShow = 1",
                                            "Enter CChatClient::SetChatPanelUI inState = -1",
                                            "Leave CChatClient::SetChatPanelUI inState = -1",
                                            "Leave CChatClient::ShowChatUI, bShow = 1",
                                            "Enter CChatClient::SetChatPanelUI inState = 0",
                                            "Leave CChatClient::SetChatPanelUI inState = 0"})},
        {"attach confirmation", false, [](Engine& e) { e->ApeAttachConfirm(5, 0, 33); },
         Scoped("CChatClient::::ApeAttachConfirm, ape_handle = 5, result = 0, userId = 33",
                Scoped("CChatClient::Enroll"))},
        {"enroll confirmation", false, [](Engine& e) { e->ApeEnrollConfirm(5, 0, 1, nullptr); },
         Scoped("CChatClient::ApeEnrollConfirm, ape_handle = 5, result = 0, resource_number = 1")},
        {"SetRosterStatus", false, [](Engine& e) { e->SetRosterStatus(0, 1); },
         Scoped("CChatClient::SetRosterStatus, inNeedRosterInfo = 0, inBroadcastRosterInfo = 1",
                Scoped("CChatClient::Enroll"))},
        {"DisconnectIndication", false, [](Engine& e) { e->DisconnectIndication(7); },
         Scoped("CChatClient::DisconnectIndication, reason=7.")},
        {"Cleanup", true, [](Engine& e) { e->Cleanup(); }, kCleanup},
        {"destructor", true, [](Engine& e) { e.reset(); },
         Scoped("CChatClient::~CChatClient", kCleanup)},
        {"SelectFeature", false, [](Engine& e) { e->SelectFeature(0x8000, 0, 0, 0, 0, nullptr); },
         Scoped("CChatClient::SelectFeature")},
        {"SetNBRStatus", false, [](Engine& e) { e->SetNBRStatus(3, 2, 1); },
         Scoped("CChatClient::SetNBRStatus, dwStatus = 3, dwOption = 2, dwReserved = 1")},
        {"SetSoundIncomingChat", false, [](Engine& e) { e->SetSoundIncomingChat(2); },
         Scoped("CChatClient::SetSourndIncomingChat, inSoundWork = 2")},
        {"SetSoundFSSpec", false, [](Engine& e) { e->SetSoundFSSpec(FSRef{}); },
         Scoped("CChatClient::SetSoundFSSpec")},
        {"customer id configuration", false, [](Engine& e) { e->SetConfig(3, kCustomerId); },
         Scoped("CChatClient::HandleCustomerIdConfig()")},
        {"FAQ macro configuration", false, [](Engine& e) { e->SetConfig(2, kFaqMacros); },
         Scoped("CChatClient::HandleFAQMacroInfoConfig()")},
    };
    std::uint32_t node = 7;
    for (const auto& [step, withService, act, lines] : steps) {
        SCOPED_TRACE(step);
        Engine engine = std::make_unique<CChatClient>();
        if (withService) {
            engine->Initialize(chatroom::StartRecord(conference.CreateClient(loop, node),
                                                     conference.ConferenceId(), 42, "Alice", node,
                                                     0));
            ++node;
            loop.RunUntilIdle();
        }
        TraceCapture capture;
        act(engine);
        EXPECT_EQ(Matching(capture, lines), lines);
    }
}
