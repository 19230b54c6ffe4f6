// Presence of one participant's service object: its announcements, the others' heard from
// the server, the roster changes they make, and the probes that tell when all is delivered.
#include <utility>

#include "netconf/nats_arm_client.h"

namespace {

constexpr char kStateAttached[] = "attached";
constexpr char kStateLeft[] = "left";
constexpr char kStateProbe[] = "probe";

std::uint64_t HeaderNumber(natsMsg* msg, const char* key, bool* ok) {
    std::uint64_t value = 0;
    if (!ParseDecimal(NatsHeader(msg, key), &value)) *ok = false;
    return value;
}

}  // namespace

void NatsArmClient::AnnounceLocked(bool ask) {
    if (!m_connection) return;
    const std::string subject = m_subjects.Presence(m_options.user);
    natsMsg* raw = nullptr;
    const bool attached = m_netAttached;
    const std::vector<std::uint8_t> empty;
    const std::vector<std::uint8_t>& info = attached ? m_enrollInfo : empty;
    if (natsMsg_Create(&raw, subject.c_str(), nullptr, reinterpret_cast<const char*>(info.data()),
                       static_cast<int>(info.size())) != NATS_OK) {
        return;
    }
    NatsPtr<natsMsg> msg(raw);
    ++m_version;
    SetNatsHeader(raw, "Qc-State", attached ? kStateAttached : kStateLeft);
    SetNatsHeader(raw, "Qc-Node", std::to_string(m_options.nodeId));
    SetNatsHeader(raw, "Qc-Instance", std::to_string(m_instance));
    SetNatsHeader(raw, "Qc-Version", std::to_string(m_version));
    SetNatsHeader(raw, "Qc-Session", std::to_string(attached ? m_session : 0));
    SetNatsHeader(raw, "Qc-Epoch", std::to_string(m_enrollEpoch));
    if (ask) SetNatsHeader(raw, "Qc-Ask", "1");
    natsConnection_PublishMsg(m_connection.get(), raw);
    m_lastAnnounce = NowMillis();
}

void NatsArmClient::DeliverRosterLocked(const RosterChange& change) {
    if (change.added.empty() && change.deleted.empty() && change.modified.empty()) return;
    if (m_pApeSink == nullptr) return;
    IArmApeSink* const sink = m_pApeSink;
    const std::uint32_t ape = m_apeHandle;
    auto shared = std::make_shared<const RosterChange>(change);
    Post(Stage::Ape, [sink, ape, shared] {
        RosterBatch batch(*shared);
        batch.DeliverTo(*sink, ape, 0);
    });
}

void NatsArmClient::OnPresence(natsConnection*, natsSubscription*, natsMsg* msg, void* closure) {
    static_cast<NatsArmClient*>(closure)->HandlePresence(msg);
    natsMsg_Destroy(msg);
}

void NatsArmClient::HandlePresence(natsMsg* msg) {
    // Who announces is the subject's last token, which the server lets only that user use.
    const std::string user = ConferenceSubjects::LastToken(natsMsg_GetSubject(msg));
    const std::string state = NatsHeader(msg, "Qc-State");
    std::unique_lock<std::mutex> lock(m_mutex);
    if (user == m_options.user) {
        std::uint64_t probe = 0;
        if (state == kStateProbe && ParseDecimal(NatsHeader(msg, "Qc-Probe"), &probe) &&
            probe > m_probeSeen) {
            m_probeSeen = probe;
            lock.unlock();
            m_progress.notify_all();
        }
        return;
    }
    // Probes and echoes are not news, or every probe would find more to do.
    if (!IsValidConferenceUser(user) || (state != kStateAttached && state != kStateLeft)) return;
    ++m_activity;
    bool ok = true;
    PresenceState heard;
    heard.user = user;
    heard.userId = ConferenceUserId(user);
    heard.attached = state == kStateAttached;
    heard.nodeId = static_cast<std::uint32_t>(HeaderNumber(msg, "Qc-Node", &ok));
    heard.instance = HeaderNumber(msg, "Qc-Instance", &ok);
    heard.version = HeaderNumber(msg, "Qc-Version", &ok);
    heard.sessionId = static_cast<std::uint32_t>(HeaderNumber(msg, "Qc-Session", &ok));
    heard.enrollEpoch = HeaderNumber(msg, "Qc-Epoch", &ok);
    if (!ok) return;
    const auto* data = reinterpret_cast<const std::uint8_t*>(natsMsg_GetData(msg));
    heard.enrollInfo.assign(data, data + natsMsg_GetDataLength(msg));
    if (NatsHeader(msg, "Qc-Ask") == "1" && m_netAttached) AnnounceLocked(false);
    DeliverRosterLocked(m_presence.Apply(heard, NowMillis(), m_netAttached ? m_session : 0));
}
