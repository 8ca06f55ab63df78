// Where the files of one payload go: folders of hosts, system directories, the applications' directory.
#include "platform/win32.h"
#include "tests/hvdeploy/engine/EngineTest.h"

namespace {

class PlacementTest : public EngineTest {
protected:
    static PackageBuilder Plugin(const std::string& hostRef) {
        return PackageBuilder("com.halvorn.glow").Payload("plugin").ForHost(hostRef).File("Glow.aex", "glow");
    }
    static PackageBuilder Content(const std::string& deployment, const std::string& hostRef) {
        return PackageBuilder("com.halvorn.glow")
            .Payload("resource")
            .Deployment(deployment)
            .ForHost(hostRef)
            .File("Glow.ffx", "glow");
    }
    static PackageBuilder App() {
        return PackageBuilder("com.halvorn.viewer").Payload("app").File("Viewer.exe", "app");
    }
    static PackageBuilder In(const std::string& keyword) {
        return PackageBuilder("com.halvorn.glow").Payload("resource").To(keyword, "Halvorn").File("Glow.dat", "glow");
    }
    /// All placed files, without the packages, the removal scripts and the shortcuts.
    std::vector<std::string> PlacedFiles() const {
        std::vector<std::string> files;
        for (const auto& [path, content] : machine.FilesWithoutFolders()) {
            if (path.rfind(kPackages, 0) != 0 && path.rfind(InProgramData(R"(Halvorn\uninstall)"), 0) != 0) {
                files.push_back(path);
            }
        }
        return files;
    }
    using Paths = std::vector<std::string>;
};

const std::string kMissingHost = WarnLine("Required host application(s) not found for payload payload-1, skipping...");
const std::string kNoMatch = DebugLine("No matching hosts found for payload payload-1, skipping...");

}  // namespace

TEST_F(PlacementTest, PutsAPluginIntoEveryVersionOfItsHost) {
    HasHosts({AfterEffects("ae22"), AfterEffects("ae23"), Premiere("pr22")});
    EXPECT_EQ(Install({Plugin("aftereffects")}), 1) << log.Text();
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Hosts\ae22\Plug-ins\Glow.aex)", R"(C:\Hosts\ae23\Plug-ins\Glow.aex)"}));
}

TEST_F(PlacementTest, PutsPresetsAndScriptsIntoFoldersOfTheirOwn) {
    HasHosts({AfterEffects("ae22")});
    EXPECT_EQ(Install({Content("hostpresets", "aftereffects").Named("a.hvpkg"),
                       Content("hostscripts", "aftereffects").Named("b.hvpkg")}),
              1);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Hosts\ae22\Presets\Glow.ffx)", R"(C:\Hosts\ae22\Scripts\Glow.ffx)"}));
}

TEST_F(PlacementTest, TakesHostappForHostplugins) {
    HasHosts({AfterEffects("ae22")});
    EXPECT_EQ(Install({Content("hostapp", "aftereffects")}), 1);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Hosts\ae22\Plug-ins\Glow.ffx)"}));
}

TEST_F(PlacementTest, PutsASubpathBelowTheHostsFolder) {
    HasHosts({AfterEffects("ae22")});
    EXPECT_EQ(Install({Plugin("aftereffects").Subpath("Halvorn/Glow")}), 1);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Hosts\ae22\Plug-ins\Halvorn\Glow\Glow.aex)"}));
}

TEST_F(PlacementTest, PutsASharedPluginOnceForAllVersionsAndBothHosts) {
    HasHosts({AfterEffects("ae22"), AfterEffects("ae23"), Premiere("pr22")});
    EXPECT_EQ(Install({Plugin("aftereffects+premiere")}), 1);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Hosts\MediaCore\Glow.aex)"}));
    EXPECT_EQ(log.Count(DebugLine("Found 1 items to copy.")), 1U);
}

TEST_F(PlacementTest, PutsAMediaCorePluginIntoTheSharedFolderOfAfterEffectsAlone) {
    HasHosts({AfterEffects("ae22"), Premiere("pr22")});
    EXPECT_EQ(Install({Plugin("aftereffectsMC")}), 1);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Hosts\MediaCore\Glow.aex)"}));
}

