// The run over a folder: phases, their order, what each reports, and what a failure of one does to the next.
#include <stdexcept>

#include "tests/hvdeploy/engine/EngineTest.h"

namespace {

using Texts = std::vector<std::string>;

class FlowTest : public EngineTest {
protected:
    static PackageBuilder TwoPayloads(const std::string& fileName) {
        return PackageBuilder("com.halvorn.glow")
            .Named(fileName)
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File("one.dll", "one")
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File("two.dll", "two");
    }
    static PackageBuilder Broken(const std::string& fileName) {
        return PackageBuilder("com.halvorn.broken").Named(fileName).ManifestText("no manifest");
    }
    /// A package that comes with a script for its removal, so that a run has something to register.
    static PackageBuilder Removable(const std::string& name) { return Placing(name).Policy("uninstall", "true"); }
    bool IsRegistered() const { return machine.Registry().find("com.halvorn.tessaly") != std::string::npos; }
    void HasSuiteFile() {
        machine.Has(R"(C:\Packages\suite.json)",
                    R"({"identifier": "com.halvorn.tessaly", "version": "3.1", "product_type": "0"})");
    }
};

class ThrowingHosts : public HV::HostAppDetector {
public:
    bool Run(std::vector<HV::HostRecord>&) override { throw std::runtime_error("no answer from the registry"); }
};

}  // namespace

TEST_F(FlowTest, ReportsEveryStepOfAFullRunWithItsPercentage) {
    Ships(TwoPayloads("preflight-glow.hvpkg"));
    Ships(TwoPayloads("glow.hvpkg"));
    Ships(TwoPayloads("postflight-glow.hvpkg"));
    EXPECT_EQ(InstallFolder(), 1) << log.Text();
    // Three files of one size: 30 points each, a quarter of one for the first report, 14.875 for each payload. Adding
    // stops at 97, so the packages after the 98 go back to it.
    EXPECT_EQ(listener.reports, (Texts{"1 Preparing to install...",
                                       "2 Checking packages to install...",
                                       "2 Installing packages...",
                                       "2 Installing preflight-glow.hvpkg",
                                       "2 Installing preflight-glow.hvpkg...",
                                       "17 Installing preflight-glow.hvpkg...",
                                       "32 Installing preflight-glow.hvpkg...",
                                       "32 Verifying installation...",
                                       "32 Checking product dependencies...",
                                       "32 Installing packages...",
                                       "32 Installing glow.hvpkg",
                                       "32 Installing glow.hvpkg...",
                                       "47 Installing glow.hvpkg...",
                                       "62 Installing glow.hvpkg...",
                                       "62 Verifying installation...",
                                       "62 Checking product dependencies...",
                                       "98 Completing installation.",
                                       "98 Installing packages...",
                                       "97 Installing postflight-glow.hvpkg",
                                       "97 Installing postflight-glow.hvpkg...",
                                       "97 Installing postflight-glow.hvpkg...",
                                       "97 Installing postflight-glow.hvpkg...",
                                       "97 Verifying installation...",
                                       "97 Checking product dependencies...",
                                       "100 Installation complete."}));
}

TEST_F(FlowTest, ShowsNoMoreThan92BeforeTheEndWhenAllPackagesAreMainOnes) {
    Ships(TwoPayloads("a.hvpkg"));
    Ships(TwoPayloads("b.hvpkg"));
    Ships(TwoPayloads("c.hvpkg"));
    EXPECT_EQ(InstallFolder(), 0) << "the phase of postflights, which has none, speaks last";
    EXPECT_TRUE(HasReported("92 Verifying installation...")) << log.Text();
}

TEST_F(FlowTest, LogsThePhasesAndTheirPackages) {
    Ships(TwoPayloads("preflight-glow.hvpkg"));
    Ships(TwoPayloads("glow.hvpkg"));
    EXPECT_EQ(InstallFolder(), 0);
    const Texts expected{
        DebugLine("HV::Deploy::HV::Deploy::DeployPackagesFromDirectory"),
        DebugLine("---------------------------"),
        DebugLine(R"(Installing from directory '"C:\Packages"')"),
        InfoLine("Deploying Preflight Packages"),
        DebugLine("Preflight packages"),
        DebugLine("-------------------"),
        DebugLine(R"("C:\Packages\preflight-glow.hvpkg")"),
        DebugLine("HV::Deploy::HV::Deploy::DeployPackages"),
        InfoLine("=============================="),
        InfoLine("Installing package [1/1]"),
        InfoLine("Deploying Main Packages"),
        InfoLine("------------------------"),
    };
    const Texts lines = log.Lines();
    auto place = lines.begin();
    for (const std::string& line : expected) {
        place = std::find(place, lines.end(), line);
        ASSERT_NE(place, lines.end()) << line << " is missing or too early in\n" << log.Text();
    }
    EXPECT_EQ(log.Count(DebugLine("-------------------")), 2U);
}

