// The Qt stand-ins of the host's services: run loop, warning box and modal panels.
#include <gtest/gtest.h>

#include <QApplication>
#include <QDir>
#include <QFileDialog>
#include <QFileInfo>
#include <QMessageBox>
#include <QTest>
#include <QTimer>
#include <thread>

#include "platform/sound.h"
#include "platform/trace.h"
#include "platform/warning_window.h"
#include "tests/ui/window_fixture.h"
#include "ui/chat_panels.h"
#include "ui/qt_run_loop.h"
#include "ui/sound_player.h"
#include "ui/warning_box.h"

namespace {

TEST(QtRunLoop, PostsFromAnyThreadAndTimersRunLaterOnTheLoopThreadUntilCancelled) {
    QtRunLoop loop;
    std::vector<int> order;
    std::thread::id ranOn;
    loop.Post([&] { order.push_back(1); });
    std::thread poster([&] {
        loop.Post([&] {
            order.push_back(2);
            ranOn = std::this_thread::get_id();
        });
    });
    poster.join();
    int once = 0;
    int repeats = 0;
    loop.AddTimer(0.001, 0, [&] { ++once; });
    RunLoop::TimerId id = 0;
    id = loop.AddTimer(0.002, 0.001, [&] {
        if (++repeats == 3) loop.CancelTimer(id);
    });
    loop.CancelTimer(loop.AddTimer(0.001, 0, [] { FAIL() << "cancelled timer fired"; }));
    EXPECT_TRUE(order.empty());
    ASSERT_TRUE(QTest::qWaitFor([&] { return order.size() == 2 && repeats >= 3 && once == 1; }));
    bool settled = false;  // no firing is left over afterwards
    QTimer::singleShot(20, [&settled] { settled = true; });
    ASSERT_TRUE(QTest::qWaitFor([&settled] { return settled; }));
    EXPECT_EQ(order, (std::vector<int>{1, 2}));
    EXPECT_EQ(ranOn, std::this_thread::get_id());
    EXPECT_EQ(once, 1);
    EXPECT_EQ(repeats, 3);
    EXPECT_EQ(loop.TimerCount(), 0u);
}

TEST(QtWarningBox, ShowsModallyUntilClosed) {
    InstallQtWarningBox();
    QString shownText;
    QTimer::singleShot(10, [&] {
        for (QWidget* widget : QApplication::topLevelWidgets())
            if (auto* box = qobject_cast<QMessageBox*>(widget); box && box->isVisible())
                shownText = box->windowTitle() + "|" + box->text();
        CloseWarningWindow2();
    });
    ShowWarningWindow2("Korvo Chat", "<b>No</b> markup");
    EXPECT_EQ(shownText, "Korvo Chat|<b>No</b> markup");
    SetWarningPresenter(nullptr);
}

TEST_F(WindowTest, SavePanelRunsUntilConfirmedOrAbortedByTheEngine) {
    std::int32_t confirmed = -1;
    std::string path = "unchanged";
    QTimer::singleShot(10, [this] { Command(msg_CloseAllDialogs); });
    Command(msg_SaveChatPanel, &confirmed, &path);
    EXPECT_EQ(confirmed, 0);
    EXPECT_EQ(path, "unchanged");

    QString title;
    QTimer::singleShot(10, [&] {
        for (QWidget* widget : QApplication::topLevelWidgets())
            if (auto* dialog = qobject_cast<QFileDialog*>(widget); dialog && dialog->isVisible()) {
                title = dialog->windowTitle();
                static_cast<QDialog*>(dialog)->accept();
            }
    });
    Command(msg_SaveChatPanel, &confirmed, &path);
    EXPECT_EQ(title, "Save Chat As");
    EXPECT_EQ(confirmed, 1);
    EXPECT_EQ(QFileInfo(QString::fromStdString(path)).fileName(), "Chat.txt");
}

void WriteFile(const QString& path, const QByteArray& bytes) {
    QFile file(path);
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    file.write(bytes);
}

TEST(QtSound, PlaysWavFilesAndRefusesTheRestWithALogLine) {
    std::vector<std::string> warnings;
    SetTraceSink([&warnings](TraceLevel level, const char*, const char* text) {
        if (level == TraceLevel::Warn) warnings.push_back(text);
    });
    const QString dir = QDir::tempPath() + "/quintara-sound-test";
    QDir().mkpath(dir);
    // A short silent WAV file: 800 samples, mono, 16 bits at 8000 Hz.
    WriteFile(dir + "/ding.wav",
              QByteArray::fromHex("524946466406000057415645666d74201000000001000100401f0000803e0000"
                                  "020010006461746140060000") +
                  QByteArray(1600, '\0'));
    WriteFile(dir + "/notes.txt", "not a sound");

    // No audio device is needed: playing is asked for and nothing fails.
    InstallQtSoundPlayer();
    KVOPlaySoundFile((dir + "/ding.wav").toUtf8().constData());
    QApplication::processEvents();
    EXPECT_TRUE(warnings.empty());
    EXPECT_FALSE(PlayWavFile((dir + "/missing.wav").toUtf8().constData()));
    EXPECT_FALSE(PlayWavFile((dir + "/notes.txt").toUtf8().constData()));
    EXPECT_EQ(warnings.size(), 2u);
    SetSoundPlayer(nullptr);
    SetTraceSink([](TraceLevel, const char*, const char*) {});
    QDir(dir).removeRecursively();
}

}  // namespace
