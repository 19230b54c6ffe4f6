// The bytes of transcript files: how the store is written out, which time prefixes are read,
// and how a file's lines become the store's entries and the texts an opened file shows.
#include "engine/transcript_format.h"

#include <gtest/gtest.h>

#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include "engine/chat_content_storage.h"

namespace {

using Strings = std::vector<std::string>;

const std::string kBom = "\xEF\xBB\xBF";
const std::string kFirst = "03/05/2009    09:03:07 AM    ";
const std::string kSecond = "12/31/2010    14:05:09 PM    ";

// What parsing a file gives: its entries' lines and the texts shown, each marked T: (title,
// 2201) or M: (message text, 2200). The file opens when there is a line.
std::pair<Strings, Strings> Parse(const std::string& bytes) {
    Strings lines;
    Strings shown;
    CChatContentStorage content;
    const bool opened =
        ParseTranscript(bytes, &content, [&shown](bool bTitle, const std::string& text) {
            shown.push_back((bTitle ? "T:" : "M:") + text);
        });
    for (std::size_t i = 0; i < content.GetLineCount(); ++i)
        lines.emplace_back(content.GetLineAtIndex(i));
    EXPECT_EQ(opened, !lines.empty());
    // Every line keeps the time it was read with.
    EXPECT_EQ(content.GetTimeCount(), lines.size());
    return {lines, shown};
}

TEST(TranscriptFormat, FileIsMarkThenPrefixLineAndLfPerTime) {
    // Read and written back, every number keeps its width, the hour is followed by AM below 12
    // and PM from 12, and an hour no clock gives, kept from an opened file, is written as read.
    const std::string file = kBom +
                             "03/05/2009    09:03:07 AM    from Ann:\r\thi\n"
                             "03/05/2009    00:15:00 AM    from Ann:\r\thi\n"
                             "03/05/2009    12:00:00 PM    from Ann:\r\thi\n"
                             "12/31/0987    14:05:09 PM    from Ann:\r\thi\n"
                             "03/05/2009    99:00:00 PM    from Ann:\r\thi\n";
    CChatContentStorage content;
    ASSERT_TRUE(ParseTranscript(file, &content, [](bool, const std::string&) {}));
    EXPECT_EQ(FormatTranscript(content), file);
    content.ModifyLatestLineByAdd(content.GetLineAtIndex(4));  // a line given its own text
    content.InsertTime({2010, 1, 2, 3, 4, 5, 1});              // a time whose line never came
    EXPECT_EQ(FormatTranscript(content), file.substr(0, file.size() - 1) +
                                             "from Ann:\r\thi\n"
                                             "01/02/2010    03:04:05 AM    \n");
    CChatContentStorage empty;
    empty.ModifyLatestLineByAdd("no line yet: nothing to add to");
    EXPECT_EQ(FormatTranscript(empty), kBom);
}

TEST(TranscriptFormat, PrefixChecksDateMinuteAndSecondAndKeepsADigitHour) {
    // The prefix, whether it is read, and the hour kept.
    const std::tuple<const char*, bool, int> cases[] = {
        {"12/31/0001    99:59:59 PM    ", true, 99},  // the hour is not examined
        {"03/05/2009    x7:03:07 AM    ", true, 0},   // and kept only when it is two digits
        {"03-05-2009xxxx09x03x07xxxxxxx", true, 9},   // nor separators and letters
        {"13/05/2009    09:03:07 AM    ", false, 0}, {"00/05/2009    09:03:07 AM    ", false, 0},
        {"03/32/2009    09:03:07 AM    ", false, 0}, {"03/05/0000    09:03:07 AM    ", false, 0},
        {"03/05/2009    09:60:07 AM    ", false, 0}, {"03/05/2009    09:03:60 AM    ", false, 0},
        {"0a/05/2009    09:03:07 AM    ", false, 0}, {"03/05/2009    09:03:07 AM   ", false, 0},
    };
    for (const auto& [prefix, valid, hour] : cases) {
        SCOPED_TRACE(prefix);
        DateTimeRec time{};
        EXPECT_EQ(ParseTimePrefix(prefix, &time), valid);
        EXPECT_EQ(time.hour, hour);
    }
}

TEST(TranscriptFormat, ParsingKeepsEntriesWholeCaseByCase) {
    const std::string month13 = "13" + kFirst.substr(2);
    // The case, the file's bytes, the entries' lines (none: the file fails to open) and the
    // texts shown.
    const std::tuple<const char*, std::string, Strings, Strings> cases[] = {
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
        {"first line short", kBom + "03/05/2009\tx\n", {}, {}},
        {"only entry without TAB", kBom + kFirst + "A\n", {}, {}},
        {"only a mark and LFs", kBom + "\n\n", {}, {}},
    };
    for (const auto& [name, bytes, lines, shown] : cases) {
        SCOPED_TRACE(name);
        EXPECT_EQ(Parse(bytes), std::make_pair(lines, shown));
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
    for (const auto& [header, kept] : cases) {
        EXPECT_EQ(Parse(kFirst + header + "\tmsg\n"),
                  std::make_pair(Strings{kept + "\tmsg"}, Strings{"T:" + kept, "M:msg"}));
    }
}

}  // namespace
