// The demo host: a conference on the in-process service with three participants, each a
// chat component driven through its exported functions. It prints how each walked from
// connect to enrolment, then what each one knows: named handles, roster and send-to menu.
// Then everybody chats: a line to each audience of its menu and a private line, and each
// transcript shows who received what.
#include <cstdio>
#include <memory>
#include <string>
#include <vector>

#include "api/quintarachat.h"
#include "api/window_bridge.h"
#include "engine/chat_client.h"
#include "platform/inproc_conference.h"
#include "platform/trace.h"
#include "platform/virtual_run_loop.h"

namespace {

constexpr std::uint32_t kSessionId = 1;

// The chat window of a demo participant: it types what the demo gives it.
class TypingWindow final : public IChatWindow {
public:
    void SetSuperView(void*) override {}
    void SetSink(IChatCommSinkForChatUI*) override {}
    int HandleCommand(int command, void* inParam, void*) override {
        if (command == msg_GetInputText) *static_cast<std::string*>(inParam) = typed;
        return 0;
    }
    std::string typed;
};

struct Person {
    const char* name;
    std::uint32_t nodeId;
    std::uint32_t roles;
};

// One participant: its own run loop (the host's main loop), service object and component.
struct Participant {
    Person person;
    VirtualRunLoop loop;
    ChatHandle handle = nullptr;
    std::vector<std::string> walk;  // the steps its engine logged
};

CChatClient* Engine(const Participant& p) {
    return static_cast<CChatClient*>(p.handle);
}

// The engine steps worth showing, as they appear in its trace.
bool IsWalkStep(const std::string& text) {
    static const char* const kSteps[] = {"Enter CChatClient::Initialize",
                                         "Enter CChatClient::ConnectConfirm",
                                         "Enter CChatClient::ConferenceJoinConfirm",
                                         "Enter CChatClient::::ApeAttachConfirm",
                                         "Enter CChatClient::Enroll",
                                         "Enter CChatClient::ApeEnrollConfirm",
                                         "Enter CChatClient::AllocNameHandleConfirm",
                                         "Enter CChatClient::SetAllCaches",
                                         "Enter CChatClient::SubscribeAllGroupCaches"};
    for (const char* step : kSteps)
        if (text.rfind(step, 0) == 0) return true;
    return false;
}

// Runs one participant's loop for a while, collecting its walk from the trace.
void Run(Participant& p, double seconds) {
    ScopedCurrentRunLoop current(&p.loop);
    SetTraceSink([&p](TraceLevel, const char*, const char* text) {
        if (IsWalkStep(text)) p.walk.push_back(text + 6);  // without "Enter "
    });
    p.loop.RunUntilIdle();
    p.loop.AdvanceBy(seconds);
    SetTraceSink([](TraceLevel, const char*, const char*) {});
}

std::string RoleText(std::uint32_t roles) {
    std::string text;
    if (roles & ROLE_HOST) text += "host ";
    if (roles & ROLE_PRESENTER) text += "presenter ";
    if (roles & ROLE_PANELIST) text += "panelist ";
    return text.empty() ? "attendee" : text.substr(0, text.size() - 1);
}

void PrintHandles(const CChatClient& engine) {
    std::printf("  named handles:\n");
    const CUsersGroupList& groups = engine.GroupList();
    for (std::int32_t i = 0; i < groups.GetGroupsCount(); ++i) {
        const CUsersGroup* group = groups.GetGroupByIndex(i);
        if (!group || group->GetGroupType() == 2) continue;
        std::printf("    %-28s %u\n", group->GetCacheName() ? group->GetCacheName() : "",
                    group->GetCacheHandle());
    }
    for (const NameHandle* handle :
         {&engine.UserInfoCacheHandle(), &engine.ChatStatusCacheHandle()})
        std::printf("    %-28.64s %u\n", handle->name, handle->handle_value);
}

void PrintRoster(const CChatClient& engine) {
    std::printf("  roster:\n");
    const CUserListManager& roster = engine.UserList();
    for (std::uint32_t i = 0; i < roster.GetCount(); ++i) {
        const UserItem* user = roster.GetUserItemByIndex(i);
        std::printf("    node %-4u user %-6u %-8s %s\n", user->dwNodeID, user->dwUserID,
                    user->strName.GetData() ? user->strName.GetData() : "",
                    RoleText(user->dwRoles).c_str());
    }
}

// Types text and sends it to the menu entry at index, as a user picking it would.
void Say(Participant& p, int index, const std::string& text) {
    CChatClient* engine = Engine(p);
    static_cast<TypingWindow*>(engine->ChatUI())->typed = text;
    engine->HandleUIMessage(msg_SelectionChanged, &index, nullptr);
    engine->HandleUIMessage(msg_SendChat, nullptr, nullptr);
}

// A line to every audience the participant may choose, and one private line.
void ChatRound(Participant& p) {
    ScopedCurrentRunLoop current(&p.loop);
    const MenuStatusList menu = Engine(p)->Menu();
    bool privately = false;
    for (std::size_t i = 0; i < menu.size(); ++i) {
        const MenuStatus& entry = menu[i];
        if (!entry.bEnabled || entry.bSeparator || entry.nGroupID == GROUP_SELECT_ATTENDEE)
            continue;
        if (entry.nGroupID != -1) {
            Say(p, static_cast<int>(i), std::string("hello, ") + entry.strTitle);
        } else if (!privately) {
            Say(p, static_cast<int>(i), "a private word for " + entry.strTitle);
            privately = true;
        }
    }
}

void PrintTranscript(const CChatClient& engine) {
    std::printf("  transcript:\n");
    const CChatContentStorage& content = engine.ChatContent();
    for (std::size_t i = 0; i < content.GetLineCount(); ++i) {
        const std::string line(content.GetLineAtIndex(i));
        const std::size_t tab = line.find('\t');
        std::printf("    %s\n      %s\n", line.substr(0, line.find(":\r")).c_str(),
                    tab == std::string::npos ? "" : line.substr(tab + 1).c_str());
    }
}

void PrintMenu(const CChatClient& engine) {
    std::printf("  send-to menu:\n");
    for (const MenuStatus& entry : engine.Menu()) {
        if (entry.bSeparator) {
            std::printf("    ------------\n");
            continue;
        }
        std::printf("    %s %-24s%s\n", entry.bSelected ? "*" : " ", entry.strTitle.c_str(),
                    entry.bEnabled ? "" : " (disabled)");
    }
}

}  // namespace

