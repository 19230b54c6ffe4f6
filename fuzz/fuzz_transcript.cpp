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
    Check(ok == !batch.lines.empty());
    Check(batch.times.size() == batch.lines.size());
    if (!ok) return 0;

    for (const TranscriptPiece& piece : batch.pieces) {
        Check(piece.entry < batch.lines.size());
        const std::string& line = batch.lines[piece.entry];
        Check(piece.offset <= line.size() && piece.size <= line.size() - piece.offset);
        if (piece.bTitle) {
            Check(piece.offset == 0 && piece.size >= 1 && piece.size <= kMaxHeaderSize);
            Check(line[piece.size - 1] == '\r' && line[piece.size] == '\t');
        }
    }

    CChatContentStorage content;
    std::vector<DateTimeRec> times = batch.times;
    std::vector<std::string> lines = batch.lines;
    content.AppendEntries(std::move(times), std::move(lines));
    const std::string written = FormatTranscript(content);
    TranscriptBatch again;
    Check(ParseTranscript(written.data(), written.size(), &again));
    Check(again.lines == batch.lines);
    for (std::size_t i = 0; i < batch.times.size(); ++i) {
        Check(SameTime(again.times[i], batch.times[i]));
    }
    return 0;
}
