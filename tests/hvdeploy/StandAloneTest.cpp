// The stand-alone program: the line that its arguments make, what it gives back, and its bar.
#include "hvdeploy/src/StandAlone.h"

#include <gtest/gtest.h>

#include <boost/thread/thread.hpp>
#include <sstream>

#include "hvdeploy/src/ProgressBar.h"
#include "platform/filesystem.h"
#include "tests/hvdeploy/TerminalPicture.h"
#include "tests/support/Machine.h"
#include "tests/support/PackageBuilder.h"
#include "tests/support/RunProgram.h"

namespace {

using HV::LineFromArguments;

TEST(LineFromArguments, JoinsByABlank) {
    EXPECT_EQ(LineFromArguments({}), "");
    EXPECT_EQ(LineFromArguments({"--verbose"}), "--verbose");
    EXPECT_EQ(LineFromArguments({"--verbose", "dir=a", "log=b"}), "--verbose dir=a log=b");
}

TEST(LineFromArguments, QuotesAValueWithWhiteSpaceAfterItsFirstEqualsSign) {
    EXPECT_EQ(LineFromArguments({R"(dir=C:\a b=c d)", "--about"}), R"(dir="C:\a b=c d" --about)");
}

TEST(LineFromArguments, QuotesForEveryKindOfWhiteSpace) {
    int quoted = 0;
    for (const char white : {' ', '\t', '\n', '\v', '\f', '\r'}) {
        const std::string value = std::string("a") + white + "b";
        EXPECT_EQ(LineFromArguments({"dir=" + value}), "dir=\"" + value + "\"");
        ++quoted;
    }
    EXPECT_EQ(quoted, 6);
}

TEST(LineFromArguments, QuotesAnArgumentWithoutAnEqualsSignAsAWhole) {
    EXPECT_EQ(LineFromArguments({"a b"}), "\"a b\"");
}

TEST(LineFromArguments, LeavesAnArgumentAloneThatIsQuotedAlready) {
    EXPECT_EQ(LineFromArguments({"dir=\"a b\"", "skip='a b'", "skip='a", "b'"}), "dir=\"a b\" skip='a b' skip='a b'");
}

TEST(LineFromArguments, QuotesABlankBesideAnApostrophe) {
    EXPECT_EQ(LineFromArguments({R"(dir=C:\Bob's Packs)"}), R"(dir="C:\Bob's Packs")");
    EXPECT_EQ(LineFromArguments({R"(dir=C:\Bob's and Al's Packs)"}), R"(dir="C:\Bob's and Al's Packs")");
}

TEST(LineFromArguments, KeepsAnEmptyArgumentAsABlank) {
    EXPECT_EQ(LineFromArguments({"--about", "", "--verbose"}), "--about  --verbose");
}

constexpr const char* kBadArguments = "hvdeploy: bad arguments; run hvdeploy without any to see its options\n";

PackageBuilder Product(const std::string& name) {
    return PackageBuilder("com.halvorn." + name)
        .Payload("resource")
        .To("programdata", "Halvorn")
        .File(name + ".txt", "text of " + name);
}

PackageBuilder Glow() {
    return PackageBuilder("com.halvorn.glow").Payload("resource").To("programdata", "Halvorn").File("Glow.txt", "new");
}

TEST(StandAlone, ExplainsItselfWithoutArguments) {
    const Machine machine;
    const ProgramResult result = RunProgram("hvdeploy", {});
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(result.errors.rfind("usage: hvdeploy dir=FOLDER", 0), 0U) << result.errors;
    int named = 0;
    for (const char* option : {"dir=", "file=", "skip=", "log=", "loglevel=", "list=hosts", "list=installed",
                               "--verbose", "--about", "--version", "--legacyuninstall", "--error"}) {
        EXPECT_NE(result.errors.find(option), std::string::npos) << option;
        ++named;
    }
    EXPECT_EQ(named, 12);
    EXPECT_NE(result.errors.find("(default: the folder \"packages\" in the current folder)\n"), std::string::npos);
    EXPECT_TRUE(machine.TempEntries().empty());
}

TEST(StandAlone, FailsForABlankLine) {
    const Machine machine;
    const ProgramResult result = RunProgram("hvdeploy", {""});
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(result.errors, kBadArguments);
}

TEST(StandAlone, FailsForUnbalancedQuotes) {
    const Machine machine;
    const ProgramResult result = RunProgram("hvdeploy", {"dir=\"a"});
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_EQ(result.errors, std::string("Line parsing error: unbalanced double quotes.\n") + kBadArguments);
}

TEST(StandAlone, FailsForABadArgument) {
    const Machine machine;
    const ProgramResult result = RunProgram("hvdeploy", {"help="});
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_NE(result.output.find(" ERROR hvdeploy-detail : unsupported argument: help=\n"), std::string::npos);
}

TEST(StandAlone, TellsWhereItsOptionsAreForEveryBadArgument) {
    const Machine machine;
    int told = 0;
    for (const char* word : {"--help", "/?", "--verbos", "dri=C:\\Packages", "list", "C:\\My Packages"}) {
        const ProgramResult result = RunProgram("hvdeploy", {word, "loglevel=emerg"});
        EXPECT_EQ(result.exitStatus, 1) << word;
        EXPECT_EQ(result.output, "") << word;
        EXPECT_EQ(result.errors, kBadArguments) << word;
        ++told;
    }
    EXPECT_EQ(told, 6);
}

TEST(StandAlone, FailsForARunThatFails) {
    const Machine machine;
    const ProgramResult result = RunProgram("hvdeploy", {R"(dir=C:\Nothing)"});
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_EQ(result.errors, "hvdeploy: failed; nothing was installed\n");
}

TEST(StandAlone, InstallsFromAFolderWithABlankInItsName) {
    const Machine machine;
    (void)Glow().WriteTo(R"(C:\My Packages)");
    const ProgramResult result = RunProgram("hvdeploy", {R"(dir=C:\My Packages)"});
    EXPECT_EQ(result.exitStatus, 0) << result.output;
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\Glow.txt)"), "new");
}

TEST(StandAlone, TakesApostrophesAndBlanksAsTheyStandInEveryValue) {
    const Machine machine;
    const std::string folder = R"(C:\Bob's Packs)";
    (void)Glow().WriteTo(folder);
    (void)Product("flare").Named("Al's flare.hvpkg").WriteTo(folder);
    const ProgramResult result =
        RunProgram("hvdeploy", {"dir=" + folder, R"(log=C:\Cy's Logs\Dee's run.log)", "skip=Al's flare.hvpkg"});
    EXPECT_EQ(result.exitStatus, 0) << result.output;
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\Glow.txt)"), "new");
    EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Halvorn\flare.txt)"));
    EXPECT_NE(machine.Content(R"(C:\Cy's Logs\Dee's run.log)").find("Installation complete."), std::string::npos);
    EXPECT_EQ(RunProgram("hvdeploy", {"file=" + folder + R"(\Al's flare.hvpkg)"}).exitStatus, 0);
    EXPECT_TRUE(machine.Exists(R"(C:\ProgramData\Halvorn\flare.txt)"));
}

