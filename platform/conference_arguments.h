// The argument checks of the conference service contract, shared by every service object, so
// that a bad request is refused with the same result whichever service the component holds.
#pragma once

#include <cstdint>
#include <memory>
#include <vector>

#include "platform/arm_service.h"
#include "platform/conference_mem_handles.h"

// The option code SetSendOption takes for the next send's option.
constexpr int kSendOptionCode = -200;
// The session resource every enroller is granted.
constexpr char kSessionResourceName[] = "c_session_id";
// Resource status of a resource that was not granted.
constexpr std::uint16_t kResourceRefused = 1;
// Most resources or name handles one request may carry.
constexpr std::uint32_t kArmMaxEntries = 4096;

// 0 when an enroll's resources and enroll info are usable, else the refusal.
int CheckEnrollArguments(int resourceCount, const ARMSessionResource* resources,
                         const void* enrollInfo, std::uint32_t enrollInfoLength);

// 0 when a name-handle request is usable, else the refusal.
int CheckNameHandleArguments(std::uint32_t count, const NameHandle* entries,
                             const IArmAllocHandleSink* sink);

// The bytes a cache action writes, copied from its memory block (none for a set without one);
// 0, or the refusal of an action other than set and append, an unknown block or a bare append.
int CacheActionBytes(tagCacheAction action, std::uint32_t memHandle,
                     const ConferenceMemHandles& memory,
                     std::shared_ptr<const std::vector<std::uint8_t>>* data);
