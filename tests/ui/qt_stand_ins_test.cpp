// The Qt stand-ins of the host's services: run loop, warning box and modal panels.
#include <gtest/gtest.h>

#include <QApplication>
#include <QDataStream>
#include <QDir>
#include <QElapsedTimer>
#include <QFileDialog>
#include <QFileInfo>
#include <QMessageBox>
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

// Runs Qt events until done() or about two seconds passed.
template <typename Done>
void RunUntil(Done done) {
    QElapsedTimer clock;
    clock.start();
    while (!done() && clock.elapsed() < 2000)
        QApplication::processEvents(QEventLoop::AllEvents, 5);
}

TEST(QtRunLoop, PostsFromAnyThreadRunLaterOnTheLoopThread) {
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
    EXPECT_TRUE(order.empty());
    RunUntil([&] { return order.size() == 2; });
    EXPECT_EQ(order, (std::vector<int>{1, 2}));
    EXPECT_EQ(ranOn, std::this_thread::get_id());
}

TEST(QtRunLoop, TimersRepeatUntilCancelledFromTheirOwnTask) {
    QtRunLoop loop;
    int once = 0;
    int repeats = 0;
    loop.AddTimer(0.001, 0, [&] { ++once; });
    RunLoop::TimerId id = 0;
    id = loop.AddTimer(0.002, 0.001, [&] {
        if (++repeats == 3) loop.CancelTimer(id);
    });
    const RunLoop::TimerId never =
        loop.AddTimer(0.001, 0, [] { FAIL() << "cancelled timer fired"; });
    loop.CancelTimer(never);
    loop.CancelTimer(9999);
    RunUntil([&] { return repeats >= 3 && once == 1; });
    bool settled = false;  // no firing is left over afterwards
    QTimer::singleShot(20, [&settled] { settled = true; });
    RunUntil([&settled] { return settled; });
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

}  // namespace

namespace {

// A short silent mono WAV file at path.
void WriteSilentWav(const QString& path) {
    QFile file(path);
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    const quint32 samples = 800;
    QByteArray data;
    QDataStream out(&data, QIODevice::WriteOnly);
    out.setByteOrder(QDataStream::LittleEndian);
    out.writeRawData("RIFF", 4);
    out << quint32(36 + samples * 2);
    out.writeRawData("WAVEfmt ", 8);
    out << quint32(16) << quint16(1) << quint16(1) << quint32(8000) << quint32(16000) << quint16(2)
        << quint16(16);
    out.writeRawData("data", 4);
    out << quint32(samples * 2);
    for (quint32 i = 0; i < samples; ++i)
        out << qint16(0);
    file.write(data);
}

TEST(QtSound, PlaysWavFilesAndRefusesTheRestWithALogLine) {
    std::vector<std::string> warnings;
    SetTraceSink([&warnings](TraceLevel level, const char*, const char* text) {
        if (level == TraceLevel::Warn) warnings.push_back(text);
    });
    const QString dir = QDir::tempPath() + "/quintara-sound-test";
    QDir().mkpath(dir);
    WriteSilentWav(dir + "/ding.wav");
    QFile text(dir + "/notes.txt");
    ASSERT_TRUE(text.open(QIODevice::WriteOnly));
    text.write("not a sound");
    text.close();

    // No audio device is needed: playing is asked for and nothing fails.
    InstallQtSoundPlayer();
    KVOPlaySoundFile((dir + "/ding.wav").toUtf8().constData());
    QApplication::processEvents();
    EXPECT_TRUE(warnings.empty());
    EXPECT_FALSE(PlayWavFile((dir + "/missing.wav").toUtf8().constData()));
    EXPECT_FALSE(PlayWavFile((dir + "/notes.txt").toUtf8().constData()));
    EXPECT_FALSE(PlayWavFile(nullptr));
    EXPECT_EQ(warnings.size(), 3u);
    SetSoundPlayer(nullptr);
    SetTraceSink([](TraceLevel, const char*, const char*) {});
    QDir(dir).removeRecursively();
}

}  // namespace
