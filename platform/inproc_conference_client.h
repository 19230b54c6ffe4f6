// One participant's service object on an InProcessConference. It answers every request with a
// callback posted to its run loop and delivers nothing more once released, detached (the ape,
// shared-data and handle callbacks), left (conference callbacks and, with the attachment, the
// ape ones) or destroyed (all callbacks), not even callbacks already posted. Tests can make
// requests fail, make confirmations carry chosen results and inject crafted deliveries.
//
// Choices the contract leaves open: ConnectConfirm carries the node id as its value; an
// ApeDataIndication carries value 0 and, as flags, the option SetSendOption set for that send;
// SharedDataReceivedEx carries the writer's action flags as value and flags 0; ApeRosterChanged
// carries the receiver's ape handle as service id and value 0; retrievals deliver every item
// whatever their item limit; an unsubscribe stops the deliveries of later actions, while those
// of earlier actions are already on their way; ApeEnroll with enroll 0 leaves the session. A
// confirmation with a non-zero result means the request did not take effect.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <vector>

#include "platform/arm_service.h"
#include "platform/conference_faults.h"
#include "platform/conference_mem_handles.h"
#include "platform/conference_roster.h"
#include "platform/host_kit.h"

class InProcessConference;
class RunLoop;

// The fields of one SharedDataReceivedEx apart from the ape and memory handles.
struct ArmCacheDelivery {
    std::uint32_t cacheId = 0;
    std::uint32_t entityId = 0;  // the cache handle
    short result = 0;
    tagCacheAction action = CACHE_APPEND;
    std::uint32_t senderId = 0;
    std::uint32_t value = 0;
    std::uint16_t flags = 0;
};

class QC_HOST_KIT InProcessArmClient final : public IArmClient {
public:
    ~InProcessArmClient();
    InProcessArmClient(const InProcessArmClient&) = delete;
    InProcessArmClient& operator=(const InProcessArmClient&) = delete;

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

    // The next `times` calls of op return result and do nothing else (result 0: the call
    // claims success but has no effect, so no answer follows). Results that tell how things
    // stand make them so: Connect 1202 connects and confirms as usual, Connect 1215 leaves
    // the object connected and ConferenceJoin 1201 leaves it joined, without confirmations.
    void FailNext(ArmOperation op, int result, int times = 1);
    // Every later call of op returns result, until ClearFaults.
    void FailAlways(ArmOperation op, int result);
    // The next `times` confirmations of kind carry result (and their request has no effect).
    void ConfirmNextWith(ArmConfirmation kind, short result, int times = 1);
    // Forgets every pending fault.
    void ClearFaults();

    // Posts an ApeDataIndication claiming senderId; false when not attached.
    bool InjectPrivateData(std::uint32_t senderId, const std::vector<std::uint8_t>& data);
    // Posts a SharedDataReceivedEx with the given fields and data (nullopt: memory handle 0)
    // to sink, or to the registered shared-data sink; false when there is none or not attached.
    bool InjectCacheDelivery(const ArmCacheDelivery& delivery,
                             std::optional<std::vector<std::uint8_t>> data,
                             IArmSharedDataSink* sink = nullptr);
    // Posts an ApeRosterChanged with exactly these records; false when not attached.
    bool InjectRosterChange(const RosterChange& change);

    std::uint32_t NodeId() const { return m_nodeId; }
    // The user id and ape handle of the current attachment, 0 when not attached.
    std::uint32_t UserId() const { return m_userId; }
    std::uint32_t ApeHandle() const { return m_apeHandle; }
    // Memory handles this object holds (deliveries' handles are freed after their callback).
    std::size_t MemHandleCount() const { return m_memory.Count(); }

private:
    friend class InProcessConference;
    using Bytes = std::shared_ptr<const std::vector<std::uint8_t>>;

    // Which callbacks a posted answer belongs to; leaving a stage drops its pending answers.
    enum class Stage { Node, Conference, Ape };
    struct Liveness {
        std::uint32_t epochs[3] = {0, 0, 0};
        std::uint32_t& Of(Stage stage) { return epochs[static_cast<int>(stage)]; }
    };

    InProcessArmClient(InProcessConference& conference, RunLoop& loop, std::uint32_t nodeId);

    // Posts task to run later unless this object is gone or stage was left meanwhile.
    void Post(Stage stage, std::function<void()> task);
    // Posted deliveries to this participant.
    void DeliverRoster(std::shared_ptr<const RosterChange> change);
    void DeliverPrivate(std::uint32_t senderId, std::uint16_t flags, Bytes data);
    void DeliverShared(IArmSharedDataSink* sink, const ArmCacheDelivery& delivery, Bytes data);

    // The result of a pending fault of op (counted down), or nullopt.
    std::optional<int> Fault(ArmOperation op);
    // The result a confirmation of kind carries now (0 unless a fault is pending).
    short ConfirmResult(ArmConfirmation kind);
    bool IsAttached(std::uint32_t apeHandle) const {
        return m_apeHandle != 0 && apeHandle == m_apeHandle;
    }
    // This participant as a roster entry.
    RosterUserEntry RosterEntry() const;
    // Drops the attachment (and with it enrolment and subscriptions), the conference, or all.
    void Detach();
    void Leave();

    InProcessConference& m_conference;
    RunLoop& m_loop;
    const std::uint32_t m_nodeId;
    std::shared_ptr<Liveness> m_liveness;

    // Connection, conference and application state with their sinks.
    bool m_bConnected = false;
    bool m_bJoined = false;
    std::uint32_t m_apeHandle = 0;
    std::uint32_t m_userId = 0;
    IArmApeSink* m_pApeSink = nullptr;
    IArmSharedDataSink* m_pSharedSink = nullptr;
    std::vector<std::uint8_t> m_enrollInfo;
    std::uint32_t m_sendOption = 0;  // for the next ApeSendData only
    std::uint32_t m_lastRequestIdx = 0;

    ConferenceMemHandles m_memory;
    FaultTable<ArmOperation> m_failures;
    FaultTable<ArmConfirmation> m_confirmations;
};
