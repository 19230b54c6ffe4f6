#include "engine/transcript_format.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "engine/chat_content_storage.h"

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

std::vector<std::string> Lines(const CChatContentStorage& store) {
    std::vector<std::string> lines;
    for (std::size_t i = 0; i < store.GetLineCount(); ++i)
        lines.emplace_back(store.GetLineAtIndex(i));
    return lines;
}

Parsed Parse(const std::string& bytes) {
    Parsed parsed{};
    CChatContentStorage content;
    parsed.ok = ParseTranscript(bytes, &content, [&parsed](bool bTitle, const std::string& text) {
        parsed.shown.push_back((bTitle ? "T:" : "M:") + text);
    });
    parsed.lines = Lines(content);
    parsed.times = content.GetTimeCount();
    return parsed;
}

// A store as an opened file fills it: one time and one line per text.
CChatContentStorage Opened(const std::vector<std::string>& headers, std::uint16_t second) {
    CChatContentStorage store;
    for (const std::string& header : headers) {
        store.InsertTime(DateTimeRec{2009, 3, 5, 9, 3, second++, 1});
        store.InsertNewLine(header);
        store.ModifyLatestLineByAdd("text");
    }
    return store;
}

const std::string kFirst = "03/05/2009    09:03:07 AM    ";
const std::string kSecond = "12/31/2010    14:05:09 PM    ";

TEST(TranscriptFormat, FileIsMarkThenPrefixLineAndLfPerTime) {
    CChatContentStorage content;
    const DateTimeRec times[] = {At(2009, 3, 5, 9, 3, 7), At(2009, 3, 5, 0, 15, 0),
                                 At(2009, 3, 5, 12, 0, 0), At(987, 12, 31, 14, 5, 9),
                                 At(2009, 3, 5, 99, 0, 0)};  // an hour an opened file kept
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
              "03/05/2009    99:00:00 PM    from Ann:\r\thi\n"
              "01/02/2010    03:04:05 AM    \n");
}

TEST(TranscriptFormat, PrefixChecksDateMinuteAndSecondAndKeepsADigitHour) {
    struct Case {
        const char* prefix;
        bool valid;
        int hour;
    };
    const Case cases[] = {
        {"12/31/0001    99:59:59 PM    ", true, 99},  // the hour is not examined
        {"03/05/2009    x7:03:07 AM    ", true, 0},   // and kept only when it is two digits
        {"03-05-2009xxxx09x03x07xxxxxxx", true, 9},   // nor separators and letters
        {"13/05/2009    09:03:07 AM    ", false, 0}, {"00/05/2009    09:03:07 AM    ", false, 0},
        {"03/32/2009    09:03:07 AM    ", false, 0}, {"03/05/0000    09:03:07 AM    ", false, 0},
        {"03/05/2009    09:60:07 AM    ", false, 0}, {"03/05/2009    09:03:60 AM    ", false, 0},
        {"0a/05/2009    09:03:07 AM    ", false, 0}, {"03/05/2009    09:03:07 AM   ", false, 0},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.prefix);
        DateTimeRec time{};
        EXPECT_EQ(ParseTimePrefix(c.prefix, &time), c.valid);
        EXPECT_EQ(time.hour, c.hour);
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

// The store: lines grow where they stand, entries taken over from an opened file follow those
// already kept, and out-of-range reads give empty results.
TEST(TranscriptStore, EntriesKeepTheirOrderAndPairsAsTheyGrowAndAreTakenOver) {
    CChatContentStorage store;
    store.ModifyLatestLineByAdd("nothing to add to");
    EXPECT_EQ(store.GetLineCount(), 0u);

    // Taken over whole into an empty store, then after entries already kept.
    CChatContentStorage first = Opened({"A\r"}, 1);
    store.AppendEntries(std::move(first));
    EXPECT_EQ(first.GetLineCount() + first.GetTimeCount(), 0u);
    store.InsertTime(DateTimeRec{2010, 1, 1, 0, 0, 0, 1});
    store.InsertNewLine("from Bo:\r");
    store.ModifyLatestLineByAdd("bye");
    store.ModifyLatestLineByAdd(store.GetLineAtIndex(1));  // a line may be given its own text
    store.AppendEntries(Opened({"C\r", "D\r"}, 7));
    store.InsertNewLine("E\r");  // its time never came

    EXPECT_EQ(Lines(store), (std::vector<std::string>{"A\r\ttext", "from Bo:\r\tbyefrom Bo:\r\tbye",
                                                      "C\r\ttext", "D\r\ttext", "E\r\t"}));
    EXPECT_EQ(store.GetTimeCount(), 4u);
    EXPECT_EQ(store.GetTimeAt(3).second, 8);
    EXPECT_EQ(store.GetTimeAt(4).year, 0);
    EXPECT_EQ(store.GetLineAtIndex(5), "");

    store.Clear();
    EXPECT_EQ(store.GetLineCount() + store.GetTimeCount(), 0u);
}

}  // namespace
