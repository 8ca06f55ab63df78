#include <gtest/gtest.h>

#include <filesystem>

#include "package/ZipEntries.h"
#include "tests/support/ArchiveBuilder.h"
#include "tests/support/HostLink.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"

namespace {

const std::string kPath = R"(C:\a.zip)";
const std::string kOut = R"(C:\out)";

std::string Error(const std::string& text) {
    return "ERROR hvdeploy-detail: " + text;
}

class ExtractionTest : public testing::Test {
protected:
    int Extract(std::vector<ArchiveEntry> entries) {
        ArchiveBuilder archive;
        for (ArchiveEntry& entry : entries) {
            archive.Add(std::move(entry));
        }
        machine.Has(kPath, archive.Bytes());
        return HV::ExtractZip(kPath, kOut);
    }

    Machine machine;
    LogRecorder log;
};

TEST_F(ExtractionTest, WritesFoldersAndFiles) {
    EXPECT_EQ(Extract({{.name = "sub/"},
                       {.name = "sub/deeper/"},
                       {.name = "top.txt", .bytes = "top"},
                       {.name = "sub/deeper/low.bin", .bytes = std::string("a\0\r\n\x1A z", 7)}}),
              0);
    EXPECT_EQ(machine.Content(R"(C:\out\top.txt)"), "top");
    EXPECT_EQ(machine.Content(R"(C:\out\sub\deeper\low.bin)"), std::string("a\0\r\n\x1A z", 7));
}

TEST_F(ExtractionTest, SaysWhatItDoes) {
    EXPECT_EQ(Extract({}), 0);
    EXPECT_EQ(log.Lines(), (std::vector<std::string>{R"(DEBUG hvdeploy-detail: DEBUG - extracting C:\a.zip)",
                                                     R"(DEBUG hvdeploy-detail:   to directory: C:\out)"}));
}

TEST_F(ExtractionTest, MakesTheDestinationWithItsParents) {
    machine.Has(kPath, ArchiveBuilder().Add({.name = "a", .bytes = "x"}).Bytes());
    EXPECT_EQ(HV::ExtractZip(kPath, R"(C:\one\two\three)"), 0);
    EXPECT_EQ(machine.Content(R"(C:\one\two\three\a)"), "x");
}

TEST_F(ExtractionTest, WhatDoesNotOpenUnpacksToNothingAndIsNoFailure) {
    machine.Has(kPath, "garbage");
    EXPECT_EQ(HV::ExtractZip(kPath, kOut), 0);
    EXPECT_TRUE(machine.Exists(kOut));
    EXPECT_EQ(machine.FilesWithoutFolders().size(), 1U);
}

TEST_F(ExtractionTest, AnEmptyEntryBecomesAnEmptyFile) {
    EXPECT_EQ(Extract({{.name = "packed"}, {.name = "stored", .bytes = "", .method = 0}}), 0);
    EXPECT_EQ(machine.Content(R"(C:\out\packed)"), "");
    EXPECT_EQ(machine.Content(R"(C:\out\stored)"), "");
}

TEST_F(ExtractionTest, SmallEntriesAfterLargeOnesAreWhole) {
    const std::string large(1 << 20, 'l');
    EXPECT_EQ(Extract({{.name = "1", .bytes = "small"},
                       {.name = "2", .bytes = large},
                       {.name = "3", .bytes = "little"},
                       {.name = "4", .bytes = large + "!"}}),
              0);
    EXPECT_EQ(machine.Content(R"(C:\out\1)"), "small");
    EXPECT_EQ(machine.Content(R"(C:\out\2)"), large);
    EXPECT_EQ(machine.Content(R"(C:\out\3)"), "little");
    EXPECT_EQ(machine.Content(R"(C:\out\4)"), large + "!");
}

TEST_F(ExtractionTest, AFolderIsMadeWithItsMissingParents) {
    EXPECT_EQ(Extract({{.name = "a/b/c/"}, {.name = "x\\y\\"}}), 0);
    EXPECT_TRUE(machine.Exists(R"(C:\out\a\b\c)"));
    EXPECT_TRUE(machine.Exists(R"(C:\out\x\y)"));
}

TEST_F(ExtractionTest, FoldersComeBeforeFilesWhereverTheyStand) {
    EXPECT_EQ(Extract({{.name = "sub/file", .bytes = "x"}, {.name = "sub/"}}), 0);
    EXPECT_EQ(machine.Content(R"(C:\out\sub\file)"), "x");
}

TEST_F(ExtractionTest, AFileWhoseFolderIsNotListedFails) {
    EXPECT_EQ(Extract({{.name = "sub/file", .bytes = "x"}}), -1);
    EXPECT_TRUE(log.Has(Error("ERROR: failed to write zip entry file sub/file")));
    EXPECT_FALSE(machine.Exists(R"(C:\out\sub)"));
}

TEST_F(ExtractionTest, AFolderBelowAFileFailsWithTheJoinedPath) {
    machine.Has(R"(C:\out\sub)", "a file is in the way");
    const int result = Extract({{.name = "sub/deeper/"}});
    EXPECT_NE(result, 0);
    EXPECT_TRUE(log.Has(Error(R"(ERROR: failed to create directory C:\out\sub/deeper/)"))) << log.Text();
}

TEST_F(ExtractionTest, AFolderThatIsThereAsAFileIsNoFailureByItself) {
    machine.Has(R"(C:\out\sub)", "a file is in the way");
    EXPECT_EQ(Extract({{.name = "sub/"}}), 0);
    EXPECT_EQ(machine.Content(R"(C:\out\sub)"), "a file is in the way");
}

TEST_F(ExtractionTest, ATargetThatCannotBeOpenedFails) {
    machine.HasFolder(R"(C:\out\taken)");
    EXPECT_EQ(Extract({{.name = "taken", .bytes = "x"}}), -1);
    EXPECT_TRUE(log.Has(Error("ERROR: failed to write zip entry file taken")));
}

TEST_F(ExtractionTest, ReplacesAFileThatIsThere) {
    machine.Has(R"(C:\out\a)", "a longer old content");
    EXPECT_EQ(Extract({{.name = "a", .bytes = "new"}}), 0);
    EXPECT_EQ(machine.Content(R"(C:\out\a)"), "new");
}

TEST_F(ExtractionTest, WritesNothingIntoAFileThatHasASecondName) {
    machine.Has(R"(C:\victim)", "somebody else's");
    machine.HasFolder(kOut);
    std::filesystem::create_hard_link(machine.HostName(R"(C:\victim)"), machine.HostName(kOut + R"(\a)"));
    EXPECT_EQ(Extract({{.name = "a", .bytes = "new"}}), -1);
    EXPECT_EQ(machine.Content(R"(C:\victim)"), "somebody else's");
}

TEST_F(ExtractionTest, WritesNothingThroughALinkInPlaceOfAFolder) {
    machine.HasFolder(R"(C:\victim)");
    machine.HasFolder(kOut + R"(\sub)");
    const HostLink link(machine, kOut + R"(\sub\deeper)", R"(C:\victim)");
    EXPECT_EQ(Extract({{.name = "sub/"},
                       {.name = "sub/deeper/"},
                       {.name = "sub/deeper/folder/"},
                       {.name = "sub/deeper/a", .bytes = "new"}}),
              -1);
    EXPECT_TRUE(std::filesystem::is_empty(machine.HostName(R"(C:\victim)")));
    EXPECT_EQ(Extract({{.name = "sub/"}, {.name = "sub/deeper/"}, {.name = "sub/deeper/a", .bytes = "new"}}), -1);
    EXPECT_TRUE(std::filesystem::is_empty(machine.HostName(R"(C:\victim)")));
    EXPECT_TRUE(log.Has(Error("ERROR: failed to write zip entry file sub/deeper/a"))) << log.Text();
}

TEST_F(ExtractionTest, FilesOfManyFoldersMayStandInAnyOrder) {
    EXPECT_EQ(Extract({{.name = "a/"},
                       {.name = "a/b/"},
                       {.name = "ab/"},
                       {.name = "a/b/1", .bytes = "1"},
                       {.name = "ab/2", .bytes = "2"},
                       {.name = "3", .bytes = "3"},
                       {.name = "a/4", .bytes = "4"},
                       {.name = "a/b/5", .bytes = "5"}}),
              0)
        << log.Text();
    EXPECT_EQ(machine.Content(kOut + R"(\a\b\1)") + machine.Content(kOut + R"(\ab\2)") +
                  machine.Content(kOut + R"(\3)") + machine.Content(kOut + R"(\a\4)") +
                  machine.Content(kOut + R"(\a\b\5)"),
              "12345");
}

TEST_F(ExtractionTest, TheFirstFailureEndsItAndWhatWasWrittenStays) {
    EXPECT_EQ(Extract({{.name = "1", .bytes = "x"}, {.name = "2", .bytes = "x", .claimedChecksum = 1}, {.name = "3"}}),
              -1);
    EXPECT_TRUE(log.Has(Error("ERROR: failed to write zip entry file 2")));
    EXPECT_TRUE(machine.Exists(R"(C:\out\1)"));
    EXPECT_FALSE(machine.Exists(R"(C:\out\3)"));
}

TEST_F(ExtractionTest, OfTwoEntriesWithOneNameNeitherIsWritten) {
    EXPECT_EQ(Extract({{.name = "twice", .bytes = "first"}, {.name = "twice", .bytes = "second"}}), -1);
    EXPECT_FALSE(machine.Exists(R"(C:\out\twice)"));
}

TEST_F(ExtractionTest, NamesOfAnyScriptAreKept) {
    EXPECT_EQ(Extract({{.name = "Gl\xC3\xBChen.txt", .bytes = "x", .flags = 1 << 11}}), 0);
    EXPECT_EQ(machine.Content("C:\\out\\Gl\xC3\xBChen.txt"), "x");
}

}  // namespace
