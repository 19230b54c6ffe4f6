// The bytes of a transcript file: a UTF-8 byte-order mark, then one line per entry made of
// a 29-byte time prefix ("03/05/2009    09:03:07 AM    "), the entry's line and an LF.
#pragma once

#include <cstddef>
#include <functional>
#include <string>
#include <string_view>

#include "engine/chat_content_storage.h"

// The mark every saved file starts with.
constexpr std::string_view kUtf8Bom = "\xEF\xBB\xBF";
// Bytes of the time prefix in front of every entry.
constexpr std::size_t kTimePrefixSize = 29;
// Longest header (the text before an entry's TAB) kept when reading, its CR included.
constexpr std::size_t kMaxHeaderSize = 8191;

// How many bytes of text fit within limit bytes without splitting a UTF-8 character: all
// of them when they fit, else limit or fewer.
std::size_t Utf8FittingSize(std::string_view text, std::size_t limit);

// The whole file for content: the mark, then one entry per time, time i with line i. Every
// number keeps its width (the year four digits, the others two), and the hour is followed by
// AM below 12 and PM from 12.
std::string FormatTranscript(const CChatContentStorage& content);

// Reads a time prefix from the start of data. True when it holds kTimePrefixSize bytes, the
// date, minute and second are digits, day is 1-31, month 1-12, year above 0 and minute and
// second below 60. The separators are not examined and neither is the hour: it is kept when
// both its bytes are digits, else it is 0.
bool ParseTimePrefix(std::string_view data, DateTimeRec* time);

// Receives, in file order, each text an opened file shows: a title (the header ending in CR)
// or a message text.
using ShowTranscriptText = std::function<void(bool bTitle, const std::string& text)>;

// Parses the bytes of a transcript file into content (which is cleared first). True when at
// least one entry was read. The first entry must have a valid prefix; a later line without
// one continues the entry before it; an entry whose header has no TAB after it is dropped. A
// stored line is header, CR, TAB, message and continuations. Texts are shown as they are
// read, from the first entry's TAB on, when the file is sure to open: a file that fails shows
// nothing.
bool ParseTranscript(std::string_view data, CChatContentStorage* content,
                     const ShowTranscriptText& show);
