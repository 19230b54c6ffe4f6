#include "platform/inproc_conference_client.h"

#include <cstring>
#include <string>
#include <utility>

#include "platform/conference_results.h"
#include "platform/inproc_conference.h"
#include "platform/run_loop.h"

namespace {

// The option code SetSendOption takes for the next send's option.
constexpr int kSendOptionCode = -200;
// The session resource every enroller is granted.
constexpr char kSessionResourceName[] = "c_session_id";
// Resource status of a resource that was not granted.
constexpr std::uint16_t kResourceRefused = 1;
// Most entries one request may carry.
constexpr std::uint32_t kMaxEntries = 4096;

// The answer of one enroll: copies of the resources, pointing at copies of their names.
struct EnrollAnswer {
    std::vector<std::string> names;
    std::vector<ARMSessionResource> resources;
};

std::shared_ptr<const std::vector<std::uint8_t>> CopyBytes(const void* data, std::uint32_t length) {
    const auto* bytes = static_cast<const std::uint8_t*>(data);
    return std::make_shared<const std::vector<std::uint8_t>>(bytes, bytes + length);
}

}  // namespace

InProcessArmClient::InProcessArmClient(InProcessConference& conference, RunLoop& loop,
                                       std::uint32_t nodeId)
    : m_conference(conference),
      m_loop(loop),
      m_nodeId(nodeId),
      m_liveness(std::make_shared<Liveness>()) {}

InProcessArmClient::~InProcessArmClient() = default;

int InProcessArmClient::Release() {
    // The conference destroys this object: nothing of it may be touched afterwards.
    m_conference.Remove(this);
    return 0;
}

int InProcessArmClient::Connect(IArmNodeControllerSink* sink, const char* /*userName*/,
                                std::uint32_t, std::uint32_t, std::uint32_t) {
    if (const auto fault = Fault(ArmOperation::Connect)) return *fault;
    if (sink == nullptr) return kArmInvalidArgument;
    if (m_bConnected) return kArmAlreadyConnected;
    const short result = ConfirmResult(ArmConfirmation::ConnectConfirm);
    m_bConnected = result == 0;
    const std::uint32_t value = m_nodeId;
    Post(Stage::Node, [sink, result, value] { sink->ConnectConfirm(result, value); });
    return 0;
}

int InProcessArmClient::Destroy(IArmNodeControllerSink*, int) {
    if (const auto fault = Fault(ArmOperation::Destroy)) return *fault;
    Leave();
    m_bConnected = false;
    ++m_liveness->Of(Stage::Node);
    return 0;
}

int InProcessArmClient::SetSendOption(int option, const ARMSendOption* value) {
    if (const auto fault = Fault(ArmOperation::SetSendOption)) return *fault;
    if (option != kSendOptionCode || value == nullptr) return kArmInvalidArgument;
    if (!IsAttached(value->dwApeHandle)) return kArmBadApeHandle;
    m_sendOption = value->dwOption;
    return 0;
}

int InProcessArmClient::ConferenceJoin(std::uint32_t, std::uint16_t conferenceId,
                                       IArmConferenceSink* sink, int) {
    if (const auto fault = Fault(ArmOperation::ConferenceJoin)) return *fault;
    if (sink == nullptr) return kArmInvalidArgument;
    if (conferenceId != m_conference.ConferenceId()) return kArmNoSuchConference;
    if (!m_bConnected) return kArmNotConnected;
    if (m_bJoined) return kArmAlreadyJoined;
    const short result = ConfirmResult(ArmConfirmation::ConferenceJoinConfirm);
    m_bJoined = result == 0;
    Post(Stage::Conference, [sink, conferenceId, result] {
        const std::string name = std::to_string(conferenceId);
        sink->ConferenceJoinConfirm(conferenceId, name.c_str(), result, 0);
    });
    return 0;
}

int InProcessArmClient::ConferenceLeave(std::uint32_t, std::uint16_t conferenceId,
                                        IArmConferenceSink*) {
    if (const auto fault = Fault(ArmOperation::ConferenceLeave)) return *fault;
    if (conferenceId != m_conference.ConferenceId()) return kArmNoSuchConference;
    if (!m_bJoined) return kArmNotJoined;
    Leave();
    return 0;
}

