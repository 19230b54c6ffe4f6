#include <gtest/gtest.h>

#include "kyutil/text_stream.h"

TEST(TextStream, KeepsTheLastByteForTheTerminatorAndWritesNumbers) {
    char buffer[8] = {};
    CTextStream text(buffer, sizeof(buffer));
    text.Advance("Assert");
    text.Advance(nullptr);
    text.Advance(" at file");
    EXPECT_STREQ("Assert ", buffer);
    EXPECT_EQ(7u, text.GetLength());
    text << "more" << 5;
    EXPECT_STREQ("Assert ", buffer);

    // Numbers are decimal, or hexadecimal for the one after Hex().
    char numbers[32] = {};
    CTextStream out(numbers, sizeof(numbers));
    out << -12 << "," << 0;
    out.Hex() << 255;
    out << "," << 255;
    EXPECT_STREQ("-12,0ff,255", numbers);
}
