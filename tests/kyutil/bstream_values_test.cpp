// Byte order of every value type, through the stream operators and the static functions.
#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

#include "kyutil/bstream.h"

namespace {

using Bytes = std::vector<uint8_t>;

template <typename T>
void ExpectStreamForm(T value, const Bytes& expected) {
    SCOPED_TRACE(::testing::Message() << "value " << +value);
    uint8_t buffer[16] = {};
    CByteStream out(buffer, sizeof(buffer));
    out << value;
    EXPECT_EQ(expected, Bytes(buffer, buffer + out.Tell()));

    CByteStream in(buffer, sizeof(buffer));
    T back{};
    in >> back;
    EXPECT_EQ(value, back);
    EXPECT_EQ(expected.size(), in.Tell());
}

template <typename V>
void ExpectStaticForm(V value, const Bytes& expected, int (*write)(void*, uint32_t, V),
                      V (*read)(const void*, uint32_t)) {
    SCOPED_TRACE(::testing::Message() << "value " << +value);
    Bytes buffer(16, 0xEE);
    ASSERT_EQ(static_cast<int>(expected.size()), write(buffer.data(), 3, value));
    EXPECT_EQ(expected, Bytes(buffer.begin() + 3, buffer.begin() + 3 + expected.size()));
    EXPECT_EQ(0xEE, buffer[2]);
    EXPECT_EQ(0xEE, buffer[3 + expected.size()]);
    EXPECT_EQ(value, read(buffer.data(), 3));
}

}  // namespace

TEST(ByteStreamValues, OperatorsWriteMostSignificantByteFirstAndReadBack) {
    ExpectStreamForm<unsigned char>(0xAB, {0xAB});
    ExpectStreamForm<char>(-2, {0xFE});
    ExpectStreamForm<short>(-2, {0xFF, 0xFE});
    ExpectStreamForm<unsigned short>(0x1234, {0x12, 0x34});
    ExpectStreamForm<int>(-2, {0xFF, 0xFF, 0xFF, 0xFE});
    ExpectStreamForm<unsigned int>(0xDEADBEEF, {0xDE, 0xAD, 0xBE, 0xEF});
    ExpectStreamForm<long>(-3, {0xFF, 0xFF, 0xFF, 0xFD});
    // The top bit set: an unsigned long must not take the sign of its four bytes.
    ExpectStreamForm<unsigned long>(0xFE020304, {0xFE, 0x02, 0x03, 0x04});
    ExpectStreamForm<float>(-2.5f, {0xC0, 0x20, 0x00, 0x00});
    ExpectStreamForm<double>(0.1, {0x3F, 0xB9, 0x99, 0x99, 0x99, 0x99, 0x99, 0x9A});
}

TEST(ByteStreamValues, StaticFunctionsUseTheSameOrderAtAnOffset) {
    ExpectStaticForm<uint8_t>(0x80, {0x80}, CByteStream::WriteUChar, CByteStream::ReadUChar);
    ExpectStaticForm<int8_t>(-128, {0x80}, CByteStream::WriteChar, CByteStream::ReadChar);
    ExpectStaticForm<uint16_t>(0xBEEF, {0xBE, 0xEF}, CByteStream::WriteUShort,
                               CByteStream::ReadUShort);
    ExpectStaticForm<int16_t>(-32768, {0x80, 0x00}, CByteStream::WriteShort,
                              CByteStream::ReadShort);
    ExpectStaticForm<uint32_t>(0x89ABCDEF, {0x89, 0xAB, 0xCD, 0xEF}, CByteStream::WriteUInt,
                               CByteStream::ReadUInt);
    ExpectStaticForm<int32_t>(1, {0x00, 0x00, 0x00, 0x01}, CByteStream::WriteInt,
                              CByteStream::ReadInt);
    ExpectStaticForm<uint32_t>(0xFFFFFFFF, {0xFF, 0xFF, 0xFF, 0xFF}, CByteStream::WriteULong,
                               CByteStream::ReadULong);
    ExpectStaticForm<int32_t>(-65536, {0xFF, 0xFF, 0x00, 0x00}, CByteStream::WriteLong,
                              CByteStream::ReadLong);
    ExpectStaticForm<float>(-2.5f, {0xC0, 0x20, 0x00, 0x00}, CByteStream::WriteFloat,
                            CByteStream::ReadFloat);
    ExpectStaticForm<double>(-0.5, {0xBF, 0xE0, 0x00, 0x00, 0x00, 0x00, 0x00, 0x00},
                             CByteStream::WriteDouble, CByteStream::ReadDouble);
}
