#include <gtest/gtest.h>

#include "kyutil/text_stream.h"

TEST(TextStream, KeepsTheLastByteForTheTerminatorAndWritesNumbers) {
    char buffer[12] = {};
    CTextStream text(buffer, sizeof(buffer));
    text.Advance("at");
    text.Advance(nullptr);
    // Numbers are decimal, or hexadecimal for the one after Hex().
    text << -12 << ",";
    text.Hex() << 255;
    text << "," << 255 << "more";
    EXPECT_STREQ("at-12,ff,25", buffer);
    EXPECT_EQ(11u, text.GetLength());
}