int main() {
    SetTraceSink([](TraceLevel, const char*, const char*) {});
    InProcessConference conference;
    const Person people[] = {
        {"Hana Host", 101, ROLE_HOST},
        {"Pavel Panelist", 102, ROLE_PANELIST},
        {"Ada Attendee", 103, 0},
    };
    SetChatWindowFactory([] { return new TypingWindow; });
    std::vector<std::unique_ptr<Participant>> participants;
    for (const Person& person : people) {
        auto p = std::make_unique<Participant>();
        p->person = person;
        participants.push_back(std::move(p));
    }

    std::printf("Quintara Chat demo: a meeting (type 3) on the in-process conference\n\n");
    for (auto& p : participants) {
        ScopedCurrentRunLoop current(&p->loop);
        p->handle = ChNewInstance();
        ChSetRosters(p->handle, p->person.roles);
        _tagChatData data{};
        data.pArmClient = conference.CreateClient(p->loop, p->person.nodeId);
        data.wConferenceID = conference.ConferenceId();
        data.dwSessionID = kSessionId;
        data.lpszUserName = p->person.name;
        data.dwNodeID = p->person.nodeId;
        data.lMeetingType = 3;
        SetTraceSink([&p](TraceLevel, const char*, const char* text) {
            if (IsWalkStep(text)) p->walk.push_back(text + 6);
        });
        ChInitialize(p->handle, &data);
        Run(*p, 0.0);
    }
    // The host names the host; then everybody's loop runs through the start-up ticks.
    for (auto& p : participants) {
        ScopedCurrentRunLoop current(&p->loop);
        ChSetHost(p->handle, people[0].nodeId);
    }
    for (int round = 0; round < 3; ++round)
        for (auto& p : participants)
            Run(*p, 2.0);
    for (auto& p : participants) {
        ChatRound(*p);
        for (auto& q : participants)
            Run(*q, 0.0);
    }
    for (auto& p : participants)
        Run(*p, 0.0);

    for (auto& p : participants) {
        const CChatClient& engine = *Engine(*p);
        std::printf("%s (node %u, %s)\n", p->person.name, p->person.nodeId,
                    RoleText(p->person.roles).c_str());
        std::printf("  walk:\n");
        for (const std::string& step : p->walk)
            std::printf("    %s\n", step.c_str());
        std::printf("  state %d, user id %u, session value %u\n", engine.State(), engine.MyUserID(),
                    engine.SessionValue());
        PrintHandles(engine);
        PrintRoster(engine);
        PrintMenu(engine);
        PrintTranscript(engine);
        std::printf("\n");
    }

    for (auto& p : participants) {
        ScopedCurrentRunLoop current(&p->loop);
        ChDeleteInstance(p->handle);
    }
    SetChatWindowFactory(nullptr);
    return 0;
}
