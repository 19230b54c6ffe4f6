#include "kyutil/ky_handle.h"

#include <new>

KyHandle* NewHandle(uint32_t nSize) {
    KyHandle* hBlock = new (std::nothrow) KyHandle{nullptr, nSize, 0};
    if (hBlock == nullptr || nSize == 0) return hBlock;
    hBlock->pData = new (std::nothrow) uint8_t[nSize]();
    if (hBlock->pData == nullptr) {
        delete hBlock;
        return nullptr;
    }
    return hBlock;
}

void DisposeHandle(KyHandle* hBlock) {
    if (hBlock == nullptr) return;
    delete[] hBlock->pData;
    delete hBlock;
}

bool HLock(KyHandle* hBlock) {
    if (hBlock == nullptr) return false;
    ++hBlock->nLockCount;
    return true;
}

bool HUnlock(KyHandle* hBlock) {
    if (hBlock == nullptr || hBlock->nLockCount == 0) return false;
    --hBlock->nLockCount;
    return true;
}
