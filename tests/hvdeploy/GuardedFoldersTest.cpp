// Folders that somebody has made before the first run, with something in them for it to read. What everybody can make
// without being seen as its owner is a second name of a file; HostedGuardedFoldersTest.cpp has another account's own.
#include "hvdeploy/src/GuardedFolders.h"

#include <gtest/gtest.h>

#include <filesystem>

#include "platform/guarded_folder.h"
#include "tests/hvdeploy/UninstallTest.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"
#include "tests/support/RunProgram.h"

namespace {

constexpr const char* kCompany = R"(C:\ProgramData\Halvorn)";
constexpr const char* kPackages = R"(C:\Packages)";
constexpr const char* kOthers = R"(C:\Others)";
constexpr const char* kRecord = R"(C:\ProgramData\Halvorn\.hvdeploy\history\com.halvorn.glow_v9.0_hvmanifest.xml)";
constexpr const char* kPlaced = R"(C:\Program Files\Halvorn\Glow.exe)";

class GuardedFoldersTest : public testing::Test {
protected:
    void SetUp() override {
        if (!platform::CanGuardFolders()) {
            GTEST_SKIP() << "only root guards folders";
        }
        machine.Has(std::string(kPackages) + R"(\suite.json)", kTessalyFile);
        (void)PackageBuilder("com.halvorn.glow")
            .Version("2.0")
            .Policy("uninstall", "true")
            .Payload("resource")
            .To("programfiles", "Halvorn")
            .File("Glow.exe", "program")
            .WriteTo(kPackages);
    }

    /// Somebody's file, which has a second name at `path`.
    void Plant(const std::string& path, const std::string& content) {
        const std::string original = std::string(kOthers) + "\\" + path.substr(path.rfind('\\') + 1);
        machine.Has(original, content);
        machine.HasFolder(path.substr(0, path.rfind('\\')));
        std::filesystem::create_hard_link(machine.HostName(original), machine.HostName(path));
    }

    ProgramResult Install() { return RunProgram("hvdeploy", {std::string("dir=") + kPackages}); }

    /// The contents of what has been set aside in the company's folder, by the ends of their names.
    [[nodiscard]] std::string SetAside(const std::string& end) const {
        for (const auto& [path, content] : machine.Files()) {
            if (path.starts_with(std::string(kCompany) + R"(\set-aside-)") && path.ends_with(end)) {
                return content;
            }
        }
        return "nothing";
    }

    static std::string Warning(const std::string& path) {
        return " WARN hvdeploy-detail : somebody else than an administrator may have made " + path +
               "; it is not used, and now it is ";
    }

    Machine machine;
};

}  // namespace

TEST_F(GuardedFoldersTest, APlantedRemovalScriptIsNotTheOneThatIsRegistered) {
    Plant(kScriptPath, "planted\r\n");
    const ProgramResult result = Install();
    EXPECT_EQ(result.exitStatus, 0) << result.output;
    const std::string script = machine.Content(kScriptPath);
    EXPECT_TRUE(script.starts_with(kHeaderOnDisk)) << script;
    EXPECT_EQ(script.find("planted"), std::string::npos);
    EXPECT_EQ(SetAside("-uninstall-com.halvorn.tessaly_v3.1.bat"), "planted\r\n");
    EXPECT_NE(result.output.find(Warning(kScriptPath)), std::string::npos) << result.output;
    EXPECT_NE(machine.Registry().find("UninstallString"), std::string::npos);
}

TEST_F(GuardedFoldersTest, APlantedRecordDoesNotKeepAProductOut) {
    Plant(kRecord, "<hvmanifest/>");
    const ProgramResult result = Install();
    EXPECT_EQ(machine.Content(kPlaced), "program");
    EXPECT_FALSE(machine.Exists(kRecord));
    EXPECT_EQ(SetAside("-com.halvorn.glow_v9.0_hvmanifest.xml"), "<hvmanifest/>");
    EXPECT_NE(result.output.find(Warning(kRecord)), std::string::npos) << result.output;
}

TEST_F(GuardedFoldersTest, WhatRunsHaveLeftThereIsUsed) {
    machine.Has(kScriptPath, "earlier\r\n");
    machine.Has(kRecord, "<hvmanifest/>");
    const auto before = machine.Files();
    EXPECT_EQ(Install().exitStatus, 0);
    EXPECT_FALSE(machine.Exists(kPlaced)) << "a newer version is on record";
    EXPECT_EQ(machine.Files(), before);
    std::filesystem::remove(machine.HostName(kRecord));
    const ProgramResult result = Install();
    EXPECT_EQ(result.exitStatus, 0);
    EXPECT_TRUE(machine.Content(kScriptPath).starts_with("earlier\r\necho Uninstalling"))
        << machine.Content(kScriptPath);
    EXPECT_EQ(result.output.find(" WARN "), std::string::npos) << result.output;
}

TEST_F(GuardedFoldersTest, AListMovesNothing) {
    Plant(kRecord, "<hvmanifest/>");
    const auto before = machine.Files();
    const ProgramResult result = RunProgram("hvdeploy", {"list=installed", "loglevel=error"});
    EXPECT_EQ(result.output, "com.halvorn.glow_v9.0\n");
    EXPECT_EQ(machine.Files(), before);
}

TEST_F(GuardedFoldersTest, ABadArgumentMovesNothing) {
    Plant(kRecord, "<hvmanifest/>");
    const auto before = machine.Files();
    EXPECT_EQ(RunProgram("hvdeploy", {std::string("dir=") + kPackages, "nonsense"}).exitStatus, 1);
    EXPECT_EQ(machine.Files(), before);
}

TEST_F(GuardedFoldersTest, ARunThatPutsNothingThereLeavesNoFolder) {
    const ProgramResult result = RunProgram("hvdeploy", {std::string("dir=") + kOthers});
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_FALSE(machine.Exists(kCompany));
    EXPECT_EQ(result.output.find(" WARN "), std::string::npos) << result.output;
}

TEST_F(GuardedFoldersTest, TheCompanysFolderIsThereFromTheFirstMomentOn) {
    {
        const HV::GuardedFolders guarded;
        EXPECT_TRUE(machine.Exists(kCompany));
        EXPECT_FALSE(machine.Exists(std::string(kCompany) + R"(\uninstall)")) << "and nothing but it";
    }
    EXPECT_FALSE(machine.Exists(kCompany));
}

TEST_F(GuardedFoldersTest, AFileInTheirPlaceStopsNothing) {
    machine.Has(kCompany, "in the way");
    const ProgramResult result = Install();
    EXPECT_EQ(result.exitStatus, 0) << result.output;
    EXPECT_EQ(machine.Content(kPlaced), "program");
    EXPECT_EQ(machine.Content(kCompany), "in the way");
    EXPECT_NE(
        result.output.find(" WARN hvdeploy-detail : the folder C:\\ProgramData\\Halvorn cannot be taken over; what is "
                           "in it is not used\n"),
        std::string::npos)
        << result.output;
}
