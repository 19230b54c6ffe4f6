// The byte stream: byte order of every value, strings, measuring, bounds, growth, memory blocks
// and its assertions.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstdlib>
#include <memory>
#include <vector>

#include "kyutil/bstream.h"
#include "tests/kyutil/debug_output_capture.h"

namespace {

using Bytes = std::vector<uint8_t>;

// A string read from a stream, freed when it goes.
using ReadText = std::unique_ptr<char, decltype(&std::free)>;
ReadText TakeString(CByteStream& stream) {
    return ReadText(stream.ReadString(), &std::free);
}

Bytes Contents(const CByteStream& stream) {
    const uint8_t* p = stream.GetData();
    return p ? Bytes(p, p + stream.GetLength()) : Bytes();
}

// A stream whose allocations fail.
class StarvedStream : public CByteStream {
public:
    using CByteStream::CByteStream;
    void* Alloc(uint32_t) override { return nullptr; }
};

using S = CByteStream;

// The value through the stream operators, and through the static functions at an offset of a
// plain buffer (touching nothing around it): the same bytes, read back the same.
template <typename T, typename V>
void ExpectForm(T value, const Bytes& expected, int (*write)(void*, uint32_t, V),
                V (*read)(const void*, uint32_t)) {
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

    Bytes plain(16, 0xEE);
    ASSERT_EQ(static_cast<int>(expected.size()), write(plain.data(), 3, value));
    EXPECT_EQ(expected, Bytes(plain.begin() + 3, plain.begin() + 3 + expected.size()));
    EXPECT_EQ(0xEE, plain[2]);
    EXPECT_EQ(0xEE, plain[3 + expected.size()]);
    EXPECT_EQ(value, read(plain.data(), 3));
}

}  // namespace

TEST(ByteStreamValues, MostSignificantByteFirstInStreamsAndAtOffsets) {
    ExpectForm<unsigned char>(0xAB, {0xAB}, S::WriteUChar, S::ReadUChar);
    ExpectForm<char>(-2, {0xFE}, S::WriteChar, S::ReadChar);
    ExpectForm<short>(-2, {0xFF, 0xFE}, S::WriteShort, S::ReadShort);
    ExpectForm<unsigned short>(0xBEEF, {0xBE, 0xEF}, S::WriteUShort, S::ReadUShort);
    ExpectForm<int>(-2, {0xFF, 0xFF, 0xFF, 0xFE}, S::WriteInt, S::ReadInt);
    ExpectForm<unsigned int>(0xDEADBEEF, {0xDE, 0xAD, 0xBE, 0xEF}, S::WriteUInt, S::ReadUInt);
    ExpectForm<long>(-3, {0xFF, 0xFF, 0xFF, 0xFD}, S::WriteLong, S::ReadLong);
    // The top bit set: an unsigned long must not take the sign of its four bytes.
    ExpectForm<unsigned long>(0xFE020304, {0xFE, 0x02, 0x03, 0x04}, S::WriteULong, S::ReadULong);
    ExpectForm<float>(-2.5f, {0xC0, 0x20, 0x00, 0x00}, S::WriteFloat, S::ReadFloat);
    ExpectForm<double>(0.1, {0x3F, 0xB9, 0x99, 0x99, 0x99, 0x99, 0x99, 0x9A}, S::WriteDouble,
                       S::ReadDouble);
}

TEST(ByteStream, StringFormCountsTheTerminatorAndRefusedStringsKeepThePosition) {
    uint8_t buffer[32] = {};
    CByteStream out(buffer, sizeof(buffer));
    out.WriteString("");
    out.WriteString(nullptr);
    out.WriteString("ab");
    EXPECT_EQ((Bytes{0, 0, 0, 1, 0, 0, 0, 0, 0, 0, 0, 0, 3, 'a', 'b', 0}), Contents(out));

    CByteStream in(buffer, out.GetLength());
    EXPECT_STREQ("", TakeString(in).get());
    EXPECT_EQ(nullptr, TakeString(in).get());
    EXPECT_EQ(9u, in.Tell());
    EXPECT_STREQ("ab", TakeString(in).get());
    EXPECT_FALSE(in.Failed());

    // Refused strings keep the position.
    const Bytes cases[] = {
        {0, 0, 0},                  // the count itself is cut off
        {0, 0, 0, 9, 'a', 'b', 0},  // the count passes the end
        {0, 0, 0, 2, 'a', 'b', 0},  // the last counted byte is not the terminator
    };
    for (Bytes data : cases) {
        SCOPED_TRACE(data.size());
        CByteStream refused(data.data(), static_cast<uint32_t>(data.size()));
        EXPECT_EQ(nullptr, TakeString(refused).get());
        EXPECT_EQ(0u, refused.Tell());
        EXPECT_TRUE(refused.Failed());
    }
}

TEST(ByteStream, BoundedStreamRefusesWhatDoesNotFitAndKeepsItsPosition) {
    uint8_t buffer[6] = {0, 0, 0, 0, 0xAA, 0xBB};
    CByteStream stream(buffer, sizeof(buffer));
    stream << 1 << 2;
    EXPECT_EQ((Bytes{0, 0, 0, 1, 0xAA, 0xBB}), Bytes(buffer, buffer + 6));
    EXPECT_TRUE(stream.Failed());
    int value = 7;
    stream >> value;
    uint8_t out[4] = {};
    EXPECT_FALSE(stream.Read(out, 3));
    EXPECT_EQ(7, value);
    EXPECT_EQ(Bytes(4, 0), Bytes(out, out + 4));
    EXPECT_EQ(4u, stream.Tell());
    EXPECT_EQ(2u, stream.Available());
    // Past the end nothing is available, not a wrapped-around huge number.
    EXPECT_EQ(4u, stream.Seek(8));
    EXPECT_EQ(0u, stream.Available());
}

