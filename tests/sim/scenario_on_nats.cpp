// Runs a scenario in the simulator with every participant on a nats-server of its own: the
// server, on a free loopback port with a temporary store, knows each participant the scenario
// joins by its short name and a password of its own, and stops when the run ends.
// Usage: scenario_on_nats SIMULATOR SCENARIO [SIMULATOR OPTIONS...]
// Exit status: the simulator's (77: the scenario needs the in-process conference), or 1 when
// the server does not start.
#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "sim/lang/scenario.h"
#include "tests/netconf/nats_server.h"

namespace {

constexpr std::uint16_t kConference = 9;

// The short names the scenario joins; false when it does not read (the simulator says why).
bool Participants(const std::string& path, std::vector<std::string>* names) {
    std::ifstream file(path, std::ios::binary);
    std::stringstream text;
    text << file.rdbuf();
    std::vector<ScenarioCommand> commands;
    ScenarioError error;
    if (!file || !ParseScenario(text.str(), &commands, &error)) return false;
    for (const ScenarioCommand& command : commands)
        if (command.verb == "join") names->push_back(command.Positional()[0]->value);
    return true;
}

// Runs the simulator and passes its output on; its exit status.
int Run(std::vector<std::string> args) {
    ChildProcess simulator(std::move(args));
    const int status = simulator.Wait();
    std::fputs(simulator.Output().c_str(), stdout);
    return status < 0 ? 1 : status;
}

}  // namespace

int main(int argc, char** argv) {
    if (argc < 3) {
        std::fprintf(stderr, "usage: %s SIMULATOR SCENARIO [SIMULATOR OPTIONS...]\n", argv[0]);
        return 2;
    }
    const std::string simulator = argv[1];
    const std::string scenario = argv[2];
    std::vector<std::string> names;
    if (!Participants(scenario, &names)) return Run({simulator, scenario});

    ConferenceServerOptions options;
    options.conferenceId = kConference;
    options.port = 0;
    std::string creds;
    for (const std::string& name : names) {
        options.participants.push_back({name, "pw-" + name});
        creds += name + " pw-" + name + "\n";
    }
    NatsServer server(options);
    TempDir dir;
    const std::string credsPath = dir.File("participants.creds");
    if (!PutFile(credsPath, creds) || !server.Start()) {
        std::fprintf(stderr, "the nats-server did not start:\n%s\n", server.Log().c_str());
        return 1;
    }
    std::vector<std::string> args = {simulator,
                                     "--server",
                                     server.Url(),
                                     "--creds",
                                     credsPath,
                                     "--conference",
                                     std::to_string(kConference)};
    args.insert(args.end(), argv + 3, argv + argc);
    args.push_back(scenario);
    return Run(args);
}
