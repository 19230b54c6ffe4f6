// The shared library in a real host: when it is loaded it makes itself at home in a Qt
// application (its loop, window, warning box and sound), as far as one exists.
#include "ui/qt_host.h"

namespace {

[[maybe_unused]] const bool g_qtDefaults = (InstallQtHostDefaults(), true);

}  // namespace
