// The conference service contract: the host's service object and the five callback
// interfaces through which it answers. Every request returns at once (0 = accepted) and its
// answer arrives later as a callback on the caller's run loop.
#pragma once

#include <cstdint>

// Result codes the component reacts to.
constexpr short kArmOk = 0;
constexpr short kArmRetry = 19;              // ConnectConfirm: connect again; cache: never set
constexpr short kArmAlreadyJoined = 1201;    // ConferenceJoin
constexpr short kArmConnectPending = 1202;   // Connect: ConnectConfirm follows
constexpr short kArmAlreadyConnected = 1215; // Connect

// A named handle request or answer: NUL-padded name (cut at 64 bytes) and the handle.
struct NameHandle {
    char name[64];
    std::uint32_t handle_value;  // 0 = not allocated
};

#pragma pack(push, 1)
// The session resource asked for at enroll; the confirmation fills value and status.
struct ARMSessionResource {
    std::uint16_t wResourceType;  // 1
    const char* pszName;          // "c_session_id"
    std::uint32_t dwCount;        // 1
    std::uint32_t dwValue;        // granted value
    std::uint16_t wStatus;        // 0 = granted
};

// One participant enrolled in an application session.
struct ARMApeUser {
    std::uint32_t dwNodeID;
    std::uint32_t dwUserID;
    const std::uint8_t* pEnrollInfo;  // enroll payload, exactly as the participant gave it
    std::int32_t nEnrollInfoLen;
};

// One application-roster record; records of one callback lie back to back.
struct ARMApeRoster {
    std::uint16_t wReserved1;
    std::uint32_t dwSessionID;
    std::uint32_t dwReserved2;
    std::uint16_t wUserCount;
    std::uint16_t wReserved3;
    ARMApeUser* pUsers;
};
#pragma pack(pop)

static_assert(sizeof(ARMSessionResource) == 12 + sizeof(void*), "packed session resource");
static_assert(sizeof(ARMApeUser) == 12 + sizeof(void*), "packed roster user entry");
static_assert(sizeof(ARMApeRoster) == 14 + sizeof(void*), "packed roster record");

enum tagCacheAction {
    CACHE_SET = 0,          // replace the cache contents
    CACHE_APPEND = 1,       // append one item
    CACHE_REPLY = 4,        // answer to a request
    CACHE_REPLY_ITEM = 5,   // one retrieved item, more follow
    CACHE_REPLY_LAST = 6,   // the last retrieved item (or the only answer)
};

enum tagCacheRequestType {
    CACHE_REQUEST_RETRIEVE = 1,     // deliver the contents once
    CACHE_REQUEST_SUBSCRIBE = 2,    // deliver every later action
    CACHE_REQUEST_UNSUBSCRIBE = 4,  // stop the deliveries
};

// The pair SetSendOption takes: which application and the option for its next send.
struct ARMSendOption {
    std::uint32_t dwApeHandle;
    std::uint32_t dwOption;  // 0, 0x90 or 0x92
};

class IArmNodeControllerSink {
public:
    virtual int ConnectConfirm(short result, std::uint32_t value) = 0;
    virtual int DisconnectIndication(short reason) = 0;
    virtual int TransportStatusIndication(std::uint32_t status) = 0;
    virtual int DisconnectConfirm(short result) = 0;

protected:
    ~IArmNodeControllerSink() = default;
};

class IArmConferenceSink {
public:
    virtual int ConferenceJoinConfirm(std::uint16_t conferenceId, const char* conferenceName,
                                      short result, std::uint32_t value) = 0;
    virtual int ConferenceLeaveIndication(std::uint16_t conferenceId, short reason) = 0;
    virtual int ConferenceRosterConfirm(std::uint16_t conferenceId, short result) = 0;
    virtual int ConferenceRosterChanged(std::uint16_t conferenceId, std::uint32_t nodeCount) = 0;
    virtual int ApeRosterConfirm(std::uint16_t conferenceId, short result) = 0;
    virtual int ApeRosterChanged(std::uint16_t conferenceId, std::uint32_t sessionId) = 0;

protected:
    ~IArmConferenceSink() = default;
};

class IArmApeSink {
public:
    virtual int ApeAttachConfirm(std::uint32_t apeHandle, short result, std::uint32_t userId) = 0;
    virtual int ApeEnrollConfirm(std::uint32_t apeHandle, short result, short resourceNumber,
                                 ARMSessionResource* resources) = 0;
    virtual int ApeDataIndication(std::uint32_t apeHandle, std::uint32_t senderId,
                                  std::uint32_t value, std::uint16_t flags, const void* data,
                                  std::uint32_t length) = 0;
    virtual int ApeBufferFullIndication(std::uint32_t apeHandle) = 0;
    virtual int TokenGrabConfirm(std::uint32_t apeHandle, std::uint32_t tokenId, short result) = 0;
    virtual int TokenInhibitConfirm(std::uint32_t apeHandle, std::uint32_t tokenId,
                                    short result) = 0;
    virtual int TokenGiveIndication(std::uint32_t apeHandle, std::uint32_t tokenId,
                                    std::uint32_t fromUserId) = 0;
    virtual int TokenGiveConfirm(std::uint32_t apeHandle, std::uint32_t tokenId, short result) = 0;
    virtual int TokenPleaseIndication(std::uint32_t apeHandle, std::uint32_t tokenId,
                                      std::uint32_t fromUserId) = 0;
    virtual int TokenReleaseConfirm(std::uint32_t apeHandle, std::uint32_t tokenId,
                                    short result) = 0;
    virtual int TokenTestConfirm(std::uint32_t apeHandle, std::uint32_t tokenId,
                                 std::uint32_t status) = 0;
    virtual int ApeRosterInquireConfirm(std::uint32_t apeHandle, short result) = 0;
    virtual int ApeRosterRefreshConfirm(std::uint32_t apeHandle, short result) = 0;
    virtual int ApeRosterReportIndication(std::uint32_t apeHandle, std::uint32_t sessionId) = 0;
    // Records: first the added, then the deleted, then the modified ones.
    virtual int ApeRosterChanged(std::uint32_t serviceId, std::uint16_t value,
                                 std::uint32_t addedCount, std::uint32_t deletedCount,
                                 std::uint32_t modifiedCount, ARMApeRoster* records) = 0;
    virtual int ApeDetachIndication(std::uint32_t apeHandle, short reason) = 0;
    virtual int ApeDataIndicationEx(std::uint32_t apeHandle, std::uint32_t senderId,
                                    const void* data, std::uint32_t length) = 0;
    virtual int ApeCacheActionConfirmEx(std::uint32_t apeHandle, std::uint32_t entityId,
                                        tagCacheAction action, std::uint32_t requestIdx,
                                        std::uint32_t cacheId, short result) = 0;

protected:
    ~IArmApeSink() = default;
};

