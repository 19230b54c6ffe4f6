// The connection of one participant's service object: connecting, the conference's streams,
// the numbers granted once per conference, stored publishing and the consumers that feed it.
#include <chrono>
#include <map>
#include <thread>
#include <utility>

#include "netconf/nats_arm_client.h"
#include "netconf/netconf_results.h"
#include "platform/conference_results.h"

namespace {

constexpr std::int64_t kConnectTimeoutMs = 2000;
constexpr std::int64_t kRequestTimeoutMs = 5000;
constexpr std::int64_t kReconnectWaitMs = 250;
constexpr std::int64_t kPingIntervalMs = 2000;
constexpr int kMaxPingsOut = 2;
// How long a stored publish keeps retrying while the servers fail over.
constexpr auto kPublishPatience = std::chrono::seconds(30);
// How long making or finding a stream waits for a cluster that is not ready yet.
constexpr auto kStreamPatience = std::chrono::seconds(15);
// Private data waits at most this long in a mailbox for its receiver.
constexpr std::int64_t kMailboxMaxAgeNanos = 24LL * 3600 * 1000000000LL;

// Connection callbacks find their object here by number; an object unregisters before it
// goes, under the same lock the callbacks hold.
std::mutex g_registryMutex;
std::map<std::uintptr_t, NatsArmClient*> g_registry;

// Whether a failed request may well succeed when tried again in a moment: the server did not
// answer, or its cluster is between leaders.
bool IsPassing(natsStatus status, jsErrCode error) {
    return status == NATS_TIMEOUT || status == NATS_NO_RESPONDERS ||
           error == JSClusterNotAvailErr || error == JSClusterNoPeersErr;
}

}  // namespace

void NatsArmClient::ConnectTask(IArmNodeControllerSink* sink, std::uint32_t epoch) {
    natsOptions* rawOptions = nullptr;
    natsStatus status = natsOptions_Create(&rawOptions);
    NatsPtr<natsOptions> options(rawOptions);
    std::vector<const char*> urls;
    for (const std::string& url : m_options.serverUrls)
        urls.push_back(url.c_str());
    const std::string inbox = ConferenceSubjects::InboxPrefix(m_options.user);
    const void* const closure = reinterpret_cast<void*>(m_registryId);
    if (status == NATS_OK) {
        status = natsOptions_SetServers(rawOptions, urls.data(), static_cast<int>(urls.size()));
    }
    if (status == NATS_OK) {
        status =
            natsOptions_SetUserInfo(rawOptions, m_options.user.c_str(), m_options.password.c_str());
    }
    if (status == NATS_OK) status = natsOptions_SetCustomInboxPrefix(rawOptions, inbox.c_str());
    if (status == NATS_OK) status = natsOptions_SetName(rawOptions, m_options.user.c_str());
    if (status == NATS_OK) status = natsOptions_SetTimeout(rawOptions, kConnectTimeoutMs);
    if (status == NATS_OK) status = natsOptions_SetMaxReconnect(rawOptions, -1);
    if (status == NATS_OK) status = natsOptions_SetReconnectWait(rawOptions, kReconnectWaitMs);
    if (status == NATS_OK) status = natsOptions_SetPingInterval(rawOptions, kPingIntervalMs);
    if (status == NATS_OK) status = natsOptions_SetMaxPingsOut(rawOptions, kMaxPingsOut);
    if (status == NATS_OK) {
        status = natsOptions_SetErrorHandler(rawOptions, &NatsArmClient::OnAsyncError,
                                             const_cast<void*>(closure));
    }
    if (status == NATS_OK) {
        status = natsOptions_SetDisconnectedCB(rawOptions, &NatsArmClient::OnDisconnected,
                                               const_cast<void*>(closure));
    }
    if (status == NATS_OK) {
        status = natsOptions_SetReconnectedCB(rawOptions, &NatsArmClient::OnReconnected,
                                              const_cast<void*>(closure));
    }
    {
        const std::lock_guard<std::mutex> lock(g_registryMutex);
        g_registry[m_registryId] = this;
    }

    std::string reason;
    short result = kArmServerUnreachable;
    natsConnection* rawConnection = nullptr;
    if (status == NATS_OK) status = natsConnection_Connect(&rawConnection, rawOptions);
    if (status != NATS_OK) {
        reason = NatsErrorText(status);
    } else {
        m_connection.reset(rawConnection);
        result = kArmServerRefused;
        jsOptions jsOpts;
        jsOptions_Init(&jsOpts);
        jsOpts.Wait = kRequestTimeoutMs;
        jsCtx* rawJs = nullptr;
        status = natsConnection_JetStream(&rawJs, rawConnection, &jsOpts);
        m_js.reset(rawJs);
        if (status != NATS_OK) {
            reason = NatsErrorText(status);
        } else if (EnsureStream(m_subjects.CacheStream(), "", false, &reason)) {
            natsSubscription* rawSub = nullptr;
            const std::string presence = m_subjects.AllPresence();
            status = natsConnection_Subscribe(&rawSub, rawConnection, presence.c_str(),
                                              &NatsArmClient::OnPresence, this);
            m_presenceSub.reset(rawSub);
            if (status == NATS_OK) m_presenceEnd.Watch(rawSub);
            if (status == NATS_OK)
                status = natsConnection_FlushTimeout(rawConnection, kRequestTimeoutMs);
            if (status == NATS_OK) {
                result = 0;
            } else {
                reason = NatsErrorText(status);
            }
        }
    }
    if (result != 0) {
        m_presenceSub.reset();
        m_js.reset();
        if (m_connection) natsConnection_Close(m_connection.get());
        m_connection.reset();
    }
    const std::lock_guard<std::mutex> lock(m_mutex);
    m_phase = result == 0 ? Phase::Connected : Phase::Idle;
    const std::uint32_t nodeId = m_options.nodeId;
    std::string where;
    for (const std::string& url : m_options.serverUrls)
        where += (where.empty() ? "" : ", ") + url;
    if (result != 0) {
        PostLog(2, "NatsArmClient: no conference at " + where + " for " + m_options.user + ": " +
                       reason);
    } else {
        PostLog(0, "NatsArmClient: " + m_options.user + " connected to " + where);
    }
    PostAt(Stage::Node, epoch, [sink, result, nodeId] { sink->ConnectConfirm(result, nodeId); });
}

