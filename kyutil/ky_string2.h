// An owned, zero-terminated C string of at most 65535 bytes with its length kept in 16 bits.
#pragma once

#include <cstdint>

class CKyString2 {
public:
    // The longest text a string holds; longer texts are cut to it.
    static constexpr uint16_t kMaxLength = 0xFFFF;

    // A null text of length 0.
    CKyString2();
    // nLength zero bytes (cut to 0..65535), terminated.
    explicit CKyString2(int32_t nLength);
    // A copy of the text, as CopyFrom.
    CKyString2(const char* pszText);
    CKyString2(const CKyString2& other);
    // Copies the other's text, as CopyFrom.
    CKyString2& operator=(const CKyString2& other);
    virtual ~CKyString2();

    // Replaces the text with a copy of pszText, cut to 65535 bytes; a null text leaves the text
    // null. Copying the string's own text, or part of it, is safe.
    void CopyFrom(const char* pszText);
    void CopyFrom(const CKyString2& other);

    // The text (null when there is none).
    const char* GetData() const { return m_pszData; }
    char* GetData() { return m_pszData; }

    // Length of the text in bytes.
    uint16_t GetLength() const { return m_nLength; }
    // True for a null or empty text.
    bool IsEmpty() const { return m_nLength == 0; }

    // True when both are empty (a null text counts as empty), or when both texts have the same
    // bytes (case-sensitive).
    bool Equals(const char* pszText) const;
    bool Equals(const CKyString2& other) const;

    // The byte at nIndex; the caller keeps nIndex within the text.
    char operator[](int32_t nIndex) const { return m_pszData[nIndex]; }

    // Removes nCount bytes from nStart (a negative start counts as 0; a count reaching past the
    // end stops at the end). Returns the new length, or -1 when nCount < 1 or nStart is at or
    // past the end (the text stays).
    int32_t Delete(int32_t nStart, int32_t nCount);

    // A new string with up to nCount bytes from nStart (a negative start counts as 0), cut at
    // the end of the text; empty when nStart is past the end or nCount is negative.
    CKyString2 Mid(int32_t nStart, int32_t nCount) const;

    // Frees the text: null, length 0.
    void Empty();

private:
    // Takes ownership of a new[] buffer holding nLength bytes and a terminator.
    void Adopt(char* pszData, uint16_t nLength);

    // The owned text (new[]), or null.
    char* m_pszData;
    // Its length in bytes.
    uint16_t m_nLength;
};
