#include "engine/transcript_format.h"

#include <cstring>
#include <utility>

namespace {

// Writes value as digits decimal digits with leading zeros; higher digits are dropped so
// the prefix keeps its width.
void PutDigits(char* out, unsigned value, int digits) {
    for (int i = digits - 1; i >= 0; --i) {
        out[i] = static_cast<char>('0' + value % 10);
        value /= 10;
    }
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
    const std::size_t entry = batch->entries.size() - 1;
    std::string& line = batch->entries[entry].line;
    batch->pieces.push_back(TranscriptPiece{false, entry, line.size(), size});
    line.append(text, size);
}

}  // namespace

void FormatTimePrefix(const DateTimeRec& time, char* out) {
    PutDigits(out, time.month, 2);
    out[2] = '/';
    PutDigits(out + 3, time.day, 2);
    out[5] = '/';
    PutDigits(out + 6, time.year, 4);
    std::memset(out + 10, ' ', 4);
    PutDigits(out + 14, time.hour, 2);
    out[16] = ':';
    PutDigits(out + 17, time.minute, 2);
    out[19] = ':';
    PutDigits(out + 20, time.second, 2);
    out[22] = ' ';
    out[23] = time.hour < 12 ? 'A' : 'P';
    out[24] = 'M';
    std::memset(out + 25, ' ', 4);
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
    batch->entries.clear();
    batch->pieces.clear();
    std::size_t pos = SkipByteOrderMark(data, size);
    while (pos < size) {
        while (pos < size && data[pos] == '\n')
            ++pos;
        if (pos == size) break;

        DateTimeRec time;
        if (!ParseTimePrefix(data + pos, size - pos, &time)) {
            // The first line must be an entry; any later one continues the entry before it.
            if (batch->entries.empty()) return false;
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

        ChatEntry entry{time, std::string()};
        entry.line.reserve(kept + 2 + (textEnd - textStart));
        entry.line.append(header, kept);
        if (kept == 0 || header[kept - 1] != '\r') entry.line.push_back('\r');
        batch->pieces.push_back(TranscriptPiece{true, batch->entries.size(), 0, entry.line.size()});
        entry.line.push_back('\t');
        batch->entries.push_back(std::move(entry));

        if (textStart >= size) break;  // nothing follows the TAB
        AppendText(batch, data + textStart, textEnd - textStart);
        pos = textEnd + 1;
    }
    return !batch->entries.empty();
}
