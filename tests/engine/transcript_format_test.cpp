#include "engine/transcript_format.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace {

DateTimeRec At(int year, int month, int day, int hour, int minute, int second) {
    auto u = [](int v) { return static_cast<std::uint16_t>(v); };
    return DateTimeRec{u(year), u(month), u(day), u(hour), u(minute), u(second), 1};
}

const std::string kBom = "\xEF\xBB\xBF";

// What parsing a file gives: its entries' lines and the texts shown, each marked T: (title,
// 2201) or M: (message text, 2200).
struct Parsed {
    bool ok;
    std::vector<std::string> lines;
    std::vector<std::string> shown;
    std::size_t times;
};

// Parses a heap copy of bytes with only the spare byte after it, so reading further is
// reading past the allocation.
Parsed Parse(const std::string& bytes) {
    std::unique_ptr<char[]> copy(new char[bytes.size() + 1]);
    bytes.copy(copy.get(), bytes.size());
    Parsed parsed{};
    ContentBlock content;
    parsed.ok = ParseTranscript(
        std::move(copy), bytes.size(), &content, [&parsed](bool bTitle, std::string_view text) {
            EXPECT_EQ(text.data()[text.size()], '\0');
            parsed.shown.push_back((bTitle ? "T:" : "M:") + std::string(text));
        });
    parsed.lines.assign(content.lines.begin(), content.lines.end());
    parsed.times = content.times.size();
    return parsed;
}

const std::string kFirst = "03/05/2009    09:03:07 AM    ";
const std::string kSecond = "12/31/2010    14:05:09 PM    ";

TEST(TranscriptFormat, FileIsMarkThenPrefixLineAndLfPerTime) {
    CChatContentStorage content;
    const DateTimeRec times[] = {At(2009, 3, 5, 9, 3, 7), At(2009, 3, 5, 0, 15, 0),
                                 At(2009, 3, 5, 12, 0, 0), At(987, 12, 31, 14, 5, 9)};
    for (const DateTimeRec& time : times) {
        content.InsertTime(time);
        content.InsertNewLine("from Ann:\r");
        content.ModifyLatestLineByAdd("hi");
    }
    content.InsertTime(At(2010, 1, 2, 3, 4, 5));  // a time whose line never came
    EXPECT_EQ(FormatTranscript(content),
              "\xEF\xBB\xBF"
              "03/05/2009    09:03:07 AM    from Ann:\r\thi\n"
              "03/05/2009    00:15:00 AM    from Ann:\r\thi\n"
              "03/05/2009    12:00:00 PM    from Ann:\r\thi\n"
              "12/31/0987    14:05:09 PM    from Ann:\r\thi\n"
              "01/02/2010    03:04:05 AM    \n");
}

TEST(TranscriptFormat, WritingComesInBoundedChunksAndStopsWhenRefused) {
    // A line longer than a chunk between two short ones, and enough short ones to fill
    // more chunks.
    CChatContentStorage content;
    std::string expected = kBom;
    const std::string big(kTranscriptChunkBytes + 10, 'b');
    const std::string bigLine = "from Ann:\r\t" + big;
    for (int i = 0; i < 40000; ++i) {
        content.InsertTime(At(2009, 3, 5, 9, 3, 7));
        content.InsertNewLine("from Ann:\r");
        content.ModifyLatestLineByAdd(i == 3 ? big : std::to_string(i));
        expected += "03/05/2009    09:03:07 AM    from Ann:\r\t" +
                    (i == 3 ? big : std::to_string(i)) + "\n";
    }
    std::string written;
    int calls = 0;
    EXPECT_TRUE(WriteTranscript(content, [&](const char* data, std::size_t size) {
        EXPECT_TRUE(size <= kTranscriptChunkBytes || std::string_view(data, size) == bigLine);
        written.append(data, size);
        ++calls;
        return true;
    }));
    EXPECT_EQ(written, expected);

    // Refused at the second chunk: nothing more is asked for.
    int refusedAt = 0;
    EXPECT_FALSE(WriteTranscript(
        content, [&refusedAt](const char*, std::size_t) { return ++refusedAt < 2; }));
    EXPECT_EQ(refusedAt, 2);
    EXPECT_GE(calls, 5);
}