TEST_F(FlowTest, NamesAFolderThatIsNone) {
    EXPECT_EQ(InstallFolder(), -2);
    EXPECT_TRUE(log.Has(ErrorLine(R"('"C:\Packages"' is not a directory.)"))) << log.Text();
    EXPECT_EQ(listener.reports, (Texts{"1 Preparing to install...", "2 Checking packages to install..."}));
}

TEST_F(FlowTest, NamesAFileThatIsGivenAsAFolder) {
    machine.Has(kPackages, "a file");
    EXPECT_EQ(InstallFolder(), -2);
    EXPECT_TRUE(log.Has(ErrorLine(R"('"C:\Packages"' is not a directory.)")));
}

TEST_F(FlowTest, RunsThroughAllPhasesOfAFolderWithASuiteFileOnly) {
    HasSuiteFile();
    EXPECT_EQ(InstallFolder(), 0);
    EXPECT_EQ(listener.reports, (Texts{"1 Preparing to install...", "2 Checking packages to install...",
                                       "98 Completing installation.", "100 Installation complete."}));
}

TEST_F(FlowTest, RegistersTheSuiteWithTheSystem) {
    HasSuiteFile();
    Ships(Removable("glow"));
    EXPECT_EQ(InstallFolder(), 0);
    EXPECT_TRUE(IsRegistered()) << machine.Registry();
}

TEST_F(FlowTest, PassesOverOtherFilesAndSubFolders) {
    machine.Has(R"(C:\Packages\readme.txt)", "text");
    machine.HasFolder(R"(C:\Packages\folder.hvpkg)");
    (void)Placing("glow").WriteTo(R"(C:\Packages\more)");
    EXPECT_EQ(InstallFolder(), 0);
    EXPECT_FALSE(machine.Exists(Placed("glow")));
    EXPECT_EQ(log.Count(InfoLine("Installing package [1/1]")), 0U);
}

TEST_F(FlowTest, KnowsAPhaseByThePrefixInAnyCase) {
    Ships(Failing("runtime").Named("PreFlight-Runtime.hvpkg"));
    EXPECT_EQ(InstallFolder(), -2);
    EXPECT_TRUE(log.Has(CritLine("** Preflight package install returned -2"))) << log.Text();
}

TEST_F(FlowTest, KnowsAPostflightPackageByThePrefixInAnyCase) {
    Ships(Failing("support").Named("POSTFLIGHT-Support.zip"));
    EXPECT_EQ(InstallFolder(), -2);
    EXPECT_TRUE(log.Has(ErrorLine("Postflight package install returned -2"))) << log.Text();
}

// The folder's walk folds the extension and the package does not: such a file is met, and then is no package.
TEST_F(FlowTest, MeetsAPackageWhoseExtensionIsInUpperCase) {
    Ships(Placing("glow").Named("GLOW.HVPKG"));
    EXPECT_EQ(InstallFolder(), -1);
    EXPECT_TRUE(log.Has(WarnLine("In HV::Package::Validate - zip does not exist at "))) << log.Text();
    EXPECT_TRUE(log.Has(CritLine(R"(Error deploying package: '"C:\Packages\GLOW.HVPKG"' err:-1)"))) << log.Text();
}

TEST_F(FlowTest, TakesAPackageThatIsNamedJustThePrefixForAPreflight) {
    Ships(Failing("runtime").Named("preflight-.hvpkg"));
    EXPECT_EQ(InstallFolder(), -2);
    EXPECT_TRUE(log.Has(CritLine("** Preflight package install returned -2")));
}

TEST_F(FlowTest, TakesThePrefixWithoutItsHyphenForAMainPackage) {
    Ships(Failing("glow").Named("preflightglow.hvpkg"));
    EXPECT_EQ(InstallFolder(), -2);
    EXPECT_TRUE(log.Has(ErrorLine("Main package install returned -2"))) << log.Text();
}

TEST_F(FlowTest, EndsWithAFailedPreflightPhase) {
    HasSuiteFile();
    Ships(Broken("preflight-runtime.hvpkg"));
    Ships(Placing("glow"));
    EXPECT_EQ(InstallFolder(), -1);
    EXPECT_TRUE(log.Has(CritLine("** Preflight package install returned -1"))) << log.Text();
    EXPECT_FALSE(machine.Exists(Placed("glow")));
    EXPECT_FALSE(log.Has(InfoLine("Deploying Main Packages")));
    EXPECT_FALSE(HasReported("98 Completing installation."));
    EXPECT_FALSE(HasReported("100 Installation complete."));
    EXPECT_FALSE(IsRegistered());
    EXPECT_EQ(listener.reports.back().substr(listener.reports.back().find(' ') + 1), "An error has occured");
}

