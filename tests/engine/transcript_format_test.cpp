#include "engine/transcript_format.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "engine/chat_content_storage.h"

namespace {

DateTimeRec At(int year, int month, int day, int hour, int minute, int second) {
    return DateTimeRec{static_cast<std::uint16_t>(year),
                       static_cast<std::uint16_t>(month),
                       static_cast<std::uint16_t>(day),
                       static_cast<std::uint16_t>(hour),
                       static_cast<std::uint16_t>(minute),
                       static_cast<std::uint16_t>(second),
                       1};
}

std::string Prefix(const DateTimeRec& time) {
    char out[kTimePrefixSize];
    FormatTimePrefix(time, out);
    return std::string(out, kTimePrefixSize);
}

bool SameTime(const DateTimeRec& a, const DateTimeRec& b) {
    return a.year == b.year && a.month == b.month && a.day == b.day && a.hour == b.hour &&
           a.minute == b.minute && a.second == b.second;
}

// The texts an opened file shows, in order, "T:" for titles and "M:" for message texts.
std::vector<std::string> Shown(const TranscriptBatch& batch) {
    std::vector<std::string> shown;
    for (const TranscriptPiece& piece : batch.pieces) {
        shown.push_back((piece.bTitle ? "T:" : "M:") +
                        batch.lines[piece.entry].substr(piece.offset, piece.size));
    }
    return shown;
}

const std::string kBom = "\xEF\xBB\xBF";
const std::string kFirst = "03/05/2009    09:03:07 AM    ";
const std::string kSecond = "12/31/2010    14:05:09 PM    ";

TEST(TranscriptFormat, TimePrefixKeepsTheTwentyFourHourClockWithAmOrPm) {
    struct Case {
        DateTimeRec time;
        const char* prefix;
    };
    const Case cases[] = {
        {At(2009, 3, 5, 9, 3, 7), "03/05/2009    09:03:07 AM    "},
        {At(2009, 3, 5, 0, 15, 0), "03/05/2009    00:15:00 AM    "},
        {At(2009, 3, 5, 11, 59, 59), "03/05/2009    11:59:59 AM    "},
        {At(2009, 3, 5, 12, 0, 0), "03/05/2009    12:00:00 PM    "},
        {At(2010, 12, 31, 14, 5, 9), "12/31/2010    14:05:09 PM    "},
        {At(987, 1, 1, 23, 0, 0), "01/01/0987    23:00:00 PM    "},
    };
    for (const Case& c : cases)
        EXPECT_EQ(Prefix(c.time), c.prefix);
}

TEST(TranscriptFormat, FileBytesAreMarkThenPrefixLineAndLfPerTime) {
    CChatContentStorage content;
    content.InsertTime(At(2009, 3, 5, 9, 3, 7));
    content.InsertNewLine("from Ann to All Participants:\r");
    content.ModifyLatestLineByAdd("hi");
    content.InsertTime(At(2010, 12, 31, 14, 5, 9));
    content.InsertNewLine("from Bo to Host (privately):\r");
    content.ModifyLatestLineByAdd("caf\xC3\xA9");
    EXPECT_EQ(FormatTranscript(content),
              "\xEF\xBB\xBF"
              "03/05/2009    09:03:07 AM    from Ann to All Participants:\r\thi\n"
              "12/31/2010    14:05:09 PM    from Bo to Host (privately):\r\tcaf\xC3\xA9\n");
}

TEST(TranscriptFormat, ATimeWithoutItsLineIsWrittenWithAnEmptyLine) {
    CChatContentStorage content;
    content.InsertTime(At(2009, 3, 5, 9, 3, 7));
    EXPECT_EQ(FormatTranscript(content), kBom + kFirst + "\n");
    CChatContentStorage empty;
    EXPECT_EQ(FormatTranscript(empty), kBom);
}

TEST(TranscriptFormat, PrefixChecksTheDateMinuteAndSecondButNotTheHour) {
    struct Case {
        const char* text;
        bool valid;
    };
    const Case cases[] = {
        {"03/05/2009    09:03:07 AM    ", true},
        {"12/31/0001    99:59:59 PM    ", true},   // the hour is not examined
        {"03-05-2009xxxx09x03x07xxxxxxx", true},   // nor the separators and letters
        {"13/05/2009    09:03:07 AM    ", false},  // month 13
        {"00/05/2009    09:03:07 AM    ", false},
        {"03/00/2009    09:03:07 AM    ", false},
        {"03/32/2009    09:03:07 AM    ", false},
        {"03/05/0000    09:03:07 AM    ", false},
        {"03/05/2009    09:60:07 AM    ", false},
        {"03/05/2009    09:03:60 AM    ", false},
        {"0a/05/2009    09:03:07 AM    ", false},  // numbers are digits
        {"03/05/2009    0 :03:07 AM    ", false},
        {"03/05/2009    09:03:07 AM   ", false},  // 28 bytes: too short
    };
    for (const Case& c : cases) {
        DateTimeRec time{};
        const std::string text = c.text;
        EXPECT_EQ(ParseTimePrefix(text.data(), text.size(), &time), c.valid) << text;
    }
    DateTimeRec time{};
    ASSERT_TRUE(ParseTimePrefix(kSecond.data(), kSecond.size(), &time));
    EXPECT_TRUE(SameTime(time, At(2010, 12, 31, 14, 5, 9)));
}

TEST(TranscriptFormat, SavedBytesParseBackIntoTheSameEntries) {
    CChatContentStorage content;
    content.InsertTime(At(2009, 3, 5, 9, 3, 7));
    content.InsertNewLine("from Ann:\r");
    content.ModifyLatestLineByAdd("one\rtwo");
    content.InsertTime(At(2010, 12, 31, 14, 5, 9));
    content.InsertNewLine("from Bo:\r");
    content.ModifyLatestLineByAdd("");
    content.InsertTime(At(2011, 1, 2, 0, 0, 0));
    content.InsertNewLine("from Cy:\r");
    content.ModifyLatestLineByAdd("last");
    const std::string bytes = FormatTranscript(content);

    TranscriptBatch batch;
    ASSERT_TRUE(ParseTranscript(bytes.data(), bytes.size(), &batch));
    ASSERT_EQ(batch.times.size(), 3u);
    ASSERT_EQ(batch.lines.size(), 3u);
    for (std::size_t i = 0; i < 3; ++i) {
        EXPECT_TRUE(SameTime(batch.times[i], content.GetTimeAt(i))) << i;
        EXPECT_EQ(batch.lines[i], content.GetLineAtIndex(i)) << i;
    }
    EXPECT_EQ(Shown(batch), (std::vector<std::string>{"T:from Ann:\r", "M:one\rtwo", "T:from Bo:\r",
                                                      "M:", "T:from Cy:\r", "M:last"}));
}

TEST(TranscriptFormat, ParsingFollowsTheFileLayoutCaseByCase) {
    struct Case {
        const char* name;
        std::string bytes;
        bool ok;
        std::vector<std::string> lines;
        std::vector<std::string> shown;
    };
    const Case cases[] = {
        {"leading LFs", kBom + "\n\n" + kFirst + "A\tx\n", true, {"A\r\tx"}, {"T:A\r", "M:x"}},
        {"no mark, no final LF", kFirst + "A\tx", true, {"A\r\tx"}, {"T:A\r", "M:x"}},
        {"UTF-16 mark skipped", "\xFF\xFE" + kFirst + "A\tx\n", true, {"A\r\tx"}, {"T:A\r", "M:x"}},
        {"header ending in CR keeps one CR",
         kFirst + "A\r\tx\n",
         true,
         {"A\r\tx"},
         {"T:A\r", "M:x"}},
        {"TAB on a later line", kFirst + "A\nB\tx\n", true, {"A\nB\r\tx"}, {"T:A\nB\r", "M:x"}},
        {"later invalid line continues the entry",
         kFirst + "A\tx\nmore\n" + kSecond + "B\ty\n",
         true,
         {"A\r\txmore", "B\r\ty"},
         {"T:A\r", "M:x", "M:more", "T:B\r", "M:y"}},
        {"later month 13 continues the entry",
         kFirst + "A\tx\n13" + kFirst.substr(2) + "B\ty\n",
         true,
         {"A\r\tx13" + kFirst.substr(2) + "B\ty"},
         {"T:A\r", "M:x", "M:13" + kFirst.substr(2) + "B\ty"}},
        {"short tail continues the entry",
         kFirst + "A\tx\n03/05/20",
         true,
         {"A\r\tx03/05/20"},
         {"T:A\r", "M:x", "M:03/05/20"}},
        {"nothing after the TAB", kFirst + "A\t", true, {"A\r\t"}, {"T:A\r"}},
        {"last entry without TAB is dropped",
         kFirst + "A\tx\n" + kSecond + "B no tab\n",
         true,
         {"A\r\tx"},
         {"T:A\r", "M:x"}},
        {"first line month 13", kBom + "13" + kFirst.substr(2) + "A\tx\n", false, {}, {}},
        {"first line too short", kBom + "03/05/2009\tx\n", false, {}, {}},
        {"only entry without TAB", kBom + kFirst + "A\n", false, {}, {}},
        {"empty", "", false, {}, {}},
        {"only a mark and LFs", kBom + "\n\n", false, {}, {}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        // An exact-size heap copy, so a read past the end is a read past the allocation.
        const std::vector<char> bytes(c.bytes.begin(), c.bytes.end());
        TranscriptBatch batch;
        EXPECT_EQ(ParseTranscript(bytes.data(), bytes.size(), &batch), c.ok);
        EXPECT_EQ(batch.lines, c.lines);
        EXPECT_EQ(batch.times.size(), batch.lines.size());
        EXPECT_EQ(Shown(batch), c.shown);
    }
}

TEST(TranscriptFormat, LongHeadersAreCutAtACharacterBoundary) {
    struct Case {
        std::string header;
        std::size_t keptBytes;  // of the header, before the CR
    };
    std::string threeByte;
    while (threeByte.size() < 9000)
        threeByte += "\xE2\x82\xAC";
    const Case cases[] = {
        {std::string(8190, 'a'), 8190},         // fits with its CR
        {std::string(8190, 'a') + "\r", 8191},  // already ends in CR
        {std::string(8191, 'a'), 8190},         // one too many
        {std::string(20000, 'a'), 8190},        // far too long
        {"a" + threeByte, 8188},                // never splits a character
    };
    for (const Case& c : cases) {
        const std::string bytes = kFirst + c.header + "\tmsg\n";
        TranscriptBatch batch;
        ASSERT_TRUE(ParseTranscript(bytes.data(), bytes.size(), &batch));
        ASSERT_EQ(batch.lines.size(), 1u);
        const std::string& line = batch.lines[0];
        const std::size_t title = batch.pieces[0].size;
        EXPECT_LE(title, kMaxHeaderSize);
        EXPECT_EQ(line.substr(0, c.keptBytes), c.header.substr(0, c.keptBytes));
        EXPECT_EQ(title, c.keptBytes < 8191 ? c.keptBytes + 1 : c.keptBytes);
        EXPECT_EQ(line.substr(title), "\tmsg");
    }
}

TEST(ChatContentStorage, TimesAndLinesAreKeptInParallel) {
    CChatContentStorage content;
    content.ModifyLatestLineByAdd("lost");  // no line yet: nothing happens
    EXPECT_EQ(content.GetLineCount(), 0u);
    content.InsertTime(At(2009, 3, 5, 9, 3, 7));
    content.InsertNewLine("title:\r");
    content.ModifyLatestLineByAdd("a");
    content.ModifyLatestLineByAdd("b");
    content.AppendEntries({At(2010, 1, 1, 1, 1, 1), At(2011, 2, 2, 2, 2, 2)}, {"x\r\ty", "z"});

    ASSERT_EQ(content.GetTimeCount(), 3u);
    ASSERT_EQ(content.GetLineCount(), 3u);
    EXPECT_EQ(content.GetLineAtIndex(0), "title:\r\tab");
    EXPECT_EQ(content.GetLineAtIndex(2), "z");
    EXPECT_TRUE(SameTime(content.GetTimeAt(1), At(2010, 1, 1, 1, 1, 1)));
    EXPECT_EQ(content.GetLineAtIndex(3), "");
    const DateTimeRec none = content.GetTimeAt(3);
    EXPECT_TRUE(SameTime(none, DateTimeRec{}));
    EXPECT_EQ(none.valid, 0);
    content.Clear();
    EXPECT_EQ(content.GetTimeCount() + content.GetLineCount(), 0u);
}

TEST(ChatContentStorage, ABatchIsAppendedInWholeEntriesOnly) {
    CChatContentStorage empty;
    // A time without its line is not an entry.
    empty.AppendEntries({At(2010, 1, 1, 1, 1, 1), At(2011, 2, 2, 2, 2, 2)}, {"only one"});
    EXPECT_EQ(empty.GetTimeCount(), 1u);
    EXPECT_EQ(empty.GetLineCount(), 1u);
    EXPECT_EQ(empty.GetLineAtIndex(0), "only one");

    empty.AppendEntries({At(2012, 3, 3, 3, 3, 3)}, {"second", "no time"});
    EXPECT_EQ(empty.GetTimeCount(), 2u);
    EXPECT_EQ(empty.GetLineCount(), 2u);
    EXPECT_EQ(empty.GetLineAtIndex(1), "second");
    EXPECT_TRUE(SameTime(empty.GetTimeAt(1), At(2012, 3, 3, 3, 3, 3)));
}

}  // namespace
