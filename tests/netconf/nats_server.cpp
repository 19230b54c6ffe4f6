#include "tests/netconf/nats_server.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <sys/socket.h>

#include <utility>
#include <vector>

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

bool NatsServer::Start() {
    const std::string config = m_dir.File("server.conf");
    if (!PutFile(config, ConferenceServerConfig(m_options))) return false;
    m_process =
        std::make_unique<ChildProcess>(std::vector<std::string>{"nats-server", "-c", config});
    return WaitForLog("Server is ready", 20);
}

std::string NatsServer::Url() const {
    return "nats://" + m_options.host + ":" + std::to_string(m_options.port);
}
