#include "api/window_bridge.h"

#include <cstdint>
#include <utility>

#include "platform/trace.h"

namespace {

ChatWindowFactory& Factory() {
    static ChatWindowFactory factory;
    return factory;
}

}  // namespace

void SetChatWindowFactory(ChatWindowFactory factory) {
    Factory() = std::move(factory);
}

int CreateUI(ChatUIHandle* retData, void* data, IChatCommSinkForChatUI* pSink) {
    MacInfoTrace2("Chat", "CreateUI, retData = 0x%x, data = 0x%x, pSink = 0x%x",
                  static_cast<unsigned>(reinterpret_cast<std::uintptr_t>(retData)),
                  static_cast<unsigned>(reinterpret_cast<std::uintptr_t>(data)),
                  static_cast<unsigned>(reinterpret_cast<std::uintptr_t>(pSink)));
    IChatWindow* window = Factory() ? Factory()() : nullptr;
    if (window) {
        window->SetSuperView(data);
        window->SetSink(pSink);
    }
    if (retData) *retData = window;
    return 0;
}

int DestoryUI(ChatUIHandle control) {
    MacInfoTrace2("Chat", "DestoryUI, control = 0x%x",
                  static_cast<unsigned>(reinterpret_cast<std::uintptr_t>(control)));
    if (!control) return 3;
    control->SetSink(nullptr);
    delete control;
    return 0;
}

int NotifyCocoaUI(ChatUIHandle control, int command, void* inParam, void* outParam) {
    if (!control) return 3;
    return control->HandleCommand(command, inParam, outParam);
}

void InstallCallback() {
    MacInfoTrace2("Chat", "InstallCallback");
}
