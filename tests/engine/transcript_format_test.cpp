#include "engine/transcript_format.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

DateTimeRec At(int year, int month, int day, int hour, int minute, int second) {
    auto u = [](int v) { return static_cast<std::uint16_t>(v); };
    return DateTimeRec{u(year), u(month), u(day), u(hour), u(minute), u(second), 1};
}

const std::string kBom = "\xEF\xBB\xBF";
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
        // An exact-size heap copy, so reading past the end is reading past the allocation.
        const std::vector<char> bytes(c.bytes.begin(), c.bytes.end());
        TranscriptBatch batch;
        EXPECT_EQ(ParseTranscript(bytes.data(), bytes.size(), &batch), !c.lines.empty());
        EXPECT_EQ(batch.lines, c.lines);
        EXPECT_EQ(batch.times.size(), batch.lines.size());
        std::vector<std::string> shown;
        for (const TranscriptPiece& p : batch.pieces) {
            shown.push_back((p.bTitle ? "T:" : "M:") +
                            batch.lines[p.entry].substr(p.offset, p.size));
        }
        EXPECT_EQ(shown, c.shown);
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
        const std::string bytes = kFirst + c.first + "\tmsg\n";
        TranscriptBatch batch;
        ASSERT_TRUE(ParseTranscript(bytes.data(), bytes.size(), &batch));
        EXPECT_EQ(batch.lines[0], c.second + "\tmsg");
        EXPECT_EQ(batch.pieces[0].size, c.second.size());
    }
}

}  // namespace
