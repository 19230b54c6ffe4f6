#include <gtest/gtest.h>

#include <string>

#include "platform/string_table.h"
#include "tests/support/german_host.h"

namespace {

TEST_F(GermanHost, KeysComeBackTranslatedInUtf8OrElseUnchanged) {
    const std::string key = "Select an Attendee...", german = "Teilnehmer ausw\xC3\xA4hlen...";
    EXPECT_EQ(GetLocalizedString(key, kChatBundleId), german);
    EXPECT_EQ(GetLocalizedString(key), german);
    EXPECT_EQ(GetLocalizedString(key, nullptr, "Localizable"), german);
    // No translation, another table, a bundle without a table: the key itself.
    for (const char* other : {"Save Chat As", "", "%s %d %@"})
        EXPECT_EQ(GetLocalizedString(other, kChatBundleId), other);
    EXPECT_EQ(GetLocalizedString(std::string("Save\0Chat", 9)), std::string("Save\0Chat", 9));
    EXPECT_EQ(GetLocalizedString(key, kChatBundleId, "Other"), key);
    EXPECT_EQ(GetLocalizedString(key, "com.korvo.nocatalogue"), key);
}

TEST(StringFormat, PlaceholdersTakeTheNamesAndEverythingElseIsText) {
    const struct {
        const char* format;
        const char* expected;
    } cases[] = {
        {"from %@ to %@ (privately)", "from Ana to %@ Bo (privately)"},
        {"from %@ to Everyone", "from Ana to Everyone"},
        {"%s and %d and 100% stay: %@", "%s and %d and 100% stay: Ana"},
        {"%2$@ <- %1$@", "%@ Bo <- Ana"},
        {"%@ %@ %@", "Ana %@ Bo %@"},  // no third name: the placeholder stays
        {"%3$@ %0$@ %1$ %", "%3$@ %0$@ %1$ %"},
        {"", ""},
    };
    for (const auto& c : cases) {
        std::string out = "previous";
        FormatStringWith2Parameters(c.format, "Ana", "%@ Bo", out);  // names are never formats
        EXPECT_EQ(out, c.expected) << c.format;
    }

    std::string out = "from %@ to %@";
    FormatStringWithParameter(out, "Ana", out);  // the output may be the format
    EXPECT_EQ(out, "from Ana to %@");
    FormatStringWithParameter("%1$@/%2$@", "Ana", out);
    EXPECT_EQ(out, "Ana/%2$@");
}

}  // namespace