TEST_F(PlacementTest, FindsNoMediaCoreWithPremiereAlone) {
    HasHosts({Premiere("pr22")});
    EXPECT_EQ(Install({Plugin("aftereffectsMC")}), 0);
    EXPECT_TRUE(log.Has(kNoMatch));
}

TEST_F(PlacementTest, PutsEachPathOnceThoughTwoReferencesNameIt) {
    HasHosts({AfterEffects("ae22"), Premiere("pr22")});
    EXPECT_EQ(Install({Plugin("aftereffects+premiere").ForHost("aftereffectsMC").ForHost("aftereffects")}), 1);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Hosts\MediaCore\Glow.aex)", R"(C:\Hosts\ae22\Plug-ins\Glow.aex)"}));
    EXPECT_EQ(log.Count(DebugLine("Found 1 items to copy.")), 2U);
}

TEST_F(PlacementTest, TakesFoldersThatDifferInCaseForTwo) {
    HV::HostRecord shouting = AfterEffects("ae23");
    shouting.hostPluginPath = R"(C:\HOSTS\ae22\Plug-ins)";
    HasHosts({AfterEffects("ae22"), shouting});
    EXPECT_EQ(Install({Plugin("aftereffects")}), 1);
    EXPECT_EQ(log.Count(DebugLine("Found 1 items to copy.")), 2U);
}

TEST_F(PlacementTest, TakesTheSharedFolderOfAHostWithoutOneOfItsOwn) {
    HV::HostRecord host = TestHost(HV::HostType::Vegas, "vegas", "vegas18");
    host.hostPluginPath.clear();
    HasHosts({host});
    EXPECT_EQ(Install({Plugin("vegas")}), 1);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Hosts\MediaCore\Glow.aex)"}));
}

TEST_F(PlacementTest, PlacesNothingForAHostWithoutAnyFolder) {
    HV::HostRecord host = TestHost(HV::HostType::Vegas, "vegas", "vegas18");
    host.hostPluginPath.clear();
    host.hostSharedPath.clear();
    HasHosts({host});
    EXPECT_EQ(Install({Plugin("vegas")}), 0);
    EXPECT_TRUE(
        log.Has(ErrorLine("unexpected logic issue in HV::Package::HV::Package::GetPayloadPaths - destPath is empty.")))
        << log.Text();
    EXPECT_TRUE(log.Has(DebugLine("Found 0 items to copy.")));
}

TEST_F(PlacementTest, SaysThatThereIsNoHost) {
    EXPECT_EQ(Install({Plugin("aftereffects")}), 0);
    EXPECT_TRUE(log.Has(DebugLine("No hosts detected on machine, skipping payload payload-1"))) << log.Text();
}

TEST_F(PlacementTest, SaysNothingOfAHostPayloadWithoutHosts) {
    HasHosts({AfterEffects("ae22")});
    EXPECT_EQ(Install({PackageBuilder("com.halvorn.glow").Payload("plugin").File("Glow.aex", "x")}), 0);
    EXPECT_FALSE(log.Has(kNoMatch));
    EXPECT_EQ(PlacedFiles(), Paths{});
}

TEST_F(PlacementTest, GoesOnWithTheNextReferenceWhenOneMatchesNoHost) {
    HasHosts({Premiere("pr22")});
    EXPECT_EQ(Install({Plugin("aftereffects").ForHost("premiere")}), 1);
    EXPECT_TRUE(log.Has(kNoMatch));
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Hosts\pr22\Plug-ins\Glow.aex)"}));
}

TEST_F(PlacementTest, LeavesTheOtherHostsOfAReferenceAfterAFailureAndTriesTheNext) {
    machine.Has(R"(C:\Hosts\ae22)", "a file where a folder has to be");
    HasHosts({AfterEffects("ae22"), AfterEffects("ae23"), Premiere("pr22")});
    EXPECT_EQ(Install({Plugin("aftereffects").ForHost("premiere")}), 1) << "a later reference that succeeds wins";
    EXPECT_TRUE(log.Has(ErrorLine(R"(failed to create directory at C:\Hosts\ae22\Plug-ins)"))) << log.Text();
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Hosts\ae22)", R"(C:\Hosts\pr22\Plug-ins\Glow.aex)"}));
}

