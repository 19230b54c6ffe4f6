// Reads and writes typed values and length-prefixed strings at a moving position, most
// significant byte first, over a caller's buffer, a buffer of its own, a memory block or nothing
// (to measure how many bytes a sequence of writes takes).
#pragma once

#include <cstdint>

#include "kyutil/ky_handle.h"

class CByteStream {
public:
    // A stream that allocates its own buffer on first need, in steps of nGrowIncrement bytes.
    explicit CByteStream(uint32_t nGrowIncrement);
    // A stream over the caller's nSize bytes; it never writes or reads beyond them.
    CByteStream(void* pBuffer, uint32_t nSize);
    // A stream over a caller's buffer of unknown size: nothing is bounded.
    explicit CByteStream(void* pBuffer);
    // Whether a stream over a memory block disposes the block when it closes.
    enum class Ownership { kBorrowed, kOwned };
    // A stream over a memory block, bounded by its size.
    CByteStream(KyHandle* hData, Ownership ownership);
    virtual ~CByteStream();

    CByteStream(const CByteStream&) = delete;
    CByteStream& operator=(const CByteStream&) = delete;

    // Writes n bytes at the position and advances it; without storage only the position
    // advances. Returns false, writing nothing, when the bytes do not fit (a bounded stream
    // drops them) or pData is null.
    bool Write(const void* pData, uint32_t n);
    bool WriteBytes(const void* pData, uint32_t n) { return Write(pData, n); }

    // Copies n bytes from the position into pData and advances it; without storage only the
    // position advances. Returns false, copying nothing and keeping the position, when the
    // bytes lie beyond the stream's capacity or pData is null.
    bool Read(void* pData, uint32_t n);
    bool ReadBytes(void* pData, uint32_t n) { return Read(pData, n); }

    // True once a read or write was refused since construction, Close or ClearFailed, so a
    // sequence of reads can be checked once at its end.
    bool Failed() const { return m_bFailed; }
    void ClearFailed() { m_bFailed = false; }

    // Write values in stream byte order: 1, 1, 2, 2, 4, 4, 4, 4, 4 and 8 bytes. A long is
    // stored in 4 bytes, so only its low 32 bits travel.
    CByteStream& operator<<(unsigned char value);
    CByteStream& operator<<(char value);
    CByteStream& operator<<(short value);
    CByteStream& operator<<(unsigned short value);
    CByteStream& operator<<(int value);
    CByteStream& operator<<(unsigned int value);
    CByteStream& operator<<(long value);
    CByteStream& operator<<(unsigned long value);
    CByteStream& operator<<(float value);
    CByteStream& operator<<(double value);

    // Read values written by the operators above; a refused read leaves the value unchanged.
    // A long is read from 4 bytes with its sign, an unsigned long without.
    CByteStream& operator>>(unsigned char& value);
    CByteStream& operator>>(char& value);
    CByteStream& operator>>(short& value);
    CByteStream& operator>>(unsigned short& value);
    CByteStream& operator>>(int& value);
    CByteStream& operator>>(unsigned int& value);
    CByteStream& operator>>(long& value);
    CByteStream& operator>>(unsigned long& value);
    CByteStream& operator>>(float& value);
    CByteStream& operator>>(double& value);

    // Writes a 32-bit byte count that includes the terminator, then the text and its
    // terminator; a null text writes the count 0 alone.
    void WriteString(const char* pszText);

    // Reads a string written by WriteString into a malloc'd copy the caller frees with free().
    // Returns null for the count 0, and, keeping the position, for a string that does not fit
    // the capacity or whose last byte is not its terminator.
    char* ReadString();

