#include <gtest/gtest.h>

#include <string>

#include "platform/string_table.h"
#include "tests/support/german_host.h"

namespace {

TEST_F(GermanHost, KeysWithATranslationComeBackTranslatedInUtf8) {
    EXPECT_EQ(GetLocalizedString("Select an Attendee...", kChatBundleId),
              "Teilnehmer ausw\xC3\xA4hlen...");
    EXPECT_EQ(GetLocalizedString("Select an Attendee..."), "Teilnehmer ausw\xC3\xA4hlen...");
    EXPECT_EQ(GetLocalizedString("Select an Attendee...", nullptr, "Localizable"),
              "Teilnehmer ausw\xC3\xA4hlen...");

    std::string title;
    FormatStringWith2Parameters(GetLocalizedString("from %@ to %@ (privately)", kChatBundleId),
                                "Ana", "Bo", title);
    EXPECT_EQ(title, "von Ana an Bo (privat)");
}

TEST_F(GermanHost, KeysWithoutATranslationComeBackUnchanged) {
    for (const char* key : {"Save Chat As", "", "%s %d %@"})
        EXPECT_EQ(GetLocalizedString(key, kChatBundleId), key);
    EXPECT_EQ(GetLocalizedString(std::string("Save\0Chat", 9)), std::string("Save\0Chat", 9));
    EXPECT_EQ(GetLocalizedString("Select an Attendee...", kChatBundleId, "Other"),
              "Select an Attendee...");
    EXPECT_EQ(GetLocalizedString("Select an Attendee...", "com.korvo.nocatalogue"),
              "Select an Attendee...");
}

struct FormatCase {
    const char* format;
    const char* expected;
};

TEST(StringFormat, PlaceholdersTakeTheNamesAndEverythingElseIsText) {
    const FormatCase cases[] = {
        {"from %@ to %@ (privately)", "from Ana to %@ Bo (privately)"},
        {"from %@ to Everyone", "from Ana to Everyone"},
        {"%s and %d and 100% stay: %@", "%s and %d and 100% stay: Ana"},
        {"%2$@ <- %1$@", "%@ Bo <- Ana"},
        {"%@ %@ %@", "Ana %@ Bo %@"},  // no third name: the placeholder stays
        {"%3$@ %0$@ %1$ %", "%3$@ %0$@ %1$ %"},
        {"", ""},
    };
    for (const FormatCase& c : cases) {
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