TEST_F(PlacementTest, FailsWhenTheLastReferenceDoes) {
    machine.Has(R"(C:\Hosts\pr22)", "a file where a folder has to be");
    HasHosts({AfterEffects("ae22"), Premiere("pr22")});
    EXPECT_EQ(Install({Plugin("aftereffects").ForHost("premiere")}), -2);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Hosts\pr22)"})) << "what the first reference got is undone";
}

TEST_F(PlacementTest, TriesNoFurtherHostOfAReferenceWhenNothingIsToBeCopied) {
    HasHosts({AfterEffects("ae22"), AfterEffects("ae23")});
    // The check of the package lets the pattern match below the folder; the placement looks into the folder alone.
    const PackageBuilder nothing = PackageBuilder("com.halvorn.grain")
                                       .Payload("plugin")
                                       .ForHost("aftereffects")
                                       .File("plugins/deep/a.aex", "x")
                                       .Source("plugins/*.aex");
    EXPECT_EQ(Install({nothing}), 0) << log.Text();
    EXPECT_EQ(log.Count(DebugLine("Found 0 items to copy.")), 1U) << log.Text();
}

TEST_F(PlacementTest, PutsAnApplicationBelowProgramFiles) {
    EXPECT_EQ(Install({App().Subpath("Halvorn")}), 1);
    EXPECT_TRUE(log.Has(InfoLine("Deploying application payload-1")));
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Program Files\Halvorn\Viewer.exe)"}));
}

TEST_F(PlacementTest, PutsAPayloadOfDeploymentAppWhereApplicationsGo) {
    EXPECT_EQ(Install({PackageBuilder("com.halvorn.viewer").Payload("help").Deployment("app").File("Help.pdf", "x")}),
              1);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Program Files\Help.pdf)"}));
}

TEST_F(PlacementTest, PutsAnApplicationIntoTheDirectoryItNames) {
    EXPECT_EQ(Install({App().SysDir("commondocs")}), 1);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Users\Public\Documents\Viewer.exe)"}));
}

TEST_F(PlacementTest, RefusesAnApplicationsUnknownDirectory) {
    EXPECT_EQ(Install({App().SysDir("ProgramFiles")}), -2) << "keywords are compared in their case";
    EXPECT_TRUE(log.Has(ErrorLine("UNSUPPORTED payload sysdir value: ProgramFiles")));
}

TEST_F(PlacementTest, FindsNoPlaceForAnApplicationWithoutADirectory) {
    EXPECT_EQ(Install({App().SysDir("absolutepath").Subpath(R"(C:\Halvorn)")}), -2);
    EXPECT_TRUE(log.Has(ErrorLine("no install path found for app payload: payload-1"))) << log.Text();
}

TEST_F(PlacementTest, PlacesAnApplicationOnlyWithAHostItRequires) {
    HasHosts({Premiere("pr22")});
    EXPECT_EQ(Install({App().ForHost("aftereffects")}), 0);
    EXPECT_TRUE(log.Has(kMissingHost)) << log.Text();
    log.Clear();
    EXPECT_EQ(Install({App().ForHost("aftereffects").ForHost("premiere")}), 1);
    EXPECT_FALSE(log.Has(kMissingHost));
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Program Files\Viewer.exe)"})) << "not into the host's folder";
}

TEST_F(PlacementTest, PlacesAFileOfTheSystemOnlyWithAHostItRequires) {
    EXPECT_EQ(Install({In("programdata").ForHost("vegas")}), 0);
    EXPECT_TRUE(log.Has(kMissingHost)) << log.Text();
    EXPECT_EQ(PlacedFiles(), Paths{});
}

TEST_F(PlacementTest, PlacesAFileBelowEveryDirectoryOfThisSystem) {
    std::size_t count = 0;
    for (const char* keyword : {"commondocs", "localappdata", "ofx", "programdata", "commonappdata", "programfiles",
                                "programfiles32", "logs", "userlogs", "history", "startmenu", "temp", "winsys"}) {
        log.Clear();
        EXPECT_EQ(Install({In(keyword)}), 1) << keyword << "\n" << log.Text();
        EXPECT_EQ(log.LinesStartingWith(DebugLine("Copying from: ")).size(), 1U) << keyword;
        ++count;
    }
    EXPECT_EQ(count, 13U);
    EXPECT_TRUE(machine.HasFile(R"(C:\Program Files\Common Files\OFX\Plugins\Halvorn\Glow.dat)"));
    EXPECT_TRUE(machine.HasFile(R"(C:\Windows\System32\Halvorn\Glow.dat)"));
}

