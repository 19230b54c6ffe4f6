// How messages split into text and link runs.
#include <gtest/gtest.h>

#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include "ui/chat_unit.h"

namespace {

// A run's text and whether it is a URL.
using UnitRun = std::pair<std::string, bool>;

std::vector<UnitRun> Runs(const char* message) {
    std::vector<UnitRun> runs;
    for (const CChatUnit& unit : CChatUnit::GetChatUnitListFromString(message))
        runs.emplace_back(unit.GetContent(), unit.IsText() == 0);
    return runs;
}

TEST(ChatUnit, WordsThatAreUrls) {
    const std::tuple<const char*, bool> cases[] = {
        {"www.example.com", true},       {"WWW.Example.COM/Path", true},
        {"https://a.b", true},           {"http://a.b", true},
        {"ftp://files.example", true},   {"ftp://nodot", false},
        {"mailto:me@example.org", true}, {"mailto:me@localhost", false},
        {"telnet:host.example", true},   {"file://x.txt", true},
        {"www.example.com.", false},     {".www.example.com", false},
        {"www.example.\r", false},       {"example.com", false},
        {"xwww.example.com", false},     {"", false},
    };
    for (const auto& [word, url] : cases)
        EXPECT_EQ(CChatUnit::IsUrl(word), url) << word;
    EXPECT_FALSE(CChatUnit::IsUrl(nullptr));
}

TEST(ChatUnit, SplitsIntoAlternatingRuns) {
    EXPECT_EQ(Runs("go www.a.com now"),
              (std::vector<UnitRun>{
                  {"go", false}, {" ", false}, {"www.a.com", true}, {" ", false}, {"now", false}}));
    // Leading and doubled blanks form one run each; a trailing full stop keeps a word plain.
    EXPECT_EQ(Runs("  see  www.a.com."),
              (std::vector<UnitRun>{
                  {"  ", false}, {"see", false}, {"  ", false}, {"www.a.com.", false}}));
    // Bytes of multi-byte characters belong to words.
    EXPECT_EQ(Runs("h\xC3\xA9 www.a.com\r"),
              (std::vector<UnitRun>{
                  {"h\xC3\xA9", false}, {" ", false}, {"www.a.com", true}, {"\r", false}}));
    // A scheme prefix counts after any blank.
    EXPECT_EQ(Runs("a\r\nhttp://x.y").back(), (UnitRun{"http://x.y", true}));
    EXPECT_EQ(Runs("a\tmailto:x@y.z").back(), (UnitRun{"mailto:x@y.z", true}));
    // Without URL-like content (a dot but no prefix, a prefix but no dot) the message is one
    // run, whatever it holds.
    EXPECT_EQ(Runs("a b.c  d"), (std::vector<UnitRun>{{"a b.c  d", false}}));
    EXPECT_EQ(Runs("see http://x now"), (std::vector<UnitRun>{{"see http://x now", false}}));
    EXPECT_TRUE(Runs(nullptr).empty());
    EXPECT_FALSE(CChatUnit::IsHaveUrlContent(nullptr));
}

TEST(ChatUnit, CopiesOwnTheirText) {
    CChatUnit unit;
    unit.SetContent("abc");
    unit.SetIsText(0);
    CChatUnit copy(unit);
    unit.SetContent("xyz");
    unit.SetContent(nullptr);  // changes nothing
    EXPECT_STREQ(copy.GetContent(), "abc");
    EXPECT_EQ(copy.IsText(), 0);
    copy = unit;
    EXPECT_STREQ(copy.GetContent(), "xyz");
    EXPECT_NE(copy.GetContent(), unit.GetContent());
}

}  // namespace
