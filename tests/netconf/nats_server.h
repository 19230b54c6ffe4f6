// A nats-server process for one test: its own configuration and JetStream folder on a free
// loopback port, killed and its files removed when the object goes.
#pragma once

#include <memory>
#include <string>

#include "netconf/server_config.h"
#include "tests/netconf/child_process.h"
#include "tests/support/temp_dir.h"

// A TCP port on 127.0.0.1 that nothing listens on right now.
int FreeLoopbackPort();

class NatsServer {
public:
    // options.port 0 takes a free port; an empty store folder a temporary one.
    explicit NatsServer(ConferenceServerOptions options);

    // Starts the server (again, after Kill) and returns once it is ready; false (with the log)
    // when it is not within 20 seconds.
    bool Start();
    // Ends the server as a crash would; returns once it is gone.
    void Kill() { m_process.reset(); }

    std::string Url() const;
    // Whether a log line containing text appeared, waiting up to seconds for it.
    bool WaitForLog(const std::string& text, double seconds) {
        return m_process && m_process->WaitFor(text, seconds);
    }
    std::string Log() const { return m_process ? m_process->Output() : std::string(); }

private:
    ConferenceServerOptions m_options;
    TempDir m_dir;
    std::unique_ptr<ChildProcess> m_process;
};
