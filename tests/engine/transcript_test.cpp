// Transcript files through the engine: save, save as, save into a folder and open, with
// what the window, the host and the user (warnings) see, and every failure of the disk.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <string>
#include <vector>

#include "engine/chat_client.h"
#include "platform/warning_window.h"
#include "tests/support/failing_file_services.h"
#include "tests/support/recording_window.h"
#include "tests/support/temp_dir.h"
#include "tests/support/trace_capture.h"

namespace {

const std::string kTitle = "Korvo Chat";
const std::string kOpenFailed =
    "Unable to open this chat file, because either the file is damaged or the file format is "
    "not recognized.";

std::string SaveFailed(const std::string& name) {
    return "Can't save this file \"" + name +
           "\". Make sure that the disk or folder you want to save is not full, "
           "write-protected, or damaged.";
}

std::string CannotReplace(const std::string& name) {
    return "Your cannot replace\"" + name + "\" because you do not have the right privileges.";
}

// Two entries as a saved transcript holds them.
const std::string kTwoEntries =
    "\xEF\xBB\xBF"
    "03/05/2009    09:03:07 AM    from Ann to All Participants:\r\thello\n"
    "03/05/2009    14:05:09 PM    from Bo to Host (privately):\r\tsee \xC3\xA9 you\n";
// A third one, in a file of its own.
const std::string kThirdEntry =
    "\xEF\xBB\xBF"
    "12/31/2010    00:15:00 AM    from Cy to All Attendees:\r\tbye\n";

class HostSink final : public IHostChatSink {
public:
    void OnIncomingChat(const char*, const char*, uint32_t) override {}
    void OnChatShown() override {}
    void OnChatModified(bool modified) override {
        events.push_back(modified ? "modified 1" : "modified 0");
    }
    void OnChatContentChanged(bool changed) override {
        events.push_back(changed ? "content 1" : "content 0");
    }
    std::vector<std::string> events;
};

struct Warning {
    std::string title;
    std::string message;
    bool operator==(const Warning& other) const {
        return title == other.title && message == other.message;
    }
};

std::ostream& operator<<(std::ostream& out, const Warning& warning) {
    return out << "[" << warning.title << "] " << warning.message;
}

// The one warning a failure shows.
std::vector<Warning> Only(const std::string& message) {
    return {Warning{kTitle, message}};
}

class TranscriptTest : public testing::Test {
protected:
    void SetUp() override {
        RecordingWindow::Install();
        SetWarningPresenter([this](const char* title, const char* message) {
            warnings.push_back(Warning{title, message});
        });
        _tagChatData data{};
        data.pHostSink = &host;
        data.lMeetingType = 1;
        engine.Initialize(data);
        window = RecordingWindow::Latest();
        ASSERT_NE(window, nullptr);
        window->Clear();
        host.events.clear();
    }
    void TearDown() override {
        SetWarningPresenter(nullptr);
        RecordingWindow::Uninstall();
    }

    // Opens path through the open panel, as the user would.
    void OpenThroughPanel(const std::string& path) {
        window->dialogConfirmed = 1;
        window->dialogPath = path;
        engine.PopChatFileOpenDialog();
    }
    // Puts bytes into a file of dir and opens it.
    void Load(const std::string& name, const std::string& bytes) {
        ASSERT_TRUE(PutFile(dir.File(name), bytes));
        OpenThroughPanel(dir.File(name));
    }
    // Saves to path through the save-as panel.
    void SaveAs(const std::string& path) {
        window->dialogConfirmed = 1;
        window->dialogPath = path;
        engine.SaveAsChatFile();
    }
    // The titles (T) and texts (M) the window was given, in order.
    std::vector<std::string> Shown() const {
        std::vector<std::string> shown;
        for (const RecordedCommand& c : window->Commands()) {
            if (c.id == msg_ShowTitle) shown.push_back("T:" + c.text);
            if (c.id == msg_ShowText) shown.push_back("M:" + c.text);
        }
        return shown;
    }
    std::vector<std::string> Lines() const {
        std::vector<std::string> lines;
        const CChatContentStorage& content = engine.ChatContent();
        for (std::size_t i = 0; i < content.GetLineCount(); ++i) {
            lines.push_back(content.GetLineAtIndex(i));
        }
        return lines;
    }

