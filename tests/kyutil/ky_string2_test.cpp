#include <gtest/gtest.h>

#include <cstring>
#include <string>

#include "kyutil/ky_string2.h"

TEST(KyString2, NullAndEmptyTextsAreEqual) {
    CKyString2 text("abc");
    text.CopyFrom(static_cast<const char*>(nullptr));
    EXPECT_EQ(nullptr, text.GetData());
    EXPECT_TRUE(text.IsEmpty());
    EXPECT_TRUE(text.Equals(static_cast<const char*>(nullptr)));
    EXPECT_TRUE(CKyString2("").Equals(text));

    const CKyString2 zeros(3);
    EXPECT_EQ(3, zeros.GetLength());
    EXPECT_EQ('\0', zeros[2]);
}

TEST(KyString2, EqualsComparesEveryByteCaseSensitively) {
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

TEST(KyString2, DeleteStaysWithinTheText) {
    struct Case {
        int32_t start;
        int32_t count;
        int32_t result;
        const char* after;
    };
    const Case cases[] = {
        {1, 2, 3, "hlo"},    {-3, 2, 3, "llo"}, {0, 0, -1, "hello"},
        {5, 1, -1, "hello"}, {3, 10, 3, "hel"}, {0, 5, 0, ""},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(::testing::Message() << c.start << "," << c.count);
        CKyString2 text("hello");
        EXPECT_EQ(c.result, text.Delete(c.start, c.count));
        EXPECT_STREQ(c.after, text.GetData());
        EXPECT_EQ(std::strlen(c.after), text.GetLength());
    }
}

TEST(KyString2, MidCutsAtTheEndOfTheText) {
    struct Case {
        int32_t start;
        int32_t count;
        const char* part;
    };
    const Case cases[] = {
        {1, 3, "ell"}, {-2, 2, "he"}, {3, 10, "lo"}, {5, 2, ""}, {6, 2, ""}, {1, -1, ""},
    };
    const CKyString2 text("hello");
    for (const Case& c : cases) {
        SCOPED_TRACE(::testing::Message() << c.start << "," << c.count);
        const CKyString2 part = text.Mid(c.start, c.count);
        EXPECT_STREQ(c.part, part.GetData());
        EXPECT_EQ(std::strlen(c.part), part.GetLength());
    }
}