void NatsArmClient::AttachTask(IArmApeSink* sink, std::uint32_t ape, std::uint32_t epoch) {
    std::string reason;
    short result = 0;
    std::string holder;
    if (!m_connection) {
        result = kArmNotConnected;
        reason = "not connected";
    } else if (!EnsureStream(m_subjects.MailboxStream(m_options.user),
                             m_subjects.Mailbox(m_options.user), true, &reason)) {
        result = kArmServerRefused;
    } else if (GrantNumber(m_subjects.UserIdClaim(m_userId), m_options.user, &holder) == 0) {
        result = kArmServerRefused;
        reason = "user id claim not answered";
    } else if (holder != m_options.user) {
        result = kArmUserIdTaken;
        reason = "user id " + std::to_string(m_userId) + " is held by " + holder;
    } else {
        auto mailbox = std::make_unique<Feed>();
        mailbox->owner = this;
        if (SubscribeFeed(*mailbox, m_subjects.MailboxStream(m_options.user),
                          m_subjects.Mailbox(m_options.user), true, 0, &reason)) {
            m_mailbox = std::move(mailbox);
        } else {
            result = kArmServerRefused;
        }
    }
    const std::lock_guard<std::mutex> lock(m_mutex);
    if (result != 0) {
        PostLog(2, "NatsArmClient: attach of " + m_options.user + " failed: " + reason);
        if (m_apeHandle == ape) {
            m_apeHandle = 0;
            m_pApeSink = nullptr;
        }
        PostAt(Stage::Ape, epoch, [sink, result] { sink->ApeAttachConfirm(0, result, 0); });
        return;
    }
    m_netAttached = true;
    m_session = 0;
    AnnounceLocked(true);
    const std::uint32_t userId = m_userId;
    PostAt(Stage::Ape, epoch, [sink, ape, userId] { sink->ApeAttachConfirm(ape, 0, userId); });
}

void NatsArmClient::DetachTask() {
    for (std::unique_ptr<Feed>& feed : LeaveNetTask())
        DropFeed(std::move(feed));
}

std::vector<std::unique_ptr<NatsArmClient::Feed>> NatsArmClient::LeaveNetTask() {
    std::vector<std::unique_ptr<Feed>> feeds;
    const std::lock_guard<std::mutex> lock(m_mutex);
    if (m_netAttached && m_connection) {
        m_netAttached = false;
        AnnounceLocked(false);
    }
    m_netAttached = false;
    m_session = 0;
    m_enrollInfo.clear();
    m_presence.Clear();
    for (auto& entry : m_cacheFeeds)
        feeds.push_back(std::move(entry.second));
    m_cacheFeeds.clear();
    if (m_mailbox) feeds.push_back(std::move(m_mailbox));
    return feeds;
}

