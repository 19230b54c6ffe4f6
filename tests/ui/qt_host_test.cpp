// What the shared library finds by itself in a Qt application.
#include <gtest/gtest.h>

#include <QApplication>
#include <QWidget>
#include <memory>
#include <thread>

#include "api/window_bridge.h"
#include "platform/run_loop.h"
#include "ui/qt_host.h"

namespace {

TEST(QtHost, FindsTheApplicationLoopOnItsThreadOnlyAndMakesTheQtWindowByDefault) {
    RunLoop::SetToolkitLoopFinder(QtApplicationRunLoop);
    ASSERT_EQ(RunLoop::Current(), nullptr);
    RunLoop* loop = RunLoop::FindCurrent();
    ASSERT_NE(loop, nullptr);
    EXPECT_EQ(RunLoop::Current(), loop);
    RunLoop* elsewhere = loop;
    std::thread other([&elsewhere] { elsewhere = RunLoop::FindCurrent(); });
    other.join();
    EXPECT_EQ(elsewhere, nullptr);
    RunLoop::SetCurrent(nullptr);
    RunLoop::SetToolkitLoopFinder(nullptr);
    EXPECT_EQ(RunLoop::FindCurrent(), nullptr);

    // The default window factory makes the Qt window in the parent view.
    SetDefaultChatWindowFactory(MakeQtChatWindow);
    QWidget parent;
    ChatUIHandle window = nullptr;
    CreateUI(&window, &parent, nullptr);
    ASSERT_NE(window, nullptr);
    EXPECT_EQ(parent.findChildren<QWidget*>("chatui").size(), 1);
    DestoryUI(window);
    EXPECT_TRUE(parent.findChildren<QWidget*>("chatui").isEmpty());
    SetDefaultChatWindowFactory(nullptr);
}

}  // namespace
