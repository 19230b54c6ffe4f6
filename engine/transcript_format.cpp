#include "engine/transcript_format.h"

#include <algorithm>
#include <cstring>
#include <utility>

namespace {

// Entries reserved ahead at most; bigger files grow their batch as they go.
constexpr std::size_t kMaxReserved = std::size_t{1} << 20;
// Bytes at the start of a file that tell how long its entries are.
constexpr std::size_t kSampleBytes = 64 * 1024;

// "00" to "99", so each two-digit field is one copy.
constexpr char kDigitPairs[] =
    "00010203040506070809101112131415161718192021222324252627282930313233343536373839"
    "40414243444546474849505152535455565758596061626364656667686970717273747576777879"
    "8081828384858687888990919293949596979899";

// Writes the last two decimal digits of value, so a field keeps its width.
void PutTwoDigits(char* out, unsigned value) {
    std::memcpy(out, kDigitPairs + 2 * (value % 100), 2);
}

// The number written as two digits at in, or 100 or more when they are not two digits.
unsigned TwoDigits(const char* in) {
    const unsigned tens = static_cast<unsigned char>(in[0]) - unsigned{'0'};
    const unsigned ones = static_cast<unsigned char>(in[1]) - unsigned{'0'};
    return tens > 9 || ones > 9 ? 100 : tens * 10 + ones;
}

// About how many entries a file of size bytes holds, judged from its first kSampleBytes,
// where nearly every line is an entry, with an eighth more for a file whose entries get
// shorter further on; beyond that the batch grows as it goes. Room reserved far beyond
// the entries would keep the memory allocator from handing the same memory out again.
std::size_t EstimatedEntries(const char* data, std::size_t size) {
    const std::size_t sample = std::min(size, kSampleBytes);
    const std::size_t lines = static_cast<std::size_t>(std::count(data, data + sample, '\n')) + 1;
    const std::size_t entries = size / std::max<std::size_t>(sample / lines, 1) + 1;
    return std::min(entries + entries / 8, kMaxReserved);
}

// Where the entries start: after a UTF-8 mark or a UTF-16 little-endian mark.
std::size_t SkipByteOrderMark(const char* data, std::size_t size) {
    if (size >= kUtf8BomSize && std::memcmp(data, kUtf8Bom, kUtf8BomSize) == 0) {
        return kUtf8BomSize;
    }
    if (size >= 2 && static_cast<unsigned char>(data[0]) == 0xFF &&
        static_cast<unsigned char>(data[1]) == 0xFE) {
        return 2;
    }
    return 0;
}

// The index of the next LF at or after from, or size when there is none.
std::size_t LineEnd(const char* data, std::size_t from, std::size_t size) {
    const void* lf = std::memchr(data + from, '\n', size - from);
    return lf ? static_cast<std::size_t>(static_cast<const char*>(lf) - data) : size;
}

// How many bytes of a header of size bytes are kept: all of it when it fits with its CR,
// else as much as fits without splitting a UTF-8 character.
std::size_t KeptHeaderSize(const char* header, std::size_t size) {
    if (size < kMaxHeaderSize || (size == kMaxHeaderSize && header[size - 1] == '\r')) {
        return size;
    }
    return Utf8FittingSize(header, size, kMaxHeaderSize - 1);
}

// Reads the time prefix at data, which holds at least kTimePrefixSize bytes, into *time;
// false, with *time untouched, when it is not a valid one. It runs for every line of a file,
// so it is always inlined, and it stores the fields one by one: a record built aside and
// copied whole would make the processor gather its small fields again.
[[gnu::always_inline]] inline bool ReadTimePrefix(const char* data, DateTimeRec* time) {
    const unsigned month = TwoDigits(data);
    const unsigned day = TwoDigits(data + 3);
    const unsigned century = TwoDigits(data + 6);
    const unsigned yearOfCentury = TwoDigits(data + 8);
    const unsigned hour = TwoDigits(data + 14);
    const unsigned minute = TwoDigits(data + 17);
    const unsigned second = TwoDigits(data + 20);
    const bool valid = (month - 1 < 12) & (day - 1 < 31) & (century < 100) & (yearOfCentury < 100) &
                       (century + yearOfCentury > 0) & (hour < 100) & (minute < 60) & (second < 60);
    if (!valid) return false;
    time->year = static_cast<std::uint16_t>(century * 100 + yearOfCentury);
    time->month = static_cast<std::uint16_t>(month);
    time->day = static_cast<std::uint16_t>(day);
    time->hour = static_cast<std::uint16_t>(hour);
    time->minute = static_cast<std::uint16_t>(minute);
    time->second = static_cast<std::uint16_t>(second);
    time->valid = 1;
    return true;
}

// Puts the start of an entry's line in place: the kept header, a CR unless it ends in one,
// and a TAB. Returns where the line starts and sets *end just past its TAB. A header kept
// whole that ends in CR already stands so in the file and nothing moves; any other is
// rewritten over the entry's prefix, where the CR has room.
std::size_t StartLine(char* data, std::size_t prefixAt, std::size_t headerSize, std::size_t* end) {
    const std::size_t headerAt = prefixAt + kTimePrefixSize;
    const std::size_t kept = KeptHeaderSize(data + headerAt, headerSize);
    if (kept == headerSize && kept > 0 && data[headerAt + kept - 1] == '\r') {
        *end = headerAt + kept + 1;
        return headerAt;
    }
    std::memmove(data + prefixAt, data + headerAt, kept);
    std::size_t at = prefixAt + kept;
    if (kept == 0 || data[at - 1] != '\r') data[at++] = '\r';
    data[at++] = '\t';
    *end = at;
    return prefixAt;
}

// Shows bytes [at, at + size) of data as one text, with a NUL put after them for the call.
// The byte there is part of the file's buffer, at worst its spare last byte.
void Show(char* data, std::size_t at, std::size_t size, bool bTitle,
          const ShowTranscriptText& show) {
    char* const end = data + at + size;
    const char after = *end;
    *end = '\0';
    show(bTitle, std::string_view(data + at, size));
    *end = after;
}

}  // namespace

