// The memory blocks one participant's service object hands out, addressed by handle numbers.
// Reads and writes are clipped to the block; an unknown or freed handle is an error result.
#pragma once

#include <cstdint>
#include <unordered_map>
#include <vector>

class ConferenceMemHandles {
public:
    ConferenceMemHandles() = default;
    ConferenceMemHandles(const ConferenceMemHandles&) = delete;
    ConferenceMemHandles& operator=(const ConferenceMemHandles&) = delete;

    // Adds a zero-filled block of size bytes under handle (a number not in use); 0, or
    // kArmTooLarge above kArmMaxDataLength.
    int Allocate(std::uint32_t handle, std::uint32_t size);
    // Adds a block holding bytes under handle (a number not in use).
    void Adopt(std::uint32_t handle, std::vector<std::uint8_t> bytes);
    // 0, or kArmUnknownHandle when the handle is not held.
    int Free(std::uint32_t handle);
    // The block's size through *size; kArmUnknownHandle or kArmInvalidArgument otherwise.
    int GetSize(std::uint32_t handle, std::uint32_t* size) const;
    // Copies up to *size bytes from data to the block at offset, clipped at the block's end;
    // *size becomes the count copied. An offset past the end is kArmOutOfRange (*size 0).
    int Write(std::uint32_t handle, std::uint32_t offset, const void* data, std::uint32_t* size);
    // Copies up to *size bytes of the block from offset into buffer, clipped the same way.
    int Read(std::uint32_t handle, std::uint32_t offset, void* buffer, std::uint32_t* size) const;
    // The block's bytes, or null when the handle is not held.
    const std::vector<std::uint8_t>* Find(std::uint32_t handle) const;
    // Blocks currently held.
    std::size_t Count() const { return m_blocks.size(); }

private:
    // Checks the common arguments of Read and Write and clips *size; the block, or null
    // with *result set.
    const std::vector<std::uint8_t>* Span(std::uint32_t handle, std::uint32_t offset,
                                          const void* bytes, std::uint32_t* size,
                                          int* result) const;

    std::unordered_map<std::uint32_t, std::vector<std::uint8_t>> m_blocks;
};
