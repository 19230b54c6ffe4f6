// Shared-data caches, private data arriving in the mailbox and memory handles of one
// participant's service object.
#include <chrono>
#include <utility>

#include "netconf/nats_arm_client.h"
#include "netconf/netconf_results.h"
#include "platform/conference_arguments.h"
#include "platform/conference_results.h"

namespace {

constexpr std::int64_t kRetrieveWaitMs = 5000;

std::int64_t WallClockNanos() {
    return std::chrono::duration_cast<std::chrono::nanoseconds>(
               std::chrono::system_clock::now().time_since_epoch())
        .count();
}

}  // namespace

int NatsArmClient::ApeSharedDataActionEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                         std::uint32_t, std::uint32_t, tagCacheAction action,
                                         std::uint32_t flags, std::uint32_t memHandle,
                                         std::uint32_t, int confirm) {
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    if (cacheHandle == 0) return kArmUnknownHandle;
    Bytes data;
    if (const int refusal = CacheActionBytes(action, memHandle, m_memory, &data)) return refusal;
    IArmApeSink* const sink = m_pApeSink;
    const std::uint32_t ape = m_apeHandle;
    const std::uint32_t requestIdx = ++m_lastRequestIdx;
    const std::string msgId = NewMsgId();
    const std::uint32_t epoch = Epoch(Stage::Ape);
    m_worker.Enqueue([this, sink, ape, cacheHandle, action, flags, data, confirm, requestIdx, msgId,
                      epoch] {
        const std::string subject = m_subjects.CacheAction(cacheHandle, m_options.user);
        natsMsg* raw = nullptr;
        const char* bytes = data ? reinterpret_cast<const char*>(data->data()) : nullptr;
        const int length = data ? static_cast<int>(data->size()) : 0;
        if (natsMsg_Create(&raw, subject.c_str(), nullptr, bytes, length) != NATS_OK) return;
        NatsPtr<natsMsg> msg(raw);
        SetNatsHeader(raw, "Qc-Action", std::to_string(static_cast<int>(action)));
        SetNatsHeader(raw, "Qc-Flags", std::to_string(flags));
        if (!data) SetNatsHeader(raw, "Qc-Empty", "1");
        if (confirm != 0) {
            // The writer's own delivery waits until its confirmation is posted.
            const std::lock_guard<std::mutex> lock(m_mutex);
            m_unconfirmed[msgId];
        }
        std::string reason;
        const std::uint64_t sequence = PublishStored(raw, msgId, &reason);
        const short result = sequence == 0 ? kArmServerRefused : 0;
        if (result != 0) PostLog(1, "NatsArmClient: cache action not stored: " + reason);
        if (confirm == 0) return;
        const std::lock_guard<std::mutex> lock(m_mutex);
        const std::uint32_t cacheId = static_cast<std::uint32_t>(sequence);
        PostAt(Stage::Ape, epoch, [sink, ape, cacheHandle, action, requestIdx, cacheId, result] {
            sink->ApeCacheActionConfirmEx(ape, cacheHandle, action, requestIdx, cacheId, result);
        });
        const auto held = m_unconfirmed.find(msgId);
        for (std::function<void()>& deliver : held->second)
            deliver();
        m_unconfirmed.erase(held);
    });
    return 0;
}

