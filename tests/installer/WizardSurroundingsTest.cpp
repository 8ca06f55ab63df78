// What somebody has put beside the release, or into it, by the time that the engine starts. The one who does it wants
// C:\planted.txt to be written, or a file of his own to be installed.
#include <algorithm>
#include <cctype>
#include <filesystem>
#include <system_error>

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

    /// A package of this name that the release does not have.
    static PackageBuilder Foreign(const std::string& name) {
        return PackageBuilder("com.halvorn." + name)
            .Payload("resource")
            .To("programdata", "Products")
            .File("foreign.txt", "planted");
    }

    /// Tries to put a foreign package into the place of the one of this name; whether the system lets it be done.
    static bool WritesOver(const std::string& name) {
        try {
            (void)Foreign(name).WriteTo(kPackages);
        } catch (const std::runtime_error&) {
            return false;
        }
        return true;
    }
    bool MovesOver(const std::string& name) {
        const fs::path foreign = Foreign(name).WriteTo(R"(C:\Elsewhere)");
        return Renames(foreign.string(), InPackages(foreign.filename().string()));
    }

    /// Both by the host's own means, as another program has them: on the hosted machine itself a file that this process
    /// has open stays where it is.
    bool Renames(const std::string& from, const std::string& to) {
        std::error_code error;
        std::filesystem::rename(machine.HostName(from), machine.HostName(to), error);
        return !error;
    }
    bool Removes(const std::string& fileName) {
        std::error_code error;
        return std::filesystem::remove(machine.HostName(InPackages(fileName)), error) && !error;
    }

    /// Presses Install and expects the refusal that the test of the packages gives, for this reason.
    void ExpectRefusal(const std::string& reason) {
        toolkit.AnswerNext(kOk);
        try {
            Install();
            ADD_FAILURE() << "the wizard goes on";
        } catch (const WizardEnded& end) {
            EXPECT_EQ(end.status, 0U);
        }
        EXPECT_EQ(toolkit.boxes, std::vector{kInvalidPackages});
        EXPECT_TRUE(log.Has("ERROR hvdeploy-detail: " + reason)) << log.Text();
        EXPECT_EQ(wizard.job, nullptr) << "the engine was started";
        EXPECT_FALSE(machine.Exists(PlaceOf("glow")));
        ExpectNothingForeign();
    }

    /// Installs what was tested.
    void ExpectInstall() {
        InstallToTheEnd();
        EXPECT_EQ(machine.Content(PlaceOf("glow")), TextOf("glow"));
        ExpectNothingForeign();
    }

    /// What was done to a file of the release either could not be done, because the system holds the file for the
    /// wizard, or is seen before the engine starts.
    void ExpectHeldOrRefused(bool done, const std::string& reason) {
        EXPECT_EQ(done, !kSystemHoldsFiles);
        if (done) {
            ExpectRefusal(reason);
        } else {
            ExpectInstall();
        }
    }

    void ExpectNothingForeign() { EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Products\foreign.txt)")); }

    static constexpr bool kSystemHoldsFiles = HV_SYSTEM_HOLDS_FILES;
};

const std::string kGlow = "com.halvorn.glow.hvpkg";

TEST_F(WizardSurroundings, APackageThatIsWrittenOverAtTheWelcomePageIsNotInstalled) {
    Ships(Product("glow"));
    BeginAndAgree();
    const bool done = WritesOver("glow");
    toolkit.Press(HV::kContinueCommand);
    ExpectHeldOrRefused(done, "validation of " + kGlow + " failed.");
}

TEST_F(WizardSurroundings, APackageThatIsReplacedAtTheWelcomePageIsNotInstalled) {
    Ships(Product("glow"));
    BeginAndAgree();
    const bool done = MovesOver("glow");
    toolkit.Press(HV::kContinueCommand);
    ExpectHeldOrRefused(done, "validation of " + kGlow + " failed.");
}

TEST_F(WizardSurroundings, APackageThatIsReplacedByAnotherOfItsSizeIsNotInstalled) {
    Ships(Product("glow"));
    BeginAndAgree();
    std::string bytes = machine.Content(InPackages(kGlow));
    machine.Has(R"(C:\Elsewhere\swapped)", bytes);
    const bool done = Renames(R"(C:\Elsewhere\swapped)", InPackages(kGlow));
    toolkit.Press(HV::kContinueCommand);
    ExpectHeldOrRefused(done, "validation of " + kGlow + " failed.");
}

