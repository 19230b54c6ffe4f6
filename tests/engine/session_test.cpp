// The engine's life against the in-process conference on a virtual clock: start, the
// connection chain and its failures, roster-info switches, the tick and the tear-down; and the
// exact log lines of that walk and of the host's tuning commands, which hosts and support
// staff search their logs for.
#include <gtest/gtest.h>

#include <optional>
#include <tuple>

#include "tests/engine/chat_room.h"
#include "tests/support/host_recorder.h"
#include "tests/support/spy_arm_client.h"
#include "tests/support/trace_capture.h"

namespace {

using Strings = std::vector<std::string>;

constexpr std::uint32_t kSessionId = 42;

class SessionTest : public ::testing::Test {
protected:
    void SetUp() override { RecordingWindow::Install(); }
    void TearDown() override { RecordingWindow::Uninstall(); }

    _tagChatData Data(IArmClient* client, std::uint32_t node, const char* name,
                      std::int32_t meetingType = 1) {
        _tagChatData data = chatroom::StartRecord(client, conference.ConferenceId(), kSessionId,
                                                  name, node, meetingType);
        data.pHostSink = &host;
        data.hParentView = &parentView;
        return data;
    }

    VirtualRunLoop loop;
    ScopedCurrentRunLoop current{&loop};
    InProcessConference conference;
    HostRecorder host;
    int parentView = 0;
};

Strings Prefix(const Strings& calls, std::size_t n) {
    return Strings(calls.begin(), calls.begin() + std::min(n, calls.size()));
}

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

TEST_F(SessionTest, NormalStartWalksFromConnectToEnrolment) {
    SpyArmClient spy(conference.CreateClient(loop, 7));
    CChatClient engine;
    engine.Initialize(Data(&spy, 7, "Alice", 3));

    // Nothing is answered inside a request: only Connect has happened yet.
    EXPECT_EQ(spy.Calls(), Strings{"Connect"});
    EXPECT_EQ(engine.State(), kStateIdle);
    loop.RunUntilIdle();

    // Each request with what the engine passes: the enroll payload's own length, the session
    // resource, and the ape handle the attach gave.
    const std::string conf = std::to_string(conference.ConferenceId());
    const std::string ape = std::to_string(spy.ApeHandle());
    ASSERT_NE(spy.ApeHandle(), 0u);
    ASSERT_FALSE(spy.EnrollPayloads().empty());
    const std::string length = std::to_string(spy.EnrollPayloads().front().size());
    EXPECT_EQ(
        Prefix(spy.CallsWithArguments(), 6),
        (Strings{"Connect(Alice, 0, 0, 0)", "ConferenceJoin(0, " + conf + ", 3)",
                 "ApeAttach(0, " + conf + ")",
                 "ApeEnroll(" + ape + ", 1, 42, 0, 1, {1, c_session_id, 1}, " + length + ", 3)",
                 "AllocNameHandle(" + ape + ", 9)", "RegisterSharedDataSink(" + ape + ")"}));
    EXPECT_EQ(engine.SessionValue(), conference.SessionValue(kSessionId));
    EXPECT_EQ(spy.RegisteredSink(), static_cast<IArmSharedDataSink*>(&engine));
    EXPECT_EQ(host.events, (Strings{"modified 0", "content 0"}));

    // Named handles for the seven group caches of meeting type 3 and the bookkeeping caches.
    const std::string prefix = std::to_string(engine.SessionValue());
    EXPECT_EQ(
        spy.HandleNames(),
        (Strings{prefix + "_chat_cache_1", prefix + "_chat_cache_2", prefix + "_chat_cache_3",
                 prefix + "_chat_cache_8", prefix + "_chat_cache_4", prefix + "_chat_cache_15",
                 prefix + "_chat_cache_16", prefix + "_Chat_User_Info", prefix + "_chat_status"}));

    RecordingWindow* window = RecordingWindow::Latest();
    ASSERT_NE(window, nullptr);
    EXPECT_EQ(window->SuperView(), &parentView);
    EXPECT_EQ(window->Sink(), static_cast<IChatCommSinkForChatUI*>(&engine));
}

TEST_F(SessionTest, RosterInfoIsPinned) {
    SpyArmClient spy(conference.CreateClient(loop, 7));
    CChatClient engine;
    engine.SetRosters(ROLE_HOST | ROLE_PRESENTER | ROLE_PANELIST, 1);
    engine.Initialize(Data(&spy, 7, "Alice <&> ]]>", 1));
    loop.RunUntilIdle();
    // Meeting type 1 clears the panelist bit; the customer id is written even when 0;
    // no FAQ fields without FAQ settings; no external tag when it is 0.
    ASSERT_FALSE(spy.EnrollPayloads().empty());
    EXPECT_EQ(spy.EnrollPayloads().front(),
              "<chat ver=\"1.0\"><mtype>5</mtype><NodeID>7</NodeID>"
              "<UserName><![CDATA[Alice <&> ]] >]]></UserName><RoleSet>3</RoleSet>"
              "<Visible>1</Visible><UserType>1</UserType><GuestID>0</GuestID></chat>");
}

TEST_F(SessionTest, RosterInfoCarriesFaqFieldsTagAndCustomerId) {
    SpyArmClient spy(conference.CreateClient(loop, 7));
    CChatClient engine;
    engine.SetRosters(ROLE_HOST | ROLE_PRESENTER | ROLE_PANELIST, 1);
    engine.SetConfig(2,
                     "<chat ver=\"1.0\"><mtype>8</mtype><fname>Ann</fname><phone>1 &amp; 2</phone>"
                     "</chat>");
    engine.SetConfig(3, "<chat ver=\"1.0\"><mtype>11</mtype><customerid>555</customerid></chat>");
    _tagChatData data = Data(&spy, 7, "Ann", 3);
    data.lExternalTagMode = 2;
    data.dwUserExternalTag = 2;
    engine.Initialize(data);
    loop.RunUntilIdle();

    ASSERT_FALSE(spy.EnrollPayloads().empty());
    EXPECT_EQ(spy.EnrollPayloads().front(),
              "<chat ver=\"1.0\"><mtype>5</mtype><NodeID>7</NodeID>"
              "<UserName><![CDATA[Ann]]></UserName><RoleSet>7</RoleSet><Visible>1</Visible>"
              "<UserType>1</UserType><FName><![CDATA[Ann]]></FName><Phone>1 &amp; 2</Phone>"
              "<GuestID>555</GuestID><UIT>2</UIT></chat>");
    // With a customer id its cache is asked for between the user-info and the status cache.
    const std::string prefix = std::to_string(engine.SessionValue());
    ASSERT_GE(spy.HandleNames().size(), 3u);
    EXPECT_EQ(Strings(spy.HandleNames().end() - 3, spy.HandleNames().end()),
              (Strings{prefix + "_Chat_User_Info", "switch_cache_555", prefix + "_chat_status"}));
}

TEST_F(SessionTest, ConnectResultDecidesWhetherTheChainGoesOn) {
    std::uint32_t node = 7;
    // Negative: the confirmation carries the value; -19 twice: two retries, then it connects.
    // Already connected, and (0) already connected and joined: the chain goes on within the
    // same call, without waiting for a confirmation.
    for (const int result : {1202, 1, 19, -5, -19, int{kArmAlreadyConnected}, 0}) {
        SCOPED_TRACE(result);
        InProcessArmClient* client = conference.CreateClient(loop, node);
        SpyArmClient spy(client);
        if (result > 0) client->FailNext(ArmOperation::Connect, result);
        if (result < 0)
            client->ConfirmNextWith(ArmConfirmation::ConnectConfirm, -result,
                                    result == -19 ? 2 : 1);
        if (result == 0) {
            client->FailNext(ArmOperation::Connect, kArmAlreadyConnected);
            client->FailNext(ArmOperation::ConferenceJoin, kArmAlreadyJoined);
        }
        TraceCapture capture;
        CChatClient engine;
        engine.Initialize(Data(&spy, node++, "Alice"));
        const bool already = result == kArmAlreadyConnected || result == 0;
        if (already) {
            const Strings chain{"Connect", "ConferenceJoin", "ApeAttach"};
            const std::size_t made = result == 0 ? 3 : 2;
            EXPECT_EQ(Prefix(spy.Calls(), made), Prefix(chain, made));
            EXPECT_TRUE(
                capture.Has("CChatClient::already connected, now call ConnectConfirm() myself"));
        }
        loop.RunUntilIdle();
        const bool joins = result == 1202 || result == -19 || already;
        EXPECT_EQ(spy.Count("Connect"), result == -19 ? 3u : 1u);
        EXPECT_EQ(spy.Count("ConferenceJoin"), joins ? 1u : 0u);
        if (joins) {
            EXPECT_EQ(engine.State(), kStateEnrolled);
            continue;
        }
        if (result < 0) {  // a confirmation other than 0 and 19 changes nothing
            EXPECT_EQ(spy.Calls(), Strings{"Connect"});
            EXPECT_EQ(engine.ArmClient(), &spy);
            EXPECT_EQ(engine.State(), kStateIdle);
            continue;
        }
        // The session ends at once, but the window is made and the tick still runs.
        EXPECT_TRUE(spy.Released());
        EXPECT_EQ(engine.ArmClient(), nullptr);
        EXPECT_NE(engine.ChatUI(), nullptr);
        EXPECT_TRUE(engine.TimerInstalled());
    }
}

TEST_F(SessionTest, AttachAndEnrollFailuresEndInIdle) {
    const auto none = std::nullopt;
    // Each failure: the call that fails or the confirmation that refuses, with its code; the
    // enrolls made by then and the error logged (none for a refusal).
    const std::tuple<const char*, std::optional<ArmOperation>, std::optional<ArmConfirmation>, int,
                     std::size_t, const char*>
        cases[] = {
            {"attach call", ArmOperation::ApeAttach, none, 5, 0,
             "CChatClient::m_pArmClient->Attach user failed, nRetCode=5, nRetCode"},
            {"attach confirmation", none, ArmConfirmation::ApeAttachConfirm, 3, 0, nullptr},
            {"enroll call", ArmOperation::ApeEnroll, none, 9, 1,
             "CChatClient::ApeEnroll failed. nRetCode = 9. "},
            {"enroll confirmation", none, ArmConfirmation::ApeEnrollConfirm, 4, 1, nullptr},
            {"resource status", none, ArmConfirmation::EnrollResourceStatus, 4, 1, nullptr},
        };
    std::uint32_t node = 7;
    for (const auto& [step, call, refusal, code, enrolls, error] : cases) {
        SCOPED_TRACE(step);
        InProcessArmClient* client = conference.CreateClient(loop, node);
        SpyArmClient spy(client);
        if (call) client->FailNext(*call, code);
        if (refusal) client->ConfirmNextWith(*refusal, code);
        TraceCapture capture;
        CChatClient engine;
        engine.Initialize(Data(&spy, node++, "Bob"));
        loop.RunUntilIdle();
        EXPECT_EQ(engine.State(), kStateIdle);
        EXPECT_EQ(engine.Enrolled(), 0);
        EXPECT_EQ(spy.Count("ApeEnroll"), enrolls);
        EXPECT_EQ(spy.Count("AllocNameHandle"), 0u);
        EXPECT_TRUE(!error || capture.Has(TraceLevel::Error, error));
        if (!refusal) continue;
        EXPECT_TRUE(spy.Released());
        // Roles change after the refusal: the tick must not reach for the released service.
        engine.SetRosters(ROLE_HOST, 0);
        loop.AdvanceBy(5.0);
        EXPECT_EQ(spy.Count("ApeEnroll"), enrolls);
    }
}

TEST_F(SessionTest, NoResourceOrNoServiceChangesNothing) {
    CChatClient engine;
    EXPECT_EQ(engine.ApeEnrollConfirm(1, 0, 0, nullptr), 0);
    EXPECT_EQ(engine.Enrolled(), 0);
    EXPECT_EQ(engine.SessionValue(), 0u);
    EXPECT_EQ(engine.State(), kStateIdle);
    EXPECT_EQ(engine.SetRosterStatus(0, 0), 0);
    EXPECT_EQ(engine.Enroll(), 1);
}

TEST_F(SessionTest, TickClosesTheAttendeePickerOnceItsWarningIsGone) {
    CChatClient engine;
    engine.Initialize(Data(nullptr, 7, "Alice"));
    RecordingWindow* window = RecordingWindow::Latest();
    ASSERT_NE(window, nullptr);
    // The commands the window gets while act runs.
    const auto during = [window](const std::function<void()>& act) {
        window->Clear();
        act();
        return window->Ids();
    };
    const std::vector<int> warning{msg_CloseAttendeeWarning};
    const std::vector<int> both{msg_CloseAttendeeWarning, msg_CloseAttendeeDialog};
    // Without a warning the dialog closes at once; with one it waits for the warning to go.
    EXPECT_EQ(during([&] { engine.CloseSeltAttDlg(); }), both);
    window->warningShowing = 1;
    EXPECT_EQ(during([&] { engine.CloseSeltAttDlg(); }), warning);
    EXPECT_EQ(during([&] { loop.AdvanceBy(1.0); }), warning);
    window->warningShowing = 0;
    EXPECT_EQ(during([&] { loop.AdvanceBy(0.5); }), both);
    EXPECT_TRUE(during([&] { loop.AdvanceBy(0.5); }).empty());
}

TEST_F(SessionTest, RolesAndRosterStatusEnrollAgainOnlyOnChange) {
    SpyArmClient spy(conference.CreateClient(loop, 7));
    CChatClient engine;
    engine.Initialize(Data(&spy, 7, "Alice"));
    EXPECT_EQ(engine.SetRosters(ROLE_PRESENTER, 0), 0);  // not enrolled yet: pending
    loop.RunUntilIdle();
    ASSERT_EQ(spy.Count("ApeEnroll"), 1u);
    loop.AdvanceBy(1.0);  // the tick enrolls the pending roles, once
    EXPECT_EQ(spy.Count("ApeEnroll"), 2u);
    loop.AdvanceBy(9.0);  // and lets the start-up countdown finish
    EXPECT_EQ(spy.Count("ApeEnroll"), 2u);
    ASSERT_EQ(engine.PrivilegeCountdown(), 0);

    engine.SetRosterStatus(1, 1);
    EXPECT_EQ(spy.Count("ApeEnroll"), 2u);
    EXPECT_EQ(engine.PrivilegeCountdown(), 0);

    engine.SetRosterStatus(0, 1);
    EXPECT_EQ(spy.Count("ApeEnroll"), 3u);
    EXPECT_EQ(engine.PrivilegeCountdown(), 5);

    engine.SetRosterStatus(7, 7);  // values other than 0 and 1 change nothing
    EXPECT_EQ(spy.Count("ApeEnroll"), 3u);
    EXPECT_EQ(engine.NeedRosterInfo(), 0);
    EXPECT_EQ(engine.BroadcastRosterInfo(), 1);
}

TEST_F(SessionTest, CleanupIsSafeTwiceAndReleasesOnce) {
    SpyArmClient spy(conference.CreateClient(loop, 7));
    CChatClient engine;
    engine.Initialize(Data(&spy, 7, "Alice"));
    loop.RunUntilIdle();
    engine.Cleanup();
    engine.Cleanup();
    // One detach and one release, last.
    EXPECT_EQ(engine.ChatUI(), nullptr);
    const std::string conf = std::to_string(conference.ConferenceId());
    EXPECT_EQ(Strings(spy.CallsWithArguments().end() - 4, spy.CallsWithArguments().end()),
              (Strings{"ApeDetach(" + std::to_string(spy.ApeHandle()) + ")",
                       "ConferenceLeave(0, " + conf + ")", "Destroy(1)", "Release()"}));
}

TEST_F(SessionTest, SecondInitializeKeepsTheServiceWindowAndTheTimerThatReappliesPrivileges) {
    SpyArmClient spyFirst(conference.CreateClient(loop, 7));
    SpyArmClient spySecond(conference.CreateClient(loop, 8));
    CChatClient engine;
    engine.Initialize(Data(&spyFirst, 7, "Alice"));
    loop.RunUntilIdle();
    const ChatUIHandle window = engine.ChatUI();
    engine.Initialize(Data(&spySecond, 7, "Alice"));
    loop.RunUntilIdle();
    EXPECT_EQ(engine.ArmClient(), &spyFirst);
    EXPECT_TRUE(spySecond.Calls().empty());
    EXPECT_EQ(spyFirst.Count("Connect"), 2u);
    EXPECT_EQ(engine.ChatUI(), window);
    EXPECT_EQ(RecordingWindow::Latest(), window);
    // One timer: the restarted countdown re-applies the privileges on the ninth tick.
    const std::string reapplied = "Enter CChatClient::OnPrivilegeChanged , in_dwPrivilege = 65615";
    TraceCapture trace;
    loop.AdvanceBy(1.0 + 0.5 * 7);  // ticks one to eight
    EXPECT_EQ(engine.PrivilegeCountdown(), 9);
    EXPECT_EQ(engine.PrivilegePending(), 1);
    EXPECT_FALSE(trace.Has(reapplied));
    loop.AdvanceBy(0.5);  // the ninth tick
    EXPECT_TRUE(trace.Has(reapplied));
    EXPECT_EQ(engine.PrivilegeCountdown(), 0);
    EXPECT_EQ(engine.PrivilegePending(), 0);
    EXPECT_EQ(engine.StartupTicks(), 10);
    loop.AdvanceBy(0.5 * 11);
    EXPECT_EQ(engine.StartupTicks(), 0);
}

TEST_F(SessionTest, DeletingWithAnswersInFlightDeliversNothingMore) {
    InProcessArmClient* client = conference.CreateClient(loop, 7);
    auto engine = std::make_unique<CChatClient>();
    engine->Initialize(Data(client, 7, "Alice"));
    loop.RunUntilIdle();
    // A change that makes the engine write to the service, then delete it before answers come.
    engine->SetRosterStatus(0, 0);
    ASSERT_GT(loop.PendingTasks(), 0u);
    engine.reset();
    host.events.clear();
    // Answers and ticks still due find no way to the engine: under the sanitizer a touch of
    // the deleted engine fails the run, and no entry point traces, nor does the host hear.
    TraceCapture trace;
    loop.AdvanceBy(5.0);
    EXPECT_TRUE(trace.Lines().empty());
    EXPECT_TRUE(host.events.empty());
}

TEST_F(SessionTest, NullNamesLeaveStringsEmptyAndTagModeZeroDropsTheTag) {
    CChatClient engine;
    _tagChatData data = Data(nullptr, 7, nullptr);  // no reserved text, tag mode 0
    data.dwUserExternalTag = 2;
    engine.Initialize(data);
    EXPECT_TRUE(engine.MyName().empty());
    EXPECT_TRUE(engine.Reserved().empty());
    EXPECT_EQ(engine.UserExternalTag(), 0u);
}

TEST_F(SessionTest, LogTextsOfTheWalkAndOfTheHostCommands) {
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
            engine->Initialize(Data(conference.CreateClient(loop, node), node, "Alice", 0));
            ++node;
            loop.RunUntilIdle();
        }
        TraceCapture capture;
        act(engine);
        EXPECT_EQ(Matching(capture, lines), lines);
    }
}

}  // namespace