int NatsArmClient::ApeRequestSharedDataEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                          std::uint32_t, tagCacheRequestType type, std::uint32_t,
                                          IArmSharedDataSink* sink) {
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    if (cacheHandle == 0) return kArmUnknownHandle;
    std::unique_lock<std::mutex> lock(m_mutex);
    IArmSharedDataSink* const target = sink != nullptr ? sink : m_pSharedSink;
    const auto found = m_cacheFeeds.find(cacheHandle);
    if (type == CACHE_REQUEST_UNSUBSCRIBE) {
        if (found == m_cacheFeeds.end()) return 0;
        // Nothing more is handed on from now; the consumer goes in turn.
        found->second->active = false;
        auto feed = std::make_shared<std::unique_ptr<Feed>>(std::move(found->second));
        m_cacheFeeds.erase(found);
        lock.unlock();
        m_worker.Enqueue([this, feed] { DropFeed(std::move(*feed)); });
        return 0;
    }
    if (target == nullptr) return kArmInvalidArgument;
    const std::uint32_t ape = m_apeHandle;
    if (type == CACHE_REQUEST_SUBSCRIBE) {
        if (found != m_cacheFeeds.end()) {
            found->second->sink = target;
            return 0;
        }
        auto created = std::make_unique<Feed>();
        Feed* const feed = created.get();
        feed->owner = this;
        feed->handle = cacheHandle;
        feed->sink = target;
        m_cacheFeeds.emplace(cacheHandle, std::move(created));
        lock.unlock();
        // Every action stored from this moment on is delivered.
        const std::int64_t start = WallClockNanos();
        m_worker.Enqueue([this, feed, start] {
            std::string reason;
            if (!SubscribeFeed(*feed, m_subjects.CacheStream(),
                               m_subjects.CacheFilter(feed->handle), false, start, &reason)) {
                PostLog(1, "NatsArmClient: subscription failed: " + reason);
            }
        });
        return 0;
    }
    if (type != CACHE_REQUEST_RETRIEVE) return kArmInvalidArgument;
    lock.unlock();
    const std::uint32_t epoch = Epoch(Stage::Ape);
    m_worker.Enqueue(
        [this, cacheHandle, target, ape, epoch] { RetrieveTask(cacheHandle, target, ape, epoch); });
    return 0;
}

void NatsArmClient::RetrieveTask(std::uint32_t handle, IArmSharedDataSink* sink, std::uint32_t ape,
                                 std::uint32_t epoch) {
    std::vector<StoredAction> items;
    bool everSet = false;
    bool complete = false;
    if (m_js) {
        jsErrCode error = static_cast<jsErrCode>(0);
        NatsPtr<natsSubscription> sub;
        natsStatus status =
            ReplayStored(m_subjects.CacheStream(), m_subjects.CacheFilter(handle), 0, &sub, &error);
        natsSubscription* const raw = sub.get();
        jsConsumerInfo* rawInfo = nullptr;
        if (status == NATS_OK) {
            status = natsSubscription_GetConsumerInfo(&rawInfo, raw, nullptr, &error);
        }
        NatsPtr<jsConsumerInfo> info(rawInfo);
        if (status == NATS_OK) {
            // The consumer may have pushed items before it was asked about them.
            complete = info->NumPending == 0 && info->Delivered.Consumer == 0;
            while (!complete) {
                natsMsg* rawMsg = nullptr;
                if (natsSubscription_NextMsg(&rawMsg, raw, kRetrieveWaitMs) != NATS_OK) break;
                NatsPtr<natsMsg> msg(rawMsg);
                jsMsgMetaData* rawMeta = nullptr;
                if (natsMsg_GetMetaData(&rawMeta, rawMsg) != NATS_OK) break;
                NatsPtr<jsMsgMetaData> meta(rawMeta);
                complete = meta->NumPending == 0;
                StoredAction item;
                if (!ReadAction(rawMsg, &item)) continue;
                everSet = true;
                if (item.action == CACHE_SET) items.clear();
                if (item.bytes) items.push_back(std::move(item));
            }
            natsSubscription_Unsubscribe(raw);
        }
        if (!complete) {
            PostLog(1, "NatsArmClient: retrieval of cache " + std::to_string(handle) +
                           " incomplete: " + NatsErrorText(status));
        }
    }
    const std::lock_guard<std::mutex> lock(m_mutex);
    if (items.empty()) {
        const short result = !complete ? kArmServerRefused : everSet ? 0 : kArmRetry;
        DeliverSharedLocked(epoch, sink, ape, handle, StoredAction(), result, CACHE_REPLY_LAST);
        return;
    }
    for (std::size_t i = 0; i < items.size(); ++i) {
        DeliverSharedLocked(epoch, sink, ape, handle, items[i], 0,
                            i + 1 < items.size() ? CACHE_REPLY_ITEM : CACHE_REPLY_LAST);
    }
}

void NatsArmClient::OnFeed(natsConnection*, natsSubscription*, natsMsg* msg, void* closure) {
    Feed& feed = *static_cast<Feed*>(closure);
    feed.owner->HandleFeed(feed, msg);
    natsMsg_Destroy(msg);
}

