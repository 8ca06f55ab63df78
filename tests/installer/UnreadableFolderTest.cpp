// A packages folder that is there and cannot be listed.
#include "tests/installer/ModelTest.h"
#include "tests/support/UnreadableFile.h"

namespace {

using UnreadableFolderTest = ModelTest;

TEST_F(UnreadableFolderTest, IsNotValidAndSaysNothing) {
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
