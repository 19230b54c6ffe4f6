// How fast the chat window shows new lines once its transcript is long: 10,000 chat lines (a
// title and a text each) appended to a window that already shows 100,000, against the same
// text appended through a text cursor to a plain QTextEdit as large as the window's transcript.
// After each line the events it caused run (layout, scrolling, painting); the two take turns
// in blocks of lines, and the time counted is the processor time of the main thread, so that
// load on a shared machine weighs on both alike. Prints the time per line (and the part spent
// inserting), their ratio (target: at most 2) and the memory per shown line of each.
// Usage: bench_window [lines shown first] [lines appended]
#include <unistd.h>
#include <QApplication>
#include <QFont>
#include <QTextCursor>
#include <QTextEdit>
#include <QWidget>
#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <fstream>
#include <string>
#include <vector>

#include "api/ui_protocol.h"
#include "platform/trace.h"
#include "ui/chat_text_view.h"
#include "ui/my_chat_controller.h"

namespace {

constexpr int kBlock = 500;

using Clock = std::chrono::steady_clock;

struct Line {
    std::string title;
    std::string text;
};

// Lines as a busy conference sends them: titles with the audience, texts of different
// lengths, one in eight with a link.
std::vector<Line> ChatLines(int count) {
    static const char* const kNames[] = {"Ann Attendee", "Hana Host", "Piet Presenter",
                                         "Max Mustermann"};
    static const char* const kTexts[] = {
        "Good morning everyone",
        "Will the recording be shared after the session?",
        "The slides are at www.example.com/agenda/slides.pdf if you missed the start",
        "Could you repeat the last point about the quarterly figures, please? The audio "
        "dropped for a moment on my side.",
        "Thanks!",
        "I have a question about the second exercise: do we hand it in before Friday or is "
        "Monday fine too?",
        "+1",
        "See https://docs.example.org/training/module-3 for the details"};
    std::vector<Line> lines;
    lines.reserve(count);
    for (int i = 0; i < count; ++i) {
        Line line;
        line.title = std::string("from ") + kNames[i % 4] + " to All Participants:\r";
        line.text = kTexts[i % 8];
        lines.push_back(std::move(line));
    }
    return lines;
}

// The process's resident memory in bytes.
long ResidentBytes() {
    std::ifstream statm("/proc/self/statm");
    long size = 0;
    long resident = 0;
    statm >> size >> resident;
    return resident * sysconf(_SC_PAGESIZE);
}

// The processor time the calling thread has used.
double CpuSeconds() {
    timespec now{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) * 1e-9;
}

// Something that shows chat lines in a host view: the chat window or the plain text view.
class Shower {
public:
    virtual ~Shower() = default;
    virtual void Show(const Line& line) = 0;

    void Fill(const std::vector<Line>& lines, int count) {
        for (int i = 0; i < count; ++i) {
            Show(lines[i]);
            if (i % 1000 == 0) QApplication::processEvents();
        }
        QApplication::processEvents();
    }

    // Shows lines [from, to), each followed by the events it caused, adding up the time taken
    // and the part of it spent inserting.
    void ShowTimed(const std::vector<Line>& lines, int from, int to) {
        for (int i = from; i < to; ++i) {
            const double start = CpuSeconds();
            Show(lines[i]);
            const double inserted = CpuSeconds();
            QApplication::processEvents();
            seconds += CpuSeconds() - start;
            insertSeconds += inserted - start;
        }
    }

    double seconds = 0;
    double insertSeconds = 0;

protected:
    Shower() { host.resize(420, 360); }

    QWidget host;
};

class WindowShower final : public Shower {
public:
    WindowShower() {
        window.SetSuperView(&host);
        host.show();
    }
    QSize TranscriptSize() const { return window.textView()->viewport()->size(); }
    void Show(const Line& line) override {
        window.HandleCommand(msg_ShowTitle, const_cast<char*>(line.title.c_str()), nullptr);
        window.HandleCommand(msg_ShowText, const_cast<char*>(line.text.c_str()), nullptr);
    }

private:
    MyChatController window;
};

class PlainShower final : public Shower {
public:
    explicit PlainShower(QSize size) : view(&host) {
        view.setReadOnly(true);
        view.setFrameShape(QFrame::NoFrame);
        view.resize(size);
        host.show();
    }
    void Show(const Line& line) override {
        QTextCursor cursor(view.document());
        cursor.movePosition(QTextCursor::End);
        cursor.insertText(QString::fromStdString(line.title));
        cursor.insertText(QString::fromStdString(line.text) + '\r');
    }

private:
    QTextEdit view;
};

void PrintTime(const char* what, const Shower& shower, int lines) {
    std::printf("  %-20s %8.1f us per line (inserting %.1f)\n", what, shower.seconds / lines * 1e6,
                shower.insertSeconds / lines * 1e6);
}

}  // namespace

int main(int argc, char** argv) {
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
    SetTraceSink([](TraceLevel, const char*, const char*) {});
    QApplication app(argc, argv);
    QFont font("DejaVu Sans");
    font.setPointSize(10);
    QApplication::setFont(font);
    const int shownFirst = argc > 1 ? std::max(1, std::atoi(argv[1])) : 100000;
    const int appended = argc > 2 ? std::max(1, std::atoi(argv[2]) / kBlock) * kBlock : 10000;
    const std::vector<Line> lines = ChatLines(shownFirst + appended);

    const long before = ResidentBytes();
    WindowShower window;
    window.Fill(lines, shownFirst);
    const long windowFilled = ResidentBytes();
    PlainShower plain(window.TranscriptSize());
    plain.Fill(lines, shownFirst);
    const long plainFilled = ResidentBytes();

    for (int from = shownFirst; from < shownFirst + appended; from += kBlock) {
        window.ShowTimed(lines, from, from + kBlock);
        plain.ShowTimed(lines, from, from + kBlock);
    }
    std::printf("%d chat lines appended to a transcript of %d\n", appended, shownFirst);
    PrintTime("chat window:", window, appended);
    PrintTime("QTextEdit + cursor:", plain, appended);
    std::printf("  ratio %.2f (target at most 2)\n", window.seconds / plain.seconds);
    std::printf("memory per shown line: chat window %.0f bytes, QTextEdit %.0f bytes\n",
                static_cast<double>(windowFilled - before) / shownFirst,
                static_cast<double>(plainFilled - windowFilled) / shownFirst);
    return 0;
}
