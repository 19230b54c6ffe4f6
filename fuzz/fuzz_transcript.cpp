// Fuzz target for the transcript file parser: any bytes a user may open. Besides not
// crashing, what it reads must stay whole: every shown piece lies inside its entry's line,
// every title is bounded and ends in CR, and writing the entries back and reading them
// again gives the same entries.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <utility>
#include <vector>

#include "engine/chat_content_storage.h"
#include "engine/transcript_format.h"

namespace {

void Check(bool condition) {
    if (!condition) std::abort();
}

bool SameTime(const DateTimeRec& a, const DateTimeRec& b) {
    return a.year == b.year && a.month == b.month && a.day == b.day && a.hour == b.hour &&
           a.minute == b.minute && a.second == b.second;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    TranscriptBatch batch;
    const bool ok = ParseTranscript(reinterpret_cast<const char*>(data), size, &batch);
    Check(ok == !batch.entries.empty());
    if (!ok) return 0;

    for (const TranscriptPiece& piece : batch.pieces) {
        Check(piece.entry < batch.entries.size());
        const std::string& line = batch.entries[piece.entry].line;
        Check(piece.offset <= line.size() && piece.size <= line.size() - piece.offset);
        if (piece.bTitle) {
            Check(piece.offset == 0 && piece.size >= 1 && piece.size <= kMaxHeaderSize);
            Check(line[piece.size - 1] == '\r' && line[piece.size] == '\t');
        }
    }

    CChatContentStorage content;
    std::vector<ChatEntry> entries = batch.entries;
    content.AppendEntries(std::move(entries));
    const std::string written = FormatTranscript(content);
    TranscriptBatch again;
    Check(ParseTranscript(written.data(), written.size(), &again));
    Check(again.entries.size() == batch.entries.size());
    for (std::size_t i = 0; i < batch.entries.size(); ++i) {
        Check(again.entries[i].line == batch.entries[i].line);
        Check(SameTime(again.entries[i].time, batch.entries[i].time));
    }
    return 0;
}
