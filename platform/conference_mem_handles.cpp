#include "platform/conference_mem_handles.h"

#include <cstring>

#include "platform/conference_results.h"

int ConferenceMemHandles::Allocate(std::uint32_t handle, std::uint32_t size) {
    if (size > kArmMaxDataLength) return kArmTooLarge;
    m_blocks[handle].assign(size, 0);
    return 0;
}

void ConferenceMemHandles::Adopt(std::uint32_t handle, std::vector<std::uint8_t> bytes) {
    m_blocks[handle] = std::move(bytes);
}

int ConferenceMemHandles::Free(std::uint32_t handle) {
    return m_blocks.erase(handle) == 1 ? 0 : kArmUnknownHandle;
}

int ConferenceMemHandles::GetSize(std::uint32_t handle, std::uint32_t* size) const {
    if (size == nullptr) return kArmInvalidArgument;
    const std::vector<std::uint8_t>* block = Find(handle);
    if (block == nullptr) return kArmUnknownHandle;
    *size = static_cast<std::uint32_t>(block->size());
    return 0;
}

int ConferenceMemHandles::Write(std::uint32_t handle, std::uint32_t offset, const void* data,
                                std::uint32_t* size) {
    int result = 0;
    if (Span(handle, offset, data, size, &result) == nullptr) return result;
    if (*size > 0) std::memcpy(m_blocks[handle].data() + offset, data, *size);
    return 0;
}

int ConferenceMemHandles::Read(std::uint32_t handle, std::uint32_t offset, void* buffer,
                               std::uint32_t* size) const {
    int result = 0;
    const std::vector<std::uint8_t>* block = Span(handle, offset, buffer, size, &result);
    if (block == nullptr) return result;
    if (*size > 0) std::memcpy(buffer, block->data() + offset, *size);
    return 0;
}

const std::vector<std::uint8_t>* ConferenceMemHandles::Find(std::uint32_t handle) const {
    const auto it = m_blocks.find(handle);
    return it == m_blocks.end() ? nullptr : &it->second;
}

const std::vector<std::uint8_t>* ConferenceMemHandles::Span(std::uint32_t handle,
                                                            std::uint32_t offset, const void* bytes,
                                                            std::uint32_t* size,
                                                            int* result) const {
    if (size == nullptr || (bytes == nullptr && *size > 0)) {
        *result = kArmInvalidArgument;
        return nullptr;
    }
    const std::vector<std::uint8_t>* block = Find(handle);
    if (block == nullptr) {
        *result = kArmUnknownHandle;
        return nullptr;
    }
    if (offset > block->size()) {
        *size = 0;
        *result = kArmOutOfRange;
        return nullptr;
    }
    const std::size_t room = block->size() - offset;
    if (*size > room) *size = static_cast<std::uint32_t>(room);
    return block;
}
