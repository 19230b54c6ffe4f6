// Fuzz target for the transcript file parser: any bytes a user may open. Besides not
// crashing, what it reads must stay whole: the lines lie in order inside the file's bytes,
// each entry shows a bounded title ending in CR and texts that make up its line, and writing
// the entries back and reading them again gives the same entries.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>
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

// A heap copy of bytes with only the spare byte the parser needs after it, so reading
// further is reading past the allocation.
std::unique_ptr<char[]> CopyOf(const void* bytes, std::size_t size) {
    std::unique_ptr<char[]> copy(new char[size + 1]);
    if (size > 0) std::memcpy(copy.get(), bytes, size);
    return copy;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    // Every entry shows its title, bounded and ending in CR, and then texts that, with the
    // TAB after the title, make up exactly its line.
    std::vector<std::string> shown;
    ContentBlock content;
    const bool ok = ParseTranscript(
        CopyOf(data, size), size, &content, [&shown](bool bTitle, std::string_view text) {
            Check(text.data()[text.size()] == '\0');
            if (bTitle) {
                Check(!text.empty() && text.size() <= kMaxHeaderSize && text.back() == '\r');
                shown.emplace_back(text).push_back('\t');
            } else {
                Check(!shown.empty());
                shown.back().append(text);
            }
        });
    const std::vector<std::string_view>& lines = content.lines;
    Check(ok == !lines.empty());
    Check(content.times.size() == lines.size());
    const std::vector<std::string> expected(lines.begin(), lines.end());
    Check(shown == expected);
    if (!ok) return 0;

    // Every line lies inside the bytes, after the one before it.
    const char* const begin = content.text.get();
    const char* previousEnd = begin;
    for (const std::string_view line : lines) {
        Check(line.data() >= previousEnd && line.data() + line.size() <= begin + size);
        previousEnd = line.data() + line.size();
    }

    // Kept by the store and written back, the entries read back the same.
    const std::vector<DateTimeRec> times = content.times;
    CChatContentStorage store;
    store.AppendEntries(std::move(content));
    const std::string written = FormatTranscript(store);
    ContentBlock again;
    Check(ParseTranscript(CopyOf(written.data(), written.size()), written.size(), &again,
                          [](bool, std::string_view) {}));
    Check(std::vector<std::string>(again.lines.begin(), again.lines.end()) == expected);
    for (std::size_t i = 0; i < times.size(); ++i) {
        Check(SameTime(again.times[i], times[i]));
    }
    return 0;
}
