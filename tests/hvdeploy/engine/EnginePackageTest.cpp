// One package: whether it is installed at all, its temporary files, its dependencies, and which failures go back.
#include "tests/hvdeploy/engine/EngineTest.h"
#include "tests/support/CapturedStreams.h"

namespace {

class EnginePackageTest : public EngineTest {
protected:
    /// Installs version `version` of com.halvorn.glow where `stems` are installed; gives whether it was placed.
    bool Installs(const std::string& version, const std::vector<std::string>& stems) {
        for (const std::string& stem : stems) {
            HasInstalled(stem);
        }
        const HV::EngineResult result = Install({Placing("glow").Version(version)});
        EXPECT_EQ(result == 1, machine.HasFile(Placed("glow"))) << log.Text();
        return result == 1;
    }
    bool OnlyTheStashIsLeft() const {
        const std::vector<std::string> left = machine.TempEntries();
        return left.size() == 1 && left[0].rfind("hvdeploystash", 0) == 0;
    }
};

}  // namespace

TEST_F(EnginePackageTest, SkipsByIdentifier) {
    Ships(Placing("glow"));
    EXPECT_EQ(InstallFolder({"com.halvorn.glow"}), 0);
    EXPECT_TRUE(log.Has(DebugLine("Skipping package com.halvorn.glow (v. 1.0)"))) << log.Text();
    EXPECT_FALSE(machine.Exists(Placed("glow")));
}

TEST_F(EnginePackageTest, SkipsByWholeFileName) {
    Ships(Placing("glow").Named("Glow 2.hvpkg"));
    EXPECT_EQ(InstallFolder({"other", "Glow 2.hvpkg"}), 0);
    EXPECT_FALSE(machine.Exists(Placed("glow")));
}

TEST_F(EnginePackageTest, DoesNotSkipByAnythingElse) {
    Ships(Placing("glow"));
    EXPECT_EQ(InstallFolder({"COM.HALVORN.GLOW", "com.halvorn.glow.HVPKG", "com.halvorn", "com.halvorn.glow "}), 0);
    EXPECT_TRUE(machine.HasFile(Placed("glow")));
}

TEST_F(EnginePackageTest, ChecksAPackageBeforeItIsSkipped) {
    Ships(PackageBuilder("com.halvorn.glow").ManifestText("no manifest"));
    EXPECT_EQ(InstallFolder({"com.halvorn.glow.hvpkg"}), -1);
}

TEST_F(EnginePackageTest, InstallsOverAnOlderVersion) {
    EXPECT_TRUE(Installs("2.0", {"com.halvorn.glow_v1.9"}));
}
TEST_F(EnginePackageTest, InstallsTheSameVersionAgain) {
    EXPECT_TRUE(Installs("2.0", {"com.halvorn.glow_v2.0"}));
}
TEST_F(EnginePackageTest, DoesNotInstallOverANewerVersion) {
    EXPECT_FALSE(Installs("2.0", {"com.halvorn.glow_v2.0.1"}));
}
TEST_F(EnginePackageTest, ComparesNumbersAndNotTexts) {
    EXPECT_FALSE(Installs("2.9", {"com.halvorn.glow_v2.10"}));
}
TEST_F(EnginePackageTest, TakesTrailingZerosForTheSameVersion) {
    EXPECT_TRUE(Installs("2.0", {"com.halvorn.glow_v2.0.0.0"}));
}
TEST_F(EnginePackageTest, LooksAtEveryInstalledVersion) {
    EXPECT_FALSE(Installs("2.0", {"com.halvorn.glow_v1.0", "com.halvorn.glow_v3.0"}));
}
TEST_F(EnginePackageTest, LooksAtItsOwnProductAlone) {
    EXPECT_TRUE(Installs("2.0", {"com.halvorn.glowing_v9.0"}));
}
TEST_F(EnginePackageTest, ReadsAVersionAfterTheFirstMark) {
    EXPECT_FALSE(Installs("2.0", {"com.halvorn.glow_v3.0_v1.0"}));
}
// Without a version the whole stem is read as one; "com" is no number, and counts as 0.
TEST_F(EnginePackageTest, InstallsOverARecordWithoutAVersion) {
    EXPECT_TRUE(Installs("2.0", {"com.halvorn.glow"}));
}
TEST_F(EnginePackageTest, InstallsOverARecordWithAnEmptyVersion) {
    EXPECT_TRUE(Installs("2.0", {"com.halvorn.glow_v"}));
}

