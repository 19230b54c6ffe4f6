// The networked conference service: one service object per participant, carrying a conference
// between processes and machines through a NATS server with JetStream. A host builds it from
// options and hands it to the component like any other service object.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "platform/arm_service.h"
#include "platform/host_kit.h"

class RunLoop;

struct NatsConferenceOptions {
    // Server addresses such as "nats://127.0.0.1:4222"; the object connects to one of them and
    // moves to another by itself when the connection drops.
    std::vector<std::string> serverUrls;
    // The conference: the id ConferenceJoin and ApeAttach must name, and the server-side
    // namespace its caches and participants live in.
    std::uint16_t conferenceId = 1;
    // The local participant's conference node id (ConnectConfirm carries it back).
    std::uint32_t nodeId = 0;
    // The credentials the server knows the participant by. The user name (letters, digits,
    // '-' and '_', at most 32) also fixes the participant's user id in the conference.
    std::string user;
    std::string password;
    // Copies of every stored cache item and private datum the server keeps (3 in a cluster).
    int replicas = 1;
};

// A new participant's service object, answering on loop (which must outlive it) from the time
// its Connect is answered until its Release(). Null when the options cannot work: no server
// address, a user name that is not usable, or a replica count outside 1 to 5.
QC_HOST_KIT IArmClient* CreateNatsArmClient(const NatsConferenceOptions& options, RunLoop& loop);
