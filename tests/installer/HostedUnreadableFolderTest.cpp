// A packages folder that is there and cannot be listed. Under Wine nothing refuses that to a program, so the claim is
// held to the hosted machine alone.
#include "tests/installer/ModelTest.h"
#include "tests/installer/UnreadableFile.h"

namespace {

using HostedUnreadableFolderTest = ModelTest;

TEST_F(HostedUnreadableFolderTest, IsNotValidAndSaysNothing) {
    setup.HasSuite();
    setup.Ships(Product("glow"));
    const UnreadableFile unreadable(machine, kPackages);
    const HV::InstallerModel& model = Load();
    EXPECT_FALSE(model.valid);
    EXPECT_TRUE(model.packageFiles.empty());
    EXPECT_EQ(model.suiteJsonPath, "");
    EXPECT_EQ(errors, "");
}

}  // namespace
