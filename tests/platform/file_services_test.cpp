#include "platform/file_services.h"

#include <gtest/gtest.h>

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

}  // namespace