TEST_F(FlowTest, GoesOnAfterAnExceptionInThePreflightPhase) {
    engine.HostCheck().AddDetector(boost::make_shared<ThrowingHosts>());
    Ships(PackageBuilder("com.halvorn.runtime")
              .Named("preflight-runtime.hvpkg")
              .Payload("plugin")
              .ForHost("aftereffects")
              .File("Runtime.aex", "x"));
    Ships(Placing("glow"));
    EXPECT_EQ(InstallFolder(), 0) << log.Text();
    EXPECT_TRUE(log.Has(ErrorLine("no answer from the registry"))) << log.Text();
    EXPECT_TRUE(machine.HasFile(Placed("glow")));
}

TEST_F(FlowTest, LetsAnExceptionOfAnotherPhaseThroughWithoutLeavingTemporaryFiles) {
    engine.HostCheck().AddDetector(boost::make_shared<ThrowingHosts>());
    Ships(PackageBuilder("com.halvorn.glow").Payload("plugin").ForHost("aftereffects").File("Glow.aex", "x"));
    EXPECT_THROW((void)InstallFolder(), std::runtime_error);
    const std::vector<std::string> left = machine.TempEntries();
    ASSERT_EQ(left.size(), 1U);
    EXPECT_EQ(left[0].rfind("hvdeploystash", 0), 0U) << left[0];
}

TEST_F(FlowTest, LeavesPostflightsAndRegistrationOutAfterAFailedMainPhase) {
    HasSuiteFile();
    Ships(Removable("runtime").Named("preflight-runtime.hvpkg"));
    Ships(Failing("glow"));
    Ships(Placing("support").Named("postflight-support.hvpkg"));
    EXPECT_EQ(InstallFolder(), -2);
    EXPECT_TRUE(log.Has(ErrorLine("Main package install returned -2"))) << log.Text();
    EXPECT_FALSE(machine.Exists(Placed("support")));
    EXPECT_TRUE(HasReported("98 Completing installation."));
    EXPECT_EQ(listener.reports.back(), "100 Installation complete.");
    EXPECT_FALSE(IsRegistered());
}

TEST_F(FlowTest, UndoesEarlierPhasesWhenAPostflightFails) {
    machine.Has(Placed("glow"), "old");
    HasSuiteFile();
    Ships(Removable("runtime").Named("preflight-runtime.hvpkg"));
    Ships(Placing("glow"));
    Ships(Failing("support").Named("postflight-support.hvpkg"));
    EXPECT_EQ(InstallFolder(), -2);
    EXPECT_TRUE(log.Has(ErrorLine("Postflight package install returned -2"))) << log.Text();
    EXPECT_EQ(machine.Content(Placed("glow")), "old");
    EXPECT_FALSE(machine.Exists(Placed("runtime")));
    EXPECT_EQ(listener.reports.back(), "100 Installation complete.");
    EXPECT_FALSE(IsRegistered());
}

TEST_F(FlowTest, ReportsNothingForAPhaseWithoutPackages) {
    EXPECT_EQ(engine.DeployPackages({}), 0);
    EXPECT_EQ(listener.reports, (Texts{"1 Preparing to install..."}));
    EXPECT_TRUE(log.Has(DebugLine("HV::Deploy::HV::Deploy::DeployPackages")));
}

TEST_F(FlowTest, KeepsTheBarAtOneForASingleFile) {
    EXPECT_EQ(Install({Placing("glow")}), 1);
    EXPECT_EQ(listener.reports,
              (Texts{"1 Preparing to install...", "1 Installing packages...", "1 Installing com.halvorn.glow.hvpkg...",
                     "1 Verifying installation...", "1 Checking product dependencies..."}));
}

TEST_F(FlowTest, InstallsWithoutAListener) {
    HV::Deploy silent(nullptr);
    EXPECT_EQ(silent.DeployPackages({Placing("glow").WriteTo(kPackages)}), 1);
    EXPECT_TRUE(machine.HasFile(Placed("glow")));
    EXPECT_TRUE(log.Has(DebugLine("Reporting progress: 0 msg: Installing packages... error: 0"))) << log.Text();
}

