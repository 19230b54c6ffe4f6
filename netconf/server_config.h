// The server configuration a conference needs: JetStream on, and one user per participant
// whose permissions let it publish only under its own subjects and listen only to its own
// replies, its own mailbox and the conference's presence and caches.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

struct ConferenceCredential {
    std::string user;  // as in NatsConferenceOptions::user
    std::string password;
};

struct ConferenceServerOptions {
    std::uint16_t conferenceId = 1;
    std::vector<ConferenceCredential> participants;
    std::string host = "127.0.0.1";
    int port = 4222;
    std::string storeDir;  // where JetStream keeps its files
    // In a cluster: this server's name, the cluster's name, its route port and the other
    // servers' route URLs ("nats-route://127.0.0.1:6223"). Empty name: a single server.
    std::string serverName;
    std::string clusterName;
    int clusterPort = 0;
    std::vector<std::string> routes;
};

// The whole configuration file's text; "" when a user name is not usable in subjects.
std::string ConferenceServerConfig(const ConferenceServerOptions& options);
