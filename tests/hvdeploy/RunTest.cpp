// A run of the front end: what it prints, which command it takes, and what it gives.
#include "tests/hvdeploy/CommandLineTest.h"

#include <stdexcept>

namespace {

constexpr const char* kNotices =
    "Copyright (c) Halvorn LLC. All rights reserved.\n"
    "Use of this program and of what it installs is subject to the licence agreement.\n"
    "=====\n";
constexpr const char* kBanner = "hvdeploy version 2.0-d1\n";

/// Makes a folder the current one for as long as it lives.
class CurrentFolder {
public:
    explicit CurrentFolder(const char* folder) : before_(fs::current_path()) { fs::current_path(fs::path(folder)); }
    ~CurrentFolder() { fs::current_path(before_); }
    CurrentFolder(const CurrentFolder&) = delete;
    CurrentFolder& operator=(const CurrentFolder&) = delete;

private:
    fs::path before_;
};

class RunTest : public CommandLineTest {
protected:
    /// What a line with nothing to do prints.
    std::string Printed(const std::string& line) {
        CapturedStreams streams;
        EXPECT_EQ(Run(line), 0);
        return streams.Output();
    }
};

TEST_F(RunTest, BeginsWithItsEntryLine) {
    EXPECT_EQ(Run("list="), 0);
    EXPECT_TRUE(log.Has(InfoLine("HV::DeployCLI::HV::DeployCLI::Run")));
}

TEST_F(RunTest, LogsTheVersionAndPrintsNothingWithoutAFlag) {
    EXPECT_EQ(Printed("list="), "");
    EXPECT_TRUE(log.Has(InfoLine("hvdeploy version 2.0-d1")));
}

TEST_F(RunTest, PrintsTheVersionAlone) {
    EXPECT_EQ(Printed("list= --version"), kBanner);
    EXPECT_FALSE(log.Has(InfoLine("hvdeploy version 2.0-d1")));
}

TEST_F(RunTest, PrintsTheNoticesWithAbout) {
    EXPECT_EQ(Printed("list= --about"), std::string(kBanner) + kNotices);
}

TEST_F(RunTest, PrintsTheNoticesWithVerbose) {
    EXPECT_EQ(Printed("list= --verbose"), std::string(kBanner) + kNotices);
}

TEST_F(RunTest, DeploysTheDefaultFolderAfterPrintingItsVersion) {
    (void)Product("glow").WriteTo(R"(C:\Work\packages)");
    const CurrentFolder current(R"(C:\Work)");
    EXPECT_EQ(Printed("--version"), kBanner);
    EXPECT_TRUE(machine.HasFile(PlaceOf("glow")));
}

TEST_F(RunTest, TakesTheDefaultFolderBesideTheProgramWhenTheCurrentFolderHasNone) {
    (void)Product("glow").WriteTo(R"(C:\Program Files\Setup\packages)");
    machine.HasFolder(R"(C:\Work)");
    const CurrentFolder current(R"(C:\Work)");
    const char* const arguments[] = {R"(C:\Program Files\Setup\hvdeploy.exe)"};
    ASSERT_EQ(cli.ParseArgs(1, arguments), 0);
    EXPECT_EQ(cli.Run(), 0);
    EXPECT_TRUE(machine.HasFile(PlaceOf("glow")));
}

TEST_F(RunTest, PrefersTheDefaultFolderOfTheCurrentFolder) {
    (void)Product("glow").WriteTo(R"(C:\Work\packages)");
    (void)Product("flare").WriteTo(R"(C:\Setup\packages)");
    const CurrentFolder current(R"(C:\Work)");
    const char* const arguments[] = {R"(C:\Setup\hvdeploy.exe)"};
    ASSERT_EQ(cli.ParseArgs(1, arguments), 0);
    EXPECT_EQ(cli.Run(), 0);
    EXPECT_TRUE(machine.HasFile(PlaceOf("glow")));
    EXPECT_FALSE(machine.Exists(PlaceOf("flare")));
}

TEST_F(RunTest, HasNoFilesToInstallWithoutADefaultFolder) {
    machine.Has(R"(C:\Work\packages)", "a file of that name is no folder");
    const CurrentFolder current(R"(C:\Work)");
    EXPECT_EQ(Run("--legacyuninstall"), 0);
    EXPECT_TRUE(log.Has(InfoLine("No files to install.")));
    EXPECT_EQ(listener.reports, (std::vector<Report>{{1, "Preparing to install...", 0}}));
}

TEST_F(RunTest, SearchesTheDefaultFolderWhenTheNameOfTheFileIsEmpty) {
    // "dir=" is not read then.
    (void)Product("glow").WriteTo(R"(C:\Elsewhere)");
    machine.HasFolder(R"(C:\Work)");
    const CurrentFolder current(R"(C:\Work)");
    EXPECT_EQ(Run(R"(file= dir=C:\Elsewhere)"), 0);
    EXPECT_TRUE(log.Has(InfoLine("No files to install.")));
    EXPECT_FALSE(machine.Exists(PlaceOf("glow")));
}

TEST_F(RunTest, SearchesTheDefaultFolderWhenTheNameOfTheFolderIsEmpty) {
    machine.HasFolder(R"(C:\Work)");
    const CurrentFolder current(R"(C:\Work)");
    EXPECT_EQ(Run("dir="), 0);
    EXPECT_TRUE(log.Has(InfoLine("No files to install.")));
}

TEST_F(RunTest, DeploysOneFileAndReadsNoFolder) {
    (void)Product("glow").Named("a&b.hvpkg").WriteTo(R"(C:\One)");
    (void)Product("flare").WriteTo(R"(C:\Folder)");
    EXPECT_EQ(Run(R"(dir=C:\Folder file=C:\One\a&b.hvpkg)"), 0);
    EXPECT_TRUE(log.Has(DebugLine("HV::DeployCLI::HV::DeployCLI::DoDeployCommand")));
    EXPECT_TRUE(log.Has(InfoLine(R"(Deploying package at "C:\One\a&&b.hvpkg")"))) << log.Text();
    EXPECT_TRUE(machine.HasFile(PlaceOf("glow")));
    EXPECT_FALSE(machine.Exists(PlaceOf("flare")));
    // No folder, no points: the bar stays where it began.
    EXPECT_FALSE(listener.reports.empty());
    for (const Report& report : listener.reports) {
        EXPECT_EQ(report.percent, 1U) << report;
    }
}

TEST_F(RunTest, FoldsTheFailureOfAFileToMinusOne) {
    (void)Product("glow").Payload("resource").File("x.dll", "x").To("nowhere").WriteTo(R"(C:\One)");
    EXPECT_EQ(Run(R"(file=C:\One\com.halvorn.glow.hvpkg)"), -1);
    EXPECT_EQ(listener.reports.back(), (Report{kFailureMark, kFailureMessage, -1}));
}

TEST_F(RunTest, StripsNoQuotesFromTheNameOfAFile) {
    (void)Product("glow").WriteTo(R"(C:\One)");
    EXPECT_NE(Run(R"(file="C:\One\com.halvorn.glow.hvpkg")"), 0);
    EXPECT_FALSE(machine.Exists(PlaceOf("glow")));
}

TEST_F(RunTest, DeploysAFolder) {
    (void)Product("glow").WriteTo(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(dir=C:\Packages)"), 0);
    EXPECT_EQ(machine.Content(PlaceOf("glow")), "text of glow");
}

TEST_F(RunTest, TakesTheQuotesFromTheNameOfAFolder) {
    (void)Product("glow").WriteTo(R"(C:\My Packages)");
    EXPECT_EQ(Run(R"(dir="C:\My Packages")"), 0);
    EXPECT_TRUE(machine.HasFile(PlaceOf("glow")));
}

TEST_F(RunTest, TakesTheLastCharacterWithAnOpeningQuoteWhateverItIs) {
    (void)Product("glow").WriteTo(R"(C:\My Packages)");
    EXPECT_EQ(Run(R"(dir="C:\My Packages"x)"), -1);
    EXPECT_TRUE(log.Has(ErrorLine(R"(not a directory: "C:\My Packages&"")"))) << log.Text();
}

TEST_F(RunTest, LeavesNothingOfALoneQuote) {
    // Two apostrophes hide it from the balance of the line.
    const char* const arguments[] = {"./hvdeploy", "dir=\""};
    ASSERT_EQ(cli.ParseArgs(2, arguments), 0);
    EXPECT_EQ(cli.Run(), -1);
    EXPECT_TRUE(log.Has(ErrorLine(R"(not a directory: "")"))) << log.Text();
}

TEST_F(RunTest, SaysWhatIsNoFolder) {
    EXPECT_EQ(Run(R"(dir=C:\Nothing&here)"), -1);
    EXPECT_TRUE(log.Has(ErrorLine(R"(not a directory: "C:\Nothing&&here")"))) << log.Text();
    EXPECT_EQ(listener.reports.back(), (Report{kFailureMark, kFailureMessage, -1}));
}

TEST_F(RunTest, FoldsTheFailureOfAFolderToMinusOne) {
    (void)Product("glow").Payload("resource").File("x.dll", "x").To("nowhere").WriteTo(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(dir=C:\Packages)"), -1);
    EXPECT_TRUE(log.Has(ErrorLine("Main package install returned -2"))) << log.Text();
}

TEST_F(RunTest, LeavesOutWhatTheLineSkips) {
    (void)Product("glow").WriteTo(R"(C:\Packages)");
    (void)Product("flare").WriteTo(R"(C:\Packages)");
    (void)Product("keyer").WriteTo(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(dir=C:\Packages skip="com.halvorn.glow,,com.halvorn.keyer.hvpkg")"), 0);
    EXPECT_EQ(machine.Exists(PlaceOf("glow")), false);
    EXPECT_EQ(machine.Exists(PlaceOf("flare")), true);
    EXPECT_EQ(machine.Exists(PlaceOf("keyer")), false);
}

TEST_F(RunTest, TakesASkippedNameInApostrophesWithItsBlankAsOne) {
    (void)Product("glow").Named("my glow.hvpkg").WriteTo(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(dir=C:\Packages skip='my glow.hvpkg')"), 0);
    EXPECT_FALSE(machine.Exists(PlaceOf("glow")));
}

TEST_F(RunTest, StripsOneQuoteOnEachSideOfTheSkippedNamesByItself) {
    (void)Product("glow").WriteTo(R"(C:\Packages)");
    const char* const arguments[] = {"./hvdeploy", R"(dir=C:\Packages)", "skip='com.halvorn.glow\""};
    ASSERT_EQ(cli.ParseArgs(3, arguments), 0);
    EXPECT_EQ(cli.Run(), 0);
    EXPECT_FALSE(machine.Exists(PlaceOf("glow")));
}

TEST_F(RunTest, SkipsOneEmptyNameForAnEmptyValue) {
    // The identifier of this package is empty, so the list's one empty text names it; without "skip=" it goes in.
    (void)PackageBuilder("")
        .Payload("resource")
        .To("programdata", "Halvorn")
        .File("a.txt", "a")
        .Named("a.hvpkg")
        .WriteTo(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(dir=C:\Packages skip=)"), 0);
    EXPECT_FALSE(machine.Exists(PlaceOf("a")));
    HV::DeployCLI other(nullptr);
    ASSERT_EQ(other.ParseLine(R"(dir=C:\Packages)"), 0);
    EXPECT_EQ(other.Run(), 0);
    EXPECT_TRUE(machine.Exists(PlaceOf("a")));
}

TEST_F(RunTest, HandsVerboseToTheEngine) {
    (void)Product("glow").WriteTo(R"(C:\Packages)");
    EXPECT_EQ(
        Printed(R"(dir=C:\Packages --verbose)"),
        std::string(kBanner) + kNotices + "Installing com.halvorn.glow.hvpkg...\n[v] Deploying payload payload-1\n");
}

TEST_F(RunTest, HandsTheLegacySwitchToTheEngine) {
    (void)Product("glow").WriteTo(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(dir=C:\Packages --legacyuninstall)"), 0);
    EXPECT_TRUE(log.Has(DebugLine("HV::Deploy::HV::Deploy::RegisterLegacyUninstall")));
}

TEST_F(RunTest, LeavesTheLegacySwitchOffWithoutTheFlag) {
    (void)Product("glow").WriteTo(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(dir=C:\Packages)"), 0);
    EXPECT_FALSE(log.Has(DebugLine("HV::Deploy::HV::Deploy::RegisterLegacyUninstall")));
}

TEST_F(RunTest, HandsTheTestErrorToTheEngine) {
    (void)Product("glow").WriteTo(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(dir=C:\Packages --error)"), -1);
    EXPECT_FALSE(log.LinesStartingWith("FATAL hvdeploy-detail: creating a fatal error").empty()) << log.Text();
    EXPECT_FALSE(machine.Exists(PlaceOf("glow")));
}

TEST_F(RunTest, ListsInPlaceOfDeploying) {
    (void)Product("glow").WriteTo(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(dir=C:\Packages list=hosts)"), 0);
    EXPECT_FALSE(machine.Exists(PlaceOf("glow")));
    EXPECT_FALSE(log.Has(DebugLine("HV::DeployCLI::HV::DeployCLI::DoDeployCommand")));
}

TEST_F(RunTest, AcceptsFourKeysThatDoNothing) {
    (void)Product("glow").WriteTo(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(rollback=force manifest=x uninstall=y update=newer dir=C:\Packages)"), 0);
    EXPECT_TRUE(machine.HasFile(PlaceOf("glow")));
}

TEST_F(RunTest, ReadsItsResultOutOfAnException) {
    listener.onReport = [](const std::string& message) {
        if (message == "Checking packages to install...") {
            throw std::runtime_error("ERROR(42) told by a test");
        }
    };
    machine.HasFolder(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(dir=C:\Packages)"), 42);
    EXPECT_TRUE(log.Has(ErrorLine("exception caught in HV::DeployCLI::Run(): \nERROR(42) told by a test")));
    EXPECT_EQ(listener.reports.back(), (Report{kFailureMark, kFailureMessage, 42}));
}

TEST_F(RunTest, TellsNobodyOfAnExceptionWhoseCodeIsNoFailure) {
    listener.onReport = [](const std::string& message) {
        if (message == "Checking packages to install...") {
            throw std::runtime_error("ERROR(1)");
        }
    };
    machine.HasFolder(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(dir=C:\Packages)"), 1);
    EXPECT_EQ(listener.reports.back(), (Report{2, "Checking packages to install...", 0}));
}

TEST_F(RunTest, IsMinusOneForAnExceptionOfNoKnownKind) {
    listener.onReport = [](const std::string& message) {
        if (message == "Checking packages to install...") {
            throw 7;
        }
    };
    machine.HasFolder(R"(C:\Packages)");
    EXPECT_EQ(Run(R"(dir=C:\Packages)"), -1);
    EXPECT_TRUE(log.Has(ErrorLine("unknown exception caught in HV::DeployCLI::Run()")));
    EXPECT_EQ(listener.reports.back(), (Report{kFailureMark, kFailureMessage, -1}));
}

TEST_F(RunTest, FailsWithoutAListenerToo) {
    HV::DeployCLI alone(nullptr);
    ASSERT_EQ(alone.ParseLine(R"(dir=C:\Nothing)"), 0);
    EXPECT_EQ(alone.Run(), -1);
}

TEST_F(RunTest, CancelsTheEngine) {
    (void)Product("glow").WriteTo(R"(C:\Packages)");
    cli.Cancel();
    EXPECT_TRUE(log.Has("CRIT hvdeploy-detail: Cancel invoked"));
    EXPECT_TRUE(log.Has(DebugLine("HV::Deploy::HV::Deploy::Cancel")));
    EXPECT_EQ(Run(R"(dir=C:\Packages)"), -1);
    EXPECT_FALSE(machine.Exists(PlaceOf("glow")));
}

}  // namespace
