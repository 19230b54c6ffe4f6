// A relocatable memory block, the alternative storage of a byte stream: its data lives at the
// block's current address, which stays put while the block is locked.
#pragma once

#include <cstdint>

struct KyHandle {
    uint8_t* pData;      // current address of the block's bytes
    uint32_t nSize;      // bytes in the block
    int32_t nLockCount;  // HLock calls not yet matched by HUnlock
};

// A new zero-filled block of nSize bytes (nSize 0 gives an empty block), or null when memory
// runs out. Release it with DisposeHandle.
KyHandle* NewHandle(uint32_t nSize);

// Frees the block and its bytes; a null handle is ignored.
void DisposeHandle(KyHandle* hBlock);

// Pins the block at its current address; returns false for a null handle.
bool HLock(KyHandle* hBlock);

// Undoes one HLock; returns false for a null handle or one that is not locked.
bool HUnlock(KyHandle* hBlock);