int InProcessArmClient::ApeAttach(IArmApeSink* sink, std::uint32_t, std::uint16_t conferenceId,
                                  std::uint32_t* apeHandle) {
    if (const auto fault = Fault(ArmOperation::ApeAttach)) return *fault;
    if (sink == nullptr || apeHandle == nullptr) return kArmInvalidArgument;
    if (conferenceId != m_conference.ConferenceId()) return kArmNoSuchConference;
    if (!m_bJoined) return kArmNotJoined;
    if (m_apeHandle == 0) {
        const short result = ConfirmResult(ArmConfirmation::ApeAttachConfirm);
        if (result != 0) {
            *apeHandle = 0;
            Post(Stage::Ape, [sink, result] { sink->ApeAttachConfirm(0, result, 0); });
            return 0;
        }
        m_apeHandle = m_conference.NewApeHandle();
        m_userId = m_conference.NewUserId();
        m_pApeSink = sink;
    }
    // A repeated attach answers the attachment it already has.
    *apeHandle = m_apeHandle;
    IArmApeSink* const attached = m_pApeSink;
    const std::uint32_t ape = m_apeHandle;
    const std::uint32_t userId = m_userId;
    Post(Stage::Ape, [attached, ape, userId] { attached->ApeAttachConfirm(ape, 0, userId); });
    return 0;
}

int InProcessArmClient::ApeEnroll(std::uint32_t apeHandle, int enroll, std::uint32_t sessionId,
                                  std::uint32_t, int resourceCount, ARMSessionResource* resources,
                                  const void* enrollInfo, std::uint32_t enrollInfoLength, int) {
    if (const auto fault = Fault(ArmOperation::ApeEnroll)) return *fault;
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    if (resourceCount < 0 || static_cast<std::uint32_t>(resourceCount) > kMaxEntries ||
        (resourceCount > 0 && resources == nullptr) ||
        (enrollInfo == nullptr && enrollInfoLength > 0)) {
        return kArmInvalidArgument;
    }
    if (enrollInfoLength > kArmMaxDataLength) return kArmTooLarge;
    IArmApeSink* const sink = m_pApeSink;
    const std::uint32_t ape = m_apeHandle;
    if (enroll == 0) {
        m_conference.Withdraw(*this);
        Post(Stage::Ape, [sink, ape] { sink->ApeEnrollConfirm(ape, 0, 0, nullptr); });
        return 0;
    }

    const short result = ConfirmResult(ArmConfirmation::ApeEnrollConfirm);
    const short status = ConfirmResult(ArmConfirmation::EnrollResourceStatus);
    const bool granted = result == 0 && status == 0;
    auto answer = std::make_shared<EnrollAnswer>();
    answer->names.reserve(resourceCount);
    for (int i = 0; i < resourceCount; ++i) {
        const char* name = resources[i].pszName;
        answer->names.emplace_back(name == nullptr ? "" : name);
    }
    for (int i = 0; i < resourceCount; ++i) {
        ARMSessionResource resource = resources[i];
        resource.pszName = answer->names[i].c_str();
        resource.dwValue = 0;
        resource.wStatus = kResourceRefused;
        if (answer->names[i] == kSessionResourceName && result == 0) {
            resource.wStatus = static_cast<std::uint16_t>(status);
            if (granted) resource.dwValue = m_conference.GrantSessionValue(sessionId);
        }
        answer->resources.push_back(resource);
    }
    Post(Stage::Ape, [sink, ape, result, answer] {
        sink->ApeEnrollConfirm(ape, result, static_cast<short>(answer->resources.size()),
                               answer->resources.empty() ? nullptr : answer->resources.data());
    });
    if (granted) {
        const auto* info = static_cast<const std::uint8_t*>(enrollInfo);
        m_enrollInfo.assign(info, info + enrollInfoLength);
        m_conference.Enroll(*this, sessionId);
    }
    return 0;
}

