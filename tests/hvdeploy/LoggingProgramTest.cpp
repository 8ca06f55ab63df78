// Logging as the shipped program sets it up: nobody has made the categories there.
#include <gtest/gtest.h>

#include "tests/support/Machine.h"
#include "tests/support/RunProgram.h"

namespace {

bool Has(const std::string& text, const std::string& part) {
    return text.find(part) != std::string::npos;
}

TEST(LoggingOfTheProgram, SaysEverythingOnStandardOutput) {
    const Machine machine;
    const ProgramResult result = RunProgram("hvdeploy", {"list="});
    EXPECT_EQ(result.exitStatus, 0);
    EXPECT_TRUE(Has(result.output, " DEBUG hvdeploy-detail : Parsing command-line hvdeploy args.\n")) << result.output;
    EXPECT_TRUE(Has(result.output, " INFO hvdeploy-detail : hvdeploy version 2.0-d1\n")) << result.output;
    EXPECT_EQ(result.errors, "");
}

TEST(LoggingOfTheProgram, SaysNoMoreThanTheLevel) {
    const Machine machine;
    const ProgramResult result = RunProgram("hvdeploy", {"list=packages", "loglevel=Warn"});
    EXPECT_FALSE(Has(result.output, " INFO ")) << result.output;
    EXPECT_TRUE(Has(result.output, " WARN hvdeploy-detail : ListPackages not yet implemented.\n")) << result.output;
}

TEST(LoggingOfTheProgram, WritesToTheFileWhatItPrints) {
    const Machine machine;
    const ProgramResult result = RunProgram("hvdeploy", {"list=packages", R"(log=C:\My Logs\run.log)"});
    EXPECT_EQ(result.exitStatus, 0);
    const std::string text = machine.Content(R"(C:\My Logs\run.log)");
    EXPECT_TRUE(Has(text, " DEBUG hvdeploy-detail : Parsing command-line hvdeploy args.")) << text;
    EXPECT_TRUE(Has(text, " WARN hvdeploy-detail : ListPackages not yet implemented.")) << text;
    EXPECT_TRUE(Has(result.output, " WARN hvdeploy-detail : ListPackages not yet implemented.\n")) << result.output;
}

TEST(LoggingOfTheProgram, SaysThatTheFileCannotBeOpenedAndRunsOn) {
    Machine machine;
    machine.Has(R"(C:\file)", "in the way");
    machine.HasFolder(R"(C:\folder.log)");
    int names = 0;
    for (const std::string name : {R"(C:\file\run.log)", R"(C:\folder.log)"}) {
        const ProgramResult result = RunProgram("hvdeploy", {"list=packages", "log=" + name});
        EXPECT_EQ(result.exitStatus, 0);
        EXPECT_EQ(result.errors,
                  "hvdeploy: cannot open log file " + name + "; the log goes to standard output alone\n");
        EXPECT_TRUE(Has(result.output, "ListPackages not yet implemented.\n")) << result.output;
        ++names;
    }
    EXPECT_EQ(names, 2);
    EXPECT_EQ(machine.Content(R"(C:\file)"), "in the way");
}

TEST(LoggingOfTheProgram, MakesTheFoldersOfALogThatIsNamedWithSlashes) {
    const Machine machine;
    (void)RunProgram("hvdeploy", {"list=packages", "log=C:/Logs/deep/run.log"});
    EXPECT_TRUE(Has(machine.Content(R"(C:\Logs\deep\run.log)"), "ListPackages not yet implemented."));
}

TEST(LoggingOfTheProgram, GoesOnInTheSameFile) {
    const Machine machine;
    (void)RunProgram("hvdeploy", {"list=packages", R"(log=C:\Logs\run.log)"});
    const std::string first = machine.Content(R"(C:\Logs\run.log)");
    (void)RunProgram("hvdeploy", {"list=packages", R"(log=C:\Logs\run.log)"});
    const std::string both = machine.Content(R"(C:\Logs\run.log)");
    EXPECT_EQ(both.rfind(first, 0), 0U);
    EXPECT_GT(both.size(), first.size());
}

TEST(LoggingOfTheProgram, NamesAnUnknownLevelAndRunsOn) {
    const Machine machine;
    const ProgramResult result = RunProgram("hvdeploy", {"list=hosts", "loglevel="});
    EXPECT_EQ(result.exitStatus, 0);
    EXPECT_EQ(result.errors, "unknown priority name: ''\nunknown priority name: ''\n");
    EXPECT_TRUE(Has(result.output, "\n[]\n")) << result.output;
}

TEST(LoggingOfTheProgram, TakesALogNameOf16383CharactersAndNoneLonger) {
    const Machine machine;
    // White space is trimmed away, so the name is empty and no file is made of it.
    const std::string longest(16383 - 2, ' ');
    EXPECT_EQ(RunProgram("hvdeploy", {"list=", "log=\"" + longest + "\""}).exitStatus, 0);
    const ProgramResult result = RunProgram("hvdeploy", {"list=", "log=\"" + longest + " \""});
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_EQ(result.errors, "hvdeploy: Arg value cannot be greater than 16k in length!\n");
    EXPECT_TRUE(machine.TempEntries().empty());
}

}  // namespace
