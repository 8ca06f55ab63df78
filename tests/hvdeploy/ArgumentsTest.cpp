// What becomes of a line and of its arguments, before anything runs.
#include "tests/hvdeploy/CommandLineTest.h"

namespace {

class ArgumentsTest : public CommandLineTest {};

TEST_F(ArgumentsTest, FailsABlankLineWithoutAWord) {
    log.Clear();
    CapturedStreams streams;
    EXPECT_EQ(cli.ParseLine(" \t\n\v\f\r"), -1);
    EXPECT_EQ(streams.Output() + streams.Errors(), "");
    EXPECT_EQ(log.Text(), "");
}

TEST_F(ArgumentsTest, SaysThatDoubleQuotesAreUnbalanced) {
    log.Clear();
    CapturedStreams streams;
    EXPECT_EQ(cli.ParseLine("dir=\"C:\\a"), -1);
    EXPECT_EQ(streams.Errors(), "Line parsing error: unbalanced double quotes.\n");
    EXPECT_EQ(streams.Output(), "");
    EXPECT_EQ(log.Text(), "");
}

TEST_F(ArgumentsTest, SaysThatItParses) {
    EXPECT_EQ(cli.ParseLine("--verbose"), 0);
    EXPECT_TRUE(log.Has(DebugLine("Parsing command-line hvdeploy args.")));
}

TEST_F(ArgumentsTest, TakesEveryKeyOfTheTable) {
    int taken = 0;
    for (const char* key :
         {"file=", "dir=", "rollback=", "skip=", "manifest=", "uninstall=", "list=", "update=", "log=", "loglevel="}) {
        EXPECT_FALSE(cli.CountArg(key));
        EXPECT_EQ(cli.ParseArg((std::string(key) + "value").c_str()), 0) << key;
        EXPECT_TRUE(cli.CountArg(key)) << key;
        EXPECT_EQ(cli.GetArg(key), "value") << key;
        ++taken;
    }
    EXPECT_EQ(taken, 10);
}

TEST_F(ArgumentsTest, TakesEveryFlagOfTheTableInOrder) {
    const std::vector<std::string> flags{"--about", "--verbose", "--version", "--legacyuninstall", "--error"};
    for (const std::string& flag : flags) {
        EXPECT_EQ(cli.ParseArg(flag.c_str()), 0) << flag;
    }
    EXPECT_EQ(cli.Flags(), flags);
}

TEST_F(ArgumentsTest, KeepsARepeatedFlagTwice) {
    EXPECT_EQ(cli.ParseLine("--about --verbose --about"), 0);
    EXPECT_EQ(cli.Flags(), (std::vector<std::string>{"--about", "--verbose", "--about"}));
}

TEST_F(ArgumentsTest, KeepsTheLastOfARepeatedKey) {
    EXPECT_EQ(cli.ParseLine("log=one dir=a log=two"), 0);
    EXPECT_EQ(cli.GetArg("log="), "two");
}

TEST_F(ArgumentsTest, KeepsTheValueAfterTheFirstEqualsSignWithItsQuotes) {
    EXPECT_EQ(cli.ParseLine("file=\"C:\\a=b c.zip\""), 0);
    EXPECT_EQ(cli.GetArg("file="), "\"C:\\a=b c.zip\"");
}

TEST_F(ArgumentsTest, GivesAnEmptyTextForAnAbsentKey) {
    EXPECT_EQ(cli.GetArg("file="), "");
    EXPECT_FALSE(cli.CountArg("file="));
}

TEST_F(ArgumentsTest, TellsAnEmptyValueFromAnAbsentKey) {
    EXPECT_EQ(cli.ParseLine("file="), 0);
    EXPECT_TRUE(cli.CountArg("file="));
    EXPECT_EQ(cli.GetArg("file="), "");
}

TEST_F(ArgumentsTest, RefusesWhatIsInNoTable) {
    int refused = 0;
    for (const char* argument :
         {"--Verbose", "--VERBOSE", "--verbose=1", "--help",    "help=", "help=me", "DIR=x",  "dir",
          "=",         "",          "x=dir=",      "force",     "newer", "only",    "ignore", "enabled",
          "disabled",  "submit",    "-verbose",    "--verbose "}) {
        log.Clear();
        EXPECT_EQ(cli.ParseArg(argument), -1) << argument;
        EXPECT_TRUE(log.Has(ErrorLine("unsupported argument: " + std::string(argument)))) << log.Text();
        ++refused;
    }
    EXPECT_EQ(refused, 20);
    EXPECT_TRUE(cli.Flags().empty());
}

TEST_F(ArgumentsTest, RefusesANullPointer) {
    EXPECT_EQ(cli.ParseArg(nullptr), -1);
    EXPECT_TRUE(log.Has(ErrorLine("NULL arg passed to ParseArg")));
}

TEST_F(ArgumentsTest, StopsAtTheFirstBadArgument) {
    EXPECT_EQ(cli.ParseLine("dir=a --verbose --error help=me log=b"), -1);
    EXPECT_TRUE(log.Has(ErrorLine("ParseArg() failed with error -1 for arg: help=me")));
    EXPECT_TRUE(log.Has(DebugLine("ParseArgs() is returning false.")));
    EXPECT_TRUE(cli.CountArg("dir="));
    EXPECT_FALSE(cli.CountArg("log="));
}

TEST_F(ArgumentsTest, TakesNoErrorFlagFromALineThatIsNotGoodToItsEnd) {
    (void)Product("glow").WriteTo(R"(C:\Packages)");
    EXPECT_EQ(cli.ParseLine(R"(dir=C:\Packages --error help=me)"), -1);
    EXPECT_EQ(cli.Run(), 0) << log.Text();
    EXPECT_TRUE(machine.Exists(PlaceOf("glow")));
}

TEST_F(ArgumentsTest, StopsAtANullArgument) {
    const char* const arguments[] = {"./hvdeploy", nullptr, "--verbose"};
    EXPECT_EQ(cli.ParseArgs(3, arguments), -1);
    EXPECT_TRUE(log.Has(ErrorLine("ParseArg() failed with error -1 for arg: ")));
    EXPECT_TRUE(cli.Flags().empty());
}

TEST_F(ArgumentsTest, ParsesNoArgumentsAtAll) {
    EXPECT_EQ(cli.ParseArgs(0, nullptr), 0);
    EXPECT_TRUE(cli.Flags().empty());
}

TEST_F(ArgumentsTest, OnlyStoresTheLogFileWhenLoggingIsSetUpAlready) {
    EXPECT_EQ(cli.ParseLine(R"(log=C:\Logs\run.log loglevel=crit)"), 0);
    EXPECT_EQ(cli.GetArg("log="), R"(C:\Logs\run.log)");
    EXPECT_EQ(cli.GetArg("loglevel="), "crit");
    EXPECT_FALSE(machine.Exists(R"(C:\Logs)"));
    EXPECT_TRUE(log.Has(DebugLine("Parsing command-line hvdeploy args."))) << "the priority was changed";
}

TEST_F(ArgumentsTest, TakesALogNameOfAnyLengthWhenLoggingIsSetUpAlready) {
    EXPECT_EQ(cli.ParseLine("log=" + std::string(16384, 'a')), 0);
}

TEST(ErrorCodeFromText, ReadsTheNumberOfAnErrorText) {
    EXPECT_EQ(HV::ErrorCodeFromText("ERROR(42)"), 42);
    EXPECT_EQ(HV::ErrorCodeFromText("ERROR(-7) in a script"), -7);
    EXPECT_EQ(HV::ErrorCodeFromText("ERROR(12 apples)"), 12);
}

TEST(ErrorCodeFromText, IsTheNearestCodeForANumberThatNoneCanHold) {
    EXPECT_EQ(HV::ErrorCodeFromText("ERROR(4294967296)"), 2147483647);
    EXPECT_EQ(HV::ErrorCodeFromText("ERROR(99999999999999999999999)"), 2147483647);
    EXPECT_EQ(HV::ErrorCodeFromText("ERROR(-4294967296)"), -2147483647 - 1);
    EXPECT_EQ(HV::ErrorCodeFromText("ERROR(2147483647)"), 2147483647);
}

TEST(ErrorCodeFromText, IsMinusOneForAnEmptyText) {
    EXPECT_EQ(HV::ErrorCodeFromText(""), -1);
}

TEST(ErrorCodeFromText, IsMinusOneWithoutAnyOfItsCharacters) {
    EXPECT_EQ(HV::ErrorCodeFromText("something went wrong 12)"), -1);
}

TEST(ErrorCodeFromText, IsMinusOneWhenTheTextEndsBeforeTheNumber) {
    EXPECT_EQ(HV::ErrorCodeFromText("ERROR("), -1);
    EXPECT_EQ(HV::ErrorCodeFromText("E"), -1);
    EXPECT_EQ(HV::ErrorCodeFromText("any ("), -1);
}

TEST(ErrorCodeFromText, IsMinusOneWithoutAClosingParenthesis) {
    EXPECT_EQ(HV::ErrorCodeFromText("ERROR(42"), -1);
    // One before the number closes nothing.
    EXPECT_EQ(HV::ErrorCodeFromText("a) ERROR(42"), -1);
}

TEST(ErrorCodeFromText, IsZeroWhereNoNumberBegins) {
    EXPECT_EQ(HV::ErrorCodeFromText("ERROR(x1)"), 0);
    EXPECT_EQ(HV::ErrorCodeFromText("ERROR()"), 0);
}

TEST(ErrorCodeFromText, SearchesForCharactersAndNotForTheWord) {
    // The O stands first, and the number six characters further on.
    EXPECT_EQ(HV::ErrorCodeFromText("On the31)"), 31);
    EXPECT_EQ(HV::ErrorCodeFromText("Read: 8)"), 8);
    EXPECT_EQ(HV::ErrorCodeFromText("(12345678)"), 678);
}

}  // namespace