int InProcessArmClient::ApeSendData(std::uint32_t apeHandle, std::uint32_t destUserId, int,
                                    const void* data, std::uint32_t length, int, int) {
    if (const auto fault = Fault(ArmOperation::ApeSendData)) return *fault;
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    const std::uint32_t option = m_sendOption;
    m_sendOption = 0;
    if (data == nullptr && length > 0) return kArmInvalidArgument;
    if (length > kArmMaxDataLength) return kArmTooLarge;
    InProcessArmClient* const receiver = m_conference.FindUser(destUserId);
    if (receiver == nullptr) return kArmUnknownUser;
    receiver->DeliverPrivate(m_userId, static_cast<std::uint16_t>(option), CopyBytes(data, length));
    return 0;
}

int InProcessArmClient::ApeDetach(std::uint32_t apeHandle) {
    if (const auto fault = Fault(ArmOperation::ApeDetach)) return *fault;
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    Detach();
    return 0;
}

int InProcessArmClient::RegisterSharedDataSink(std::uint32_t apeHandle, IArmSharedDataSink* sink) {
    if (const auto fault = Fault(ArmOperation::RegisterSharedDataSink)) return *fault;
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    m_pSharedSink = sink;
    return 0;
}

int InProcessArmClient::AllocNameHandle(std::uint32_t apeHandle, std::uint32_t count,
                                        NameHandle* entries, IArmAllocHandleSink* sink) {
    if (const auto fault = Fault(ArmOperation::AllocNameHandle)) return *fault;
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    if (sink == nullptr || count > kMaxEntries || (count > 0 && entries == nullptr)) {
        return kArmInvalidArgument;
    }
    const short result = ConfirmResult(ArmConfirmation::AllocNameHandleConfirm);
    auto answer = std::make_shared<std::vector<NameHandle>>(entries, entries + count);
    for (NameHandle& entry : *answer) {
        const std::string name(entry.name, strnlen(entry.name, sizeof entry.name));
        entry.handle_value = result == 0 ? m_conference.NameHandleFor(name) : 0;
    }
    const std::uint32_t ape = m_apeHandle;
    Post(Stage::Ape, [sink, ape, count, result, answer] {
        sink->AllocNameHandleConfirm(ape, count, answer->empty() ? nullptr : answer->data(), result,
                                     0);
    });
    return 0;
}

int InProcessArmClient::ApeSharedDataActionEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                              std::uint32_t, std::uint32_t, tagCacheAction action,
                                              std::uint32_t flags, std::uint32_t memHandle,
                                              std::uint32_t, int confirm) {
    if (const auto fault = Fault(ArmOperation::ApeSharedDataActionEx)) return *fault;
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    ConferenceCache* const cache = m_conference.FindCache(cacheHandle);
    if (cache == nullptr) return kArmUnknownHandle;
    if (action != CACHE_SET && action != CACHE_APPEND) return kArmInvalidArgument;
    Bytes data;
    if (memHandle != 0) {
        const std::vector<std::uint8_t>* block = m_memory.Find(memHandle);
        if (block == nullptr) return kArmUnknownHandle;
        data = std::make_shared<const std::vector<std::uint8_t>>(*block);
    } else if (action == CACHE_APPEND) {
        return kArmInvalidArgument;  // an item needs bytes
    }

    const short result = ConfirmResult(ArmConfirmation::ApeCacheActionConfirmEx);
    const std::uint32_t requestIdx = ++m_lastRequestIdx;
    std::uint32_t cacheId = 0;
    if (result == 0) {
        cacheId = action == CACHE_SET ? cache->Set(m_userId, flags, data)
                                      : cache->Append(m_userId, flags, data);
    }
    if (confirm != 0) {
        IArmApeSink* const sink = m_pApeSink;
        const std::uint32_t ape = m_apeHandle;
        Post(Stage::Ape, [sink, ape, cacheHandle, action, requestIdx, cacheId, result] {
            sink->ApeCacheActionConfirmEx(ape, cacheHandle, action, requestIdx, cacheId, result);
        });
    }
    if (result != 0) return 0;
    ArmCacheDelivery delivery;
    delivery.cacheId = cacheId;
    delivery.entityId = cacheHandle;
    delivery.action = action;
    delivery.senderId = m_userId;
    delivery.value = flags;
    for (const ConferenceCacheSubscriber& subscriber : cache->Subscribers()) {
        subscriber.client->DeliverShared(subscriber.sink, delivery, data);
    }
    return 0;
}

