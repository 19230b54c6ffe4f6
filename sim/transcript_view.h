// Reading the engine's transcript store the way the simulator reports it: one entry is a
// title (without its ":" and CR), a text (line breaks as \n) and a time.
#pragma once

#include <string>
#include <string_view>

#include "engine/chat_content_storage.h"

struct TranscriptEntry {
    std::string title;
    std::string text;
    std::string time;  // "hh:mm:ss", empty when the entry has no valid time
};

// The entry at index of the store.
TranscriptEntry ReadTranscriptEntry(const CChatContentStorage& store, std::size_t index);
