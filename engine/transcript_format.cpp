#include "engine/transcript_format.h"

#include <algorithm>

namespace {

// Appends the last width decimal digits of value.
void AppendDigits(std::string* out, unsigned value, int width) {
    char digits[4];
    for (int i = width - 1; i >= 0; --i) {
        digits[i] = static_cast<char>('0' + value % 10);
        value /= 10;
    }
    out->append(digits, static_cast<std::size_t>(width));
}

// The number written as two digits at the start of text, or -1 when they are not digits.
int TwoDigits(std::string_view text) {
    const auto digit = [](char c) { return c >= '0' && c <= '9'; };
    if (!digit(text[0]) || !digit(text[1])) return -1;
    return (text[0] - '0') * 10 + (text[1] - '0');
}

// How many bytes a file starts with for its byte-order mark: UTF-8, UTF-16 little-endian or
// none.
std::size_t ByteOrderMarkSize(std::string_view data) {
    if (data.substr(0, kUtf8Bom.size()) == kUtf8Bom) return kUtf8Bom.size();
    if (data.substr(0, 2) == "\xFF\xFE") return 2;
    return 0;
}

// The index of the next LF at or after from, or the size of data when there is none.
std::size_t LineEnd(std::string_view data, std::size_t from) {
    return std::min(data.find('\n', from), data.size());
}

// The part of a header that is kept: all of it when it fits with its CR, else as much as
// fits without splitting a UTF-8 character.
std::string_view KeptHeader(std::string_view header) {
    if (header.size() < kMaxHeaderSize ||
        (header.size() == kMaxHeaderSize && header.back() == '\r')) {
        return header;
    }
    return header.substr(0, Utf8FittingSize(header, kMaxHeaderSize - 1));
}

}  // namespace

std::size_t Utf8FittingSize(std::string_view text, std::size_t limit) {
    std::size_t kept = std::min(text.size(), limit);
    while (kept > 0 && kept < text.size() &&
           (static_cast<unsigned char>(text[kept]) & 0xC0) == 0x80)
        --kept;
    return kept;
}

std::string FormatTranscript(const CChatContentStorage& content) {
    std::string out(kUtf8Bom);
    for (std::size_t i = 0; i < content.GetTimeCount(); ++i) {
        const DateTimeRec time = content.GetTimeAt(i);
        AppendDigits(&out, time.month, 2);
        out += '/';
        AppendDigits(&out, time.day, 2);
        out += '/';
        AppendDigits(&out, time.year, 4);
        out += "    ";
        AppendDigits(&out, time.hour, 2);
        out += ':';
        AppendDigits(&out, time.minute, 2);
        out += ':';
        AppendDigits(&out, time.second, 2);
        out += time.hour < 12 ? " AM    " : " PM    ";
        out += content.GetLineAtIndex(i);
        out += '\n';
    }
    return out;
}

bool ParseTimePrefix(std::string_view data, DateTimeRec* time) {
    if (data.size() < kTimePrefixSize) return false;
    const int month = TwoDigits(data.substr(0));
    const int day = TwoDigits(data.substr(3));
    const int century = TwoDigits(data.substr(6));
    const int yearOfCentury = TwoDigits(data.substr(8));
    const int hour = TwoDigits(data.substr(14));
    const int minute = TwoDigits(data.substr(17));
    const int second = TwoDigits(data.substr(20));
    if (month < 1 || month > 12 || day < 1 || day > 31 || century < 0 || yearOfCentury < 0 ||
        century + yearOfCentury == 0 || minute < 0 || minute >= 60 || second < 0 || second >= 60) {
        return false;
    }
    const auto u16 = [](int value) { return static_cast<std::uint16_t>(value); };
    *time = DateTimeRec{u16(century * 100 + yearOfCentury),
                        u16(month),
                        u16(day),
                        u16(std::max(hour, 0)),
                        u16(minute),
                        u16(second),
                        1};
    return true;
}

bool ParseTranscript(std::string_view data, CChatContentStorage* content,
                     const ShowTranscriptText& show) {
    content->Clear();
    std::string text;  // the text being shown
    std::size_t pos = ByteOrderMarkSize(data);
    while (pos < data.size()) {
        if (data[pos] == '\n') {
            ++pos;
            continue;
        }
        DateTimeRec time{};
        if (!ParseTimePrefix(data.substr(pos), &time)) {
            // The first line must be an entry; any later one continues the entry before it,
            // joined to its line without the LF.
            if (content->GetLineCount() == 0) return false;
            const std::size_t end = LineEnd(data, pos);
            text.assign(data.substr(pos, end - pos));
            show(false, text);
            content->ModifyLatestLineByAdd(text);
            pos = end + 1;
            continue;
        }

        // The header runs to the next TAB, which may lie on a later line. Without one the
        // entry is incomplete and is dropped, so times and lines stay paired. With one the
        // file is sure to open, so its texts are shown from here on.
        const std::size_t headerAt = pos + kTimePrefixSize;
        const std::size_t tab = data.find('\t', headerAt);
        if (tab == std::string_view::npos) break;
        text.assign(KeptHeader(data.substr(headerAt, tab - headerAt)));
        if (text.empty() || text.back() != '\r') text += '\r';
        show(true, text);
        content->InsertTime(time);
        content->InsertNewLine(text);
        if (tab + 1 == data.size()) break;  // nothing follows the TAB

        const std::size_t end = LineEnd(data, tab + 1);
        text.assign(data.substr(tab + 1, end - tab - 1));
        show(false, text);
        content->ModifyLatestLineByAdd(text);
        pos = end + 1;
    }
    return content->GetLineCount() > 0;
}
