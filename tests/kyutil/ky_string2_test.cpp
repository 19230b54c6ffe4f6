#include <gtest/gtest.h>

#include <cstring>
#include <string>
#include <tuple>

#include "kyutil/ky_string2.h"

TEST(KyString2, NullAndEmptyTextsAreEqualAndOtherwiseEveryByteCounts) {
    const std::tuple<const char*, const char*, bool> cases[] = {
        {"abc", "abc", true},  {"abc", "abd", false},   {"abc", "ab", false},
        {"abc", "ABC", false}, {"abc", nullptr, false}, {nullptr, "", true},
    };
    for (const auto& [a, b, equal] : cases) {
        SCOPED_TRACE(std::string(a ? a : "(null)") + " / " + (b ? b : "(null)"));
        EXPECT_EQ(equal, CKyString2(a).Equals(b));
        EXPECT_EQ(equal, CKyString2(a).Equals(CKyString2(b)));
    }
    CKyString2 text("abc");
    text.CopyFrom(static_cast<const char*>(nullptr));
    EXPECT_EQ(nullptr, text.GetData());
    EXPECT_TRUE(text.IsEmpty());
    EXPECT_TRUE(text.Equals(static_cast<const char*>(nullptr)));
}

TEST(KyString2, CopiesAreCutTo65535BytesAndMayTakeTheirOwnText) {
    std::string longText(70000, 'x');
    longText[65534] = 'y';
    CKyString2 text(longText.c_str());
    ASSERT_EQ(65535, text.GetLength());
    EXPECT_EQ(65535u, std::strlen(text.GetData()));
    EXPECT_TRUE(text.Equals(longText.substr(0, 65535).c_str()));
    EXPECT_FALSE(text.Equals(longText.c_str()));
    EXPECT_TRUE(text.Equals(CKyString2(text)));

    // Copying its own text, or a part of it, is safe.
    text.CopyFrom("hello");
    text.CopyFrom(text.GetData());
    EXPECT_STREQ("hello", text.GetData());
    text.CopyFrom(text);
    EXPECT_STREQ("hello", text.GetData());
    text.CopyFrom(text.GetData() + 2);
    EXPECT_STREQ("llo", text.GetData());
    EXPECT_EQ(3, text.GetLength());

    CKyString2 other("x");
    other = text;
    text.CopyFrom("changed");
    EXPECT_STREQ("llo", other.GetData());
}

TEST(KyString2, DeleteAndMidStayWithinTheText) {
    // Each start and count: Delete's answer and what it leaves of "hello", and Mid's part.
    const std::tuple<int32_t, int32_t, int32_t, const char*, const char*> cases[] = {
        {1, 2, 3, "hlo", "el"},  {-3, 2, 3, "llo", "he"},  {0, 0, -1, "hello", ""},
        {5, 1, -1, "hello", ""}, {3, 10, 3, "hel", "lo"},  {0, 5, 0, "", "hello"},
        {6, 2, -1, "hello", ""}, {1, -1, -1, "hello", ""},
    };
    for (const auto& [start, count, result, left, part] : cases) {
        SCOPED_TRACE(::testing::Message() << start << "," << count);
        CKyString2 text("hello");
        const CKyString2 mid = text.Mid(start, count);
        EXPECT_STREQ(part, mid.GetData());
        EXPECT_EQ(std::strlen(part), mid.GetLength());
        EXPECT_EQ(result, text.Delete(start, count));
        EXPECT_STREQ(left, text.GetData());
        EXPECT_EQ(std::strlen(left), text.GetLength());
    }
}