TEST_F(EnginePackageTest, ReadsOnlyRecordsFromTheHistory) {
    machine.Has(std::string(kHistory) + "com.halvorn.glow_v9.0.xml", "");
    machine.HasFolder(std::string(kHistory) + "com.halvorn.glow_v9.0_hvmanifest.xml");
    machine.Has(std::string(kHistory) + R"(deeper\com.halvorn.glow_v9.0_hvmanifest.xml)", "");
    EXPECT_TRUE(Installs("2.0", {}));
}

TEST_F(EnginePackageTest, DoesNotSeeRecordsOfItsOwnRunOnceItHasReadSome) {
    HasInstalled("com.halvorn.other_v1.0");
    const PackageBuilder newer = Placing("glow", "newer")
                                     .Version("2.0")
                                     .Named("newer.hvpkg")
                                     .Payload("resource")
                                     .To("history")
                                     .File("history/com.halvorn.glow_v2.0_hvmanifest.xml", "<hvmanifest/>");
    EXPECT_EQ(Install({newer, Placing("glow", "older")}), 1);
    EXPECT_EQ(machine.Content(Placed("glow")), "older");
}

TEST_F(EnginePackageTest, SeesRecordsOfItsOwnRunWhileItHasReadNone) {
    const PackageBuilder newer = Placing("glow", "newer")
                                     .Version("2.0")
                                     .Named("newer.hvpkg")
                                     .Payload("resource")
                                     .To("history")
                                     .File("history/com.halvorn.glow_v2.0_hvmanifest.xml", "<hvmanifest/>");
    EXPECT_EQ(Install({newer, Placing("glow", "older")}), 0);
    EXPECT_EQ(machine.Content(Placed("glow")), "newer");
}

TEST_F(EnginePackageTest, MeetsADependencyByALaterPackageOfThePhase) {
    EXPECT_EQ(Install({Placing("glow").DependsOn("com.halvorn.core"), Placing("core")}), 1) << log.Text();
}

TEST_F(EnginePackageTest, MeetsADependencyByTheHistory) {
    HasInstalled("com.halvorn.core_v1.0");
    EXPECT_EQ(Install({Placing("glow").DependsOn("com.halvorn.core")}), 1) << log.Text();
}

TEST_F(EnginePackageTest, MeetsADependencyByAPackageThatPlacedNothing) {
    const PackageBuilder nothing =
        PackageBuilder("com.halvorn.core").Payload("script").Deployment("run").File("a", "b");
    EXPECT_EQ(Install({nothing, Placing("glow").DependsOn("com.halvorn.core")}), 1) << log.Text();
}

TEST_F(EnginePackageTest, NamesTheFirstMissingDependencyOfEachPayload) {
    EXPECT_EQ(Install({Placing("glow")
                           .DisplayName("Tessaly Glow")
                           .DependsOn("com.halvorn.core")
                           .DependsOn("com.halvorn.second")
                           .Payload("resource")
                           .To("programdata", "Halvorn")
                           .File("other.dll", "x")
                           .DependsOn("com.halvorn.third")}),
              -1);
    const auto missing = [](const std::string& product) {
        return ErrorLine("product Tessaly Glow requires package " + product + ", not found or installed.");
    };
    EXPECT_EQ(log.LinesStartingWith(ErrorLine("product")),
              (std::vector<std::string>{missing("com.halvorn.core"), missing("com.halvorn.third")}));
    EXPECT_TRUE(machine.HasFile(Placed("glow")));
    EXPECT_FALSE(HasRolledBack());
    EXPECT_EQ(listener.reports.back(), "1 An error has occured");
}

