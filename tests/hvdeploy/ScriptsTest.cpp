// Pre- and postflights, one call at a time. The scripts hold only what both command processors know; the one line that
// /bin/sh does not (the switch that silences cmd) costs a message on standard error, which is held back.
#include "platform/win32.h"
#include "tests/hvdeploy/SideActionsTest.h"
#include "tests/support/CapturedStreams.h"

namespace {

constexpr const char* kExtracted = R"(C:\Extracted)";

class ScriptsTest : public SideActionsTest {
protected:
    ScriptsTest() {
        machine.HasFolder(kExtracted);
        script.id = "setup";
    }

    /// The package has this script file.
    void HasScript(const std::string& content) {
        machine.Has(R"(C:\Extracted\scripts\run.bat)", "@echo off\n" + content);
        script.source = R"(scripts\run.bat)";
    }

    HV::EngineResult Run() {
        const HV::Package package{fs::path(kExtracted)};
        log.Clear();
        const CapturedStreams streams;
        return engine.RunPreOrPostflight(script, package);
    }

    HV::PayloadScript script;
};

std::string Lines(int count, const std::string& line) {
    std::string text;
    for (int i = 0; i < count; ++i) {
        text += line + "\n";
    }
    return text;
}

}  // namespace

TEST_F(ScriptsTest, GiveNothingDoneForAnEmptyRecord) {
    EXPECT_EQ(Run(), 0);
    EXPECT_EQ(log.Lines(), std::vector<std::string>{DebugLine("HV::Deploy::HV::Deploy::RunPreOrPostflight")});
}

TEST_F(ScriptsTest, RunAFileOfThePackageAndTellAboutIt) {
    HasScript("echo hello\n");
    EXPECT_EQ(Run(), 1);
    const std::vector<std::string> expected{
        DebugLine("HV::Deploy::HV::Deploy::RunPreOrPostflight"),
        DebugLine("Running payload script: [id: setup]"),
        DebugLine(R"(Running payload script: [id: setup] : 'C:\Extracted\scripts\run.bat')"),
        DebugLine("Script output: [id: setup] \nhello\n"),
        DebugLine("Script execution succeeded"),
    };
    EXPECT_EQ(log.Lines(), expected);
}

TEST_F(ScriptsTest, RunACommandAndTellAboutIt) {
    script.command = "echo hello";
    EXPECT_EQ(Run(), 1);
    const std::vector<std::string> expected{
        DebugLine("HV::Deploy::HV::Deploy::RunPreOrPostflight"),
        DebugLine("Running postflight command: [id:setup]"),
        DebugLine("Postflight command: echo hello"),
        DebugLine("Command output: [id: setup] \nhello\n"),
        DebugLine("Script execution succeeded"),
    };
    EXPECT_EQ(log.Lines(), expected);
}

TEST_F(ScriptsTest, CallThePreflightsCommandAPostflightsToo) {
    script.command = "echo hello";
    script.isPreflight = true;
    EXPECT_EQ(Run(), 1);
    EXPECT_TRUE(log.Has(DebugLine("Running postflight command: [id:setup]")));
}

TEST_F(ScriptsTest, DoNotAskForTheSystemThatAScriptNames) {
    script.command = "echo hello";
    script.os = "mac";
    EXPECT_EQ(Run(), 1);
}

TEST_F(ScriptsTest, HandTheCommandOverAsItStands) {
    script.command = "echo \"two  words\"";
    EXPECT_EQ(Run(), 1);
    const std::vector<std::string> output = log.LinesStartingWith(DebugLine("Command output: "));
    ASSERT_EQ(output.size(), 1U);
    // cmd prints the quotes, which it hands to echo as they stand; the shell takes them off.
    EXPECT_NE(output[0].find("two  words"), std::string::npos) << output[0];
}

TEST_F(ScriptsTest, CountCodesBelow256AsSuccess) {
    int seen = 0;
    for (const int code : {1, 3, 255}) {
        HasScript("exit " + std::to_string(code) + "\n");
        EXPECT_EQ(Run(), 1) << code;
        EXPECT_TRUE(log.Has(DebugLine("Script execution succeeded")));
        ++seen;
    }
    EXPECT_EQ(seen, 3);
}

TEST_F(ScriptsTest, CountCodesBelow256OfACommandAsSuccess) {
    script.command = "exit 3";
    EXPECT_EQ(Run(), 1);
    EXPECT_TRUE(log.Has(DebugLine("Script execution succeeded")));
}