    TempDir dir;
    HostSink host;
    CChatClient engine;
    RecordingWindow* window = nullptr;
    std::vector<Warning> warnings;
};

TEST_F(TranscriptTest, OpeningIntoAnEmptyTranscriptShowsEveryEntryAndLeavesTheFlag) {
    Load("a.txt", kTwoEntries);
    EXPECT_EQ(Shown(),
              (std::vector<std::string>{"T:from Ann to All Participants:\r", "M:hello",
                                        "T:from Bo to Host (privately):\r", "M:see \xC3\xA9 you"}));
    EXPECT_EQ(Lines(),
              (std::vector<std::string>{"from Ann to All Participants:\r\thello",
                                        "from Bo to Host (privately):\r\tsee \xC3\xA9 you"}));
    EXPECT_EQ(engine.ChatContent().GetTimeCount(), 2u);
    EXPECT_EQ(engine.ChatContent().GetTimeAt(1).hour, 14);
    EXPECT_EQ(engine.FileNeedSave(), 0);
    EXPECT_EQ(host.events, std::vector<std::string>{"content 1"});
    EXPECT_EQ(engine.ChatFilePath(), dir.File("a.txt"));
    EXPECT_TRUE(engine.IsChatHaveContent());
    EXPECT_TRUE(warnings.empty());
}

TEST_F(TranscriptTest, OpeningIntoATranscriptWithEntriesAppendsAndMarksItModified) {
    Load("a.txt", kTwoEntries);
    host.events.clear();
    Load("c.kcf", kThirdEntry);
    EXPECT_EQ(Lines().size(), 3u);
    EXPECT_EQ(Lines()[2], "from Cy to All Attendees:\r\tbye");
    EXPECT_EQ(engine.FileNeedSave(), 1);
    EXPECT_EQ(host.events, (std::vector<std::string>{"modified 1", "content 1"}));
    EXPECT_EQ(engine.ChatFilePath(), dir.File("c.kcf"));
}

TEST_F(TranscriptTest, SavedFileHoldsExactlyTheTranscriptAndOpensBackTheSame) {
    Load("a.txt", kTwoEntries);
    Load("c.txt", kThirdEntry);
    ASSERT_EQ(engine.FileNeedSave(), 1);
    host.events.clear();

    SaveAs(dir.File("saved.txt"));
    EXPECT_EQ(FileBytes(dir.File("saved.txt")),
              "\xEF\xBB\xBF"
              "03/05/2009    09:03:07 AM    from Ann to All Participants:\r\thello\n"
              "03/05/2009    14:05:09 PM    from Bo to Host (privately):\r\tsee \xC3\xA9 you\n"
              "12/31/2010    00:15:00 AM    from Cy to All Attendees:\r\tbye\n");
    EXPECT_EQ(engine.FileNeedSave(), 0);
    EXPECT_EQ(host.events, std::vector<std::string>{"modified 0"});
    EXPECT_EQ(engine.ChatFilePath(), dir.File("saved.txt"));
    EXPECT_TRUE(warnings.empty());
    EXPECT_FALSE(FileExists(dir.File(".saved.txt.saving")));

    CChatClient reader;
    _tagChatData data{};
    reader.Initialize(data);
    RecordingWindow* readerWindow = RecordingWindow::Latest();
    readerWindow->dialogConfirmed = 1;
    readerWindow->dialogPath = dir.File("saved.txt");
    reader.PopChatFileOpenDialog();
    ASSERT_EQ(reader.ChatContent().GetLineCount(), 3u);
    for (std::size_t i = 0; i < 3; ++i) {
        EXPECT_EQ(reader.ChatContent().GetLineAtIndex(i), engine.ChatContent().GetLineAtIndex(i));
    }
}

TEST_F(TranscriptTest, SaveWritesToTheCurrentPathAndReplacesWhatWasThere) {
    Load("a.txt", kTwoEntries);
    Load("c.txt", kThirdEntry);  // the current path is now c.txt
    window->Clear();
    engine.SaveChatFile(1);
    EXPECT_EQ(FileBytes(dir.File("c.txt")), kTwoEntries + kThirdEntry.substr(3));
    EXPECT_EQ(engine.FileNeedSave(), 0);
    EXPECT_TRUE(window->Ids().empty());  // no panel: the path was known
    EXPECT_TRUE(warnings.empty());
}

TEST_F(TranscriptTest, SaveWithoutAPathAsksForOneAndACancelledPanelChangesNothing) {
    Load("a.txt", kTwoEntries);
    Load("c.txt", kThirdEntry);
    ASSERT_TRUE(PutFile(dir.File("bad.txt"), "13/01/2009    bad\tx\n"));
    OpenThroughPanel(dir.File("bad.txt"));  // a failed open forgets the path
    ASSERT_EQ(engine.ChatFilePath(), "");
    window->Clear();
    window->dialogConfirmed = 0;
    engine.SaveChatFile(1);
    EXPECT_EQ(window->Ids(), std::vector<int>{msg_SaveChatPanel});
    EXPECT_EQ(engine.FileNeedSave(), 1);

    window->dialogConfirmed = 1;
    window->dialogPath = dir.File("chosen.txt");
    engine.SaveChatFile(1);
    EXPECT_TRUE(FileExists(dir.File("chosen.txt")));
    EXPECT_EQ(engine.FileNeedSave(), 0);
}

TEST_F(TranscriptTest, AFileThatCannotBeOpenedChangesNeitherTranscriptNorWindow) {
    struct Case {
        const char* name;
        std::string bytes;
    };
    const Case cases[] = {
        {"month 13 on the first line",
         "\xEF\xBB\xBF"
         "13/05/2009    09:03:07 AM    from Ann:\r\thello\n"},
        {"only entry without TAB",
         "\xEF\xBB\xBF"
         "03/05/2009    09:03:07 AM    from Ann\n"},
        {"empty", ""},
        {"text", "just some notes\n"},
    };
    Load("a.txt", kTwoEntries);
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        window->Clear();
        host.events.clear();
        warnings.clear();
        Load("bad.txt", c.bytes);
        EXPECT_EQ(Shown(), std::vector<std::string>{});
        EXPECT_EQ(engine.ChatContent().GetTimeCount(), 2u);
        EXPECT_EQ(engine.ChatContent().GetLineCount(), 2u);
        EXPECT_EQ(engine.FileNeedSave(), 0);
        EXPECT_TRUE(host.events.empty());
        EXPECT_EQ(warnings, Only(kOpenFailed));
        EXPECT_EQ(engine.ChatFilePath(), "");
    }
}

