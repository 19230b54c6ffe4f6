// The window bridge: the only way the engine creates, drives and destroys its chat window.
// The window itself is made by a factory that a host (or a test) installs.
#pragma once

#include <functional>

#include "api/ui_protocol.h"

// The engine's face for window events.
class IChatCommSinkForChatUI {
public:
    virtual int HandleUIMessage(int message, void* iParam, void* oParam) = 0;

protected:
    ~IChatCommSinkForChatUI() = default;
};

// A chat window as the bridge drives it.
class IChatWindow {
public:
    virtual ~IChatWindow() = default;
    // The host view the window lives in (the start-up record's parent view).
    virtual void SetSuperView(void* view) = 0;
    // Where events go; null stops every event.
    virtual void SetSink(IChatCommSinkForChatUI* sink) = 0;
    // Carries out one command of the protocol; the result is what NotifyCocoaUI returns.
    virtual int HandleCommand(int command, void* inParam, void* outParam) = 0;
};

using ChatUIHandle = IChatWindow*;

// Makes a new window; may return null (the engine then runs without a window).
using ChatWindowFactory = std::function<IChatWindow*()>;

// Installs the factory CreateUI uses; an empty one means no window is made.
void SetChatWindowFactory(ChatWindowFactory factory);
// Installs the factory CreateUI uses until SetChatWindowFactory was called: the shared
// library's own window.
void SetDefaultChatWindowFactory(ChatWindowFactory factory);

// Creates the window, gives it the parent view and the sink, stores it in *retData. Returns 0.
int CreateUI(ChatUIHandle* retData, void* data, IChatCommSinkForChatUI* pSink);
// Clears the window's sink and destroys it; 3 for a null handle, else 0.
int DestoryUI(ChatUIHandle control);
// Delivers one command; 3 for a null handle, else the window's result.
int NotifyCocoaUI(ChatUIHandle control, int command, void* inParam, void* outParam);
// Only traces.
void InstallCallback();
