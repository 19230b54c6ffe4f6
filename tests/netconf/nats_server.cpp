#include "tests/netconf/nats_server.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <signal.h>
#include <spawn.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <utility>
#include <vector>

extern char** environ;

int FreeLoopbackPort() {
    const int fd = socket(AF_INET, SOCK_STREAM, 0);
    if (fd < 0) return 0;
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    socklen_t length = sizeof address;
    int port = 0;
    if (bind(fd, reinterpret_cast<sockaddr*>(&address), sizeof address) == 0 &&
        getsockname(fd, reinterpret_cast<sockaddr*>(&address), &length) == 0) {
        port = ntohs(address.sin_port);
    }
    close(fd);
    return port;
}

NatsServer::NatsServer(ConferenceServerOptions options) : m_options(std::move(options)) {
    if (m_options.port == 0) m_options.port = FreeLoopbackPort();
    if (m_options.storeDir.empty()) m_options.storeDir = m_dir.File("store");
}

NatsServer::~NatsServer() {
    Stop();
}

bool NatsServer::Start() {
    const std::string config = m_dir.File("server.conf");
    if (!PutFile(config, ConferenceServerConfig(m_options))) return false;
    int pipeFds[2];
    if (pipe(pipeFds) != 0) return false;
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_adddup2(&actions, pipeFds[1], STDOUT_FILENO);
    posix_spawn_file_actions_adddup2(&actions, pipeFds[1], STDERR_FILENO);
    posix_spawn_file_actions_addclose(&actions, pipeFds[0]);
    std::vector<std::string> args = {"nats-server", "-c", config};
    std::vector<char*> argv;
    for (std::string& arg : args)
        argv.push_back(arg.data());
    argv.push_back(nullptr);
    const int spawned =
        posix_spawnp(&m_pid, "nats-server", &actions, nullptr, argv.data(), environ);
    posix_spawn_file_actions_destroy(&actions);
    close(pipeFds[1]);
    if (spawned != 0) {
        close(pipeFds[0]);
        m_pid = -1;
        return false;
    }
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        m_log.clear();
    }
    // The log is read to its end, so the server never blocks on a full pipe.
    const int readFd = pipeFds[0];
    m_reader = std::thread([this, readFd] {
        char buffer[4096];
        for (;;) {
            const ssize_t got = read(readFd, buffer, sizeof buffer);
            if (got <= 0) break;
            {
                const std::lock_guard<std::mutex> lock(m_mutex);
                m_log.append(buffer, static_cast<std::size_t>(got));
            }
            m_logged.notify_all();
        }
        close(readFd);
    });
    return WaitForLog("Server is ready", 20);
}

void NatsServer::Stop() {
    End(SIGTERM);
}

void NatsServer::Kill() {
    End(SIGKILL);
}

void NatsServer::End(int signal) {
    if (m_pid > 0) {
        kill(m_pid, signal);
        int status = 0;
        waitpid(m_pid, &status, 0);
        m_pid = -1;
    }
    if (m_reader.joinable()) m_reader.join();
}

std::string NatsServer::Url() const {
    return "nats://" + m_options.host + ":" + std::to_string(m_options.port);
}

bool NatsServer::WaitForLog(const std::string& text, double seconds) {
    std::unique_lock<std::mutex> lock(m_mutex);
    return m_logged.wait_for(lock, std::chrono::duration<double>(seconds),
                             [this, &text] { return m_log.find(text) != std::string::npos; });
}

std::string NatsServer::Log() const {
    const std::lock_guard<std::mutex> lock(m_mutex);
    return m_log;
}