TEST(TranscriptFormat, PrefixChecksDateMinuteAndSecondButNotTheHour) {
    const std::pair<const char*, bool> cases[] = {
        {"12/31/0001    99:59:59 PM    ", true},  // the hour is not examined
        {"03-05-2009xxxx09x03x07xxxxxxx", true},  // nor separators and letters
        {"13/05/2009    09:03:07 AM    ", false}, {"00/05/2009    09:03:07 AM    ", false},
        {"03/32/2009    09:03:07 AM    ", false}, {"03/05/0000    09:03:07 AM    ", false},
        {"03/05/2009    09:60:07 AM    ", false}, {"03/05/2009    09:03:60 AM    ", false},
        {"0a/05/2009    09:03:07 AM    ", false}, {"03/05/2009    09:03:07 AM   ", false},
    };
    for (const auto& c : cases) {
        DateTimeRec time{};
        const std::string text = c.first;
        EXPECT_EQ(ParseTimePrefix(text.data(), text.size(), &time), c.second) << text;
    }
}

TEST(TranscriptFormat, ParsingKeepsEntriesWholeCaseByCase) {
    struct Case {
        const char* name;
        std::string bytes;
        std::vector<std::string> lines;  // none: the file fails to open
        std::vector<std::string> shown;  // T: title (2201), M: text (2200)
    };
    const std::string month13 = "13" + kFirst.substr(2);
    const Case cases[] = {
        {"leading LFs", kBom + "\n\n" + kFirst + "A\tx\n", {"A\r\tx"}, {"T:A\r", "M:x"}},
        {"UTF-16 mark", "\xFF\xFE" + kFirst + "A\r\tx", {"A\r\tx"}, {"T:A\r", "M:x"}},
        {"TAB on a later line", kFirst + "A\nB\tx\n", {"A\nB\r\tx"}, {"T:A\nB\r", "M:x"}},
        {"later invalid lines continue the entry",
         kFirst + "A\tx\n" + month13 + "B\ty\n" + kSecond + "C\tz\n03/05/20",
         {"A\r\tx" + month13 + "B\ty", "C\r\tz03/05/20"},
         {"T:A\r", "M:x", "M:" + month13 + "B\ty", "T:C\r", "M:z", "M:03/05/20"}},
        {"an empty message, then a continuation",
         kFirst + "A\r\t\n" + "more\n" + kSecond + "B\tx",
         {"A\r\tmore", "B\r\tx"},
         {"T:A\r", "M:", "M:more", "T:B\r", "M:x"}},
        {"nothing after the TAB", kFirst + "A\t", {"A\r\t"}, {"T:A\r"}},
        {"last entry without TAB dropped",
         kFirst + "A\tx\n" + kSecond + "B\n",
         {"A\r\tx"},
         {"T:A\r", "M:x"}},
        {"first line month 13", kBom + month13 + "A\tx\n", {}, {}},
        {"first line short", kBom + "03/05/2009\tx\n", {}, {}},
        {"only entry without TAB", kBom + kFirst + "A\n", {}, {}},
        {"only a mark and LFs", kBom + "\n\n", {}, {}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        const Parsed parsed = Parse(c.bytes);
        EXPECT_EQ(parsed.ok, !c.lines.empty());
        EXPECT_EQ(parsed.lines, c.lines);
        EXPECT_EQ(parsed.times, parsed.lines.size());
        EXPECT_EQ(parsed.shown, c.shown);
    }
}

TEST(TranscriptFormat, LongHeadersAreCutToTheBufferAtACharacterBoundary) {
    std::string euros = "a";
    while (euros.size() < 9000)
        euros += "\xE2\x82\xAC";
    const std::pair<std::string, std::string> cases[] = {
        {std::string(8190, 'a'), std::string(8190, 'a') + "\r"},
        {std::string(8190, 'a') + "\r", std::string(8190, 'a') + "\r"},
        {std::string(20000, 'a'), std::string(8190, 'a') + "\r"},
        {euros, euros.substr(0, 8188) + "\r"},
    };
    for (const auto& c : cases) {
        const Parsed parsed = Parse(kFirst + c.first + "\tmsg\n");
        EXPECT_EQ(parsed.lines, std::vector<std::string>{c.second + "\tmsg"});
        EXPECT_EQ(parsed.shown, (std::vector<std::string>{"T:" + c.second, "M:msg"}));
    }
}

}  // namespace
