// What a run leaves behind for its removal.
#include "tests/hvdeploy/SideActionsTest.h"
#include "tests/hvdeploy/UninstallTest.h"

namespace {

constexpr const char* kFolder = R"(C:\Packages)";
constexpr const char* kGlow = R"(C:\ProgramData\Halvorn\Glow.exe)";
constexpr const char* kLink = R"(C:\ProgramData\Microsoft\Windows\Start Menu\Programs\Glow.lnk)";

PackageBuilder Glow(const std::string& identifier = "com.halvorn.glow") {
    return PackageBuilder(identifier)
        .Version("2.0")
        .Policy("uninstall", "true")
        .Payload("resource")
        .To("programdata", "Halvorn")
        .File("Glow.exe", "program");
}

class UninstallHandOverTest : public SideActionsTest {
protected:
    HV::EngineResult DeployFolder() { return engine.DeployPackagesFromDirectory(fs::path(kFolder), {}); }

    void ExpectNoScript(const std::string& identifier) {
        EXPECT_TRUE(log.Has(DebugLine(" - skipping uninstall script creation for " + identifier)));
        EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Halvorn\uninstall)"));
    }
};

}  // namespace

TEST_F(UninstallHandOverTest, NamesEveryFileAndShortcutOfThePackage) {
    machine.Has(R"(C:\Packages\suite.json)", kTessalyFile);
    (void)Glow()
        .Shortcut("Glow.exe", "", "startmenu")
        .Payload("resource")
        .To("commondocs", "Halvorn")
        .File("Manual.txt", "text")
        .WriteTo(kFolder);
    EXPECT_FALSE(HV::IsFailure(DeployFolder())) << log.Text();
    EXPECT_TRUE(log.Has(DebugLine("Writing standalone uninstall script for com.halvorn.glow")));
    EXPECT_EQ(machine.Content(kScriptPath), kHeaderOnDisk + EchoOnDisk("Tessaly Suite", "3.1") +
                                                EchoOnDisk("com.halvorn.glow.hvpkg", "2.0") + DeleteOnDisk(kGlow) +
                                                DeleteOnDisk(kLink) +
                                                DeleteOnDisk(R"(C:\Users\Public\Documents\Halvorn\Manual.txt)") +
                                                RegistryOnDisk("Tessaly Suite v3.1"));
}

TEST_F(UninstallHandOverTest, AsksPayloadsOfAnotherSystemToo) {
    machine.Has(R"(C:\Packages\suite.json)", kTessalyFile);
    (void)PackageBuilder("com.halvorn.glow")
        .Version("2.0")
        .Payload("resource")
        .To("programdata", "Halvorn")
        .File("Glow.exe", "program")
        .Payload("plugin")
        .Os("mac")
        .File("Glow.plugin", "for another system")
        .WriteTo(kFolder);
    EXPECT_FALSE(HV::IsFailure(DeployFolder())) << log.Text();
    EXPECT_TRUE(machine.HasFile(kScriptPath)) << log.Text();
}

TEST_F(UninstallHandOverTest, EntersTheSuiteInTheListOfInstalledPrograms) {
    machine.Has(R"(C:\Packages\suite.json)", kTessalyFile);
    (void)Glow().WriteTo(kFolder);
    EXPECT_FALSE(HV::IsFailure(DeployFolder()));
    const std::string registry = machine.Registry();
    EXPECT_NE(registry.find(R"(\Uninstall\Tessaly Suite v3.1])"), std::string::npos) << registry;
    EXPECT_NE(registry.find(R"("UninstallString"="\"C:\\ProgramData\\Halvorn\\uninstall\\uninstall-)"),
              std::string::npos)
        << registry;
}

TEST_F(UninstallHandOverTest, LeavesNoEntryAfterAFailedRun) {
    machine.Has(R"(C:\Packages\suite.json)", kTessalyFile);
    (void)Glow().Postflight("exit 512").WriteTo(kFolder);
    const std::string before = machine.Registry();
    EXPECT_EQ(DeployFolder(), -2);
    EXPECT_EQ(machine.Registry(), before);
}

