#include "hosts/HostRecord.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

namespace {

using HV::HostRecord;
using HV::HostType;

TEST(HostType, KnowsEveryAbbreviation) {
    const std::vector<std::pair<std::string, int>> table{
        {"aftereffects", 0},  {"aftereffectsMC", 1}, {"premiere", 2}, {"aftereffects+premiere", 3},
        {"edius", 4},         {"finalcutprox", 5},   {"ofx", 6},      {"hitfilm", 7},
        {"mediacomposer", 8}, {"motion", 9},         {"resolve", 10}, {"vegas", 11},
    };
    int checked = 0;
    for (const auto& [abbreviation, number] : table) {
        EXPECT_EQ(static_cast<int>(HV::HostTypeFromAbbreviation(abbreviation)), number) << abbreviation;
        ++checked;
    }
    EXPECT_EQ(checked, 12);
}

TEST(HostType, KnowsNoOtherTextAndNoOtherCase) {
    int checked = 0;
    for (const char* text : {"", "AfterEffects", "aftereffectsmc", "after effects", "premiere ", "ae", "nuke"}) {
        EXPECT_EQ(static_cast<int>(HV::HostTypeFromAbbreviation(text)), -1) << text;
        ++checked;
    }
    EXPECT_EQ(checked, 7);
}

TEST(HostRecord, IsOfNoTypeAtFirst) {
    EXPECT_EQ(static_cast<int>(HostRecord{}.hostType), -1);
}

TEST(HostRecord, ShowsNothingButBracesWhenItHoldsNothing) {
    EXPECT_EQ(HostRecord{}.ToText(), "{}");
}

TEST(HostRecord, ShowsEveryFieldInItsOrder) {
    HostRecord host;
    host.hostType = HostType::AfterEffects;
    host.hostData = "j";
    host.hostDocsPath = "i";
    host.hostScriptsPath = "h";
    host.hostPresetsPath = "g";
    host.hostSharedPath = "f";
    host.hostPluginPath = "e";
    host.hostAppPath = "d";
    host.hostVersion = "c";
    host.hostDisplayName = "b";
    host.hostAbbreviation = "a";
    EXPECT_EQ(host.ToText(),
              "{\n"
              "  \"hostAbbreviation\": \"a\",\n"
              "  \"hostDisplayName\": \"b\",\n"
              "  \"hostVersion\": \"c\",\n"
              "  \"hostAppPath\": \"d\",\n"
              "  \"hostPluginPath\": \"e\",\n"
              "  \"hostSharedPath\": \"f\",\n"
              "  \"hostPresetsPath\": \"g\",\n"
              "  \"hostScriptsPath\": \"h\",\n"
              "  \"hostDocsPath\": \"i\",\n"
              "  \"hostData\": \"j\"\n"
              "}");
}

TEST(HostRecord, LeavesOutFieldsThatAreEmpty) {
    HostRecord host;
    host.hostAbbreviation = "resolve";
    host.hostSharedPath = "C:\\Shared";
    EXPECT_EQ(host.ToText(), "{\n  \"hostAbbreviation\": \"resolve\",\n  \"hostSharedPath\": \"C:\\Shared\"\n}");
}

TEST(HostRecord, ShowsValuesAsTheyStand) {
    HostRecord host;
    host.hostAppPath = R"(C:\a "b"\c.exe)";
    EXPECT_EQ(host.ToText(), "{\n  \"hostAppPath\": \"C:\\a \"b\"\\c.exe\"\n}");
}

TEST(HostRecord, KeepsTheCommasOfItsValues) {
    HostRecord host;
    host.hostDisplayName = "One, Two,";
    EXPECT_EQ(host.ToText(), "{\n  \"hostDisplayName\": \"One, Two,\"\n}");
}

}  // namespace
