// A host that records what the component tells it, in order: "sender: text @node" for an
// incoming line, "shown", and "modified 0/1" and "content 0/1" for the two flags.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "api/quintarachat.h"

struct HostRecorder final : IHostChatSink {
    void OnIncomingChat(const char* sender, const char* message, uint32_t nodeId) override {
        events.push_back(std::string(sender) + ": " + message + " @" + std::to_string(nodeId));
    }
    void OnChatShown() override { events.push_back("shown"); }
    void OnChatModified(bool on) override { events.push_back(on ? "modified 1" : "modified 0"); }
    void OnChatContentChanged(bool on) override {
        events.push_back(on ? "content 1" : "content 0");
    }
    std::vector<std::string> events;
};