    // Sets the position; returns the previous one.
    uint32_t Seek(uint32_t nPosition);
    // The position.
    uint32_t Tell() const { return m_nPosition; }
    // Advances the position by n and returns n; 0, without moving, when it would pass 4 GiB.
    uint32_t Skip(uint32_t n);
    // Bytes between the position and the capacity; 0 at or past the capacity.
    uint32_t Available() const;
    // The highest position a write reached.
    uint32_t GetLength() const { return m_nLength; }
    // Usable size of the storage; 0 when nothing is bounded.
    uint32_t GetCapacity() const { return m_nCapacity; }

    // The buffer, else the memory block's current address, else null.
    uint8_t* GetData() const;

    // Lock or unlock the memory block; 1 when there is one, else 0.
    int Lock();
    int Unlock();

    // Replaces the buffer pointer (the capacity stays) and rewinds to position 0.
    void Reset(void* pBuffer);

    // Frees the buffer and disposes the block when the stream owns them, and forgets storage,
    // position, length, increment and capacity.
    void Close();

    // Moves n bytes from pSrc to pDst; returns false, moving nothing, when either is null.
    static bool Memcpy(void* pDst, const void* pSrc, uint32_t n);

    // Storage for the stream's own buffer (malloc, free and realloc); null when memory runs out.
    virtual void* Alloc(uint32_t nSize);
    virtual void Free(void* pBlock);
    virtual void* Realloc(void* pBlock, uint32_t nSize);

    // Values at an offset of a plain buffer, in stream byte order. ReadChar sign-extends.
    static uint8_t ReadUChar(const void* pBuffer, uint32_t nOffset);
    static int8_t ReadChar(const void* pBuffer, uint32_t nOffset);
    static uint16_t ReadUShort(const void* pBuffer, uint32_t nOffset);
    static int16_t ReadShort(const void* pBuffer, uint32_t nOffset);
    static uint32_t ReadUInt(const void* pBuffer, uint32_t nOffset);
    static int32_t ReadInt(const void* pBuffer, uint32_t nOffset);
    static uint32_t ReadULong(const void* pBuffer, uint32_t nOffset);
    static int32_t ReadLong(const void* pBuffer, uint32_t nOffset);
    static float ReadFloat(const void* pBuffer, uint32_t nOffset);
    static double ReadDouble(const void* pBuffer, uint32_t nOffset);

    // Store a value at an offset of a plain buffer; return the bytes written (1, 1, 2, 2, 4, 4,
    // 4, 4, 4, 8).
    static int WriteUChar(void* pBuffer, uint32_t nOffset, uint8_t value);
    static int WriteChar(void* pBuffer, uint32_t nOffset, int8_t value);
    static int WriteUShort(void* pBuffer, uint32_t nOffset, uint16_t value);
    static int WriteShort(void* pBuffer, uint32_t nOffset, int16_t value);
    static int WriteUInt(void* pBuffer, uint32_t nOffset, uint32_t value);
    static int WriteInt(void* pBuffer, uint32_t nOffset, int32_t value);
    static int WriteULong(void* pBuffer, uint32_t nOffset, uint32_t value);
    static int WriteLong(void* pBuffer, uint32_t nOffset, int32_t value);
    static int WriteFloat(void* pBuffer, uint32_t nOffset, float value);
    static int WriteDouble(void* pBuffer, uint32_t nOffset, double value);

private:
    // True when n more bytes from the position stay below 4 GiB and within the capacity.
    bool Fits(uint32_t n) const;
    // Makes the capacity at least nNeeded by growing in whole increments.
    bool Grow(uint32_t nNeeded);

    // Storage: at most one of the two is used.
    uint8_t* m_pBuffer;
    KyHandle* m_hData;
    // Where the next byte goes and the highest position a write reached.
    uint32_t m_nPosition;
    uint32_t m_nLength;
    // Growth step (0: never allocates) and usable size (0: unbounded).
    uint32_t m_nIncrement;
    uint32_t m_nCapacity;
    // The stream frees the buffer and disposes the block.
    int32_t m_bOwns;
    // A read or write was refused.
    bool m_bFailed;
};