void NatsArmClient::DisconnectTask() {
    {
        // From here on no connection callback reaches this object; one running now finishes
        // first, as it holds the registry.
        const std::lock_guard<std::mutex> lock(g_registryMutex);
        g_registry.erase(m_registryId);
    }
    std::vector<std::unique_ptr<Feed>> feeds = LeaveNetTask();
    for (std::unique_ptr<Feed>& feed : m_closingFeeds)
        feeds.push_back(std::move(feed));
    m_closingFeeds.clear();
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        m_phase = Phase::Idle;
    }
    // Closing the connection ends every subscription at once. Closing the consumers one by
    // one instead would race the client recreating them after a reconnect; the server drops
    // consumers nobody listens to by itself.
    if (m_connection) {
        natsConnection_FlushTimeout(m_connection.get(), kRequestTimeoutMs);
        natsConnection_Close(m_connection.get());
    }
    // The handlers' last calls are awaited before the connection and what they use go.
    if (m_presenceSub && !m_presenceEnd.Ended(kRequestTimeoutMs)) {
        PostLog(2, "NatsArmClient: presence handler of " + m_options.user + " did not end");
    }
    for (std::unique_ptr<Feed>& feed : feeds) {
        // One that never ends is left behind rather than freed under its handler.
        if (feed->sub && !feed->end.Ended(kRequestTimeoutMs)) static_cast<void>(feed.release());
    }
    m_presenceSub.reset();
    m_js.reset();
    m_connection.reset();
}

bool NatsArmClient::EnsureStream(const std::string& name, const std::string& subjects, bool mailbox,
                                 std::string* reason) {
    const std::string caches = m_subjects.AllCaches();
    const std::string numbers = m_subjects.AllNumbers();
    const char* list[2] = {caches.c_str(), numbers.c_str()};
    const char* mailboxList[1] = {subjects.c_str()};
    jsStreamConfig config;
    jsStreamConfig_Init(&config);
    config.Name = name.c_str();
    config.Subjects = mailbox ? mailboxList : list;
    config.SubjectsLen = mailbox ? 1 : 2;
    config.Storage = js_FileStorage;
    config.Replicas = m_options.replicas;
    if (mailbox) config.MaxAge = kMailboxMaxAgeNanos;
    // A cluster that is still forming or electing a leader answers late or not at all for a
    // moment; that is worth waiting for, a refusal is not.
    const auto giveUp = std::chrono::steady_clock::now() + kStreamPatience;
    for (;;) {
        jsErrCode error = static_cast<jsErrCode>(0);
        jsStreamInfo* rawInfo = nullptr;
        natsStatus status = js_GetStreamInfo(&rawInfo, m_js.get(), name.c_str(), nullptr, &error);
        NatsPtr<jsStreamInfo> info(rawInfo);
        if (status == NATS_OK) return true;
        if (status == NATS_NOT_FOUND) {
            error = static_cast<jsErrCode>(0);
            rawInfo = nullptr;
            status = js_AddStream(&rawInfo, m_js.get(), &config, nullptr, &error);
            info.reset(rawInfo);
            // Somebody else may have made it meanwhile.
            if (status == NATS_OK || error == JSStreamNameExistErr) return true;
        }
        if (!IsPassing(status, error) || std::chrono::steady_clock::now() >= giveUp) {
            *reason = "stream " + name + ": " + NatsErrorText(status);
            return false;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(kReconnectWaitMs));
    }
}

std::uint64_t NatsArmClient::GrantNumber(const std::string& subject, const std::string& claim,
                                         std::string* holder) {
    if (!m_js) return 0;
    jsPubOptions options;
    jsPubOptions_Init(&options);
    options.ExpectNoMessage = true;
    // A stream whose copies are still electing a leader answers nothing for a moment.
    const auto giveUp = std::chrono::steady_clock::now() + kStreamPatience;
    for (;;) {
        jsErrCode error = static_cast<jsErrCode>(0);
        jsPubAck* rawAck = nullptr;
        natsStatus status = js_Publish(&rawAck, m_js.get(), subject.c_str(), claim.data(),
                                       static_cast<int>(claim.size()), &options, &error);
        NatsPtr<jsPubAck> ack(rawAck);
        if (status == NATS_OK) {
            *holder = claim;
            return ack->Sequence;
        }
        if (error == JSStreamWrongLastSequenceErr) {
            // Granted before: the first message there holds the number, whatever came later.
            std::uint64_t sequence = 0;
            status = FirstMessage(subject, holder, &sequence);
            if (status == NATS_OK) return sequence;
        }
        if (!IsPassing(status, error) || std::chrono::steady_clock::now() >= giveUp) return 0;
        std::this_thread::sleep_for(std::chrono::milliseconds(kReconnectWaitMs));
    }
}

