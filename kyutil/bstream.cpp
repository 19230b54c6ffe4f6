#include "kyutil/bstream.h"

#include <cstdlib>
#include <cstring>

#include "kyutil/safe_mem.h"
#include "kyutil/text_stream.h"
#include "newutil/macutil/debug_output.h"

namespace {

// The source named in the stream's assertion messages.
constexpr const char* kSourcePath = "kyutil/bstream.cpp";

// Where each assertion is reported from; the numbers are part of the message texts.
enum AssertLine : int32_t {
    kNoIncrement = 12,
    kNullWrappedBuffer = 26,
    kBufferAfterClose = 75,
    kHandleAfterClose = 76,
    kMemcpyNullDst = 164,
    kMemcpyNullSrc = 165,
    kGrowNoIncrement = 181,
    kGrowNoIncrementAgain = 184,
    kGrowFailed = 199,
    kWriteNullData = 267,
    kStillTooSmall = 280,
    kReadNullData = 311,
    kStringAllocFailed = 668,
};

// Reports a failed check of the stream; execution always continues.
void StreamAssert(int32_t nLine) {
    if (GetTraceLevel() < 1) return;
    char text[512] = {};
    CTextStream out(text, sizeof(text));
    out << "Assert -- "
        << " at file " << kSourcePath << ", line " << nLine << "\n";
    OutputDebugString(text);
}

}  // namespace

CByteStream::CByteStream(uint32_t nGrowIncrement)
    : m_pBuffer(nullptr),
      m_hData(nullptr),
      m_nPosition(0),
      m_nLength(0),
      m_nIncrement(nGrowIncrement),
      m_nCapacity(0),
      m_bOwns(1),
      m_bFailed(false) {
    if (nGrowIncrement == 0) StreamAssert(kNoIncrement);
}

CByteStream::CByteStream(void* pBuffer, uint32_t nSize)
    : m_pBuffer(static_cast<uint8_t*>(pBuffer)),
      m_hData(nullptr),
      m_nPosition(0),
      m_nLength(0),
      m_nIncrement(0),
      m_nCapacity(nSize),
      m_bOwns(0),
      m_bFailed(false) {
    if (pBuffer == nullptr) StreamAssert(kNullWrappedBuffer);
}

CByteStream::CByteStream(void* pBuffer)
    : m_pBuffer(static_cast<uint8_t*>(pBuffer)),
      m_hData(nullptr),
      m_nPosition(0),
      m_nLength(0),
      m_nIncrement(0),
      m_nCapacity(0),
      m_bOwns(0),
      m_bFailed(false) {}

CByteStream::CByteStream(KyHandle* hData, Ownership ownership)
    : m_pBuffer(nullptr),
      m_hData(hData),
      m_nPosition(0),
      m_nLength(0),
      m_nIncrement(0),
      m_nCapacity(hData != nullptr ? hData->nSize : 0),
      m_bOwns(ownership == Ownership::kOwned ? 1 : 0),
      m_bFailed(false) {
    if (hData == nullptr) StreamAssert(kNullWrappedBuffer);
}

CByteStream::~CByteStream() {
    if (m_pBuffer != nullptr || m_hData != nullptr) Close();
    if (m_pBuffer != nullptr) StreamAssert(kBufferAfterClose);
    if (m_hData != nullptr) StreamAssert(kHandleAfterClose);
}

bool CByteStream::Fits(uint32_t n) const {
    const uint64_t nEnd = uint64_t{m_nPosition} + n;
    if (nEnd > UINT32_MAX) return false;
    return m_nCapacity == 0 || nEnd <= m_nCapacity;
}

bool CByteStream::Write(const void* pData, uint32_t n) {
    if (n == 0) return true;
    if (pData == nullptr) {
        StreamAssert(kWriteNullData);
        m_bFailed = true;
        return false;
    }
    const uint64_t nEnd = uint64_t{m_nPosition} + n;
    if (m_nIncrement != 0 && nEnd > m_nCapacity) {
        if (nEnd > UINT32_MAX || !Grow(static_cast<uint32_t>(nEnd))) {
            m_bFailed = true;
            return false;
        }
        if (nEnd > m_nCapacity) StreamAssert(kStillTooSmall);
    }
    if (!Fits(n)) {
        m_bFailed = true;
        return false;
    }
    uint8_t* pBase = GetData();
    if (pBase != nullptr && !Memcpy(pBase + m_nPosition, pData, n)) {
        m_bFailed = true;
        return false;
    }
    m_nPosition += n;
    if (m_nPosition > m_nLength) m_nLength = m_nPosition;
    return true;
}

bool CByteStream::Read(void* pData, uint32_t n) {
    if (n == 0) return true;
    if (pData == nullptr) {
        StreamAssert(kReadNullData);
        m_bFailed = true;
        return false;
    }
    if (!Fits(n)) {
        m_bFailed = true;
        return false;
    }
    const uint8_t* pBase = GetData();
    if (pBase != nullptr && !Memcpy(pData, pBase + m_nPosition, n)) {
        m_bFailed = true;
        return false;
    }
    m_nPosition += n;
    return true;
}

