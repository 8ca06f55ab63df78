// The folders by whose files a run decides are another account's. Hosted only, where an attacker can be another
// account; and only root can take one.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <fstream>

#include "hvdeploy/src/Deploy.h"
#include "hvdeploy/src/GuardedFolders.h"
#include "tests/hvdeploy/UninstallTest.h"
#include "tests/hvdeploy/engine/EngineTest.h"
#include "tests/support/Faults.h"
#include "tests/support/RunProgram.h"
#include "tests/support/Stranger.h"

namespace {

constexpr const char* kCompany = R"(C:\ProgramData\Halvorn)";
constexpr const char* kUninstall = R"(C:\ProgramData\Halvorn\uninstall)";
constexpr const char* kPlaced = R"(C:\Program Files\Halvorn\Glow.exe)";
constexpr const char* kVictim = R"(C:\Windows\system32\Victim)";
const std::string kRecord = std::string(kHistory) + "com.halvorn.glow_v9.0_hvmanifest.xml";

class SquattedTest : public EngineTest {
protected:
    void SetUp() override {
        if (!Stranger::CanBe()) {
            GTEST_SKIP() << "only root can hand a folder over to another account";
        }
        machine.Has(std::string(kPackages) + R"(\suite.json)", kTessalyFile);
        Ships(PackageBuilder("com.halvorn.glow")
                  .Version("2.0")
                  .Policy("uninstall", "true")
                  .Payload("resource")
                  .To("programfiles", "Halvorn")
                  .File("Glow.exe", "program"));
    }

    void Owns(const std::string& path) { Stranger::Owns(machine.HostName(path)); }
    /// The stranger makes all folders down to this one, and leaves them open to everybody.
    void Squats(const std::string& folder) {
        machine.HasFolder(folder);
        for (std::string at = folder; at.size() >= std::string(kCompany).size(); at = at.substr(0, at.rfind('\\'))) {
            Owns(at);
            EXPECT_EQ(chmod(machine.HostName(at).c_str(), 0777), 0);
        }
    }
    void SquatsLink(const std::string& path, const std::string& target) {
        ASSERT_EQ(symlink(machine.HostName(target).c_str(), machine.HostName(path).c_str()), 0) << path;
        ASSERT_EQ(lchown(machine.HostName(path).c_str(), 65534, 65534), 0) << path;
    }

    /// Whether a run places the product.
    bool Installs() {
        guarded.emplace().LogWarnings();
        return !HV::IsFailure(InstallFolder()) && machine.HasFile(kPlaced);
    }
    /// One's own folder, which everybody may read.
    void ExpectGuarded(const std::string& folder) {
        struct stat found {};
        ASSERT_EQ(lstat(machine.HostName(folder).c_str(), &found), 0) << folder;
        EXPECT_EQ(found.st_uid, 0U) << folder;
        EXPECT_EQ(found.st_mode, static_cast<mode_t>(S_IFDIR | 0755)) << folder;
    }
    std::size_t Warnings() { return log.LinesStartingWith(WarnLine("somebody else than an administrator")).size(); }

    std::optional<HV::GuardedFolders> guarded;
};

}  // namespace

TEST_F(SquattedTest, FoldersAreTakenOver) {
    Squats(std::string(kHistory).substr(0, std::string(kHistory).size() - 1));
    Squats(kUninstall);
    Squats(std::string(kCompany) + R"(\Installer)");
    EXPECT_TRUE(Installs());
    int folders = 0;
    for (const char* folder : {"", R"(\uninstall)", R"(\.hvdeploy)", R"(\.hvdeploy\history)", R"(\Installer)"}) {
        ExpectGuarded(kCompany + std::string(folder));
        ++folders;
    }
    EXPECT_EQ(folders, 5);
    EXPECT_EQ(Warnings(), 0U) << log.Text();
}

TEST_F(SquattedTest, ARemovalScriptOfAStrangerIsNotAppendedTo) {
    Squats(kUninstall);
    machine.Has(kScriptPath, "planted");
    Owns(kScriptPath);
    EXPECT_TRUE(Installs());
    EXPECT_TRUE(machine.Content(kScriptPath).starts_with(kHeaderOnDisk));
    EXPECT_EQ(Warnings(), 1U) << log.Text();
}

TEST_F(SquattedTest, ARecordOfAStrangerDoesNotCount) {
    machine.Has(kRecord, "<hvmanifest/>");
    Owns(kRecord);
    EXPECT_TRUE(Installs()) << log.Text();
    EXPECT_FALSE(machine.Exists(kRecord));
    EXPECT_EQ(Warnings(), 1U) << log.Text();
}

TEST_F(SquattedTest, AFileOfTheAdministratorsThatEverybodyMayWriteDoesNotCount) {
    machine.Has(kRecord, "<hvmanifest/>");
    ASSERT_EQ(chmod(machine.HostName(kRecord).c_str(), 0666), 0);
    EXPECT_TRUE(Installs()) << log.Text();
    EXPECT_FALSE(machine.Exists(kRecord));
}

