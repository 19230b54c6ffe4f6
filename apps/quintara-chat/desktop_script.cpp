#include "apps/quintara-chat/desktop_script.h"

#include <cstring>

#include <QStandardItem>
#include <QTableView>

#include "apps/quintara-chat/desktop_participant.h"
#include "engine/chat_client.h"
#include "platform/sound.h"
#include "platform/warning_window.h"
#include "sim/lang/scenario_notation.h"
#include "ui/attd_data_source.h"
#include "ui/chat_menu_item.h"
#include "ui/chat_popup_button.h"
#include "ui/chat_select_attd_control.h"
#include "ui/kvo_text_field.h"
#include "ui/localized.h"
#include "ui/my_chat_controller.h"

namespace {

// The start-up takes its own time (about five seconds), whatever the script's wait.
constexpr double kStartupSeconds = 20;

std::uint32_t Number(const ScenarioArg& arg) {
    return *ParseScenarioNumber(arg.value);
}

// The transcript entry at index: its title without ":" and CR, its text with \n line breaks.
std::pair<std::string, std::string> Entry(const CChatContentStorage& store, std::size_t index) {
    const std::string_view line = store.GetLineAtIndex(index);
    const std::size_t tab = line.find('\t');
    std::string title(line.substr(0, tab));
    std::string text;
    if (tab != std::string_view::npos) {
        for (std::size_t i = tab + 1; i < line.size(); ++i) {
            if (line[i] != '\r') {
                text.push_back(line[i]);
                continue;
            }
            text.push_back('\n');
            if (i + 1 < line.size() && line[i + 1] == '\n') ++i;
        }
    }
    while (!title.empty() && (title.back() == '\r' || title.back() == ':'))
        title.pop_back();
    return {title, text};
}

}  // namespace

DesktopScript::DesktopScript(DesktopParticipant& me, std::FILE* out) : m_me(me), m_out(out) {
    SetWarningPresenter(
        [this](const char*, const char* message) { m_warnings.push_back(message ? message : ""); });
    SetSoundPlayer([this](const char*) { ++m_sounds; });
}

DesktopScript::~DesktopScript() {
    SetWarningPresenter(nullptr);
    SetSoundPlayer(nullptr);
}

int DesktopScript::Run(const std::vector<ScenarioCommand>& commands) {
    for (const ScenarioCommand& c : commands) {
        if (c.verb == "conference") continue;  // taken before the participant started
        if (!m_me.In() && c.verb != "tick") {
            Fail(c, "me has left the conference");
            continue;
        }
        Execute(c);
        if (m_me.In()) m_me.Settle();
    }
    return m_failures;
}

void DesktopScript::Execute(const ScenarioCommand& c) {
    const auto args = c.Positional();
    const ChatHandle me = m_me.Handle();
    const std::string& verb = c.verb;
    // The commands whose participant list (all of it optional) starts at that argument.
    static const std::pair<const char*, std::size_t> kListFrom[] = {
        {"privilege", 1}, {"before-host", 0},   {"practice", 1}, {"panel", 1},
        {"feature", 1},   {"nbr", 2},           {"config", 2},   {"roster-status", 2},
        {"sound", 2},     {"close-dialogs", 0}, {"print", 0}};
    for (const auto& [name, first] : kListFrom) {
        if (verb != name) continue;
        for (std::size_t i = first; i < args.size(); ++i)
            if (!IsMe(c, i)) return;
    }
    if (verb == "join") return Fail(c, "the command line joins this participant");
    if (verb == "fail" || verb == "inject")
        return Fail(c, "only the simulator's own conference can be made to fail or lie");
    if (verb == "answer" || verb == "save" || verb == "open")
        return Fail(c, "the desktop program leaves its save and open panels to the user");
    if (verb == "host" || verb == "presenter") return HostCall(c);
    if (verb == "roles") {
        if (!IsMe(c, 0)) return;
        const auto roles = ParseScenarioRoles(args[1]->value);
        if (!roles) return Fail(c, "roles takes host, presenter, panelist or attendee");
        ChSetRosters(me, *roles);
    } else if (verb == "privilege") {
        ChSetPrivilege(me, Number(*args[0]));
    } else if (verb == "before-host") {
        ChSetBeforeHostStatus(me, 1);
    } else if (verb == "practice") {
        ChSetPracticeStatus(me, args[0]->value == "on" ? 1 : 0);
    } else if (verb == "panel") {
        ChSetPanelStatus(me, Number(*args[0]));
    } else if (verb == "feature") {
        ChSelectFeature(me, Number(*args[0]), 0, 0, 0, 0, nullptr);
    } else if (verb == "nbr") {
        SetNBR2Status(me, Number(*args[0]), Number(*args[1]), 0);
    } else if (verb == "config") {
        ChSetConfig(me, Number(*args[0]), args[1]->value.c_str());
    } else if (verb == "roster-status") {
        ChSetRosterStatus(me, Number(*args[0]), Number(*args[1]));
    } else if (verb == "add-group") {
        if (!IsMe(c, 0)) return;
        _tagChatGroupInfo info{};
        info.dwIndex = Number(*args[1]);
        info.dwGroupType = Number(*args[2]);
        info.dwGroupId = Number(*args[3]);
        info.cszGroupName = args[4]->value.c_str();
        ChAddGroup(me, &info);
    } else if (verb == "select-node") {
        const auto node = ParseScenarioNumber(args[1]->value);
        if (!IsMe(c, 0)) return;
        if (!node) return Fail(c, "select-node takes me and a node number here");
        ChSelectUserByNodeId(me, *node);
    } else if (verb == "sound") {
        FSRef file{};
        std::strncpy(file.path, args[1]->value.c_str(), sizeof(file.path) - 1);
        ChSetSoundMode(me, static_cast<long>(Number(*args[0])));
        ChSetSoundFile(me, file);
    } else if (verb == "close-dialogs") {
        ChCloseAllDlg(me);
    } else if (verb == "select") {
        Select(c);
    } else if (verb == "say") {
        Say(c);
    } else if (verb == "pick") {
        Pick(c);
    } else if (verb == "leave") {
        if (IsMe(c, 0)) m_me.Leave();
    } else if (verb == "expect") {
        Expect(c);
    } else if (verb == "print") {
        Print();
    } else if (verb == "tick") {
        const double seconds = 0.5 * Number(*args[0]);
        DesktopParticipant::RunUntil([] { return false; }, seconds);
    } else if (verb == "startup") {
        // On a server the start-up is over once the component is enrolled and its privileges
        // were re-applied: a send-to choice made before then does not last.
        if (!m_me.WaitStartedUp(kStartupSeconds))
            Fail(c, "timed out: me has not finished starting up");
    } else {
        Fail(c, "unknown command " + verb);
    }
}