TEST_F(TranscriptTest, EveryReadFailureIsAnOpenFailure) {
    ASSERT_TRUE(PutFile(dir.File("a.txt"), kTwoEntries));
    const FileOp ops[] = {FileOp::Open, FileOp::GetSize, FileOp::Read, FileOp::Close};
    for (const FileOp op : ops) {
        SCOPED_TRACE(static_cast<int>(op));
        FailingFileServices files;
        files.Fail(op, kFileError);
        warnings.clear();
        OpenThroughPanel(dir.File("a.txt"));
        EXPECT_EQ(warnings, Only(kOpenFailed));
        EXPECT_FALSE(engine.IsChatHaveContent());
        EXPECT_EQ(engine.ChatFilePath(), "");
    }
    warnings.clear();
    OpenThroughPanel(dir.File("missing.txt"));
    EXPECT_EQ(warnings, Only(kOpenFailed));
}

TEST_F(TranscriptTest, AFailedSaveKeepsTheOldFileTheFlagAndWarns) {
    struct Case {
        const char* name;
        FileOp op;
        FileResult result;
        const char* path;  // the half-written file, or the saved one for the rename
    };
    const Case cases[] = {
        {"a stale half-written file stays", FileOp::Delete, kFileError, ".saving"},
        {"the folder refuses new files", FileOp::Create, kFilePermission, ".saving"},
        {"the new file cannot be opened", FileOp::Open, kFileError, ".saving"},
        {"the disk is full", FileOp::Write, kFileError, ".saving"},
        {"the last bytes never reach the disk", FileOp::Close, kFileError, ".saving"},
        {"the old file cannot be replaced", FileOp::Rename, kFileError, "/c.txt"},
    };
    Load("a.txt", kTwoEntries);
    Load("c.txt", kThirdEntry);
    ASSERT_EQ(engine.FileNeedSave(), 1);
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        warnings.clear();
        host.events.clear();
        FailingFileServices files;
        files.Fail(c.op, c.result, c.path);
        engine.SaveChatFile(1);
        EXPECT_EQ(FileBytes(dir.File("c.txt")), kThirdEntry);
        EXPECT_EQ(engine.FileNeedSave(), 1);
        EXPECT_TRUE(host.events.empty());
        EXPECT_EQ(warnings, Only(SaveFailed("c.txt")));
        EXPECT_FALSE(FileExists(dir.File(".c.txt.saving")));
    }
}

