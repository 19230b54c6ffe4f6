#include "platform/inproc_conference.h"

#include <algorithm>
#include <utility>

InProcessConference::InProcessConference(std::uint16_t conferenceId)
    : m_conferenceId(conferenceId) {}

InProcessConference::~InProcessConference() {
    // Destroying a service object reports nothing, so the loops may already be gone.
    m_clients.clear();
}

InProcessArmClient* InProcessConference::CreateClient(RunLoop& loop, std::uint32_t nodeId) {
    m_clients.emplace_back(new InProcessArmClient(*this, loop, nodeId));
    return m_clients.back().get();
}

std::uint32_t InProcessConference::SessionValue(std::uint32_t sessionId) const {
    const auto it = m_sessions.find(sessionId);
    return it == m_sessions.end() ? 0 : it->second.value;
}

std::uint32_t InProcessConference::GrantSessionValue(std::uint32_t sessionId) {
    Session& session = m_sessions[sessionId];
    if (session.value == 0) session.value = m_nextSessionValue++;
    return session.value;
}

std::uint32_t InProcessConference::NameHandleFor(const std::string& name) {
    const auto found = m_nameHandles.find(name);
    if (found != m_nameHandles.end()) return found->second;
    const std::uint32_t handle = m_nextNameHandle++;
    m_nameHandles.emplace(name, handle);
    m_caches.emplace(handle, ConferenceCache());
    return handle;
}

ConferenceCache* InProcessConference::FindCache(std::uint32_t handle) {
    const auto it = m_caches.find(handle);
    return it == m_caches.end() ? nullptr : &it->second;
}

InProcessArmClient* InProcessConference::FindUser(std::uint32_t userId) const {
    if (userId == 0) return nullptr;
    for (const std::unique_ptr<InProcessArmClient>& client : m_clients) {
        if (client->UserId() == userId) return client.get();
    }
    return nullptr;
}

void InProcessConference::Enroll(InProcessArmClient& client, std::uint32_t sessionId) {
    std::uint32_t current = 0;
    if (SessionOf(client, &current) != nullptr && current != sessionId) Withdraw(client);
    Session& session = m_sessions[sessionId];
    RosterRecord record{sessionId, {client.RosterEntry()}};
    RosterChange change;
    const bool member =
        std::find(session.members.begin(), session.members.end(), &client) != session.members.end();
    if (member) {
        change.modified.push_back(std::move(record));
    } else {
        // A newcomer learns first who is already there.
        if (!session.members.empty()) {
            RosterChange present;
            RosterRecord everyone{sessionId, {}};
            for (const InProcessArmClient* other : session.members) {
                everyone.users.push_back(other->RosterEntry());
            }
            present.added.push_back(std::move(everyone));
            client.DeliverRoster(std::make_shared<const RosterChange>(std::move(present)));
        }
        session.members.push_back(&client);
        change.added.push_back(std::move(record));
    }
    Report(session, change);
}

void InProcessConference::Withdraw(InProcessArmClient& client) {
    std::uint32_t sessionId = 0;
    Session* session = SessionOf(client, &sessionId);
    if (session == nullptr) return;
    session->members.erase(std::find(session->members.begin(), session->members.end(), &client));
    RosterChange change;
    change.deleted.push_back({sessionId, {client.RosterEntry()}});
    Report(*session, change);
}

void InProcessConference::DropSubscriptions(const InProcessArmClient& client) {
    for (auto& entry : m_caches)
        entry.second.Unsubscribe(&client);
}

void InProcessConference::Remove(InProcessArmClient* client) {
    client->Detach();
    m_clients.erase(std::find_if(m_clients.begin(), m_clients.end(),
                                 [client](const std::unique_ptr<InProcessArmClient>& held) {
                                     return held.get() == client;
                                 }));
}

void InProcessConference::Report(const Session& session, const RosterChange& change) {
    const auto shared = std::make_shared<const RosterChange>(change);
    for (InProcessArmClient* member : session.members)
        member->DeliverRoster(shared);
}

InProcessConference::Session* InProcessConference::SessionOf(const InProcessArmClient& client,
                                                             std::uint32_t* sessionId) {
    for (auto& entry : m_sessions) {
        const std::vector<InProcessArmClient*>& members = entry.second.members;
        if (std::find(members.begin(), members.end(), &client) != members.end()) {
            if (sessionId != nullptr) *sessionId = entry.first;
            return &entry.second;
        }
    }
    return nullptr;
}
