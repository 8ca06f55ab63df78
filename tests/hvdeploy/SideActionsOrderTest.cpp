// When the side actions of a payload happen, and what becomes of the run when one fails.
#include <algorithm>

#include "tests/hvdeploy/SideActionsTest.h"
#include "tests/support/Link.h"

namespace {

constexpr const char* kPlacedFile = R"(C:\ProgramData\Halvorn\Glow.exe)";
constexpr const char* kLink = R"(C:\ProgramData\Microsoft\Windows\Start Menu\Programs\Glow.lnk)";
constexpr const char* kFails = "exit 512";

class SideActionsOrderTest : public SideActionsTest {
protected:
    /// A package whose first payload places a program.
    static PackageBuilder Placing() {
        return PackageBuilder("com.halvorn.glow")
            .Payload("resource")
            .To("programdata", "Halvorn")
            .File("Glow.exe", "program");
    }
    /// A package whose first payload has nothing to place.
    static PackageBuilder PlacingNothing() {
        return PackageBuilder("com.halvorn.glow").Payload("script").Deployment("run").File("Readme.txt", "text");
    }

    bool HasRun(const std::string& command) const { return log.Has(DebugLine("Postflight command: " + command)); }
    bool HasEntered(const std::string& operation) const {
        return log.Has(DebugLine("HV::Deploy::HV::Deploy::" + operation));
    }
    bool HasRolledBack(int result) const {
        return log.Has(
            ErrorLine("Installation cannot complete, rolling back; error value is " + std::to_string(result)));
    }
};

}  // namespace

TEST_F(SideActionsOrderTest, PreflightsThenRegistryThenPostflightsThenShortcuts) {
    const HV::EngineResult result = Deploy(Placing()
                                               .Shortcut("Glow.exe", "", "startmenu")
                                               .Postflight("echo after")
                                               .RegistryEntry("", R"(SOFTWARE\Halvorn)", "a", "b", "windows")
                                               .Preflight("echo before"));
    EXPECT_EQ(result, 1) << log.Text();
    const std::vector<std::size_t> places{
        PlaceOf(DebugLine("Postflight command: echo before")),
        PlaceOf(DebugLine("HV::Deploy::HV::Deploy::DeployPayload")),
        PlaceOf(DebugLine("HV::Deploy::HV::Deploy::MakeRegistryEntry")),
        PlaceOf(DebugLine("Postflight command: echo after")),
        PlaceOf(DebugLine("HV::Deploy::HV::Deploy::MakeShortcut")),
    };
    EXPECT_TRUE(std::is_sorted(places.begin(), places.end())) << log.Text();
}

TEST_F(SideActionsOrderTest, RunsScriptsInTheirOrder) {
    EXPECT_EQ(Deploy(Placing().Postflight("echo one").Postflight("echo two").Postflight("echo three")), 1);
    EXPECT_LT(PlaceOf(DebugLine("Postflight command: echo one")), PlaceOf(DebugLine("Postflight command: echo two")));
    EXPECT_LT(PlaceOf(DebugLine("Postflight command: echo two")), PlaceOf(DebugLine("Postflight command: echo three")));
}

TEST_F(SideActionsOrderTest, RunsAScriptFileOfTheExtractedPackage) {
    EXPECT_EQ(Deploy(Placing()
                         .File("scripts/setup.bat", "echo from the file\n")
                         .PostflightXml(R"(<postflight id="setup" source="scripts/setup.bat"/>)")),
              1);
    const std::vector<std::string> output = log.LinesStartingWith(DebugLine("Script output: [id: setup] "));
    ASSERT_EQ(output.size(), 1U);
    EXPECT_NE(output[0].find("from the file\n"), std::string::npos) << output[0];
}

TEST_F(SideActionsOrderTest, AFailedPreflightDoesNotKeepThePayloadFromBeingPlaced) {
    EXPECT_EQ(Deploy(Placing().Preflight(kFails).Preflight("echo never").Postflight("echo after")), 1);
    EXPECT_TRUE(machine.HasFile(kPlacedFile));
    EXPECT_FALSE(HasRun("echo never"));
    EXPECT_TRUE(HasRun("echo after"));
}

TEST_F(SideActionsOrderTest, AFailedPreflightStopsTheRunWhenNothingWasPlaced) {
    EXPECT_EQ(Deploy(PlacingNothing()
                         .Preflight(kFails)
                         .Payload("resource")
                         .To("programdata", "Halvorn")
                         .File("Glow.exe", "program")),
              -2);
    EXPECT_TRUE(HasRolledBack(-2));
    EXPECT_FALSE(machine.Exists(kPlacedFile));
}

TEST_F(SideActionsOrderTest, APayloadThatPlacesNothingRunsItsPreflightsAlone) {
    EXPECT_EQ(Deploy(PlacingNothing()
                         .Preflight("echo before")
                         .RegistryEntry("", R"(SOFTWARE\Halvorn)", "a", "b", "windows")
                         .Postflight("echo after")
                         .Shortcut("Readme.txt", "", "startmenu")),
              0);
    EXPECT_TRUE(HasRun("echo before"));
    EXPECT_FALSE(HasRun("echo after"));
    EXPECT_FALSE(HasEntered("MakeRegistryEntry"));
    EXPECT_FALSE(HasEntered("MakeShortcut"));
}

