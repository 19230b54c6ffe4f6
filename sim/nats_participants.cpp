#include "sim/nats_participants.h"

#include <fstream>
#include <sstream>

#include "netconf/conference_credentials.h"
#include "netconf/nats_arm_client.h"

bool ReadSimCredentials(const std::string& path, std::map<std::string, std::string>* passwords,
                        std::string* error) {
    std::ifstream file(path);
    if (!file) {
        *error = path + ": cannot read the credentials";
        return false;
    }
    std::stringstream text;
    text << file.rdbuf();
    std::vector<ConferenceCredential> pairs;
    if (!ParseConferenceCredentials(text.str(), &pairs, error)) {
        *error = path + ": " + *error;
        return false;
    }
    for (const ConferenceCredential& pair : pairs)
        (*passwords)[pair.user] = pair.password;
    return true;
}

NatsParticipants::NatsParticipants(NatsSimOptions options) : m_options(std::move(options)) {}

NatsParticipants::~NatsParticipants() {
    for (auto& [client, lifetime] : m_clients) {
        if (!lifetime.expired()) client->Release();
    }
}

IArmClient* NatsParticipants::Create(const std::string& name, std::uint32_t nodeId, RunLoop& loop,
                                     std::string* error) {
    NatsConferenceOptions options;
    options.serverUrls = {m_options.url};
    options.conferenceId = m_options.conferenceId;
    options.nodeId = nodeId;
    options.user = name;
    if (m_options.bHasCredentials) {
        const auto found = m_options.passwords.find(name);
        if (found == m_options.passwords.end()) {
            *error = "the credentials have no password for " + name;
            return nullptr;
        }
        options.password = found->second;
    }
    auto* client = static_cast<NatsArmClient*>(CreateNatsArmClient(options, loop));
    if (client == nullptr) {
        *error =
            name + " cannot be a user name on the server (letters, digits, - and _, at most 32)";
        return nullptr;
    }
    m_clients.emplace_back(client, client->Lifetime());
    return client;
}

std::uint64_t NatsParticipants::Settle() {
    std::uint64_t activity = 0;
    for (auto& [client, lifetime] : m_clients) {
        if (!lifetime.expired()) activity += client->Settle();
    }
    return activity;
}
