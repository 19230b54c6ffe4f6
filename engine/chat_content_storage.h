// CChatContentStorage: the transcript store. Every shown chat line is kept with its time, in
// two parallel sequences whose index i pairs time i with line i.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
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

class CChatContentStorage {
public:
    // Appends a new line made of the header followed by one TAB.
    void InsertNewLine(std::string_view header);
    // Appends text to the last line; does nothing while there is no line.
    void ModifyLatestLineByAdd(std::string_view text);
    // Appends a time.
    void InsertTime(const DateTimeRec& time);
    // Appends the entries of other, in order, and leaves other empty.
    void AppendEntries(CChatContentStorage&& other);

    // The time at index, or an all-zero record when index is out of range.
    DateTimeRec GetTimeAt(std::size_t index) const {
        return index < m_times.size() ? m_times[index] : DateTimeRec{};
    }
    // The line at index, or an empty view when index is out of range; valid until the store
    // changes.
    std::string_view GetLineAtIndex(std::size_t index) const {
        return index < m_lines.size() ? std::string_view(m_lines[index]) : std::string_view();
    }

    std::size_t GetTimeCount() const { return m_times.size(); }
    std::size_t GetLineCount() const { return m_lines.size(); }

    // Forgets every time and line.
    void Clear();

private:
    std::vector<DateTimeRec> m_times;
    std::vector<std::string> m_lines;
};
