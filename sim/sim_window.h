// What the simulator needs from a participant's chat window besides the bridge's commands:
// reading what the user sees and acting as the user would.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "api/window_bridge.h"

// One item of the send-to popup as the user sees it.
struct PopupItem {
    std::string title;  // full title; empty for a separator
    bool separator = false;
    bool enabled = true;
    bool selected = false;
    bool placeholder = false;  // the window's own "--- Please Select ---" item
};

class SimWindow : public IChatWindow {
public:
    virtual std::vector<PopupItem> Popup() const = 0;
    virtual bool InputEnabled() const = 0;
    virtual std::string InputText() const = 0;

    // The user types text into the input field (replacing what is there) and sends it;
    // false when the input field does not take text.
    virtual bool TypeAndSend(const std::string& text) = 0;
    // The user chooses the popup item at index; false when it cannot be chosen.
    virtual bool Choose(int index) = 0;
    // The user opens the attendee picker and confirms the attendee listed under name;
    // false when there is no picker entry or no such attendee.
    virtual bool PickAttendee(const std::string& name) = 0;
    // Closes an open attendee picker without a choice.
    virtual void CloseAttendeePicker() = 0;
    // Writes a picture of the window; false when this window cannot draw.
    virtual bool SavePicture(const std::string& path) = 0;
};
