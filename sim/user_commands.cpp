// What users do (choose, type, pick, save, open, leave) and the faults a scenario injects.
#include "engine/chat_client.h"
#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"
#include "sim/simulator.h"

namespace {

// The service operations a scenario can make fail, by the names the service gives them.
constexpr struct {
    const char* name;
    ArmOperation op;
} kOperations[] = {
    {"Connect", ArmOperation::Connect},
    {"Destroy", ArmOperation::Destroy},
    {"SetSendOption", ArmOperation::SetSendOption},
    {"ConferenceJoin", ArmOperation::ConferenceJoin},
    {"ConferenceLeave", ArmOperation::ConferenceLeave},
    {"ApeAttach", ArmOperation::ApeAttach},
    {"ApeEnroll", ArmOperation::ApeEnroll},
    {"ApeSendData", ArmOperation::ApeSendData},
    {"ApeDetach", ArmOperation::ApeDetach},
    {"RegisterSharedDataSink", ArmOperation::RegisterSharedDataSink},
    {"AllocNameHandle", ArmOperation::AllocNameHandle},
    {"ApeSharedDataActionEx", ArmOperation::ApeSharedDataActionEx},
    {"ApeRequestSharedDataEx", ArmOperation::ApeRequestSharedDataEx},
    {"AllocMemHandle", ArmOperation::AllocMemHandle},
    {"FreeMemHandle", ArmOperation::FreeMemHandle},
    {"GetMemHandleSize", ArmOperation::GetMemHandleSize},
    {"WriteMemHandle", ArmOperation::WriteMemHandle},
    {"ReadMemHandle", ArmOperation::ReadMemHandle},
};

std::vector<std::uint8_t> Bytes(const std::string& text) {
    return std::vector<std::uint8_t>(text.begin(), text.end());
}

}  // namespace

void Simulator::Select(const ScenarioCommand& c) {
    Participant* p = Find(c, c.Positional()[0]->value);
    if (!p) return;
    if (!p->window) return Fail(c, p->name + " has no window");
    int index = -1;
    if (const ScenarioArg* node = c.Option("node")) {
        const std::uint32_t wanted = *ParseScenarioNumber(node->value);
        const MenuStatusList& menu = Engine(*p).Menu();
        for (std::size_t i = 0; i < menu.size() && index < 0; ++i)
            if (menu[i].dwNodeID == wanted && !menu[i].bSeparator) index = static_cast<int>(i);
        if (index < 0) return Fail(c, "no entry for node " + node->value);
    } else {
        const std::string& title = c.Positional()[1]->value;
        const std::vector<PopupItem> popup = p->window->Popup();
        for (std::size_t i = 0; i < popup.size(); ++i) {
            if (popup[i].separator || popup[i].title != title) continue;
            if (index >= 0) return Fail(c, "\"" + title + "\" appears twice; select by node=");
            index = static_cast<int>(i);
        }
        if (index < 0) return Fail(c, "no item \"" + title + "\" in " + p->name + "'s popup");
    }
    bool chosen;
    {
        ActingScope acting(*p->loop);
        chosen = p->window->Choose(index);
    }
    Settle();
    if (!chosen) Fail(c, p->name + " cannot choose that item (disabled or popup off)");
}

void Simulator::Say(const ScenarioCommand& c) {
    Participant* p = Find(c, c.Positional()[0]->value);
    if (!p) return;
    if (!p->window) return Fail(c, p->name + " has no window");
    bool typed;
    {
        ActingScope acting(*p->loop);
        typed = p->window->TypeAndSend(c.Positional()[1]->value);
    }
    Settle();
    if (!typed) Fail(c, p->name + "'s input field is disabled");
}

void Simulator::Pick(const ScenarioCommand& c) {
    Participant* p = Find(c, c.Positional()[0]->value);
    Participant* other = Find(c, c.Positional()[1]->value);
    if (!p || !other) return;
    if (!p->window) return Fail(c, p->name + " has no window");
    // One attendee picker per process: whoever has one open loses it first.
    for (auto& q : m_participants) {
        if (q->left || !q->window) continue;
        ActingScope acting(*q->loop);
        q->window->CloseAttendeePicker();
    }
    Settle();
    bool picked;
    {
        ActingScope acting(*p->loop);
        picked = p->window->PickAttendee(other->displayName);
    }
    Settle();
    if (!picked) Fail(c, p->name + "'s attendee picker does not list " + other->displayName);
}