void DesktopScript::Fail(const ScenarioCommand& c, const std::string& message) {
    ++m_failures;
    std::fprintf(m_out, "line %d: %s: %s\n", c.line, c.verb.c_str(), message.c_str());
    std::fflush(m_out);
}

std::string DesktopScript::WaitFor(const ScenarioCommand& c, Check check) {
    std::string complaint;
    DesktopParticipant::RunUntil(
        [&] {
            complaint = m_me.In() ? (this->*check)(c) : "me has left the conference";
            return complaint.empty();
        },
        m_me.Options().waitSeconds);
    return complaint;
}

bool DesktopScript::IsMe(const ScenarioCommand& c, std::size_t index) {
    const auto args = c.Positional();
    if (index < args.size() && args[index]->value == "me") return true;
    Fail(c, "only me is in this process: " + (index < args.size() ? args[index]->value : ""));
    return false;
}

void DesktopScript::HostCall(const ScenarioCommand& c) {
    std::uint32_t node = m_me.Options().nodeId;
    if (const ScenarioArg* given = c.Option("node")) {
        node = Number(*given);
    } else if (!IsMe(c, 0)) {
        return;
    }
    c.verb == "host" ? ChSetHost(m_me.Handle(), node) : ChSetPresenter(m_me.Handle(), node);
}

void DesktopScript::Select(const ScenarioCommand& c) {
    if (!IsMe(c, 0)) return;
    // The entry of another participant appears once the server reports them.
    const std::string missing = WaitFor(c, &DesktopScript::SelectableNow);
    if (!missing.empty()) return Fail(c, "timed out: " + missing);
    const int index = SelectIndex(c);
    ChatPopUpButton* button = m_me.Window()->userlist();
    button->setCurrentIndex(index);
    emit button->activated(index);
}

void DesktopScript::Say(const ScenarioCommand& c) {
    if (!IsMe(c, 0)) return;
    const std::string closed = WaitFor(c, &DesktopScript::InputOpen);
    if (!closed.empty()) return Fail(c, "timed out: " + closed);
    MyChatController* window = m_me.Window();
    window->editView()->setPlainText(QString::fromStdString(c.Positional()[1]->value));
    window->onSend();
}

