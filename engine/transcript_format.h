// The bytes of a transcript file: a UTF-8 byte-order mark, then one line per entry made of
// a 29-byte time prefix ("03/05/2009    09:03:07 AM    "), the entry's line and an LF.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "engine/chat_content_storage.h"

// The mark every saved file starts with.
constexpr char kUtf8Bom[] = "\xEF\xBB\xBF";
constexpr std::size_t kUtf8BomSize = 3;
// Bytes of the time prefix in front of every entry.
constexpr std::size_t kTimePrefixSize = 29;
// Longest header (the text before an entry's TAB) kept when reading, its CR included.
constexpr std::size_t kMaxHeaderSize = 8191;

// Writes the time prefix of time into out (no terminator). The hour stays 00 to 23 and is
// followed by AM below 12 and PM from 12.
void FormatTimePrefix(const DateTimeRec& time, char* out);

// Appends one entry as it stands in a file: prefix, line, LF.
void AppendTranscriptEntry(const DateTimeRec& time, const std::string& line, std::string& out);

// The whole file for content: the mark, then one entry per time, time i with line i.
std::string FormatTranscript(const CChatContentStorage& content);

// Reads a time prefix from the first kTimePrefixSize bytes of data. True when there are
// that many, the numbers are digits, day is 1-31, month 1-12, year above 0 and minute and
// second below 60; the separators and the hour's value are not examined.
bool ParseTimePrefix(const char* data, std::size_t size, DateTimeRec* time);

// One text an opened file shows, in file order: a title (the header ending in CR) or a
// message text, taken as bytes [offset, offset + size) of the line of entry `entry`.
struct TranscriptPiece {
    bool bTitle;
    std::size_t entry;
    std::size_t offset;
    std::size_t size;
};

// What a transcript file holds: whole entries (times[i] with lines[i]) and what to show.
struct TranscriptBatch {
    std::vector<DateTimeRec> times;
    std::vector<std::string> lines;
    std::vector<TranscriptPiece> pieces;
};

// Parses the bytes of a transcript file into batch (which is cleared first). True when at
// least one entry was read. The first entry must have a valid prefix; a later line without
// one continues the entry before it; an entry whose header has no TAB after it is dropped.
// A stored line is header, CR, TAB, message and continuations.
bool ParseTranscript(const char* data, std::size_t size, TranscriptBatch* batch);
