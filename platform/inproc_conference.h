// The embedded conference service: one in-process conference whose participants each hold
// their own service object bound to their own run loop. Every answer is a callback posted to
// that loop. All participants and loops run on one thread.
#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/conference_cache.h"
#include "platform/host_kit.h"
#include "platform/inproc_conference_client.h"

class RunLoop;

class QC_HOST_KIT InProcessConference {
public:
    explicit InProcessConference(std::uint16_t conferenceId = 1);
    // Destroys the service objects not yet released, without delivering anything more.
    ~InProcessConference();
    InProcessConference(const InProcessConference&) = delete;
    InProcessConference& operator=(const InProcessConference&) = delete;

    // A new participant's service object, answering on loop (which must outlive it). It lives
    // until its Release() or the conference's end.
    InProcessArmClient* CreateClient(RunLoop& loop, std::uint32_t nodeId);

    // The id ConferenceJoin and ApeAttach must name.
    std::uint16_t ConferenceId() const { return m_conferenceId; }
    // Service objects created and not yet released.
    std::size_t ClientCount() const { return m_clients.size(); }
    // The value granted for "c_session_id" in sessionId, 0 before anybody enrolled there.
    std::uint32_t SessionValue(std::uint32_t sessionId) const;

private:
    friend class InProcessArmClient;

    // One application session: its granted value and its members in enroll order.
    struct Session {
        std::uint32_t value = 0;
        std::vector<InProcessArmClient*> members;
    };

    // Numbers given out once per conference, each family in its own range so that a handle
    // passed where another kind belongs is refused.
    std::uint32_t NewUserId() { return m_nextUserId++; }
    std::uint32_t NewApeHandle() { return m_nextApeHandle++; }
    std::uint32_t NewMemHandle() { return m_nextMemHandle++; }

    // The session value of sessionId, granted on first use.
    std::uint32_t GrantSessionValue(std::uint32_t sessionId);
    // The same non-zero handle for the same name, for everybody.
    std::uint32_t NameHandleFor(const std::string& name);
    // The cache of a handle NameHandleFor gave out, or null.
    ConferenceCache* FindCache(std::uint32_t handle);
    // The attached participant holding userId, or null.
    InProcessArmClient* FindUser(std::uint32_t userId) const;

    // Enrolls (or re-enrolls) client in sessionId and reports the change to every member.
    void Enroll(InProcessArmClient& client, std::uint32_t sessionId);
    // Takes client out of its session, reporting the deletion to the members left.
    void Withdraw(InProcessArmClient& client);
    // Ends every subscription of client.
    void DropSubscriptions(const InProcessArmClient& client);
    // Tears client down and destroys it.
    void Remove(InProcessArmClient* client);

    // Posts one roster change to every member of session.
    static void Report(const Session& session, const RosterChange& change);
    // The session client is enrolled in, or null.
    Session* SessionOf(const InProcessArmClient& client, std::uint32_t* sessionId = nullptr);

    const std::uint16_t m_conferenceId;

    // Participants, and the named handles with their caches.
    std::vector<std::unique_ptr<InProcessArmClient>> m_clients;
    std::map<std::string, std::uint32_t> m_nameHandles;
    std::unordered_map<std::uint32_t, ConferenceCache> m_caches;
    std::map<std::uint32_t, Session> m_sessions;

    // Next numbers of each family.
    std::uint32_t m_nextUserId = 1001;
    std::uint32_t m_nextApeHandle = 20001;
    std::uint32_t m_nextNameHandle = 50001;
    std::uint32_t m_nextMemHandle = 0x100001;
    std::uint32_t m_nextSessionValue = 70001;
};