void DesktopScript::Pick(const ScenarioCommand& c) {
    if (!IsMe(c, 0)) return;
    // Other participants are known here by their node: the roster gives the picker's name.
    const auto node = ParseScenarioNumber(c.Positional()[1]->value);
    if (!node) return Fail(c, "pick takes me and a node number here");
    const CUserListManager& roster = m_me.Engine().UserList();
    std::string name;
    const bool known = DesktopParticipant::RunUntil(
        [&] {
            for (std::uint32_t i = 0; m_me.In() && i < roster.GetCount(); ++i) {
                const UserItem* user = roster.GetUserItemByIndex(i);
                if (user->dwNodeID != *node || !user->strName.GetData()) continue;
                name = user->strName.GetData();
                return true;
            }
            return false;
        },
        m_me.Options().waitSeconds);
    if (!known) return Fail(c, "timed out: nobody on node " + c.Positional()[1]->value + " joined");
    MyChatController* window = m_me.Window();
    ChatPopUpButton* button = window->userlist();
    const int entry = button->indexOfItemWithTitle(Localized("Select an Attendee..."));
    if (entry < 0 || !button->itemAtIndex(entry)->isEnabled())
        return Fail(c, "me has no attendee picker");
    button->setCurrentIndex(entry);
    emit button->activated(entry);
    ChatSelectAttdControl* picker = ChatSelectAttdControl::instance();
    if (!picker) return Fail(c, "the attendee picker did not open");
    const AttdDataSource* rows = picker->dataSource();
    for (int row = 0; row < rows->numberOfRowsInTableView(); ++row) {
        if (rows->itemNameAtIndex(row).toStdString() != name) continue;
        picker->tableView()->selectRow(row);
        picker->onOK();
        return;
    }
    picker->onCancel();
    Fail(c, "me's attendee picker does not list " + name);
}

void DesktopScript::Expect(const ScenarioCommand& c) {
    const auto args = c.Positional();
    if (!IsMe(c, 0)) return;
    const std::string& kind = args[1]->value;
    static const std::pair<const char*, Check> kChecks[] = {
        {"line", &DesktopScript::CheckLine},       {"menu", &DesktopScript::CheckMenu},
        {"input", &DesktopScript::CheckInput},     {"input-text", &DesktopScript::CheckInputText},
        {"warning", &DesktopScript::CheckWarning}, {"sound", &DesktopScript::CheckSound}};
    const CChatContentStorage& store = m_me.Engine().ChatContent();
    if (kind == "no-new-lines") {
        // Nothing can be awaited here: what was in flight has arrived once the service settled.
        if (store.GetLineCount() != m_linesSeen) {
            const auto [title, text] = Entry(store, store.GetLineCount() - 1);
            Fail(c, "me got " + std::to_string(store.GetLineCount() - m_linesSeen) +
                        " new line(s), the newest " + QuotedScenarioText(title) + " " +
                        QuotedScenarioText(text));
        }
        m_linesSeen = store.GetLineCount();
        return;
    }
    for (const auto& [name, check] : kChecks) {
        if (kind != name) continue;
        const std::string seen = WaitFor(c, check);
        if (!seen.empty()) Fail(c, "timed out: " + seen);
        if (kind == "warning") m_warnings.clear();
        if (m_me.In()) m_linesSeen = m_me.Engine().ChatContent().GetLineCount();
        return;
    }
    Fail(c, "expect " + kind + " is not available in the desktop program");
}

void DesktopScript::Print() {
    const CChatClient& engine = m_me.Engine();
    const CChatContentStorage& store = engine.ChatContent();
    std::fprintf(m_out, "== me (%s, node %u)\n", m_me.Options().displayName.c_str(),
                 m_me.Options().nodeId);
    for (std::size_t i = 0; i < store.GetLineCount(); ++i) {
        const auto [title, text] = Entry(store, i);
        std::fprintf(m_out, "  %s:\n    %s\n", title.c_str(), text.c_str());
    }
    std::fprintf(m_out, "  send-to list: %s\n", QuotedScenarioList(EngineMenu()).c_str());
    m_linesSeen = store.GetLineCount();
}

std::string DesktopScript::CheckLine(const ScenarioCommand& c) {
    const auto args = c.Positional();
    if (args.size() != 4) return "expect line takes a title and a text";
    const CChatContentStorage& store = m_me.Engine().ChatContent();
    if (store.GetLineCount() == 0) return "me's transcript is empty";
    // Lines of different senders travel different ways and may arrive in either order, so
    // any line not claimed by an earlier expectation will do.
    for (std::size_t i = 0; i < store.GetLineCount(); ++i) {
        if (m_claimed.count(i)) continue;
        const auto [title, text] = Entry(store, i);
        if (title != args[2]->value || text != args[3]->value) continue;
        m_claimed.insert(i);
        return "";
    }
    const auto [title, text] = Entry(store, store.GetLineCount() - 1);
    return "me's newest line is " + QuotedScenarioText(title) + " " + QuotedScenarioText(text);
}

