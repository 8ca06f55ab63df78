#include <gtest/gtest.h>

#include <algorithm>
#include <set>

#include "package/Package.h"
#include "tests/support/LogRecorder.h"
#include "tests/support/Machine.h"

namespace {

using Pairs = std::vector<HV::PayloadPathPair>;

/// A package that is unpacked already, with one payload.
class PayloadPathsTest : public testing::Test {
protected:
    void SetUp() override {
        machine.Has(R"(C:\unpacked\top.txt)", "x");
        machine.Has(R"(C:\unpacked\plugins\Glow.aex)", "x");
        machine.Has(R"(C:\unpacked\plugins\core.dll)", "x");
        machine.Has(R"(C:\unpacked\plugins\sub\deep.dll)", "x");
    }

    Pairs PathsTo(const std::string& directory) {
        Pairs pairs;
        HV::Package(fs::path(R"(C:\unpacked)")).GetPayloadPaths(fs::path(directory), payload, pairs);
        return pairs;
    }

    /// "source > destination", in no order, since a folder lists its entries in none.
    std::set<std::string> SetOfPathsTo(const std::string& directory) {
        std::set<std::string> texts;
        for (const HV::PayloadPathPair& pair : PathsTo(directory)) {
            texts.insert(pair.source.string() + " > " + pair.destination.string());
        }
        return texts;
    }

    Machine machine;
    LogRecorder log;
    HV::Payload payload;
};

TEST_F(PayloadPathsTest, AFileLandsUnderItsOwnName) {
    payload.source = R"(plugins\Glow.aex)";
    EXPECT_EQ(SetOfPathsTo(R"(C:\target)"),
              (std::set<std::string>{R"(C:\unpacked\plugins\Glow.aex > C:\target\Glow.aex)"}));
}

TEST_F(PayloadPathsTest, AFolderLandsUnderItsOwnName) {
    payload.source = R"(plugins\sub)";
    EXPECT_EQ(SetOfPathsTo(R"(C:\target)"), (std::set<std::string>{R"(C:\unpacked\plugins\sub > C:\target\sub)"}));
}

TEST_F(PayloadPathsTest, AFolderWithATrailingSeparatorLandsUnderItsOwnNameToo) {
    payload.source = R"(plugins\sub\)";
    const Pairs pairs = PathsTo(R"(C:\target)");
    ASSERT_EQ(pairs.size(), 1U);
    EXPECT_EQ(pairs[0].destination.string(), R"(C:\target\sub)");
}

TEST_F(PayloadPathsTest, TheSubpathLiesBelowTheDirectory) {
    payload.source = "top.txt";
    payload.subpath = R"(Halvorn\Glow)";
    EXPECT_EQ(SetOfPathsTo(R"(C:\target)"),
              (std::set<std::string>{R"(C:\unpacked\top.txt > C:\target\Halvorn\Glow\top.txt)"}));
}

TEST_F(PayloadPathsTest, AnAbsolutePathIsTheSubpathAlone) {
    payload.source = "top.txt";
    payload.sysdir = "absolutepath";
    payload.subpath = R"(C:\exactly\here)";
    EXPECT_EQ(SetOfPathsTo(""), (std::set<std::string>{R"(C:\unpacked\top.txt > C:\exactly\here\top.txt)"}));
}

TEST_F(PayloadPathsTest, AnAbsolutePathWithoutSubpathHasNoParent) {
    payload.source = "top.txt";
    payload.sysdir = "absolutepath";
    const Pairs pairs = PathsTo("");
    ASSERT_EQ(pairs.size(), 1U);
    EXPECT_EQ(pairs[0].destination.string(), "top.txt");
    EXPECT_TRUE(pairs[0].destination.parent_path().empty());
}

TEST_F(PayloadPathsTest, AnEmptyDirectoryIsAnErrorForEveryOtherKeyword) {
    payload.source = "top.txt";
    payload.subpath = R"(C:\exactly\here)";
    Pairs pairs;
    HV::Package(fs::path(R"(C:\unpacked)")).GetPayloadPaths(fs::path(), payload, pairs);
    EXPECT_TRUE(pairs.empty());
    EXPECT_EQ(log.Lines(), std::vector<std::string>{"ERROR hvdeploy-detail: unexpected logic issue in HV::Package::"
                                                    "HV::Package::GetPayloadPaths - destPath is empty."});
}

TEST_F(PayloadPathsTest, AnEmptyDestinationIsLoggedAndKept) {
    payload.sysdir = "absolutepath";
    Pairs pairs;
    const HV::Package nothing{fs::path(R"(C:\nowhere)")};
    nothing.GetPayloadPaths(fs::path(), payload, pairs);
    ASSERT_EQ(pairs.size(), 1U);
    EXPECT_TRUE(pairs[0].destination.empty());
    EXPECT_EQ(log.Lines(), std::vector<std::string>{"ERROR hvdeploy-detail: dest path is empty in HV::Package::"
                                                    "HV::Package::GetPayloadPaths line 277"});
}

TEST_F(PayloadPathsTest, ClearsWhatTheListHeld) {
    payload.source = "top.txt";
    Pairs pairs(3);
    HV::Package(fs::path(R"(C:\unpacked)")).GetPayloadPaths(fs::path(R"(C:\target)"), payload, pairs);
    EXPECT_EQ(pairs.size(), 1U);
}

TEST_F(PayloadPathsTest, AStarTakesFilesAndFoldersWithoutGoingDown) {
    payload.source = R"(plugins\*)";
    EXPECT_EQ(SetOfPathsTo(R"(C:\target)"), (std::set<std::string>{
                                                R"(C:\unpacked\plugins\Glow.aex > C:\target\Glow.aex)",
                                                R"(C:\unpacked\plugins\core.dll > C:\target\core.dll)",
                                                R"(C:\unpacked\plugins\sub > C:\target\sub)",
                                            }));
}

TEST_F(PayloadPathsTest, APatternTakesWhatMatchesIt) {
    payload.source = R"(plugins\*.d?l)";
    payload.subpath = "Halvorn";
    EXPECT_EQ(SetOfPathsTo(R"(C:\target)"),
              (std::set<std::string>{R"(C:\unpacked\plugins\core.dll > C:\target\Halvorn\core.dll)"}));
}

TEST_F(PayloadPathsTest, AStarAtTheRootTakesTheRoot) {
    payload.source = "*.txt";
    EXPECT_EQ(SetOfPathsTo(R"(C:\target)"), (std::set<std::string>{R"(C:\unpacked\top.txt > C:\target\top.txt)"}));
}

TEST_F(PayloadPathsTest, APatternThatMatchesNothingGivesNoPairs) {
    payload.source = R"(plugins\*.exe)";
    EXPECT_TRUE(PathsTo(R"(C:\target)").empty());
    EXPECT_TRUE(log.Lines().empty());
}

TEST_F(PayloadPathsTest, AStarInAFoldersNameIsLookedForAsItStands) {
    payload.source = R"(plug*\core.dll)";
    EXPECT_THROW(PathsTo(R"(C:\target)"), fs::filesystem_error);
}

TEST_F(PayloadPathsTest, AQuestionMarkAloneIsNoWildcard) {
    payload.source = R"(plugins\?ore.dll)";
    const Pairs pairs = PathsTo(R"(C:\target)");
    ASSERT_EQ(pairs.size(), 1U);
    EXPECT_EQ(pairs[0].source.string(), R"(C:\unpacked\plugins\?ore.dll)");
}

}  // namespace
