// A bounded text builder over a caller's zero-filled buffer. The last byte of the buffer always
// stays free for the terminator. The byte stream composes its assertion messages with it.
#pragma once

#include <cstdint>

class CTextStream {
public:
    // Builds into the nCapacity bytes at pBuffer, starting at its beginning.
    CTextStream(char* pBuffer, uint32_t nCapacity);

    CTextStream(const CTextStream&) = delete;
    CTextStream& operator=(const CTextStream&) = delete;

    // Appends as much of the text as fits before the buffer's last byte and keeps the text
    // terminated; a null text appends nothing.
    void Advance(const char* pszText);

    // Makes the next number appended hexadecimal ("%x"); later ones are decimal again.
    CTextStream& Hex();

    // Appends the text as Advance does.
    CTextStream& operator<<(const char* pszText);

    // Appends the number in decimal, or once in hexadecimal after Hex().
    CTextStream& operator<<(int32_t nValue);

    // Bytes appended so far.
    uint32_t GetLength() const { return m_nLength; }

    // The buffer being built into.
    const char* GetData() const { return m_pBuffer; }

private:
    char* m_pBuffer;       // caller's buffer
    uint32_t m_nCapacity;  // its size in bytes
    uint32_t m_nLength;    // bytes appended so far
    bool m_bHex;           // the next number is hexadecimal
};
