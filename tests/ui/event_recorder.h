// The engine's side of the window for tests: records every event the window raises with its
// decoded value, and may answer an event by calling back into the window.
#pragma once

#include <cstdint>
#include <functional>
#include <vector>

#include "api/window_bridge.h"

struct RecordedEvent {
    int id;
    std::int64_t value;  // 5001/5002: the int; 5003: the node id; 5000: 0
    bool operator==(const RecordedEvent& other) const {
        return id == other.id && value == other.value;
    }
};

class EventRecorder final : public IChatCommSinkForChatUI {
public:
    int HandleUIMessage(int message, void* iParam, void*) override {
        std::int64_t value = 0;
        if (iParam && message == msg_AttendeeSelected) {
            value = *static_cast<std::uint32_t*>(iParam);
        } else if (iParam) {
            value = *static_cast<std::int32_t*>(iParam);
        }
        events.push_back({message, value});
        if (onEvent) onEvent(message, value);
        return 0;
    }

    std::vector<RecordedEvent> events;
    std::function<void(int id, std::int64_t value)> onEvent;
};
