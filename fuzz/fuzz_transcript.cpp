// Fuzz target for the transcript file parser: any bytes a user may open. Besides not
// crashing, what it reads must stay whole: each entry shows a bounded title ending in CR and
// texts that make up its line, and writing the entries back and reading them again gives the
// same entries.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>
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

std::vector<std::string> Lines(const CChatContentStorage& content) {
    std::vector<std::string> lines;
    for (std::size_t i = 0; i < content.GetLineCount(); ++i)
        lines.emplace_back(content.GetLineAtIndex(i));
    return lines;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    // Every entry shows its title, bounded and ending in CR, and then texts that, with the
    // TAB after the title, make up exactly its line.
    std::vector<std::string> shown;
    CChatContentStorage content;
    const bool ok = ParseTranscript(
        std::string_view(reinterpret_cast<const char*>(data), size), &content,
        [&shown](bool bTitle, const std::string& text) {
            if (bTitle) {
                Check(!text.empty() && text.size() <= kMaxHeaderSize && text.back() == '\r');
                shown.emplace_back(text).push_back('\t');
            } else {
                Check(!shown.empty());
                shown.back().append(text);
            }
        });
    const std::vector<std::string> lines = Lines(content);
    Check(ok == !lines.empty());
    Check(content.GetTimeCount() == lines.size());
    Check(shown == lines);
    if (!ok) return 0;

    // Written back, the entries read back the same.
    const std::string written = FormatTranscript(content);
    CChatContentStorage again;
    Check(ParseTranscript(written, &again, [](bool, const std::string&) {}));
    Check(Lines(again) == lines);
    for (std::size_t i = 0; i < lines.size(); ++i) {
        Check(SameTime(again.GetTimeAt(i), content.GetTimeAt(i)));
    }
    return 0;
}
