// The bounded-copy helpers: cut texts stay terminated, and a refusal is reported and never
// passes for success or equality. Overlapping moves are exercised by the vector's inserts and
// removals and by a string copying its own text.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "kyutil/safe_mem.h"
#include "tests/support/safec_guard.h"

TEST(SafeMem, TextIsCutAndTerminatedAndRefusalsAreNeverMistakenForSuccess) {
    char small[4] = {'w', 'x', 'y', 'z'};
    EXPECT_EQ(3u, SafeCopyText(small, sizeof(small), "hello"));
    EXPECT_STREQ("hel", small);
    EXPECT_EQ(0u, SafeCopyText(small, sizeof(small), nullptr));
    EXPECT_STREQ("", small);
    const std::string longText(40000, 'q');
    std::vector<char> large(50000, 'z');
    EXPECT_EQ(longText.size(), SafeCopyText(large.data(), large.size(), longText.c_str()));
    EXPECT_EQ(longText, std::string(large.data()));
    EXPECT_TRUE(SafeBytesEqual("abc", "abc", 3));
    EXPECT_FALSE(SafeBytesEqual("abc", "abd", 3));

    ExpectSafecViolation expected;
    EXPECT_FALSE(SafeMove(small, sizeof(small), "123456", 6));
    EXPECT_FALSE(SafeMove(small, sizeof(small), nullptr, 2));
    EXPECT_FALSE(SafeBytesEqual("abc", nullptr, 3));
    EXPECT_EQ(3, expected.Count());
}
