// What only the hosted machine can be asked: it alone breaks on demand, and only of it do we know the host's side.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <string>

#include "platform/filesystem.h"
#include "tests/support/Faults.h"
#include "tests/support/Machine.h"

namespace {

namespace errc = boost::system::errc;
using boost::system::error_code;
using hosted::Operation;

constexpr const char* Folder = "C:\\ProgramData\\Test";

class HostedFilesTest : public testing::Test {
protected:
    HostedFilesTest() { machine.HasFolder(Folder); }

    static std::string In(const std::string& name) { return std::string(Folder) + "\\" + name; }
    struct stat HostStatus(const std::string& name) const {
        struct stat found {};
        EXPECT_EQ(::stat(machine.HostName(In(name)).c_str(), &found), 0) << name;
        return found;
    }

    Machine machine;
    MachineFaults faults{machine};
    error_code code;
};

TEST_F(HostedFilesTest, ACopyWithoutSpaceLeavesNoFileBehind) {
    machine.Has(In("file"), "12345");
    faults.LimitSpace(4);
    EXPECT_FALSE(fs::copy_file(In("file"), In("copy"), code));
    EXPECT_EQ(code, errc::no_space_on_device);
    EXPECT_FALSE(machine.Exists(In("copy")));
}

TEST_F(HostedFilesTest, ACopyTakesTheSpaceOfItsBytes) {
    machine.Has(In("file"), "12345");
    faults.LimitSpace(9);
    EXPECT_TRUE(fs::copy_file(In("file"), In("first"), code));
    EXPECT_FALSE(fs::copy_file(In("file"), In("second"), code));
}

TEST_F(HostedFilesTest, AFailedWriteOfACopyLeavesNoFileBehind) {
    machine.Has(In("file"), "content");
    faults.FailNth(Operation::Write, 1);
    EXPECT_FALSE(fs::copy_file(In("file"), In("copy"), code));
    EXPECT_EQ(code, errc::io_error);
    EXPECT_FALSE(machine.Exists(In("copy")));
}

TEST_F(HostedFilesTest, ACopyCountsAsOneCreationAndOneWrite) {
    machine.Has(In("file"), std::string(1000000, 'x'));
    faults.StartCounting();
    fs::copy_file(In("file"), In("copy"));
    EXPECT_EQ(faults.Count(Operation::Create), 1u);
    EXPECT_EQ(faults.Count(Operation::Write), 1u);
}

TEST_F(HostedFilesTest, EachKindOfOperationFailsWhereItIsToldTo) {
    machine.Has(In("file"), "content");
    faults.FailNth(Operation::Create, 1);
    EXPECT_FALSE(fs::copy_file(In("file"), In("copy"), code));
    EXPECT_EQ(code, errc::permission_denied);
    faults.FailNth(Operation::Create, 1);
    EXPECT_FALSE(fs::create_directory(In("folder"), code));
    EXPECT_EQ(code, errc::permission_denied);
    faults.FailNth(Operation::Rename, 1);
    fs::rename(In("file"), In("new"), code);
    EXPECT_EQ(code, errc::permission_denied);
    faults.FailNth(Operation::Delete, 1);
    EXPECT_FALSE(fs::remove(In("file"), code));
    EXPECT_EQ(code, errc::permission_denied);
    EXPECT_EQ(machine.Content(In("file")), "content");
    EXPECT_FALSE(machine.Exists(In("copy")));
    EXPECT_FALSE(machine.Exists(In("folder")));
}

TEST_F(HostedFilesTest, MakingFoldersFailsAtTheOneItIsToldTo) {
    faults.FailNth(Operation::Create, 2);
    EXPECT_FALSE(fs::create_directories(In("a\\b\\c"), code));
    EXPECT_EQ(code, errc::permission_denied);
    EXPECT_TRUE(machine.Exists(In("a")));
    EXPECT_FALSE(machine.Exists(In("a\\b")));
}

TEST_F(HostedFilesTest, RemovingATreeStopsAtTheFirstFailure) {
    machine.Has(In("tree\\file"), "content");
    faults.FailNth(Operation::Delete, 1);
    EXPECT_EQ(fs::remove_all(In("tree"), code), std::uintmax_t(-1));
    EXPECT_EQ(code, errc::permission_denied);
    EXPECT_EQ(machine.Content(In("tree\\file")), "content");
}

TEST_F(HostedFilesTest, AFileHeldByAnotherProgramCanOnlyBeRead) {
    machine.Has(In("file"), "content");
    machine.Has(In("other"), "other");
    faults.Lock(In("file"));
    fs::rename(In("file"), In("new"), code);
    EXPECT_TRUE(code);
    fs::rename(In("other"), In("file"), code);
    EXPECT_TRUE(code);
    EXPECT_FALSE(fs::remove(In("file"), code));
    EXPECT_TRUE(code);
    EXPECT_TRUE(fs::copy_file(In("file"), In("copy"), code));
    EXPECT_EQ(machine.Content(In("file")), "content");
}

// On Windows this holds too, but Wine lets root replace read-only files.
TEST_F(HostedFilesTest, ARenameReplacesNoReadOnlyFile) {
    machine.Has(In("file"), "content");
    machine.HasReadOnly(In("kept"), "kept");
    fs::rename(In("file"), In("kept"), code);
    EXPECT_EQ(code, errc::permission_denied);
    EXPECT_EQ(machine.Content(In("kept")), "kept");
}

TEST_F(HostedFilesTest, ACopyIsAsOldAndAsReadOnlyAsItsSource) {
    machine.HasReadOnly(In("file"), "content");
    const timespec times[2] = {{.tv_sec = 1000, .tv_nsec = 0}, {.tv_sec = 1234567, .tv_nsec = 500}};
    ASSERT_EQ(::utimensat(AT_FDCWD, machine.HostName(In("file")).c_str(), times, 0), 0);
    fs::copy_file(In("file"), In("copy"));
    EXPECT_EQ(HostStatus("copy").st_mtim.tv_sec, 1234567);
    EXPECT_EQ(HostStatus("copy").st_mtim.tv_nsec, 500);
    EXPECT_EQ(HostStatus("copy").st_mode & 0222, 0u);
}

// A link on Windows needs rights that the tests' user may lack, and Wine makes none.
TEST_F(HostedFilesTest, ALinkIsRemovedAndNotWhatItLeadsTo) {
    machine.Has(In("kept\\file"), "content");
    machine.HasFolder(In("tree"));
    ASSERT_EQ(::symlink(machine.HostName(In("kept")).c_str(), machine.HostName(In("tree\\link")).c_str()), 0);
    EXPECT_EQ(fs::remove_all(In("tree")), 2u);
    EXPECT_EQ(machine.Content(In("kept\\file")), "content");
}

TEST_F(HostedFilesTest, ALinkIsListedAsALinkAndNotWalkedInto) {
    machine.Has(In("target\\file"), "content");
    machine.HasFolder(In("tree"));
    ASSERT_EQ(::symlink(machine.HostName(In("target")).c_str(), machine.HostName(In("tree\\link")).c_str()), 0);
    int entries = 0;
    for (fs::recursive_directory_iterator i(In("tree")), end; i != end; ++i, ++entries) {
        EXPECT_TRUE(fs::is_symlink(*i));
        EXPECT_TRUE(fs::is_directory(*i));
    }
    EXPECT_EQ(entries, 1);
    EXPECT_EQ(fs::status(In("tree\\link")).type(), fs::directory_file);
    EXPECT_EQ(fs::symlink_status(In("tree\\link")).type(), fs::symlink_file);
}

TEST_F(HostedFilesTest, APipeIsNeverWaitedFor) {
    ASSERT_EQ(::mkfifo(machine.HostName(In("pipe")).c_str(), 0666), 0);
    EXPECT_FALSE(fs::copy_file(In("pipe"), In("copy"), code));
    EXPECT_EQ(code, errc::permission_denied);
    EXPECT_EQ(fs::status(In("pipe")).type(), fs::type_unknown);
}

TEST_F(HostedFilesTest, SeesTheHostsFilesOnDriveZ) {
    machine.Has(In("file"), "content");
    EXPECT_EQ(fs::file_size(fs::path("Z:") / machine.HostName(In("file"))), 7u);
    EXPECT_TRUE(fs::is_directory("Z:\\"));
}

}  // namespace
