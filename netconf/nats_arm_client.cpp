#include "netconf/nats_arm_client.h"

#include <chrono>
#include <cstring>
#include <random>
#include <utility>

#include "netconf/netconf_results.h"
#include "platform/conference_arguments.h"
#include "platform/conference_results.h"
#include "platform/run_loop.h"
#include "platform/trace.h"

namespace {

constexpr auto kTickInterval = std::chrono::milliseconds(500);

std::uint64_t RandomInstance() {
    std::random_device device;
    return (static_cast<std::uint64_t>(device()) << 32) ^ device() ^
           static_cast<std::uint64_t>(std::chrono::steady_clock::now().time_since_epoch().count());
}

std::uintptr_t NextRegistryId() {
    static std::atomic<std::uintptr_t> next{1};
    return next++;
}

// Ape and memory handles are this process's own numbers.
std::uint32_t NewApeHandle() {
    static std::atomic<std::uint32_t> next{20001};
    return next++;
}

// The answer of one enroll: copies of the resources, pointing at copies of their names.
struct EnrollAnswer {
    std::vector<std::string> names;
    std::vector<ARMSessionResource> resources;
};

}  // namespace

IArmClient* CreateNatsArmClient(const NatsConferenceOptions& options, RunLoop& loop) {
    if (options.serverUrls.empty() || !IsValidConferenceUser(options.user) ||
        options.replicas < 1 || options.replicas > 5) {
        return nullptr;
    }
    return new NatsArmClient(options, loop);
}

NatsArmClient::NatsArmClient(const NatsConferenceOptions& options, RunLoop& loop)
    : m_options(options),
      m_subjects(options.conferenceId),
      m_userId(ConferenceUserId(options.user)),
      m_instance(RandomInstance()),
      m_registryId(NextRegistryId()),
      m_loop(loop),
      m_liveness(std::make_shared<Liveness>()),
      m_worker(kTickInterval, [this] { Tick(); }) {}

NatsArmClient::~NatsArmClient() {
    m_worker.Stop();
}

int NatsArmClient::Release() {
    Leave(Closing::WithConnection);
    for (Stage stage : {Stage::Node, Stage::Conference, Stage::Ape})
        ++m_liveness->Of(stage);
    m_worker.Enqueue([this] { DisconnectTask(); });
    m_worker.Stop();
    delete this;
    return 0;
}

int NatsArmClient::Connect(IArmNodeControllerSink* sink, const char*, std::uint32_t, std::uint32_t,
                           std::uint32_t) {
    if (sink == nullptr) return kArmInvalidArgument;
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        if (m_phase != Phase::Idle) return kArmAlreadyConnected;
        m_phase = Phase::Connecting;
    }
    const std::uint32_t epoch = Epoch(Stage::Node);
    m_worker.Enqueue([this, sink, epoch] { ConnectTask(sink, epoch); });
    return kArmConnectPending;
}

int NatsArmClient::Destroy(IArmNodeControllerSink*, int) {
    Leave(Closing::WithConnection);
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        m_phase = Phase::Idle;
    }
    ++m_liveness->Of(Stage::Node);
    m_worker.Enqueue([this] { DisconnectTask(); });
    return 0;
}

int NatsArmClient::SetSendOption(int option, const ARMSendOption* value) {
    if (option != kSendOptionCode || value == nullptr) return kArmInvalidArgument;
    if (!IsAttached(value->dwApeHandle)) return kArmBadApeHandle;
    m_sendOption = value->dwOption;
    return 0;
}

int NatsArmClient::ConferenceJoin(std::uint32_t, std::uint16_t conferenceId,
                                  IArmConferenceSink* sink, int) {
    if (sink == nullptr) return kArmInvalidArgument;
    if (conferenceId != m_options.conferenceId) return kArmNoSuchConference;
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        if (m_phase != Phase::Connected) return kArmNotConnected;
    }
    if (m_bJoined) return kArmAlreadyJoined;
    m_bJoined = true;
    Post(Stage::Conference, [sink, conferenceId] {
        const std::string name = std::to_string(conferenceId);
        sink->ConferenceJoinConfirm(conferenceId, name.c_str(), 0, 0);
    });
    return 0;
}

int NatsArmClient::ConferenceLeave(std::uint32_t, std::uint16_t conferenceId, IArmConferenceSink*) {
    if (conferenceId != m_options.conferenceId) return kArmNoSuchConference;
    if (!m_bJoined) return kArmNotJoined;
    Leave(Closing::Now);
    return 0;
}

