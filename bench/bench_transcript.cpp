// How fast a 100,000-entry transcript is saved and opened, against the floor of writing
// the same bytes with one buffered write and reading them with one read. Prints both times
// and their ratios (targets: save at most 1.5 times the floor, open at most 3 times).
#include <fcntl.h>
#include <stdlib.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <functional>
#include <memory>
#include <string>

#include "api/window_bridge.h"
#include "engine/chat_client.h"
#include "engine/transcript_format.h"

namespace {

constexpr int kEntries = 100000;
constexpr int kRounds = 7;

// A window that answers the open panel with one path and ignores everything else.
class PanelWindow final : public IChatWindow {
public:
    explicit PanelWindow(std::string path) : m_path(std::move(path)) {}
    void SetSuperView(void*) override {}
    void SetSink(IChatCommSinkForChatUI*) override {}
    int HandleCommand(int command, void* inParam, void* outParam) override {
        if (command == msg_OpenChatPanel) {
            *static_cast<std::int32_t*>(inParam) = 1;
            *static_cast<std::string*>(outParam) = m_path;
        }
        return 0;
    }

private:
    std::string m_path;
};

// The bytes of a transcript as a conference of some hours leaves it.
std::string TranscriptBytes() {
    CChatContentStorage content;
    for (int i = 0; i < kEntries; ++i) {
        const DateTimeRec time{2024,
                               static_cast<std::uint16_t>(1 + i % 12),
                               static_cast<std::uint16_t>(1 + i % 28),
                               static_cast<std::uint16_t>(i / 3600 % 24),
                               static_cast<std::uint16_t>(i / 60 % 60),
                               static_cast<std::uint16_t>(i % 60),
                               1};
        content.InsertTime(time);
        content.InsertNewLine("from Participant " + std::to_string(i % 250) +
                              " to All Participants:\r");
        content.ModifyLatestLineByAdd("message number " + std::to_string(i) +
                                      ", about the slides on the screen right now");
    }
    return FormatTranscript(content);
}

double Seconds(const std::function<void()>& work) {
    const auto start = std::chrono::steady_clock::now();
    work();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

// The fastest of kRounds runs.
double Best(const std::function<void()>& work) {
    double best = 1e9;
    for (int i = 0; i < kRounds; ++i)
        best = std::min(best, Seconds(work));
    return best;
}

bool WriteOnce(const std::string& path, const std::string& bytes) {
    const int fd = ::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644);
    if (fd < 0) return false;
    const bool ok = ::write(fd, bytes.data(), bytes.size()) == static_cast<ssize_t>(bytes.size());
    return ::close(fd) == 0 && ok;
}

bool ReadOnce(const std::string& path) {
    const int fd = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
    if (fd < 0) return false;
    struct stat st;
    bool ok = ::fstat(fd, &st) == 0;
    std::unique_ptr<char[]> buffer(new char[st.st_size]);
    ok = ok && ::read(fd, buffer.get(), st.st_size) == st.st_size;
    return ::close(fd) == 0 && ok;
}

}  // namespace

int main() {
    const char* base = std::getenv("TMPDIR");
    std::string folder = std::string(base && *base ? base : "/tmp") + "/qc-bench-XXXXXX";
    if (!::mkdtemp(&folder[0])) return 1;
    const std::string source = folder + "/source.txt";
    const std::string floorFile = folder + "/floor.txt";
    const std::string bytes = TranscriptBytes();
    if (!WriteOnce(source, bytes)) return 1;

    SetChatWindowFactory([source] { return new PanelWindow(source); });
    CChatClient saver;
    saver.Initialize(_tagChatData{});
    saver.PopChatFileOpenDialog();
    if (saver.ChatContent().GetTimeCount() != static_cast<std::size_t>(kEntries)) return 1;

    bool ok = true;
    const double floorWrite = Best([&] { ok = WriteOnce(floorFile, bytes) && ok; });
    const double save = Best([&] { ok = saver.SaveFileToFolder(folder.c_str()) == 0 && ok; });
    const double floorRead = Best([&] { ok = ReadOnce(floorFile) && ok; });
    // Only the open itself is timed: not making the engine, nor freeing what it read.
    double open = 1e9;
    for (int i = 0; i < kRounds; ++i) {
        CChatClient reader;
        reader.Initialize(_tagChatData{});
        open = std::min(open, Seconds([&] { reader.PopChatFileOpenDialog(); }));
        ok = reader.ChatContent().GetTimeCount() == static_cast<std::size_t>(kEntries) && ok;
    }
    SetChatWindowFactory(nullptr);

    std::printf("transcript of %d entries, %.1f MB\n", kEntries, bytes.size() / 1e6);
    std::printf("save  %7.2f ms   floor (one write) %7.2f ms   ratio %.2f (target <= 1.5)\n",
                save * 1e3, floorWrite * 1e3, save / floorWrite);
    std::printf("open  %7.2f ms   floor (one read)  %7.2f ms   ratio %.2f (target <= 3)\n",
                open * 1e3, floorRead * 1e3, open / floorRead);
    for (const char* name : {"/source.txt", "/floor.txt", "/Chat.txt"}) {
        ::unlink((folder + name).c_str());
    }
    ::rmdir(folder.c_str());
    return ok ? 0 : 1;
}
