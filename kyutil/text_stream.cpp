#include "kyutil/text_stream.h"

#include <cstdio>

#include "kyutil/safe_mem.h"

CTextStream::CTextStream(char* pBuffer, uint32_t nCapacity)
    : m_pBuffer(pBuffer),
      m_nCapacity(pBuffer != nullptr ? nCapacity : 0),
      m_nLength(0),
      m_bHex(false) {}

void CTextStream::Advance(const char* pszText) {
    if (pszText == nullptr || m_nLength + 1 >= m_nCapacity) return;
    const uint32_t nRoom = m_nCapacity - m_nLength - 1;
    const size_t n = SafeTextLength(pszText, nRoom);
    if (!SafeMove(m_pBuffer + m_nLength, m_nCapacity - m_nLength, pszText, n)) return;
    m_nLength += static_cast<uint32_t>(n);
    m_pBuffer[m_nLength] = '\0';
}

CTextStream& CTextStream::Hex() {
    m_bHex = true;
    return *this;
}

CTextStream& CTextStream::operator<<(const char* pszText) {
    Advance(pszText);
    return *this;
}

CTextStream& CTextStream::operator<<(int32_t nValue) {
    char digits[16] = {};
    if (m_bHex) {
        std::snprintf(digits, sizeof(digits), "%x", static_cast<uint32_t>(nValue));
    } else {
        std::snprintf(digits, sizeof(digits), "%d", nValue);
    }
    m_bHex = false;
    Advance(digits);
    return *this;
}
