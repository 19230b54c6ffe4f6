// The participants of a simulated conference on a NATS server instead of in this process:
// one networked service object each, and the wait that tells when the server has answered
// everything asked of it and delivered everything that followed.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "platform/arm_service.h"

class NatsArmClient;
class RunLoop;

struct NatsSimOptions {
    std::string url;  // such as "nats://127.0.0.1:4222"
    std::uint16_t conferenceId = 1;
    // Passwords by user name; without a credentials file, every participant connects by its
    // name alone (a server that asks for none).
    bool bHasCredentials = false;
    std::map<std::string, std::string> passwords;
};

// Reads a credentials file: one participant a line, its user name (the scenario's short name)
// and its password (no blanks, no '#'), separated by blanks; '#' starts a comment. False with a
// message naming the line when a line is not like that.
bool ReadSimCredentials(const std::string& path, std::map<std::string, std::string>* passwords,
                        std::string* error);

class NatsParticipants {
public:
    explicit NatsParticipants(NatsSimOptions options);
    // Releases the service objects no component released.
    ~NatsParticipants();
    NatsParticipants(const NatsParticipants&) = delete;
    NatsParticipants& operator=(const NatsParticipants&) = delete;

    std::uint16_t ConferenceId() const { return m_options.conferenceId; }

    // The service object of participant name (also its user name on the server), answering on
    // loop; null with a reason when the name cannot be a user name or has no credentials.
    IArmClient* Create(const std::string& name, std::uint32_t nodeId, RunLoop& loop,
                       std::string* error);

    // One round over the participants still there: each one's requests answered, a flush
    // round trip on its connection, and what reached it posted to its loop. Returns how much
    // happened meanwhile (0: the conference was quiet).
    std::uint64_t Settle();

private:
    const NatsSimOptions m_options;
    std::vector<std::pair<NatsArmClient*, std::weak_ptr<const void>>> m_clients;
};
