// Transcript files through the engine: what the file, the window, the host and the user's
// warnings show when saving and opening succeed, and when any step of the disk fails.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <filesystem>
#include <optional>
#include <string>
#include <tuple>
#include <vector>

#include "engine/chat_client.h"
#include "platform/warning_window.h"
#include "tests/support/failing_file_services.h"
#include "tests/support/host_recorder.h"
#include "tests/support/recording_window.h"
#include "tests/support/temp_dir.h"
#include "tests/support/trace_capture.h"

namespace {

namespace fs = std::filesystem;
using Strings = std::vector<std::string>;

const std::string kTwoEntries =
    "\xEF\xBB\xBF"
    "03/05/2009    09:03:07 AM    from Ann to All Participants:\r\thello\n"
    "03/05/2009    14:05:09 PM    from Bo to Host (privately):\r\tsee \xC3\xA9 you\n";
const std::string kThird = "12/31/2010    00:15:00 AM    from Cy to All Attendees:\r\tbye\n";
// What saving the two entries and the third one writes: one mark, then the entries as read.
const std::string kSavedThree = kTwoEntries + kThird;

std::string SaveFailed(const std::string& name) {
    return "Can't save this file \"" + name +
           "\". Make sure that the disk or folder you want to save is not full, "
           "write-protected, or damaged.";
}

// The names in folder, sorted.
Strings Names(const std::string& folder) {
    Strings names;
    for (const auto& entry : fs::directory_iterator(folder))
        names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    return names;
}

class TranscriptTest : public testing::Test {
protected:
    void SetUp() override {
        RecordingWindow::Install();
        SetWarningPresenter([this](const char* title, const char* message) {
            warnings.push_back(std::string(title) + ": " + message);
        });
        _tagChatData data{};
        data.pHostSink = &host;
        engine.Initialize(data);
        window = RecordingWindow::Latest();
        ASSERT_NE(window, nullptr);
        window->dialogConfirmed = 1;
        host.events.clear();
    }
    void TearDown() override {
        SetWarningPresenter(nullptr);
        RecordingWindow::Uninstall();
    }
    // Puts bytes into dir/name and opens it through the open panel.
    void Load(const std::string& name, const std::string& bytes) {
        ASSERT_TRUE(PutFile(dir.File(name), bytes));
        window->dialogPath = dir.File(name);
        engine.PopChatFileOpenDialog();
    }
    void SaveAs(const std::string& path) {
        window->dialogPath = path;
        engine.SaveAsChatFile();
    }
    // Loads the two entries and the third one: three entries, modified, current path c.txt.
    void LoadThree() {
        Load("a.txt", kTwoEntries);
        Load("c.txt", "\xEF\xBB\xBF" + kThird);
        window->Clear();
        host.events.clear();
    }