std::size_t Utf8FittingSize(const char* text, std::size_t size, std::size_t limit) {
    std::size_t kept = std::min(size, limit);
    while (kept > 0 && kept < size && (static_cast<unsigned char>(text[kept]) & 0xC0) == 0x80)
        --kept;
    return kept;
}

void FormatTimePrefix(const DateTimeRec& time, char* out) {
    std::memcpy(out, "00/00/0000    00:00:00 AM    ", kTimePrefixSize);
    PutTwoDigits(out, time.month);
    PutTwoDigits(out + 3, time.day);
    PutTwoDigits(out + 6, time.year / 100u);
    PutTwoDigits(out + 8, time.year);
    PutTwoDigits(out + 14, time.hour);
    PutTwoDigits(out + 17, time.minute);
    PutTwoDigits(out + 20, time.second);
    if (time.hour >= 12) out[23] = 'P';
}

bool WriteTranscript(const CChatContentStorage& content, const WriteTranscriptBytes& write) {
    const std::unique_ptr<char[]> chunk(new char[kTranscriptChunkBytes]);
    std::memcpy(chunk.get(), kUtf8Bom, kUtf8BomSize);
    std::size_t used = kUtf8BomSize;
    const std::size_t count = content.GetTimeCount();
    for (std::size_t i = 0; i < count; ++i) {
        const std::string_view line = content.GetLineAtIndex(i);
        const std::size_t entrySize = kTimePrefixSize + line.size() + 1;
        if (used > 0 && used + entrySize > kTranscriptChunkBytes) {
            if (!write(chunk.get(), used)) return false;
            used = 0;
        }
        // Formatted in place, so each byte is copied once on its way to the file.
        char* const entry = chunk.get() + used;
        FormatTimePrefix(content.GetTimeAt(i), entry);
        if (entrySize <= kTranscriptChunkBytes) {
            if (!line.empty()) std::memcpy(entry + kTimePrefixSize, line.data(), line.size());
            entry[entrySize - 1] = '\n';
            used += entrySize;
        } else {
            if (!write(entry, kTimePrefixSize) || !write(line.data(), line.size())) return false;
            entry[0] = '\n';
            used = 1;
        }
    }
    return write(chunk.get(), used);
}

