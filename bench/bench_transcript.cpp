// How fast a 100,000-entry transcript is saved and opened, each against the plain work it
// cannot do without: open against one read of the file into a buffer of its size, save
// against one write of the same bytes to a new file in the same folder, synced, renamed over
// the old one, with the folder synced after. The fastest of kRounds runs of each counts.
// A save goes to the disk, so its floor does too; an open is measured twice: from the disk
// (the file's pages dropped from the page cache first, the way a transcript saved yesterday
// is read) and from the page cache, where the floor is a memory copy and parsing alone costs
// many times more. Prints the times and their ratios (target: at most 4 for the save and for
// the open from disk), then the in-memory stages (formatting; parsing with showing).
#include <fcntl.h>
#include <stdlib.h>
#include <sys/stat.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <functional>
#include <memory>
#include <string>
#include <utility>

#include "api/window_bridge.h"
#include "engine/chat_client.h"
#include "engine/transcript_format.h"

namespace {

constexpr int kEntries = 100000;
constexpr int kRounds = 15;

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

// The fastest run of some work.
class Fastest {
public:
    void Run(const std::function<void()>& work) {
        const auto start = std::chrono::steady_clock::now();
        work();
        const double seconds =
            std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
        if (seconds < m_seconds) m_seconds = seconds;
    }
    double Ms() const { return m_seconds * 1e3; }

private:
    double m_seconds = 1e9;
};

bool WriteOnce(const std::string& path, const std::string& bytes) {
    const int fd = ::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644);
    if (fd < 0) return false;
    const bool ok = ::write(fd, bytes.data(), bytes.size()) == static_cast<ssize_t>(bytes.size());
    return ::close(fd) == 0 && ok;
}

// What a save cannot do without: a new file in the folder, one write, its sync, the rename
// over the old file and the folder's sync.
bool ReplaceOnce(const std::string& folder, const std::string& path, const std::string& bytes) {
    const std::string temp = folder + "/.floor.new";
    const int fd = ::open(temp.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0644);
    if (fd < 0) return false;
    bool ok = ::write(fd, bytes.data(), bytes.size()) == static_cast<ssize_t>(bytes.size());
    ok = ::fsync(fd) == 0 && ok;
    ok = ::close(fd) == 0 && ok;
    ok = ok && ::rename(temp.c_str(), path.c_str()) == 0;
    const int dir = ::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    ok = dir >= 0 && ::fsync(dir) == 0 && ok;
    if (dir >= 0) ::close(dir);
    return ok;
}

// Drops a file's pages from the page cache, so the next read comes from the disk.
bool Evict(const std::string& path) {
    const int fd = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
    if (fd < 0) return false;
    const bool ok = ::fdatasync(fd) == 0 && ::posix_fadvise(fd, 0, 0, POSIX_FADV_DONTNEED) == 0;
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

void PrintRow(const char* name, const Fastest& run, const Fastest& floor, const char* floorName,
              const char* target) {
    std::printf("%-16s %8.2f ms   %s %8.2f ms   ratio %.2f%s\n", name, run.Ms(), floorName,
                floor.Ms(), run.Ms() / floor.Ms(), target);
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
    bool ok = saver.ChatContent().GetTimeCount() == static_cast<std::size_t>(kEntries);

    // Each kind of run repeats back to back, the way the floor reads best: its buffer is the
    // same memory every time.
    Fastest floorWrite, save, floorRead, open, floorColdRead, coldOpen, format, parse;
    for (int round = 0; round < kRounds; ++round)
        floorWrite.Run([&] { ok = ReplaceOnce(folder, floorFile, bytes) && ok; });
    for (int round = 0; round < kRounds; ++round)
        save.Run([&] { ok = saver.SaveFileToFolder(folder.c_str()) == 0 && ok; });
    for (int round = 0; round < kRounds; ++round)
        floorRead.Run([&] { ok = ReadOnce(floorFile) && ok; });
    for (int round = 0; round < kRounds; ++round) {
        // Only the open itself is timed: not making the engine, nor freeing what it read.
        CChatClient reader;
        reader.Initialize(_tagChatData{});
        open.Run([&] { reader.PopChatFileOpenDialog(); });
        ok = reader.ChatContent().GetTimeCount() == static_cast<std::size_t>(kEntries) && ok;
    }
    for (int round = 0; round < kRounds; ++round) {
        ok = Evict(floorFile) && ok;
        floorColdRead.Run([&] { ok = ReadOnce(floorFile) && ok; });
        CChatClient reader;
        reader.Initialize(_tagChatData{});
        ok = Evict(source) && ok;
        coldOpen.Run([&] { reader.PopChatFileOpenDialog(); });
        ok = reader.ChatContent().GetTimeCount() == static_cast<std::size_t>(kEntries) && ok;
    }
    for (int round = 0; round < kRounds; ++round) {
        format.Run(
            [&] { ok = FormatTranscript(saver.ChatContent()).size() == bytes.size() && ok; });
    }
    for (int round = 0; round < kRounds; ++round) {
        CChatContentStorage parsed;
        std::size_t shown = 0;
        parse.Run([&] {
            ok = ParseTranscript(bytes, &parsed, [&shown](bool, const std::string&) { ++shown; }) &&
                 ok;
        });
        ok = shown == 2 * static_cast<std::size_t>(kEntries) && ok;
    }
    SetChatWindowFactory(nullptr);

    std::printf("transcript of %d entries, %.1f MB, fastest of %d rounds\n", kEntries,
                bytes.size() / 1e6, kRounds);
    PrintRow("save", save, floorWrite, "floor (write, syncs, rename)", " (target <= 4)");
    PrintRow("open from disk", coldOpen, floorColdRead, "floor (one read)            ",
             " (target <= 4)");
    PrintRow("open from cache", open, floorRead, "floor (one read)            ", "");
    std::printf("stages: format %.2f ms; parse and show %.2f ms\n", format.Ms(), parse.Ms());
    for (const char* name : {"/source.txt", "/floor.txt", "/Chat.txt"}) {
        ::unlink((folder + name).c_str());
    }
    ::rmdir(folder.c_str());
    return ok ? 0 : 1;
}