TEST_F(FlowTest, StopsAtTheFirstPackageThatFails) {
    EXPECT_EQ(Install({Placing("glow"), Failing("grain"), Placing("keyer")}), -2);
    EXPECT_TRUE(log.Has(InfoLine("Installing package [2/3]")));
    EXPECT_FALSE(log.Has(InfoLine("Installing package [3/3]")));
    EXPECT_TRUE(log.Has(CritLine(R"(Error deploying package: '"C:\Packages\com.halvorn.grain.hvpkg"' err:-2)")));
    EXPECT_FALSE(HasReported("1 Verifying installation..."));
    EXPECT_EQ(listener.reports.back(), "1 An error has occured");
}

TEST_F(FlowTest, GivesTheResultOfTheLastPackage) {
    HasInstalled("com.halvorn.grain_v9.0");
    EXPECT_EQ(Install({Placing("glow"), Placing("grain")}), 0);
    EXPECT_TRUE(machine.HasFile(Placed("glow")));
}

TEST_F(FlowTest, AsksForDependenciesPhaseByPhase) {
    Ships(Placing("runtime").Named("preflight-runtime.hvpkg"));
    Ships(Placing("glow").DependsOn("com.halvorn.runtime"));
    EXPECT_EQ(InstallFolder(), -1) << log.Text();
    EXPECT_TRUE(log.Has(ErrorLine("Main package install returned -1")));
    EXPECT_TRUE(machine.HasFile(Placed("glow"))) << "a missing dependency undoes nothing";
    EXPECT_FALSE(HasRolledBack());
}

TEST_F(FlowTest, AsksPackagesOfAnEarlierPhaseForTheirDependenciesNoMore) {
    Ships(Placing("runtime").DependsOn("com.halvorn.core").Named("preflight-runtime.hvpkg"));
    Ships(Placing("core").Named("preflight-core.hvpkg"));
    Ships(Placing("glow"));
    EXPECT_EQ(InstallFolder(), 0) << log.Text();
    EXPECT_EQ(log.LinesStartingWith("ERROR"), Texts{});
    EXPECT_TRUE(machine.HasFile(Placed("glow")));
}

TEST_F(FlowTest, CountsTheBytesOfEachFolderAnew) {
    Ships(Placing("glow"));
    EXPECT_EQ(InstallFolder(), 0);
    EXPECT_EQ(InstallFolder(), 0);
    EXPECT_EQ(engine.PackageProgressPoints(fs::path(R"(C:\Packages\com.halvorn.glow.hvpkg)")), 90.0F);
}

TEST_F(FlowTest, CountsSkippedPackagesInTheTotal) {
    Ships(TwoPayloads("preflight-glow.hvpkg"));
    Ships(TwoPayloads("glow.hvpkg"));
    EXPECT_EQ(InstallFolder({"preflight-glow.hvpkg"}), 0);
    // The quarter point at 2, and then all 44.75 that are left of the 45.
    EXPECT_EQ(listener.reports[3], "2 Installing preflight-glow.hvpkg");
    EXPECT_EQ(listener.reports[4], "47 Installing packages...");
}

TEST_F(FlowTest, CancelBeforeTheFirstPackageUndoesAnEmptyStash) {
    engine.Cancel();
    EXPECT_EQ(Install({Placing("glow")}), -2);
    EXPECT_TRUE(log.Has(DebugLine("HV::Deploy::HV::Deploy::Cancel")));
    EXPECT_TRUE(log.Has(WarnLine("Installation cancelled, rolling back..."))) << log.Text();
    EXPECT_TRUE(HasRolledBack());
    EXPECT_EQ(listener.reports,
              (Texts{"1 Preparing to install...", "1 Installing packages...", "1 Cancelling install..."}));
}

TEST_F(FlowTest, CancelAfterALastPackageThatWasSkippedVerifiesNothing) {
    listener.onReport = [this](std::size_t) {
        if (listener.reports.back() == "92 Installing packages...") {
            engine.Cancel();
        }
    };
    Ships(Placing("glow"));
    EXPECT_EQ(InstallFolder({"com.halvorn.glow"}), 0);
    EXPECT_TRUE(HasReported("92 Cancelling install...")) << log.Text();
    EXPECT_FALSE(HasReported("92 Verifying installation..."));
}

TEST_F(FlowTest, CancelAfterTheLastPackageReportsItAndKeepsTheResult) {
    listener.onReport = [this](std::size_t) {
        if (listener.reports.back() == "1 Checking product dependencies...") {
            engine.Cancel();
        }
    };
    EXPECT_EQ(Install({Placing("glow")}), 1);
    EXPECT_EQ(listener.reports.back(), "1 Cancelling install...");
    EXPECT_TRUE(machine.HasFile(Placed("glow")));
}
