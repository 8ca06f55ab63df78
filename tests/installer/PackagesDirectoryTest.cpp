// Where the packages lie, and what the wizard says when they do not lie there.
#include <gtest/gtest.h>

#include "installer/StartUp.h"
#include "tests/installer/ScriptedToolkit.h"
#include "tests/support/Machine.h"

namespace {

constexpr const char* kPackages = R"(C:\Setup\packages)";

class PackagesDirectoryTest : public testing::Test {
protected:
    /// The status with which the process would have ended.
    std::optional<unsigned> Require() {
        try {
            HV::RequirePackagesDirectory(toolkit, kPackages);
            return std::nullopt;
        } catch (const WizardEnded& end) {
            return end.status;
        }
    }

    Machine machine;
    ScriptedToolkit toolkit;
};

const ShownBox kBox{
    .title = "Packages Directory Not Found",
    .text =
        "This installer application has been moved. It must be run from its original folder containing a packages "
        "directory. The installer will now exit.",
    .beep = 16U,
    .type = 16,
    .ownedByWindow = false,
};

TEST_F(PackagesDirectoryTest, LiesBesideTheProgram) {
    EXPECT_EQ(HV::PackagesDirectoryPath(R"(C:\Setup\hvinstaller.exe)"), kPackages);
}

TEST_F(PackagesDirectoryTest, IsEnoughForTheWizardToGoOn) {
    machine.HasFolder(kPackages);
    EXPECT_EQ(Require(), std::nullopt);
    EXPECT_TRUE(toolkit.calls.empty());
}

TEST_F(PackagesDirectoryTest, EndsTheWizardWithABoxWhenItIsMissing) {
    toolkit.AnswerNext(1);
    EXPECT_EQ(Require(), 0U);
    EXPECT_EQ(toolkit.boxes, std::vector<ShownBox>{kBox});
}

TEST_F(PackagesDirectoryTest, IsMissingWhereAFileHasItsName) {
    machine.Has(kPackages, "no folder");
    toolkit.AnswerNext(1);
    EXPECT_EQ(Require(), 0U);
    EXPECT_EQ(toolkit.boxes, std::vector<ShownBox>{kBox});
}

}  // namespace
