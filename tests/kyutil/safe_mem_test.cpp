#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "kyutil/safe_mem.h"
#include "tests/support/safec_guard.h"

TEST(SafeMem, MoveHandlesOverlapAndRefusesWhatDoesNotFit) {
    char text[] = "abcdef";
    EXPECT_TRUE(SafeMove(text + 1, 6, text, 4));
    EXPECT_STREQ("aabcdf", text);
    EXPECT_TRUE(SafeMove(text, 7, text + 2, 3));
    EXPECT_STREQ("bcdcdf", text);

    ExpectSafecViolation expected;
    char small[4] = {'w', 'x', 'y', 'z'};
    EXPECT_FALSE(SafeMove(small, sizeof(small), "123456", 6));
    EXPECT_FALSE(SafeMove(small, sizeof(small), nullptr, 2));
    EXPECT_EQ(2, expected.Count());
}

TEST(SafeMem, CopyTextCutsAndTerminatesAtAnySize) {
    char small[4] = {'w', 'x', 'y', 'z'};
    EXPECT_EQ(3u, SafeCopyText(small, sizeof(small), "hello"));
    EXPECT_STREQ("hel", small);
    EXPECT_EQ(0u, SafeCopyText(small, sizeof(small), nullptr));
    EXPECT_STREQ("", small);

    const std::string longText(40000, 'q');
    std::vector<char> large(50000, 'z');
    EXPECT_EQ(longText.size(), SafeCopyText(large.data(), large.size(), longText.c_str()));
    EXPECT_EQ(longText, std::string(large.data()));
}

TEST(SafeMem, ComparisonsNeverMistakeARefusalForEquality) {
    EXPECT_TRUE(SafeBytesEqual("abc", "abc", 3));
    EXPECT_FALSE(SafeBytesEqual("abc", "abd", 3));
    int order = 0;
    EXPECT_TRUE(SafeCompareText("abc", "ABD", 16, true, &order));
    EXPECT_LT(order, 0);
    EXPECT_TRUE(SafeCompareText("abc", "ABD", 16, false, &order));
    EXPECT_GT(order, 0);

    ExpectSafecViolation expected;
    EXPECT_FALSE(SafeBytesEqual("abc", nullptr, 3));
    order = 42;
    EXPECT_FALSE(SafeCompareText("abc", "abc", 40000, false, &order));
    EXPECT_EQ(42, order);
    EXPECT_EQ(2, expected.Count());
}
