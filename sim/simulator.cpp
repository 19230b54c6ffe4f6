// The simulator's running core: dispatch, settling, the clock, participants and the end.
#include "sim/simulator.h"

#include <QCoreApplication>
#include <QEventLoop>
#include <QTimer>
#include "engine/chat_client.h"
#include "platform/sound.h"
#include "platform/trace.h"
#include "platform/warning_window.h"

#include "sim/qt_window.h"
#include "sim/scripted_panels.h"

namespace {

const char* LevelName(TraceLevel level) {
    switch (level) {
        case TraceLevel::Info:
            return "info";
        case TraceLevel::Warn:
            return "warn";
        case TraceLevel::Error:
            return "error";
    }
    return "?";
}

}  // namespace

const Simulator::CommandEntry Simulator::kCommands[] = {
    {"conference", &Simulator::Conference},
    {"join", &Simulator::Join},
    {"host", &Simulator::HostOrPresenter},
    {"presenter", &Simulator::HostOrPresenter},
    {"roles", &Simulator::Roles},
    {"privilege", &Simulator::Privilege},
    {"before-host", &Simulator::BeforeHost},
    {"practice", &Simulator::Practice},
    {"panel", &Simulator::Panel},
    {"feature", &Simulator::Feature},
    {"nbr", &Simulator::Nbr},
    {"config", &Simulator::Config},
    {"roster-status", &Simulator::RosterStatus},
    {"add-group", &Simulator::AddGroup},
    {"select-node", &Simulator::SelectNode},
    {"sound", &Simulator::Sound},
    {"close-dialogs", &Simulator::CloseDialogs},
    {"select", &Simulator::Select},
    {"say", &Simulator::Say},
    {"pick", &Simulator::Pick},
    {"answer", &Simulator::Answer},
    {"save", &Simulator::SaveOrOpen},
    {"open", &Simulator::SaveOrOpen},
    {"leave", &Simulator::Leave},
    {"fail", &Simulator::FailOperation},
    {"inject", &Simulator::Inject},
    {"expect", &Simulator::Expect},
    {"print", &Simulator::Print},
    {"tick", &Simulator::TickCommand},
    {"startup", &Simulator::Startup},
};

Simulator::Simulator(SimOptions options) : m_options(std::move(options)) {
    if (m_options.gui) m_qtLoop = std::make_unique<QtRunLoop>();
    std::FILE* log = m_options.log;
    const bool networked = m_options.server.has_value();
    SetTraceSink([this, log, networked](TraceLevel level, const char* tag, const char* text) {
        const std::string& acting = ParticipantLoop::Acting();
        // A server that cannot be reached or refuses a participant says so only here; a run
        // in which nobody could talk must not pass for one in which all went well.
        if (networked && level == TraceLevel::Error) {
            ++m_failures;
            std::fprintf(m_options.out, "[%s] error: %s\n", acting.empty() ? "-" : acting.c_str(),
                         text);
        }
        if (!log) return;
        std::fprintf(log, "%-5s %s [%s] %s\n", LevelName(level), tag ? tag : "",
                     acting.empty() ? "-" : acting.c_str(), text);
    });
    SetChatPanelProvider(std::make_shared<ScriptedPanels>(
        [this](bool bSave, std::string* path) { return NextPanelAnswer(bSave, path); }));
    SetChatWindowFactory([this]() -> IChatWindow* {
        auto* window = new QtSimWindow(QString::fromStdString(ParticipantLoop::Acting()));
        m_pNewWindow = window;
        return window;
    });
    SetSoundPlayer([this](const char*) {
        for (auto& p : m_participants)
            if (p->name == ParticipantLoop::Acting()) ++p->sounds;
    });
    SetWarningPresenter([this](const char* title, const char* message) {
        const std::string& acting = ParticipantLoop::Acting();
        for (auto& p : m_participants)
            if (p->name == acting) p->warnings.push_back(message ? message : "");
        if (!m_warningAnswers.empty()) m_warningAnswers.pop_front();
        if (m_options.log)
            std::fprintf(m_options.log, "box   [%s] %s: %s\n", acting.c_str(), title ? title : "",
                         message ? message : "");
    });
}

Simulator::~Simulator() {
    CloseAll();
    SetWarningPresenter(nullptr);
    SetSoundPlayer(nullptr);
    SetChatWindowFactory(nullptr);
    SetChatPanelProvider(nullptr);
    SetTraceSink(nullptr);
}

int Simulator::Run(const std::vector<ScenarioCommand>& commands) {
    if (m_options.gui) {
        RunInRealTime(commands);
    } else {
        for (const ScenarioCommand& command : commands)
            Execute(command);
    }
    if (m_options.printAtEnd)
        for (const auto& p : m_participants)
            if (!p->left) PrintParticipant(*p);
    if (!m_options.outputDir.empty()) WriteOutputs();
    if (!m_options.gui) CloseAll();
    return m_failures;
}

void Simulator::RunInRealTime(const std::vector<ScenarioCommand>& commands) {
    QEventLoop loop;
    std::size_t next = 0;
    std::function<void()> step = [&] {
        if (next == commands.size()) return loop.quit();
        m_realWait = 0;
        Execute(commands[next++]);
        QTimer::singleShot(static_cast<int>((0.5 + m_realWait) * 1000), &loop, step);
    };
    QTimer::singleShot(0, &loop, step);
    loop.exec();
}

