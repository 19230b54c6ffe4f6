// Fault injection and crafted deliveries of one participant's service object.
#include <utility>

#include "platform/inproc_conference_client.h"

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

std::optional<int> InProcessArmClient::Fault(ArmOperation op) {
    int result = 0;
    if (!m_failures.Take(op, &result)) return std::nullopt;
    return result;
}

short InProcessArmClient::ConfirmResult(ArmConfirmation kind) {
    int result = 0;
    return m_confirmations.Take(kind, &result) ? static_cast<short>(result) : 0;
}