TEST(StandAlone, PairsQuotesThatWereTypedAcrossArguments) {
    const Machine machine;
    (void)Glow().Named("my glow.hvpkg").WriteTo(R"(C:\Packages)");
    const ProgramResult result = RunProgram("hvdeploy", {R"(dir=C:\Packages)", "skip='my", "glow.hvpkg'"});
    EXPECT_EQ(result.exitStatus, 0) << result.output;
    EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Halvorn\Glow.txt)"));
}

/// The last word of a run on a fresh machine with these packages.
class OutcomeTest : public testing::Test {
protected:
    ProgramResult Deploy() { return RunProgram("hvdeploy", {R"(dir=C:\Packages)", "loglevel=emerg"}); }
    static void Ships(const PackageBuilder& package) { (void)package.WriteTo(R"(C:\Packages)"); }
    static PackageBuilder Failing() { return Product("zfailing").Payload("resource").File("x", "x").To("nowhere"); }

    Machine machine;
};

TEST_F(OutcomeTest, IsThatItIsInstalled) {
    Ships(Glow());
    EXPECT_EQ(Deploy().errors, "hvdeploy: installed\n");
}

TEST_F(OutcomeTest, IsThatItIsInstalledThoughTheLastPackageHadNothingToDo) {
    Ships(Glow());
    Ships(PackageBuilder("com.halvorn.last").Named("postflight-last.hvpkg"));
    EXPECT_EQ(Deploy().errors, "hvdeploy: installed\n");
}

TEST_F(OutcomeTest, IsThatThereWasNothingToDo) {
    machine.HasFolder(R"(C:\Packages)");
    EXPECT_EQ(Deploy().errors, "hvdeploy: nothing to do\n");
}

// A name that ends in dots cannot be copied on any target.
TEST_F(OutcomeTest, IsThatNothingWasInstalledWhereTheSystemRefusedIt) {
    Ships(PackageBuilder("com.halvorn.dots").Payload("resource").File("x", "x").To("programdata", "Halvorn\\dots..."));
    const ProgramResult result = Deploy();
    EXPECT_EQ(result.exitStatus, 0);
    EXPECT_EQ(result.errors, "hvdeploy: nothing was installed; the log says why\n");
}

