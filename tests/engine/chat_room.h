// Several chat engines in one in-process conference on one virtual clock, each behind a
// recording window: who types what to which audience, and what each transcript then shows.
#pragma once

#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "engine/chat_client.h"
#include "platform/inproc_conference.h"
#include "platform/telemetry.h"
#include "platform/virtual_run_loop.h"
#include "tests/support/recording_window.h"

namespace chatroom {

// The start record of a participant on a conference, through client (may be null).
inline _tagChatData StartRecord(IArmClient* client, std::uint16_t conferenceId,
                                std::uint32_t sessionId, const char* name, std::uint32_t node,
                                std::int32_t meetingType) {
    _tagChatData data{};
    data.pArmClient = client;
    data.wConferenceID = conferenceId;
    data.dwSessionID = sessionId;
    data.lpszUserName = name;
    data.dwNodeID = node;
    data.lMeetingType = meetingType;
    return data;
}

// Reported telemetry actions, collected while the object lives.
struct TelemetryCapture {
    TelemetryCapture() {
        SetTelemetrySink([this](int id) { actions.push_back(id); });
    }
    ~TelemetryCapture() { SetTelemetrySink(nullptr); }
    std::vector<int> actions;
};

// A participant: its name, its node and the ROLE_* bits the host gives before the start.
struct Person {
    const char* name;
    std::uint32_t node, roles;
};

// One participant: its engine, the window it made and its service object.
struct Member {
    Person person{};
    CChatClient engine;
    RecordingWindow* window = nullptr;
    InProcessArmClient* client = nullptr;
};

class ChatRoom {
public:
    // features go to every member before it starts.
    explicit ChatRoom(std::int32_t meetingType, std::uint32_t features = 0)
        : m_meetingType(meetingType), m_features(features) {
        RecordingWindow::Install();
    }
    ~ChatRoom() { RecordingWindow::Uninstall(); }

    // Starts a participant and runs the conference until it is enrolled and subscribed.
    Member& Join(const Person& person, IHostChatSink* hostSink = nullptr);
    // Names host and presenter to everybody and runs the start-up ticks.
    void SetHostAndPresenter(std::uint32_t hostNode, std::uint32_t presenterNode);
    // Types text and sends it to the group's entry, or (groupId -1) to the node's entry,
    // making the entry first when the menu rules have not.
    void Say(Member& from, const std::string& text, std::int32_t groupId, std::uint32_t node = 0);
    // Selects the entry at index through the window's event; false when there is none.
    bool Select(Member& from, std::int32_t groupId, std::uint32_t node = 0);
    // Transcript lines as "title|text" (the title without its ":" and CR).
    static std::vector<std::string> Transcript(const Member& member);
    // Names of the members whose transcript ends with the line.
    std::vector<std::string> Holders(const std::string& line) const;
    void Run() { loop.RunUntilIdle(); }

    // Runs on every member's engine before it starts (a host's configuration).
    std::function<void(CChatClient&)> beforeStart;

    VirtualRunLoop loop;
    ScopedCurrentRunLoop current{&loop};
    InProcessConference conference;
    std::deque<std::unique_ptr<Member>> members;

private:
    std::int32_t m_meetingType;
    std::uint32_t m_features;
};

}  // namespace chatroom
