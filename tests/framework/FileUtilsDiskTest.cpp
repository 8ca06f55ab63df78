#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <utility>

#include "hvframework/FileUtils.h"
#include "platform/filesystem.h"
#include "platform/win32.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/Machine.h"

// What FileUtils does on a disk.
namespace HVL::FileUtils {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::IsSupersetOf;
using testing::Pair;
using testing::UnorderedElementsAre;

class OnDisk : public testing::Test {
protected:
    /// The same item under a name on another volume. Volumes are told apart by their texts, so the drive in lower case
    /// is a second volume that every machine has.
    static std::string OnOtherVolume(const std::string& path) { return "c" + path.substr(1); }

    Machine machine;
};

class Status : public OnDisk {};

TEST_F(Status, TellsFilesFromDirectories) {
    machine.Has(R"(C:\T\a.txt)", "x");
    EXPECT_TRUE(FileExists(R"(C:\T\a.txt)"));
    EXPECT_FALSE(DirectoryExists(R"(C:\T\a.txt)"));
    EXPECT_FALSE(FileExists(R"(C:\T)"));
    EXPECT_TRUE(DirectoryExists(R"(C:\T)"));
    EXPECT_TRUE(DirectoryExists(R"(C:\T\)"));
    EXPECT_TRUE(DirectoryExists(R"(C:\)"));
}

TEST_F(Status, FindsNothingWhereNothingIs) {
    machine.Has(R"(C:\T\a.txt)", "x");
    int paths = 0;
    for (const char* path : {R"(C:\T\b)", R"(C:\None\b)", R"(C:\T\a.txt\b)", ""}) {
        EXPECT_FALSE(FileExists(path)) << path;
        EXPECT_FALSE(DirectoryExists(path)) << path;
        ++paths;
    }
    EXPECT_EQ(paths, 4);
}

TEST_F(Status, TakesForwardSlashesToo) {
    machine.Has(R"(C:\T\a.txt)", "x");
    EXPECT_TRUE(FileExists("C:/T/a.txt"));
}

TEST_F(Status, TakesNamesBeyondAscii) {
    machine.Has("C:\\T\\\xc3\xa4\xe6\xbc\xa2.txt", "x");
    EXPECT_TRUE(FileExists("C:\\T\\\xc3\xa4\xe6\xbc\xa2.txt"));
}

class Creating : public OnDisk {};

TEST_F(Creating, MakesTheMissingParents) {
    machine.HasFolder(R"(C:\T)");
    EXPECT_EQ(CreateDirectories(R"(C:\T\a\b\c)"), 0);
    EXPECT_TRUE(DirectoryExists(R"(C:\T\a\b\c)"));
}

TEST_F(Creating, TakesATrailingSeparator) {
    EXPECT_EQ(CreateDirectories(R"(C:\T\a\)"), 0);
    EXPECT_TRUE(DirectoryExists(R"(C:\T\a)"));
}

TEST_F(Creating, IsDoneWhenTheDirectoryIsThere) {
    machine.Has(R"(C:\T\a\x)", "x");
    EXPECT_EQ(CreateDirectories(R"(C:\T\a)"), 0);
    EXPECT_EQ(CreateDirectories(R"(C:\)"), 0);
    EXPECT_TRUE(FileExists(R"(C:\T\a\x)"));
}

TEST_F(Creating, LeavesAFileOfThatNameAlone) {
    machine.Has(R"(C:\T\a)", "x");
    EXPECT_EQ(CreateDirectories(R"(C:\T\a)"), 0);
    EXPECT_EQ(machine.Content(R"(C:\T\a)"), "x");
}

TEST_F(Creating, IsDoneWhenTheParentWasAllThatWasMissing) {
    EXPECT_EQ(CreateDirectories(R"(C:\T\a\.)"), 0);
    EXPECT_TRUE(DirectoryExists(R"(C:\T\a)"));
}

TEST_F(Creating, FailsBelowAFile) {
    machine.Has(R"(C:\T\a)", "x");
    EXPECT_NE(CreateDirectories(R"(C:\T\a\b)"), 0);
    EXPECT_NE(CreateDirectories(R"(C:\T\a\b\c\d)"), 0);
}

TEST_F(Creating, FailsWithoutAName) {
    EXPECT_NE(CreateDirectories(""), 0);
}

TEST_F(Creating, FailsOnADriveThatIsNotThere) {
    EXPECT_NE(CreateDirectories(R"(Q:\T\a)"), 0);
}

TEST_F(Creating, MakesNothingForATempPath) {
    const auto path = MakeTempPath("tmp", machine.TempFolder());
    EXPECT_FALSE(FileExists(path));
    EXPECT_FALSE(DirectoryExists(path));
    EXPECT_THAT(machine.TempEntries(), IsEmpty());
}

class Deleting : public OnDisk {};

TEST_F(Deleting, SucceedsWhereNothingIs) {
    EXPECT_EQ(DeleteFileOrDirectory(R"(C:\T\none)"), 0);
    EXPECT_EQ(DeleteFileOrDirectory(""), 0);
}

TEST_F(Deleting, RemovesAFile) {
    machine.Has(R"(C:\T\a)", "x");
    machine.Has(R"(C:\T\b)", "y");
    EXPECT_EQ(DeleteFileOrDirectory(R"(C:\T\a)"), 0);
    EXPECT_THAT(machine.FilesWithoutFolders(), ElementsAre(Pair(R"(C:\T\b)", "y")));
}

TEST_F(Deleting, RemovesADirectoryWithAllItsContents) {
    machine.Has(R"(C:\T\d\a)", "x");
    machine.Has(R"(C:\T\d\e\f\b)", "x");
    machine.HasFolder(R"(C:\T\d\empty)");
    EXPECT_EQ(DeleteFileOrDirectory(R"(C:\T\d)"), 0);
    EXPECT_THAT(machine.Files(), ElementsAre(Pair(R"(C:\T\)", "")));
}

TEST_F(Deleting, TakesATrailingSeparator) {
    machine.Has(R"(C:\T\d\a)", "x");
    EXPECT_EQ(DeleteFileOrDirectory(R"(C:\T\d\)"), 0);
    EXPECT_FALSE(machine.Exists(R"(C:\T\d)"));
}

TEST_F(Deleting, RemovesNamesBeyondAscii) {
    machine.Has("C:\\T\\d\\\xc3\xa4\xe6\xbc\xa2\\\xf0\x9f\x8e\xac.txt", "x");
    EXPECT_EQ(DeleteFileOrDirectory(R"(C:\T\d)"), 0);
    EXPECT_FALSE(machine.Exists(R"(C:\T\d)"));
}

// Such a name is another one on the disk, with a character in place of what is malformed, and is listed so.
TEST_F(Deleting, RemovesFilesThatWereWrittenUnderMalformedNames) {
    machine.HasFolder(R"(C:\T\d)");
    for (const char* name : {"C:\\T\\d\\a\xFF\xFE", "C:\\T\\d\\\xC3"}) {
        FILE* stream = nullptr;
        ASSERT_EQ(fopen_s(&stream, name, "wb"), 0) << name;
        std::fclose(stream);
    }
    ASSERT_EQ(machine.FilesWithoutFolders().size(), 2U);
    EXPECT_EQ(DeleteFileOrDirectory(R"(C:\T\d)"), 0);
    EXPECT_FALSE(machine.Exists(R"(C:\T\d)"));
}

TEST_F(Deleting, FailsOnAFileThatMayNotBeDeleted) {
    machine.HasReadOnly(R"(C:\T\a)", "x");
    EXPECT_NE(DeleteFileOrDirectory(R"(C:\T\a)"), 0);
    EXPECT_EQ(machine.Content(R"(C:\T\a)"), "x");
}

TEST_F(Deleting, StopsAtTheFirstFailureInADirectory) {
    machine.HasReadOnly(R"(C:\T\d\e\a)", "x");
    EXPECT_NE(DeleteFileOrDirectory(R"(C:\T\d)"), 0);
    EXPECT_EQ(machine.Content(R"(C:\T\d\e\a)"), "x");
}

class Copying : public OnDisk {};

TEST_F(Copying, CopiesAFileAndMakesItsParent) {
    machine.Has(R"(C:\T\a)", std::string("x\0\r\ny", 5));
    EXPECT_EQ(CopyFileOrDirectory(R"(C:\T\a)", R"(C:\N\m\b)"), 0);
    EXPECT_EQ(machine.Content(R"(C:\N\m\b)"), std::string("x\0\r\ny", 5));
    EXPECT_TRUE(machine.HasFile(R"(C:\T\a)"));
}

TEST_F(Copying, NeverOverwritesAFile) {
    machine.Has(R"(C:\T\a)", "new");
    machine.Has(R"(C:\T\b)", "old");
    EXPECT_THROW((void)CopyFileOrDirectory(R"(C:\T\a)", R"(C:\T\b)"), fs::filesystem_error);
    EXPECT_EQ(machine.Content(R"(C:\T\b)"), "old");
}

TEST_F(Copying, CopiesATree) {
    machine.Has(R"(C:\T\s\a)", "1");
    machine.Has(R"(C:\T\s\d\b)", "2");
    machine.Has(R"(C:\T\s\d\e\c)", "");
    machine.HasFolder(R"(C:\T\s\empty)");
    EXPECT_EQ(CopyFileOrDirectory(R"(C:\T\s)", R"(C:\N\t)"), 0);
    EXPECT_THAT(machine.Files(),
                IsSupersetOf({Pair(R"(C:\N\t\a)", "1"), Pair(R"(C:\N\t\d\b)", "2"), Pair(R"(C:\N\t\d\e\c)", ""),
                              Pair(R"(C:\N\t\empty\)", ""), Pair(R"(C:\T\s\a)", "1")}));
}

TEST_F(Copying, CopiesATreeWhoseNameEndsInASeparator) {
    machine.Has(R"(C:\T\s\d\a)", "1");
    EXPECT_EQ(CopyFileOrDirectory(R"(C:\T\s\)", R"(C:\N\t\)"), 0);
    EXPECT_EQ(machine.Content(R"(C:\N\t\d\a)"), "1");
}

TEST_F(Copying, AddsATreeToADirectoryThatIsThere) {
    machine.Has(R"(C:\T\s\d\a)", "1");
    machine.Has(R"(C:\N\d\b)", "2");
    EXPECT_EQ(CopyFileOrDirectory(R"(C:\T\s)", R"(C:\N)"), 0);
    EXPECT_EQ(machine.Content(R"(C:\N\d\a)"), "1");
    EXPECT_EQ(machine.Content(R"(C:\N\d\b)"), "2");
}

TEST_F(Copying, NeverOverwritesAFileInATree) {
    machine.Has(R"(C:\T\s\d\a)", "new");
    machine.Has(R"(C:\N\d\a)", "old");
    EXPECT_THROW((void)CopyFileOrDirectory(R"(C:\T\s)", R"(C:\N)"), fs::filesystem_error);
    EXPECT_EQ(machine.Content(R"(C:\N\d\a)"), "old");
}

TEST_F(Copying, FailsWhenAFileStandsWhereTheDirectoryShould) {
    machine.HasFolder(R"(C:\T\s)");
    machine.Has(R"(C:\T\t)", "x");
    EXPECT_EQ(CopyFileOrDirectory(R"(C:\T\s)", R"(C:\T\t)"), -1);
    EXPECT_EQ(machine.Content(R"(C:\T\t)"), "x");
}

TEST_F(Copying, SaysWhenTheParentCannotBeMade) {
    machine.Has(R"(C:\T\a)", "x");
    CapturedStreams streams;
    EXPECT_EQ(CopyFileOrDirectory(R"(C:\T\a)", R"(C:\T\a\b\c)"), -1);
    EXPECT_EQ(streams.Errors(), "ERROR: failed to make parent directory at C:\\T\\a\\b\n");
    EXPECT_EQ(streams.Output(), "");
}

TEST_F(Copying, SaysWhenTheSourceDoesNotExist) {
    CapturedStreams streams;
    EXPECT_EQ(CopyFileOrDirectory(R"(C:\T\none)", R"(C:\N\b)"), -1);
    EXPECT_EQ(streams.Errors(), "ERROR: source does not exist at C:\\T\\none\n");
    EXPECT_TRUE(machine.Exists(R"(C:\N)"));
}

class Moving : public OnDisk {};

TEST_F(Moving, RenamesWithinAVolume) {
    machine.Has(R"(C:\T\d\a)", "x");
    machine.HasFolder(R"(C:\N)");
    EXPECT_TRUE(MoveFileOrDirectory(R"(C:\T\d)", R"(C:\N\e)"));
    EXPECT_THAT(machine.FilesWithoutFolders(), ElementsAre(Pair(R"(C:\N\e\a)", "x")));
}

TEST_F(Moving, MakesNoParentWithinAVolume) {
    machine.Has(R"(C:\T\a)", "x");
    EXPECT_FALSE(MoveFileOrDirectory(R"(C:\T\a)", R"(C:\None\a)"));
    EXPECT_EQ(machine.Content(R"(C:\T\a)"), "x");
}

TEST_F(Moving, ReplacesAFileWithinAVolume) {
    machine.Has(R"(C:\T\a)", "new");
    machine.Has(R"(C:\T\b)", "old");
    EXPECT_TRUE(MoveFileOrDirectory(R"(C:\T\a)", R"(C:\T\b)"));
    EXPECT_THAT(machine.FilesWithoutFolders(), ElementsAre(Pair(R"(C:\T\b)", "new")));
}

TEST_F(Moving, ReplacesNoDirectoryWithinAVolume) {
    machine.Has(R"(C:\T\a\x)", "new");
    machine.Has(R"(C:\T\b\y)", "old");
    EXPECT_FALSE(MoveFileOrDirectory(R"(C:\T\a)", R"(C:\T\b)"));
    EXPECT_THAT(machine.FilesWithoutFolders(),
                UnorderedElementsAre(Pair(R"(C:\T\a\x)", "new"), Pair(R"(C:\T\b\y)", "old")));
}

TEST_F(Moving, FailsWithoutASource) {
    machine.HasFolder(R"(C:\T)");
    EXPECT_FALSE(MoveFileOrDirectory(R"(C:\T\none)", R"(C:\T\b)"));
}

TEST_F(Moving, CopiesAndDeletesBetweenVolumes) {
    machine.Has(R"(C:\T\d\a)", "x");
    machine.HasFolder(R"(C:\N)");
    EXPECT_TRUE(MoveFileOrDirectory(R"(C:\T\d)", OnOtherVolume(R"(C:\N\new\e)")));
    EXPECT_THAT(machine.FilesWithoutFolders(), ElementsAre(Pair(R"(C:\N\new\e\a)", "x")));
    EXPECT_FALSE(machine.Exists(R"(C:\T\d)"));
}

TEST_F(Moving, FailsOnAnExistingFileBetweenVolumes) {
    machine.Has(R"(C:\T\a)", "new");
    machine.Has(R"(C:\N\a)", "old");
    EXPECT_THROW((void)MoveFileOrDirectory(R"(C:\T\a)", OnOtherVolume(R"(C:\N\a)")), fs::filesystem_error);
    EXPECT_THAT(machine.FilesWithoutFolders(),
                UnorderedElementsAre(Pair(R"(C:\T\a)", "new"), Pair(R"(C:\N\a)", "old")));
}

TEST_F(Moving, FailsWithoutASourceBetweenVolumes) {
    machine.HasFolder(R"(C:\N)");
    CapturedStreams streams;
    EXPECT_FALSE(MoveFileOrDirectory(R"(C:\T\none)", OnOtherVolume(R"(C:\N\a)")));
    EXPECT_EQ(streams.Errors(), "ERROR: source does not exist at C:\\T\\none\n");
}

TEST_F(Moving, CountsAsDoneWhenTheSourceStaysBetweenVolumes) {
    machine.HasReadOnly(R"(C:\T\a)", "x");
    machine.HasFolder(R"(C:\N)");
    EXPECT_TRUE(MoveFileOrDirectory(R"(C:\T\a)", OnOtherVolume(R"(C:\N\a)")));
    EXPECT_EQ(machine.Content(R"(C:\T\a)"), "x");
    EXPECT_EQ(machine.Content(R"(C:\N\a)"), "x");
}

class Reading : public OnDisk {};

TEST_F(Reading, GivesTheWholeFileByteForByte) {
    const std::string content(
        "\xef\xbb\xbf"
        "a\r\nb\n\x1a\0c",
        10);
    machine.Has(R"(C:\T\a)", content);
    std::string text = "before";
    EXPECT_EQ(ReadFileToString(R"(C:\T\a)", text), 0);
    EXPECT_EQ(text, content);
}

TEST_F(Reading, GivesALargeFile) {
    std::string content;
    for (int line = 0; line < 100000; ++line) {
        content += std::to_string(line) + "\r\n";
    }
    machine.Has(R"(C:\T\a)", content);
    std::string text;
    EXPECT_EQ(ReadFileToString(R"(C:\T\a)", text), 0);
    EXPECT_TRUE(text == content);
}

TEST_F(Reading, GivesAnEmptyFile) {
    machine.Has(R"(C:\T\a)", "");
    std::string text = "before";
    EXPECT_EQ(ReadFileToString(R"(C:\T\a)", text), 0);
    EXPECT_EQ(text, "");
}

TEST_F(Reading, FailsOnWhatIsNoRegularFile) {
    machine.HasFolder(R"(C:\T)");
    std::string text = "before";
    EXPECT_EQ(ReadFileToString(R"(C:\T)", text), -1);
    EXPECT_EQ(text, "");
    EXPECT_EQ(ReadFileToString(R"(C:\T\none)", text), -1);
}

TEST_F(Reading, SplitsLinesAtLineFeeds) {
    machine.Has(R"(C:\T\a)", "one\r\ntwo\n\r\nthree\r\r\nfo\rur");
    std::vector<std::string> lines = {"before"};
    EXPECT_EQ(ReadFileLines(R"(C:\T\a)", lines), 0);
    EXPECT_THAT(lines, ElementsAre("one", "two", "", "three\r", "fo\rur"));
}

TEST_F(Reading, GivesALastEmptyLineAfterALineFeed) {
    machine.Has(R"(C:\T\a)", "one\r\n");
    std::vector<std::string> lines;
    EXPECT_EQ(ReadFileLines(R"(C:\T\a)", lines), 0);
    EXPECT_THAT(lines, ElementsAre("one", ""));
}

TEST_F(Reading, GivesNoLinesOfWhatIsNoRegularFile) {
    std::vector<std::string> lines = {"before"};
    EXPECT_EQ(ReadFileLines(R"(C:\T\none)", lines), -1);
    EXPECT_THAT(lines, IsEmpty());
}

class FileDigest : public OnDisk {};

TEST_F(FileDigest, IsTheMd5OfTheBytes) {
    machine.Has(R"(C:\T\a)", "message digest");
    EXPECT_EQ(GetFileMD5(R"(C:\T\a)"), "f96b697d7cb7938d525a2f31aaf161d0");
    machine.Has(R"(C:\T\b)",
                "a\r\nb\x1a"
                "c\n");
    EXPECT_EQ(GetFileMD5(R"(C:\T\b)"), "f10d7cb3eb586886516bc76e3f341592");
}

TEST_F(FileDigest, CoversFilesOfManyBlocks) {
    machine.Has(R"(C:\T\a)", std::string(1000003, 'x'));
    EXPECT_EQ(GetFileMD5(R"(C:\T\a)"), "55a76be3046fa1e602ae663deccfcd78");
    machine.Has(R"(C:\T\b)", std::string(4096, 'x'));
    EXPECT_EQ(GetFileMD5(R"(C:\T\b)"), "20439f79e4e9dc95be34b21029221f80");
}

TEST_F(FileDigest, OfAFileThatCannotBeOpenedIsThatOfNoData) {
    EXPECT_EQ(GetFileMD5(R"(C:\T\none)"), "d41d8cd98f00b204e9800998ecf8427e");
    EXPECT_EQ(GetFileMD5(R"(C:\)"), "d41d8cd98f00b204e9800998ecf8427e");
}

class UniqueOnDisk : public OnDisk {};

TEST_F(UniqueOnDisk, ProbesAndLeavesNothing) {
    machine.Has(R"(C:\T\un.bat)", "x");
    machine.Has(R"(C:\T\un-1.bat)", "x");
    const auto before = machine.Files();
    EXPECT_TRUE(GetUniqueFileName(R"(C:\T\un.bat)"));
    EXPECT_TRUE(GetUniqueFileName(R"(C:\T\none)"));
    EXPECT_EQ(machine.Files(), before);
}

class Matching : public OnDisk {
protected:
    std::vector<std::string> files = {"before"};
};

TEST_F(Matching, FindsTheRegularFilesOfADirectory) {
    machine.Has(R"(C:\V\vegas180.exe)", "");
    machine.Has(R"(C:\V\vegas.exe)", "");
    machine.Has(R"(C:\V\vegas180.dll)", "");
    machine.Has(R"(C:\V\sub\vegas190.exe)", "");
    machine.HasFolder(R"(C:\V\vegas-folder.exe)");
    EXPECT_TRUE(MatchFilesInDirectory(R"(C:\V)", "vegas*.exe", files));
    EXPECT_THAT(files, UnorderedElementsAre(R"(C:\V\vegas180.exe)", R"(C:\V\vegas.exe)"));
}

TEST_F(Matching, TakesADirectoryWithATrailingSeparator) {
    machine.Has(R"(C:\V\vegas.exe)", "");
    EXPECT_TRUE(MatchFilesInDirectory(R"(C:\V\)", "vegas*.exe", files));
    EXPECT_THAT(files, ElementsAre(R"(C:\V\vegas.exe)"));
}

TEST_F(Matching, IsFalseWhenNothingMatches) {
    machine.Has(R"(C:\V\Vegas.exe)", "");
    EXPECT_FALSE(MatchFilesInDirectory(R"(C:\V)", "vegas*.exe", files));
    EXPECT_THAT(files, IsEmpty());
}

TEST_F(Matching, IsFalseForWhatIsNoDirectory) {
    machine.Has(R"(C:\V\vegas.exe)", "");
    EXPECT_FALSE(MatchFilesInDirectory(R"(C:\V\vegas.exe)", "*", files));
    EXPECT_FALSE(MatchFilesInDirectory(R"(C:\None)", "*", files));
    EXPECT_THAT(files, IsEmpty());
}

}  // namespace
}  // namespace HVL::FileUtils
