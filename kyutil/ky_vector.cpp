#include "kyutil/ky_vector.h"

#include <new>

#include "kyutil/safe_mem.h"
#include "newutil/macutil/debug_output.h"

namespace {

// Slots added by each growth step.
constexpr int32_t kGrowSlots = 32;

// The module the vector's index assertions are reported from.
constexpr const char* kModule = "newutil/macutil";

// Holds the vector's lock for the duration of one operation.
class LockScope {
public:
    explicit LockScope(CKyCriticalSection& section) : m_section(section) { m_section.Lock(); }
    ~LockScope() { m_section.Unlock(); }
    LockScope(const LockScope&) = delete;
    LockScope& operator=(const LockScope&) = delete;

private:
    CKyCriticalSection& m_section;
};

size_t SlotBytes(int32_t nSlots) {
    return static_cast<size_t>(nSlots) * sizeof(void*);
}

}  // namespace

CKyVector::CKyVector() : m_ppData(nullptr), m_nSize(0), m_nUsed(0) {}

CKyVector::CKyVector(void* const* ppItems, int32_t nCount)
    : m_ppData(nullptr), m_nSize(0), m_nUsed(0) {
    Assign(ppItems, nCount);
}

CKyVector::CKyVector(const CKyVector& other) : m_ppData(nullptr), m_nSize(0), m_nUsed(0) {
    Assign(other.m_ppData, other.m_nUsed);
}

CKyVector& CKyVector::operator=(const CKyVector& other) {
    if (this != &other) Assign(other.m_ppData, other.m_nUsed);
    return *this;
}

CKyVector::~CKyVector() {
    delete[] m_ppData;
}

void CKyVector::Assign(void* const* ppItems, int32_t nCount) {
    LockScope lock(m_Lock);
    delete[] m_ppData;
    m_ppData = nullptr;
    m_nSize = 0;
    m_nUsed = 0;
    if (ppItems == nullptr || nCount < 1) return;
    void** ppNew = new (std::nothrow) void*[nCount];
    if (ppNew == nullptr) return;
    if (!SafeMove(ppNew, SlotBytes(nCount), ppItems, SlotBytes(nCount))) {
        delete[] ppNew;
        return;
    }
    m_ppData = ppNew;
    m_nSize = nCount;
    m_nUsed = nCount;
}

int CKyVector::Add(void* pItem, bool bUnique) {
    LockScope lock(m_Lock);
    if (bUnique && GetIndex(pItem) >= 0) return 0;
    if (!Expand()) return 0;
    m_ppData[m_nUsed++] = pItem;
    return 1;
}

int CKyVector::Expand() {
    LockScope lock(m_Lock);
    if (m_nUsed < m_nSize) return 1;
    if (m_nSize > INT32_MAX - kGrowSlots) return 0;
    const int32_t nNewSize = m_nSize + kGrowSlots;
    void** ppNew = new (std::nothrow) void*[nNewSize];
    if (ppNew == nullptr) return 0;
    if (!SafeMove(ppNew, SlotBytes(nNewSize), m_ppData, SlotBytes(m_nUsed))) {
        delete[] ppNew;
        return 0;
    }
    delete[] m_ppData;
    m_ppData = ppNew;
    m_nSize = nNewSize;
    return 1;
}

int32_t CKyVector::GetIndex(const void* pItem) const {
    LockScope lock(m_Lock);
    for (int32_t i = 0; i < m_nUsed; ++i) {
        if (m_ppData[i] == pItem) return i;
    }
    return -1;
}

int CKyVector::InsertAt(int32_t nIndex, void* pItem) {
    LockScope lock(m_Lock);
    if (nIndex < 0 || nIndex > m_nUsed) {
        ReportAssertion("nIndex >= 0 && nIndex <= m_nUsed", "InsertAt", kModule);
        return 0;
    }
    if (!Expand()) return 0;
    const int32_t nTail = m_nUsed - nIndex;
    if (!SafeMove(m_ppData + nIndex + 1, SlotBytes(m_nSize - nIndex - 1), m_ppData + nIndex,
                  SlotBytes(nTail))) {
        return 0;
    }
    m_ppData[nIndex] = pItem;
    ++m_nUsed;
    return 1;
}

int CKyVector::SetAt(int32_t nIndex, void* pItem) {
    LockScope lock(m_Lock);
    if (nIndex < 0 || nIndex >= m_nUsed) {
        ReportAssertion("nIndex >= 0 && nIndex < m_nUsed", "SetAt", kModule);
        return 0;
    }
    m_ppData[nIndex] = pItem;
    return 1;
}

int CKyVector::Remove(const void* pItem) {
    LockScope lock(m_Lock);
    const int32_t nIndex = GetIndex(pItem);
    return nIndex >= 0 ? RemoveAt(nIndex) : 0;
}

int CKyVector::RemoveAt(int32_t nIndex) {
    LockScope lock(m_Lock);
    if (nIndex < 0 || nIndex >= m_nUsed) return 0;
    const int32_t nTail = m_nUsed - nIndex - 1;
    if (!SafeMove(m_ppData + nIndex, SlotBytes(m_nSize - nIndex), m_ppData + nIndex + 1,
                  SlotBytes(nTail))) {
        return 0;
    }
    --m_nUsed;
    return 1;
}

void CKyVector::RemoveAll() {
    LockScope lock(m_Lock);
    delete[] m_ppData;
    m_ppData = nullptr;
    m_nSize = 0;
    m_nUsed = 0;
}

std::unique_ptr<CKyVector> CKyVector::Clone() const {
    LockScope lock(m_Lock);
    return std::unique_ptr<CKyVector>(new (std::nothrow) CKyVector(*this));
}

void** CKyVector::GetHead() const {
    LockScope lock(m_Lock);
    return m_ppData;
}

int32_t CKyVector::GetCapacity() const {
    LockScope lock(m_Lock);
    return m_nSize;
}