TEST_F(OutcomeTest, IsThatSomethingIsMissingWhereTheSystemRefusedIt) {
    Ships(Glow());
    Ships(Product("dots").Payload("resource").File("x", "x").To("programdata", "Halvorn\\dots..."));
    EXPECT_EQ(Deploy().errors, "hvdeploy: installed, but not all; the log says what is missing\n");
}

TEST_F(OutcomeTest, IsThatTheRunFailedAndIsUndone) {
    Ships(Glow().Named("preflight-glow.hvpkg"));
    Ships(Failing());
    const ProgramResult result = Deploy();
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_EQ(result.errors, "hvdeploy: failed and undone\n");
    EXPECT_FALSE(machine.Exists(R"(C:\ProgramData\Halvorn\Glow.txt)"));
}

TEST_F(OutcomeTest, IsThatWhatWasInstalledStaysWhereAFailureIsNotUndone) {
    Ships(Glow().DependsOn("com.halvorn.nobody"));
    const ProgramResult result = Deploy();
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_EQ(result.errors, "hvdeploy: failed; what was installed until then stays\n");
    EXPECT_TRUE(machine.Exists(R"(C:\ProgramData\Halvorn\Glow.txt)"));
}

TEST_F(OutcomeTest, IsAFailureWhateverTheExitStatusSays) {
    machine.Has(R"(C:\Packages\suite.json)", "[1, 2]");
    Ships(Glow());
    const ProgramResult result = Deploy();
    EXPECT_EQ(result.exitStatus, 0) << "the number in the exception's text";
    EXPECT_EQ(result.errors, "hvdeploy: failed; nothing was installed\n");
}

/// Makes a folder of the machine the current one, which programs inherit, for as long as this object lives.
class WorkingIn {
public:
    explicit WorkingIn(const std::string& folder) : before_(fs::current_path()) { fs::current_path(fs::path(folder)); }
    ~WorkingIn() {
        boost::system::error_code error;
        fs::current_path(before_, error);
        EXPECT_FALSE(error) << error.message();
    }
    WorkingIn(const WorkingIn&) = delete;
    WorkingIn& operator=(const WorkingIn&) = delete;

private:
    fs::path before_;
};

TEST(StandAlone, InstallsThePackagesOfTheCurrentFolderWhenNoneAreNamed) {
    Machine machine;
    (void)Glow().WriteTo(R"(C:\Here\packages)");
    const WorkingIn here(R"(C:\Here)");
    const ProgramResult result = RunProgram("hvdeploy", {"loglevel=info"});
    EXPECT_EQ(result.exitStatus, 0) << result.output;
    EXPECT_EQ(machine.Content(R"(C:\ProgramData\Halvorn\Glow.txt)"), "new");
}

TEST(StandAlone, StartedFromAnotherFolderDoesNotSeeThePackagesBesideTheProgram) {
    Machine machine;
    machine.HasFolder(R"(C:\Elsewhere)");
    ASSERT_TRUE(fs::is_directory(fs::path("Z:" HV_PROGRAM_FOLDER "/packages")));
    const auto before = machine.Files();
    const WorkingIn elsewhere(R"(C:\Elsewhere)");
    const ProgramResult result = RunProgram("hvdeploy", {"loglevel=info"});
    EXPECT_EQ(result.exitStatus, 0);
    EXPECT_EQ(result.errors, "hvdeploy: nothing to do\n");
    EXPECT_NE(result.output.find(" INFO hvdeploy-detail : No files to install.\n"), std::string::npos) << result.output;
    EXPECT_EQ(machine.Files(), before);
}

TEST(StandAlone, ShowsNoBarWhereNobodyWatches) {
    const Machine machine;
    (void)Glow().WriteTo(R"(C:\Packages)");
    const ProgramResult result = RunProgram("hvdeploy", {R"(dir=C:\Packages)", "loglevel=emerg"});
    EXPECT_EQ(result.exitStatus, 0);
    EXPECT_EQ(result.output, "");
}

TEST(StandAlone, SaysSoWhenItCannotMakeItsStash) {
    Machine machine;
    machine.Has(R"(C:\file)", "in the way");
    const ProgramResult result = RunProgram(
        "hvdeploy", {"list="}, {{"TMP", R"(C:\file)"}, {"TEMP", R"(C:\file)"}, {"USERPROFILE", R"(C:\file)"}});
    EXPECT_EQ(result.exitStatus, 1);
    EXPECT_EQ(result.errors.rfind("hvdeploy: ", 0), 0U) << result.errors;
    EXPECT_EQ(result.output, "");
}

