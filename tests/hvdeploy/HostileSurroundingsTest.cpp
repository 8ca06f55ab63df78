// Scripts in surroundings that somebody else has prepared: the folder that they lie in, the environment, the current
// folder. The one who prepares them wants C:\planted.txt to be written.
//
// Hosted, scripts are run by /bin/sh under its full name, so these attacks fail there whatever the engine does; what
// the tests hold there is that the honest script runs. Wine's command processor looks into the current folder first,
// whatever the environment says; so the test of a program beside the release is the wizard's on that target, and what
// Windows' own command processor makes of the variable is not shown.
#include <cstdio>

#include "platform/filesystem.h"
#include "platform/win32.h"
#include "tests/hvdeploy/SideActionsTest.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/RunProgram.h"

namespace {

constexpr const char* kMark = R"(C:\planted.txt)";
constexpr const char* kPlantedProgram = "Z:" HV_PROGRAM_FOLDER "/planted_program" HV_PROGRAM_SUFFIX;

class HostileSurroundingsTest : public SideActionsTest {
protected:
    /// Runs a script that says hello from a folder of this name. Gives the engine's result.
    HV::EngineResult RunScriptIn(const std::string& folder) {
        machine.Has(folder + R"(\run.bat)", "echo hello\n");
        HV::PayloadScript script;
        script.id = "setup";
        script.source = "run.bat";
        log.Clear();
        const CapturedStreams streams;
        return engine.RunPreOrPostflight(script, HV::Package{fs::path(folder)});
    }

    void ExpectTheScriptRan() const {
        const std::vector<std::string> output = log.LinesStartingWith(DebugLine("Script output: [id: setup] \n"));
        ASSERT_EQ(output.size(), 1U) << log.Text();
        EXPECT_NE(output[0].find("hello"), std::string::npos) << output[0];
    }

    /// A package in `C:\Download\packages` whose one script runs this line.
    static void HasPackage(const std::string& line) {
        (void)PackageBuilder("com.halvorn.glow")
            .Payload("resource")
            .To("programdata", "Glow")
            .File("Glow.txt", "text")
            .Postflight(line)
            .WriteTo(R"(C:\Download\packages)");
    }
};

}  // namespace

TEST_F(HostileSurroundingsTest, ScriptsRunWhateverTheirFolderIsCalled) {
    machine.Has(R"(C:\Temp\Fish.bat)", "echo stolen>C:\\planted.txt\n");
    machine.Has(R"(C:\Temp\Fish)", "");
    int folders = 0;
    for (const char* name : {"Plain", "Fish&Chips", "Fish & Chips", "Fish(Chips)", "Fish (and Chips)", "Fish^Chips",
                             "Fish@Chips", "Fish;Chips", "Fish,Chips", "Fish=Chips", "50% Fish", "it's Fish"}) {
        EXPECT_EQ(RunScriptIn(std::string(R"(C:\Temp\)") + name), 1) << name;
        ExpectTheScriptRan();
        EXPECT_FALSE(machine.Exists(kMark)) << name;
        ++folders;
    }
    EXPECT_EQ(folders, 12);
}

TEST_F(HostileSurroundingsTest, TheLogShowsTheScriptsPathAsItIs) {
    (void)RunScriptIn(R"(C:\Temp\Fish & Chips)");
    EXPECT_TRUE(log.Has(DebugLine(R"(Running payload script: [id: setup] : 'C:\Temp\Fish & Chips\run.bat')")))
        << log.Text();
}

TEST_F(HostileSurroundingsTest, CommandsThatBeginWithAQuotedPathKeepTheirOwnQuotes) {
    machine.Has(R"(C:\Fish & Chips\run.bat)", "echo hello\n");
    HV::PayloadScript script;
    script.id = "setup";
    script.command = R"("C:\Fish & Chips\run.bat")";
    const CapturedStreams streams;
    EXPECT_EQ(engine.RunPreOrPostflight(script, HV::Package{fs::path(R"(C:\Temp)")}), 1);
    EXPECT_TRUE(log.Has(DebugLine(R"(Postflight command: "C:\Fish & Chips\run.bat")")));
    const std::vector<std::string> output = log.LinesStartingWith(DebugLine("Command output: [id: setup] \n"));
    ASSERT_EQ(output.size(), 1U);
    EXPECT_NE(output[0].find("hello"), std::string::npos) << output[0];
}

TEST_F(HostileSurroundingsTest, ACommandProcessorOfTheUsersRunsNoScript) {
    HasPackage("echo hello");
    const ProgramResult result =
        RunProgram("hvdeploy", {R"(dir=C:\Download\packages)"}, {{"COMSPEC", kPlantedProgram}});
    EXPECT_EQ(result.exitStatus, 0) << result.output;
    EXPECT_NE(result.output.find("hello"), std::string::npos) << result.output;
    EXPECT_FALSE(machine.Exists(kMark));
}