int NatsArmClient::ApeAttach(IArmApeSink* sink, std::uint32_t, std::uint16_t conferenceId,
                             std::uint32_t* apeHandle) {
    if (sink == nullptr || apeHandle == nullptr) return kArmInvalidArgument;
    if (conferenceId != m_options.conferenceId) return kArmNoSuchConference;
    if (!m_bJoined) return kArmNotJoined;
    if (m_apeHandle != 0) {
        // A repeated attach answers the attachment it already has, once that is confirmed.
        *apeHandle = m_apeHandle;
        IArmApeSink* const attached = m_pApeSink;
        const std::uint32_t ape = m_apeHandle;
        const std::uint32_t userId = m_userId;
        const std::uint32_t epoch = Epoch(Stage::Ape);
        m_worker.Enqueue([this, attached, ape, userId, epoch] {
            PostAt(Stage::Ape, epoch,
                   [attached, ape, userId] { attached->ApeAttachConfirm(ape, 0, userId); });
        });
        return 0;
    }
    const std::uint32_t ape = NewApeHandle();
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        m_apeHandle = ape;
        m_pApeSink = sink;
    }
    *apeHandle = ape;
    const std::uint32_t epoch = Epoch(Stage::Ape);
    m_worker.Enqueue([this, sink, ape, epoch] { AttachTask(sink, ape, epoch); });
    return 0;
}

int NatsArmClient::ApeEnroll(std::uint32_t apeHandle, int enroll, std::uint32_t sessionId,
                             std::uint32_t, int resourceCount, ARMSessionResource* resources,
                             const void* enrollInfo, std::uint32_t enrollInfoLength, int) {
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    if (const int refusal =
            CheckEnrollArguments(resourceCount, resources, enrollInfo, enrollInfoLength))
        return refusal;
    IArmApeSink* const sink = m_pApeSink;
    const std::uint32_t ape = m_apeHandle;
    auto answer = std::make_shared<EnrollAnswer>();
    for (int i = 0; i < resourceCount; ++i) {
        const char* name = resources[i].pszName;
        answer->names.emplace_back(name == nullptr ? "" : name);
    }
    for (int i = 0; i < resourceCount; ++i) {
        ARMSessionResource resource = resources[i];
        resource.pszName = answer->names[i].c_str();
        resource.dwValue = 0;
        resource.wStatus = kResourceRefused;
        answer->resources.push_back(resource);
    }
    const auto* info = static_cast<const std::uint8_t*>(enrollInfo);
    auto payload = std::make_shared<std::vector<std::uint8_t>>(info, info + enrollInfoLength);
    const std::uint32_t session = enroll == 0 ? 0 : sessionId;
    const std::uint32_t epoch = Epoch(Stage::Ape);
    m_worker.Enqueue([this, sink, ape, answer, payload, session, epoch] {
        short result = 0;
        if (session != 0) {
            for (ARMSessionResource& resource : answer->resources) {
                if (std::strcmp(resource.pszName, kSessionResourceName) != 0) continue;
                std::string holder;
                const std::uint64_t value =
                    GrantNumber(m_subjects.SessionNumber(session), "session", &holder);
                if (value == 0 || value > 0xffffffffu) {
                    result = kArmServerRefused;
                    break;
                }
                resource.dwValue = static_cast<std::uint32_t>(value);
                resource.wStatus = 0;
            }
        }
        const std::lock_guard<std::mutex> lock(m_mutex);
        const short count = static_cast<short>(session == 0 ? 0 : answer->resources.size());
        PostAt(Stage::Ape, epoch, [sink, ape, result, count, answer] {
            sink->ApeEnrollConfirm(ape, result, count,
                                   count == 0 ? nullptr : answer->resources.data());
        });
        if (result != 0 || !m_netAttached) return;
        const bool current = epoch == Epoch(Stage::Ape);
        // The participant learns first who is there, then its own arrival or change.
        const std::uint32_t previous = m_session;
        RosterChange own;
        const RosterUserEntry self{m_options.nodeId, m_userId, *payload};
        if (session != 0 && session != previous) {
            RosterChange present;
            std::vector<RosterUserEntry> members = m_presence.Members(session);
            if (!members.empty()) present.added.push_back({session, std::move(members)});
            if (!present.added.empty() && current) DeliverRosterLocked(present);
            own.added.push_back({session, {self}});
        } else if (session != 0) {
            own.modified.push_back({session, {self}});
        }
        m_session = session;
        m_enrollInfo = *payload;
        ++m_enrollEpoch;
        if (current) DeliverRosterLocked(own);
        AnnounceLocked(false);
    });
    return 0;
}