TEST_F(TranscriptTest, AFileThatMayNotBeReplacedWarnsAndMayAskForAnotherPath) {
    Load("a.txt", kTwoEntries);
    Load("c.txt", kThirdEntry);
    for (const int prompt : {0, 1}) {
        SCOPED_TRACE(prompt);
        FailingFileServices files;
        files.Fail(FileOp::Open, kFilePermission, "/c.txt");
        warnings.clear();
        window->Clear();
        window->dialogConfirmed = 0;
        engine.SaveChatFile(prompt);
        EXPECT_EQ(warnings, Only(CannotReplace("c.txt")));
        EXPECT_EQ(window->Ids(), prompt ? std::vector<int>{msg_SaveChatPanel} : std::vector<int>{});
        EXPECT_EQ(FileBytes(dir.File("c.txt")), kThirdEntry);
        EXPECT_EQ(engine.FileNeedSave(), 1);
    }
    // A file that has gone since is no reason to refuse.
    ASSERT_EQ(::remove(dir.File("c.txt").c_str()), 0);
    warnings.clear();
    engine.SaveChatFile(1);
    EXPECT_TRUE(warnings.empty());
    EXPECT_EQ(engine.FileNeedSave(), 0);
}

TEST_F(TranscriptTest, SaveIntoAFolderWritesChatTxtAndReportsEveryFailure) {
    EXPECT_EQ(engine.SaveFileToFolder(nullptr), -1);
    EXPECT_EQ(engine.SaveFileToFolder(dir.File("missing").c_str()), -1);

    Load("a.txt", kTwoEntries);
    Load("c.txt", kThirdEntry);
    ASSERT_EQ(::mkdir(dir.File("out").c_str(), 0755), 0);
    ASSERT_TRUE(PutFile(dir.File("out/Chat.txt"), "an older save"));
    EXPECT_EQ(engine.SaveFileToFolder(dir.File("out").c_str()), 0);
    EXPECT_EQ(FileBytes(dir.File("out/Chat.txt")), kTwoEntries + kThirdEntry.substr(3));
    EXPECT_EQ(engine.ChatFilePath(), dir.File("out") + "/Chat.txt");
    EXPECT_EQ(engine.FileNeedSave(), 0);

    // A Chat.txt that cannot be replaced (here a folder of that name) is a failure.
    Load("c.txt", kThirdEntry);
    ASSERT_EQ(::mkdir(dir.File("full").c_str(), 0755), 0);
    ASSERT_EQ(::mkdir(dir.File("full/Chat.txt").c_str(), 0755), 0);
    ASSERT_TRUE(PutFile(dir.File("full/Chat.txt/keep"), "k"));
    EXPECT_EQ(engine.SaveFileToFolder(dir.File("full").c_str()), -1);
    EXPECT_EQ(engine.FileNeedSave(), 1);
    EXPECT_EQ(engine.ChatFilePath(), dir.File("c.txt"));
    {
        FailingFileServices files;
        files.Fail(FileOp::Write, kFileError);
        EXPECT_EQ(engine.SaveFileToFolder(dir.File("out").c_str()), -1);
    }
    EXPECT_EQ(FileBytes(dir.File("out/Chat.txt")), kTwoEntries + kThirdEntry.substr(3));
    EXPECT_EQ(engine.FileNeedSave(), 1);
    // This path warns nobody: the host hears of the failure through the result.
    EXPECT_TRUE(warnings.empty());
}