TEST_F(ScriptsTest, ReadTheCodeDividedBy256) {
    HasScript("exit 512\n");
    EXPECT_EQ(Run(), -2);
    EXPECT_EQ(log.Lines().back(), ErrorLine("script returned 2"));
    HasScript("exit 256\n");
    EXPECT_EQ(Run(), -2);
    EXPECT_EQ(log.Lines().back(), ErrorLine("script returned 1"));
}

TEST_F(ScriptsTest, DoNotRunTheCommandAfterAFailedScript) {
    HasScript("exit 512\n");
    script.command = "echo hello";
    EXPECT_EQ(Run(), -2);
    EXPECT_TRUE(log.LinesStartingWith(DebugLine("Running postflight command")).empty());
}

TEST_F(ScriptsTest, GoOnToTheCommandAfterAScriptThatMayFail) {
    HasScript("exit 512\n");
    script.command = "echo hello";
    script.failOnError = false;
    EXPECT_EQ(Run(), 1);
    EXPECT_TRUE(log.Has(WarnLine("setup execution returned 2. Continuing")));
    EXPECT_TRUE(log.Has(DebugLine("Command output: [id: setup] \nhello\n")));
}

TEST_F(ScriptsTest, GiveNothingDoneWhenAScriptMayFailAndDoes) {
    HasScript("exit 512\n");
    script.failOnError = false;
    EXPECT_EQ(Run(), 0);
    EXPECT_EQ(log.Lines().back(), WarnLine("setup execution returned 2. Continuing"));
}

TEST_F(ScriptsTest, FailWithTheirCommand) {
    script.command = "exit 512";
    EXPECT_EQ(Run(), -2);
    EXPECT_EQ(log.Lines().back(), ErrorLine("command returned 2"));
}

TEST_F(ScriptsTest, FailWithTheCommandAfterAScriptThatSucceeded) {
    HasScript("echo hello\n");
    script.command = "exit 512";
    EXPECT_EQ(Run(), -2);
    EXPECT_TRUE(log.Has(DebugLine("Script execution succeeded")));
}

TEST_F(ScriptsTest, KeepTheScriptsSuccessWhenTheCommandMayFail) {
    HasScript("echo hello\n");
    script.command = "exit 512";
    script.failOnError = false;
    EXPECT_EQ(Run(), 1);
    EXPECT_EQ(log.Lines().back(), WarnLine("setup execution returned 2. Continuing"));
}

TEST_F(ScriptsTest, GiveNothingDoneWhenACommandMayFailAndDoes) {
    script.command = "exit 512";
    script.failOnError = false;
    EXPECT_EQ(Run(), 0);
}

TEST_F(ScriptsTest, ThatDoNotExistFareAsTheCommandProcessorsOwnCodeSays) {
    script.source = "none.bat";
    int code = 0;
    {
        const CapturedStreams streams;
        code = _pclose(_popen(R"("C:\Extracted\none.bat")", "r"));
    }
    EXPECT_NE(code, 0);
    // Where that code is below 256, as it mostly is, not even a script that is missing fails the run.
    EXPECT_EQ(Run(), code / 256 == 0 ? 1 : -2);
    EXPECT_TRUE(log.Has(DebugLine("Script output: [id: setup] \n")));
}

TEST_F(ScriptsTest, MayPrintNothing) {
    HasScript("");
    EXPECT_EQ(Run(), 1);
    EXPECT_TRUE(log.Has(DebugLine("Script output: [id: setup] \n")));
}

TEST_F(ScriptsTest, MayPrintMegabytes) {
    const std::string line(1000, 'x');
    HasScript(Lines(2000, "echo " + line));
    EXPECT_EQ(Run(), 1);
    EXPECT_TRUE(log.Has(DebugLine("Script output: [id: setup] \n" + Lines(2000, line))));
}

TEST_F(ScriptsTest, StartTheCommandsOutputAfresh) {
    HasScript("echo one\n");
    script.command = "echo two";
    EXPECT_EQ(Run(), 1);
    EXPECT_TRUE(log.Has(DebugLine("Script output: [id: setup] \none\n")));
    EXPECT_TRUE(log.Has(DebugLine("Command output: [id: setup] \ntwo\n")));
}

TEST_F(ScriptsTest, LeaveStandardErrorToTheProgramsOwn) {
    script.command = "echo trouble>&2";
    std::string errors;
    {
        CapturedStreams streams;
        (void)engine.RunPreOrPostflight(script, HV::Package{fs::path(kExtracted)});
        errors = streams.Errors();
    }
    EXPECT_EQ(errors, "trouble\n");
    EXPECT_TRUE(log.Has(DebugLine("Command output: [id: setup] \n")));
}