RunLoop& Simulator::SharedLoop() {
    if (m_qtLoop) return *m_qtLoop;
    return m_clock;
}

void Simulator::Execute(const ScenarioCommand& command) {
    for (const CommandEntry& entry : kCommands) {
        if (command.verb != entry.verb) continue;
        (this->*entry.handler)(command);
        return;
    }
    Fail(command, "unknown command " + command.verb);
}

void Simulator::Settle() {
    if (m_qtLoop) return QCoreApplication::processEvents();
    SettleHere();
    // Only a request sets the networked conference moving: with none since it was last quiet,
    // nothing is on its way (the clock's ticks mostly ask nothing).
    if (!m_nats || ServiceCalls() == m_callsSettled) return;
    // The server goes quiet before anything here runs: what one request sets off (a newcomer's
    // call for everybody's presence, say) has then reached every participant before the
    // callbacks that answer it run, whatever order the connections took.
    for (;;) {
        std::uint64_t heard = 0;
        while (const std::uint64_t more = m_nats->Settle())
            heard += more;
        const std::size_t ran = SettleHere();
        if (heard == 0 && ran == 0) break;
    }
    m_callsSettled = ServiceCalls();
}

std::size_t Simulator::SettleHere() {
    // The windows' posted events (deferred deletions included) count as work too.
    std::size_t total = 0;
    for (;;) {
        QCoreApplication::sendPostedEvents();
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
        std::size_t ran = m_clock.RunUntilIdle();
        total += ran;
        if (ran != 0) continue;
        QCoreApplication::processEvents();
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
        ran = m_clock.RunUntilIdle();
        total += ran;
        if (ran == 0) return total;
    }
}

std::uint64_t Simulator::ServiceCalls() const {
    std::uint64_t calls = 0;
    for (const auto& p : m_participants)
        calls += p->service->Calls();
    return calls;
}

void Simulator::Tick(std::uint32_t halfSeconds) {
    if (m_qtLoop) {
        m_realWait += 0.5 * halfSeconds;
        return;
    }
    for (std::uint32_t i = 0; i < halfSeconds; ++i) {
        m_clock.AdvanceBy(0.5);
        Settle();
    }
}

void Simulator::Fail(const ScenarioCommand& command, const std::string& message) {
    ++m_failures;
    std::fprintf(m_options.out, "line %d: %s: %s\n", command.line, command.verb.c_str(),
                 message.c_str());
}

Simulator::Participant* Simulator::Find(const ScenarioCommand& command, const std::string& name) {
    for (auto& p : m_participants)
        if (p->name == name && !p->left) return p.get();
    Fail(command, "nobody called " + name + " is in the conference");
    return nullptr;
}

bool Simulator::Targets(const ScenarioCommand& command, std::size_t first,
                        std::vector<Participant*>* out) {
    out->clear();
    const auto positional = command.Positional();
    for (std::size_t i = first; i < positional.size(); ++i) {
        Participant* p = Find(command, positional[i]->value);
        if (!p) return false;
        out->push_back(p);
    }
    if (first >= positional.size())
        for (auto& p : m_participants)
            if (!p->left) out->push_back(p.get());
    return true;
}

void Simulator::ForEach(const ScenarioCommand& command, std::size_t first,
                        const std::function<void(Participant&)>& fn) {
    std::vector<Participant*> targets;
    if (!Targets(command, first, &targets)) return;
    for (Participant* p : targets) {
        ActingScope acting(*p->loop);
        fn(*p);
    }
    Settle();
}

CChatClient& Simulator::Engine(const Participant& p) {
    return *static_cast<CChatClient*>(p.handle);
}

void Simulator::CloseAll() {
    for (auto& p : m_participants) {
        if (p->left) continue;
        {
            ActingScope acting(*p->loop);
            ChDeleteInstance(p->handle);
        }
        p->left = true;
        p->window = nullptr;
        Settle();
    }
}

void Simulator::WriteOutputs() {
    for (const auto& p : m_participants) {
        if (p->left) continue;
        const std::string base = m_options.outputDir + "/" + p->name;
        ActingScope acting(*p->loop);
        if (!Engine(*p).WriteChatFileToFolder(base + ".txt"))
            std::fprintf(m_options.out, "could not write %s.txt\n", base.c_str());
        if (p->window && p->window->SavePicture(base + ".png"))
            std::fprintf(m_options.out, "wrote %s.png\n", base.c_str());
    }
}

bool Simulator::NextPanelAnswer(bool bSave, std::string* path) {
    auto& answers = bSave ? m_saveAnswers : m_openAnswers;
    if (answers.empty()) return false;  // nobody scripted an answer: the user cancels
    const std::optional<std::string> answer = answers.front();
    answers.pop_front();
    if (!answer) return false;
    *path = *answer;
    return true;
}

std::optional<std::uint32_t> Simulator::NodeOf(const ScenarioCommand& c, const std::string& text) {
    for (auto& p : m_participants)
        if (p->name == text) return p->nodeId;
    if (auto number = ParseScenarioNumber(text)) return number;
    Fail(c, "nobody called " + text + " joined");
    return std::nullopt;
}

void Simulator::TickCommand(const ScenarioCommand& c) {
    Tick(*ParseScenarioNumber(c.Positional()[0]->value));
}

void Simulator::Startup(const ScenarioCommand&) {
    Tick(20);
}