int InProcessArmClient::ApeRequestSharedDataEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                               std::uint32_t, tagCacheRequestType type,
                                               std::uint32_t, IArmSharedDataSink* sink) {
    if (const auto fault = Fault(ArmOperation::ApeRequestSharedDataEx)) return *fault;
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    ConferenceCache* const cache = m_conference.FindCache(cacheHandle);
    if (cache == nullptr) return kArmUnknownHandle;
    IArmSharedDataSink* const target = sink != nullptr ? sink : m_pSharedSink;
    if (type == CACHE_REQUEST_UNSUBSCRIBE) {
        cache->Unsubscribe(this);
        return 0;
    }
    if (target == nullptr) return kArmInvalidArgument;
    if (type == CACHE_REQUEST_SUBSCRIBE) {
        cache->Subscribe(this, target);
        return 0;
    }
    if (type != CACHE_REQUEST_RETRIEVE) return kArmInvalidArgument;

    ArmCacheDelivery delivery;
    delivery.entityId = cacheHandle;
    delivery.action = CACHE_REPLY_LAST;
    const std::vector<ConferenceCacheItem>& items = cache->Items();
    if (items.empty()) {
        delivery.result = cache->IsSet() ? 0 : kArmRetry;
        DeliverShared(target, delivery, nullptr);
        return 0;
    }
    for (std::size_t i = 0; i < items.size(); ++i) {
        delivery.cacheId = items[i].cacheId;
        delivery.senderId = items[i].senderId;
        delivery.value = items[i].flags;
        delivery.action = i + 1 < items.size() ? CACHE_REPLY_ITEM : CACHE_REPLY_LAST;
        DeliverShared(target, delivery, items[i].bytes);
    }
    return 0;
}

int InProcessArmClient::AllocMemHandle(std::uint32_t size, std::uint32_t* handle) {
    if (const auto fault = Fault(ArmOperation::AllocMemHandle)) return *fault;
    if (handle == nullptr) return kArmInvalidArgument;
    const std::uint32_t number = m_conference.NewMemHandle();
    const int result = m_memory.Allocate(number, size);
    if (result == 0) *handle = number;
    return result;
}

int InProcessArmClient::FreeMemHandle(std::uint32_t handle) {
    if (const auto fault = Fault(ArmOperation::FreeMemHandle)) return *fault;
    return m_memory.Free(handle);
}

int InProcessArmClient::GetMemHandleSize(std::uint32_t handle, std::uint32_t* size) {
    if (const auto fault = Fault(ArmOperation::GetMemHandleSize)) return *fault;
    return m_memory.GetSize(handle, size);
}

int InProcessArmClient::WriteMemHandle(std::uint32_t handle, std::uint32_t offset, const void* data,
                                       std::uint32_t* size) {
    if (const auto fault = Fault(ArmOperation::WriteMemHandle)) return *fault;
    return m_memory.Write(handle, offset, data, size);
}

int InProcessArmClient::ReadMemHandle(std::uint32_t handle, std::uint32_t offset, void* buffer,
                                      std::uint32_t* size) {
    if (const auto fault = Fault(ArmOperation::ReadMemHandle)) return *fault;
    return m_memory.Read(handle, offset, buffer, size);
}

void InProcessArmClient::FailNext(ArmOperation op, int result, int times) {
    m_failures.Set(op, result, times);
}

void InProcessArmClient::FailAlways(ArmOperation op, int result) {
    m_failures.Set(op, result, FaultTable<ArmOperation>::kAlways);
}

void InProcessArmClient::ConfirmNextWith(ArmConfirmation kind, short result, int times) {
    m_confirmations.Set(kind, result, times);
}

void InProcessArmClient::ClearFaults() {
    m_failures.Clear();
    m_confirmations.Clear();
}

bool InProcessArmClient::InjectPrivateData(std::uint32_t senderId,
                                           const std::vector<std::uint8_t>& data) {
    if (m_pApeSink == nullptr) return false;
    DeliverPrivate(senderId, 0, std::make_shared<const std::vector<std::uint8_t>>(data));
    return true;
}