void NatsArmClient::HandleFeed(Feed& feed, natsMsg* msg) {
    ++m_activity;
    jsMsgMetaData* rawMeta = nullptr;
    if (natsMsg_GetMetaData(&rawMeta, msg) != NATS_OK) return;
    NatsPtr<jsMsgMetaData> meta(rawMeta);
    std::unique_lock<std::mutex> lock(m_mutex);
    const bool again = meta->Sequence.Stream <= feed.lastStream;
    if (!again) feed.lastStream = meta->Sequence.Stream;
    if (again) {
        // Handed on before the consumer was recreated.
    } else if (feed.handle == 0) {
        // Private data: the sender is the subject's last token, which only it may publish.
        const std::string sender = ConferenceSubjects::LastToken(natsMsg_GetSubject(msg));
        std::uint64_t flags = 0;
        ParseDecimal(NatsHeader(msg, "Qc-Flags"), &flags);
        IArmApeSink* const sink = m_pApeSink;
        const std::uint32_t ape = m_apeHandle;
        if (sink != nullptr && IsValidConferenceUser(sender)) {
            const std::uint32_t senderId = ConferenceUserId(sender);
            const char* data = natsMsg_GetData(msg);
            auto bytes = std::make_shared<const std::vector<std::uint8_t>>(
                data, data + natsMsg_GetDataLength(msg));
            const std::uint16_t option = static_cast<std::uint16_t>(flags);
            Post(Stage::Ape, [sink, ape, senderId, option, bytes] {
                sink->ApeDataIndication(ape, senderId, 0, option, bytes->data(),
                                        static_cast<std::uint32_t>(bytes->size()));
            });
        }
    } else {
        StoredAction item;
        if (feed.active && ReadAction(msg, &item)) {
            const auto held = m_unconfirmed.find(item.msgId);
            IArmSharedDataSink* const sink = feed.sink;
            const std::uint32_t ape = m_apeHandle;
            const std::uint32_t handle = feed.handle;
            const std::uint32_t epoch = Epoch(Stage::Ape);
            if (held == m_unconfirmed.end()) {
                DeliverSharedLocked(epoch, sink, ape, handle, item, 0, item.action);
            } else {
                held->second.push_back([this, epoch, sink, ape, handle, item] {
                    DeliverSharedLocked(epoch, sink, ape, handle, item, 0, item.action);
                });
            }
        }
    }
    feed.handled = meta->Sequence.Consumer;
    lock.unlock();
    m_progress.notify_all();
}

bool NatsArmClient::ReadAction(natsMsg* msg, StoredAction* item) {
    const std::string writer = ConferenceSubjects::LastToken(natsMsg_GetSubject(msg));
    std::uint64_t action = 0, flags = 0;
    if (!IsValidConferenceUser(writer) || !ParseDecimal(NatsHeader(msg, "Qc-Action"), &action) ||
        (action != CACHE_SET && action != CACHE_APPEND) ||
        !ParseDecimal(NatsHeader(msg, "Qc-Flags"), &flags)) {
        return false;
    }
    item->sequence = natsMsg_GetSequence(msg);
    if (item->sequence == 0) {
        jsMsgMetaData* rawMeta = nullptr;
        if (natsMsg_GetMetaData(&rawMeta, msg) == NATS_OK) {
            item->sequence = rawMeta->Sequence.Stream;
            jsMsgMetaData_Destroy(rawMeta);
        }
    }
    item->senderId = ConferenceUserId(writer);
    item->action = static_cast<tagCacheAction>(action);
    item->flags = static_cast<std::uint32_t>(flags);
    item->msgId = NatsHeader(msg, "Nats-Msg-Id");
    if (NatsHeader(msg, "Qc-Empty") != "1") {
        const char* data = natsMsg_GetData(msg);
        item->bytes = std::make_shared<const std::vector<std::uint8_t>>(
            data, data + natsMsg_GetDataLength(msg));
    } else if (action == CACHE_APPEND) {
        return false;
    }
    return true;
}