TEST_F(PlacementTest, RefusesDirectoriesOfTheOtherSystemAndUnknownOnes) {
    std::size_t count = 0;
    for (const char* keyword : {"applications", "appsupport", "frameworks", "launchdaemons", "userappsupport",
                                "usersshared", "TEMP", "ProgramFiles", "desktop"}) {
        log.Clear();
        EXPECT_EQ(Install({In(keyword)}), -2) << keyword;
        EXPECT_TRUE(log.Has(ErrorLine(std::string("UNSUPPORTED payload sysdir value: ") + keyword))) << log.Text();
        ++count;
    }
    EXPECT_EQ(count, 9U);
    EXPECT_EQ(PlacedFiles(), Paths{});
}

TEST_F(PlacementTest, FindsNoPathForADirectoryThatTheEnvironmentDoesNotName) {
    SetEnvironmentVariableA("LOCALAPPDATA", nullptr);
    EXPECT_EQ(Install({In("localappdata")}), -2);
    EXPECT_TRUE(log.Has(ErrorLine("no path found for target sysdir value: localappdata"))) << log.Text();
    EXPECT_EQ(PlacedFiles(), Paths{});
}

TEST_F(PlacementTest, LetsAnAbsoluteSubpathBeTheWholeDestination) {
    EXPECT_EQ(Install({PackageBuilder("com.halvorn.glow")
                           .Payload("resource")
                           .To("absolutepath", "C:/Studio/Halvorn")
                           .File("Glow.dat", "x")}),
              1);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Studio\Halvorn\Glow.dat)"}));
}

TEST_F(PlacementTest, PassesOverAnItemWithoutAParent) {
    EXPECT_EQ(
        Install({PackageBuilder("com.halvorn.glow").Payload("resource").To("absolutepath").File("Glow.dat", "x")}), 0);
    EXPECT_TRUE(log.Has(WarnLine("Destination parent path is an empty string, cannot process this payload.")))
        << log.Text();
}

TEST_F(PlacementTest, PlacesNothingWithoutADeploymentThatItKnows) {
    EXPECT_EQ(Install({PackageBuilder("com.halvorn.glow").Payload("script").Deployment("run").File("a.bat", "x")}), 0);
    EXPECT_EQ(PlacedFiles(), Paths{});
}

TEST_F(PlacementTest, PutsAFolderUnderItsOwnName) {
    const PackageBuilder bundle = PackageBuilder("com.halvorn.glow")
                                      .Payload("resource")
                                      .To("ofx")
                                      .Source("bundles/Glow.ofx.bundle/")
                                      .File("bundles/Glow.ofx.bundle/Contents/Win64/Glow.ofx", "ofx")
                                      .File("bundles/Glow.ofx.bundle/Contents/Info.txt", "info");
    EXPECT_EQ(Install({bundle}), 1) << log.Text();
    EXPECT_EQ(PlacedFiles(),
              (Paths{R"(C:\Program Files\Common Files\OFX\Plugins\Glow.ofx.bundle\Contents\Info.txt)",
                     R"(C:\Program Files\Common Files\OFX\Plugins\Glow.ofx.bundle\Contents\Win64\Glow.ofx)"}));
    EXPECT_TRUE(log.Has(DebugLine("Found 1 items to copy.")));
}

TEST_F(PlacementTest, PutsFilesAndFoldersThatAPatternNames) {
    const PackageBuilder presets = PackageBuilder("com.halvorn.presets")
                                       .Payload("presets")
                                       .To("commondocs", "Halvorn")
                                       .Source("presets/Glow*")
                                       .File("presets/Glow soft.ffx", "soft")
                                       .File("presets/Glow folder/deep.ffx", "deep")
                                       .File("presets/Grain.ffx", "grain");
    EXPECT_EQ(Install({presets}), 1);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\Users\Public\Documents\Halvorn\Glow folder\deep.ffx)",
                                    R"(C:\Users\Public\Documents\Halvorn\Glow soft.ffx)"}));
    EXPECT_TRUE(log.Has(DebugLine("Found 2 items to copy.")));
}

