// The host's modal warning box: a title and a message the user dismisses. The window host
// installs a real box; by default a warning becomes a log line.
#pragma once

#include <functional>

// Shows one warning and returns when it is dismissed.
using WarningPresenter = std::function<void(const char* title, const char* message)>;
// Dismisses the warning that is showing, if any.
using WarningCloser = std::function<void()>;

// Installs how warnings are shown and closed; empty functions restore the defaults
// (a warning log line, and nothing to close).
void SetWarningPresenter(WarningPresenter show, WarningCloser close = nullptr);

// Shows a warning titled title with message; null texts count as empty.
void ShowWarningWindow2(const char* title, const char* message);
// Closes the warning that is showing, if any.
void CloseWarningWindow2();