void NatsArmClient::DeliverSharedLocked(std::uint32_t epoch, IArmSharedDataSink* sink,
                                        std::uint32_t ape, std::uint32_t handle,
                                        const StoredAction& item, short result,
                                        tagCacheAction action) {
    if (sink == nullptr) return;
    std::weak_ptr<Liveness> token = m_liveness;
    const std::uint32_t cacheId = static_cast<std::uint32_t>(item.sequence);
    const std::uint32_t senderId = item.senderId;
    const std::uint32_t value = item.flags;
    Bytes bytes = item.bytes;
    PostAt(Stage::Ape, epoch,
           [this, token = std::move(token), sink, ape, handle, cacheId, senderId, value, result,
            action, bytes] {
               // The receiver reads the item through a handle of its own, valid for this call.
               std::uint32_t memHandle = 0;
               if (bytes) {
                   memHandle = NewMemHandleNumber();
                   m_memory.Adopt(memHandle, *bytes);
               }
               sink->SharedDataReceivedEx(ape, cacheId, handle, memHandle, result, action, senderId,
                                          value, 0);
               // The callback may have released this object (and with it the handle) or freed it.
               if (memHandle != 0 && !token.expired()) m_memory.Free(memHandle);
           });
}

int NatsArmClient::AllocMemHandle(std::uint32_t size, std::uint32_t* handle) {
    if (handle == nullptr) return kArmInvalidArgument;
    const std::uint32_t number = NewMemHandleNumber();
    const int result = m_memory.Allocate(number, size);
    if (result == 0) *handle = number;
    return result;
}

int NatsArmClient::FreeMemHandle(std::uint32_t handle) {
    return m_memory.Free(handle);
}

int NatsArmClient::GetMemHandleSize(std::uint32_t handle, std::uint32_t* size) {
    return m_memory.GetSize(handle, size);
}

int NatsArmClient::WriteMemHandle(std::uint32_t handle, std::uint32_t offset, const void* data,
                                  std::uint32_t* size) {
    return m_memory.Write(handle, offset, data, size);
}

int NatsArmClient::ReadMemHandle(std::uint32_t handle, std::uint32_t offset, void* buffer,
                                 std::uint32_t* size) {
    return m_memory.Read(handle, offset, buffer, size);
}

std::uint64_t NatsArmClient::Settle() {
    m_worker.WaitIdle();
    if (m_connection) {
        natsConnection_FlushTimeout(m_connection.get(), kRetrieveWaitMs);
        std::unique_lock<std::mutex> lock(m_mutex);
        // A probe through the presence subscription comes back after everything before it.
        const std::uint64_t probe = ++m_probeSent;
        const std::string subject = m_subjects.Presence(m_options.user);
        natsMsg* raw = nullptr;
        if (natsMsg_Create(&raw, subject.c_str(), nullptr, nullptr, 0) == NATS_OK) {
            NatsPtr<natsMsg> msg(raw);
            SetNatsHeader(raw, "Qc-State", "probe");
            SetNatsHeader(raw, "Qc-Probe", std::to_string(probe));
            natsConnection_PublishMsg(m_connection.get(), raw);
            natsConnection_Flush(m_connection.get());
            m_progress.wait_for(lock, std::chrono::milliseconds(kRetrieveWaitMs),
                                [this, probe] { return m_probeSeen >= probe; });
        }
        std::vector<Feed*> feeds;
        if (m_mailbox && m_mailbox->sub) feeds.push_back(m_mailbox.get());
        for (auto& entry : m_cacheFeeds) {
            if (entry.second->sub) feeds.push_back(entry.second.get());
        }
        lock.unlock();
        // Every consumer has handed on all it delivered, and has nothing left to deliver.
        const auto giveUp = std::chrono::steady_clock::now() + std::chrono::seconds(10);
        for (Feed* feed : feeds) {
            while (std::chrono::steady_clock::now() < giveUp) {
                jsConsumerInfo* rawInfo = nullptr;
                jsErrCode error = static_cast<jsErrCode>(0);
                if (natsSubscription_GetConsumerInfo(&rawInfo, feed->sub.get(), nullptr, &error) !=
                    NATS_OK) {
                    break;
                }
                NatsPtr<jsConsumerInfo> info(rawInfo);
                const std::uint64_t delivered = info->Delivered.Consumer;
                if (info->NumPending == 0 && feed->handled >= delivered) break;
                lock.lock();
                m_progress.wait_for(lock, std::chrono::milliseconds(50),
                                    [feed, delivered] { return feed->handled >= delivered; });
                lock.unlock();
            }
        }
    }
    const std::uint64_t activity = m_activity + m_worker.TasksRun();
    const std::uint64_t since = activity - m_activityReported;
    m_activityReported = activity;
    return since;
}
