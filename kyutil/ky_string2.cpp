#include "kyutil/ky_string2.h"

#include <algorithm>
#include <new>

#include "kyutil/safe_mem.h"

namespace {

// A new[] buffer holding the n bytes at pSource and a terminator, or null when memory runs out.
char* CopyOut(const char* pSource, uint16_t n) {
    char* pszCopy = new (std::nothrow) char[size_t{n} + 1];
    if (pszCopy == nullptr) return nullptr;
    if (!SafeMove(pszCopy, size_t{n} + 1, pSource, n)) {
        delete[] pszCopy;
        return nullptr;
    }
    pszCopy[n] = '\0';
    return pszCopy;
}

}  // namespace

CKyString2::CKyString2() : m_pszData(nullptr), m_nLength(0) {}

CKyString2::CKyString2(int32_t nLength) : m_pszData(nullptr), m_nLength(0) {
    const uint16_t n =
        static_cast<uint16_t>(nLength < 0 ? 0 : std::min<int32_t>(nLength, kMaxLength));
    Adopt(new (std::nothrow) char[size_t{n} + 1](), n);
}

CKyString2::CKyString2(const char* pszText) : m_pszData(nullptr), m_nLength(0) {
    CopyFrom(pszText);
}

CKyString2::CKyString2(const CKyString2& other) : m_pszData(nullptr), m_nLength(0) {
    CopyFrom(other);
}

CKyString2& CKyString2::operator=(const CKyString2& other) {
    CopyFrom(other);
    return *this;
}

CKyString2::~CKyString2() {
    delete[] m_pszData;
}

void CKyString2::Adopt(char* pszData, uint16_t nLength) {
    delete[] m_pszData;
    m_pszData = pszData;
    m_nLength = pszData != nullptr ? nLength : 0;
}

void CKyString2::CopyFrom(const char* pszText) {
    if (pszText == nullptr) {
        Empty();
        return;
    }
    // The copy is made before the old text is freed, so pszText may point into it.
    const uint16_t n = static_cast<uint16_t>(SafeTextLength(pszText, kMaxLength));
    Adopt(CopyOut(pszText, n), n);
}

void CKyString2::CopyFrom(const CKyString2& other) {
    if (&other != this) CopyFrom(other.m_pszData);
}

bool CKyString2::Equals(const char* pszText) const {
    const size_t nOther = SafeTextLength(pszText, size_t{kMaxLength} + 1);
    if (m_nLength == 0 || nOther == 0) return m_nLength == 0 && nOther == 0;
    return nOther == m_nLength && SafeBytesEqual(m_pszData, pszText, m_nLength);
}

bool CKyString2::Equals(const CKyString2& other) const {
    if (m_nLength != other.m_nLength) return false;
    return m_nLength == 0 || SafeBytesEqual(m_pszData, other.m_pszData, m_nLength);
}

int32_t CKyString2::Delete(int32_t nStart, int32_t nCount) {
    if (nStart < 0) nStart = 0;
    if (nCount < 1 || nStart >= m_nLength) return -1;
    if (nCount > m_nLength - nStart) nCount = m_nLength - nStart;
    const uint16_t nNewLength = static_cast<uint16_t>(m_nLength - nCount);
    char* pszNew = new (std::nothrow) char[size_t{nNewLength} + 1];
    if (pszNew == nullptr) return -1;
    const size_t nRoom = size_t{nNewLength} + 1;
    const size_t nHead = static_cast<size_t>(nStart);
    if (!SafeMove(pszNew, nRoom, m_pszData, nHead) ||
        !SafeMove(pszNew + nHead, nRoom - nHead, m_pszData + nHead + nCount, nNewLength - nHead)) {
        delete[] pszNew;
        return -1;
    }
    pszNew[nNewLength] = '\0';
    Adopt(pszNew, nNewLength);
    return nNewLength;
}

CKyString2 CKyString2::Mid(int32_t nStart, int32_t nCount) const {
    if (nStart < 0) nStart = 0;
    int32_t nTaken = 0;
    if (nStart <= m_nLength && nCount > 0) {
        nTaken = nCount < m_nLength - nStart ? nCount : m_nLength - nStart;
    }
    CKyString2 part;
    const char* pSource = nTaken > 0 ? m_pszData + nStart : "";
    part.Adopt(CopyOut(pSource, static_cast<uint16_t>(nTaken)), static_cast<uint16_t>(nTaken));
    return part;
}

void CKyString2::Empty() {
    Adopt(nullptr, 0);
}
