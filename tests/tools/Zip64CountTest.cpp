#include "tools/hvpack/Zip64Count.h"

#include <gtest/gtest.h>

#include "package/ZipEntries.h"
#include "tests/support/ArchiveBuilder.h"
#include "tests/support/Machine.h"

namespace {

const std::string kPath = R"(C:\a.zip)";

/// An archive of three entries that says its number of entries does not fit.
class Zip64CountTest : public testing::Test {
protected:
    void SetUp() override {
        std::string bytes =
            ArchiveBuilder().Add({.name = "a", .bytes = "1"}).Add({.name = "b/"}).Add({.name = "c"}).Bytes();
        bytes.replace(bytes.size() - 14, 4, "\xFF\xFF\xFF\xFF");
        machine.Has(kPath, bytes);
    }

    Machine machine;
    std::vector<std::string> files;
    std::vector<std::string> directories;
};

TEST_F(Zip64CountTest, ADirectoryThatEndsBeforeTheCountThatDoesNotFitIsBroken) {
    EXPECT_EQ(HV::ReadZipEntries(kPath, files, directories), -1);
}

TEST_F(Zip64CountTest, TellsReadersTheNumberOfEntries) {
    ASSERT_TRUE(HVPack::AddZip64Count(fs::path(kPath), 3));
    EXPECT_EQ(HV::ReadZipEntries(kPath, files, directories), 0);
    EXPECT_EQ(files, (std::vector<std::string>{"a", "c"}));
    EXPECT_EQ(directories, std::vector<std::string>{"b/"});
    std::vector<char> bytes;
    EXPECT_EQ(HV::ReadZipEntryBytes(kPath, "a", bytes), 0);
}

TEST_F(Zip64CountTest, ANumberBeyondTheDirectoryIsALie) {
    ASSERT_TRUE(HVPack::AddZip64Count(fs::path(kPath), 4));
    EXPECT_EQ(HV::ReadZipEntries(kPath, files, directories), -1);
}

TEST_F(Zip64CountTest, FailsForWhatIsNoArchive) {
    EXPECT_FALSE(HVPack::AddZip64Count(fs::path(R"(C:\none.zip)"), 3));
    machine.Has(R"(C:\short.zip)", "short");
    EXPECT_FALSE(HVPack::AddZip64Count(fs::path(R"(C:\short.zip)"), 3));
}

}  // namespace
