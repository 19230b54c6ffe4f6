// A participant's real chat window, offscreen or on screen, in its own host view, with the
// reading and acting the simulator needs.
#pragma once

#include <QWidget>
#include <memory>

#include "sim/sim_window.h"

class MyChatController;

class QtSimWindow final : public SimWindow {
public:
    // title names the host view's window (shown with --gui).
    explicit QtSimWindow(const QString& title);
    ~QtSimWindow() override;

    // The window always lives in its own host view.
    void SetSuperView(void*) override;
    void SetSink(IChatCommSinkForChatUI* sink) override;
    int HandleCommand(int command, void* inParam, void* outParam) override;

    std::vector<PopupItem> Popup() const override;
    bool InputEnabled() const override;
    std::string InputText() const override;
    bool TypeAndSend(const std::string& text) override;
    bool Choose(int index) override;
    bool PickAttendee(const std::string& name) override;
    void CloseAttendeePicker() override;
    bool SavePicture(const std::string& path) override;

    QWidget& HostView() { return m_host; }

private:
    QWidget m_host;
    std::unique_ptr<MyChatController> m_controller;
};