TEST_F(WizardSurroundings, APackageThatGoesAtTheWelcomePageEndsTheWizard) {
    Ships(Product("glow"));
    BeginAndAgree();
    const bool done = Removes(kGlow);
    toolkit.Press(HV::kContinueCommand);
    ExpectHeldOrRefused(done, "validation of " + kGlow + " failed.");
}

TEST_F(WizardSurroundings, ASuiteThatIsReplacedAtTheWelcomePageRegistersNothing) {
    Ships(Product("glow"));
    BeginAndAgree();
    machine.Has(R"(C:\Elsewhere\suite.json)", R"({"identifier": "x", "version": "1", "display_name": "Foreign"})");
    const bool done = Renames(R"(C:\Elsewhere\suite.json)", InPackages("suite.json"));
    toolkit.Press(HV::kContinueCommand);
    ExpectHeldOrRefused(done, "validation of suite.json failed.");
}

class AddedFile : public WizardSurroundings, public testing::WithParamInterface<const char*> {};

TEST_P(AddedFile, AtTheWelcomePageEndsTheWizard) {
    const std::string name = GetParam();
    Ships(Product("glow"));
    BeginAndAgree();
    if (name.starts_with("a.")) {
        machine.Has(InPackages(name), R"({"identifier": "x", "version": "1", "display_name": "Foreign"})");
    } else {
        (void)Foreign("foreign").Named(name).WriteTo(kPackages);
    }
    toolkit.Press(HV::kContinueCommand);
    ExpectRefusal("ERROR: " + name + " is not valid payload.");
}

INSTANTIATE_TEST_SUITE_P(OfEveryKindThatTheEngineReads, AddedFile,
                         testing::Values("foreign.hvpkg", "foreign.zip", "FOREIGN.HVPKG", "foreign.Zip", "a.json",
                                         "a.JSON"));

// The scan passes over an extension in upper case; the engine does not.
TEST_F(WizardSurroundings, APackageThatTheScanHasPassedOverIsNotInstalled) {
    Ships(Product("glow"));
    (void)Foreign("foreign").Named("foreign.HVPKG").WriteTo(kPackages);
    GoToSelection();
    ExpectRefusal("ERROR: foreign.HVPKG is not valid payload.");
}

TEST_F(WizardSurroundings, WhatIsAddedOnceTheEngineHasStartedIsNotInstalled) {
    Ships(Product("glow"));
    GoToSelection();
    output.gate.HoldAt("hvdeploy version");
    Install();
    ASSERT_TRUE(output.gate.WaitUntilHeld());
    (void)Foreign("foreign").WriteTo(kPackages);
    EndTheRun();
    toolkit.AnswerNext(kOk);
    TickToTheEnd();
    EXPECT_EQ(toolkit.boxes, std::vector{kInstallationFailed});
    EXPECT_TRUE(log.Has("ERROR hvdeploy-detail: ERROR: com.halvorn.foreign.hvpkg is not valid payload.")) << log.Text();
    EXPECT_FALSE(machine.Exists(PlaceOf("glow")));
    ExpectNothingForeign();
}

TEST_F(WizardSurroundings, FilesThatTheEngineDoesNotReadMayComeAndGo) {
    machine.Has(InPackages("readme.txt"), "text");
    Ships(Product("glow"));
    GoToSelection();
    EXPECT_TRUE(Removes("readme.txt"));
    machine.Has(InPackages("Thumbs.db"), "pictures");
    machine.HasFolder(InPackages("folder.hvpkg"));
    ExpectInstall();
}

// The whole folder: where the system holds the files in it, it stays.
TEST_F(WizardSurroundings, APackagesFolderThatIsSwappedAtTheWelcomePageIsNotInstalledFrom) {
    Ships(Product("glow"));
    BeginAndAgree();
    const bool done = Renames(kPackages, R"(C:\Setup\before)");
    if (done) {
        machine.Has(InPackages("suite.json"), machine.Content(R"(C:\Setup\before\suite.json)"));
        (void)Foreign("glow").WriteTo(kPackages);
    }
    toolkit.Press(HV::kContinueCommand);
    // Wine renames a folder whose files are open; Windows does not. Either way nothing foreign is installed.
    if (done) {
        ExpectRefusal("validation of suite.json failed.");
    } else {
        ExpectInstall();
    }
}

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