TEST(ByteStream, GrowsInWholeIncrementsAndKeepsItsData) {
    CByteStream out(100u);
    const Bytes first(130, 0xA5), second(100, 0x5A);
    ASSERT_TRUE(out.Write(first.data(), 130));
    EXPECT_EQ(200u, out.GetCapacity());
    ASSERT_TRUE(out.Write(second.data(), 100));
    EXPECT_EQ(300u, out.GetCapacity());
    Bytes expected = first;
    expected.insert(expected.end(), second.begin(), second.end());
    EXPECT_EQ(expected, Contents(out));
}

TEST(ByteStream, WithoutStorageOnlyMeasuresAndPositionsPastFourGibibytesDoNotFit) {
    CByteStream measure(static_cast<void*>(nullptr));
    measure << 1;
    measure.WriteString("ab");
    EXPECT_EQ(11u, measure.Tell());
    EXPECT_EQ(11u, measure.GetLength());
    EXPECT_EQ(nullptr, measure.GetData());
    EXPECT_FALSE(measure.Failed());
    measure.Seek(UINT32_MAX - 1);
    measure << 1;
    EXPECT_EQ(UINT32_MAX - 1, measure.Tell());
    EXPECT_TRUE(measure.Failed());
    EXPECT_EQ(0u, measure.Skip(4));
    EXPECT_EQ(1u, measure.Skip(1));

    // Without a size nothing is bounded, short of the four gibibytes.
    uint8_t buffer[8] = {};
    CByteStream unbounded(buffer);
    unbounded << 0x01020304;
    EXPECT_EQ(0x01020304, CByteStream::ReadInt(buffer, 0));
    unbounded.Seek(UINT32_MAX - 1);
    int value = 5;
    unbounded >> value;  // would read far outside the buffer if the position wrapped
    EXPECT_EQ(5, value);
    EXPECT_EQ(UINT32_MAX - 1, unbounded.Tell());

    CByteStream growable(16u);
    growable.Seek(UINT32_MAX - 1);
    EXPECT_FALSE(growable.Write(buffer, 4));
    EXPECT_EQ(nullptr, growable.GetData());
}

// Block-backed streams are bounded like buffers (the same size check); what they add is the lock.
TEST(ByteStream, UnlockAnswersWhileThereIsAMemoryBlock) {
    KyHandle* hBlock = NewHandle(8);
    ASSERT_NE(nullptr, hBlock);
    {
        CByteStream stream(hBlock, CByteStream::Ownership::kBorrowed);
        EXPECT_EQ(1, stream.Lock());
        EXPECT_EQ(1, hBlock->nLockCount);
        EXPECT_EQ(1, stream.Unlock());
        // A surplus unlock still answers that there is a block, and leaves it unlocked.
        EXPECT_EQ(1, stream.Unlock());
        EXPECT_EQ(0, hBlock->nLockCount);
    }
    // The stream did not own the block: disposing of it here is its only disposal.
    DisposeHandle(hBlock);

    CByteStream plain(4u);
    EXPECT_EQ(0, plain.Lock());
    EXPECT_EQ(0, plain.Unlock());
}

TEST(ByteStreamAssert, ChecksReportTheirLineAndNullDataIsNeverCopied) {
    uint8_t buffer[8] = {1, 2, 3, 4, 5, 6, 7, 8};
    DebugOutputCapture capture;
    CByteStream noIncrement(0u);
    CByteStream nullBuffer(nullptr, 4);
    CByteStream stream(buffer, sizeof(buffer));
    EXPECT_FALSE(stream.Write(nullptr, 4));
    EXPECT_FALSE(stream.Read(nullptr, 4));
    EXPECT_EQ(0u, stream.Tell());
    EXPECT_FALSE(CByteStream::Memcpy(nullptr, buffer, 4));
    EXPECT_FALSE(CByteStream::Memcpy(buffer, nullptr, 4));
    EXPECT_FALSE(CByteStream::Memcpy(nullptr, nullptr, 4));
    std::vector<std::string> expected;
    for (int line : {12, 26, 267, 311, 164, 165, 164, 165})
        expected.push_back(StreamAssertText(line));
    EXPECT_EQ(expected, capture.Texts());
    EXPECT_EQ((Bytes{1, 2, 3, 4, 5, 6, 7, 8}), Bytes(buffer, buffer + 8));
}

TEST(ByteStreamAssert, WithoutMemoryAStringIsSkippedAndAWriteDropped) {
    uint8_t buffer[] = {0, 0, 0, 3, 'a', 'b', 0, 0, 0, 0, 5};
    StarvedStream in(buffer, sizeof(buffer));
    DebugOutputCapture capture;
    EXPECT_EQ(nullptr, in.ReadString());
    EXPECT_EQ(std::vector<std::string>{StreamAssertText(668)}, capture.Texts());
    int next = 0;
    in >> next;
    EXPECT_EQ(5, next);

    // Growth that cannot allocate drops the write.
    StarvedStream out(16u);
    out << 1;
    EXPECT_EQ(0u, out.Tell());
    EXPECT_TRUE(out.Failed());
    EXPECT_EQ((std::vector<std::string>{StreamAssertText(668), StreamAssertText(199)}),
              capture.Texts());
}