bool CByteStream::Grow(uint32_t nNeeded) {
    if (m_nCapacity >= nNeeded) return true;
    if (m_nIncrement == 0) {
        StreamAssert(kGrowNoIncrement);
        StreamAssert(kGrowNoIncrementAgain);
        return false;
    }
    const uint64_t nSteps = (uint64_t{nNeeded} - m_nCapacity + m_nIncrement - 1) / m_nIncrement;
    const uint64_t nNewSize = m_nCapacity + nSteps * m_nIncrement;
    void* pNew = nullptr;
    if (nNewSize <= UINT32_MAX) {
        const uint32_t nSize = static_cast<uint32_t>(nNewSize);
        if (m_pBuffer == nullptr && m_hData == nullptr) {
            pNew = Alloc(nSize);
        } else if (m_pBuffer != nullptr && m_bOwns) {
            // The stream's own buffer grows in place or moves with its bytes.
            pNew = Realloc(m_pBuffer, nSize);
        }
    }
    if (pNew == nullptr) {
        StreamAssert(kGrowFailed);
        return false;
    }
    m_pBuffer = static_cast<uint8_t*>(pNew);
    m_nCapacity = static_cast<uint32_t>(nNewSize);
    return true;
}

void CByteStream::WriteString(const char* pszText) {
    if (pszText == nullptr) {
        *this << 0u;
        return;
    }
    const size_t nLength = std::strlen(pszText);
    if (nLength >= UINT32_MAX) {
        m_bFailed = true;
        return;
    }
    const uint32_t nCount = static_cast<uint32_t>(nLength) + 1;
    *this << nCount;
    Write(pszText, nCount);
}

char* CByteStream::ReadString() {
    const uint32_t nStart = m_nPosition;
    uint8_t countBytes[4] = {};
    if (!Read(countBytes, sizeof(countBytes))) return nullptr;
    const uint32_t nCount = ReadUInt(countBytes, 0);
    if (nCount == 0) return nullptr;

    const uint8_t* pBase = GetData();
    // A count that passes the capacity, or a string that does not end in its terminator,
    // is refused whole.
    if (!Fits(nCount) || (pBase != nullptr && pBase[m_nPosition + nCount - 1] != '\0')) {
        m_nPosition = nStart;
        m_bFailed = true;
        return nullptr;
    }
    char* pszText = static_cast<char*>(Alloc(nCount));
    if (pszText == nullptr) {
        StreamAssert(kStringAllocFailed);
        m_nPosition += nCount;
        m_bFailed = true;
        return nullptr;
    }
    Read(pszText, nCount);
    return pszText;
}

uint32_t CByteStream::Seek(uint32_t nPosition) {
    const uint32_t nOld = m_nPosition;
    m_nPosition = nPosition;
    return nOld;
}

uint32_t CByteStream::Skip(uint32_t n) {
    if (uint64_t{m_nPosition} + n > UINT32_MAX) return 0;
    m_nPosition += n;
    return n;
}

uint32_t CByteStream::Available() const {
    return m_nCapacity > m_nPosition ? m_nCapacity - m_nPosition : 0;
}

uint8_t* CByteStream::GetData() const {
    if (m_pBuffer != nullptr) return m_pBuffer;
    return m_hData != nullptr ? m_hData->pData : nullptr;
}

int CByteStream::Lock() {
    return HLock(m_hData) ? 1 : 0;
}

int CByteStream::Unlock() {
    if (m_hData == nullptr) return 0;
    // An unlock without a matching lock leaves the block as it is; there still is a block.
    HUnlock(m_hData);
    return 1;
}

void CByteStream::Reset(void* pBuffer) {
    m_pBuffer = static_cast<uint8_t*>(pBuffer);
    m_nPosition = 0;
}

void CByteStream::Close() {
    if (m_bOwns) {
        if (m_pBuffer != nullptr) Free(m_pBuffer);
        DisposeHandle(m_hData);
    }
    m_pBuffer = nullptr;
    m_hData = nullptr;
    m_nPosition = 0;
    m_nLength = 0;
    m_nIncrement = 0;
    m_nCapacity = 0;
    m_bFailed = false;
}

bool CByteStream::Memcpy(void* pDst, const void* pSrc, uint32_t n) {
    if (pDst == nullptr) StreamAssert(kMemcpyNullDst);
    if (pSrc == nullptr) StreamAssert(kMemcpyNullSrc);
    if (pDst == nullptr || pSrc == nullptr) return false;
    return SafeMove(pDst, n, pSrc, n);
}

void* CByteStream::Alloc(uint32_t nSize) {
    return std::malloc(nSize);
}

void CByteStream::Free(void* pBlock) {
    std::free(pBlock);
}

void* CByteStream::Realloc(void* pBlock, uint32_t nSize) {
    return std::realloc(pBlock, nSize);
}