std::string FormatTranscript(const CChatContentStorage& content) {
    std::string out;
    WriteTranscript(content, [&out](const char* data, std::size_t size) {
        out.append(data, size);
        return true;
    });
    return out;
}

bool ParseTimePrefix(const char* data, std::size_t size, DateTimeRec* time) {
    return size >= kTimePrefixSize && ReadTimePrefix(data, time);
}

bool ParseTranscript(std::unique_ptr<char[]> bytes, std::size_t size, ContentBlock* content,
                     const ShowTranscriptText& show) {
    std::vector<DateTimeRec>& times = content->times;
    std::vector<std::string_view>& lines = content->lines;
    times.clear();
    lines.clear();
    const std::size_t entries = EstimatedEntries(bytes.get(), size);
    times.reserve(entries);
    lines.reserve(entries);

    // Each line is put together inside the file's own bytes. A line never starts after its
    // entry's prefix and every text added to it loses at least the LF before it, so bytes
    // are only ever moved towards the front, over bytes already read.
    char* const data = bytes.get();
    content->text = std::move(bytes);
    std::size_t lineAt = 0;   // where the last line starts
    std::size_t lineEnd = 0;  // where it ends, and where its next text goes
    // Adds bytes [from, from + size) to the last line and shows them as one text.
    const auto addText = [&](std::size_t from, std::size_t textSize) {
        if (from != lineEnd) std::memmove(data + lineEnd, data + from, textSize);
        Show(data, lineEnd, textSize, false, show);
        lineEnd += textSize;
    };

    std::size_t pos = SkipByteOrderMark(data, size);
    while (pos < size) {
        while (pos < size && data[pos] == '\n')
            ++pos;
        if (pos == size) break;

        // The time goes straight into its place and is taken back when the line is no entry.
        DateTimeRec& time = times.emplace_back();
        if (size - pos < kTimePrefixSize || !ReadTimePrefix(data + pos, &time)) {
            times.pop_back();
            // The first line must be an entry; any later one continues the entry before it,
            // joined to its line without the LF.
            if (lines.empty()) return false;
            const std::size_t end = LineEnd(data, pos, size);
            addText(pos, end - pos);
            lines.back() = std::string_view(data + lineAt, lineEnd - lineAt);
            pos = end + 1;
            continue;
        }

        // The header runs to the next TAB, which may lie on a later line. Without one the
        // entry is incomplete and is dropped, so times and lines stay paired. With one the
        // file is sure to open, so its texts are shown from here on.
        const std::size_t headerStart = pos + kTimePrefixSize;
        const void* tab = std::memchr(data + headerStart, '\t', size - headerStart);
        if (!tab) {
            times.pop_back();
            break;
        }
        const std::size_t tabAt = static_cast<std::size_t>(static_cast<const char*>(tab) - data);
        const std::size_t textStart = tabAt + 1;
        lineAt = StartLine(data, pos, tabAt - headerStart, &lineEnd);
        Show(data, lineAt, lineEnd - 1 - lineAt, true, show);
        if (textStart < size) {  // else nothing follows the TAB
            const std::size_t textEnd = LineEnd(data, textStart, size);
            addText(textStart, textEnd - textStart);
            pos = textEnd + 1;
        } else {
            pos = size;
        }
        lines.emplace_back(data + lineAt, lineEnd - lineAt);
    }
    return !lines.empty();
}
