// A growable array of untyped pointers, growing by 32 slots at a time. It never owns what the
// pointers point to: its users delete their items themselves.
#pragma once

#include <cstdint>
#include <memory>

#include "kyutil/ky_critical_section.h"

class CKyVector {
public:
    CKyVector();
    // Holds copies of the nCount pointers at ppItems (none when ppItems is null or nCount < 1).
    CKyVector(void* const* ppItems, int32_t nCount);
    CKyVector(const CKyVector& other);
    // Replaces the pointers with the other's; assigning a vector to itself keeps it as it is.
    CKyVector& operator=(const CKyVector& other);
    virtual ~CKyVector();

    // Appends pItem; with bUnique a pointer already present is not added again.
    // Returns 1 when added, 0 when not (already present, or out of memory).
    int Add(void* pItem, bool bUnique = false);

    // Makes room for 32 more slots when full; returns 0 only when memory runs out.
    int Expand();

    // The first position holding pItem, or -1.
    int32_t GetIndex(const void* pItem) const;

    // Inserts pItem before position nIndex (0 <= nIndex <= count). Returns 1 when inserted,
    // 0 for an index out of range (reported as an assertion) or when memory runs out.
    int InsertAt(int32_t nIndex, void* pItem);

    // Replaces the pointer at nIndex (0 <= nIndex < count). Returns 1 when stored, 0 for an
    // index out of range (reported as an assertion).
    int SetAt(int32_t nIndex, void* pItem);

    // Removes the first occurrence of pItem; returns 1 when it was present.
    int Remove(const void* pItem);

    // Removes position nIndex; returns 1 when 0 <= nIndex < count, else 0.
    int RemoveAt(int32_t nIndex);

    // Frees the slots: no pointers, capacity 0.
    void RemoveAll();

    // A new vector holding the same pointers.
    std::unique_ptr<CKyVector> Clone() const;

    // The slot array (null when no slots are allocated).
    void** GetHead() const;
    void** GetData() const { return GetHead(); }

    // Number of pointers held.
    int32_t GetCount() const {
        m_Lock.Lock();
        const int32_t nUsed = m_nUsed;
        m_Lock.Unlock();
        return nUsed;
    }

    // Number of slots allocated.
    int32_t GetCapacity() const;

    // The pointer at nIndex, or null when nIndex is negative or not below the count. Inline:
    // roster and group lookups walk whole lists through it.
    void* operator[](int32_t nIndex) const {
        m_Lock.Lock();
        void* pItem = nIndex >= 0 && nIndex < m_nUsed ? m_ppData[nIndex] : nullptr;
        m_Lock.Unlock();
        return pItem;
    }

private:
    // Empties the vector and copies nCount pointers into a new array of exactly that size.
    void Assign(void* const* ppItems, int32_t nCount);

    // Slot array, slots allocated and slots used.
    void** m_ppData;
    int32_t m_nSize;
    int32_t m_nUsed;
    // Brackets every operation.
    mutable CKyCriticalSection m_Lock;
};
