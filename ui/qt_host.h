// What the component finds by itself in a Qt application: the application's run loop when no
// loop is current, its Qt window, the warning box and the incoming-chat sound.
#pragma once

class IChatWindow;
class RunLoop;

// Installs the Qt defaults; a host or a test may still replace each of them.
void InstallQtHostDefaults();

// The Qt window when a QApplication exists; otherwise null, said once in the log.
IChatWindow* MakeQtChatWindow();

// The run loop of the Qt application's thread when called on that thread, else null.
RunLoop* QtApplicationRunLoop();