TEST_F(SquattedTest, ALinkInThePlaceOfAFolderIsNotFollowed) {
    machine.HasFolder(kVictim);
    Squats(kCompany);
    SquatsLink(kUninstall, kVictim);
    EXPECT_TRUE(Installs());
    EXPECT_TRUE(std::filesystem::is_empty(machine.HostName(kVictim)));
    EXPECT_TRUE(machine.HasFile(kScriptPath));
    EXPECT_FALSE(std::filesystem::is_symlink(machine.HostName(kUninstall)));
    EXPECT_EQ(Warnings(), 1U) << log.Text();
}

TEST_F(SquattedTest, ALinkInThePlaceOfTheCompanysFolderIsNotFollowed) {
    machine.HasFolder(kVictim);
    ASSERT_EQ(chown(machine.HostName(kVictim).c_str(), 1, 1), 0);
    SquatsLink(kCompany, kVictim);
    EXPECT_TRUE(Installs());
    struct stat found {};
    ASSERT_EQ(stat(machine.HostName(kVictim).c_str(), &found), 0);
    EXPECT_EQ(found.st_uid, 1U) << "it was taken over";
    EXPECT_TRUE(std::filesystem::is_empty(machine.HostName(kVictim)));
    ExpectGuarded(kCompany);
    EXPECT_EQ(Warnings(), 1U) << log.Text();
}

TEST_F(SquattedTest, AnAdministratorsLinkIsFollowedAndWhereItLeadsIsLeftAsItIs) {
    machine.HasFolder(R"(C:\Other disk)");
    ASSERT_EQ(chmod(machine.HostName(R"(C:\Other disk)").c_str(), 0775), 0);
    ASSERT_EQ(symlink(machine.HostName(R"(C:\Other disk)").c_str(), machine.HostName(kCompany).c_str()), 0);
    EXPECT_TRUE(Installs());
    struct stat found {};
    ASSERT_EQ(stat(machine.HostName(R"(C:\Other disk)").c_str(), &found), 0);
    EXPECT_EQ(found.st_mode & 0777U, 0775U);
    EXPECT_TRUE(machine.HasFile(R"(C:\Other disk\uninstall\uninstall-com.halvorn.tessaly_v3.1.bat)"));
}

// Windows moves no file that somebody keeps open.
TEST_F(SquattedTest, WhatCannotBeMovedAwayIsNotUsed) {
    Squats(kUninstall);
    machine.Has(kScriptPath, "planted");
    Owns(kScriptPath);
    machine.Has(kRecord, "<hvmanifest/>");
    Owns(kRecord);
    MachineFaults faults(machine);
    faults.Lock(kScriptPath);
    faults.Lock(kRecord);
    EXPECT_TRUE(Installs()) << log.Text();
    EXPECT_EQ(machine.Content(kScriptPath), "planted");
    EXPECT_EQ(machine.Registry().find("UninstallString"), std::string::npos);
    EXPECT_EQ(log.LinesStartingWith(WarnLine("somebody else than an administrator may have made")).size(), 2U);
    EXPECT_TRUE(log.Has(WarnLine("somebody else than an administrator may have made " + kRecord +
                                 "; it cannot be moved away, and it is not used")))
        << log.Text();
}

// As in ProgramData, where everybody may make folders and nobody may rename another's.
TEST_F(SquattedTest, NobodyMakesTheFolderWhileTheRunGoesOn) {
    std::filesystem::permissions(machine.HostName(R"(C:\)") + "/..", std::filesystem::perms(0755));
    machine.HasFolder(R"(C:\Strangers)");
    Owns(R"(C:\Strangers)");
    const std::string data = machine.HostName(R"(C:\ProgramData)");
    ASSERT_EQ(chmod(data.c_str(), 01777), 0);
    guarded.emplace();
    const std::string company = data + "/Halvorn";
    const std::string done = machine.HostName(R"(C:\Strangers\done)");
    const Stranger stranger([&] {
        (void)std::rename(company.c_str(), (company + ".away").c_str());
        std::filesystem::create_directories(company + "/.hvdeploy/history");
        std::ofstream(company + "/.hvdeploy/history/com.halvorn.glow_v9.0_hvmanifest.xml") << "planted";
        std::ofstream(done) << "done";
        pause();
    });
    // Refused at the first step, he never comes to the last: so he has time, and then the run begins.
    for (int i = 0; i < 20 && access(done.c_str(), F_OK) != 0; ++i) {
        usleep(10000);
    }
    EXPECT_FALSE(HV::IsFailure(InstallFolder())) << log.Text();
    EXPECT_TRUE(machine.HasFile(kPlaced));
    EXPECT_FALSE(machine.Exists(std::string(kCompany) + ".away"));
    EXPECT_FALSE(machine.Exists(kRecord));
}
