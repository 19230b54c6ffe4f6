#include "engine/transcript_format.h"

#include <algorithm>
#include <cstring>

namespace {

// Entries reserved ahead at most; bigger files grow their batch as they go.
constexpr std::size_t kMaxReserved = std::size_t{1} << 20;

// "00" to "99", so each two-digit field is one copy.
constexpr char kDigitPairs[] =
    "00010203040506070809101112131415161718192021222324252627282930313233343536373839"
    "40414243444546474849505152535455565758596061626364656667686970717273747576777879"
    "8081828384858687888990919293949596979899";

// Writes the last two decimal digits of value, so a field keeps its width.
void PutTwoDigits(char* out, unsigned value) {
    std::memcpy(out, kDigitPairs + 2 * (value % 100), 2);
}

bool ReadDigits(const char* in, int digits, std::uint16_t* value) {
    unsigned result = 0;
    for (int i = 0; i < digits; ++i) {
        const char c = in[i];
        if (c < '0' || c > '9') return false;
        result = result * 10 + static_cast<unsigned>(c - '0');
    }
    *value = static_cast<std::uint16_t>(result);
    return true;
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
    std::size_t kept = kMaxHeaderSize - 1;
    while (kept > 0 && (static_cast<unsigned char>(header[kept]) & 0xC0) == 0x80)
        --kept;
    return kept;
}

void AppendText(TranscriptBatch* batch, const char* text, std::size_t size) {
    const std::size_t entry = batch->lines.size() - 1;
    std::string& line = batch->lines[entry];
    batch->pieces.push_back(TranscriptPiece{false, entry, line.size(), size});
    line.append(text, size);
}

}  // namespace

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

void AppendTranscriptEntry(const DateTimeRec& time, const std::string& line, std::string& out) {
    char prefix[kTimePrefixSize];
    FormatTimePrefix(time, prefix);
    out.append(prefix, kTimePrefixSize);
    out.append(line);
    out.push_back('\n');
}

std::string FormatTranscript(const CChatContentStorage& content) {
    const std::size_t count = content.GetTimeCount();
    std::size_t total = kUtf8BomSize;
    for (std::size_t i = 0; i < count; ++i) {
        total += kTimePrefixSize + content.GetLineAtIndex(i).size() + 1;
    }
    std::string out;
    out.reserve(total);
    out.append(kUtf8Bom, kUtf8BomSize);
    for (std::size_t i = 0; i < count; ++i) {
        AppendTranscriptEntry(content.GetTimeAt(i), content.GetLineAtIndex(i), out);
    }
    return out;
}

bool ParseTimePrefix(const char* data, std::size_t size, DateTimeRec* time) {
    if (size < kTimePrefixSize) return false;
    DateTimeRec t{};
    if (!ReadDigits(data, 2, &t.month) || !ReadDigits(data + 3, 2, &t.day) ||
        !ReadDigits(data + 6, 4, &t.year) || !ReadDigits(data + 14, 2, &t.hour) ||
        !ReadDigits(data + 17, 2, &t.minute) || !ReadDigits(data + 20, 2, &t.second)) {
        return false;
    }
    if (t.day < 1 || t.day > 31 || t.month < 1 || t.month > 12 || t.year == 0 || t.minute >= 60 ||
        t.second >= 60) {
        return false;
    }
    t.valid = 1;
    *time = t;
    return true;
}

bool ParseTranscript(const char* data, std::size_t size, TranscriptBatch* batch) {
    batch->times.clear();
    batch->lines.clear();
    batch->pieces.clear();
    // Every entry takes at least its prefix and TAB, so this seldom falls short; what is
    // reserved beyond the entries read is never touched.
    const std::size_t mostEntries = std::min(size / (kTimePrefixSize + 1) + 1, kMaxReserved);
    batch->times.reserve(mostEntries);
    batch->lines.reserve(mostEntries);
    batch->pieces.reserve(2 * mostEntries);

    std::size_t pos = SkipByteOrderMark(data, size);
    while (pos < size) {
        while (pos < size && data[pos] == '\n')
            ++pos;
        if (pos == size) break;

        DateTimeRec time;
        if (!ParseTimePrefix(data + pos, size - pos, &time)) {
            // The first line must be an entry; any later one continues the entry before it.
            if (batch->lines.empty()) return false;
            const std::size_t end = LineEnd(data, pos, size);
            AppendText(batch, data + pos, end - pos);
            pos = end + 1;
            continue;
        }

        // The header runs to the next TAB, which may lie on a later line. Without one the
        // entry is incomplete and is dropped, so times and lines stay paired.
        const std::size_t headerStart = pos + kTimePrefixSize;
        const void* tab = std::memchr(data + headerStart, '\t', size - headerStart);
        if (!tab) break;
        const std::size_t tabAt = static_cast<std::size_t>(static_cast<const char*>(tab) - data);
        const char* header = data + headerStart;
        const std::size_t kept = KeptHeaderSize(header, tabAt - headerStart);
        const std::size_t textStart = tabAt + 1;
        const std::size_t textEnd = textStart < size ? LineEnd(data, textStart, size) : size;

        const std::size_t entry = batch->lines.size();
        batch->times.push_back(time);
        batch->lines.emplace_back();
        std::string& line = batch->lines.back();
        line.reserve(kept + 2 + (textEnd - textStart));
        line.append(header, kept);
        if (kept == 0 || header[kept - 1] != '\r') line.push_back('\r');
        batch->pieces.push_back(TranscriptPiece{true, entry, 0, line.size()});
        line.push_back('\t');

        if (textStart >= size) break;  // nothing follows the TAB
        AppendText(batch, data + textStart, textEnd - textStart);
        pos = textEnd + 1;
    }
    return !batch->lines.empty();
}
