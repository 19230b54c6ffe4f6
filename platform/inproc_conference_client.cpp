#include "platform/inproc_conference_client.h"

#include <cstring>
#include <optional>
#include <string>
#include <utility>

#include "platform/conference_arguments.h"
#include "platform/conference_results.h"
#include "platform/inproc_conference.h"
#include "platform/run_loop.h"

namespace {

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
    // An injected answer that tells how things stand makes them so: "pending" connects and
    // confirms as usual, "already connected" connects without a confirmation.
    const std::optional<int> fault = Fault(ArmOperation::Connect);
    if (fault && *fault != kArmConnectPending) {
        if (*fault == kArmAlreadyConnected) m_bConnected = true;
        return *fault;
    }
    if (sink == nullptr) return kArmInvalidArgument;
    if (m_bConnected) return kArmAlreadyConnected;
    const short result = ConfirmResult(ArmConfirmation::ConnectConfirm);
    m_bConnected = result == 0;
    const std::uint32_t value = m_nodeId;
    Post(Stage::Node, [sink, result, value] { sink->ConnectConfirm(result, value); });
    return fault ? *fault : 0;
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
    if (const auto fault = Fault(ArmOperation::ConferenceJoin)) {
        // An injected "already joined" leaves the object joined, as it tells the caller.
        if (*fault == kArmAlreadyJoined) m_bJoined = true;
        return *fault;
    }
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
    if (const int refusal =
            CheckEnrollArguments(resourceCount, resources, enrollInfo, enrollInfoLength))
        return refusal;
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
    if (const int refusal = CheckNameHandleArguments(count, entries, sink)) return refusal;
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