std::string DesktopScript::CheckMenu(const ScenarioCommand& c) {
    const auto args = c.Positional();
    std::vector<std::string> expected;
    std::vector<std::string> modelExpected;
    for (std::size_t i = 2; i < args.size(); ++i) {
        expected.push_back(args[i]->value);
        if (args[i]->value != "?") modelExpected.push_back(args[i]->value);
    }
    const std::vector<std::string> model = EngineMenu();
    if (model != modelExpected) return "me's send-to list is " + QuotedScenarioList(model);
    const std::vector<std::string> popup = PopupMenu();
    if (popup != expected) return "me's popup shows " + QuotedScenarioList(popup);
    return "";
}

std::string DesktopScript::CheckInput(const ScenarioCommand& c) {
    const std::string& want = c.Positional()[2]->value;
    const bool enabled = m_me.Window() && m_me.Window()->editView()->isEnabled();
    if (enabled == (want == "enabled")) return "";
    return std::string("me's input is ") + (enabled ? "enabled" : "disabled");
}

std::string DesktopScript::CheckInputText(const ScenarioCommand& c) {
    const std::string text =
        m_me.Window() ? m_me.Window()->editView()->toPlainText().toStdString() : "";
    if (text == c.Positional()[2]->value) return "";
    return "me's input holds " + QuotedScenarioText(text);
}

std::string DesktopScript::CheckWarning(const ScenarioCommand& c) {
    if (m_warnings.empty()) return "me saw no warning";
    if (m_warnings.back() == c.Positional()[2]->value) return "";
    return "me's newest warning is " + QuotedScenarioText(m_warnings.back());
}

std::string DesktopScript::CheckSound(const ScenarioCommand& c) {
    const auto want = ParseScenarioNumber(c.Positional()[2]->value);
    if (want && static_cast<std::uint32_t>(m_sounds) == *want) return "";
    return "me heard " + std::to_string(m_sounds) + " sound(s)";
}

std::string DesktopScript::SelectableNow(const ScenarioCommand& c) {
    const int index = SelectIndex(c);
    if (index == -2) return "\"" + c.Positional()[1]->value + "\" appears twice; select by node=";
    if (index < 0) return "no such item in me's popup: " + QuotedScenarioList(PopupMenu());
    const ChatPopUpButton* button = m_me.Window()->userlist();
    if (!button->isEnabled() || !button->itemAtIndex(index)->isEnabled())
        return "the item is disabled in me's popup";
    return "";
}

std::string DesktopScript::InputOpen(const ScenarioCommand&) {
    if (m_me.Window() && m_me.Window()->editView()->isEnabled()) return "";
    return "me's input field is disabled";
}

int DesktopScript::SelectIndex(const ScenarioCommand& c) const {
    if (!m_me.Window()) return -1;
    if (const ScenarioArg* node = c.Option("node")) {
        const MenuStatusList& menu = m_me.Engine().Menu();
        for (std::size_t i = 0; i < menu.size(); ++i)
            if (menu[i].dwNodeID == Number(*node) && !menu[i].bSeparator)
                return static_cast<int>(i);
        return -1;
    }
    const auto args = c.Positional();
    if (args.size() < 2) return -1;
    const ChatPopUpButton* button = m_me.Window()->userlist();
    int index = -1;
    for (int i = 0; i < button->numberOfItems(); ++i) {
        const QStandardItem* row = button->itemAtIndex(i);
        const ChatMenuItem* item = ChatMenuItem::From(button->itemAtIndex(i));
        const QString title = item && item->hasFullTitle() ? item->fullTitle() : row->text();
        if (ChatMenuItem::IsSeparator(row) || title.toStdString() != args[1]->value) continue;
        if (index >= 0) return -2;
        index = i;
    }
    return index;
}

std::vector<std::string> DesktopScript::EngineMenu() const {
    std::vector<std::string> items;
    for (const MenuStatus& entry : m_me.Engine().Menu())
        items.push_back(MenuEntryNotation(entry.strTitle,
                                          entry.bSeparator && entry.strTitle.empty(),
                                          entry.bSelected, entry.bEnabled));
    return items;
}

std::vector<std::string> DesktopScript::PopupMenu() const {
    std::vector<std::string> items;
    if (!m_me.Window()) return items;
    const ChatPopUpButton* button = m_me.Window()->userlist();
    const QString placeholder = Localized("--- Please Select ---");
    for (int i = 0; i < button->numberOfItems(); ++i) {
        const QStandardItem* row = button->itemAtIndex(i);
        const ChatMenuItem* item = ChatMenuItem::From(button->itemAtIndex(i));
        const QString title = item && item->hasFullTitle() ? item->fullTitle() : row->text();
        const bool separator = ChatMenuItem::IsSeparator(row);
        if (!separator && row->text() == placeholder) {
            items.push_back("?");
            continue;
        }
        items.push_back(MenuEntryNotation(title.toStdString(), separator,
                                          i == button->currentIndex(), row->isEnabled()));
    }
    return items;
}
