#include "api/window_bridge.h"

#include <cstdint>
#include <utility>

#include "platform/func_trace.h"

namespace {

struct Factories {
    ChatWindowFactory installed;
    bool isInstalled = false;
    ChatWindowFactory fallback;
};

Factories& Installed() {
    static Factories factories;
    return factories;
}

const ChatWindowFactory& Factory() {
    const Factories& factories = Installed();
    return factories.isInstalled ? factories.installed : factories.fallback;
}

// An address as the traces print it.
unsigned Hex(const void* address) {
    return static_cast<unsigned>(reinterpret_cast<std::uintptr_t>(address));
}

}  // namespace

void SetChatWindowFactory(ChatWindowFactory factory) {
    Installed().installed = std::move(factory);
    Installed().isInstalled = true;
}

void SetDefaultChatWindowFactory(ChatWindowFactory factory) {
    Installed().fallback = std::move(factory);
}

int CreateUI(ChatUIHandle* retData, void* data, IChatCommSinkForChatUI* pSink) {
    CFuncTrace trace("CreateUI, retData = 0x%x, data = 0x%x, pSink = 0x%x", Hex(retData), Hex(data),
                     Hex(pSink));
    IChatWindow* window = Factory() ? Factory()() : nullptr;
    if (window) {
        window->SetSuperView(data);
        window->SetSink(pSink);
    }
    if (retData) *retData = window;
    return 0;
}

int DestoryUI(ChatUIHandle control) {
    CFuncTrace trace("DestoryUI, control = 0x%x", Hex(control));
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
    CFuncTrace trace("InstallCallback");
}
