#include <gtest/gtest.h>

#include <cstring>
#include <string>

#include "kyutil/ky_string2.h"

TEST(KyString2, NullAndEmptyTextsAreEqualAndOtherwiseEveryByteCounts) {
    struct Case {
        const char* a;
        const char* b;
        bool equal;
    };
    const Case cases[] = {
        {"abc", "abc", true},  {"abc", "abd", false},   {"abc", "ab", false},
        {"abc", "ABC", false}, {"abc", nullptr, false}, {nullptr, "", true},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(c.a ? c.a : "(null)") + " / " + (c.b ? c.b : "(null)"));
        const CKyString2 a(c.a);
        EXPECT_EQ(c.equal, a.Equals(c.b));
        EXPECT_EQ(c.equal, a.Equals(CKyString2(c.b)));
    }
    CKyString2 text("abc");
    text.CopyFrom(static_cast<const char*>(nullptr));
    EXPECT_EQ(nullptr, text.GetData());
    EXPECT_TRUE(text.IsEmpty());
    EXPECT_TRUE(text.Equals(static_cast<const char*>(nullptr)));
}

TEST(KyString2, LongTextsAreCutTo65535Bytes) {
    std::string longText(70000, 'x');
    longText[65534] = 'y';
    const CKyString2 text(longText.c_str());
    ASSERT_EQ(65535, text.GetLength());
    EXPECT_EQ(65535u, std::strlen(text.GetData()));
    EXPECT_EQ('y', text[65534]);
    EXPECT_TRUE(text.Equals(longText.substr(0, 65535).c_str()));
    EXPECT_FALSE(text.Equals(longText.c_str()));
    EXPECT_TRUE(text.Equals(CKyString2(text)));
}

TEST(KyString2, CopyingItsOwnTextIsSafe) {
    CKyString2 text("hello");
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
    struct Case {
        bool mid;
        int32_t start;
        int32_t count;
        const char* text;  // what Delete leaves of "hello", or the part Mid takes
        int32_t result;    // Delete's answer
    };
    const Case cases[] = {
        {false, 1, 2, "hlo", 3},    {false, -3, 2, "llo", 3}, {false, 0, 0, "hello", -1},
        {false, 5, 1, "hello", -1}, {false, 3, 10, "hel", 3}, {false, 0, 5, "", 0},
        {true, 1, 3, "ell", 0},     {true, -2, 2, "he", 0},   {true, 3, 10, "lo", 0},
        {true, 5, 2, "", 0},        {true, 6, 2, "", 0},      {true, 1, -1, "", 0},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(::testing::Message() << c.mid << ": " << c.start << "," << c.count);
        CKyString2 text("hello");
        if (!c.mid) {
            EXPECT_EQ(c.result, text.Delete(c.start, c.count));
        }
        const CKyString2 seen = c.mid ? text.Mid(c.start, c.count) : text;
        EXPECT_STREQ(c.text, seen.GetData());
        EXPECT_EQ(std::strlen(c.text), seen.GetLength());
    }
}
