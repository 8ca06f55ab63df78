#include "package/ZipEntries.h"

#include <gtest/gtest.h>

#include "platform/filesystem.h"
#include "tests/support/ArchiveBuilder.h"
#include "tests/support/Machine.h"

namespace {

const std::string kPath = R"(C:\a.zip)";

class ZipEntriesTest : public testing::Test {
protected:
    void Archive(std::vector<ArchiveEntry> entries) {
        ArchiveBuilder archive;
        for (ArchiveEntry& entry : entries) {
            archive.Add(std::move(entry));
        }
        machine.Has(kPath, archive.Bytes());
    }

    int List() { return HV::ReadZipEntries(kPath, files, directories); }

    int Read(const std::string& name) {
        std::vector<char> bytes;
        const int result = HV::ReadZipEntryBytes(kPath, name, bytes);
        content.assign(bytes.begin(), bytes.end());
        return result;
    }

    Machine machine;
    std::vector<std::string> files{"left over"};
    std::vector<std::string> directories{"left over"};
    std::string content;
};

using Names = std::vector<std::string>;

TEST_F(ZipEntriesTest, ListsFilesAndDirectoriesInArchiveOrder) {
    Archive({{.name = "z.txt", .bytes = "1"}, {.name = "b/"}, {.name = "a/c.txt"}, {.name = "back\\"}, {.name = "a/"}});
    EXPECT_EQ(List(), 0);
    EXPECT_EQ(files, (Names{"z.txt", "a/c.txt"}));
    EXPECT_EQ(directories, (Names{"b/", "back\\", "a/"}));
}

TEST_F(ZipEntriesTest, AnArchiveWithoutEntriesOpens) {
    // The library finds the end of a directory anywhere but at the very beginning of a file.
    machine.Has(kPath, "x" + ArchiveBuilder().Bytes());
    EXPECT_EQ(List(), 0);
    EXPECT_TRUE(files.empty());
    EXPECT_TRUE(directories.empty());
}

TEST_F(ZipEntriesTest, WhatIsNoArchiveDoesNotOpenAndClearsTheLists) {
    machine.Has(kPath, "garbage, and quite a lot of it, enough for an end of a directory");
    EXPECT_EQ(List(), -1);
    EXPECT_TRUE(files.empty());
    EXPECT_TRUE(directories.empty());
}

TEST_F(ZipEntriesTest, AMissingArchiveDoesNotOpen) {
    EXPECT_EQ(List(), -1);
}

TEST_F(ZipEntriesTest, ADirectoryThatBreaksOffDoesNotOpen) {
    Archive({{.name = "first.txt", .bytes = "1"}, {.name = "second.txt", .bytes = "2"}});
    std::string bytes = machine.Content(kPath);
    const auto second = bytes.rfind("PK\x01\x02");
    ASSERT_NE(second, std::string::npos);
    bytes[second] = 'X';
    machine.Has(kPath, bytes);
    EXPECT_EQ(List(), -1);
    EXPECT_TRUE(files.empty());
}

TEST_F(ZipEntriesTest, ReadsDeflatedAndStoredEntries) {
    const std::string large(300000, 'x');
    Archive({{.name = "packed", .bytes = large}, {.name = "stored", .bytes = "as it is", .method = 0}});
    EXPECT_EQ(Read("packed"), 0);
    EXPECT_EQ(content, large);
    EXPECT_EQ(Read("stored"), 0);
    EXPECT_EQ(content, "as it is");
}

TEST_F(ZipEntriesTest, AnEntryOfLengthZeroIsNotRead) {
    Archive({{.name = "empty"}});
    EXPECT_EQ(Read("empty"), -1);
}

TEST_F(ZipEntriesTest, AMissingEntryIsNotRead) {
    Archive({{.name = "there", .bytes = "x"}});
    EXPECT_EQ(Read("not there"), -1);
    EXPECT_EQ(Read("THERE"), -1);
    EXPECT_EQ(Read(""), -1);
}

TEST_F(ZipEntriesTest, NothingIsReadFromWhatIsNoArchive) {
    machine.Has(kPath, "garbage");
    EXPECT_EQ(Read("x"), -1);
}

TEST_F(ZipEntriesTest, OfTwoEntriesWithOneNameNeitherIsRead) {
    Archive({{.name = "twice", .bytes = "first"}, {.name = "twice", .bytes = "second"}});
    EXPECT_EQ(List(), 0);
    EXPECT_EQ(files, (Names{"twice", "twice"}));
    EXPECT_EQ(Read("twice"), -1);
}

TEST_F(ZipEntriesTest, NamesUpToTheBuffersRoomAreKnown) {
    const std::string longest = std::string(129, 'f') + "/" + std::string(129, 'n');
    Archive({{.name = longest, .bytes = "x"}});
    EXPECT_EQ(List(), 0);
    EXPECT_EQ(files, Names{longest});
    EXPECT_EQ(Read(longest), 0);
}

TEST_F(ZipEntriesTest, LongerNamesAreCutAndCannotBeRead) {
    Archive({{.name = std::string(260, 'n'), .bytes = "x"}, {.name = std::string(300, 'd') + "/"}});
    EXPECT_EQ(List(), 0);
    EXPECT_EQ(files, (Names{std::string(259, 'n'), std::string(259, 'd')}));
    EXPECT_TRUE(directories.empty());
    EXPECT_EQ(Read(std::string(259, 'n')), -1);
    EXPECT_EQ(Read(std::string(260, 'n')), -1);
}

TEST_F(ZipEntriesTest, BytesThatDoNotMatchTheirChecksumAreNotRead) {
    Archive({{.name = "bad", .bytes = "content", .claimedChecksum = 12345}});
    EXPECT_EQ(Read("bad"), -1);
}

TEST_F(ZipEntriesTest, AnArchiveAfterAnotherFilesBytesOpens) {
    Archive({{.name = "a", .bytes = "x"}});
    machine.Has(kPath, "a program that unpacks itself" + machine.Content(kPath));
    EXPECT_EQ(List(), 0);
    EXPECT_EQ(Read("a"), 0);
    EXPECT_EQ(content, "x");
}

TEST_F(ZipEntriesTest, EachFunctionLeavesTheArchiveClosed) {
    Archive({{.name = "a", .bytes = "x"}});
    EXPECT_EQ(List(), 0);
    EXPECT_EQ(Read("a"), 0);
    EXPECT_EQ(HV::ExtractZip(kPath, R"(C:\out)"), 0);
    boost::system::error_code error;
    EXPECT_TRUE(fs::remove(fs::path(kPath), error)) << error.message();
}

}  // namespace
