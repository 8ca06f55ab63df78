#include "system/SystemDirectories.h"

#include <gtest/gtest.h>

#include "hvframework/FileUtils.h"
#include "tests/support/Machine.h"

namespace HV {
namespace {

std::string DirectoryOf(const std::string& keyword) {
    return GetSystemDirectory(SysDirFromKeyword(keyword)).string();
}

class SystemDirectories : public testing::Test {
protected:
    Machine machine;
};

TEST_F(SystemDirectories, KnowEveryKeyword) {
    int keywords = 0;
    for (const char* keyword : {"absolutepath", "applications",   "appsupport",     "commondocs",  "commonappdata",
                                "frameworks",   "launchdaemons",  "localappdata",   "ofx",         "programdata",
                                "programfiles", "programfiles32", "logs",           "userlogs",    "history",
                                "startmenu",    "temp",           "userappsupport", "usersshared", "winsys"}) {
        EXPECT_NE(SysDirFromKeyword(keyword), SysDir::Unknown) << keyword;
        ++keywords;
    }
    EXPECT_EQ(keywords, 20);
}

TEST_F(SystemDirectories, DoNotKnowAKeywordInOtherCase) {
    EXPECT_EQ(SysDirFromKeyword("TEMP"), SysDir::Unknown);
    EXPECT_EQ(SysDirFromKeyword("ProgramFiles"), SysDir::Unknown);
}

TEST_F(SystemDirectories, DoNotKnowOtherKeywords) {
    EXPECT_EQ(SysDirFromKeyword(""), SysDir::Unknown);
    EXPECT_EQ(SysDirFromKeyword("temp "), SysDir::Unknown);
    EXPECT_EQ(SysDirFromKeyword("desktop"), SysDir::Unknown);
    EXPECT_EQ(static_cast<int>(SysDirFromKeyword("desktop")), 0);
}

TEST_F(SystemDirectories, AreEmptyForValuesThatNameNone) {
    EXPECT_EQ(GetSystemDirectory(SysDir::Unknown), fs::path());
    EXPECT_EQ(GetSystemDirectory(static_cast<SysDir>(-1)), fs::path());
    EXPECT_EQ(GetSystemDirectory(static_cast<SysDir>(1000)), fs::path());
    EXPECT_EQ(DirectoryOf("absolutepath"), "");
}

TEST_F(SystemDirectories, AreFixedForSomeKeywords) {
    int variables = 0;
    for (const char* variable : {"ProgramData", "PROGRAMFILES", "Public", "SystemRoot", "CommonProgramFiles"}) {
        SetEnvironmentVariableA(variable, R"(D:\Elsewhere)");
        ++variables;
    }
    EXPECT_EQ(variables, 5);
    EXPECT_EQ(DirectoryOf("commondocs"), R"(C:\Users\Public\Documents)");
    EXPECT_EQ(DirectoryOf("ofx"), R"(C:\Program Files\Common Files\OFX\Plugins)");
    EXPECT_EQ(DirectoryOf("history"), R"(C:\ProgramData\Halvorn\.hvdeploy\history)");
    EXPECT_EQ(DirectoryOf("startmenu"), R"(C:\ProgramData\Microsoft\Windows\Start Menu\Programs)");
    EXPECT_EQ(DirectoryOf("winsys"), R"(C:\Windows\System32)");
}

TEST_F(SystemDirectories, AreMacPathsForMacKeywords) {
    EXPECT_EQ(DirectoryOf("applications"), "/Applications");
    EXPECT_EQ(DirectoryOf("appsupport"), "/Library/Application Support");
    EXPECT_EQ(DirectoryOf("frameworks"), "/Library/Frameworks");
    EXPECT_EQ(DirectoryOf("launchdaemons"), "/Library/LaunchDaemons");
    EXPECT_EQ(DirectoryOf("usersshared"), "/Users/Shared");
}

TEST_F(SystemDirectories, FollowTheEnvironmentAtEachCall) {
    int places = 0;
    int variables = 0;
    for (const std::string place : {R"(D:\One)", R"(D:\Two)"}) {
        for (const char* variable : {"LOCALAPPDATA", "Temp", "USERPROFILE", "ProgramData", "AppData"}) {
            SetEnvironmentVariableA(variable, place.c_str());
            ++variables;
        }
        EXPECT_EQ(DirectoryOf("localappdata"), place);
        EXPECT_EQ(DirectoryOf("temp"), place);
        EXPECT_EQ(DirectoryOf("temp"), HVL::FileUtils::GetTempDirectory());
        EXPECT_EQ(DirectoryOf("userappsupport"), place + R"(\Library\Application Support)");
        EXPECT_EQ(DirectoryOf("logs"), place + R"(\Halvorn\logs)");
        EXPECT_EQ(DirectoryOf("userlogs"), place + R"(\Halvorn\logs)");
        ++places;
    }
    EXPECT_EQ(places, 2);
    EXPECT_EQ(variables, 10);
}

TEST_F(SystemDirectories, PutNoSecondSeparatorAfterAVariableThatEndsInOne) {
    SetEnvironmentVariableA("AppData", R"(D:\)");
    EXPECT_EQ(DirectoryOf("userlogs"), R"(D:\Halvorn\logs)");
}

TEST_F(SystemDirectories, HaveNoFallbackForVariablesThatAreNotSet) {
    int variables = 0;
    for (const char* variable : {"LOCALAPPDATA", "Temp", "USERPROFILE", "ProgramData", "AppData"}) {
        SetEnvironmentVariableA(variable, nullptr);
        ++variables;
    }
    EXPECT_EQ(variables, 5);
    EXPECT_EQ(DirectoryOf("localappdata"), "");
    EXPECT_EQ(DirectoryOf("temp"), "");
    EXPECT_EQ(DirectoryOf("userappsupport"), R"(\Library\Application Support)");
    EXPECT_EQ(DirectoryOf("logs"), R"(\Halvorn\logs)");
    EXPECT_EQ(DirectoryOf("userlogs"), R"(\Halvorn\logs)");
}

TEST_F(SystemDirectories, AreTheSameForBothNamesOfProgramData) {
    EXPECT_EQ(SysDirFromKeyword("commonappdata"), SysDirFromKeyword("programdata"));
    EXPECT_EQ(DirectoryOf("commonappdata"), DirectoryOf("programdata"));
}

TEST_F(SystemDirectories, SendApplicationsToProgramFiles) {
    EXPECT_EQ(GetDefaultInstallDirectory(), GetSystemDirectory(SysDir::ProgramFiles));
    EXPECT_NE(GetDefaultInstallDirectory(), fs::path());
}

}  // namespace
}  // namespace HV