/// A bar on a terminal that a test can look at.
class ProgressBarTest : public testing::Test {
protected:
    using Lines = std::vector<std::string>;
    Lines Picture() const { return TerminalPicture(stream.str()); }

    std::ostringstream stream;
    std::unique_ptr<HV::ProgressBar> bar = std::make_unique<HV::ProgressBar>(stream);
};

TEST_F(ProgressBarTest, IsNotThereBeforeTheFirstReport) {
    stream << "a line\n" << std::flush;
    bar.reset();
    EXPECT_EQ(stream.str(), "a line\n");
}

TEST_F(ProgressBarTest, FillsItsCellsWithThePercentage) {
    bar->update(0, "a", 0);
    EXPECT_EQ(Picture(), (Lines{"[........................]   0% a"}));
    bar->update(50, "b", 0);
    EXPECT_EQ(Picture(), (Lines{"[############............]  50% b"}));
    bar->update(100, "c", 0);
    EXPECT_EQ(Picture(), (Lines{"[########################] 100% c"}));
}

TEST_F(ProgressBarTest, LeavesNothingOfALongerMessage) {
    bar->update(1, "a rather long message", 0);
    bar->update(1, "short", 0);
    EXPECT_EQ(Picture(), (Lines{"[........................]   1% short"}));
}

TEST_F(ProgressBarTest, KeepsItsMessageWhenAReportHasNone) {
    bar->update(1, "message", 0);
    bar->update(25, "", 0);
    EXPECT_EQ(Picture(), (Lines{"[######..................]  25% message"}));
    bar->update(26, nullptr, 0);
    EXPECT_EQ(Picture(), (Lines{"[######..................]  26% message"}));
}

TEST_F(ProgressBarTest, StaysWhereItWasWhenTheRunFails) {
    bar->update(50, "message", 0);
    bar->update(0xFFFFFFFF, "failed", -1);
    EXPECT_EQ(Picture(), (Lines{"[############............]  50% failed"}));
}

TEST_F(ProgressBarTest, MakesRoomForALineAndReturnsBelowItThoughNobodyFlushes) {
    bar->update(50, "message", 0);
    stream << "a log line" << '\n';
    EXPECT_EQ(Picture(), (Lines{"a log line", "[############............]  50% message"}));
    stream << "another\n";
    EXPECT_EQ(Picture(), (Lines{"a log line", "another", "[############............]  50% message"}));
}

TEST_F(ProgressBarTest, WaitsForTheEndOfALineThatComesInPieces) {
    bar->update(50, "message", 0);
    stream << "half a line" << std::flush;
    EXPECT_EQ(Picture(), (Lines{"half a line"}));
    stream.put(',');
    stream << " and the rest\n";
    EXPECT_EQ(Picture(), (Lines{"half a line, and the rest", "[############............]  50% message"}));
}

TEST_F(ProgressBarTest, LeavesItsLastStateOnALineOfItsOwn) {
    bar->update(100, "done", 0);
    stream << "a log line\n";
    bar.reset();
    stream << "later\n";
    EXPECT_EQ(Picture(), (Lines{"a log line", "[########################] 100% done", "later"}));
}

TEST_F(ProgressBarTest, IsNeverWiderThanATerminalAndCutsNoCharacter) {
    bar->update(1, std::string(200, 'm').c_str(), 0);
    EXPECT_EQ(Picture().back().size(), 79U);
    // 32 columns stand before the message; its two-byte letters end in the middle of column 79's.
    std::string accents;
    for (int i = 0; i < 100; ++i) {
        accents += "\xC3\xA4";
    }
    bar->update(1, accents.c_str(), 0);
    EXPECT_EQ(Picture().back().size(), 78U);
    EXPECT_EQ(Picture().back().substr(76), "\xC3\xA4");
}

TEST_F(ProgressBarTest, TakesReportsAndLinesFromTwoThreads) {
    boost::thread writer([this] {
        for (int i = 0; i < 200; ++i) {
            stream << "line\n";
        }
    });
    for (std::uint32_t i = 0; i < 200; ++i) {
        bar->update(i / 2, "message", 0);
    }
    writer.join();
    Lines lines = Picture();
    EXPECT_EQ(lines.size(), 201U);
    EXPECT_EQ(lines.back(), "[#######################.]  99% message");
    lines.pop_back();
    EXPECT_EQ(std::count(lines.begin(), lines.end(), "line"), 200);
}

}  // namespace
