// The bytes of a transcript file: a UTF-8 byte-order mark, then one line per entry made of
// a 29-byte time prefix ("03/05/2009    09:03:07 AM    "), the entry's line and an LF.
#pragma once

#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

#include "engine/chat_content_storage.h"

// The mark every saved file starts with.
constexpr char kUtf8Bom[] = "\xEF\xBB\xBF";
constexpr std::size_t kUtf8BomSize = 3;
// Bytes of the time prefix in front of every entry.
constexpr std::size_t kTimePrefixSize = 29;
// Longest header (the text before an entry's TAB) kept when reading, its CR included.
constexpr std::size_t kMaxHeaderSize = 8191;

// How many of the size bytes at text fit within limit bytes without splitting a UTF-8
// character: all of them when they fit, else limit or fewer.
std::size_t Utf8FittingSize(const char* text, std::size_t size, std::size_t limit);

// Writes the time prefix of time into out (no terminator). The hour stays 00 to 23 and is
// followed by AM below 12 and PM from 12.
void FormatTimePrefix(const DateTimeRec& time, char* out);

// Takes the next bytes of a file being written; false stops the writing.
using WriteTranscriptBytes = std::function<bool(const char* data, std::size_t size)>;
// Bytes gathered before each call of a WriteTranscriptBytes.
constexpr std::size_t kTranscriptChunkBytes = 1024 * 1024;

// Passes the whole file for content to write, in order: the mark, then one entry per time,
// time i with line i. The bytes come in chunks of at most kTranscriptChunkBytes, except
// that a longer line comes by itself, straight from the store. True when every call of
// write returned true.
bool WriteTranscript(const CChatContentStorage& content, const WriteTranscriptBytes& write);

// The whole file for content, as WriteTranscript passes it.
std::string FormatTranscript(const CChatContentStorage& content);

// Reads a time prefix from the first kTimePrefixSize bytes of data. True when there are
// that many, the numbers are digits, day is 1-31, month 1-12, year above 0 and minute and
// second below 60; the separators and the hour's value are not examined.
bool ParseTimePrefix(const char* data, std::size_t size, DateTimeRec* time);

// Receives, in file order, each text an opened file shows: a title (the header ending in CR)
// or a message text. A NUL follows the text; both are valid only during the call.
using ShowTranscriptText = std::function<void(bool bTitle, std::string_view text)>;

// Parses the size bytes of a transcript file into content (which is cleared first), taking
// the bytes over; they must be followed by one spare byte. Each line is put together in place
// inside the bytes, so nothing is copied or allocated per entry. True when at least one entry
// was read. The first entry must have a valid prefix; a later line without one continues the
// entry before it; an entry whose header has no TAB after it is dropped. A stored line is
// header, CR, TAB, message and continuations. Texts are shown as they are read, from the
// first entry's TAB on, when the file is sure to open: a file that fails shows nothing.
bool ParseTranscript(std::unique_ptr<char[]> bytes, std::size_t size, ContentBlock* content,
                     const ShowTranscriptText& show);
