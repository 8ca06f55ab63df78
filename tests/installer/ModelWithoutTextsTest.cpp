// A program into which no table of texts is compiled, which is a table that cannot be read.
#include "tests/installer/ModelTest.h"

namespace {

using ModelWithoutTextsTest = ModelTest;

TEST_F(ModelWithoutTextsTest, SaysSoAndGoesOn) {
    setup.HasSuite();
    setup.Ships(Product("glow"));
    const HV::InstallerModel& model = Load();
    EXPECT_EQ(errors, "ERROR: xml strings resource parsing failed.\n");
    EXPECT_TRUE(model.valid) << log.Text();
    EXPECT_EQ(model.packages.size(), 1U);
}

TEST_F(ModelWithoutTextsTest, HasAnEmptyTitle) {
    const HV::InstallerModel& model = Load();
    CapturedStreams streams;
    EXPECT_EQ(model.GetString("installer.title.noversion"), "");
}

}  // namespace
