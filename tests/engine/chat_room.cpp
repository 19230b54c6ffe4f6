#include "tests/engine/chat_room.h"

#include "api/ui_protocol.h"
#include "tests/engine/menu_harness.h"

namespace chatroom {

constexpr std::uint32_t kSession = 5;

Member& ChatRoom::Join(const Person& person, IHostChatSink* hostSink) {
    members.push_back(std::make_unique<Member>());
    Member& m = *members.back();
    m.person = person;
    m.client = conference.CreateClient(loop, person.node);
    m.engine.SetRosters(person.roles, 0);
    if (m_features != 0) m.engine.SelectFeature(m_features, 0, 0, 0, 0, nullptr);
    if (beforeStart) beforeStart(m.engine);
    _tagChatData data = StartRecord(m.client, conference.ConferenceId(), kSession, person.name,
                                    person.node, m_meetingType);
    data.pHostSink = hostSink;
    m.engine.Initialize(data);
    m.window = static_cast<RecordingWindow*>(m.engine.ChatUI());
    Run();
    return m;
}

void ChatRoom::SetHostAndPresenter(std::uint32_t hostNode, std::uint32_t presenterNode) {
    for (auto& m : members) {
        m->engine.OnHostChanged(hostNode);
        m->engine.OnPresenterChanged(presenterNode);
        m->engine.SubscribeAllGroupCaches();
    }
    loop.AdvanceBy(6.0);
}

bool ChatRoom::Select(Member& from, std::int32_t groupId, std::uint32_t node) {
    CChatClient& engine = from.engine;
    std::int32_t index =
        groupId >= 0 ? engine.GetIndexOfMenuByGroup(groupId) : engine.GetIndexOfMenuByNodeID(node);
    if (index == -1 && groupId >= 0) {
        // The group's own name updates the group instead of adding one without a cache.
        const char* name =
            engine.GetGroupNameFromGroupCacheHandle(engine.GetCacheHandleFormGroupId(groupId));
        menutest::AddGroup(engine, static_cast<std::uint32_t>(engine.Menu().size()), 1,
                           static_cast<std::uint32_t>(groupId), name ? name : "Audience");
        index = engine.GetIndexOfMenuByGroup(groupId);
    } else if (index == -1) {
        const UserItem* user = engine.UserList().GetUserItemFromNodeId(node);
        engine.InsertChatUserName(user ? user->strName.GetData() : "?", node, 0);
        index = engine.GetIndexOfMenuByNodeID(node);
    }
    if (index == -1) return false;
    engine.HandleUIMessage(msg_SelectionChanged, &index, nullptr);
    return true;
}

void ChatRoom::Say(Member& from, const std::string& text, std::int32_t groupId,
                   std::uint32_t node) {
    Select(from, groupId, node);
    from.window->inputText = text;
    from.engine.HandleUIMessage(msg_SendChat, nullptr, nullptr);
    Run();
}

std::vector<std::string> ChatRoom::Transcript(const Member& member) {
    std::vector<std::string> lines;
    const CChatContentStorage& content = member.engine.ChatContent();
    for (std::size_t i = 0; i < content.GetLineCount(); ++i) {
        std::string line(content.GetLineAtIndex(i));
        const std::size_t end = line.find(":\r\t");
        if (end != std::string::npos) line.replace(end, 3, "|");
        lines.push_back(line);
    }
    return lines;
}

std::vector<std::string> ChatRoom::Holders(const std::string& line) const {
    std::vector<std::string> names;
    for (const auto& m : members) {
        const std::vector<std::string> lines = Transcript(*m);
        if (!lines.empty() && lines.back() == line) names.push_back(m->person.name);
    }
    return names;
}

}  // namespace chatroom
