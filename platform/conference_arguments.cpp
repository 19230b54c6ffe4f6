#include "platform/conference_arguments.h"

#include "platform/conference_results.h"

int CheckEnrollArguments(int resourceCount, const ARMSessionResource* resources,
                         const void* enrollInfo, std::uint32_t enrollInfoLength) {
    if (resourceCount < 0 || static_cast<std::uint32_t>(resourceCount) > kArmMaxEntries ||
        (resourceCount > 0 && resources == nullptr) ||
        (enrollInfo == nullptr && enrollInfoLength > 0)) {
        return kArmInvalidArgument;
    }
    return enrollInfoLength > kArmMaxDataLength ? kArmTooLarge : 0;
}

int CheckNameHandleArguments(std::uint32_t count, const NameHandle* entries,
                             const IArmAllocHandleSink* sink) {
    if (sink == nullptr || count > kArmMaxEntries || (count > 0 && entries == nullptr))
        return kArmInvalidArgument;
    return 0;
}

int CacheActionBytes(tagCacheAction action, std::uint32_t memHandle,
                     const ConferenceMemHandles& memory,
                     std::shared_ptr<const std::vector<std::uint8_t>>* data) {
    if (action != CACHE_SET && action != CACHE_APPEND) return kArmInvalidArgument;
    if (memHandle == 0)
        return action == CACHE_APPEND ? kArmInvalidArgument : 0;  // an item needs bytes
    const std::vector<std::uint8_t>* block = memory.Find(memHandle);
    if (block == nullptr) return kArmUnknownHandle;
    *data = std::make_shared<const std::vector<std::uint8_t>>(*block);
    return 0;
}
