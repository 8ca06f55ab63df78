// What somebody has put beside the release, or into it, by the time that the engine starts. The one who does it wants
// C:\planted.txt to be written, or a file of his own to be installed.
#include <algorithm>
#include <cctype>

#include "hvframework/FileUtils.h"
#include "tests/installer/WizardTest.h"

namespace {

constexpr const char* kSetup = R"(C:\Setup)";
constexpr const char* kPlantedProgram = "Z:" HV_PROGRAM_FOLDER "/planted_program" HV_PROGRAM_SUFFIX;

class WizardSurroundings : public WizardTest {
protected:
    /// Goes on from the selection page to the end of the run.
    void InstallToTheEnd() {
        (void)InstallAndPoll();
        WaitForJob();
    }

};

// Hosted, /bin/sh does not look for programs in the current folder by itself, so there the test holds no more than that
// the engine works in the system's folder.
TEST_F(WizardSurroundings, AProgramBesideTheReleaseIsNotRunByAScript) {
    std::string program;
    ASSERT_EQ(HVL::FileUtils::ReadFileToString(kPlantedProgram, program), 0);
    machine.Has(R"(C:\Setup\reg.exe)", program);
    Ships(Product("glow").Postflight("reg query HKCU"));
    fs::current_path(fs::path(kSetup));
    GoToSelection();
    InstallToTheEnd();
    EXPECT_EQ(machine.Content(PlaceOf("glow")), TextOf("glow"));
    EXPECT_TRUE(log.Has("DEBUG hvdeploy-detail: Postflight command: reg query HKCU")) << log.Text();
    EXPECT_FALSE(machine.Exists(R"(C:\planted.txt)"));
    std::string folder = fs::current_path().string();
    std::ranges::transform(folder, folder.begin(), [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    EXPECT_EQ(folder, R"(c:\windows\system32)");
}

}  // namespace
