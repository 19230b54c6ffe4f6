#include "platform/file_services.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include "tests/support/temp_dir.h"

namespace {

TEST(PosixFiles, MissingFilesAreToldApartFromOtherFailures) {
    PosixFileServices files;
    TempDir dir;
    ASSERT_TRUE(PutFile(dir.File("plain"), "x"));
    FileInfo info;
    FileId id = -1;
    for (const std::string& path : {dir.File("missing"), dir.File("plain/inside")}) {
        EXPECT_EQ(files.Resolve(path), kFileNotFound) << path;
        EXPECT_EQ(files.GetInfo(path, &info), kFileNotFound) << path;
        EXPECT_EQ(files.Open(path, kFileRead, &id), kFileNotFound) << path;
        EXPECT_EQ(files.Delete(path), kFileNotFound) << path;
    }
    EXPECT_EQ(files.Create(dir.File("missing"), "name", 0, 0), kFileNotFound);
    std::string name;
    EXPECT_EQ(files.CreateUnique(dir.File("missing"), "n", kDefaultFileMode, &name, &id),
              kFileNotFound);
    EXPECT_EQ(files.SyncFolder(dir.File("missing")), kFileNotFound);
    EXPECT_EQ(files.Create(dir.Path(), "plain", 0, 0), kFileExists);
    // A folder where a file is expected is a failure of another kind.
    EXPECT_EQ(files.Open(dir.Path(), kFileWrite, &id), kFileError);
    EXPECT_EQ(files.Delete(dir.Path()), kFileError);
}

TEST(PosixFiles, AnOpenFileIsWrittenCutAndReadExactly) {
    PosixFileServices files;
    TempDir dir;
    ASSERT_TRUE(PutFile(dir.File("f"), "old content"));
    OpenFile file(files);
    ASSERT_EQ(file.Open(dir.File("f"), kFileReadWrite), kFileOk);
    ASSERT_EQ(files.Truncate(file.Id(), 0), kFileOk);
    ASSERT_EQ(files.Write(file.Id(), "hello", 5), kFileOk);
    std::uint64_t size = 0;
    EXPECT_EQ(files.GetSize(file.Id(), &size), kFileOk);
    EXPECT_EQ(size, 5u);
    ASSERT_EQ(file.Open(dir.File("f"), kFileRead), kFileOk);  // closes the first
    char buffer[4];
    EXPECT_EQ(files.Read(file.Id(), buffer, 4), kFileOk);
    EXPECT_EQ(files.Read(file.Id(), buffer, 4), kFileError);  // one byte was left
    EXPECT_EQ(file.Close(), kFileOk);
}

TEST(PosixFiles, UniqueFilesAreNewOpenForWritingAndTakeTheModeAsked) {
    PosixFileServices files;
    TempDir dir;
    const mode_t umask = ::umask(022);
    struct Made {
        std::string name;
        FileId id = -1;
    } made[3];
    ASSERT_EQ(files.CreateUnique(dir.Path(), ".f.", kDefaultFileMode, &made[0].name, &made[0].id),
              kFileOk);
    ASSERT_EQ(files.CreateUnique(dir.Path(), ".f.", kDefaultFileMode, &made[1].name, &made[1].id),
              kFileOk);
    ASSERT_EQ(files.CreateUnique(dir.Path() + "/", ".f.", 0604, &made[2].name, &made[2].id),
              kFileOk);
    ::umask(umask);
    EXPECT_NE(made[0].name, made[1].name);
    const mode_t modes[] = {0644, 0644, 0604};
    for (int i = 0; i < 3; ++i) {
        EXPECT_EQ(made[i].name.rfind(".f.", 0), 0u);
        EXPECT_EQ(files.Write(made[i].id, "x", 1), kFileOk);
        EXPECT_EQ(files.Sync(made[i].id), kFileOk);
        EXPECT_EQ(files.Close(made[i].id), kFileOk);
        FileInfo info;
        ASSERT_EQ(files.GetInfo(dir.File(made[i].name), &info), kFileOk);
        EXPECT_EQ(info.mode, modes[i]);
        EXPECT_EQ(FileBytes(dir.File(made[i].name)), "x");
    }
    EXPECT_EQ(files.SyncFolder(dir.Path()), kFileOk);
}

}  // namespace
