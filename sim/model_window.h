// A chat window without pixels: it keeps what a window shows (send-to popup, input field,
// transcript lines) from the engine's commands and acts for the user through the same events
// a real window raises. The simulator uses it where no toolkit window is available.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "sim/sim_window.h"

// Scripted answers for the window's save and open panels: true with a path, or false.
using PanelAnswer = std::function<bool(bool bSave, std::string* path)>;

class ModelWindow final : public SimWindow {
public:
    explicit ModelWindow(PanelAnswer answer) : m_answer(std::move(answer)) {}

    void SetSuperView(void*) override {}
    void SetSink(IChatCommSinkForChatUI* sink) override { m_pSink = sink; }
    int HandleCommand(int command, void* inParam, void* outParam) override;

    std::vector<PopupItem> Popup() const override;
    bool InputEnabled() const override { return m_bInputEnabled; }
    std::string InputText() const override { return m_strInput; }
    std::vector<std::string> TranscriptLines() const override { return m_transcript; }
    bool TypeAndSend(const std::string& text) override;
    bool Choose(int index) override;
    bool PickAttendee(const std::string& name) override;
    void CloseAttendeePicker() override;
    bool SavePicture(const std::string&) override { return false; }

private:
    struct Item {
        PopupItem shown;
        bool group = false;
    };

    // Tells the engine which item is selected (-1 while a selected user has left).
    void ReportSelection();
    // Selects index and reports it when it changes the selection.
    void SelectAndReport(int index);
    void RemoveAt(int index);
    void RemovePlaceholder();
    void AppendPlaceholder();
    int Count() const { return static_cast<int>(m_items.size()); }
    void Send(int message, void* param);

    PanelAnswer m_answer;
    IChatCommSinkForChatUI* m_pSink = nullptr;

    // The send-to popup.
    std::vector<Item> m_items;
    int m_nSelected = -1;
    bool m_bSelectedUserLeft = false;
    bool m_bPopupEnabled = true;
    bool m_bNoSendTo = false;

    // The input field and the transcript view.
    std::string m_strInput;
    bool m_bInputEnabled = true;
    std::vector<std::string> m_transcript;

    // The attendee picker while open: names and node ids as the engine listed them.
    bool m_bPickerOpen = false;
    std::vector<AttendeeRecord> m_attendees;
};
