// The conference simulator: runs a scenario on one in-process conference, one virtual clock
// and one chat component (with its window) per participant, and checks its expectations.
#pragma once

#include <cstdint>
#include <cstdio>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "api/quintarachat.h"
#include "hostpanel/host_panel.h"
#include "platform/inproc_conference.h"
#include "platform/virtual_run_loop.h"
#include "sim/lang/scenario.h"
#include "sim/nats_participants.h"
#include "sim/participant_loop.h"
#include "sim/sim_window.h"
#include "sim/watched_arm_client.h"
#include "ui/qt_run_loop.h"

class CChatClient;

struct SimOptions {
    std::FILE* out = stdout;   // reports, failures and what `print` shows
    std::FILE* log = nullptr;  // every trace line with the acting participant's name
    std::string outputDir;     // when set: each window's picture and transcript at the end
    bool printAtEnd = false;   // print every transcript and send-to list at the end
    bool gui = false;          // real time on the Qt loop, one command every half second
    // Every participant on the networked conference of this server instead of in-process.
    std::optional<NatsSimOptions> server;
};

class Simulator {
public:
    explicit Simulator(SimOptions options);
    ~Simulator();
    Simulator(const Simulator&) = delete;
    Simulator& operator=(const Simulator&) = delete;

    // Runs every command in order, then (unless the windows are left to the user) closes
    // every component. Returns the number of expectations that did not hold plus the
    // commands that could not be carried out.
    int Run(const std::vector<ScenarioCommand>& commands);
    // How the host panel reaches the participants once the script has ended (--gui).
    HostPanel::Hooks PanelHooks();

private:
    struct Participant {
        std::string name;  // the scenario's short name
        std::string displayName;
        std::uint32_t nodeId = 0;
        std::unique_ptr<ParticipantLoop> loop;
        InProcessArmClient* client = nullptr;       // null on a server
        std::unique_ptr<WatchedArmClient> service;  // what the component holds
        ChatHandle handle = nullptr;
        SimWindow* window = nullptr;
        bool left = false;
        std::size_t linesSeen = 0;          // transcript entries at the last expect or print
        std::vector<std::string> warnings;  // warning boxes shown, newest last
        int sounds = 0;                     // incoming-chat sounds played
    };
    using Handler = void (Simulator::*)(const ScenarioCommand&);

    // ---- Running (simulator.cpp) ----
    void Execute(const ScenarioCommand& command);
    // The script on the Qt loop: one command every half second, ticks as real waits.
    void RunInRealTime(const std::vector<ScenarioCommand>& commands);
    // The loop the participants' work runs on: the virtual clock, or Qt's loop with --gui.
    RunLoop& SharedLoop();
    // Runs posted work and due timers until nothing is left, without moving the clock; on a
    // server also until every request is answered and everything it caused has arrived.
    void Settle();
    // Runs what is due in this process until nothing is left; how many tasks ran.
    std::size_t SettleHere();
    // Requests the components made of their services so far.
    std::uint64_t ServiceCalls() const;
    // Moves the clock by half-seconds, settling after each.
    void Tick(std::uint32_t halfSeconds);
    void Fail(const ScenarioCommand& command, const std::string& message);
    // The joined (and not departed) participant of that name; reports a failure when none.
    Participant* Find(const ScenarioCommand& command, const std::string& name);
    // The participants named by the arguments from first on, or everybody still in.
    bool Targets(const ScenarioCommand& command, std::size_t first, std::vector<Participant*>* out);
    // Runs fn for each target with that participant acting, then settles.
    void ForEach(const ScenarioCommand& command, std::size_t first,
                 const std::function<void(Participant&)>& fn);
    static CChatClient& Engine(const Participant& p);
    void CloseAll();
    void WriteOutputs();

    // ---- Commands (conference_commands.cpp, user_commands.cpp, expect_commands.cpp) ----
    void Conference(const ScenarioCommand& c);
    void Join(const ScenarioCommand& c);
    void HostOrPresenter(const ScenarioCommand& c);
    void Roles(const ScenarioCommand& c);
    void Privilege(const ScenarioCommand& c);
    void BeforeHost(const ScenarioCommand& c);
    void Practice(const ScenarioCommand& c);
    void Panel(const ScenarioCommand& c);
    void Feature(const ScenarioCommand& c);
    void Nbr(const ScenarioCommand& c);
    void Config(const ScenarioCommand& c);
    void RosterStatus(const ScenarioCommand& c);
    void AddGroup(const ScenarioCommand& c);
    void SelectNode(const ScenarioCommand& c);
    void Sound(const ScenarioCommand& c);
    void CloseDialogs(const ScenarioCommand& c);
    void Select(const ScenarioCommand& c);
    void Say(const ScenarioCommand& c);
    void Pick(const ScenarioCommand& c);
    void Answer(const ScenarioCommand& c);
    void SaveOrOpen(const ScenarioCommand& c);
    void Leave(const ScenarioCommand& c);
    void FailOperation(const ScenarioCommand& c);
    void Inject(const ScenarioCommand& c);
    void Expect(const ScenarioCommand& c);
    void Print(const ScenarioCommand& c);
    void TickCommand(const ScenarioCommand& c);
    void Startup(const ScenarioCommand& c);

    // ---- Showing (report.cpp) ----
    void PrintParticipant(const Participant& p);
    // The engine's send-to list in the `expect menu` notation.
    static std::vector<std::string> EngineMenu(const CChatClient& engine);
    // The window's popup in the same notation.
    static std::vector<std::string> PopupMenu(const SimWindow& window);

    // A participant name or a number naming a node.
    std::optional<std::uint32_t> NodeOf(const ScenarioCommand& c, const std::string& text);
    // The answer the next panel of that kind gets: a path, or nullopt for cancel.
    bool NextPanelAnswer(bool bSave, std::string* path);

    static const struct CommandEntry {
        const char* verb;
        Handler handler;
    } kCommands[];

    SimOptions m_options;
    VirtualRunLoop m_clock;
    std::unique_ptr<QtRunLoop> m_qtLoop;  // with --gui
    double m_realWait = 0;                // seconds the next command waits (--gui)
    std::unique_ptr<InProcessConference> m_conference;
    std::vector<std::unique_ptr<Participant>> m_participants;  // in join order, departed kept
    // With a server, instead of m_conference; gone before the participants' loops it posts to.
    std::unique_ptr<NatsParticipants> m_nats;
    std::uint64_t m_callsSettled = 0;  // ServiceCalls() when the server was last quiet
    int m_failures = 0;

    // The conference line.
    std::int32_t m_meetingType = 0;
    bool m_bQM = false;
    std::uint32_t m_sessionId = 1;

    // Scripted answers, oldest first; nullopt cancels.
    std::deque<std::optional<std::string>> m_saveAnswers;
    std::deque<std::optional<std::string>> m_openAnswers;
    std::deque<int> m_warningAnswers;

    SimWindow* m_pNewWindow = nullptr;  // the window the factory made last
};