TEST_F(UninstallHandOverTest, KeepsOneScriptForAllPackagesOfARun) {
    // Without a suite the first package gives the script its name, and the others go on with it.
    (void)Glow().Named("1.hvpkg").WriteTo(kFolder);
    (void)PackageBuilder("com.halvorn.flare")
        .Policy("uninstall", "true")
        .Payload("resource")
        .To("programdata", "Halvorn")
        .File("Flare.exe", "program")
        .Named("2.hvpkg")
        .WriteTo(kFolder);
    EXPECT_EQ(engine.DeployPackages({fs::path(R"(C:\Packages\1.hvpkg)"), fs::path(R"(C:\Packages\2.hvpkg)")}), 1);
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\uninstall\uninstall-1.hvpkg_v2.0.bat)"),
              kHeaderOnDisk + EchoOnDisk("1.hvpkg", "2.0") + DeleteOnDisk(kGlow) + RegistryOnDisk(" v") +
                  EchoOnDisk("2.hvpkg", "1.0") + DeleteOnDisk(R"(C:\ProgramData\Halvorn\Flare.exe)") +
                  RegistryOnDisk(" v"));
}

TEST_F(UninstallHandOverTest, LeavesProductsAloneThatBringTheirOwnRemoval) {
    int seen = 0;
    for (const std::string identifier : {"com.halvorn.service", "com.halvorn.app"}) {
        EXPECT_EQ(Deploy(Glow(identifier)), 1);
        ExpectNoScript(identifier);
        ++seen;
    }
    EXPECT_EQ(seen, 2);
}

TEST_F(UninstallHandOverTest, TakesProductsWhoseNamesOnlyBeginLikeThose) {
    EXPECT_EQ(Deploy(Glow("com.halvorn.app2")), 1);
    EXPECT_TRUE(log.Has(DebugLine("Writing standalone uninstall script for com.halvorn.app2")));
}

TEST_F(UninstallHandOverTest, LeavesAPackageAloneThatNeitherAsksForItNorHoldsAPluginOrAnApp) {
    EXPECT_EQ(Deploy(PackageBuilder("com.halvorn.presets")
                         .Payload("presets")
                         .To("programdata", "Halvorn")
                         .File("Glow.ffx", "preset")),
              1);
    ExpectNoScript("com.halvorn.presets");
}

TEST_F(UninstallHandOverTest, TakesAPackageThatHoldsAnAppWithoutBeingAsked) {
    EXPECT_EQ(Deploy(PackageBuilder("com.halvorn.tool").Payload("app").Subpath("Halvorn").File("Tool.exe", "program")),
              1);
    EXPECT_TRUE(log.Has(DebugLine("Writing standalone uninstall script for com.halvorn.tool")));
}

TEST_F(UninstallHandOverTest, TakesAPackageThatHoldsAPluginWithoutBeingAsked) {
    // The plug-in finds no host and is not placed; it is the payload's type that counts.
    EXPECT_EQ(Deploy(PackageBuilder("com.halvorn.glow")
                         .Payload("plugin")
                         .ForHost("aftereffects")
                         .File("Glow.aex", "plug-in")
                         .Payload("presets")
                         .To("programdata", "Halvorn")
                         .File("Glow.ffx", "preset")),
              1);
    EXPECT_TRUE(log.Has(DebugLine("Writing standalone uninstall script for com.halvorn.glow")));
}

TEST_F(UninstallHandOverTest, LeavesNothingForAPackageThatPlacedNothing) {
    EXPECT_EQ(Deploy(PackageBuilder("com.halvorn.glow")
                         .Policy("uninstall", "true")
                         .Payload("script")
                         .Deployment("run")
                         .File("Readme.txt", "text")),
              0);
    EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Halvorn\uninstall)"));
}

TEST_F(UninstallHandOverTest, DoesNotFailTheRunWhenTheScriptCannotBeWritten) {
    machine.Has(R"(C:\ProgramData\Halvorn\uninstall)", "a file in the folder's place");
    EXPECT_EQ(Deploy(Glow()), 1);
    EXPECT_TRUE(machine.HasFile(kGlow));
}

TEST_F(UninstallHandOverTest, OfTheLegacyKindIsOneLineInTheLog) {
    engine.SetLegacyUninstall(true);
    EXPECT_EQ(Deploy(Glow()), 1);
    EXPECT_EQ(log.Count(DebugLine("HV::Deploy::HV::Deploy::RegisterLegacyUninstall")), 1U);
    EXPECT_TRUE(log.Has(DebugLine("Writing standalone uninstall script for com.halvorn.glow")));
}

TEST_F(UninstallHandOverTest, OfTheLegacyKindIsNotEvenThatUnlessAskedFor) {
    EXPECT_EQ(Deploy(Glow()), 1);
    EXPECT_FALSE(log.Has(DebugLine("HV::Deploy::HV::Deploy::RegisterLegacyUninstall")));
}
