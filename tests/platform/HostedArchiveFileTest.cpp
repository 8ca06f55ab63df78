// Faults of an archive's file. Only the hosted machine breaks on demand.

#include <gtest/gtest.h>
#include <minizip/zip.h>

#include <string>

#include "platform/filesystem.h"
#include "platform/libraries.h"
#include "tests/support/Faults.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* FileName = "C:\\ProgramData\\some.zip";

class HostedArchiveFileTest : public testing::Test {
protected:
    HostedArchiveFileTest() { platform::FillArchiveFileFunctions(functions); }

    zipFile Create() { return zipOpen2_64(fs::path(FileName).c_str(), APPEND_STATUS_CREATE, nullptr, &functions); }
    voidpf Open(int mode) { return functions.zopen64_file(nullptr, fs::path(FileName).c_str(), mode); }

    Machine machine;
    MachineFaults faults{machine};
    zlib_filefunc64_def functions{};
};

TEST_F(HostedArchiveFileTest, AFailedWriteShowsAtTheLatestWhenTheArchiveIsClosed) {
    faults.FailNth(hosted::Operation::Write, 1);
    zipFile archive = Create();
    ASSERT_NE(archive, nullptr);
    zipOpenNewFileInZip64(archive, "entry", nullptr, nullptr, 0, nullptr, 0, nullptr, 0, 0, 0);
    zipWriteInFileInZip(archive, "content", 7);
    zipCloseFileInZip(archive);
    EXPECT_NE(zipClose(archive, nullptr), ZIP_OK);
}

TEST_F(HostedArchiveFileTest, AFullDiskShowsWhileAnEntryIsWritten) {
    faults.LimitSpace(100000);
    zipFile archive = Create();
    ASSERT_NE(archive, nullptr);
    zipOpenNewFileInZip64(archive, "entry", nullptr, nullptr, 0, nullptr, 0, nullptr, 0, 0, 0);
    const std::string content(1000000, 'x');
    EXPECT_NE(zipWriteInFileInZip(archive, content.data(), static_cast<unsigned>(content.size())), ZIP_OK);
    zipCloseFileInZip(archive);
    zipClose(archive, nullptr);
    EXPECT_LE(fs::file_size(FileName), 100000u);
}

TEST_F(HostedArchiveFileTest, AHeldOrReadOnlyFileOpensForReadingOnly) {
    constexpr int ToRead = ZLIB_FILEFUNC_MODE_READ | ZLIB_FILEFUNC_MODE_EXISTING;
    machine.Has(FileName, "held");
    faults.Lock(FileName);
    EXPECT_EQ(Create(), nullptr);
    voidpf stream = Open(ToRead);
    ASSERT_NE(stream, nullptr);
    EXPECT_EQ(functions.zclose_file(nullptr, stream), 0);
    faults.Unlock(FileName);
    machine.HasReadOnly(FileName, "read-only");
    EXPECT_EQ(Create(), nullptr);
    EXPECT_EQ(machine.Content(FileName), "read-only");
}

}  // namespace
