// CChatContentStorage: the transcript store. Every shown chat line is kept with its time,
// in two parallel sequences whose index i pairs time i with line i. The lines' bytes live in
// a few large blocks rather than one allocation per line: a transcript read from a file keeps
// the file's own buffer, and lines added while chatting share blocks of kBlockBytes.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>
#include <vector>

// A calendar time as the transcript keeps it; valid is 1 when it was filled from the clock.
struct DateTimeRec {
    std::uint16_t year;
    std::uint16_t month;   // 1 to 12
    std::uint16_t day;     // 1 to 31
    std::uint16_t hour;    // 0 to 23
    std::uint16_t minute;  // 0 to 59
    std::uint16_t second;  // 0 to 59
    std::uint16_t valid;
};

// Entries made in one piece, such as a file's: times[i] with lines[i], every line a view
// into text.
struct ContentBlock {
    std::unique_ptr<char[]> text;
    std::vector<DateTimeRec> times;
    std::vector<std::string_view> lines;
};

class CChatContentStorage {
public:
    CChatContentStorage() = default;
    CChatContentStorage(const CChatContentStorage&) = delete;
    CChatContentStorage& operator=(const CChatContentStorage&) = delete;

    // Appends a new line made of the header followed by one TAB.
    void InsertNewLine(std::string_view header);
    // Appends text to the last line; does nothing while there is no line.
    void ModifyLatestLineByAdd(std::string_view text);
    // Appends a time.
    void InsertTime(const DateTimeRec& time);
    // Appends the block's entries, times[i] with lines[i], in order, and keeps its text.
    // Pairs beyond the shorter of the two are dropped.
    void AppendEntries(ContentBlock&& block);

    // The time at index, or an all-zero record when index is out of range.
    DateTimeRec GetTimeAt(std::size_t index) const {
        return index < m_times.size() ? m_times[index] : DateTimeRec{};
    }
    // The line at index, or an empty view when index is out of range. The bytes stay valid
    // until Clear; appending to the last line may move it, leaving an older view as it was.
    std::string_view GetLineAtIndex(std::size_t index) const {
        return index < m_lines.size() ? m_lines[index] : std::string_view();
    }

    std::size_t GetTimeCount() const { return m_times.size(); }
    std::size_t GetLineCount() const { return m_lines.size(); }

    // Forgets every time and line.
    void Clear();

    // Smallest block for lines added one by one.
    static constexpr std::size_t kBlockBytes = 64 * 1024;

private:
    // Hands out size bytes at the end of the live block, starting a new block when the live
    // one is too full.
    char* Take(std::size_t size);
    // Copies the last line and text to a fresh place and makes that the last line.
    void MoveLatestLineAndAdd(std::string_view text);

    // The entries.
    std::vector<DateTimeRec> m_times;
    std::vector<std::string_view> m_lines;  // views into m_blocks

    // Where the lines' bytes live; blocks are only ever freed by Clear.
    std::vector<std::unique_ptr<char[]>> m_blocks;
    char* m_pFree = nullptr;  // the unused end of the live block, the one Take hands out from
    std::size_t m_nFree = 0;
    bool m_bLatestAtFree = false;  // the last line ends where m_pFree begins
};
