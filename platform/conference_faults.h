// Fault injection for a participant's service object: which requests fail with which result,
// and which confirmations carry which result, once, n times or always.
#pragma once

#include <array>
#include <cstddef>

// The requests that can be made to fail, in interface order (Release always works).
enum class ArmOperation {
    Connect,
    Destroy,
    SetSendOption,
    ConferenceJoin,
    ConferenceLeave,
    ApeAttach,
    ApeEnroll,
    ApeSendData,
    ApeDetach,
    RegisterSharedDataSink,
    AllocNameHandle,
    ApeSharedDataActionEx,
    ApeRequestSharedDataEx,
    AllocMemHandle,
    FreeMemHandle,
    GetMemHandleSize,
    WriteMemHandle,
    ReadMemHandle,
    Count
};

// The confirmations that can carry a chosen result. EnrollResourceStatus keeps the enroll
// result 0 but fills the chosen value into the session resource's status instead.
enum class ArmConfirmation {
    ConnectConfirm,
    ConferenceJoinConfirm,
    ApeAttachConfirm,
    ApeEnrollConfirm,
    EnrollResourceStatus,
    AllocNameHandleConfirm,
    ApeCacheActionConfirmEx,
    Count
};

// Pending results per key; a count of kAlways never runs out.
template <typename Key>
class FaultTable {
public:
    static constexpr int kAlways = -1;

    // The next times uses of key take result (times kAlways: every use, until cleared).
    void Set(Key key, int result, int times) { m_faults[Index(key)] = {result, times}; }
    void Clear() { m_faults.fill({}); }

    // True, with the result, when a fault is pending for key; counts one use down.
    bool Take(Key key, int* result) {
        Fault& fault = m_faults[Index(key)];
        if (fault.remaining == 0) return false;
        if (fault.remaining > 0) --fault.remaining;
        *result = fault.result;
        return true;
    }

private:
    struct Fault {
        int result = 0;
        int remaining = 0;
    };
    static std::size_t Index(Key key) { return static_cast<std::size_t>(key); }

    std::array<Fault, static_cast<std::size_t>(Key::Count)> m_faults{};
};