TEST_F(PlacementTest, PutsEverythingThatAFolderHolds) {
    const PackageBuilder presets = PackageBuilder("com.halvorn.presets")
                                       .Payload("presets")
                                       .To("commondocs", "Halvorn")
                                       .Source("presets/*")
                                       .File("presets/a.ffx", "a")
                                       .File("presets/.hidden", "h");
    EXPECT_EQ(Install({presets}), 1);
    EXPECT_EQ(PlacedFiles(),
              (Paths{R"(C:\Users\Public\Documents\Halvorn\.hidden)", R"(C:\Users\Public\Documents\Halvorn\a.ffx)"}));
}

TEST_F(PlacementTest, LogsEachStepOfACopy) {
    EXPECT_EQ(Install({In("programdata")}), 1);
    const std::vector<std::string> expected{
        DebugLine("HV::Deploy::HV::Deploy::DeploySysDirPayload"),
        DebugLine("HV::Deploy::HV::Deploy::DeployPayloadToDirectory"),
        DebugLine("Found 1 items to copy."),
        DebugLine(R"(Checking dest path, creating if needed: "C:\ProgramData\Halvorn")"),
        DebugLine(R"(- Creating destination directory at C:\ProgramData\Halvorn)"),
        DebugLine("Directory created."),
    };
    const std::vector<std::string> lines = log.Lines();
    const auto first = std::find(lines.begin(), lines.end(), expected.front());
    ASSERT_GE(lines.end() - first, static_cast<std::ptrdiff_t>(expected.size())) << log.Text();
    EXPECT_EQ(std::vector<std::string>(first, first + static_cast<std::ptrdiff_t>(expected.size())), expected);
    const std::vector<std::string> copies = log.LinesStartingWith(DebugLine("Copying from: "));
    ASSERT_EQ(copies.size(), 1U);
    EXPECT_TRUE(copies[0].ends_with("\\Glow.dat\n to: C:\\ProgramData\\Halvorn\\Glow.dat")) << copies[0];
}

TEST_F(PlacementTest, DoublesTheAmpersandOfAStreamedPathAlone) {
    machine.HasFolder(R"(C:\ProgramData\Black & White)");
    EXPECT_EQ(
        Install(
            {PackageBuilder("com.halvorn.glow").Payload("resource").To("programdata", "Black & White").File("a", "b")}),
        1);
    EXPECT_TRUE(log.Has(DebugLine(R"(Checking dest path, creating if needed: "C:\ProgramData\Black && White")")))
        << log.Text();
    EXPECT_TRUE(log.Has(DebugLine(R"(Directory found at C:\ProgramData\Black & White)")));
}

TEST_F(PlacementTest, StashesWhatIsThereBeforeItCopies) {
    machine.Has(R"(C:\ProgramData\Halvorn\Glow.dat)", "old");
    EXPECT_EQ(Install({In("programdata")}), 1);
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\Glow.dat)"), "glow");
    EXPECT_TRUE(
        log.Has(DebugLine(R"(stashing existing file in case of rollback, from "C:\ProgramData\Halvorn\Glow.dat")")))
        << log.Text();
}

TEST_F(PlacementTest, ReplacesAFolderWholly) {
    machine.Has(R"(C:\ProgramData\Halvorn\Glow\stale.txt)", "old");
    EXPECT_EQ(Install({PackageBuilder("com.halvorn.glow")
                           .Payload("resource")
                           .To("programdata", "Halvorn")
                           .Source("Glow")
                           .File("Glow/fresh.txt", "new")}),
              1);
    EXPECT_EQ(PlacedFiles(), (Paths{R"(C:\ProgramData\Halvorn\Glow\fresh.txt)"}));
}

TEST_F(PlacementTest, KeepsItsResultWhenTheFolderOfAPatternIsMissing) {
    // The star stands in a folder's place, where it is looked for as it stands.
    EXPECT_EQ(Install({PackageBuilder("com.halvorn.glow")
                           .Payload("resource")
                           .To("programdata")
                           .File("any/Glow.dat", "x")
                           .Source("a*/Glow.dat")}),
              0)
        << log.Text();
    EXPECT_EQ(log.LinesStartingWith(ErrorLine("exception deploying payload payload-1: ")).size(), 1U) << log.Text();
    EXPECT_FALSE(HasRolledBack());
}