natsStatus NatsArmClient::ReplayStored(const std::string& stream, const std::string& filter,
                                       std::int64_t startNanos, NatsPtr<natsSubscription>* sub,
                                       jsErrCode* error) {
    jsSubOptions options;
    jsSubOptions_Init(&options);
    options.Stream = stream.c_str();
    options.Ordered = true;
    options.Config.DeliverPolicy = startNanos != 0 ? js_DeliverByStartTime : js_DeliverAll;
    options.Config.OptStartTime = startNanos;
    natsSubscription* raw = nullptr;
    const natsStatus status =
        js_SubscribeSync(&raw, m_js.get(), filter.c_str(), nullptr, &options, error);
    sub->reset(raw);
    return status;
}

natsStatus NatsArmClient::FirstMessage(const std::string& subject, std::string* data,
                                       std::uint64_t* sequence) {
    jsErrCode error = static_cast<jsErrCode>(0);
    NatsPtr<natsSubscription> sub;
    natsStatus status = ReplayStored(m_subjects.CacheStream(), subject, 0, &sub, &error);
    natsSubscription* const raw = sub.get();
    natsMsg* rawMsg = nullptr;
    if (status == NATS_OK) status = natsSubscription_NextMsg(&rawMsg, raw, kRequestTimeoutMs);
    NatsPtr<natsMsg> msg(rawMsg);
    jsMsgMetaData* rawMeta = nullptr;
    if (status == NATS_OK) status = natsMsg_GetMetaData(&rawMeta, rawMsg);
    NatsPtr<jsMsgMetaData> meta(rawMeta);
    if (status == NATS_OK) {
        data->assign(natsMsg_GetData(rawMsg), natsMsg_GetDataLength(rawMsg));
        *sequence = meta->Sequence.Stream;
    }
    if (sub) natsSubscription_Unsubscribe(raw);
    return status;
}

std::uint64_t NatsArmClient::PublishStored(natsMsg* msg, const std::string& msgId,
                                           std::string* reason) {
    if (!m_js) {
        *reason = "not connected";
        return 0;
    }
    jsPubOptions options;
    jsPubOptions_Init(&options);
    options.MsgId = msgId.c_str();
    const auto giveUp = std::chrono::steady_clock::now() + kPublishPatience;
    for (;;) {
        jsErrCode error = static_cast<jsErrCode>(0);
        jsPubAck* rawAck = nullptr;
        const natsStatus status = js_PublishMsg(&rawAck, m_js.get(), msg, &options, &error);
        NatsPtr<jsPubAck> ack(rawAck);
        if (status == NATS_OK) return ack->Sequence;
        // The same message id again is stored once, however many tries reach the server.
        const bool transient = status == NATS_TIMEOUT || status == NATS_NO_RESPONDERS ||
                               status == NATS_CONNECTION_DISCONNECTED ||
                               status == NATS_CONNECTION_CLOSED;
        if (!transient || status == NATS_CONNECTION_CLOSED ||
            std::chrono::steady_clock::now() >= giveUp) {
            *reason = NatsErrorText(status);
            return 0;
        }
    }
}

bool NatsArmClient::SubscribeFeed(Feed& feed, const std::string& stream, const std::string& filter,
                                  bool fromNow, std::int64_t startNanos, std::string* reason) {
    std::uint64_t startSequence = 0;
    if (!fromNow && !FirstSequenceSince(stream, filter, startNanos, &startSequence, reason)) {
        return false;
    }
    jsSubOptions options;
    jsSubOptions_Init(&options);
    options.Stream = stream.c_str();
    options.Ordered = true;
    // By sequence, not by time: a consumer the client recreates after a failover resumes by
    // sequence, and the server refuses one that carries a start time as well.
    options.Config.DeliverPolicy = fromNow ? js_DeliverNew : js_DeliverByStartSequence;
    if (!fromNow) options.Config.OptStartSeq = startSequence;
    jsErrCode error = static_cast<jsErrCode>(0);
    natsSubscription* raw = nullptr;
    const natsStatus status = js_Subscribe(&raw, m_js.get(), filter.c_str(), &NatsArmClient::OnFeed,
                                           &feed, nullptr, &options, &error);
    feed.sub.reset(raw);
    if (status == NATS_OK) feed.end.Watch(raw);
    if (status != NATS_OK) {
        *reason = "consumer on " + filter + ": " + NatsErrorText(status);
        feed.sub.reset();
        return false;
    }
    return true;
}

