// Typed values in stream byte order: most significant byte first, floats and doubles as their
// IEEE bit patterns, whatever the machine's own order.
#include <cstring>

#include "kyutil/bstream.h"

namespace {

uint64_t GetBigEndian(const void* pBuffer, uint32_t nOffset, int nBytes) {
    const uint8_t* p = static_cast<const uint8_t*>(pBuffer) + nOffset;
    uint64_t value = 0;
    for (int i = 0; i < nBytes; ++i)
        value = (value << 8) | p[i];
    return value;
}

int PutBigEndian(void* pBuffer, uint32_t nOffset, uint64_t value, int nBytes) {
    uint8_t* p = static_cast<uint8_t*>(pBuffer) + nOffset;
    for (int i = nBytes - 1; i >= 0; --i) {
        p[i] = static_cast<uint8_t>(value);
        value >>= 8;
    }
    return nBytes;
}

// Reinterprets the bits of one type as another of the same size.
template <typename To, typename From>
To BitCast(From from) {
    static_assert(sizeof(To) == sizeof(From), "sizes differ");
    To to;
    std::memcpy(&to, &from, sizeof(to));
    return to;
}

// Appends a value through a small local copy in stream byte order.
template <typename T, typename Put>
CByteStream& Append(CByteStream& stream, T value, Put put) {
    uint8_t bytes[8] = {};
    stream.Write(bytes, static_cast<uint32_t>(put(bytes, 0, value)));
    return stream;
}

// Reads nBytes into a small local copy and converts them; a refused read leaves value alone.
template <typename T, typename Get>
CByteStream& Extract(CByteStream& stream, T& value, uint32_t nBytes, Get get) {
    uint8_t bytes[8] = {};
    if (stream.Read(bytes, nBytes)) value = static_cast<T>(get(bytes, 0));
    return stream;
}

}  // namespace

uint8_t CByteStream::ReadUChar(const void* pBuffer, uint32_t nOffset) {
    return static_cast<uint8_t>(GetBigEndian(pBuffer, nOffset, 1));
}

int8_t CByteStream::ReadChar(const void* pBuffer, uint32_t nOffset) {
    return static_cast<int8_t>(ReadUChar(pBuffer, nOffset));
}

uint16_t CByteStream::ReadUShort(const void* pBuffer, uint32_t nOffset) {
    return static_cast<uint16_t>(GetBigEndian(pBuffer, nOffset, 2));
}

int16_t CByteStream::ReadShort(const void* pBuffer, uint32_t nOffset) {
    return static_cast<int16_t>(ReadUShort(pBuffer, nOffset));
}

uint32_t CByteStream::ReadUInt(const void* pBuffer, uint32_t nOffset) {
    return static_cast<uint32_t>(GetBigEndian(pBuffer, nOffset, 4));
}

int32_t CByteStream::ReadInt(const void* pBuffer, uint32_t nOffset) {
    return static_cast<int32_t>(ReadUInt(pBuffer, nOffset));
}

uint32_t CByteStream::ReadULong(const void* pBuffer, uint32_t nOffset) {
    return ReadUInt(pBuffer, nOffset);
}

int32_t CByteStream::ReadLong(const void* pBuffer, uint32_t nOffset) {
    return ReadInt(pBuffer, nOffset);
}

float CByteStream::ReadFloat(const void* pBuffer, uint32_t nOffset) {
    return BitCast<float>(ReadUInt(pBuffer, nOffset));
}

double CByteStream::ReadDouble(const void* pBuffer, uint32_t nOffset) {
    return BitCast<double>(GetBigEndian(pBuffer, nOffset, 8));
}

int CByteStream::WriteUChar(void* pBuffer, uint32_t nOffset, uint8_t value) {
    return PutBigEndian(pBuffer, nOffset, value, 1);
}

int CByteStream::WriteChar(void* pBuffer, uint32_t nOffset, int8_t value) {
    return WriteUChar(pBuffer, nOffset, static_cast<uint8_t>(value));
}

