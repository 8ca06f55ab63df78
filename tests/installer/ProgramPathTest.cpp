// Where the wizard lies.
#include <gtest/gtest.h>

#include "hvframework/FileUtils.h"
#include "installer/StartUp.h"
#include "tests/support/Machine.h"

namespace {

TEST(ProgramPath, IsTheFullPathOfThisProgram) {
    const Machine machine;
    const std::string path = HV::ProgramPath();
    EXPECT_EQ(HVL::FileUtils::GetFileName(path).rfind("start_up_tests", 0), 0U) << path;
    EXPECT_EQ(path.substr(1, 2), ":\\") << path;
    EXPECT_TRUE(HVL::FileUtils::FileExists(path)) << path;
}

TEST(ProgramPath, HasThePackagesBesideIt) {
    const Machine machine;
    EXPECT_EQ(HV::PackagesDirectoryPath(), HVL::FileUtils::GetParentPath(HV::ProgramPath()) + "\\packages");
}

}  // namespace
