// The line that the wizard gives the engine: its text, and what the engine reads in it.
#include "installer/InstallLine.h"

#include <gtest/gtest.h>

#include "hvdeploy/src/HVDeployCLI.h"
#include "tests/support/CapturedStreams.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"

namespace {

HV::InstallRequest Request() {
    return {{}, R"(C:\ProgramData\Halvorn\logs\com.halvorn.tessaly-suite-)", 1700000000, R"(C:\Installer\packages)"};
}

TEST(InstallLine, NamesNothingToSkipWhenEverythingIsChosen) {
    EXPECT_EQ(HV::InstallLine(Request()),
              R"(--verbose log="C:\ProgramData\Halvorn\logs\com.halvorn.tessaly-suite-1700000000-log.txt" )"
              R"(--legacyuninstall dir="C:\Installer\packages")");
}

TEST(InstallLine, NamesWhatIsSkippedInOrder) {
    HV::InstallRequest request = Request();
    request.skippedIdentifiers = {"com.halvorn.keyer", "com.halvorn.glow", "com.halvorn.blur"};
    EXPECT_EQ(HV::InstallLine(request),
              R"(--verbose skip="com.halvorn.keyer,com.halvorn.glow,com.halvorn.blur" )"
              R"(log="C:\ProgramData\Halvorn\logs\com.halvorn.tessaly-suite-1700000000-log.txt" )"
              R"(--legacyuninstall dir="C:\Installer\packages")");
}

TEST(InstallLine, NamesASingleProductToSkipWithoutAComma) {
    EXPECT_EQ(HV::InstallLine({{"com.halvorn.glow"}, "p-", 0, "d"}),
              R"(--verbose skip="com.halvorn.glow" log="p-0-log.txt" --legacyuninstall dir="d")");
}

/// What the engine reads.
class InstallLineReading : public testing::Test {
protected:
    int Parse(const HV::InstallRequest& request) { return cli.ParseLine(HV::InstallLine(request)); }

    Machine machine;
    LogRecorder log;
    HV::DeployCLI cli{nullptr};
};

TEST_F(InstallLineReading, FindsEveryArgument) {
    HV::InstallRequest request = Request();
    request.skippedIdentifiers = {"com.halvorn.keyer", "com.halvorn.glow"};
    ASSERT_EQ(Parse(request), 0) << log.Text();
    EXPECT_EQ(cli.Flags(), (std::vector<std::string>{"--verbose", "--legacyuninstall"}));
    EXPECT_EQ(cli.GetArg("skip="), R"("com.halvorn.keyer,com.halvorn.glow")");
    EXPECT_EQ(cli.GetArg("log="), R"("C:\ProgramData\Halvorn\logs\com.halvorn.tessaly-suite-1700000000-log.txt")");
    EXPECT_EQ(cli.GetArg("dir="), R"("C:\Installer\packages")");
}

TEST_F(InstallLineReading, FindsNoListWhereNothingIsSkipped) {
    ASSERT_EQ(Parse(Request()), 0);
    EXPECT_FALSE(cli.CountArg("skip="));
}

TEST_F(InstallLineReading, TakesTheFolderAsItIsCalled) {
    const std::vector<std::string> folders = {
        R"(C:\Users\Ann Lee\My Downloads\packages)",
        R"(C:\one,two, three\packages)",
        R"(C:\Ann's folder\packages)",
        R"(C:\Ann's and Bob's folder\packages)",
        R"(C:\a 'quoted folder' here\packages)",
        R"(C:\dir=C:\packages)",
        R"(C:\--verbose & (x86) %Temp% ; ^!\packages)",
        std::string("C:\\\xC3\x9C") + "bung \xE6\x97\xA5\xE6\x9C\xAC\\packages",
        R"(C:\  two  blanks  \packages)",
        "D:\\packages",
    };
    int read = 0;
    for (const std::string& folder : folders) {
        HV::DeployCLI fresh(nullptr);
        HV::InstallRequest request = Request();
        request.packagesDirectory = folder;
        EXPECT_EQ(fresh.ParseLine(HV::InstallLine(request)), 0) << folder;
        EXPECT_EQ(fresh.GetArg("dir="), '"' + folder + '"');
        EXPECT_EQ(fresh.Flags().size(), 2U) << folder;
        ++read;
    }
    EXPECT_EQ(read, 10);
}

TEST_F(InstallLineReading, LosesTheFolderBetweenTwoLoneApostrophes) {
    // They pair up across the arguments and hide the quotes between them. No suite's identifier has an apostrophe.
    HV::InstallRequest request = Request();
    request.logPathPrefix = R"(C:\ProgramData\Halvorn\logs\ann's-suite-)";
    request.packagesDirectory = R"(C:\Bob's\packages)";
    EXPECT_EQ(Parse(request), 0);
    EXPECT_FALSE(cli.CountArg("dir="));
}

TEST_F(InstallLineReading, RefusesALoneDoubleQuote) {
    HV::InstallRequest request = Request();
    request.skippedIdentifiers = {"com.halvorn.\"glow"};
    const CapturedStreams streams;
    EXPECT_EQ(Parse(request), -1);
}

}  // namespace
