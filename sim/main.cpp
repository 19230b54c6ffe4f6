// quintara-chat-sim: runs a conference scenario on the in-process conference, or on the
// networked conference of a NATS server.
//   quintara-chat-sim [--gui] [--print] [--out DIR] [--log FILE]
//                     [--server URL [--creds FILE] [--conference N]] SCENARIO
// Exit status 0 when every expectation holds, 1 when some failed, 2 for a bad command line
// or a scenario that does not read, 77 when the scenario needs the in-process conference
// (it makes the service fail or injects deliveries) but a server was given.
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <cstring>
#include <fstream>
#include <sstream>
#include <string>

#include <QApplication>

#include "platform/trace.h"
#include "sim/lang/scenario.h"
#include "sim/simulator.h"

namespace {

constexpr int kSkipped = 77;

int Usage() {
    std::fprintf(
        stderr,
        "usage: quintara-chat-sim [--gui] [--print] [--out DIR] [--log FILE]\n"
        "                         [--server URL [--creds FILE] [--conference N]] SCENARIO\n"
        "  --gui       on screen in real time, one command every half second; the\n"
        "              windows stay open for the user when the script ends\n"
        "  --print     print every transcript and send-to list at the end\n"
        "  --out DIR   write each transcript (and window picture) into DIR\n"
        "  --log FILE  write every log line, with the participant's name, to FILE\n"
        "  --server URL      every participant on the conference of this NATS server\n"
        "                    (nats://HOST:PORT), connecting by its short name\n"
        "  --creds FILE      the participants' passwords: \"NAME PASSWORD\" a line\n"
        "  --conference N    the conference's number on the server (default 1)\n");
    return 2;
}

}  // namespace

int main(int argc, char** argv) {
    SimOptions options;
    std::string scenarioPath;
    std::string logPath;
    NatsSimOptions server;
    std::string credsPath;
    bool conferenceGiven = false;
    for (int i = 1; i < argc; ++i) {
        const bool hasValue = i + 1 < argc;
        if (std::strcmp(argv[i], "--gui") == 0) {
            options.gui = true;
        } else if (std::strcmp(argv[i], "--print") == 0) {
            options.printAtEnd = true;
        } else if (std::strcmp(argv[i], "--out") == 0 && hasValue) {
            options.outputDir = argv[++i];
        } else if (std::strcmp(argv[i], "--log") == 0 && hasValue) {
            logPath = argv[++i];
        } else if (std::strcmp(argv[i], "--server") == 0 && hasValue) {
            server.url = argv[++i];
        } else if (std::strcmp(argv[i], "--creds") == 0 && hasValue) {
            credsPath = argv[++i];
        } else if (std::strcmp(argv[i], "--conference") == 0 && hasValue) {
            const auto number = ParseScenarioNumber(argv[++i]);
            if (!number || *number == 0 || *number > 0xffff) return Usage();
            server.conferenceId = static_cast<std::uint16_t>(*number);
            conferenceGiven = true;
        } else if (argv[i][0] != '-' && scenarioPath.empty()) {
            scenarioPath = argv[i];
        } else {
            return Usage();
        }
    }
    if (scenarioPath.empty()) return Usage();
    if (server.url.empty() && (!credsPath.empty() || conferenceGiven)) return Usage();
    if (!credsPath.empty()) {
        std::string error;
        server.bHasCredentials = true;
        if (!ReadSimCredentials(credsPath, &server.passwords, &error)) {
            std::fprintf(stderr, "%s\n", error.c_str());
            return 2;
        }
    }

    std::ifstream file(scenarioPath, std::ios::binary);
    if (!file) {
        std::fprintf(stderr, "%s: cannot read the scenario\n", scenarioPath.c_str());
        return 2;
    }
    std::stringstream text;
    text << file.rdbuf();
    std::vector<ScenarioCommand> commands;
    ScenarioError error;
    if (!ParseScenario(text.str(), &commands, &error)) {
        std::fprintf(stderr, "%s:%d: %s\n", scenarioPath.c_str(), error.line,
                     error.message.c_str());
        return 2;
    }
    if (!server.url.empty()) {
        // A server cannot be made to fail on request nor to deliver what nobody sent.
        for (const ScenarioCommand& command : commands) {
            if (command.verb != "fail" && command.verb != "inject") continue;
            std::printf("%s: skipped: line %d: %s needs the in-process conference\n",
                        scenarioPath.c_str(), command.line, command.verb.c_str());
            return kSkipped;
        }
        options.server = server;
    }
    if (!options.outputDir.empty()) mkdir(options.outputDir.c_str(), 0755);
    if (!logPath.empty()) {
        options.log = std::fopen(logPath.c_str(), "w");
        if (!options.log) {
            std::fprintf(stderr, "%s: cannot write the log\n", logPath.c_str());
            return 2;
        }
        setvbuf(options.log, nullptr, _IOLBF, 0);  // a killed run keeps its log
    }

    // The windows are real chat windows; they draw offscreen. Qt wants a private runtime
    // folder and complains on every run without one.
    if (!options.gui) qputenv("QT_QPA_PLATFORM", "offscreen");
    if (qEnvironmentVariableIsEmpty("XDG_RUNTIME_DIR")) {
        const std::string runtime = "/tmp/runtime-" + std::to_string(getuid());
        mkdir(runtime.c_str(), 0700);
        qputenv("XDG_RUNTIME_DIR", runtime.c_str());
    }
    QApplication application(argc, argv);
    // Qt's own remarks (an offscreen window cannot be raised, ...) belong in the log too.
    qInstallMessageHandler([](QtMsgType type, const QMessageLogContext&, const QString& text) {
        const QByteArray bytes = text.toUtf8();
        if (type == QtDebugMsg || type == QtInfoMsg) {
            MacInfoTrace2("Qt", "%s", bytes.constData());
        } else {
            MacWarnTrace2("Qt", "%s", bytes.constData());
        }
    });
    int failures;
    {
        Simulator simulator(options);
        failures = simulator.Run(commands);
        if (options.gui) {
            HostPanel panel(simulator.PanelHooks());
            panel.show();
            std::printf("the script has ended; the host panel and the windows are yours\n");
            std::fflush(stdout);
            QApplication::exec();
        }
    }
    if (options.log) std::fclose(options.log);
    if (failures == 0) {
        std::printf("%s: every expectation holds\n", scenarioPath.c_str());
        return 0;
    }
    std::printf("%s: %d failure(s)\n", scenarioPath.c_str(), failures);
    return 1;
}