int CByteStream::WriteUShort(void* pBuffer, uint32_t nOffset, uint16_t value) {
    return PutBigEndian(pBuffer, nOffset, value, 2);
}

int CByteStream::WriteShort(void* pBuffer, uint32_t nOffset, int16_t value) {
    return WriteUShort(pBuffer, nOffset, static_cast<uint16_t>(value));
}

int CByteStream::WriteUInt(void* pBuffer, uint32_t nOffset, uint32_t value) {
    return PutBigEndian(pBuffer, nOffset, value, 4);
}

int CByteStream::WriteInt(void* pBuffer, uint32_t nOffset, int32_t value) {
    return WriteUInt(pBuffer, nOffset, static_cast<uint32_t>(value));
}

int CByteStream::WriteULong(void* pBuffer, uint32_t nOffset, uint32_t value) {
    return WriteUInt(pBuffer, nOffset, value);
}

int CByteStream::WriteLong(void* pBuffer, uint32_t nOffset, int32_t value) {
    return WriteInt(pBuffer, nOffset, value);
}

int CByteStream::WriteFloat(void* pBuffer, uint32_t nOffset, float value) {
    return WriteUInt(pBuffer, nOffset, BitCast<uint32_t>(value));
}

int CByteStream::WriteDouble(void* pBuffer, uint32_t nOffset, double value) {
    return PutBigEndian(pBuffer, nOffset, BitCast<uint64_t>(value), 8);
}

CByteStream& CByteStream::operator<<(unsigned char value) {
    return Append(*this, value, WriteUChar);
}
CByteStream& CByteStream::operator<<(char value) {
    return Append(*this, static_cast<int8_t>(value), WriteChar);
}
CByteStream& CByteStream::operator<<(short value) {
    return Append(*this, value, WriteShort);
}
CByteStream& CByteStream::operator<<(unsigned short value) {
    return Append(*this, value, WriteUShort);
}
CByteStream& CByteStream::operator<<(int value) {
    return Append(*this, value, WriteInt);
}
CByteStream& CByteStream::operator<<(unsigned int value) {
    return Append(*this, value, WriteUInt);
}
CByteStream& CByteStream::operator<<(long value) {
    return Append(*this, static_cast<int32_t>(value), WriteLong);
}
CByteStream& CByteStream::operator<<(unsigned long value) {
    return Append(*this, static_cast<uint32_t>(value), WriteULong);
}
CByteStream& CByteStream::operator<<(float value) {
    return Append(*this, value, WriteFloat);
}
CByteStream& CByteStream::operator<<(double value) {
    return Append(*this, value, WriteDouble);
}

CByteStream& CByteStream::operator>>(unsigned char& value) {
    return Extract(*this, value, 1, ReadUChar);
}
CByteStream& CByteStream::operator>>(char& value) {
    return Extract(*this, value, 1, ReadChar);
}
CByteStream& CByteStream::operator>>(short& value) {
    return Extract(*this, value, 2, ReadShort);
}
CByteStream& CByteStream::operator>>(unsigned short& value) {
    return Extract(*this, value, 2, ReadUShort);
}
CByteStream& CByteStream::operator>>(int& value) {
    return Extract(*this, value, 4, ReadInt);
}
CByteStream& CByteStream::operator>>(unsigned int& value) {
    return Extract(*this, value, 4, ReadUInt);
}
CByteStream& CByteStream::operator>>(long& value) {
    return Extract(*this, value, 4, ReadLong);
}
CByteStream& CByteStream::operator>>(unsigned long& value) {
    return Extract(*this, value, 4, ReadULong);
}
CByteStream& CByteStream::operator>>(float& value) {
    return Extract(*this, value, 4, ReadFloat);
}
CByteStream& CByteStream::operator>>(double& value) {
    return Extract(*this, value, 8, ReadDouble);
}