int NatsArmClient::ApeSendData(std::uint32_t apeHandle, std::uint32_t destUserId, int,
                               const void* data, std::uint32_t length, int, int) {
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    const std::uint32_t option = m_sendOption;
    m_sendOption = 0;
    if (data == nullptr && length > 0) return kArmInvalidArgument;
    if (length > kArmMaxDataLength) return kArmTooLarge;
    std::string receiver;
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        if (destUserId == m_userId) {
            receiver = m_options.user;
        } else if (const auto user = m_presence.UserOf(destUserId)) {
            receiver = *user;
        } else {
            return kArmUnknownUser;
        }
    }
    const auto* bytes = static_cast<const std::uint8_t*>(data);
    auto payload = std::make_shared<const std::vector<std::uint8_t>>(bytes, bytes + length);
    const std::string msgId = NewMsgId();
    m_worker.Enqueue([this, receiver, payload, option, msgId] {
        natsMsg* raw = nullptr;
        const std::string subject = m_subjects.Private(receiver, m_options.user);
        if (natsMsg_Create(&raw, subject.c_str(), nullptr,
                           reinterpret_cast<const char*>(payload->data()),
                           static_cast<int>(payload->size())) != NATS_OK) {
            return;
        }
        NatsPtr<natsMsg> msg(raw);
        SetNatsHeader(raw, "Qc-Flags", std::to_string(option));
        std::string reason;
        if (PublishStored(raw, msgId, &reason) == 0) {
            PostLog(1, "NatsArmClient: private data to " + receiver + " not sent: " + reason);
        }
    });
    return 0;
}

int NatsArmClient::ApeDetach(std::uint32_t apeHandle) {
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    Detach(Closing::Now);
    return 0;
}

int NatsArmClient::RegisterSharedDataSink(std::uint32_t apeHandle, IArmSharedDataSink* sink) {
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    const std::lock_guard<std::mutex> lock(m_mutex);
    m_pSharedSink = sink;
    return 0;
}

int NatsArmClient::AllocNameHandle(std::uint32_t apeHandle, std::uint32_t count,
                                   NameHandle* entries, IArmAllocHandleSink* sink) {
    if (!IsAttached(apeHandle)) return kArmBadApeHandle;
    if (const int refusal = CheckNameHandleArguments(count, entries, sink)) return refusal;
    auto answer = std::make_shared<std::vector<NameHandle>>(entries, entries + count);
    const std::uint32_t ape = m_apeHandle;
    const std::uint32_t epoch = Epoch(Stage::Ape);
    m_worker.Enqueue([this, sink, ape, answer, epoch] {
        short result = 0;
        for (NameHandle& entry : *answer) {
            const std::string name(entry.name, strnlen(entry.name, sizeof entry.name));
            std::string holder;
            const std::uint64_t value = GrantNumber(m_subjects.NameNumber(name), "name", &holder);
            if (value == 0 || value > 0xffffffffu) result = kArmServerRefused;
            entry.handle_value = static_cast<std::uint32_t>(value > 0xffffffffu ? 0 : value);
        }
        if (result != 0) {
            for (NameHandle& entry : *answer)
                entry.handle_value = 0;
        }
        const std::uint32_t count = static_cast<std::uint32_t>(answer->size());
        PostAt(Stage::Ape, epoch, [sink, ape, count, result, answer] {
            sink->AllocNameHandleConfirm(ape, count, answer->empty() ? nullptr : answer->data(),
                                         result, 0);
        });
    });
    return 0;
}

void NatsArmClient::PostAt(Stage stage, std::uint32_t epoch, std::function<void()> task) {
    std::weak_ptr<Liveness> token = m_liveness;
    m_loop.Post([token = std::move(token), stage, epoch, task = std::move(task)] {
        {
            const std::shared_ptr<Liveness> live = token.lock();
            if (!live || live->Of(stage) != epoch) return;
        }
        task();
    });
}

void NatsArmClient::PostLog(int level, std::string text) {
    // The trace library belongs to the run loop's thread.
    Post(Stage::Node, [level, text = std::move(text)] {
        if (level >= 2) {
            MacErrorTrace2("Chat", "%s", text.c_str());
        } else if (level == 1) {
            MacWarnTrace2("Chat", "%s", text.c_str());
        } else {
            MacInfoTrace2("Chat", "%s", text.c_str());
        }
    });
}

void NatsArmClient::Detach(Closing closing) {
    if (m_apeHandle == 0) return;
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        m_apeHandle = 0;
        m_pApeSink = nullptr;
        m_pSharedSink = nullptr;
        for (auto& entry : m_cacheFeeds)
            entry.second->active = false;
    }
    m_sendOption = 0;
    ++m_liveness->Of(Stage::Ape);
    if (closing == Closing::Now) m_worker.Enqueue([this] { DetachTask(); });
}

void NatsArmClient::Leave(Closing closing) {
    Detach(closing);
    m_bJoined = false;
    ++m_liveness->Of(Stage::Conference);
}

std::string NatsArmClient::NewMsgId() {
    char instance[17];
    std::snprintf(instance, sizeof instance, "%016llx",
                  static_cast<unsigned long long>(m_instance));
    return m_options.user + "-" + instance + "-" + std::to_string(++m_nextMsg);
}

std::int64_t NatsArmClient::NowMillis() {
    return std::chrono::duration_cast<std::chrono::milliseconds>(
               std::chrono::steady_clock::now().time_since_epoch())
        .count();
}

std::uint32_t NatsArmClient::NewMemHandleNumber() {
    static std::atomic<std::uint32_t> next{0x100001};
    return next++;
}