TEST_F(SideActionsOrderTest, AFailedRegistryEntryUndoesTheRun) {
    EXPECT_EQ(Deploy(Placing()
                         .RegistryEntry("", R"(SOFTWARE\)" + std::string(300, 'x'), "a", "b", "windows")
                         .RegistryEntry("", R"(SOFTWARE\Halvorn)", "never", "b", "windows")
                         .Postflight("echo never")
                         .Shortcut("Glow.exe", "", "startmenu")),
              -1);
    EXPECT_TRUE(HasRolledBack(-1));
    EXPECT_FALSE(machine.Exists(kPlacedFile));
    EXPECT_EQ(log.Count(DebugLine("HV::Deploy::HV::Deploy::MakeRegistryEntry")), 1U);
    EXPECT_FALSE(HasRun("echo never"));
    EXPECT_FALSE(HasEntered("MakeShortcut"));
}

TEST_F(SideActionsOrderTest, AFailedPostflightUndoesTheRun) {
    machine.Has(kPlacedFile, "the old one");
    EXPECT_EQ(Deploy(Placing().Postflight(kFails).Postflight("echo never").Shortcut("Glow.exe", "", "startmenu")), -2);
    EXPECT_TRUE(HasRolledBack(-2));
    EXPECT_EQ(machine.Content(kPlacedFile), "the old one");
    EXPECT_FALSE(HasRun("echo never"));
    EXPECT_FALSE(HasEntered("MakeShortcut"));
}

TEST_F(SideActionsOrderTest, APostflightThatMayFailChangesNothing) {
    EXPECT_EQ(Deploy(Placing().Postflight(kFails, false).Postflight("echo after")), 1);
    EXPECT_TRUE(HasRun("echo after"));
    EXPECT_TRUE(machine.HasFile(kPlacedFile));
}

TEST_F(SideActionsOrderTest, AShortcutPointsToAFileOfItsOwnPayload) {
    EXPECT_EQ(Deploy(Placing()
                         .Payload("resource")
                         .To("programdata", "Other")
                         .File("Other.txt", "text")
                         .Shortcut("Glow.exe", "", "startmenu")),
              1);
    EXPECT_TRUE(log.Has(ErrorLine("Shortcut source path not found.")));
    EXPECT_FALSE(machine.Exists(kLink));
}

TEST_F(SideActionsOrderTest, AShortcutDoesNotPointToTheLinkMadeBeforeIt) {
    EXPECT_EQ(Deploy(Placing().Shortcut("Glow.exe", "", "startmenu").Shortcut("Glow.lnk", "", "programdata")), 1);
    EXPECT_EQ(LinkOf(machine, kLink).target, kPlacedFile);
    EXPECT_TRUE(log.Has(ErrorLine("Shortcut source path not found.")));
}

TEST_F(SideActionsOrderTest, AShortcutThatMayFailChangesNothing) {
    EXPECT_EQ(Deploy(Placing().Shortcut("None.exe", "", "startmenu").Shortcut("Glow.exe", "", "startmenu")), 1);
    EXPECT_TRUE(machine.HasFile(kLink));
    EXPECT_TRUE(machine.HasFile(kPlacedFile));
}

TEST_F(SideActionsOrderTest, AFailedShortcutOfTheLastPayloadUndoesTheRun) {
    EXPECT_EQ(Deploy(Placing().Shortcut("None.exe", "", "startmenu", "", true).Shortcut("Glow.exe", "", "startmenu")),
              -1);
    EXPECT_TRUE(HasRolledBack(-1));
    EXPECT_FALSE(machine.Exists(kPlacedFile));
    EXPECT_EQ(log.Count(DebugLine("HV::Deploy::HV::Deploy::MakeShortcut")), 1U);
}

TEST_F(SideActionsOrderTest, AFailedShortcutIsForgottenOnceAnotherPayloadIsPlaced) {
    EXPECT_EQ(Deploy(Placing()
                         .Shortcut("None.exe", "", "startmenu", "", true)
                         .Payload("resource")
                         .To("programdata", "Other")
                         .File("Other.txt", "text")),
              1);
    EXPECT_TRUE(machine.HasFile(kPlacedFile));
    EXPECT_TRUE(machine.HasFile(R"(C:\ProgramData\Other\Other.txt)"));
}

TEST_F(SideActionsOrderTest, AFailedShortcutStandsWhenTheNextPayloadPlacesNothing) {
    EXPECT_EQ(Deploy(Placing()
                         .Shortcut("None.exe", "", "startmenu", "", true)
                         .Payload("script")
                         .Deployment("run")
                         .File("Readme.txt", "text")),
              -1);
    EXPECT_TRUE(HasRolledBack(-1));
}