class IArmSharedDataSink {
public:
    virtual int SharedDataReceived(std::uint32_t apeHandle, std::uint32_t entityId,
                                   std::uint32_t memHandle, short result) = 0;
    // One delivery of a cache: the item's cache id, the cache handle (entity), the item's
    // bytes in a memory handle that lives until the callback returns (0 when none).
    virtual int SharedDataReceivedEx(std::uint32_t apeHandle, std::uint32_t cacheId,
                                     std::uint32_t entityId, std::uint32_t memHandle,
                                     short result, tagCacheAction action,
                                     std::uint32_t senderId, std::uint32_t value,
                                     std::uint16_t flags) = 0;

protected:
    ~IArmSharedDataSink() = default;
};

class IArmAllocHandleSink {
public:
    virtual int AllocHandleConfirm(std::uint32_t apeHandle, std::uint32_t handle,
                                   short result) = 0;
    virtual int AllocNameHandleConfirm(std::uint32_t apeHandle, std::uint32_t count,
                                       NameHandle* handles, short result,
                                       std::uint32_t reserved) = 0;

protected:
    ~IArmAllocHandleSink() = default;
};

// The service object one participant holds. Operations in interface order; 0 = accepted.
class IArmClient {
public:
    // Last call: the object is gone afterwards and delivers nothing more.
    virtual int Release() = 0;
    virtual int Connect(IArmNodeControllerSink* sink, const char* userName, std::uint32_t a,
                        std::uint32_t b, std::uint32_t c) = 0;
    virtual int Destroy(IArmNodeControllerSink* sink, int flag) = 0;
    virtual int SetSendOption(int option, const ARMSendOption* value) = 0;
    virtual int ConferenceJoin(std::uint32_t reserved, std::uint16_t conferenceId,
                               IArmConferenceSink* sink, int mode) = 0;
    virtual int ConferenceLeave(std::uint32_t reserved, std::uint16_t conferenceId,
                                IArmConferenceSink* sink) = 0;
    virtual int ApeAttach(IArmApeSink* sink, std::uint32_t reserved, std::uint16_t conferenceId,
                          std::uint32_t* apeHandle) = 0;
    virtual int ApeEnroll(std::uint32_t apeHandle, int enroll, std::uint32_t sessionId,
                          std::uint32_t reserved, int resourceCount,
                          ARMSessionResource* resources, const void* enrollInfo,
                          std::uint32_t enrollInfoLength, int mode) = 0;
    virtual int ApeSendData(std::uint32_t apeHandle, std::uint32_t destUserId, int priority,
                            const void* data, std::uint32_t length, int reliable,
                            int segment) = 0;
    virtual int ApeDetach(std::uint32_t apeHandle) = 0;
    virtual int RegisterSharedDataSink(std::uint32_t apeHandle, IArmSharedDataSink* sink) = 0;
    virtual int AllocNameHandle(std::uint32_t apeHandle, std::uint32_t count,
                                NameHandle* entries, IArmAllocHandleSink* sink) = 0;
    virtual int ApeSharedDataActionEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                      std::uint32_t reserved1, std::uint32_t reserved2,
                                      tagCacheAction action, std::uint32_t flags,
                                      std::uint32_t memHandle, std::uint32_t reserved3,
                                      int confirm) = 0;
    virtual int ApeRequestSharedDataEx(std::uint32_t apeHandle, std::uint32_t cacheHandle,
                                       std::uint32_t reserved, tagCacheRequestType type,
                                       std::uint32_t maxItems, IArmSharedDataSink* sink) = 0;
    virtual int AllocMemHandle(std::uint32_t size, std::uint32_t* handle) = 0;
    virtual int FreeMemHandle(std::uint32_t handle) = 0;
    virtual int GetMemHandleSize(std::uint32_t handle, std::uint32_t* size) = 0;
    virtual int WriteMemHandle(std::uint32_t handle, std::uint32_t offset, const void* data,
                               std::uint32_t* size) = 0;
    virtual int ReadMemHandle(std::uint32_t handle, std::uint32_t offset, void* buffer,
                              std::uint32_t* size) = 0;

protected:
    ~IArmClient() = default;
};