TEST_F(EnginePackageTest, DoesNotAskPayloadsOfAnotherSystemForDependencies) {
    EXPECT_EQ(
        Install({Placing("glow").Payload("library").To("ofx").Os("mac").DependsOn("com.halvorn.core").File("a", "b")}),
        1);
}

TEST_F(EnginePackageTest, DoesNotAskAPackageThatPlacedNothingForDependencies) {
    HasInstalled("com.halvorn.glow_v9.0");
    EXPECT_EQ(Install({Placing("glow").DependsOn("com.halvorn.core")}), 0) << log.Text();
}

TEST_F(EnginePackageTest, GoesBackWhenAPackageIsNotSound) {
    EXPECT_EQ(Install({Placing("glow"), PackageBuilder("com.halvorn.bad").WithoutManifest().File("a", "b")}), -1);
    const std::vector<std::string> errors = log.LinesStartingWith("ERROR");
    EXPECT_EQ(errors,
              (std::vector<std::string>{ErrorLine("No manifest XML file found in com.halvorn.bad.hvpkg"),
                                        ErrorLine("package.Validate() failed for com.halvorn.bad.hvpkg"),
                                        ErrorLine("Package validation of com.halvorn.bad.hvpkg failed with error -1"),
                                        ErrorLine("Installation cannot complete, rolling back; error value is -1")}));
    EXPECT_FALSE(machine.Exists(Placed("glow")));
}

TEST_F(EnginePackageTest, ReportsAPackageThatIsNotSoundBeforeItFails) {
    Ships(PackageBuilder("com.halvorn.bad").WithoutManifest().File("a", "b"));
    EXPECT_EQ(InstallFolder(), -1);
    EXPECT_TRUE(HasReported("2 Installing com.halvorn.bad.hvpkg"));
    EXPECT_FALSE(HasReported("2 Installing com.halvorn.bad.hvpkg..."));
}

TEST_F(EnginePackageTest, EndsWithoutAWayBackForTheErrorFlag) {
    const HV::EngineResult first = Install({Placing("glow")});
    ASSERT_EQ(first, 1);
    engine.SetFatalErrorTest(true);
    EXPECT_EQ(Install({Placing("grain")}), -2);
    const std::vector<std::string> lines = log.Lines();
    EXPECT_EQ(std::count_if(lines.begin(), lines.end(),
                            [](const std::string& line) {
                                return line.ends_with("hvdeploy-detail: creating a fatal error for testing purposes.");
                            }),
              1);
    EXPECT_FALSE(HasRolledBack());
    EXPECT_TRUE(machine.HasFile(Placed("glow")));
    EXPECT_FALSE(machine.Exists(Placed("grain")));
}

TEST_F(EnginePackageTest, EndsWithoutAWayBackWhenAPackageDoesNotExtract) {
    const PackageBuilder lying =
        Placing("bad").RawEntry({.name = "spoilt.dat", .bytes = "bytes", .claimedChecksum = 1U});
    EXPECT_EQ(Install({Placing("glow"), lying}), -1);
    EXPECT_TRUE(log.Has(ErrorLine("Failed to extract package com.halvorn.bad.hvpkg"))) << log.Text();
    EXPECT_FALSE(HasRolledBack());
    EXPECT_TRUE(machine.HasFile(Placed("glow")));
    EXPECT_FALSE(machine.Exists(Placed("bad")));
    EXPECT_TRUE(OnlyTheStashIsLeft());
}

