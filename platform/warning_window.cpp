#include "platform/warning_window.h"

#include <utility>

#include "platform/trace.h"

namespace {

struct Presenter {
    WarningPresenter show;
    WarningCloser close;
};

Presenter& Current() {
    static Presenter presenter;
    return presenter;
}

}  // namespace

void SetWarningPresenter(WarningPresenter show, WarningCloser close) {
    Current() = Presenter{std::move(show), std::move(close)};
}

void ShowWarningWindow2(const char* title, const char* message) {
    const char* safeTitle = title ? title : "";
    const char* safeMessage = message ? message : "";
    // A copy, so a presenter that replaces itself while showing stays alive until it returns.
    const WarningPresenter show = Current().show;
    if (show) {
        show(safeTitle, safeMessage);
    } else {
        MacWarnTrace2("Chat", "warning \"%s\": %s", safeTitle, safeMessage);
    }
}

void CloseWarningWindow2() {
    const WarningCloser close = Current().close;
    if (close) close();
}
