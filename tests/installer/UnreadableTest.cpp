// Files of the packages folder that are there and cannot be read.
#include "tests/installer/ModelTest.h"
#include "tests/support/UnreadableFile.h"

namespace {

using UnreadableTest = ModelTest;

TEST_F(UnreadableTest, ASuiteFileThatCannotBeReadIsRefusedWithoutAWord) {
    setup.HasSuite();
    setup.Ships(Product("glow"));
    const UnreadableFile unreadable(machine, InPackages("suite.json"));
    const HV::InstallerModel& model = Load();
    EXPECT_FALSE(model.valid);
    EXPECT_EQ(model.suiteJsonPath, InPackages("suite.json"));
    EXPECT_EQ(errors, "");
    EXPECT_EQ(log.LinesStartingWith("ERROR"), Texts{});
}

TEST_F(UnreadableTest, APackageThatCannotBeReadIsRefused) {
    setup.HasSuite();
    const std::string name = setup.Ships(Product("glow"));
    const UnreadableFile unreadable(machine, InPackages(name));
    EXPECT_FALSE(Load().valid);
    EXPECT_EQ(log.LinesStartingWith("ERROR"), Texts{DetailError("validation of com.halvorn.glow.hvpkg failed.")});
}

TEST_F(UnreadableTest, APackageThatCannotBeReadIsRefusedEvenWhereNoDataHasTheRightDigest) {
    setup.HasSuite();
    const std::string name = setup.Has(Product("glow"));
    setup.Knows(name, "d41d8cd98f00b204e9800998ecf8427e");
    const UnreadableFile unreadable(machine, InPackages(name));
    EXPECT_FALSE(Load().valid);
    EXPECT_EQ(log.LinesStartingWith("ERROR"), Texts{DetailError("ReadZipEntries failed for com.halvorn.glow.hvpkg")});
}

}  // namespace
