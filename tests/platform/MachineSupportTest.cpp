// What tests themselves rely on: the machine of a test, the recorder of log lines, the capture of streams.

#include <gtest/gtest-spi.h>
#include <gtest/gtest.h>

#include <cstdio>
#include <iostream>

#include "hvframework/Log.h"
#include "platform/filesystem.h"
#include "platform/win32.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"
#include "tests/support/RunProgram.h"

namespace {

using Files = std::map<std::string, std::string>;

TEST(MachineOfATest, IsFreshWithNothingAdded) {
    const Machine machine;
    EXPECT_EQ(machine.Files(), Files());
    EXPECT_EQ(machine.Registry(), "REGEDIT4\n");
    EXPECT_TRUE(machine.TempEntries().empty());
}

TEST(MachineOfATest, ShowsWhatWasAdded) {
    Machine machine;
    machine.Has(R"(C:\Program Files\Halvorn\Glow.aex)", std::string("a\r\nb\0c", 6));
    machine.HasFolder(R"(C:\Users\Public\Documents\Empty)");
    const Files expected = {{R"(C:\Program Files\Halvorn\)", ""},
                            {R"(C:\Program Files\Halvorn\Glow.aex)", std::string("a\r\nb\0c", 6)},
                            {R"(C:\Users\Public\Documents\Empty\)", ""}};
    EXPECT_EQ(machine.Files(), expected);
    const Files filesOnly = {{R"(C:\Program Files\Halvorn\Glow.aex)", std::string("a\r\nb\0c", 6)}};
    EXPECT_EQ(machine.FilesWithoutFolders(), filesOnly);
}

TEST(MachineOfATest, ShowsWhatTheLogicAdds) {
    Machine machine;
    ASSERT_TRUE(fs::create_directories(fs::path(R"(C:\Program Files (x86)\Halvorn\Deep)")));
    const Files expected = {{R"(C:\Program Files (x86)\Halvorn\)", ""},
                            {R"(C:\Program Files (x86)\Halvorn\Deep\)", ""}};
    EXPECT_EQ(machine.Files(), expected);
}

TEST(MachineOfATest, IsClearedForTheNext) {
    {
        Machine machine;
        machine.Has(R"(C:\Windows\System32\new.dll)", "x");
        machine.HasReadOnly(R"(C:\ProgramData\Deep\er\file)", "x");
        machine.Has(machine.TempFolder() + R"(\folder\file)", "x");
        machine.Loads("REGEDIT4\n[HKEY_LOCAL_MACHINE\\Software\\Halvorn\\Sub]\n\"a\"=\"b\"\n");
        machine.Loads("REGEDIT4\n[HKEY_CLASSES_ROOT\\.hvtest]\n@=\"x\"\n");
        EXPECT_NE(machine.Registry().find("[HKEY_LOCAL_MACHINE\\SOFTWARE\\Classes\\.hvtest]\n@=\"x\""),
                  std::string::npos);
        EXPECT_EQ(machine.Files().size(), 4u);
        EXPECT_EQ(machine.TempEntries(), std::vector<std::string>{"folder"});
    }
    const Machine machine;
    EXPECT_EQ(machine.Files(), Files());
    EXPECT_EQ(machine.Registry(), "REGEDIT4\n");
    EXPECT_TRUE(machine.TempEntries().empty());
}

TEST(MachineOfATest, LeavesLogsOut) {
    Machine machine;
    machine.Has(R"(C:\ProgramData\Halvorn\Logs\Suite.log)", "x");
    machine.Has(R"(C:\ProgramData\Halvorn\Logs\Suite.log.1)", "x");
    machine.Has(R"(C:\ProgramData\Halvorn\Logs\other.txt)", "x");
    const Files expected = {{R"(C:\ProgramData\Halvorn\Logs\other.txt)", "x"}};
    EXPECT_EQ(machine.FilesWithoutFolders(), expected);
}

TEST(MachineOfATest, ShowsItsRegistryAsText) {
    Machine machine;
    machine.Loads(
        "REGEDIT4\n"
        "[HKEY_LOCAL_MACHINE\\Software\\Halvorn\\b]\n\"z\"=dword:00000001\n\"A\"=\"x\\\\y\"\n@=\"d\"\n"
        "[HKEY_LOCAL_MACHINE\\Software\\Halvorn\\a]\n"
        "[HKEY_CURRENT_USER\\Environment]\n\"HV\"=hex(2):25,00\n");
    EXPECT_EQ(machine.Registry(),
              "REGEDIT4\n\n"
              "[HKEY_CURRENT_USER\\Environment]\n\"HV\"=hex(2):25,00\n\n"
              "[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn\\a]\n\n"
              "[HKEY_LOCAL_MACHINE\\SOFTWARE\\Halvorn\\b]\n@=\"d\"\n\"A\"=\"x\\\\y\"\n\"z\"=dword:00000001\n");
}

TEST(MachineOfATest, LoadsDeletionsToo) {
    Machine machine;
    machine.Loads(
        "REGEDIT4\n[HKEY_CURRENT_USER\\Software\\Halvorn\\a]\n\"x\"=\"1\"\n\"y\"=\"2\"\n"
        "[HKEY_CURRENT_USER\\Software\\Halvorn\\b]\n");
    machine.Loads(
        "REGEDIT4\n[HKEY_CURRENT_USER\\Software\\Halvorn\\a]\n\"x\"=-\n[-HKEY_CURRENT_USER\\Software\\Halvorn\\b]\n");
    EXPECT_EQ(machine.Registry(), "REGEDIT4\n\n[HKEY_CURRENT_USER\\Software\\Halvorn\\a]\n\"y\"=\"2\"\n");
}

TEST(MachineOfATest, FailsATestWhoseRegistryTextCannotBeRead) {
    EXPECT_NONFATAL_FAILURE(
        {
            Machine machine;
            machine.Loads("REGEDIT4\nwords\n");
        },
        "line 2 of the registry text");
}

TEST(MachineOfATest, FailsATestThatAsksForAMissingFile) {
    EXPECT_NONFATAL_FAILURE(
        {
            const Machine machine;
            EXPECT_EQ(machine.Content(R"(C:\missing)"), "");
        },
        R"(there is no file C:\missing)");
}

TEST(LogRecorderOfATest, CollectsTheLinesOfBothCategories) {
    LogRecorder log;
    HVL_LOG(Debug, "one " << 1);
    HVL_LOG_TO(HVL::Log::General(), Error, "two");
    HVL_LOG(Debug, "one " << 1);
    EXPECT_EQ(log.Text(), "DEBUG hvdeploy-detail: one 1\nERROR halvorn: two\nDEBUG hvdeploy-detail: one 1\n");
    EXPECT_TRUE(log.Has("ERROR halvorn: two"));
    EXPECT_FALSE(log.Has("ERROR halvorn: three"));
    EXPECT_EQ(log.Count("DEBUG hvdeploy-detail: one 1"), 2u);
    EXPECT_EQ(log.LinesStartingWith("DEBUG").size(), 2u);
    log.Clear();
    EXPECT_TRUE(log.Lines().empty());
}

TEST(LogRecorderOfATest, PutsThePrioritiesBack) {
    HVL::Log::Detail().setPriority(log4cpp::Priority::ERROR);
    {
        const LogRecorder log;
        EXPECT_EQ(HVL::Log::Detail().getPriority(), log4cpp::Priority::DEBUG);
    }
    EXPECT_EQ(HVL::Log::Detail().getPriority(), log4cpp::Priority::ERROR);
    EXPECT_TRUE(HVL::Log::Detail().getAllAppenders().empty());
}

TEST(CapturedStreamsOfATest, HoldBackWhatIsWritten) {
    CapturedStreams streams;
    std::printf("one\n");
    std::cout << "two\r\n";
    std::fprintf(stderr, "three\n");
    std::cerr << "four";
    EXPECT_EQ(streams.Output(), "one\ntwo\n");
    EXPECT_EQ(streams.Errors(), "three\nfour");
    std::printf("five\n");
    EXPECT_EQ(streams.Output(), "one\ntwo\nfive\n");
}

TEST(CapturedStreamsOfATest, LeaveNothingOnTheMachine) {
    const Machine machine;
    CapturedStreams streams;
    std::printf("text\n");
    EXPECT_EQ(streams.Output(), "text\n");
    EXPECT_EQ(machine.Files(), Files());
    EXPECT_TRUE(machine.TempEntries().empty());
}

TEST(RunProgramOfATest, GivesStreamsAndExitStatus) {
    const Machine machine;
    const ProgramResult result = RunProgram("program_for_tests", {"a b", R"(c"d\)", "", "7"}, {{"HV_TEST", "value"}});
    EXPECT_EQ(result.output, "[a b]\n[c\"d\\]\n[]\n[7]\nvalue\n");
    EXPECT_EQ(result.errors, "to standard error\n");
    EXPECT_EQ(result.exitStatus, 7);
}

TEST(RunProgramOfATest, SharesTheMachineWithTheTest) {
    Machine machine;
    machine.Loads("REGEDIT4\n[HKEY_CURRENT_USER\\Software\\Halvorn]\n\"before\"=\"1\"\n");
    EXPECT_EQ(RunProgram("program_for_tests", {"--change", "0"}, {}).exitStatus, 0);
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\made.txt)"), "made");
    EXPECT_EQ(machine.Registry(),
              "REGEDIT4\n\n[HKEY_CURRENT_USER\\Software\\Halvorn]\n\"after\"=\"1\"\n\"before\"=\"1\"\n");
}

TEST(RunProgramOfATest, FailsATestWhoseProgramIsMissing) {
    EXPECT_NONFATAL_FAILURE(
        {
            const Machine machine;
            EXPECT_EQ(RunProgram("no_such_program", {}).exitStatus, -1);
        },
        "no_such_program");
}

}  // namespace
