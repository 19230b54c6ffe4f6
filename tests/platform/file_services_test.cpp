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

}  // namespace