    TempDir dir;
    HostRecorder host;
    CChatClient engine;
    RecordingWindow* window = nullptr;
    Strings warnings;
};

TEST_F(TranscriptTest, OpeningShowsEveryEntryAndMarksOnlyATranscriptThatHadEntries) {
    TraceCapture trace;
    EXPECT_FALSE(engine.IsChatHaveContent());
    EXPECT_TRUE(trace.Has("Enter CChatClient::IsChatHaveContent"));
    Load("a.txt", kTwoEntries);
    EXPECT_TRUE(engine.IsChatHaveContent());
    // The open panel (2601), then each title (2201) and text (2200) in a command of its own.
    Strings shown;
    for (const RecordedCommand& c : window->Commands())
        shown.push_back(std::to_string(c.id) + ":" + c.text);
    EXPECT_EQ(shown, (Strings{"2601:", "2201:from Ann to All Participants:\r", "2200:hello",
                              "2201:from Bo to Host (privately):\r", "2200:see \xC3\xA9 you"}));
    // Opened into a transcript that had entries, the transcript is modified too.
    Load("c.kcf", kThird);
    EXPECT_EQ(host.events, (Strings{"content 1", "modified 1", "content 1"}));
}

TEST_F(TranscriptTest, SavedFileHoldsExactlyTheTranscriptAndOpensBackTheSame) {
    LoadThree();
    // A file of the user's that looks like an unfinished save is none of the save's business.
    ASSERT_TRUE(PutFile(dir.File(".saved.txt.saving"), "mine"));
    const mode_t umask = ::umask(027);
    const std::string saved = dir.File("saved.txt");
    SaveAs(saved);
    ::umask(umask);
    EXPECT_EQ(FileBytes(saved), kSavedThree);
    EXPECT_EQ(fs::status(saved).permissions(), fs::perms(0640));  // a new file: 0666 less umask
    EXPECT_EQ(host.events, Strings{"modified 0"});
    EXPECT_EQ(FileBytes(dir.File(".saved.txt.saving")), "mine");
    EXPECT_EQ(Names(dir.Path()), (Strings{".saved.txt.saving", "a.txt", "c.txt", "saved.txt"}));

    // Opened after the entries it holds and saved again where it was opened from, the file
    // has its own entries twice and keeps the mode it had.
    fs::permissions(saved, fs::perms(0604));
    window->dialogPath = saved;
    engine.PopChatFileOpenDialog();
    engine.SaveChatFile(1);
    EXPECT_EQ(FileBytes(saved), kSavedThree + kSavedThree.substr(3));
    EXPECT_EQ(fs::status(saved).permissions(), fs::perms(0604));
    EXPECT_TRUE(warnings.empty());
}

TEST_F(TranscriptTest, AFileThatCannotBeOpenedChangesNeitherTranscriptNorWindow) {
    // The case, the file's bytes and the step that fails.
    const std::tuple<const char*, std::string, std::optional<FileOp>> cases[] = {
        {"month 13 first", "13/05/2009    09:03:07 AM    from Ann:\r\thello\n", {}},
        {"cannot open", kThird, FileOp::Open},
        {"size unknown", kThird, FileOp::GetSize},
        {"read fails", kThird, FileOp::Read},
    };
    Load("a.txt", kTwoEntries);
    for (const auto& [name, bytes, failing] : cases) {
        SCOPED_TRACE(name);
        FailingFileServices files;
        if (failing) files.Fail(*failing, kFileError, "bad.txt");
        window->Clear();
        warnings.clear();
        Load("bad.txt", bytes);
        EXPECT_EQ(window->Ids(), std::vector<int>{msg_OpenChatPanel});  // nothing shown
        EXPECT_EQ(engine.ChatContent().GetTimeCount(), 2u);
        EXPECT_EQ(engine.FileNeedSave(), 0);
        EXPECT_EQ(warnings, Strings{"Korvo Chat: Unable to open this chat file, because either the "
                                    "file is damaged or the file format is not recognized."});
        EXPECT_EQ(engine.ChatFilePath(), "");
    }
}

TEST_F(TranscriptTest, TheLongestNameAFolderTakesCanBeSavedTo) {
    // 255 bytes, with 2-byte characters where the file written first stops borrowing from it.
    std::string name = "n";
    while (name.size() < 251)
        name += "\xC3\xA9";
    name += ".txt";
    LoadThree();
    SaveAs(dir.File(name));
    EXPECT_EQ(FileBytes(dir.File(name)), kSavedThree);
    EXPECT_TRUE(warnings.empty());
}

TEST_F(TranscriptTest, AFailedSaveKeepsTheOldFileAndTheFlagAndWarns) {
    // The step that fails, on which path, and whether it failed after the new file took the old
    // one's place.
    const std::tuple<FileOp, const char*, bool> cases[] = {
        {FileOp::CreateUnique, "/.c.txt.saving-", false},
        {FileOp::Write, ".saving-", false},  // the disk is full
        {FileOp::Sync, ".saving-", false},   // the bytes never reached the disk
        {FileOp::Close, ".saving-", false},
        {FileOp::Rename, "/c.txt", false},
        {FileOp::SyncFolder, "", true},  // the rename may not have reached the disk
    };
    LoadThree();
    for (const auto& [op, pathPart, replaced] : cases) {
        SCOPED_TRACE(static_cast<int>(op));
        ASSERT_TRUE(PutFile(dir.File("c.txt"), "\xEF\xBB\xBF" + kThird));
        FailingFileServices files;
        files.Fail(op, kFileError, pathPart);
        warnings.clear();
        engine.SaveChatFile(1);
        EXPECT_EQ(FileBytes(dir.File("c.txt")), replaced ? kSavedThree : "\xEF\xBB\xBF" + kThird);
        EXPECT_EQ(engine.FileNeedSave(), 1);
        EXPECT_EQ(warnings, Strings{"Korvo Chat: " + SaveFailed("c.txt")});
        EXPECT_EQ(Names(dir.Path()), (Strings{"a.txt", "c.txt"}));
    }
}

TEST_F(TranscriptTest, AFileWithoutTheRightPrivilegesIsNotReplaced) {
    LoadThree();
    FailingFileServices files;
    files.Fail(FileOp::Open, kFilePermission, "/c.txt");
    // Refused, the host's save offers the save panel; the same file chosen there is refused
    // again without another panel.
    window->dialogPath = dir.File("c.txt");
    engine.SaveChatFile(1);
    EXPECT_EQ(warnings, Strings(2,
                                "Korvo Chat: Your cannot replace\"c.txt\" "
                                "because you do not have the right "
                                "privileges."));
    EXPECT_EQ(window->Ids(), std::vector<int>{msg_SaveChatPanel});
    EXPECT_EQ(FileBytes(dir.File("c.txt")), "\xEF\xBB\xBF" + kThird);
    EXPECT_EQ(engine.FileNeedSave(), 1);
}

TEST_F(TranscriptTest, SaveIntoAFolderAnswersWhetherChatTxtHoldsTheTranscript) {
    EXPECT_EQ(engine.SaveFileToFolder(nullptr), -1);
    EXPECT_EQ(engine.SaveFileToFolder(dir.File("missing").c_str()), -1);
    LoadThree();
    ASSERT_TRUE(PutFile(dir.File("Chat.txt"), "an older save"));
    EXPECT_EQ(engine.SaveFileToFolder(dir.Path().c_str()), 0);
    EXPECT_EQ(FileBytes(dir.File("Chat.txt")), kSavedThree);
    EXPECT_EQ(engine.ChatFilePath(), dir.File("Chat.txt"));

    // A Chat.txt that cannot be written: the host hears of it through the result only.
    FailingFileServices files;
    files.Fail(FileOp::Write, kFileError);
    EXPECT_EQ(engine.SaveFileToFolder(dir.Path().c_str()), -1);
    EXPECT_TRUE(warnings.empty());
}

TEST_F(TranscriptTest, TheTickMarksTheTranscriptModifiedWhenItsSavedFileGoes) {
    Load("a.txt", kTwoEntries);
    SaveAs(dir.File("saved.txt"));
    host.events.clear();
    TraceCapture trace;
    engine.CheckSavedFileStillThere();
    EXPECT_EQ(engine.FileNeedSave(), 0);
    ASSERT_EQ(::remove(dir.File("saved.txt").c_str()), 0);
    engine.CheckSavedFileStillThere();
    EXPECT_EQ(host.events, Strings{"modified 1"});
    EXPECT_TRUE(trace.Has("CChatClient::OnTick() SetFileNeedSave(true)"));

    SaveAs(dir.File("saved.txt"));
    FailingFileServices files;  // there, but it cannot be examined
    files.Fail(FileOp::GetInfo, kFileError);
    engine.CheckSavedFileStillThere();
    EXPECT_EQ(engine.FileNeedSave(), 1);
}

TEST_F(TranscriptTest, WarningsNameTheFileLiterallyWithinTheirBound) {
    engine.AlertForSaveFailed("");  // nothing to name: no warning
    EXPECT_FALSE(engine.AlertIfSaveFailed(dir.File("%s%n.txt").c_str()));
    std::string longName;
    while (longName.size() < 3000)
        longName += "\xC3\xA9";
    engine.AlertForSaveFailed("/x/" + longName);
    ASSERT_EQ(warnings.size(), 2u);
    EXPECT_EQ(warnings[0], "Korvo Chat: " + SaveFailed("%s%n.txt"));
    // "Korvo Chat: " and 2046 bytes: the 2047th would split a character.
    EXPECT_EQ(warnings[1].size(), 12u + 2046u);
}

}  // namespace
