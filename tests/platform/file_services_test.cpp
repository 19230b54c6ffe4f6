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
    // Twice the default mode (0666 less the umask), once a mode of its own in the folder
    // written with a trailing slash.
    const std::string folders[] = {dir.Path(), dir.Path(), dir.Path() + "/"};
    const std::uint32_t asked[] = {kDefaultFileMode, kDefaultFileMode, 0604};
    const mode_t modes[] = {0644, 0644, 0604};
    std::string names[3];
    for (int i = 0; i < 3; ++i) {
        FileId id = -1;
        ASSERT_EQ(files.CreateUnique(folders[i], ".f.", asked[i], &names[i], &id), kFileOk);
        EXPECT_EQ(names[i].rfind(".f.", 0), 0u);
        EXPECT_EQ(files.Write(id, "x", 1), kFileOk);
        EXPECT_EQ(files.Sync(id), kFileOk);
        EXPECT_EQ(files.Close(id), kFileOk);
        FileInfo info;
        ASSERT_EQ(files.GetInfo(dir.File(names[i]), &info), kFileOk);
        EXPECT_EQ(info.mode, modes[i]);
        EXPECT_EQ(FileBytes(dir.File(names[i])), "x");
    }
    ::umask(umask);
    EXPECT_NE(names[0], names[1]);
    EXPECT_EQ(files.SyncFolder(dir.Path()), kFileOk);
}

}  // namespace
