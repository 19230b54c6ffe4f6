// A nats-server process for one test: its own configuration and JetStream folder on a free
// loopback port, stopped and its files removed when the object goes.
#pragma once

#include <sys/types.h>

#include <condition_variable>
#include <memory>
#include <mutex>
#include <string>
#include <thread>

#include "netconf/server_config.h"
#include "tests/support/temp_dir.h"

// A TCP port on 127.0.0.1 that nothing listens on right now.
int FreeLoopbackPort();

class NatsServer {
public:
    // options.port 0 takes a free port; an empty store folder a temporary one.
    explicit NatsServer(ConferenceServerOptions options);
    ~NatsServer();
    NatsServer(const NatsServer&) = delete;
    NatsServer& operator=(const NatsServer&) = delete;

    // Starts the server and returns once it is ready; false (with the log) when it is not
    // within 20 seconds.
    bool Start();
    // Ends the server: politely (SIGTERM) or as a crash (SIGKILL); returns once it is gone.
    void Stop();
    void Kill();

    std::string Url() const;
    const ConferenceServerOptions& Options() const { return m_options; }
    // Whether a log line containing text appeared, waiting up to seconds for it.
    bool WaitForLog(const std::string& text, double seconds);
    std::string Log() const;

private:
    void End(int signal);

    ConferenceServerOptions m_options;
    TempDir m_dir;
    pid_t m_pid = -1;
    std::thread m_reader;
    mutable std::mutex m_mutex;
    std::condition_variable m_logged;
    std::string m_log;
};
