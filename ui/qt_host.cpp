#include "ui/qt_host.h"

#include <QApplication>
#include <QThread>

#include "platform/func_trace.h"
#include "ui/my_chat_controller.h"
#include "ui/qt_run_loop.h"
#include "ui/sound_player.h"
#include "ui/warning_box.h"

IChatWindow* MakeQtChatWindow() {
    if (qobject_cast<QApplication*>(QCoreApplication::instance())) return new MyChatController;
    static bool told = false;
    if (!told) {
        MacWarnTrace2(kChatTag, "no QApplication exists: the chat runs without a window");
        told = true;
    }
    return nullptr;
}

RunLoop* QtApplicationRunLoop() {
    QCoreApplication* app = QCoreApplication::instance();
    if (!app || QThread::currentThread() != app->thread()) return nullptr;
    // One loop per application, gone with it.
    static QtRunLoop* loop = nullptr;
    if (!loop) {
        loop = new QtRunLoop(app->thread());
        QObject::connect(app, &QObject::destroyed, [] {
            if (RunLoop::Current() == loop) RunLoop::SetCurrent(nullptr);
            delete loop;
            loop = nullptr;
        });
    }
    return loop;
}

void InstallQtHostDefaults() {
    SetDefaultChatWindowFactory(MakeQtChatWindow);
    RunLoop::SetToolkitLoopFinder(QtApplicationRunLoop);
    InstallQtWarningBox();
    InstallQtSoundPlayer();
}