bool NatsArmClient::FirstSequenceSince(const std::string& stream, const std::string& filter,
                                       std::int64_t startNanos, std::uint64_t* sequence,
                                       std::string* reason) {
    // A consumer by start time that nothing has been delivered by yet stands right before
    // the first action stored since; one that already delivered names it in that message.
    jsErrCode error = static_cast<jsErrCode>(0);
    NatsPtr<natsSubscription> sub;
    natsStatus status = ReplayStored(stream, filter, startNanos, &sub, &error);
    natsSubscription* const raw = sub.get();
    jsConsumerInfo* rawInfo = nullptr;
    if (status == NATS_OK)
        status = natsSubscription_GetConsumerInfo(&rawInfo, raw, nullptr, &error);
    NatsPtr<jsConsumerInfo> info(rawInfo);
    if (status == NATS_OK && info->Delivered.Consumer == 0) {
        *sequence = info->Delivered.Stream + 1;
    } else if (status == NATS_OK) {
        natsMsg* rawMsg = nullptr;
        jsMsgMetaData* rawMeta = nullptr;
        status = natsSubscription_NextMsg(&rawMsg, raw, kRequestTimeoutMs);
        NatsPtr<natsMsg> msg(rawMsg);
        if (status == NATS_OK) status = natsMsg_GetMetaData(&rawMeta, rawMsg);
        NatsPtr<jsMsgMetaData> meta(rawMeta);
        if (status == NATS_OK) *sequence = meta->Sequence.Stream;
    }
    if (sub) natsSubscription_Unsubscribe(raw);
    if (status != NATS_OK) {
        *reason = "start of " + filter + ": " + NatsErrorText(status);
        return false;
    }
    return true;
}

void NatsArmClient::DropFeed(std::unique_ptr<Feed> feed) {
    if (!feed || !feed->sub) return;
    // The feed goes only once its handler has run for the last time.
    if (!feed->end.Close(feed->sub.get(), kRequestTimeoutMs)) {
        m_closingFeeds.push_back(std::move(feed));
    }
}

void NatsArmClient::Tick() {
    const std::lock_guard<std::mutex> lock(m_mutex);
    if (!m_connection) return;
    const std::int64_t now = NowMillis();
    if (m_netAttached && now - m_lastAnnounce >= PresenceTable::kSilenceLimit / 3) {
        AnnounceLocked(false);
    }
    DeliverRosterLocked(m_presence.Expire(now, m_session));
}

void NatsArmClient::OnAsyncError(natsConnection*, natsSubscription*, natsStatus status,
                                 void* closure) {
    const std::lock_guard<std::mutex> lock(g_registryMutex);
    const auto it = g_registry.find(reinterpret_cast<std::uintptr_t>(closure));
    if (it == g_registry.end()) return;
    it->second->PostLog(1, "NatsArmClient: the server reports: " + NatsErrorText(status));
}

void NatsArmClient::OnDisconnected(natsConnection*, void* closure) {
    const std::lock_guard<std::mutex> lock(g_registryMutex);
    const auto it = g_registry.find(reinterpret_cast<std::uintptr_t>(closure));
    if (it == g_registry.end()) return;
    it->second->PostLog(
        1, "NatsArmClient: connection of " + it->second->m_options.user + " lost, reconnecting");
}

void NatsArmClient::OnReconnected(natsConnection*, void* closure) {
    const std::lock_guard<std::mutex> lock(g_registryMutex);
    const auto it = g_registry.find(reinterpret_cast<std::uintptr_t>(closure));
    if (it == g_registry.end()) return;
    NatsArmClient& client = *it->second;
    client.PostLog(0, "NatsArmClient: connection of " + client.m_options.user + " restored");
    // Whoever forgot this participant meanwhile learns of it again, and it of them.
    const std::lock_guard<std::mutex> own(client.m_mutex);
    if (client.m_netAttached) client.AnnounceLocked(true);
}
