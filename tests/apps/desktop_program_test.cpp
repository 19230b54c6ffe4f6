// The desktop program as people run it: two processes chat through one nats-server, and a
// conference that cannot be joined or a script line that never comes ends it with its status.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <QProcess>

#include "tests/netconf/nats_server.h"
#include "tests/support/temp_dir.h"

namespace {

constexpr std::uint16_t kConference = 9;

struct Finished {
    int exitCode = -1;
    std::string out;  // stdout and stderr
};

class DesktopProgram : public testing::Test {
protected:
    DesktopProgram() : server(ServerOptions()) {}

    static ConferenceServerOptions ServerOptions() {
        ConferenceServerOptions options;
        options.conferenceId = kConference;
        options.port = 0;
        options.participants = {{"ann", "pw-ann"}, {"bob", "pw-bob"}};
        return options;
    }

    std::string Creds(const std::string& user, const std::string& password) {
        const std::string path = dir.File(user + ".creds");
        PutFile(path, "# the desktop's user\n" + user + " " + password + "\n");
        chmod(path.c_str(), 0600);
        return path;
    }

    // Starts a participant with a script from this folder (or none).
    void Start(QProcess* process, const std::string& url, const std::string& creds,
               const char* name, int node, const QStringList& extra) {
        QStringList args = {"--server",     QString::fromStdString(url),
                            "--creds",      QString::fromStdString(creds),
                            "--conference", QString::number(kConference),
                            "--name",       name,
                            "--node",       QString::number(node),
                            "--offscreen"};
        process->setProcessChannelMode(QProcess::MergedChannels);
        process->start(QC_DESKTOP_PROGRAM, args + extra);
    }

    // The program bounds every wait of its own (connect, enrol, start-up, each expectation), so
    // the limit here only catches a hang: on a busy machine a sound run can take over 30 s.
    static Finished Finish(QProcess* process) {
        Finished run;
        if (process->waitForFinished(120000) && process->exitStatus() == QProcess::NormalExit)
            run.exitCode = process->exitCode();
        run.out = process->readAll().toStdString();
        return run;
    }

    static QStringList Script(const char* file) {
        return {"--script", QString(QC_DESKTOP_SCRIPTS) + "/" + file};
    }

    TempDir dir;
    NatsServer server;
};

TEST_F(DesktopProgram, TwoParticipantsChatBothWaysAndPrivatelyThroughOneServer) {
    ASSERT_TRUE(server.Start()) << server.Log();
    QProcess ann;
    QProcess bob;
    Start(&ann, server.Url(), Creds("ann", "pw-ann"), "Ann Host", 11,
          QStringList{"--host"} + Script("ann.chat"));
    Start(&bob, server.Url(), Creds("bob", "pw-bob"), "Bob Attendee", 12, Script("bob.chat"));
    const Finished annRun = Finish(&ann);
    const Finished bobRun = Finish(&bob);
    EXPECT_EQ(annRun.exitCode, 0) << annRun.out;
    EXPECT_NE(annRun.out.find("ann.chat: every expectation holds"), std::string::npos);
    EXPECT_EQ(bobRun.exitCode, 0) << bobRun.out;
    EXPECT_NE(bobRun.out.find("bob.chat: every expectation holds"), std::string::npos);
}

TEST_F(DesktopProgram, ARunThatCannotSucceedSaysWhyAndEndsWithItsStatus) {
    ASSERT_TRUE(server.Start()) << server.Log();
    const std::string nobody = "nats://127.0.0.1:" + std::to_string(FreeLoopbackPort());
    const std::string script = dir.File("alone.chat");
    PutFile(script, "conference type=3\nexpect me line \"from Ann Host to Host\" \"hi\"\n");
    const struct {
        std::string url;
        std::string password;
        QStringList extra;
        int exitCode;
        std::string says;
    } cases[] = {
        {nobody, "pw-ann", {}, 3, "quintara-chat: cannot connect to " + nobody},
        {server.Url(), "wrong", {}, 3, "quintara-chat: cannot connect to " + server.Url()},
        // A line that never comes fails once the wait is over.
        {server.Url(),
         "pw-ann",
         {"--wait", "1", "--script", QString::fromStdString(script)},
         1,
         "line 2: expect: timed out: me's transcript is empty"},
    };
    for (const auto& c : cases) {
        QProcess ann;
        Start(&ann, c.url, Creds("ann", c.password), "Ann Host", 11, c.extra);
        const Finished run = Finish(&ann);
        EXPECT_EQ(run.exitCode, c.exitCode) << c.says << "\n" << run.out;
        EXPECT_NE(run.out.find(c.says), std::string::npos) << run.out;
    }
}

}  // namespace