TEST_F(TranscriptTest, TheTickMarksTheTranscriptModifiedWhenItsSavedFileGoes) {
    Load("a.txt", kTwoEntries);
    SaveAs(dir.File("saved.txt"));
    ASSERT_EQ(engine.FileNeedSave(), 0);
    host.events.clear();
    TraceCapture trace;

    engine.CheckSavedFileStillThere();  // still there: nothing
    EXPECT_EQ(engine.FileNeedSave(), 0);
    {
        FailingFileServices files;  // there, but cannot be examined
        files.Fail(FileOp::GetInfo, kFileError);
        engine.CheckSavedFileStillThere();
    }
    EXPECT_EQ(engine.FileNeedSave(), 1);
    EXPECT_TRUE(trace.Has("CChatClient::OnTick() SetFileNeedSave(true)"));

    SaveAs(dir.File("saved.txt"));
    ASSERT_EQ(::remove(dir.File("saved.txt").c_str()), 0);
    host.events.clear();
    trace.Clear();
    engine.CheckSavedFileStillThere();
    EXPECT_EQ(engine.FileNeedSave(), 1);
    EXPECT_EQ(host.events, std::vector<std::string>{"modified 1"});
    engine.CheckSavedFileStillThere();  // already modified: no second mark
    EXPECT_EQ(host.events.size(), 1u);
}

TEST_F(TranscriptTest, WarningsNameTheFileLiterallyAndStayBounded) {
    engine.AlertForSaveFailed("");
    EXPECT_TRUE(warnings.empty());
    engine.AlertForSaveFailed("/some/folder/%s%n%x.txt");
    engine.AlertForSaveFailed("no-folder.txt");
    engine.AlertForSaveFailed("/ends/with/");
    EXPECT_EQ(warnings, (std::vector<Warning>{{kTitle, SaveFailed("%s%n%x.txt")},
                                              {kTitle, SaveFailed("no-folder.txt")},
                                              {kTitle, SaveFailed("/ends/with/")}}));
    warnings.clear();
    std::string longName;
    while (longName.size() < 3000)
        longName += "\xC3\xA9";
    engine.AlertForSaveFailed("/x/" + longName);
    ASSERT_EQ(warnings.size(), 1u);
    EXPECT_EQ(warnings[0].message.size(), 2046u);  // 2047 would split a character
    EXPECT_EQ(warnings[0].message.substr(0, 22), "Can't save this file \"");

    warnings.clear();
    EXPECT_FALSE(engine.AlertIfSaveFailed(dir.File("missing.txt").c_str()));
    EXPECT_FALSE(engine.AlertIfSaveFailed(""));
    ASSERT_TRUE(PutFile(dir.File("here.txt"), "x"));
    EXPECT_TRUE(engine.AlertIfSaveFailed(dir.File("here.txt").c_str()));
    EXPECT_EQ(warnings, Only(SaveFailed("missing.txt")));
}

TEST_F(TranscriptTest, TheHostHearsOfTheModifiedFlagOnlyWhenItChanges) {
    engine.SetFileNeedSave(1);
    engine.SetFileNeedSave(1);
    engine.SetFileNeedSave(0);
    engine.SetFileNeedSave(0);
    EXPECT_EQ(host.events, (std::vector<std::string>{"modified 1", "modified 0"}));
}

}  // namespace
