// Disks that run full while an archive is unpacked, and links in place of a file. Only the hosted machine can be
// broken, and Wine shows a host's link to a file as that file, so these exist for it alone.
#include <gtest/gtest.h>

#include "package/Package.h"
#include "package/ZipEntries.h"
#include "tests/support/ArchiveBuilder.h"
#include "tests/support/Faults.h"
#include "tests/support/HostLink.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"

namespace {

const std::string kPath = R"(C:\a.zip)";
const std::string kOut = R"(C:\out)";
const std::string kLarge(100000, 'l');

class ExtractionOnAFullDisk : public testing::Test {
protected:
    ExtractionOnAFullDisk() {
        machine.Has(kPath, ArchiveBuilder()
                               .Add({.name = "small", .bytes = "12345"})
                               .Add({.name = "large", .bytes = kLarge})
                               .Add({.name = "last", .bytes = "x"})
                               .Bytes());
    }

    /// Unpacks with room for this many bytes, which ends within the large entry.
    void ExpectAShortWrite(std::uint64_t room) {
        faults.LimitSpace(room);
        EXPECT_EQ(HV::ExtractZip(kPath, kOut), -1);
        EXPECT_EQ(log.LinesStartingWith("ERROR"),
                  (std::vector<std::string>{"ERROR hvdeploy-detail: ERROR: failed to write zip entry file large"}));
        EXPECT_EQ(machine.Content(kOut + R"(\small)"), "12345") << "what was written before stays";
        EXPECT_TRUE(machine.HasFile(kOut + R"(\large)")) << "the caller removes the folder";
        EXPECT_LE(machine.Content(kOut + R"(\large)").size(), room - 5);
        EXPECT_FALSE(machine.Exists(kOut + R"(\last)"));
    }

    Machine machine;
    LogRecorder log;
    MachineFaults faults{machine};
};

TEST_F(ExtractionOnAFullDisk, FailsWhenNoByteOfAnEntryFits) {
    ExpectAShortWrite(5);
}

TEST_F(ExtractionOnAFullDisk, FailsWhenHalfOfAnEntryFits) {
    ExpectAShortWrite(5 + kLarge.size() / 2);
}

TEST_F(ExtractionOnAFullDisk, FailsWhenTheLastByteOfAnEntryDoesNotFit) {
    ExpectAShortWrite(5 + kLarge.size() - 1);
}

TEST_F(ExtractionOnAFullDisk, SucceedsWhenTheLastByteFits) {
    faults.LimitSpace(5 + kLarge.size() + 1);
    EXPECT_EQ(HV::ExtractZip(kPath, kOut), 0) << log.Text();
    EXPECT_EQ(machine.Content(kOut + R"(\large)"), kLarge);
    EXPECT_EQ(machine.Content(kOut + R"(\last)"), "x");
}

TEST_F(ExtractionOnAFullDisk, FailsWhenTheWriteItselfFails) {
    faults.FailNth(hosted::Operation::Write, 2);
    EXPECT_EQ(HV::ExtractZip(kPath, kOut), -1);
    EXPECT_LT(machine.Content(kOut + R"(\large)").size(), kLarge.size());
}

TEST_F(ExtractionOnAFullDisk, DoesNotMakeAPackageCountAsExtracted) {
    faults.LimitSpace(50000);
    HV::Package package{fs::path(kPath)};
    EXPECT_FALSE(package.ExtractTo(fs::path(kOut)));
    EXPECT_FALSE(package.IsExtracted());
    EXPECT_EQ(package.extractedPath, fs::path());
}

TEST(ExtractionOntoALink, WritesNothingThroughIt) {
    Machine machine;
    const LogRecorder log;
    machine.Has(R"(C:\victim)", "somebody else's");
    machine.HasFolder(kOut);
    machine.Has(kPath, ArchiveBuilder().Add({.name = "a", .bytes = "new"}).Add({.name = "b", .bytes = "new"}).Bytes());
    for (const char* target : {R"(C:\victim)", R"(C:\made)"}) {
        const HostLink link(machine, kOut + R"(\a)", target);
        EXPECT_EQ(HV::ExtractZip(kPath, kOut), -1);
        EXPECT_TRUE(log.Has("ERROR hvdeploy-detail: ERROR: failed to write zip entry file a")) << log.Text();
    }
    EXPECT_EQ(machine.Content(R"(C:\victim)"), "somebody else's");
    EXPECT_FALSE(machine.Exists(R"(C:\made)"));
}

}  // namespace