TEST_F(EnginePackageTest, RemovesItsTemporaryFilesAfterASuccess) {
    EXPECT_EQ(Install({Placing("glow")}), 1);
    EXPECT_EQ(log.LinesStartingWith(DebugLine("Cleaning up temp files at \"")).size(), 1U);
    EXPECT_TRUE(OnlyTheStashIsLeft());
}

TEST_F(EnginePackageTest, RemovesItsTemporaryFilesAfterAFailure) {
    EXPECT_EQ(Install({Failing("glow")}), -2);
    EXPECT_EQ(log.LinesStartingWith(DebugLine("Cleaning up temp files at \"")).size(), 1U);
    EXPECT_TRUE(OnlyTheStashIsLeft());
}

TEST_F(EnginePackageTest, FinishesAPackageWithNothingForThisSystem) {
    Ships(PackageBuilder("com.halvorn.glow")
              .Policy("uninstall", "true")
              .Payload("plugin")
              .Os("mac")
              .ForHost("aftereffects")
              .File("Glow.plugin", "x"));
    EXPECT_EQ(InstallFolder(), 0);
    EXPECT_TRUE(HasReported("92 Verifying installation...")) << log.Text();
    EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Halvorn\uninstall)"));
    EXPECT_EQ(log.LinesStartingWith(DebugLine("Writing standalone")).size(), 0U);
}

TEST_F(EnginePackageTest, LogsEachOfItsSteps) {
    EXPECT_EQ(Install({Placing("glow").DisplayName("Tessaly Glow")}), 1);
    const std::vector<std::string> expected{
        DebugLine(R"(packagePath: "C:\Packages\com.halvorn.glow.hvpkg")"),
        DebugLine("package com.halvorn.glow.hvpkg, progress points 0"),
        // The manifest is read after this text is made, so it names the file.
        DebugLine("Installing com.halvorn.glow.hvpkg"),
        DebugLine("HV::Deploy::HV::Deploy::ShouldInstallPacakge"),
        InfoLine("Installing com.halvorn.glow.hvpkg..."),
        DebugLine("HV::Deploy::HV::Deploy::DeployPackagePayloads"),
        DebugLine("HV::Deploy::HV::Deploy::DeployPayload"),
        DebugLine("HV::Deploy::DeployPayload payload-1 fromPackage com.halvorn.glow.hvpkg"),
        DebugLine(" - DeployPackagePayloads success for com.halvorn.glow"),
        DebugLine("HV::Deploy::HV::Deploy::EnsureDependencies"),
    };
    const std::vector<std::string> lines = log.Lines();
    auto place = lines.begin();
    for (const std::string& line : expected) {
        place = std::find(place, lines.end(), line);
        ASSERT_NE(place, lines.end()) << line << " is missing or too early in\n" << log.Text();
    }
}

TEST_F(EnginePackageTest, PrintsWhatItDoesWhenItIsVerbose) {
    engine.SetVerbose(true);
    CapturedStreams streams;
    EXPECT_EQ(Install({Placing("glow")}), 1);
    EXPECT_EQ(streams.Output(), "Installing com.halvorn.glow.hvpkg...\n[v] Deploying payload payload-1\n");
}

TEST_F(EnginePackageTest, SaysNothingWhenItIsNotVerbose) {
    CapturedStreams streams;
    EXPECT_EQ(Install({Placing("glow")}), 1);
    EXPECT_EQ(streams.Output(), "");
}

TEST_F(EnginePackageTest, RecordsThatTheOlderRemovalWasAskedFor) {
    engine.SetLegacyUninstall(true);
    EXPECT_EQ(Install({Placing("glow")}), 1);
    EXPECT_TRUE(log.Has(DebugLine("HV::Deploy::HV::Deploy::RegisterLegacyUninstall")));
}

TEST_F(EnginePackageTest, ThrowsForAPackageFileThatIsGone) {
    EXPECT_THROW((void)engine.DeployPackages({fs::path(R"(C:\Packages\gone.hvpkg)")}), std::runtime_error);
}
