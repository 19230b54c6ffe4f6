// The conference line, joining, and the host client's calls on the components.
#include <cstdio>
#include <cstring>

#include "engine/chat_client.h"
#include "sim/simulator.h"

namespace {

std::uint32_t Number(const ScenarioArg& arg) {
    return *ParseScenarioNumber(arg.value);
}

std::uint32_t OptionNumber(const ScenarioCommand& c, const char* key, std::uint32_t fallback) {
    const ScenarioArg* arg = c.Option(key);
    return arg ? Number(*arg) : fallback;
}

}  // namespace

void Simulator::Conference(const ScenarioCommand& c) {
    m_meetingType = static_cast<std::int32_t>(OptionNumber(c, "type", 0));
    m_bQM = !c.Positional().empty();
    m_sessionId = OptionNumber(c, "session", 1);
    if (const ScenarioArg* start = c.Option("start")) {
        CalendarTime origin;
        char extra = 0;
        const int fields =
            std::sscanf(start->value.c_str(), "%d-%d-%d %d:%d:%d%c", &origin.year, &origin.month,
                        &origin.day, &origin.hour, &origin.minute, &origin.second, &extra);
        if (fields != 6 || !m_clock.SetCalendarOrigin(origin))
            Fail(c, "start= takes a time such as \"2009-03-05 09:03:00\", not " + start->value);
    }
    if (m_options.server) {
        m_nats = std::make_unique<NatsParticipants>(*m_options.server);
    } else {
        m_conference = std::make_unique<InProcessConference>();
    }
    Settle();
}

void Simulator::Join(const ScenarioCommand& c) {
    const std::string name = c.Positional()[0]->value;
    for (const auto& p : m_participants) {
        if (p->name == name && !p->left) return Fail(c, name + " has already joined");
    }
    std::optional<std::uint32_t> roles;
    if (const ScenarioArg* arg = c.Option("roles")) {
        roles = ParseScenarioRoles(arg->value);
        if (!roles)
            return Fail(c, "roles= takes host, presenter, panelist or attendee: " + arg->value);
    }
    auto p = std::make_unique<Participant>();
    p->name = name;
    p->displayName = c.Option("name") ? c.Option("name")->value : name;
    p->nodeId = OptionNumber(c, "node", 0);
    p->loop = std::make_unique<ParticipantLoop>(SharedLoop(), name);
    IArmClient* service = nullptr;
    if (m_nats) {
        std::string error;
        service = m_nats->Create(name, p->nodeId, *p->loop, &error);
        if (!service) return Fail(c, error);
    } else {
        p->client = m_conference->CreateClient(*p->loop, p->nodeId);
        service = p->client;
    }
    p->service = std::make_unique<WatchedArmClient>(service);
    Participant& joined = *p;
    m_participants.push_back(std::move(p));

    ActingScope acting(*joined.loop);
    m_pNewWindow = nullptr;
    joined.handle = ChNewInstance();
    _tagChatData data{};
    data.pArmClient = joined.service.get();
    data.wConferenceID = m_nats ? m_nats->ConferenceId() : m_conference->ConferenceId();
    data.dwSessionID = m_sessionId;
    data.lpszUserName = joined.displayName.c_str();
    data.dwNodeID = joined.nodeId;
    data.lMeetingType = m_meetingType;
    data.bUseAttendeeSelector = c.Positional().size() > 1 ? 1 : 0;
    data.lExternalTagMode = static_cast<std::int32_t>(OptionNumber(c, "extmode", 0));
    data.dwUserExternalTag = OptionNumber(c, "tag", 0);
    ChInitialize(joined.handle, &data);
    joined.window = m_pNewWindow;

    // What a host hands over before the connection chain completes, in the host's order.
    if (c.Option("customer")) {
        const std::string xml = "<chat ver=\"1.0\"><mtype>11</mtype><customerid>" +
                                std::to_string(OptionNumber(c, "customer", 0)) +
                                "</customerid></chat>";
        ChSetConfig(joined.handle, 3, xml.c_str());
    }
    if (const ScenarioArg* faq = c.Option("faq")) ChSetConfig(joined.handle, 2, faq->value.c_str());
    if (c.Option("features") || m_bQM) {
        const std::uint32_t features =
            OptionNumber(c, "features", 0) | (m_bQM ? FEATURE_QM_MODE : 0);
        ChSelectFeature(joined.handle, features, 0, 0, 0, 0, nullptr);
    }
    if (roles) ChSetRosters(joined.handle, *roles);
    if (c.Option("privilege")) ChSetPrivilege(joined.handle, OptionNumber(c, "privilege", 0));
    Settle();
}

