#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "hvframework/FileUtils.h"
#include "platform/filesystem.h"
#include "tests/support/Faults.h"
#include "tests/support/Machine.h"

// Symbolic links and broken disks. Only the hosted machine has them: Wine shows a host's link as what it names and
// makes none of its own, and Windows cannot be broken on demand.
namespace HVL::FileUtils {
namespace {

using hosted::Operation;
using testing::ElementsAre;
using testing::Pair;

class Links : public testing::Test {
protected:
    /// A link at `path` onto `target`, which need not exist.
    void Link(const std::string& path, const std::string& target) {
        const int result = symlink(machine.HostName(target).c_str(), machine.HostName(path).c_str());
        ASSERT_EQ(result, 0) << path;
    }

    Machine machine;
};

TEST_F(Links, AreRemovedButNotWhatTheyName) {
    machine.Has(R"(C:\Kept\a)", "x");
    machine.HasFolder(R"(C:\T\d)");
    Link(R"(C:\T\d\folder)", R"(C:\Kept)");
    Link(R"(C:\T\d\file)", R"(C:\Kept\a)");
    Link(R"(C:\T\d\nothing)", R"(C:\None)");
    EXPECT_EQ(DeleteFileOrDirectory(R"(C:\T\d)"), 0);
    EXPECT_FALSE(machine.Exists(R"(C:\T\d)"));
    EXPECT_EQ(machine.Content(R"(C:\Kept\a)"), "x");
}

TEST_F(Links, AreRemovedWhenTheyAreThePathItself) {
    machine.Has(R"(C:\Kept\a)", "x");
    Link(R"(C:\Link)", R"(C:\Kept)");
    EXPECT_EQ(DeleteFileOrDirectory(R"(C:\Link)"), 0);
    EXPECT_FALSE(machine.Exists(R"(C:\Link)"));
    EXPECT_EQ(machine.Content(R"(C:\Kept\a)"), "x");
}

TEST_F(Links, OntoNothingAreRemovedToo) {
    Link(R"(C:\Link)", R"(C:\None)");
    EXPECT_FALSE(FileExists(R"(C:\Link)"));
    EXPECT_EQ(DeleteFileOrDirectory(R"(C:\Link)"), 0);
    // A link onto nothing can be made again only where the old one is gone.
    Link(R"(C:\Link)", R"(C:\None)");
}

TEST_F(Links, OntoDirectoriesAreNotCopied) {
    machine.Has(R"(C:\Kept\a)", "x");
    machine.HasFolder(R"(C:\T\s)");
    Link(R"(C:\T\s\folder)", R"(C:\Kept)");
    EXPECT_EQ(CopyFileOrDirectory(R"(C:\T\s)", R"(C:\N)"), -1);
}

TEST_F(Links, OntoFilesAreCopiedAsFiles) {
    machine.Has(R"(C:\Kept\a)", "x");
    machine.HasFolder(R"(C:\T\s)");
    Link(R"(C:\T\s\file)", R"(C:\Kept\a)");
    EXPECT_EQ(CopyFileOrDirectory(R"(C:\T\s)", R"(C:\N)"), 0);
    EXPECT_EQ(machine.Content(R"(C:\N\file)"), "x");
}

class BrokenDisk : public testing::Test {
protected:
    Machine machine;
    MachineFaults faults{machine};
};

TEST_F(BrokenDisk, GivesBackTheFailureToMakeADirectory) {
    machine.HasFolder(R"(C:\T)");
    faults.FailNth(Operation::Create, 2);
    EXPECT_NE(CreateDirectories(R"(C:\T\a\b\c)"), 0);
    EXPECT_TRUE(DirectoryExists(R"(C:\T\a)"));
    EXPECT_FALSE(DirectoryExists(R"(C:\T\a\b)"));
}

TEST_F(BrokenDisk, IsAskedForNoDirectoryThatIsThere) {
    machine.HasFolder(R"(C:\T\a\b)");
    faults.StartCounting();
    EXPECT_EQ(CreateDirectories(R"(C:\T\a\b\c)"), 0);
    EXPECT_EQ(faults.Count(Operation::Create), 1U);
}

TEST_F(BrokenDisk, FailsACopyWithAnException) {
    machine.Has(R"(C:\T\a)", "twelve bytes");
    faults.LimitSpace(11);
    EXPECT_THROW((void)CopyFileOrDirectory(R"(C:\T\a)", R"(C:\T\b)"), fs::filesystem_error);
    EXPECT_FALSE(machine.Exists(R"(C:\T\b)"));
}

TEST_F(BrokenDisk, FailsTheCopyOfATreeWithAnException) {
    machine.Has(R"(C:\T\s\d\a)", "x");
    faults.FailNth(Operation::Create, 2);
    EXPECT_THROW((void)CopyFileOrDirectory(R"(C:\T\s)", R"(C:\T\t)"), fs::filesystem_error);
}

TEST_F(BrokenDisk, KeepsALockedFileWhereItIs) {
    machine.Has(R"(C:\T\a)", "x");
    faults.Lock(R"(C:\T\a)");
    EXPECT_FALSE(MoveFileOrDirectory(R"(C:\T\a)", R"(C:\T\b)"));
    EXPECT_NE(DeleteFileOrDirectory(R"(C:\T\a)"), 0);
    EXPECT_EQ(machine.Content(R"(C:\T\a)"), "x");
}

TEST_F(BrokenDisk, GivesMinusOneWhenADirectoryStays) {
    machine.Has(R"(C:\T\d\a)", "x");
    faults.FailNth(Operation::Delete, 2);
    EXPECT_EQ(DeleteFileOrDirectory(R"(C:\T\d)"), -1);
    EXPECT_THAT(machine.Files(), ElementsAre(Pair(R"(C:\T\)", ""), Pair(R"(C:\T\d\)", "")));
}

TEST_F(BrokenDisk, LeavesAllThatFollowsAFailedDeletion) {
    for (int file = 0; file < 10; ++file) {
        machine.Has(R"(C:\T\d\)" + std::to_string(file), "x");
    }
    faults.FailNth(Operation::Delete, 4);
    EXPECT_NE(DeleteFileOrDirectory(R"(C:\T\d)"), 0);
    EXPECT_EQ(machine.FilesWithoutFolders().size(), 7U);
    EXPECT_EQ(faults.Count(Operation::Delete), 4U);
}

}  // namespace
}  // namespace HVL::FileUtils
