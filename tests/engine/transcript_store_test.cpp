// The transcript store: lines kept in shared blocks stay whole and apart however they grow,
// whether they were added one by one or taken over from a file's bytes.
#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <string>
#include <string_view>
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

// A block as an opened file gives it: the lines lie one after the other in text.
ContentBlock FileBlock(const std::vector<std::string>& lines) {
    std::string all;
    for (const std::string& line : lines)
        all += line;
    ContentBlock block;
    block.text.reset(new char[all.size()]);
    std::memcpy(block.text.get(), all.data(), all.size());
    std::size_t at = 0;
    for (const std::string& line : lines) {
        block.lines.emplace_back(block.text.get() + at, line.size());
        block.times.push_back(DateTimeRec{2009, 3, 5, 9, 3, static_cast<std::uint16_t>(at), 1});
        at += line.size();
    }
    return block;
}

TEST(TranscriptStore, LinesStayWholeAndApartAsTheyGrowAcrossBlocks) {
    CChatContentStorage store;
    std::vector<std::string> expected;
    std::vector<std::string_view> views;  // each line as it stood when it was complete
    // Enough lines to fill several blocks, so some are moved when they grow.
    for (int i = 0; i < 3000; ++i) {
        const std::string header = "from Participant " + std::to_string(i) + ":\r";
        store.InsertNewLine(header);
        store.ModifyLatestLineByAdd("message ");
        store.ModifyLatestLineByAdd(std::string(i % 40, 'x') + std::to_string(i));
        expected.push_back(header + "\tmessage " + std::string(i % 40, 'x') + std::to_string(i));
        views.push_back(store.GetLineAtIndex(store.GetLineCount() - 1));
    }
    // A last line that outgrows a whole block, then keeps growing.
    store.InsertNewLine("from Ann:\r");
    const std::string big(CChatContentStorage::kBlockBytes + 100, 'b');
    store.ModifyLatestLineByAdd(big);
    store.ModifyLatestLineByAdd("end");
    expected.push_back("from Ann:\r\t" + big + "end");

    EXPECT_EQ(Lines(store), expected);
    for (std::size_t i = 0; i < views.size(); ++i)
        ASSERT_EQ(views[i], expected[i]) << i;
    EXPECT_EQ(store.GetLineAtIndex(expected.size()), "");
}

TEST(TranscriptStore, LinesTakenOverFromAFileGrowLikeAnyOther) {
    CChatContentStorage store;
    store.InsertTime(DateTimeRec{2009, 3, 5, 9, 3, 7, 1});
    store.InsertNewLine("from Ann:\r");
    store.ModifyLatestLineByAdd("hi");
    store.AppendEntries(FileBlock({"A\r\tone", "B\r\ttwo"}));
    const std::string_view before = store.GetLineAtIndex(2);
    // The last line lies in the file's bytes, right before the next one would: adding to it
    // must not write over anything.
    store.ModifyLatestLineByAdd(" more");
    store.InsertNewLine("from Bo:\r");
    store.ModifyLatestLineByAdd("bye");
    // A line may be given its own text.
    store.ModifyLatestLineByAdd(store.GetLineAtIndex(3));

    EXPECT_EQ(Lines(store),
              (std::vector<std::string>{"from Ann:\r\thi", "A\r\tone", "B\r\ttwo more",
                                        "from Bo:\r\tbyefrom Bo:\r\tbye"}));
    EXPECT_EQ(before, "B\r\ttwo");        // an older view keeps what it showed
    EXPECT_EQ(store.GetTimeCount(), 3u);  // the fourth line's time never came
    EXPECT_EQ(store.GetTimeAt(2).second, 6);
    EXPECT_EQ(store.GetTimeAt(3).year, 0);

    // A block with more times than lines keeps only whole entries.
    ContentBlock uneven = FileBlock({"C\r\tthree"});
    uneven.times.push_back(DateTimeRec{2010, 1, 1, 0, 0, 0, 1});
    store.AppendEntries(std::move(uneven));
    EXPECT_EQ(store.GetTimeCount(), 4u);
    EXPECT_EQ(store.GetLineAtIndex(4), "C\r\tthree");

    store.Clear();
    EXPECT_EQ(store.GetLineCount(), 0u);
    EXPECT_EQ(store.GetTimeCount(), 0u);
    store.ModifyLatestLineByAdd("nothing to add to");
    EXPECT_EQ(store.GetLineCount(), 0u);
}

}  // namespace