void Simulator::HostOrPresenter(const ScenarioCommand& c) {
    std::optional<std::uint32_t> node;
    if (c.Option("node")) {
        node = OptionNumber(c, "node", 0);
    } else if (Participant* holder = Find(c, c.Positional()[0]->value)) {
        node = holder->nodeId;
    }
    if (!node) return;
    const bool host = c.verb == "host";
    ForEach(c, c.Positional().size(), [&](Participant& p) {
        host ? ChSetHost(p.handle, *node) : ChSetPresenter(p.handle, *node);
    });
}

void Simulator::Roles(const ScenarioCommand& c) {
    const auto roles = ParseScenarioRoles(c.Positional()[1]->value);
    if (!roles) return Fail(c, "roles takes host, presenter, panelist or attendee");
    Participant* p = Find(c, c.Positional()[0]->value);
    if (!p) return;
    {
        ActingScope acting(*p->loop);
        ChSetRosters(p->handle, *roles);
    }
    Settle();
}

void Simulator::Privilege(const ScenarioCommand& c) {
    const std::uint32_t value = Number(*c.Positional()[0]);
    ForEach(c, 1, [&](Participant& p) { ChSetPrivilege(p.handle, value); });
}

void Simulator::BeforeHost(const ScenarioCommand& c) {
    ForEach(c, 0, [](Participant& p) { ChSetBeforeHostStatus(p.handle, 1); });
}

void Simulator::Practice(const ScenarioCommand& c) {
    const signed char on = c.Positional()[0]->value == "on" ? 1 : 0;
    ForEach(c, 1, [&](Participant& p) { ChSetPracticeStatus(p.handle, on); });
}

void Simulator::Panel(const ScenarioCommand& c) {
    const std::uint32_t status = Number(*c.Positional()[0]);
    ForEach(c, 1, [&](Participant& p) { ChSetPanelStatus(p.handle, status); });
}

void Simulator::Feature(const ScenarioCommand& c) {
    const std::uint32_t features = Number(*c.Positional()[0]) | (m_bQM ? FEATURE_QM_MODE : 0);
    ForEach(c, 1,
            [&](Participant& p) { ChSelectFeature(p.handle, features, 0, 0, 0, 0, nullptr); });
}

void Simulator::Nbr(const ScenarioCommand& c) {
    const std::uint32_t status = Number(*c.Positional()[0]);
    const std::uint32_t option = Number(*c.Positional()[1]);
    ForEach(c, 2, [&](Participant& p) { SetNBR2Status(p.handle, status, option, 0); });
}

void Simulator::Config(const ScenarioCommand& c) {
    const std::uint32_t type = Number(*c.Positional()[0]);
    const std::string xml = c.Positional()[1]->value;
    ForEach(c, 2, [&](Participant& p) { ChSetConfig(p.handle, type, xml.c_str()); });
}

void Simulator::RosterStatus(const ScenarioCommand& c) {
    const std::uint32_t need = Number(*c.Positional()[0]);
    const std::uint32_t broadcast = Number(*c.Positional()[1]);
    ForEach(c, 2, [&](Participant& p) { ChSetRosterStatus(p.handle, need, broadcast); });
}

void Simulator::AddGroup(const ScenarioCommand& c) {
    const auto args = c.Positional();
    _tagChatGroupInfo info{};
    info.dwIndex = Number(*args[1]);
    info.dwGroupType = Number(*args[2]);
    info.dwGroupId = Number(*args[3]);
    info.cszGroupName = args[4]->value.c_str();
    Participant* p = Find(c, args[0]->value);
    if (!p) return;
    {
        ActingScope acting(*p->loop);
        ChAddGroup(p->handle, &info);
    }
    Settle();
}

void Simulator::SelectNode(const ScenarioCommand& c) {
    const auto args = c.Positional();
    Participant* p = Find(c, args[0]->value);
    const std::optional<std::uint32_t> node = NodeOf(c, args[1]->value);
    if (!p || !node) return;
    {
        ActingScope acting(*p->loop);
        ChSelectUserByNodeId(p->handle, *node);
    }
    Settle();
}

void Simulator::Sound(const ScenarioCommand& c) {
    const long mode = static_cast<long>(Number(*c.Positional()[0]));
    FSRef file{};
    std::strncpy(file.path, c.Positional()[1]->value.c_str(), sizeof(file.path) - 1);
    ForEach(c, 2, [&](Participant& p) {
        ChSetSoundMode(p.handle, mode);
        ChSetSoundFile(p.handle, file);
    });
}

void Simulator::CloseDialogs(const ScenarioCommand& c) {
    ForEach(c, 0, [](Participant& p) { ChCloseAllDlg(p.handle); });
}
