// The transcript store: lines grow where they stand, entries taken over from an opened file
// follow those already kept, and out-of-range reads give empty results.
#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "engine/chat_content_storage.h"

namespace {

std::vector<std::string> Lines(const CChatContentStorage& store) {
    std::vector<std::string> lines;
    for (std::size_t i = 0; i < store.GetLineCount(); ++i)
        lines.emplace_back(store.GetLineAtIndex(i));
    return lines;
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
