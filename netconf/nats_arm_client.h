// One participant's service object on a conference carried by a NATS server (see
// nats_conference.h). Requests are checked and answered on the run loop's thread; whatever
// needs the server runs in order on the object's worker thread, and messages arriving from
// the server are turned into callbacks posted to the run loop. Once released, detached (ape,
// shared-data and handle callbacks), left (conference and ape callbacks) or destroyed (all),
// nothing more is delivered, not even callbacks already posted.
//
// Choices the contract leaves open, shared with the in-process conference: ConnectConfirm
// carries the node id; ApeDataIndication carries value 0 and the send option as flags;
// SharedDataReceivedEx carries the writer's action flags as value; ApeRosterChanged carries
// the receiver's ape handle as service id; a retrieval delivers every item. Connect answers
// 1202 and confirms once the server accepted the credentials. User ids derive from the
// credential name; named handles, session values and cache ids are sequence numbers of the
// conference's stream, so they are unique across processes. Any non-zero cache handle is
// taken (a handle nobody was granted names a cache that was never set); actions of different
// writers are ordered as the server stores them.
#pragma once

#include <atomic>
#include <condition_variable>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "netconf/conference_subjects.h"
#include "netconf/nats_conference.h"
#include "netconf/nats_handles.h"
#include "netconf/presence_table.h"
#include "netconf/serial_worker.h"
#include "netconf/subscription_end.h"
#include "platform/conference_mem_handles.h"

class NatsArmClient final : public IArmClient {
public:
    NatsArmClient(const NatsConferenceOptions& options, RunLoop& loop);
    ~NatsArmClient();
    NatsArmClient(const NatsArmClient&) = delete;
    NatsArmClient& operator=(const NatsArmClient&) = delete;

    int Release() override;
    int Connect(IArmNodeControllerSink* sink, const char* userName, std::uint32_t a,
                std::uint32_t b, std::uint32_t c) override;
    int Destroy(IArmNodeControllerSink* sink, int flag) override;
    int SetSendOption(int option, const ARMSendOption* value) override;
    int ConferenceJoin(std::uint32_t reserved, std::uint16_t conferenceId, IArmConferenceSink* sink,
                       int mode) override;
    int ConferenceLeave(std::uint32_t reserved, std::uint16_t conferenceId,
                        IArmConferenceSink* sink) override;
    int ApeAttach(IArmApeSink* sink, std::uint32_t reserved, std::uint16_t conferenceId,
                  std::uint32_t* apeHandle) override;
    int ApeEnroll(std::uint32_t apeHandle, int enroll, std::uint32_t sessionId,
                  std::uint32_t reserved, int resourceCount, ARMSessionResource* resources,
                  const void* enrollInfo, std::uint32_t enrollInfoLength, int mode) override;
    int ApeSendData(std::uint32_t apeHandle, std::uint32_t destUserId, int priority,
                    const void* data, std::uint32_t length, int reliable, int segment) override;
    int ApeDetach(std::uint32_t apeHandle) override;
    int RegisterSharedDataSink(std::uint32_t apeHandle, IArmSharedDataSink* sink) override;
    int AllocNameHandle(std::uint32_t apeHandle, std::uint32_t count, NameHandle* entries,
                        IArmAllocHandleSink* sink) override;
    int ApeSharedDataActionEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                              std::uint32_t reserved1, std::uint32_t reserved2,
                              tagCacheAction action, std::uint32_t flags, std::uint32_t memHandle,
                              std::uint32_t reserved3, int confirm) override;
    int ApeRequestSharedDataEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                               std::uint32_t reserved, tagCacheRequestType type,
                               std::uint32_t maxItems, IArmSharedDataSink* sink) override;
    int AllocMemHandle(std::uint32_t size, std::uint32_t* handle) override;
    int FreeMemHandle(std::uint32_t handle) override;
    int GetMemHandleSize(std::uint32_t handle, std::uint32_t* size) override;
    int WriteMemHandle(std::uint32_t handle, std::uint32_t offset, const void* data,
                       std::uint32_t* size) override;
    int ReadMemHandle(std::uint32_t handle, std::uint32_t offset, void* buffer,
                      std::uint32_t* size) override;

    // Waits until every request made so far was answered, the connection did a flush round
    // trip and everything that had reached this object was posted to its run loop. Returns
    // how many requests and messages it handled since the last call (0: it was quiet).
    std::uint64_t Settle();

    // The user id the credentials stand for.
    std::uint32_t UserId() const { return m_userId; }
    // Expires when the object is gone (released).
    std::weak_ptr<const void> Lifetime() const { return m_liveness; }

