// A chat window for engine tests: records every command with its decoded payload and
// answers what a user would type or pick. Install it with RecordingWindow::Install(); with
// answerBack it also reports the selection from inside SetSink, 2303, 2305 and 2306 as a real
// window does, re-entering the engine before the command returns.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "api/window_bridge.h"
#include "engine/menu_status.h"

struct RecordedCommand {
    int id = 0;
    std::string name;           // protocol name, e.g. "msg_ShowText"
    std::string text;           // 2200/2201 text, 2304 title, 2602/2603 path
    std::int32_t index = -2;    // 2301 position (-1 = append), 2302..2307 index, 2103 flag,
                                // 5001 reported index
    MenuStatus entry;           // 2301, 2307
    MenuStatusList menu;        // 2400
    AttendeeRecord attendee{};  // 2604
};

class RecordingWindow final : public IChatWindow {
public:
    RecordingWindow() : m_bAnswerBack(s_answerBack) { s_pLatest = this; }
    ~RecordingWindow() override {
        if (s_pLatest == this) s_pLatest = nullptr;
    }

    // Makes CreateUI build RecordingWindow objects from now on; Latest() is the newest one.
    // With answerBack they report selections (5001) back to the engine, recorded in order.
    static void Install(bool answerBack = false) {
        s_answerBack = answerBack;
        SetChatWindowFactory([] { return new RecordingWindow; });
    }
    // Makes CreateUI build no window at all.
    static void Uninstall() { SetChatWindowFactory(nullptr); }
    // The window made most recently and still alive, or null.
    static RecordingWindow* Latest() { return s_pLatest; }

    void SetSuperView(void* view) override { m_pSuperView = view; }
    void SetSink(IChatCommSinkForChatUI* sink) override;
    int HandleCommand(int command, void* inParam, void* outParam) override;

    // What the window answers.
    std::string inputText;             // 2500
    std::int32_t dialogConfirmed = 0;  // 2600 / 2601
    std::string dialogPath;            // 2600 / 2601
    std::int32_t warningShowing = 0;   // 2606

    const std::vector<RecordedCommand>& Commands() const { return m_commands; }
    // The ids alone, in order.
    std::vector<int> Ids() const { return IdsSince(0); }
    // Ids from the given position on.
    std::vector<int> IdsSince(std::size_t first) const;
    void Clear() { m_commands.clear(); }
    IChatCommSinkForChatUI* Sink() const { return m_pSink; }
    void* SuperView() const { return m_pSuperView; }

private:
    static inline RecordingWindow* s_pLatest = nullptr;
    static inline bool s_answerBack = false;  // what the next window is made with
    // Sends 5001 with the index to the engine and records that it did.
    void ReportSelection(std::int32_t index);

    std::vector<RecordedCommand> m_commands;
    // What a real window keeps to decide what it reports.
    bool m_bAnswerBack = false;
    std::int32_t m_selectedIndex = 0;
    bool m_bSelectedUserLeft = false;
    IChatCommSinkForChatUI* m_pSink = nullptr;
    void* m_pSuperView = nullptr;
};
