#include "sim/transcript_view.h"

#include <cstdio>

TranscriptEntry ReadTranscriptEntry(const CChatContentStorage& store, std::size_t index) {
    TranscriptEntry entry;
    const std::string_view line = store.GetLineAtIndex(index);
    const std::size_t tab = line.find('\t');
    std::string_view title = line.substr(0, tab);
    // Line breaks travel as CR or CR LF; the simulator shows each as one \n.
    if (tab != std::string_view::npos) {
        const std::string_view text = line.substr(tab + 1);
        for (std::size_t i = 0; i < text.size(); ++i) {
            if (text[i] != '\r') {
                entry.text.push_back(text[i]);
                continue;
            }
            entry.text.push_back('\n');
            if (i + 1 < text.size() && text[i + 1] == '\n') ++i;
        }
    }
    if (!title.empty() && title.back() == '\r') title.remove_suffix(1);
    if (!title.empty() && title.back() == ':') title.remove_suffix(1);
    entry.title = std::string(title);
    const DateTimeRec time = store.GetTimeAt(index);
    if (time.valid) {
        char text[16];
        std::snprintf(text, sizeof(text), "%02u:%02u:%02u", time.hour % 100u, time.minute % 100u,
                      time.second % 100u);
        entry.time = text;
    }
    return entry;
}