private:
    using Bytes = std::shared_ptr<const std::vector<std::uint8_t>>;

    // Which callbacks a posted answer belongs to; leaving a stage drops its pending answers.
    enum class Stage { Node, Conference, Ape };
    struct Liveness {
        std::atomic<std::uint32_t> epochs[3] = {{0}, {0}, {0}};
        std::atomic<std::uint32_t>& Of(Stage stage) { return epochs[static_cast<int>(stage)]; }
    };
    // How far the connection got.
    enum class Phase { Idle, Connecting, Connected };

    // A JetStream consumer delivering to this object: the private mailbox or a subscribed
    // cache. Its handler runs on the client's delivery thread.
    struct Feed {
        NatsArmClient* owner = nullptr;
        std::uint32_t handle = 0;            // cache handle; 0 for the mailbox
        IArmSharedDataSink* sink = nullptr;  // caches: where deliveries go (under m_mutex)
        bool active = true;                  // false once unsubscribed (under m_mutex)
        NatsPtr<natsSubscription> sub;
        SubscriptionEnd end;
        std::atomic<std::uint64_t> handled{0};  // consumer sequence handed on so far
        // Stream sequence handed on last (under m_mutex): a consumer the client recreates
        // after a failover may deliver again what came just before it.
        std::uint64_t lastStream = 0;
    };
    // A cache item as delivered from the stream.
    struct StoredAction {
        std::uint64_t sequence = 0;
        std::uint32_t senderId = 0;
        tagCacheAction action = CACHE_APPEND;
        std::uint32_t flags = 0;
        Bytes bytes;  // null: a set without bytes
        std::string msgId;
    };

    // Posting to the run loop from any thread. A task posted for a request carries the epoch
    // of the request's stage, so leaving the stage meanwhile drops it.
    std::uint32_t Epoch(Stage stage) const { return m_liveness->Of(stage); }
    void PostAt(Stage stage, std::uint32_t epoch, std::function<void()> task);
    void Post(Stage stage, std::function<void()> task) {
        PostAt(stage, Epoch(stage), std::move(task));
    }
    void PostLog(int level, std::string text);
    bool IsAttached(std::uint32_t apeHandle) const {
        return m_apeHandle != 0 && apeHandle == m_apeHandle;
    }
    // Whether the server-side part goes now, or with the connection (whose closing task the
    // caller queues).
    enum class Closing { Now, WithConnection };
    void Detach(Closing closing);
    void Leave(Closing closing);
    std::string NewMsgId();

    // Worker tasks (nats_arm_client_link.cpp, nats_arm_client_roster.cpp).
    void ConnectTask(IArmNodeControllerSink* sink, std::uint32_t epoch);
    void AttachTask(IArmApeSink* sink, std::uint32_t ape, std::uint32_t epoch);
    void DetachTask();
    // Leaves the conference on the server; the feeds it had, still open.
    std::vector<std::unique_ptr<Feed>> LeaveNetTask();
    void DisconnectTask();
    void Tick();
    bool EnsureStream(const std::string& name, const std::string& subjects, bool mailbox,
                      std::string* reason);
    // The number granted once per conference for subject: the stream sequence of the first
    // message ever published there (payload claim). 0 when the server cannot answer.
    std::uint64_t GrantNumber(const std::string& subject, const std::string& claim,
                              std::string* holder);
    // An ordered look at what stream stores under filter: everything, or with a start time
    // (nanoseconds since the epoch, not 0) what was stored since.
    natsStatus ReplayStored(const std::string& stream, const std::string& filter,
                            std::int64_t startNanos, NatsPtr<natsSubscription>* sub,
                            jsErrCode* error);
    // The data and stream sequence of the first message ever stored on subject.
    natsStatus FirstMessage(const std::string& subject, std::string* data, std::uint64_t* sequence);
    // Publishes to the stream, retrying the same message id while the server is away.
    // The stored sequence, or 0 with *reason set.
    std::uint64_t PublishStored(natsMsg* msg, const std::string& msgId, std::string* reason);
    bool SubscribeFeed(Feed& feed, const std::string& stream, const std::string& filter,
                       bool fromNow, std::int64_t startNanos, std::string* reason);
    // The stream sequence of the first message on filter stored at or after startNanos (the
    // next one to come when there is none yet).
    bool FirstSequenceSince(const std::string& stream, const std::string& filter,
                            std::int64_t startNanos, std::uint64_t* sequence, std::string* reason);
    void DropFeed(std::unique_ptr<Feed> feed);

    // Presence and roster (nats_arm_client_roster.cpp); m_mutex held.
    void AnnounceLocked(bool ask);
    void DeliverRosterLocked(const RosterChange& change);
    static void OnPresence(natsConnection*, natsSubscription*, natsMsg* msg, void* closure);
    void HandlePresence(natsMsg* msg);

    // Caches and private data (nats_arm_client_caches.cpp).
    static void OnFeed(natsConnection*, natsSubscription*, natsMsg* msg, void* closure);
    void HandleFeed(Feed& feed, natsMsg* msg);
    void RetrieveTask(std::uint32_t handle, IArmSharedDataSink* sink, std::uint32_t ape,
                      std::uint32_t epoch);
    void DeliverSharedLocked(std::uint32_t epoch, IArmSharedDataSink* sink, std::uint32_t ape,
                             std::uint32_t handle, const StoredAction& item, short result,
                             tagCacheAction action);
    static bool ReadAction(natsMsg* msg, StoredAction* item);

    // Connection-level callbacks reach the object through a registry, so a callback the
    // client runs after the object is gone finds nothing.
    static void OnAsyncError(natsConnection*, natsSubscription*, natsStatus status, void* closure);
    static void OnDisconnected(natsConnection*, void* closure);
    static void OnReconnected(natsConnection*, void* closure);

    static std::int64_t NowMillis();
    static std::uint32_t NewMemHandleNumber();

    const NatsConferenceOptions m_options;
    const ConferenceSubjects m_subjects;
    const std::uint32_t m_userId;
    const std::uint64_t m_instance;  // tells this object's announcements from a predecessor's
    const std::uintptr_t m_registryId;
    RunLoop& m_loop;
    std::shared_ptr<Liveness> m_liveness;

    // Loop thread only.
    bool m_bJoined = false;
    std::uint32_t m_sendOption = 0;
    std::uint32_t m_lastRequestIdx = 0;
    std::uint64_t m_nextMsg = 0;
    ConferenceMemHandles m_memory;

    // Shared with the worker and the client's threads.
    mutable std::mutex m_mutex;
    std::condition_variable m_progress;  // a feed or the presence probe moved on
    Phase m_phase = Phase::Idle;
    std::uint32_t m_apeHandle = 0;  // the loop's view of the attachment
    IArmApeSink* m_pApeSink = nullptr;
    IArmSharedDataSink* m_pSharedSink = nullptr;
    std::map<std::uint32_t, std::unique_ptr<Feed>> m_cacheFeeds;
    std::map<std::string, std::vector<std::function<void()>>> m_unconfirmed;  // by message id
    // The server's view: attached, enrolled where, with what.
    bool m_netAttached = false;
    std::uint32_t m_session = 0;
    std::uint64_t m_enrollEpoch = 0;
    std::uint64_t m_version = 0;
    std::vector<std::uint8_t> m_enrollInfo;
    std::int64_t m_lastAnnounce = 0;
    PresenceTable m_presence;
    std::uint64_t m_probeSent = 0;
    std::uint64_t m_probeSeen = 0;
    std::atomic<std::uint64_t> m_activity{0};
    std::uint64_t m_activityReported = 0;

    // Owned by the worker thread (and Settle while the worker is idle).
    NatsPtr<natsConnection> m_connection;
    NatsPtr<jsCtx> m_js;
    NatsPtr<natsSubscription> m_presenceSub;
    SubscriptionEnd m_presenceEnd;
    std::unique_ptr<Feed> m_mailbox;
    // Closed feeds whose handler had not returned for the last time yet; they go once the
    // connection is closed.
    std::vector<std::unique_ptr<Feed>> m_closingFeeds;

    SerialWorker m_worker;  // last: stops before anything it uses goes away
};
