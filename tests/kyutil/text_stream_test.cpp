#include <gtest/gtest.h>

#include "kyutil/text_stream.h"

TEST(TextStream, KeepsTheLastByteForTheTerminator) {
    char buffer[8] = {};
    CTextStream text(buffer, sizeof(buffer));
    text.Advance("Assert");
    text.Advance(nullptr);
    text.Advance(" at file");
    EXPECT_STREQ("Assert ", buffer);
    EXPECT_EQ(7u, text.GetLength());
    text << "more" << 5;
    EXPECT_STREQ("Assert ", buffer);
}

TEST(TextStream, NumbersAreDecimalOrOnceHexadecimal) {
    char buffer[32] = {};
    CTextStream text(buffer, sizeof(buffer));
    text << -12 << "," << 0;
    text.Hex() << 255;
    text << "," << 255;
    EXPECT_STREQ("-12,0ff,255", buffer);
}
