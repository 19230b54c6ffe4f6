// The input formatters: length limit with beeps, digits up to a largest value.
#include <gtest/gtest.h>

#include <tuple>

#include "ui/input_filters.h"

namespace {

TEST(MaxFilter, BeepsAtTheLimitAndCutsWholeCharacters) {
    int beeps = 0;
    MaxFilter filter;
    filter.setMax(1000);
    filter.setBeeper([&beeps] { ++beeps; });
    EXPECT_TRUE(filter.isPartialStringValid(QString(999, 'a')));
    EXPECT_EQ(beeps, 0);
    EXPECT_TRUE(filter.isPartialStringValid(QString(1200, 'b')));
    EXPECT_EQ(beeps, 1);

    // A character outside the basic plane is one character and is never split.
    const QString clef = QString::fromUcs4(U"\U0001D11E");
    filter.setMax(2);
    EXPECT_EQ(filter.getObjectValue("a" + clef + "b"), "a" + clef);
    filter.setMax(1);
    EXPECT_EQ(filter.getObjectValue("a" + clef), "a");
    EXPECT_EQ(filter.getObjectValue(clef + "a"), clef);
}

TEST(NumberFilter, AcceptsDigitsUpToTheLimitWithoutOverflow) {
    int beeps = 0;
    NumberFilter filter;
    filter.setMaxnumber(100);
    filter.setBeeper([&beeps] { ++beeps; });
    const std::tuple<const char*, bool> cases[] = {
        {"", true},    {"1", true},   {"100", true},
        {"0", false},  {"05", false}, {"101", false},
        {"1a", false}, {"-1", false}, {"99999999999999999999", false}};
    int rejected = 0;
    for (const auto& [text, valid] : cases) {
        EXPECT_EQ(filter.isPartialStringValid(text), valid) << text;
        rejected += valid ? 0 : 1;
    }
    EXPECT_EQ(beeps, rejected);

    // Long digit strings do not overflow, in checks or in values.
    filter.setMaxnumber(INT_MAX);
    EXPECT_TRUE(filter.isPartialStringValid("2147483647"));
    EXPECT_FALSE(filter.isPartialStringValid("2147483648"));
    EXPECT_EQ(filter.getObjectValue("42abc"), 42);
    EXPECT_EQ(filter.getObjectValue("abc"), 0);
    EXPECT_EQ(filter.getObjectValue("123456789012345678901234567890"), INT_MAX);
    EXPECT_EQ(filter.getObjectValue("-99999999999999999999"), -INT_MAX);
    EXPECT_EQ(filter.stringForObjectValue(QVariant(17)), "17");
    EXPECT_TRUE(filter.stringForObjectValue(QVariant(QString("17"))).isNull());
}

}  // namespace