void Simulator::Answer(const ScenarioCommand& c) {
    const std::string& kind = c.Positional()[0]->value;
    const ScenarioArg& value = *c.Positional()[1];
    if (kind == "warning") {
        const auto button = ParseScenarioNumber(value.value);
        if (!button || value.quoted) return Fail(c, "answer warning takes a button number");
        m_warningAnswers.push_back(static_cast<int>(*button));
        return;
    }
    std::optional<std::string> path;
    if (value.quoted) {
        path = value.value;
    } else if (value.value != "cancel") {
        return Fail(c, "answer " + kind + " takes a path in quotes or cancel");
    }
    (kind == "save" ? m_saveAnswers : m_openAnswers).push_back(path);
}

void Simulator::SaveOrOpen(const ScenarioCommand& c) {
    Participant* p = Find(c, c.Positional()[0]->value);
    if (!p) return;
    const bool save = c.verb == "save";
    (save ? m_saveAnswers : m_openAnswers).push_front(c.Positional()[1]->value);
    {
        ActingScope acting(*p->loop);
        save ? ChFileSaveAs(p->handle) : ChFileOpen(p->handle);
    }
    Settle();
}

void Simulator::Leave(const ScenarioCommand& c) {
    Participant* p = Find(c, c.Positional()[0]->value);
    if (!p) return;
    {
        ActingScope acting(*p->loop);
        ChDeleteInstance(p->handle);
    }
    p->left = true;
    p->window = nullptr;
    Settle();
}

void Simulator::FailOperation(const ScenarioCommand& c) {
    Participant* p = Find(c, c.Positional()[0]->value);
    if (!p) return;
    if (!p->client) return Fail(c, "only the in-process conference fails on request");
    const std::string& name = c.Positional()[1]->value;
    const int result = static_cast<int>(*ParseScenarioNumber(c.Positional()[2]->value));
    const ScenarioArg* times = c.Option("times");
    for (const auto& entry : kOperations) {
        if (name != entry.name) continue;
        p->client->FailNext(entry.op, result,
                            times ? static_cast<int>(*ParseScenarioNumber(times->value)) : 1);
        return;
    }
    Fail(c, "no service operation called " + name);
}

void Simulator::Inject(const ScenarioCommand& c) {
    const auto args = c.Positional();
    Participant* p = Find(c, args[0]->value);
    if (!p) return;
    if (!p->client) return Fail(c, "only the in-process conference takes crafted deliveries");
    const std::string& kind = args[1]->value;
    const ScenarioArg* sender = c.Option("sender");
    bool delivered = false;
    if (kind == "bytes") {
        if (args.size() != 3) return Fail(c, "inject NAME bytes takes one string");
        const std::uint32_t senderId = sender ? *ParseScenarioNumber(sender->value) : 0;
        delivered = p->client->InjectPrivateData(senderId, Bytes(args[2]->value));
    } else {
        if (args.size() != 4 || !args[3]->quoted)
            return Fail(c, "inject NAME " + kind + " FROM \"text\"");
        Participant* from = Find(c, args[2]->value);
        if (!from) return;
        const std::uint32_t fromUser = from->client->UserId();
        const std::uint32_t senderId = sender ? *ParseScenarioNumber(sender->value) : fromUser;
        if (kind == "private") {
            CPrivateMessagePDU pdu;
            pdu.SetSendID(fromUser);
            pdu.SetSenderName(from->displayName);
            pdu.SetReveID(p->client->UserId());
            pdu.SetReceiverName(p->displayName);
            pdu.SetMessageContent(args[3]->value);
            pdu.GenerateXMLPDU();
            delivered = p->client->InjectPrivateData(senderId, Bytes(pdu.ToWireText()));
        } else {
            CGroupMessagePDU pdu;
            pdu.SetSendID(fromUser);
            pdu.SetSendNodeId(from->nodeId);
            pdu.SetSenderName(from->displayName);
            pdu.SetGroupID(GROUP_EVERYONE);
            pdu.SetMessageContent(args[3]->value);
            pdu.GenerateXMLPDU();
            ArmCacheDelivery delivery;
            delivery.entityId = Engine(*p).GetCacheHandleFromGroupId(GROUP_EVERYONE);
            delivery.senderId = senderId;
            delivered = p->client->InjectCacheDelivery(delivery, Bytes(pdu.ToWireText()));
        }
    }
    Settle();
    if (!delivered) Fail(c, p->name + " is not attached to the conference");
}
