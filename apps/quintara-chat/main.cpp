// quintara-chat: one participant of a conference on a NATS server, with its chat window and
// the host panel, so people on several machines chat through one server.
//   quintara-chat --server nats://HOST:PORT --creds FILE --conference N --name "Display Name"
//                 --node N [--host] [--presenter] [--panelist] [--meeting-type N]
//                 [--offscreen] [--script FILE [--wait SECONDS]]
// Exit status 0 when the script's expectations all hold (or the user closed the window),
// 1 when some failed, 2 for a bad command line, credentials file or script, 3 when the
// conference could not be joined.
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <fstream>
#include <sstream>

#include <QApplication>
#include <QCheckBox>
#include <QHBoxLayout>

#include "apps/quintara-chat/desktop_options.h"
#include "apps/quintara-chat/desktop_participant.h"
#include "apps/quintara-chat/desktop_script.h"
#include "hostpanel/host_panel.h"
#include "ui/qt_host.h"

namespace {

constexpr double kConnectSeconds = 15;
constexpr double kEnrolSeconds = 20;

int Usage(const std::string& error) {
    std::fprintf(stderr,
                 "quintara-chat: %s\n"
                 "usage: quintara-chat --server nats://HOST:PORT --creds FILE --conference N\n"
                 "                     --name \"Display Name\" --node N\n"
                 "                     [--host] [--presenter] [--panelist] [--meeting-type N]\n"
                 "                     [--offscreen] [--script FILE [--wait SECONDS]]\n"
                 "  --creds FILE   the participant's user on the server: \"NAME PASSWORD\"\n"
                 "  --script FILE  runs a scenario as the participant `me`\n"
                 "  --wait SECONDS how long the script waits for others (10)\n",
                 error.c_str());
    return 2;
}

bool ReadScript(const std::string& path, std::vector<ScenarioCommand>* commands) {
    std::ifstream file(path, std::ios::binary);
    if (!file) {
        std::fprintf(stderr, "quintara-chat: cannot read the script %s\n", path.c_str());
        return false;
    }
    std::stringstream text;
    text << file.rdbuf();
    ScenarioError error;
    if (ParseScenario(text.str(), commands, &error)) return true;
    std::fprintf(stderr, "%s:%d: %s\n", path.c_str(), error.line, error.message.c_str());
    return false;
}

// The conference line may ask for QM and, unless the command line says, a meeting type.
bool TakeConferenceLine(const std::vector<ScenarioCommand>& commands, DesktopOptions* options) {
    if (commands.empty()) return false;
    const ScenarioCommand& line = commands.front();
    if (const ScenarioArg* type = line.Option("type"); type && !options->meetingTypeGiven)
        options->meetingType = static_cast<std::int32_t>(*ParseScenarioNumber(type->value));
    return !line.Positional().empty();
}

}  // namespace

int main(int argc, char** argv) {
    DesktopOptions options;
    std::string error;
    if (!ParseDesktopOptions(argc, argv, &options, &error)) return Usage(error);
    DesktopCredentials creds;
    if (!ReadCredentials(options.credsPath, &creds, &error)) return Usage(error);
    struct stat info {};
    if (stat(options.credsPath.c_str(), &info) == 0 && (info.st_mode & 077) != 0)
        std::fprintf(stderr, "quintara-chat: %s can be read by others; chmod 600 it\n",
                     options.credsPath.c_str());
    std::vector<ScenarioCommand> commands;
    if (!options.scriptPath.empty() && !ReadScript(options.scriptPath, &commands)) return 2;
    const bool bQM = TakeConferenceLine(commands, &options);

    if (options.offscreen) qputenv("QT_QPA_PLATFORM", "offscreen");
    if (qEnvironmentVariableIsEmpty("XDG_RUNTIME_DIR")) {
        const std::string runtime = "/tmp/runtime-" + std::to_string(getuid());
        mkdir(runtime.c_str(), 0700);
        qputenv("XDG_RUNTIME_DIR", runtime.c_str());
    }
    QApplication application(argc, argv);
    InstallQtHostDefaults();

    QWidget window;
    window.setWindowTitle(QString::fromStdString(options.displayName) + " - Quintara Chat");
    auto* layout = new QHBoxLayout(&window);
    auto* chatView = new QWidget;
    chatView->setMinimumSize(420, 360);
    layout->addWidget(chatView, 1);

    int status = 0;
    {
        DesktopParticipant me(options, creds, chatView);
        if (!me.Connect(kConnectSeconds, &error)) {
            std::fprintf(stderr, "quintara-chat: %s\n", error.c_str());
            return 3;
        }
        me.Start(bQM);
        HostPanel::Hooks hooks;
        hooks.members = [&me] {
            std::vector<HostPanel::Member> members;
            if (me.In()) members.push_back({"me", me.Handle(), me.Options().nodeId});
            return members;
        };
        auto* panel = new HostPanel(hooks);
        panel->SetFeatureWord(bQM ? HostPanel::kQMFeature : 0);
        for (const std::uint32_t role : {0x1u, 0x2u, 0x4u})
            panel->roleBox(role)->setChecked((options.roles & role) != 0);
        layout->addWidget(panel);
        window.show();

        if (!me.WaitEnrolled(kEnrolSeconds)) {
            std::fprintf(stderr,
                         "quintara-chat: connected, but not let into conference %u within %d "
                         "seconds (is user \"%s\" allowed there?)\n",
                         options.conferenceId, static_cast<int>(kEnrolSeconds), creds.user.c_str());
            return 3;
        }
        if (!options.scriptPath.empty()) {
            DesktopScript script(me, stdout);
            const int failures = script.Run(commands);
            std::printf("%s: %s\n", options.scriptPath.c_str(),
                        failures == 0 ? "every expectation holds"
                                      : (std::to_string(failures) + " failure(s)").c_str());
            std::fflush(stdout);
            status = failures == 0 ? 0 : 1;
        }
        // On screen the window stays the user's until it is closed; offscreen without a
        // script the participant stays in the conference until the program is ended.
        if (!options.offscreen || options.scriptPath.empty()) QApplication::exec();
    }
    return status;
}