bool InProcessArmClient::InjectCacheDelivery(const ArmCacheDelivery& delivery,
                                             std::optional<std::vector<std::uint8_t>> data,
                                             IArmSharedDataSink* sink) {
    IArmSharedDataSink* const target = sink != nullptr ? sink : m_pSharedSink;
    if (m_apeHandle == 0 || target == nullptr) return false;
    Bytes bytes;
    if (data) bytes = std::make_shared<const std::vector<std::uint8_t>>(std::move(*data));
    DeliverShared(target, delivery, std::move(bytes));
    return true;
}

bool InProcessArmClient::InjectRosterChange(const RosterChange& change) {
    if (m_pApeSink == nullptr) return false;
    DeliverRoster(std::make_shared<const RosterChange>(change));
    return true;
}

void InProcessArmClient::Post(Stage stage, std::function<void()> task) {
    std::weak_ptr<Liveness> token = m_liveness;
    const std::uint32_t epoch = m_liveness->Of(stage);
    m_loop.Post([token = std::move(token), stage, epoch, task = std::move(task)] {
        {
            const std::shared_ptr<Liveness> live = token.lock();
            if (!live || live->Of(stage) != epoch) return;
        }
        task();
    });
}

void InProcessArmClient::DeliverRoster(std::shared_ptr<const RosterChange> change) {
    IArmApeSink* const sink = m_pApeSink;
    const std::uint32_t ape = m_apeHandle;
    Post(Stage::Ape, [sink, ape, change = std::move(change)] {
        RosterBatch batch(*change);
        batch.DeliverTo(*sink, ape, 0);
    });
}

void InProcessArmClient::DeliverPrivate(std::uint32_t senderId, std::uint16_t flags, Bytes data) {
    IArmApeSink* const sink = m_pApeSink;
    const std::uint32_t ape = m_apeHandle;
    Post(Stage::Ape, [sink, ape, senderId, flags, data = std::move(data)] {
        sink->ApeDataIndication(ape, senderId, 0, flags, data->data(),
                                static_cast<std::uint32_t>(data->size()));
    });
}

void InProcessArmClient::DeliverShared(IArmSharedDataSink* sink, const ArmCacheDelivery& delivery,
                                       Bytes data) {
    const std::uint32_t ape = m_apeHandle;
    std::weak_ptr<Liveness> token = m_liveness;
    Post(Stage::Ape, [this, token = std::move(token), sink, ape, delivery, data = std::move(data)] {
        // The receiver reads the item through a handle of its own, valid for this call.
        std::uint32_t memHandle = 0;
        if (data) {
            memHandle = m_conference.NewMemHandle();
            m_memory.Adopt(memHandle, *data);
        }
        sink->SharedDataReceivedEx(ape, delivery.cacheId, delivery.entityId, memHandle,
                                   delivery.result, delivery.action, delivery.senderId,
                                   delivery.value, delivery.flags);
        // The callback may have released this object (and with it the handle) or freed it.
        if (memHandle != 0 && !token.expired()) m_memory.Free(memHandle);
    });
}

std::optional<int> InProcessArmClient::Fault(ArmOperation op) {
    int result = 0;
    if (!m_failures.Take(op, &result)) return std::nullopt;
    return result;
}

short InProcessArmClient::ConfirmResult(ArmConfirmation kind) {
    int result = 0;
    return m_confirmations.Take(kind, &result) ? static_cast<short>(result) : 0;
}

RosterUserEntry InProcessArmClient::RosterEntry() const {
    return {m_nodeId, m_userId, m_enrollInfo};
}

void InProcessArmClient::Detach() {
    if (m_apeHandle == 0) return;
    m_conference.Withdraw(*this);
    m_conference.DropSubscriptions(*this);
    m_apeHandle = 0;
    m_userId = 0;
    m_pApeSink = nullptr;
    m_pSharedSink = nullptr;
    m_sendOption = 0;
    m_enrollInfo.clear();
    ++m_liveness->Of(Stage::Ape);
}

void InProcessArmClient::Leave() {
    Detach();
    m_bJoined = false;
    ++m_liveness->Of(Stage::Conference);
}
