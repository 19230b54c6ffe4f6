#include "platform/file_services.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <string>

#include "tests/support/failing_file_services.h"
#include "tests/support/temp_dir.h"

namespace {

class PosixFiles : public testing::Test {
protected:
    PosixFileServices files;
    TempDir dir;
};

TEST_F(PosixFiles, MissingFilesAreNotFoundApartFromOtherFailures) {
    ASSERT_TRUE(PutFile(dir.File("plain"), "x"));
    const std::string missing = dir.File("missing");
    const std::string throughFile = dir.File("plain/inside");
    FileInfo info;
    FileId id = -1;
    for (const std::string& path : {missing, throughFile}) {
        SCOPED_TRACE(path);
        EXPECT_EQ(files.Resolve(path), kFileNotFound);
        EXPECT_EQ(files.GetInfo(path, &info), kFileNotFound);
        EXPECT_EQ(files.Open(path, kFileRead, &id), kFileNotFound);
        EXPECT_EQ(files.Delete(path), kFileNotFound);
        EXPECT_EQ(files.Rename(path, dir.File("other")), kFileNotFound);
    }
    EXPECT_EQ(files.Create(dir.File("no-folder"), "name", 0, 0), kFileNotFound);
    // A folder where a file is expected is a failure of its own kind.
    EXPECT_EQ(files.Open(dir.Path(), kFileWrite, &id), kFileError);
    EXPECT_EQ(files.Delete(dir.Path()), kFileError);
}

TEST_F(PosixFiles, CreateMakesAnEmptyFileOnceWithOrWithoutTrailingSlash) {
    EXPECT_EQ(files.Create(dir.Path(), "a.txt", FileTag("TEXT"), FileTag("ttxt")), kFileOk);
    EXPECT_EQ(files.Create(dir.Path() + "/", "b.txt", 0, 0), kFileOk);
    EXPECT_EQ(files.Create(dir.Path(), "a.txt", 0, 0), kFileExists);
    FileInfo info;
    ASSERT_EQ(files.GetInfo(dir.File("b.txt"), &info), kFileOk);
    EXPECT_EQ(info.size, 0u);
    EXPECT_FALSE(info.isFolder);
    ASSERT_EQ(files.GetInfo(dir.Path(), &info), kFileOk);
    EXPECT_TRUE(info.isFolder);
}

TEST_F(PosixFiles, WriteTruncateReadAndSizeWorkOnOneOpenFile) {
    const std::string path = dir.File("data");
    ASSERT_TRUE(PutFile(path, "old content"));
    OpenFile file(files);
    ASSERT_EQ(file.Open(path, kFileReadWrite), kFileOk);
    ASSERT_EQ(files.Truncate(file.Id(), 0), kFileOk);
    ASSERT_EQ(files.Write(file.Id(), "hello", 5), kFileOk);
    std::uint64_t size = 0;
    ASSERT_EQ(files.GetSize(file.Id(), &size), kFileOk);
    EXPECT_EQ(size, 5u);
    EXPECT_EQ(file.Close(), kFileOk);
    EXPECT_FALSE(file.IsOpen());
    EXPECT_EQ(FileBytes(path), "hello");

    ASSERT_EQ(file.Open(path, kFileRead), kFileOk);
    char buffer[8] = {};
    EXPECT_EQ(files.Read(file.Id(), buffer, 3), kFileOk);
    EXPECT_EQ(std::string(buffer, 3), "hel");
    // Asking for more than is left fails rather than returning a short buffer.
    EXPECT_EQ(files.Read(file.Id(), buffer, 3), kFileError);
}

TEST_F(PosixFiles, RenameReplacesTheTargetButNotAFolder) {
    ASSERT_TRUE(PutFile(dir.File("new"), "new"));
    ASSERT_TRUE(PutFile(dir.File("old"), "old"));
    EXPECT_EQ(files.Rename(dir.File("new"), dir.File("old")), kFileOk);
    EXPECT_EQ(FileBytes(dir.File("old")), "new");
    EXPECT_FALSE(FileExists(dir.File("new")));

    ASSERT_EQ(::mkdir(dir.File("folder").c_str(), 0755), 0);
    ASSERT_TRUE(PutFile(dir.File("folder/keep"), "k"));
    EXPECT_EQ(files.Rename(dir.File("old"), dir.File("folder")), kFileError);
    EXPECT_EQ(FileBytes(dir.File("old")), "new");
}

TEST(FileServicesInstance, ADoubleIsUsedWhileInstalledAndFailsOnlyWhatItWasTold) {
    TempDir dir;
    ASSERT_TRUE(PutFile(dir.File("a"), "a"));
    ASSERT_TRUE(PutFile(dir.File("b"), "b"));
    FileServices* const before = &CurrentFileServices();
    {
        FailingFileServices failing;
        EXPECT_EQ(&CurrentFileServices(), &failing);
        failing.Fail(FileOp::Resolve, kFilePermission, "/b");
        failing.Fail(FileOp::Write, kFileError, "/a", 1);
        EXPECT_EQ(CurrentFileServices().Resolve(dir.File("a")), kFileOk);
        EXPECT_EQ(CurrentFileServices().Resolve(dir.File("b")), kFilePermission);
        EXPECT_EQ(failing.Calls(FileOp::Resolve), 2);

        OpenFile file(failing);
        ASSERT_EQ(file.Open(dir.File("a"), kFileWrite), kFileOk);
        EXPECT_EQ(failing.Write(file.Id(), "1", 1), kFileOk);  // the first one passes
        EXPECT_EQ(failing.Write(file.Id(), "2", 1), kFileError);
    }
    EXPECT_EQ(&CurrentFileServices(), before);
}

TEST(FileServicesInstance, AnOpenFileIsClosedWhenItGoesOutOfScope) {
    TempDir dir;
    ASSERT_TRUE(PutFile(dir.File("a"), "a"));
    FailingFileServices counting;
    {
        OpenFile file(counting);
        ASSERT_EQ(file.Open(dir.File("a"), kFileRead), kFileOk);
        // Opening again closes the first one.
        ASSERT_EQ(file.Open(dir.File("a"), kFileRead), kFileOk);
        EXPECT_EQ(counting.Calls(FileOp::Close), 1);
    }
    EXPECT_EQ(counting.Calls(FileOp::Close), 2);
}

}  // namespace
