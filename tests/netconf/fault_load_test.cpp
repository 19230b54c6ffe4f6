// Faults and load: three servers in a cluster keeping every stream in three copies, three
// participants in processes of their own exchanging 3,000 group and private lines, and one
// server killed while they send and started again. Every participant must get every line
// meant for it exactly once and in its sender's order.
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <thread>

#include "tests/netconf/nats_harness.h"

extern char** environ;

namespace {

constexpr int kLinesPerParticipant = 1000;  // half group, half private: 3,000 in all

// A child process whose input the test writes and whose output it reads.
class Child {
public:
    explicit Child(std::vector<std::string> args) {
        int in[2], out[2];
        if (pipe(in) != 0 || pipe(out) != 0) return;
        posix_spawn_file_actions_t actions;
        posix_spawn_file_actions_init(&actions);
        posix_spawn_file_actions_adddup2(&actions, in[0], STDIN_FILENO);
        posix_spawn_file_actions_adddup2(&actions, out[1], STDOUT_FILENO);
        posix_spawn_file_actions_addclose(&actions, in[1]);
        posix_spawn_file_actions_addclose(&actions, out[0]);
        std::vector<char*> argv;
        for (std::string& arg : args)
            argv.push_back(arg.data());
        argv.push_back(nullptr);
        if (posix_spawn(&m_pid, argv[0], &actions, nullptr, argv.data(), environ) != 0) m_pid = -1;
        posix_spawn_file_actions_destroy(&actions);
        close(in[0]);
        close(out[1]);
        m_input = in[1];
        const int readFd = out[0];
        m_reader = std::thread([this, readFd] {
            char buffer[512];
            for (ssize_t got; (got = read(readFd, buffer, sizeof buffer)) > 0;) {
                const std::lock_guard<std::mutex> lock(m_mutex);
                m_output.append(buffer, static_cast<std::size_t>(got));
                m_changed.notify_all();
            }
            close(readFd);
            const std::lock_guard<std::mutex> lock(m_mutex);
            m_ended = true;
            m_changed.notify_all();
        });
    }
    ~Child() {
        if (m_pid > 0) kill(m_pid, SIGKILL);
        Wait();
        if (m_input >= 0) close(m_input);
    }
    // Whether the output shows text within limit; false at once when the child failed.
    bool WaitFor(const std::string& text, std::chrono::seconds limit) {
        std::unique_lock<std::mutex> lock(m_mutex);
        m_changed.wait_for(lock, limit, [&] {
            return m_ended || m_output.find("failed") != std::string::npos ||
                   m_output.find(text) != std::string::npos;
        });
        return m_output.find(text) != std::string::npos;
    }
    void Say(const std::string& text) {
        // A child that died meanwhile shows in its exit status.
        const ssize_t written = write(m_input, text.data(), text.size());
        static_cast<void>(written);
    }
    // The exit status once the process ended.
    int Wait() {
        if (m_pid > 0) {
            waitpid(m_pid, &m_status, 0);
            m_pid = -1;
        }
        if (m_reader.joinable()) m_reader.join();
        return WIFEXITED(m_status) ? WEXITSTATUS(m_status) : -1;
    }
    std::string Output() {
        const std::lock_guard<std::mutex> lock(m_mutex);
        return m_output;
    }

private:
    pid_t m_pid = -1;
    int m_input = -1;
    int m_status = -1;
    std::thread m_reader;
    std::mutex m_mutex;
    std::condition_variable m_changed;
    std::string m_output;
    bool m_ended = false;
};

}  // namespace

TEST(NatsFaultAndLoad, EveryLineArrivesOnceAndInOrderWhileAServerRestarts) {
    signal(SIGPIPE, SIG_IGN);  // a participant that died must fail the test, not end it
    const int clusterPorts[3] = {FreeLoopbackPort(), FreeLoopbackPort(), FreeLoopbackPort()};
    std::vector<std::unique_ptr<NatsServer>> servers;
    std::string urls;
    for (int i = 0; i < 3; ++i) {
        ConferenceServerOptions options = FixtureServerOptions();
        options.serverName = "s" + std::to_string(i + 1);
        options.clusterName = "quintara";
        options.clusterPort = clusterPorts[i];
        for (int j = 0; j < 3; ++j) {
            if (j != i) {
                options.routes.push_back("nats-route://127.0.0.1:" +
                                         std::to_string(clusterPorts[j]));
            }
        }
        servers.push_back(std::make_unique<NatsServer>(options));
        urls += (urls.empty() ? "" : ",") + servers.back()->Url();
    }
    for (auto& server : servers)
        ASSERT_TRUE(server->Start()) << server->Log();
    // The cluster can place streams once one of the servers leads it.
    const auto formed = [&servers] {
        for (auto& server : servers) {
            if (server->WaitForLog("Self is new JetStream cluster metadata leader", 0.1)) {
                return true;
            }
        }
        return false;
    };
    const auto giveUp = std::chrono::steady_clock::now() + std::chrono::seconds(30);
    while (!formed() && std::chrono::steady_clock::now() < giveUp) {
    }
    ASSERT_TRUE(formed()) << servers[0]->Log();

    const std::vector<std::string> users = {"p21", "p22", "p23"};
    std::vector<std::unique_ptr<Child>> participants;
    for (std::size_t i = 0; i < users.size(); ++i) {
        std::vector<std::string> args = {QC_NETCONF_LOAD_PARTICIPANT,
                                         urls,
                                         users[i],
                                         FixturePassword(users[i]),
                                         std::to_string(21 + i),
                                         std::to_string(kLinesPerParticipant),
                                         users[(i + 1) % users.size()]};
        for (std::size_t j = 0; j < users.size(); ++j) {
            if (j != i) args.push_back(users[j]);
        }
        participants.push_back(std::make_unique<Child>(args));
    }
    for (auto& participant : participants)
        ASSERT_TRUE(participant->WaitFor("ready", std::chrono::seconds(30)))
            << participant->Output();

    for (auto& participant : participants)
        participant->Say("go\n");
    // Half-way through the sending, the second server dies; a second later it is back.
    std::this_thread::sleep_for(std::chrono::milliseconds(kLinesPerParticipant));
    servers[1]->Kill();
    std::this_thread::sleep_for(std::chrono::seconds(1));
    ASSERT_TRUE(servers[1]->Start()) << servers[1]->Log();

    for (std::size_t i = 0; i < participants.size(); ++i) {
        const int status = participants[i]->Wait();
        const std::string output = participants[i]->Output();
        std::printf("%s: %s", users[i].c_str(), output.substr(output.find("received")).c_str());
        EXPECT_EQ(0, status) << output;
    }
}
